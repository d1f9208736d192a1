#ifndef VETRA_APPS_GDALRASTER_OVERVIEWS_H
#define VETRA_APPS_GDALRASTER_OVERVIEWS_H

#include <string>

namespace vetra::tool {

/// Gives a GeoTIFF overviews without pixels, in the file: each half as large as the one before,
/// rounded up, until one has no more than 256 columns and rows. Masks get them too.
/// \returns how many
/// \throws RunError
int AddEmptyOverviews(const std::string& sPath);

/// Copies an image and its mask into an overview of the same size.
/// \param nLevel   number of the overview, from 0
/// \param fnCheck  called now and then; may throw
/// \throws RunError
void FillOverview(const std::string& sPath, int nLevel, const std::string& sFrom,
                  void (*fnCheck)());

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_OVERVIEWS_H
