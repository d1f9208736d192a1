#ifndef VETRA_APPS_RESAMPLECOMMAND_H
#define VETRA_APPS_RESAMPLECOMMAND_H

#include <CLI/CLI.hpp>

namespace vetra::tool {

/// Adds `resample` to the commands of the program. Its work is done while the arguments are parsed,
/// with the failures of `RunResample`.
void AddResampleCommand(CLI::App& oApp);

}  // namespace vetra::tool

#endif  // VETRA_APPS_RESAMPLECOMMAND_H
