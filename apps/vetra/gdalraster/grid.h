#ifndef VETRA_APPS_GDALRASTER_GRID_H
#define VETRA_APPS_GDALRASTER_GRID_H

#include <gdal_priv.h>
#include <ogr_spatialref.h>

#include <array>
#include <memory>
#include <optional>

namespace vetra::tool {

/// How a user gives the size of the target.
struct GridRequest {
    enum Kind {
        eGK_SIZE,        ///< columns and rows
        eGK_SCALE,       ///< target pixels per source pixel
        eGK_RESOLUTION,  ///< pixel size in georeferenced units
        eGK_FACTOR,      ///< source pixels per target pixel
    };
    Kind eKind = eGK_SIZE;
    double dfX = 1.0;
    double dfY = 1.0;
};

/// The target's pixels. Without a reference system of their own they are those of the source,
/// coarser or finer, from the same upper left corner.
struct Grid {
    int nCols = 0;
    int nRows = 0;
    double dfColScale = 1.0;  ///< source columns per target column
    double dfRowScale = 1.0;
    std::optional<std::array<double, 6>> oGeoTransform;
    /// That of a warped target; it may be empty. Scales mean nothing then.
    std::shared_ptr<const OGRSpatialReference> poCrs;

    /// A pixel-edge column of the source, counted in target columns; rows likewise.
    double ToTargetCol(double dfSrcCol) const { return dfSrcCol / dfColScale; }
    double ToTargetRow(double dfSrcRow) const { return dfSrcRow / dfRowScale; }
};

/// Size and scale cover the source exactly; a scale rounds to whole pixels, at least one. A
/// resolution and a factor are kept to the last digit: columns and rows are rounded so that every
/// target pixel has its centre inside the source, which leaves out, or reaches over, at most half a
/// target pixel.
/// \throws RunError for a target without pixels or with more than a file can hold, and for a
///         resolution where the source has no georeference.
Grid PlanGrid(GDALDataset& oSource, const GridRequest& oRequest);

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_GRID_H
