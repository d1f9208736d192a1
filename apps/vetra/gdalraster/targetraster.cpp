#include "gdalraster/targetraster.h"

#include <cpl_conv.h>
#include <cpl_string.h>

#include <algorithm>

#include "gdalraster/description.h"
#include "gdalraster/errors.h"
#include "gdalraster/pixeltypes.h"

namespace vetra::tool {

namespace {

constexpr const char* kCannotCreate = "can't create the target";
// So many are written to the file at once, if there is no need to write fewer.
constexpr long long kFewestBytes = 2 * 1024 * 1024;

}  // namespace

TargetRaster::TargetRaster(GDALDriver& oDriver, const std::string& sPath, const TargetPlan& oPlan,
                           SourceRaster& oSource) {
    GdalMessages::ForgetFailures();
    const CPLStringList oOptions =
        CompleteOptions(oDriver, oPlan.oOptions, oSource, oPlan.oGrid, oPlan.eType);
    const int nNumBands = static_cast<int>(oSource.GetBands().size());
    mpoDataset.reset(oDriver.Create(sPath.c_str(), oPlan.oGrid.nCols, oPlan.oGrid.nRows, nNumBands,
                                    ToGdalType(oPlan.eType), oOptions.List()));
    if (!mpoDataset) {
        GdalMessages::Throw(kCannotCreate);
    }
    GdalMessages::ThrowIfFailed(kCannotCreate);
    if (mpoDataset->GetRasterBand(1)->GetRasterDataType() != ToGdalType(oPlan.eType)) {
        throw RunError("the target's format has chosen another pixel type");
    }
    CopyDescription(oSource.GetDataset(), oPlan.oGrid, oPlan.bSameValues, *mpoDataset);
    if (oPlan.oNodata) {
        for (int nBand = 1; nBand <= nNumBands; ++nBand) {
            if (!oSource.GetBands()[static_cast<std::size_t>(nBand) - 1].bAlpha &&
                !oPlan.oNodata->Declare(*mpoDataset->GetRasterBand(nBand))) {
                GdalMessages::Throw("can't store a nodata value in the target");
            }
        }
    }
    if (oPlan.bMaskBand) {
        // In the file itself where the format allows it, and on this thread only.
        const CPLConfigOptionSetter oInternal("GDAL_TIFF_INTERNAL_MASK", "YES", false);
        if (mpoDataset->CreateMaskBand(GMF_PER_DATASET) != CE_None) {
            GdalMessages::Throw("can't store a mask in the target");
        }
        mpoMask = mpoDataset->GetRasterBand(1)->GetMaskBand();
    }
    mpoDataset->GetRasterBand(1)->GetBlockSize(&mnPieceCols, &mnPieceRows);
    mnPixelBytes =
        static_cast<long long>(nNumBands) * gobs::DataTypeAdapter::ByteSize(oPlan.eType) +
        (oPlan.bMaskBand ? 1 : 0);
    GdalMessages::ThrowIfFailed(kCannotCreate);
}

TargetRaster::~TargetRaster() {
    if (mpoDataset) {
        // Nobody wants the pixels that closing would write.
        mpoDataset->MarkSuppressOnClose();
    }
}

bool TargetRaster::EndsWithPieces(const utils::PixelRect& oRect) const {
    const auto Ends = [](int nEnd, int nPiece, int nSize) {
        return nEnd % nPiece == 0 || nEnd == nSize;
    };
    return Ends(oRect.nCol + oRect.nCols, mnPieceCols, mpoDataset->GetRasterXSize()) &&
           Ends(oRect.nRow + oRect.nRows, mnPieceRows, mpoDataset->GetRasterYSize());
}

void TargetRaster::Write(const utils::PixelRect& oRect, BandArrays& oArrays,
                         unsigned char* pabyMask) {
    if (!oArrays.Transfer(*mpoDataset, GF_Write, oRect)) {
        GdalMessages::Throw(GetWriteFailure());
    }
    if (mpoMask != nullptr &&
        mpoMask->RasterIO(GF_Write, oRect.nCol, oRect.nRow, oRect.nCols, oRect.nRows, pabyMask,
                          oRect.nCols, oRect.nRows, GDT_Byte, 0, 0, nullptr) != CE_None) {
        GdalMessages::Throw(GetWriteFailure());
    }
    // Soon, while other steps of the run are at work. Whole pieces are best: a part would be read
    // back and written a second time.
    mnDirtyPixels += oRect.GetNumPix();
    const long long nMostPixels = GDALGetCacheMax64() / 2 / mnPixelBytes;
    if (mnDirtyPixels > nMostPixels ||
        (mnDirtyPixels > std::min(nMostPixels / 2, kFewestBytes / mnPixelBytes) &&
         EndsWithPieces(oRect))) {
        mnDirtyPixels = 0;
        for (GDALRasterBand* poBand : mpoDataset->GetBands()) {
            poBand->FlushCache(false);
        }
        if (mpoMask != nullptr) {
            mpoMask->FlushCache(false);
        }
    }
    GdalMessages::ThrowIfFailed(GetWriteFailure());
}

void TargetRaster::Close() {
    GdalMessages::ForgetFailures();
    mpoDataset->FlushCache(false);
    GdalMessages::ThrowIfFailed(GetWriteFailure());
    mpoDataset.reset();
    GdalMessages::ThrowIfFailed(GetWriteFailure());
}

void CopyRaster(const std::string& sFrom, GDALDriver& oDriver, const std::string& sTo,
                const CPLStringList& oOptions, GDALProgressFunc fnProgress, void* poProgressData) {
    GdalMessages::ForgetFailures();
    const GDALDatasetUniquePtr poFrom(GDALDataset::Open(sFrom.c_str(), GDAL_OF_RASTER));
    if (!poFrom) {
        GdalMessages::Throw(TargetRaster::GetWriteFailure());
    }
    GDALDatasetUniquePtr poTo(oDriver.CreateCopy(sTo.c_str(), poFrom.get(), TRUE, oOptions.List(),
                                                 fnProgress, poProgressData));
    if (!poTo) {
        GdalMessages::Throw(TargetRaster::GetWriteFailure());
    }
    poTo.reset();
    GdalMessages::ThrowIfFailed(TargetRaster::GetWriteFailure());
}

}  // namespace vetra::tool
