#ifndef VETRA_APPS_KERNELCOMMAND_H
#define VETRA_APPS_KERNELCOMMAND_H

#include <CLI/CLI.hpp>

namespace vetra::tool {

/// Adds the command `vetra kernel`.
void AddKernelCommand(CLI::App& oApp);

}  // namespace vetra::tool

#endif  // VETRA_APPS_KERNELCOMMAND_H
