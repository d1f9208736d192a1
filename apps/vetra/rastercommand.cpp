#include "rastercommand.h"

#include <cpl_string.h>

#include <algorithm>
#include <cstdio>
#include <limits>

#include "gdalraster/errors.h"
#include "gdalraster/pixeltypes.h"
#include "methods.h"
#include "vetra/base/utils/string/stringutils.h"

namespace vetra::tool {

namespace {

constexpr int kMostThreads = 4096;
constexpr long long kMostMemoryMb = 1LL << 30;

std::optional<NodataValue> ToNodata(const char* pszOption, const std::string& sText) {
    if (sText.empty()) {
        return std::nullopt;
    }
    const std::optional<NodataValue> oNodata = NodataValue::FromText(sText);
    if (!oNodata) {
        throw UsageError(std::string(pszOption) + ": " + sText + " is not a number");
    }
    return oNodata;
}

// As the parser's own, but a type name says all about the values.
class HelpFormatter : public CLI::Formatter {
 public:
    HelpFormatter() { column_width(26); }

 private:
    std::string make_option_opts(const CLI::Option* poOption) const override {
        const std::string sType = poOption->get_type_name();
        return sType.empty() ? "" : " " + sType;
    }
};

}  // namespace

CLI::Validator Plain(CLI::Validator oValidator) { return oValidator.description(""); }

CLI::App* AddRasterCommand(CLI::App& oApp, const char* pszName, const char* pszHelp,
                           RasterOptions& oOptions) {
    CLI::App* poCommand = oApp.add_subcommand(pszName, pszHelp);
    poCommand->formatter(std::make_shared<HelpFormatter>());
    AddOption(poCommand, "SRC", oOptions.sSource, "", "The source image")->required();
    AddOption(poCommand, "DST", oOptions.sTarget, "",
              "The target image; one that exists is replaced when the run has succeeded")
        ->required();
    return poCommand;
}

CLI::Option_group* AddGroup(CLI::App* poCommand, const char* pszName, const char* pszHelp) {
    CLI::Option_group* poGroup = poCommand->add_option_group(pszName, pszHelp);
    poGroup->formatter(std::make_shared<HelpFormatter>());
    return poGroup;
}

void AddRasterOptions(CLI::App* poCommand, RasterTexts& oTexts, RasterOptions& oOptions) {
    const auto NotEmpty = [](const std::string& s) {
        return TrimWhitespace(s).empty() ? std::string("no method is given") : std::string();
    };
    AddOption(poCommand, "--method", oTexts.sMethod, "NAME[,KEY=VALUE...]",
              "The method, BILIN by default, with its keys, for instance\n"
              "SINC8,SHAPINGWINDOW=LANCZOS; vetra methods lists all")
        ->check(NotEmpty);
    AddOption(
        poCommand, "--type", oTexts.sType, "TYPE",
        "Pixel type of the target, that of the source by default; one of\n" + GetPixelTypeNames());
    AddOption(poCommand, "--nodata", oTexts.sNodata, "VALUE",
              "Value of pixels without data, for instance -9999 or nan: replaces what\n"
              "the source declares, and is declared in the target");
    AddOption(poCommand, "--dst-nodata", oTexts.sTargetNodata, "VALUE",
              "The same for the target alone");
    AddOption(poCommand, "--fill", oTexts.sFill, "nn | bgd",
              "What a pixel becomes whose window is not whole, at the source's edges\n"
              "and beside pixels without data: the nearest pixel (nn, the default) or\n"
              "background (bgd), which is the nodata value or 0")
        ->check(Plain(CLI::IsMember({"nn", "bgd"}, CLI::ignore_case)));
    CLI::Option* poFormat =
        AddOption(poCommand, "--of", oOptions.sFormat, "FORMAT",
                  "Format of the target, a driver name of GDAL; by default the extension\n"
                  "of DST decides, and is GTiff where it is not known");
    poCommand
        ->add_flag("--cog", oTexts.bCog,
                   "Write a cloud optimized GeoTIFF, with overviews: means of 2 x 2\n"
                   "pixels unless --overviews has another method")
        ->excludes(poFormat);
    AddOption(poCommand, "--overviews", oTexts.sOverviews, "NAME[,KEY=VALUE...]",
              "Put overviews into the GeoTIFF, each made from the one before by\n"
              "this method, whose window is 2 x 2 unless it has its own")
        ->check(NotEmpty);
    AddOption(poCommand, "--co", oOptions.oCreationOptions, "NAME=VALUE",
              "Creation option of the format; may be repeated")
        ->expected(1)
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
    AddOption(poCommand, "--threads", oOptions.nThreads, "N",
              "Number of threads that resample, beside those that plan, read and\n"
              "write; all processors by default or for 0")
        ->check(Plain(CLI::Range(0, kMostThreads)));
    AddOption(poCommand, "--memory", oOptions.nMemoryMb, "MB",
              "Memory limit of the run in megabytes, 512 by default")
        ->check(Plain(CLI::Range(1LL, kMostMemoryMb)));
    poCommand->add_flag("-q,--quiet", oOptions.bQuiet, "Show neither progress nor warnings");
}

void Interpret(const RasterTexts& oTexts, RasterOptions& oOptions) {
    if (!oTexts.sMethod.empty()) {
        oOptions.sMethod = oTexts.sMethod;
    }
    if (!oTexts.sType.empty()) {
        oOptions.oType = FindPixelType(oTexts.sType);
        if (!oOptions.oType) {
            throw UsageError("--type: " + oTexts.sType + " is none of " + GetPixelTypeNames());
        }
    }
    oOptions.oNodata = ToNodata("--nodata", oTexts.sNodata);
    oOptions.oTargetNodata = ToNodata("--dst-nodata", oTexts.sTargetNodata);
    if (!oTexts.sFill.empty()) {
        oOptions.eFill = EQUAL(oTexts.sFill.c_str(), "bgd") ? utils::eNFA_BGD : utils::eNFA_NN;
    }
    if (oTexts.bCog) {
        oOptions.sFormat = "COG";
    }
    if (!oTexts.sOverviews.empty()) {
        oOptions.sOverviews = WithFactor(oTexts.sOverviews, 2);
        MakeResampler(oOptions.sOverviews);
    }
    CheckPairs("--co", oOptions.oCreationOptions);
}

std::array<double, 2> ToPair(const char* pszOption, const std::vector<double>& oNumbers) {
    const std::array<double, 2> vdfPair = {oNumbers.front(), oNumbers.back()};
    for (const double df : vdfPair) {
        if (!(df > 0.0 && df <= std::numeric_limits<double>::max())) {
            throw UsageError(std::string(pszOption) + ": numbers above 0 are needed");
        }
    }
    return vdfPair;
}

// Of a key that is given twice, the last one counts.
std::string WithFactor(const std::string& sMethod, int nFactor) {
    const std::string sFactor = std::to_string(nFactor);
    const std::size_t nEnd = std::min(sMethod.find(','), sMethod.size());
    return sMethod.substr(0, nEnd) + ",NUMCOLS=" + sFactor + ",NUMROWS=" + sFactor +
           ",DSFACTORCOL=" + sFactor + sMethod.substr(nEnd);
}

void CheckPairs(const char* pszOption, const std::vector<std::string>& oPairs) {
    for (const std::string& sPair : oPairs) {
        if (sPair.find('=', 1) == std::string::npos) {
            throw UsageError(std::string(pszOption) + ": " + sPair +
                             " is not of the form NAME=VALUE");
        }
    }
}

void ShowWarnings(const RasterOptions& oOptions) {
    if (!oOptions.bQuiet) {
        for (const std::string& sWarning : GdalMessages::GetWarnings()) {
            std::fprintf(stderr, "vetra: warning: %s\n", sWarning.c_str());
        }
    }
}

}  // namespace vetra::tool
