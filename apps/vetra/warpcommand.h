#ifndef VETRA_APPS_WARPCOMMAND_H
#define VETRA_APPS_WARPCOMMAND_H

#include <CLI/CLI.hpp>

namespace vetra::tool {

/// Adds `warp` to the commands of the program. Its work is done while the arguments are parsed,
/// with the failures of `RunWarp`.
void AddWarpCommand(CLI::App& oApp);

}  // namespace vetra::tool

#endif  // VETRA_APPS_WARPCOMMAND_H
