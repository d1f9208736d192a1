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

class SourceRaster;

/// The samples and the validity of a rectangle of a source.
class SourceBlock {
 public:
    /// \param oSource  must outlive this object
    /// \param bJoined  as for `BandArrays`
    SourceBlock(const SourceRaster& oSource, bool bJoined);

    /// Bytes per pixel for samples and masks.
    int GetPixelBytes() const;
    /// A view on a group with its mask, one byte per pixel, 1 for valid; without one when all
    /// pixels are valid. Holds until the next call.
    utils::ResampleBuffer GetGroup(int nGroup);

 private:
    friend class SourceRaster;

    const SourceRaster* mpoSource;
    utils::PixelRect moRect;
    BandArrays moArrays;
    ByteArray moSharedMask;
    std::vector<ByteArray> moBandMasks;
    ByteArray moNodataMask;
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

    bool HasSharedMask() const { return mpoSharedMask != nullptr; }

    /// What it means that `Read` fails.
    std::string GetReadFailure() const { return "can't read the pixels of the source " + msPath; }
    /// Reads all bands and masks of a rectangle. The image is used by one thread at a time, a block
    /// that was read by any.
    /// \throws RunError when a part can't be read, or GDAL has reported a failure before.
    void Read(const utils::PixelRect& oRect, SourceBlock& oBlock);

 private:
    void ReadMask(GDALRasterBand& oMask, const utils::PixelRect& oRect, ByteArray& oBytes);

    std::string msPath;
    GDALDatasetUniquePtr mpoDataset;
    std::vector<SourceBand> moBands;
    GDALRasterBand* mpoSharedMask = nullptr;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_SOURCERASTER_H
