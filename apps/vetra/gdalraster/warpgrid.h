#ifndef VETRA_APPS_GDALRASTER_WARPGRID_H
#define VETRA_APPS_GDALRASTER_WARPGRID_H

#include <gdal_priv.h>

#include <array>
#include <optional>
#include <string>
#include <vector>

#include "gdalraster/geotransformer.h"
#include "gdalraster/grid.h"

namespace vetra::tool {

/// How a user gives the grid of a warped target. What is absent follows from the source.
struct WarpRequest {
    std::optional<std::array<double, 2>> oResolution;
    std::optional<std::array<int, 2>> oSize;
    std::optional<std::array<double, 4>> oExtent;  ///< least x and y, then greatest x and y
};

/// A grid in the transformer's reference system, its upper left pixel at the extent's corner. An
/// extent is kept; a resolution too, and rounds the extent to whole pixels, at its right and lower
/// sides. Neither size nor resolution: that of the source in the middle of the target.
/// \throws RunError for a target with more pixels than a file can hold.
Grid PlanWarpGrid(GeoTransformer& oTransformer, const WarpRequest& oRequest);

/// The grid of another image, and its reference system as text.
/// \throws RunError when it has no geotransform.
Grid ReadGrid(const std::string& sPath, std::string& sCrs);

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_WARPGRID_H
