#include "gdalraster/overviews.h"

#include <cpl_conv.h>
#include <gdal_priv.h>

#include <algorithm>
#include <vector>

#include "gdalraster/errors.h"

namespace vetra::tool {

namespace {

constexpr int kLargestLast = 256;
constexpr const char* kCannotAdd = "can't add overviews";

GDALDatasetUniquePtr Open(const std::string& sPath, unsigned nFlags) {
    GDALDatasetUniquePtr poImage(GDALDataset::Open(sPath.c_str(), GDAL_OF_RASTER | nFlags));
    if (!poImage) {
        GdalMessages::Throw(kCannotAdd);
    }
    return poImage;
}

void CopyRows(GDALRasterBand& oFrom, GDALRasterBand& oTo, int nRow, int nRows,
              std::vector<unsigned char>& vbyRows) {
    const GDALDataType eType = oFrom.GetRasterDataType();
    const int nCols = oFrom.GetXSize();
    vbyRows.resize(static_cast<std::size_t>(nCols) * static_cast<std::size_t>(nRows) *
                   static_cast<std::size_t>(GDALGetDataTypeSizeBytes(eType)));
    for (const auto& [poBand, eDirection] : {std::pair(&oFrom, GF_Read), {&oTo, GF_Write}}) {
        if (poBand->RasterIO(eDirection, 0, nRow, nCols, nRows, vbyRows.data(), nCols, nRows, eType,
                             0, 0, nullptr) != CE_None) {
            GdalMessages::Throw(kCannotAdd);
        }
    }
}

void Close(GDALDatasetUniquePtr poImage) {
    poImage->FlushCache(false);
    poImage.reset();
    GdalMessages::ThrowIfFailed(kCannotAdd);
}

}  // namespace

int AddEmptyOverviews(const std::string& sPath) {
    GdalMessages::ForgetFailures();
    const CPLConfigOptionSetter oInternal("GDAL_TIFF_INTERNAL_MASK", "YES", false);
    GDALDatasetUniquePtr poImage = Open(sPath, GDAL_OF_UPDATE);
    std::vector<int> vnFactors;
    const int nLargest = std::max(poImage->GetRasterXSize(), poImage->GetRasterYSize());
    for (long long nFactor = 2; (nLargest - 1) / (nFactor / 2) + 1 > kLargestLast; nFactor *= 2) {
        vnFactors.push_back(static_cast<int>(nFactor));
    }
    if (vnFactors.empty()) {
        return 0;
    }
    const int nNumLevels = static_cast<int>(vnFactors.size());
    if (GDALBuildOverviews(GDALDataset::ToHandle(poImage.get()), "NONE", nNumLevels,
                           vnFactors.data(), 0, nullptr, GDALDummyProgress, nullptr) != CE_None) {
        GdalMessages::Throw(kCannotAdd);
    }
    Close(std::move(poImage));
    return nNumLevels;
}

void FillOverview(const std::string& sPath, int nLevel, const std::string& sFrom,
                  void (*fnCheck)()) {
    GdalMessages::ForgetFailures();
    const CPLConfigOptionSetter oInternal("GDAL_TIFF_INTERNAL_MASK", "YES", false);
    const GDALDatasetUniquePtr poFrom = Open(sFrom, 0);
    GDALDatasetUniquePtr poImage = Open(sPath, GDAL_OF_UPDATE);
    const auto Overview = [&](int nBand) {
        GDALRasterBand* poBand = poImage->GetRasterBand(nBand)->GetOverview(nLevel);
        if (poBand == nullptr || poBand->GetXSize() != poFrom->GetRasterXSize() ||
            poBand->GetYSize() != poFrom->GetRasterYSize()) {
            throw RunError(std::string(kCannotAdd) + ": the format has chosen another size");
        }
        return poBand;
    };
    GDALRasterBand& oFromMask = *poFrom->GetRasterBand(1)->GetMaskBand();
    const bool bMask = poFrom->GetRasterBand(1)->GetMaskFlags() == GMF_PER_DATASET;
    std::vector<unsigned char> vbyRows;
    int nCols = 0;
    int nPieceRows = 0;
    Overview(1)->GetBlockSize(&nCols, &nPieceRows);
    for (int nRow = 0; nRow < poFrom->GetRasterYSize(); nRow += nPieceRows) {
        fnCheck();
        const int nRows = std::min(nPieceRows, poFrom->GetRasterYSize() - nRow);
        for (int nBand = 1; nBand <= poFrom->GetRasterCount(); ++nBand) {
            CopyRows(*poFrom->GetRasterBand(nBand), *Overview(nBand), nRow, nRows, vbyRows);
        }
        if (bMask) {
            CopyRows(oFromMask, *Overview(1)->GetMaskBand(), nRow, nRows, vbyRows);
        }
    }
    Close(std::move(poImage));
}

}  // namespace vetra::tool
