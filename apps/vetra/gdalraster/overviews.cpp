#include "gdalraster/overviews.h"

#include <cpl_conv.h>
#include <gdal_priv.h>

#include <algorithm>
#include <vector>

#include "gdalraster/errors.h"
#include "vetra/base/utils/resample/postfm/bufposblocktfm.h"

namespace vetra::tool {

namespace {

constexpr int kLargestLast = 256;
constexpr int kPiecesAtOnce = 16;
constexpr const char* kCannotAdd = "can't add overviews";

GDALDatasetUniquePtr Open(const std::string& sPath, unsigned nFlags) {
    GDALDatasetUniquePtr poImage(GDALDataset::Open(sPath.c_str(), GDAL_OF_RASTER | nFlags));
    if (!poImage) {
        GdalMessages::Throw(kCannotAdd);
    }
    return poImage;
}

void CopyPixels(GDALRasterBand& oFrom, GDALRasterBand& oTo, const utils::PixelRect& oRect,
                std::vector<unsigned char>& vbyPixels) {
    const GDALDataType eType = oFrom.GetRasterDataType();
    vbyPixels.resize(static_cast<std::size_t>(oRect.GetNumPix()) *
                     static_cast<std::size_t>(GDALGetDataTypeSizeBytes(eType)));
    for (const auto& [poBand, eDirection] : {std::pair(&oFrom, GF_Read), {&oTo, GF_Write}}) {
        if (poBand->RasterIO(eDirection, oRect.nCol, oRect.nRow, oRect.nCols, oRect.nRows,
                             vbyPixels.data(), oRect.nCols, oRect.nRows, eType, 0, 0,
                             nullptr) != CE_None) {
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
    std::vector<unsigned char> vbyPixels;
    // Pieces as they are in the file, some side by side.
    int nAcross = 0;
    int nDown = 0;
    Overview(1)->GetBlockSize(&nAcross, &nDown);
    nAcross *= kPiecesAtOnce;
    const int nCols = poFrom->GetRasterXSize();
    const int nRows = poFrom->GetRasterYSize();
    utils::PixelRect oRect;
    for (oRect.nRow = 0; oRect.nRow < nRows; oRect.nRow += oRect.nRows) {
        oRect.nRows = std::min(nDown, nRows - oRect.nRow);
        for (oRect.nCol = 0; oRect.nCol < nCols; oRect.nCol += oRect.nCols) {
            oRect.nCols = std::min(nAcross, nCols - oRect.nCol);
            fnCheck();
            for (int nBand = 1; nBand <= poFrom->GetRasterCount(); ++nBand) {
                CopyPixels(*poFrom->GetRasterBand(nBand), *Overview(nBand), oRect, vbyPixels);
            }
            if (bMask) {
                CopyPixels(oFromMask, *Overview(1)->GetMaskBand(), oRect, vbyPixels);
            }
        }
    }
    Close(std::move(poImage));
}

}  // namespace vetra::tool
