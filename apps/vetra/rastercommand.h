#ifndef VETRA_APPS_RASTERCOMMAND_H
#define VETRA_APPS_RASTERCOMMAND_H

#include <array>
#include <CLI/CLI.hpp>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "rasterjob/rasteroptions.h"

namespace vetra::tool {

/// The options of a command that makes an image file from another, as typed, where they need more
/// than a conversion.
struct RasterTexts {
    std::string sMethod;
    std::string sType;
    std::string sNodata;
    std::string sTargetNodata;
    std::string sFill;
    std::string sOverviews;
    bool bCog = false;
};

/// Adds a command with its two files.
CLI::App* AddRasterCommand(CLI::App& oApp, const char* pszName, const char* pszHelp,
                           RasterOptions& oOptions);
/// Adds an option with its values for the help, and returns it.
template <class Value>
CLI::Option* AddOption(CLI::App* poGroup, const char* pszName, Value& oValue, const char* pszValues,
                       const std::string& sHelp) {
    return poGroup->add_option(pszName, oValue, sHelp)->type_name(pszValues);
}
/// A group with a heading of its own.
CLI::Option_group* AddGroup(CLI::App* poCommand, const char* pszName, const char* pszHelp);
/// A validator that adds nothing to an option's help.
CLI::Validator Plain(CLI::Validator oValidator);

/// Adds the options that don't concern the target's grid.
void AddRasterOptions(CLI::App* poCommand, RasterTexts& oTexts, RasterOptions& oOptions);
/// \throws UsageError
void Interpret(const RasterTexts& oTexts, RasterOptions& oOptions);
/// Two numbers above 0, the second that of the first where there is one only.
/// \throws UsageError
std::array<double, 2> ToPair(const char* pszOption, const std::vector<double>& oNumbers);
/// The method of a reduction by a factor: its sizes are the factor unless the string has its own.
std::string WithFactor(const std::string& sMethod, int nFactor);
/// \throws UsageError unless all are of the form NAME=VALUE.
void CheckPairs(const char* pszOption, const std::vector<std::string>& oPairs);
/// Shows what GDAL has warned of.
void ShowWarnings(const RasterOptions& oOptions);

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERCOMMAND_H
