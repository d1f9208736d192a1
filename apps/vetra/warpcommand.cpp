#include "warpcommand.h"

#include <cmath>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "gdalraster/errors.h"
#include "methods.h"
#include "rastercommand.h"
#include "rasterjob/resamplejob.h"

namespace vetra::tool {

namespace {

// The options as typed, where they need more than a conversion.
struct Texts : RasterTexts {
    std::vector<double> oResolution;
    std::vector<int> oSize;
    std::vector<double> oExtent;
};

void InterpretAll(const Texts& oTexts, WarpOptions& oOptions) {
    Interpret(oTexts, oOptions);
    WarpRequest& oGrid = oOptions.oGrid;
    if (!oTexts.oResolution.empty()) {
        oGrid.oResolution = ToPair("--res", oTexts.oResolution);
    }
    if (!oTexts.oSize.empty()) {
        oGrid.oSize = {oTexts.oSize[0], oTexts.oSize[1]};
    }
    if (const std::vector<double>& o = oTexts.oExtent; !o.empty()) {
        // The differences are finite too then.
        if (!(o[0] < o[2] && o[1] < o[3] && std::isfinite(o[2] - o[0]) &&
              std::isfinite(o[3] - o[1]))) {
            throw UsageError("--extent: the least x and y, then the greatest x and y are needed");
        }
        oGrid.oExtent = {o[0], o[1], o[2], o[3]};
    }
    if (!(oOptions.dfError >= 0.0 && std::isfinite(oOptions.dfError))) {
        throw UsageError("--error: a number of pixels is needed, 0 or more");
    }
    CheckPairs("--to", oOptions.oReference.oTransformer);
    // Names a wrong method before any file is looked at.
    MakeResampler(oOptions.sMethod);
}

}  // namespace

void AddWarpCommand(CLI::App& oApp) {
    const auto poOptions = std::make_shared<WarpOptions>();
    const auto poTexts = std::make_shared<Texts>();
    CLI::App* poCommand = AddRasterCommand(
        oApp, "warp", "Write an image file in another coordinate system, grid or extent.",
        *poOptions);

    CLI::Option_group* poGrid =
        AddGroup(poCommand, "Grid", "Where the target's pixels are; what is left out is chosen");
    CLI::Option* poCrs =
        AddOption(poGrid, "--crs", poOptions->oReference.sTargetCrs, "CRS",
                  "Coordinate reference system of the target, for instance EPSG:32633;\n"
                  "that of the source by default");
    CLI::Option* poResolution =
        AddOption(poGrid, "--res", poTexts->oResolution, "R | RX RY",
                  "Size of a target pixel in units of the target's system, kept exactly")
            ->expected(2);
    CLI::Option* poSize =
        AddOption(poGrid, "--size", poTexts->oSize, "COLS ROWS", "Number of columns and rows")
            ->expected(2)
            ->check(Plain(CLI::Range(1, std::numeric_limits<int>::max())));
    CLI::Option* poExtent = AddOption(poGrid, "--extent", poTexts->oExtent, "XMIN YMIN XMAX YMAX",
                                      "Edges of the target in its system")
                                ->expected(4);
    CLI::Option* poLike = AddOption(poGrid, "--like", poOptions->sLike, "REF",
                                    "Coordinate system, size and pixels of another image");
    poSize->excludes(poResolution);
    for (CLI::Option* poOther : {poCrs, poResolution, poSize, poExtent}) {
        poLike->excludes(poOther);
    }

    AddOption(poCommand, "--error", poOptions->dfError, "PIXELS",
              "Positions may be interpolated where that is off by no more than this,\n"
              "in source pixels; 0.01 by default, 0 for exact positions everywhere");
    AddOption(poCommand, "--src-crs", poOptions->oReference.sSourceCrs, "CRS",
              "Coordinate reference system of the source, instead of its own");
    AddOption(poCommand, "--to", poOptions->oReference.oTransformer, "NAME=VALUE",
              "Option of GDAL's transformers, for instance METHOD=GCP_TPS,\n"
              "MAX_GCP_ORDER=2, RPC_HEIGHT=300 or RPC_DEM=FILE; may be repeated")
        ->expected(1)
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
    AddRasterOptions(poCommand, *poTexts, *poOptions);
    poCommand->footer(
        "The source is georeferenced by its geotransform, ground control points or rational\n"
        "polynomials. Pixels that its nodata values, mask or alpha band mark as invalid never\n"
        "contribute to a target pixel. Target pixels beside the source become nodata; where\n"
        "the source has neither nodata value, mask nor alpha band, that is nan for floating\n"
        "types and 0 for others, which no other pixel takes, or a mask with NEAR.\n"
        "\n"
        "A method sees as many source pixels as its window has, whatever the target's pixel\n"
        "size. For a target with pixels n times as large choose a mean, for instance\n"
        "AVERAGE,NUMCOLS=n,NUMROWS=n, or GAUSSIAN,DSFACTORCOL=n.");

    poCommand->callback([poOptions, poTexts] {
        InterpretAll(*poTexts, *poOptions);
        RunWarp(*poOptions);
        ShowWarnings(*poOptions);
    });
}

}  // namespace vetra::tool
