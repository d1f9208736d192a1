#include "resamplecommand.h"

#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "methods.h"
#include "rastercommand.h"
#include "rasterjob/resamplejob.h"

namespace vetra::tool {

namespace {

// The options as typed, where they need more than a conversion.
struct Texts : RasterTexts {
    std::vector<int> oSize;
    std::vector<double> oScale;
    std::vector<double> oResolution;
    int nDownsample = 0;
};

void InterpretAll(const Texts& oTexts, ResampleOptions& oOptions) {
    Interpret(oTexts, oOptions);
    const auto Pair = [](GridRequest::Kind eKind, const std::array<double, 2>& vdf) {
        return GridRequest{eKind, vdf[0], vdf[1]};
    };
    if (oTexts.nDownsample > 0) {
        oOptions.oGrid = {GridRequest::eGK_FACTOR, static_cast<double>(oTexts.nDownsample),
                          static_cast<double>(oTexts.nDownsample)};
        oOptions.sMethod =
            WithFactor(oTexts.sMethod.empty() ? "AVERAGE" : oTexts.sMethod, oTexts.nDownsample);
    } else if (!oTexts.oSize.empty()) {
        oOptions.oGrid = {GridRequest::eGK_SIZE, static_cast<double>(oTexts.oSize[0]),
                          static_cast<double>(oTexts.oSize[1])};
    } else if (!oTexts.oScale.empty()) {
        oOptions.oGrid = Pair(GridRequest::eGK_SCALE, ToPair("--scale", oTexts.oScale));
    } else {
        oOptions.oGrid = Pair(GridRequest::eGK_RESOLUTION, ToPair("--res", oTexts.oResolution));
    }
    // Names a wrong method before any file is looked at.
    MakeResampler(oOptions.sMethod);
}

}  // namespace

void AddResampleCommand(CLI::App& oApp) {
    const auto poOptions = std::make_shared<ResampleOptions>();
    const auto poTexts = std::make_shared<Texts>();
    CLI::App* poCommand = AddRasterCommand(
        oApp, "resample", "Write an image file with coarser or finer pixels than another.",
        *poOptions);

    CLI::Option_group* poGrid = AddGroup(poCommand, "Size", "How many pixels the target has");
    poGrid->require_option(1);
    AddOption(poGrid, "--size", poTexts->oSize, "COLS ROWS", "Number of columns and rows")
        ->expected(2)
        ->check(Plain(CLI::Range(1, std::numeric_limits<int>::max())));
    AddOption(poGrid, "--scale", poTexts->oScale, "F | FX FY",
              "Target pixels per source pixel: 0.5 halves columns and rows")
        ->expected(2);
    AddOption(poGrid, "--res", poTexts->oResolution, "R | RX RY",
              "Size of a target pixel in georeferenced units, kept exactly")
        ->expected(2);
    AddOption(poGrid, "--downsample", poTexts->nDownsample, "N",
              "A target pixel for N x N source pixels: their mean, or their median with\n"
              "--method MEDIAN, or what the method makes of them. N is also the size of\n"
              "the window and the factor of GAUSSIAN, unless the method has its own")
        ->check(Plain(CLI::Range(1, std::numeric_limits<int>::max())));

    AddRasterOptions(poCommand, *poTexts, *poOptions);
    poCommand->footer(
        "The target has the source's upper left corner, its georeference and description.\n"
        "Pixels that the source's nodata values, mask or alpha band mark as invalid never\n"
        "contribute to a target pixel.");

    poCommand->callback([poOptions, poTexts] {
        InterpretAll(*poTexts, *poOptions);
        RunResample(*poOptions);
        ShowWarnings(*poOptions);
    });
}

}  // namespace vetra::tool
