#ifndef VETRA_APPS_GDALRASTER_TARGETRASTER_H
#define VETRA_APPS_GDALRASTER_TARGETRASTER_H

#include <cpl_string.h>
#include <gdal_priv.h>

#include <optional>
#include <string>
#include <vector>

#include "gdalraster/bandarrays.h"
#include "gdalraster/grid.h"
#include "gdalraster/nodatavalue.h"
#include "gdalraster/sourceraster.h"
#include "gdalraster/targetformat.h"

namespace vetra::tool {

/// What a new image is to be.
struct TargetPlan {
    Grid oGrid;
    gobs::NativeDataTypeCode eType = gobs::eDT_UNKNOWN;
    std::optional<NodataValue> oNodata;
    bool bMaskBand = false;
    bool bSameValues = false;  ///< see `CopyDescription`
    std::vector<std::string> oOptions;
};

/// An image file being written. One that is not closed is abandoned: its maker deletes it.
class TargetRaster {
 public:
    /// Creates the file with the description of \p oSource.
    /// \throws RunError when GDAL can't.
    TargetRaster(GDALDriver& oDriver, const std::string& sPath, const TargetPlan& oPlan,
                 SourceRaster& oSource);
    TargetRaster(const TargetRaster&) = delete;
    TargetRaster& operator=(const TargetRaster&) = delete;
    ~TargetRaster();

    /// What it means that `Write` fails.
    static std::string GetWriteFailure() { return "can't write the target"; }
    /// Columns of the pieces in which the file is written.
    int GetPieceCols() const { return mnPieceCols; }
    /// Writes a rectangle of all bands, and its mask (0 or 255 per pixel) where there is one. Other
    /// threads may read other images meanwhile.
    /// \throws RunError also when GDAL has reported a failure before.
    void Write(const utils::PixelRect& oRect, BandArrays& oArrays, unsigned char* pabyMask);
    /// Writes what is still in memory.
    void Close();

 private:
    // Keeps dirty blocks in GDAL's cache for this object's thread to write. Another thread, that
    // reads, would take them out of the cache to make room and write them then; a block asked for
    // in between would come from the file as it was before.
    struct DirtyBlocksStay {
        DirtyBlocksStay() { GDALRasterBlock::EnterDisableDirtyBlockFlush(); }
        DirtyBlocksStay(const DirtyBlocksStay&) = delete;
        DirtyBlocksStay& operator=(const DirtyBlocksStay&) = delete;
        ~DirtyBlocksStay() { GDALRasterBlock::LeaveDisableDirtyBlockFlush(); }
    };

    bool EndsWithPieces(const utils::PixelRect& oRect) const;

    const DirtyBlocksStay moDirtyBlocksStay;
    GDALDatasetUniquePtr mpoDataset;
    GDALRasterBand* mpoMask = nullptr;
    int mnPieceCols = 0;
    int mnPieceRows = 0;
    // Pixels that may be in dirty blocks, and how many bytes each has.
    long long mnDirtyPixels = 0;
    long long mnPixelBytes = 0;
};

/// Writes a finished image as another format.
/// \param fnProgress  as `GDALProgressFunc`; stops the work by returning FALSE
void CopyRaster(const std::string& sFrom, GDALDriver& oDriver, const std::string& sTo,
                const CPLStringList& oOptions, GDALProgressFunc fnProgress, void* poProgressData);

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_TARGETRASTER_H
