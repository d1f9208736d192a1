#ifndef VETRA_APPS_GDALRASTER_BANDARRAYS_H
#define VETRA_APPS_GDALRASTER_BANDARRAYS_H

#include <gdal_priv.h>

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

#include "vetra/base/utils/resample/postfm/bufposblocktfm.h"
#include "vetra/base/utils/resample/resamplebuffer.h"

namespace vetra::tool {

/// Bytes that grow on demand and are never filled.
class ByteArray {
 public:
    unsigned char* Get() { return mpabyBytes.get(); }
    void Reserve(std::size_t nBytes);

 private:
    std::unique_ptr<unsigned char[]> mpabyBytes;
    std::size_t mnBytes = 0;
};

/// The samples of all bands for a rectangle of pixels, as the engine takes them: in one group with
/// a channel per band, or in one group per band.
class BandArrays {
 public:
    /// \param oTypes   type of each band's samples; all the same when the bands form one group
    /// \param bJoined  whether the bands form one group
    BandArrays(std::vector<gobs::NativeDataTypeCode> oTypes, bool bJoined);

    /// Bytes per pixel.
    int GetPixelBytes() const;
    int GetNumGroups() const { return mbJoined ? 1 : static_cast<int>(moTypes.size()); }

    /// Sets the rectangle's size. The samples are lost.
    void Resize(int nCols, int nRows);
    /// A view on a group, which must not outlive the next `Resize`.
    utils::ResampleBuffer GetGroup(int nGroup, unsigned char* pabyMask);

    /// Reads the rectangle from all bands of a dataset, or writes it.
    /// \param oRect  its size must be the one set
    /// \returns false when GDAL reports a failure
    bool Transfer(GDALDataset& oDataset, GDALRWFlag eDirection, const utils::PixelRect& oRect);

 private:
    std::vector<gobs::NativeDataTypeCode> moTypes;
    bool mbJoined;
    int mnCols = 0;
    int mnRows = 0;
    ByteArray moBytes;
    std::vector<std::size_t> moOffsets;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_BANDARRAYS_H
