#ifndef VETRA_APPS_GDALRASTER_DESCRIPTION_H
#define VETRA_APPS_GDALRASTER_DESCRIPTION_H

#include <gdal_priv.h>

#include "gdalraster/grid.h"

namespace vetra::tool {

/// Gives the target what the source says of itself and what still holds for its new pixels:
/// reference system, geotransform, ground control points and rational polynomials, the latter three
/// for the new pixel grid; metadata; for each band description, colour interpretation, unit, offset
/// and scale, category names, and with \p bSameValues the colour table.
///
/// A warped target has reference system and geotransform of its grid, and neither points nor
/// polynomials.
///
/// What would no longer hold is left out: statistics, the declared tuple of nodata values (the
/// target gets a mask for it), print resolution and image size, geolocation arrays, and the domains
/// that describe the source's file and not its image.
///
/// What the format of the target refuses becomes a warning.
///
/// \param bSameValues  whether the target has no values that the source doesn't have
void CopyDescription(GDALDataset& oSource, const Grid& oGrid, bool bSameValues,
                     GDALDataset& oTarget);

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_DESCRIPTION_H
