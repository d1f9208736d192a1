#include "resamplecommand.h"

#include <cpl_string.h>

#include <algorithm>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "gdalraster/errors.h"
#include "gdalraster/pixeltypes.h"
#include "methods.h"
#include "rasterjob/resamplejob.h"
#include "vetra/base/utils/string/stringutils.h"

namespace vetra::tool {

namespace {

constexpr int kMostThreads = 4096;
constexpr long long kMostMemoryMb = 1LL << 30;

// The options as typed, where they need more than a conversion.
struct Texts {
    std::vector<int> oSize;
    std::vector<double> oScale;
    std::vector<double> oResolution;
    std::string sType;
    std::string sNodata;
    std::string sTargetNodata;
    std::string sFill;
    int nDownsample = 0;
    std::string sMethod;
};

GridRequest ToPair(GridRequest::Kind eKind, const char* pszOption,
                   const std::vector<double>& oNumbers) {
    const GridRequest oRequest{eKind, oNumbers.front(), oNumbers.back()};
    const double dfMax = std::numeric_limits<double>::max();
    if (!(oRequest.dfX > 0.0 && oRequest.dfX <= dfMax && oRequest.dfY > 0.0 &&
          oRequest.dfY <= dfMax)) {
        throw UsageError(std::string(pszOption) + ": numbers above 0 are needed");
    }
    return oRequest;
}

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

// The method of a reduction by a factor: its sizes are the factor unless the string has its own, of
// which the last counts.
std::string WithFactor(const std::string& sMethod, int nFactor) {
    const std::string sFactor = std::to_string(nFactor);
    const std::size_t nEnd = std::min(sMethod.find(','), sMethod.size());
    return sMethod.substr(0, nEnd) + ",NUMCOLS=" + sFactor + ",NUMROWS=" + sFactor +
           ",DSFACTORCOL=" + sFactor + sMethod.substr(nEnd);
}

void Interpret(const Texts& oTexts, ResampleOptions& oOptions) {
    if (!oTexts.sMethod.empty()) {
        oOptions.sMethod = oTexts.sMethod;
    }
    if (oTexts.nDownsample > 0) {
        oOptions.oGrid = {GridRequest::eGK_FACTOR, static_cast<double>(oTexts.nDownsample),
                          static_cast<double>(oTexts.nDownsample)};
        oOptions.sMethod =
            WithFactor(oTexts.sMethod.empty() ? "AVERAGE" : oTexts.sMethod, oTexts.nDownsample);
    } else if (!oTexts.oSize.empty()) {
        oOptions.oGrid = {GridRequest::eGK_SIZE, static_cast<double>(oTexts.oSize[0]),
                          static_cast<double>(oTexts.oSize[1])};
    } else if (!oTexts.oScale.empty()) {
        oOptions.oGrid = ToPair(GridRequest::eGK_SCALE, "--scale", oTexts.oScale);
    } else {
        oOptions.oGrid = ToPair(GridRequest::eGK_RESOLUTION, "--res", oTexts.oResolution);
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
    for (const std::string& sOption : oOptions.oCreationOptions) {
        if (sOption.find('=', 1) == std::string::npos) {
            throw UsageError("--co: " + sOption + " is not of the form NAME=VALUE");
        }
    }
    // Names a wrong method before any file is looked at.
    MakeResampler(oOptions.sMethod);
}

// A validator that adds nothing to an option's help.
CLI::Validator Plain(CLI::Validator oValidator) { return oValidator.description(""); }

// As the parser's own, but a type name says all about the values.
class HelpFormatter : public CLI::Formatter {
    std::string make_option_opts(const CLI::Option* poOption) const override {
        const std::string sType = poOption->get_type_name();
        return sType.empty() ? "" : " " + sType;
    }
};

}  // namespace

void AddResampleCommand(CLI::App& oApp) {
    CLI::App* poCommand = oApp.add_subcommand(
        "resample", "Write an image file with coarser or finer pixels than another.");
    const auto poFormatter = std::make_shared<HelpFormatter>();
    poFormatter->column_width(26);
    poCommand->formatter(poFormatter);
    const auto poOptions = std::make_shared<ResampleOptions>();
    const auto poTexts = std::make_shared<Texts>();
    const auto Add = [](CLI::App* poGroup, const char* pszName, auto& oValue, const char* pszValues,
                        const std::string& sHelp) {
        return poGroup->add_option(pszName, oValue, sHelp)->type_name(pszValues);
    };

    Add(poCommand, "SRC", poOptions->sSource, "", "The source image")->required();
    Add(poCommand, "DST", poOptions->sTarget, "",
        "The target image; one that exists is replaced when the run has succeeded")
        ->required();

    CLI::Option_group* poGrid =
        poCommand->add_option_group("Size", "How many pixels the target has");
    poGrid->formatter(poFormatter);
    poGrid->require_option(1);
    Add(poGrid, "--size", poTexts->oSize, "COLS ROWS", "Number of columns and rows")
        ->expected(2)
        ->check(Plain(CLI::Range(1, std::numeric_limits<int>::max())));
    Add(poGrid, "--scale", poTexts->oScale, "F | FX FY",
        "Target pixels per source pixel: 0.5 halves columns and rows")
        ->expected(2);
    Add(poGrid, "--res", poTexts->oResolution, "R | RX RY",
        "Size of a target pixel in georeferenced units, kept exactly")
        ->expected(2);

    Add(poGrid, "--downsample", poTexts->nDownsample, "N",
        "A target pixel for N x N source pixels: their mean, or their median with\n"
        "--method MEDIAN, or what the method makes of them. N is also the size of\n"
        "the window and the factor of GAUSSIAN, unless the method has its own")
        ->check(Plain(CLI::Range(1, std::numeric_limits<int>::max())));

    Add(poCommand, "--method", poTexts->sMethod, "NAME[,KEY=VALUE...]",
        "The method, BILIN by default, with its keys, for instance\n"
        "SINC8,SHAPINGWINDOW=LANCZOS; vetra methods lists all")
        ->check([](const std::string& s) {
            return TrimWhitespace(s).empty() ? std::string("no method is given") : std::string();
        });
    Add(poCommand, "--type", poTexts->sType, "TYPE",
        "Pixel type of the target, that of the source by default; one of\n" + GetPixelTypeNames());
    Add(poCommand, "--nodata", poTexts->sNodata, "VALUE",
        "Value of pixels without data, for instance -9999 or nan: replaces what\n"
        "the source declares, and is declared in the target");
    Add(poCommand, "--dst-nodata", poTexts->sTargetNodata, "VALUE",
        "The same for the target alone");
    Add(poCommand, "--fill", poTexts->sFill, "nn | bgd",
        "What a pixel becomes whose window is not whole, at the source's edges\n"
        "and beside pixels without data: the nearest pixel (nn, the default) or\n"
        "background (bgd), which is the nodata value or 0")
        ->check(Plain(CLI::IsMember({"nn", "bgd"}, CLI::ignore_case)));
    Add(poCommand, "--of", poOptions->sFormat, "FORMAT",
        "Format of the target, a driver name of GDAL; by default the extension\n"
        "of DST decides, and is GTiff where it is not known");
    Add(poCommand, "--co", poOptions->oCreationOptions, "NAME=VALUE",
        "Creation option of the format; may be repeated")
        ->expected(1)
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
    Add(poCommand, "--threads", poOptions->nThreads, "N",
        "Number of threads; all processors by default or for 0")
        ->check(Plain(CLI::Range(0, kMostThreads)));
    Add(poCommand, "--memory", poOptions->nMemoryMb, "MB",
        "Memory limit of the run in megabytes, 512 by default")
        ->check(Plain(CLI::Range(1LL, kMostMemoryMb)));
    poCommand->add_flag("-q,--quiet", poOptions->bQuiet, "Show neither progress nor warnings");
    poCommand->footer(
        "The target has the source's upper left corner, its georeference and description.\n"
        "Pixels that the source's nodata values, mask or alpha band mark as invalid never\n"
        "contribute to a target pixel.");

    poCommand->callback([poOptions, poTexts] {
        Interpret(*poTexts, *poOptions);
        RunResample(*poOptions);
        if (!poOptions->bQuiet) {
            for (const std::string& sWarning : GdalMessages::GetWarnings()) {
                std::fprintf(stderr, "vetra: warning: %s\n", sWarning.c_str());
            }
        }
    });
}

}  // namespace vetra::tool
