#ifndef VETRA_APPS_RASTERJOB_RESAMPLEJOB_H
#define VETRA_APPS_RASTERJOB_RESAMPLEJOB_H

#include <string>

#include "gdalraster/geotransformer.h"
#include "gdalraster/grid.h"
#include "gdalraster/warpgrid.h"
#include "rasterjob/rasteroptions.h"

namespace vetra::tool {

struct ResampleOptions : RasterOptions {
    GridRequest oGrid;
};

struct WarpOptions : RasterOptions {
    GeoReference oReference;
    WarpRequest oGrid;
    std::string sLike;      ///< an image whose grid and reference system count; else empty
    double dfError = 0.01;  ///< bound for positions in source pixels; 0 for exact ones
};

/// Resamples an image file block by block. The pixels of the target depend on neither threads nor
/// memory. When it throws, the target's folder is as it was.
///
/// \throws RunError, UsageError, Interrupted and the engine's exceptions.
void RunResample(const ResampleOptions& oOptions);
/// As above, into another reference system or grid.
void RunWarp(const WarpOptions& oOptions);

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_RESAMPLEJOB_H
