#include "gdalraster/bandarrays.h"

#include <algorithm>
#include <utility>

namespace vetra::tool {

namespace {

using gobs::DataTypeAdapter;

// Every group starts at a multiple of this, which suits the widest sample.
constexpr std::size_t kAlignment = 64;

}  // namespace

void ByteArray::Reserve(std::size_t nBytes) {
    if (nBytes > mnBytes) {
        mpabyBytes.reset();
        mpabyBytes = std::make_unique_for_overwrite<unsigned char[]>(nBytes);
        mnBytes = nBytes;
    }
}

BandArrays::BandArrays(std::vector<gobs::NativeDataTypeCode> oTypes, bool bJoined)
    : moTypes(std::move(oTypes)), mbJoined(bJoined) {}

int BandArrays::GetPixelBytes() const {
    int nBytes = 0;
    for (const gobs::NativeDataTypeCode eType : moTypes) {
        nBytes += DataTypeAdapter::ByteSize(eType);
    }
    return nBytes;
}

void BandArrays::Resize(int nCols, int nRows) {
    mnCols = nCols;
    mnRows = nRows;
    const std::size_t nPixels = static_cast<std::size_t>(nCols) * static_cast<std::size_t>(nRows);
    std::size_t nBytes = 0;
    moOffsets.clear();
    if (mbJoined) {
        moOffsets.push_back(0);
        nBytes = nPixels * static_cast<std::size_t>(GetPixelBytes());
    } else {
        for (const gobs::NativeDataTypeCode eType : moTypes) {
            moOffsets.push_back(nBytes);
            nBytes += nPixels * static_cast<std::size_t>(DataTypeAdapter::ByteSize(eType));
            nBytes = (nBytes + kAlignment - 1) / kAlignment * kAlignment;
        }
    }
    moBytes.Reserve(nBytes);
}

utils::ResampleBuffer BandArrays::GetGroup(int nGroup, unsigned char* pabyMask) {
    const auto n = static_cast<std::size_t>(nGroup);
    return utils::ResampleBuffer(moTypes[n], mnCols, mnRows,
                                 mbJoined ? static_cast<int>(moTypes.size()) : 1,
                                 moBytes.Get() + moOffsets[n], pabyMask, false);
}

bool BandArrays::Transfer(GDALDataset& oDataset, GDALRWFlag eDirection,
                          const utils::PixelRect& oRect) {
    // The bands' own types: no sample is converted on its way.
    const auto Type = [&](int nBand) { return oDataset.GetRasterBand(nBand)->GetRasterDataType(); };
    const int nNumBands = static_cast<int>(moTypes.size());
    const GSpacing nBytes = DataTypeAdapter::ByteSize(moTypes[0]);
    if (mbJoined) {
        const GSpacing nPixelSpace = nBytes * nNumBands;
        return oDataset.RasterIO(eDirection, oRect.nCol, oRect.nRow, oRect.nCols, oRect.nRows,
                                 moBytes.Get(), oRect.nCols, oRect.nRows, Type(1), nNumBands,
                                 nullptr, nPixelSpace, nPixelSpace * oRect.nCols, nBytes,
                                 nullptr) == CE_None;
    }
    const bool bOneType = std::all_of(moTypes.begin(), moTypes.end(),
                                      [&](auto eType) { return eType == moTypes[0]; });
    if (bOneType && nNumBands > 1) {
        // One call for all bands reads a file with interleaved pixels once.
        const auto nBandSpace = static_cast<GSpacing>(moOffsets[1]);
        return oDataset.RasterIO(eDirection, oRect.nCol, oRect.nRow, oRect.nCols, oRect.nRows,
                                 moBytes.Get(), oRect.nCols, oRect.nRows, Type(1), nNumBands,
                                 nullptr, nBytes, nBytes * oRect.nCols, nBandSpace,
                                 nullptr) == CE_None;
    }
    for (int n = 0; n < nNumBands; ++n) {
        if (oDataset.GetRasterBand(n + 1)->RasterIO(
                eDirection, oRect.nCol, oRect.nRow, oRect.nCols, oRect.nRows,
                moBytes.Get() + moOffsets[static_cast<std::size_t>(n)], oRect.nCols, oRect.nRows,
                Type(n + 1), 0, 0, nullptr) != CE_None) {
            return false;
        }
    }
    return true;
}

}  // namespace vetra::tool
