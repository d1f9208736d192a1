#include "methodscommand.h"

#include <cstdio>
#include <memory>
#include <string>

#include "methods.h"

namespace vetra::tool {

void AddMethodsCommand(CLI::App& oApp) {
    CLI::App* poCommand = oApp.add_subcommand(
        "methods", "List the resampling methods, with their keys, windows and margins.");
    const auto psMethod = std::make_shared<std::string>();
    poCommand->add_option("METHOD", *psMethod, "Show this one, with its keys: NAME[,KEY=VALUE...]");
    poCommand->callback([psMethod] {
        const std::string sText = psMethod->empty() ? DescribeMethods() : DescribeMethod(*psMethod);
        std::fputs(sText.c_str(), stdout);
    });
}

}  // namespace vetra::tool
