#ifndef VETRA_APPS_GDALRASTER_TARGETFORMAT_H
#define VETRA_APPS_GDALRASTER_TARGETFORMAT_H

#include <cpl_string.h>
#include <gdal_priv.h>

#include <string>
#include <vector>

#include "gdalraster/grid.h"
#include "gdalraster/sourceraster.h"

namespace vetra::tool {

/// A file format that can be written.
class TargetFormat {
 public:
    /// \param sFormat  short name of the driver; empty to go by the extension of \p sPath, with
    ///                 GeoTIFF for an extension that belongs to no driver
    /// \throws UsageError when there is no such driver or it can't write.
    TargetFormat(const std::string& sFormat, const std::string& sPath);

    GDALDriver& GetDriver() const { return *mpoDriver; }
    std::string GetName() const { return mpoDriver->GetDescription(); }
    /// Whether the driver writes whole images only, so that the run writes another file first.
    bool IsCopyOnly() const { return mbCopyOnly; }
    /// Tells before the run what only its end would show.
    /// \throws RunError when the format doesn't hold pixels of this type.
    void CheckHolds(gobs::NativeDataTypeCode eType) const;
    /// The method of the target's overviews, empty when it has none. A cloud optimized GeoTIFF has
    /// them unless its options speak of them.
    /// \param sWanted      what the user wants; may be empty
    /// \param bSameValues  whether overviews must not have values that the image doesn't have
    /// \throws UsageError when overviews are wanted in another format.
    std::string ChooseOverviews(const std::string& sWanted,
                                const std::vector<std::string>& oUserOptions,
                                bool bSameValues) const;
    /// Adds to a user's options what a copy should have beyond them.
    CPLStringList CompleteCopyOptions(const std::vector<std::string>& oUserOptions) const;

 private:
    GDALDriver* mpoDriver;
    bool mbCopyOnly;
};

/// The driver of the file that a run writes first where the format is copy-only.
GDALDriver& GetStageDriver();

/// Adds to the options of a user what a new file of this driver should have beyond them.
CPLStringList CompleteOptions(GDALDriver& oDriver, const std::vector<std::string>& oUserOptions,
                              SourceRaster& oSource, const Grid& oGrid,
                              gobs::NativeDataTypeCode eType);

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_TARGETFORMAT_H
