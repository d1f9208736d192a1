#ifndef VETRA_APPS_METHODSCOMMAND_H
#define VETRA_APPS_METHODSCOMMAND_H

#include <CLI/CLI.hpp>

namespace vetra::tool {

/// Adds the command `vetra methods`.
void AddMethodsCommand(CLI::App& oApp);

}  // namespace vetra::tool

#endif  // VETRA_APPS_METHODSCOMMAND_H
