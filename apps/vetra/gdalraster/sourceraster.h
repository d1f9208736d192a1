#ifndef VETRA_APPS_GDALRASTER_SOURCERASTER_H
#define VETRA_APPS_GDALRASTER_SOURCERASTER_H

#include <gdal_priv.h>

#include <optional>
#include <string>
#include <vector>

#include "gdalraster/bandarrays.h"
#include "gdalraster/nodatavalue.h"

namespace vetra::tool {

struct SourceBand {
    gobs::NativeDataTypeCode eType;
    bool bAlpha;
    /// Absent also where no sample can have the declared value.
    std::optional<NodataValue> oNodata;
    /// The band's own mask, null when it has none.
    GDALRasterBand* poMask;
};

/// The source image, and which of its pixels are valid.
///
/// A pixel of a band is valid when nothing speaks against it: neither a mask band of the image, nor
/// an alpha of 0, nor the band's own mask, nor the band's nodata value. The alpha band is a band
/// like the others, without a nodata value.
class SourceRaster {
 public:
    /// \param oNodata  replaces the nodata values that the bands declare
    /// \throws RunError when the file can't be opened or holds no image of a known type.
    SourceRaster(const std::string& sPath, const std::optional<NodataValue>& oNodata);

    GDALDataset& GetDataset() { return *mpoDataset; }
    int GetNumCols() const { return mpoDataset->GetRasterXSize(); }
    int GetNumRows() const { return mpoDataset->GetRasterYSize(); }
    const std::vector<SourceBand>& GetBands() const { return moBands; }
    bool HasAlpha() const;
    /// Whether validity can only be kept by a mask band.
    bool NeedsMaskBand() const { return mpoSharedMask != nullptr && !HasAlpha(); }
    /// Whether one validity mask holds for all bands.
    bool HasOneMask() const;
    /// Whether a band's values are numbers of palette entries.
    bool HasPalette() const;
    /// Whether the path names one of the files that the image consists of.
    bool Owns(const std::string& sPath);

    /// Bytes per pixel that `Read` and `GetMask` keep for masks.
    int GetMaskBytes() const;
    /// Reads all bands and masks of a rectangle.
    /// \throws RunError when a part can't be read.
    void Read(const utils::PixelRect& oRect, BandArrays& oArrays);
    /// The mask of a group of the arrays of the last `Read`, one byte per pixel, 1 for valid; null
    /// when all are valid. Holds until the next call.
    unsigned char* GetMask(int nGroup, BandArrays& oArrays);

 private:
    void ReadMask(GDALRasterBand& oMask, unsigned char* pabyMask);
    [[noreturn]] void ThrowUnreadable() const;

    std::string msPath;
    GDALDatasetUniquePtr mpoDataset;
    std::vector<SourceBand> moBands;
    GDALRasterBand* mpoSharedMask = nullptr;
    utils::PixelRect moRect;
    ByteArray moSharedMask;
    ByteArray moBandMask;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_SOURCERASTER_H
