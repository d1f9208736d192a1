#include "gdalraster/sourceraster.h"

#include <cpl_conv.h>
#include <cpl_string.h>

#include <algorithm>
#include <cstring>
#include <filesystem>
#include <system_error>

#include "gdalraster/errors.h"
#include "gdalraster/pixeltypes.h"

namespace vetra::tool {

namespace {

bool IsAlpha(GDALRasterBand& oBand) { return oBand.GetColorInterpretation() == GCI_AlphaBand; }

std::vector<gobs::NativeDataTypeCode> GetTypes(const SourceRaster& oSource) {
    std::vector<gobs::NativeDataTypeCode> oTypes;
    for (const SourceBand& oBand : oSource.GetBands()) {
        oTypes.push_back(oBand.eType);
    }
    return oTypes;
}

}  // namespace

SourceBlock::SourceBlock(const SourceRaster& oSource, bool bJoined)
    : mpoSource(&oSource),
      moArrays(GetTypes(oSource), bJoined),
      moBandMasks(oSource.GetBands().size()) {}

int SourceBlock::GetPixelBytes() const {
    int nBytes = moArrays.GetPixelBytes() + (mpoSource->HasSharedMask() ? 1 : 0);
    bool bNodata = false;
    for (const SourceBand& oBand : mpoSource->GetBands()) {
        nBytes += oBand.poMask != nullptr ? 1 : 0;
        bNodata = bNodata || oBand.oNodata.has_value();
    }
    return nBytes + (bNodata ? 1 : 0);
}

utils::ResampleBuffer SourceBlock::GetGroup(int nGroup) {
    const auto n = static_cast<std::size_t>(nGroup);
    const SourceBand& oBand = mpoSource->GetBands()[n];
    unsigned char* pabyShared = mpoSource->HasSharedMask() ? moSharedMask.Get() : nullptr;
    if (!oBand.oNodata && oBand.poMask == nullptr) {
        return moArrays.GetGroup(nGroup, pabyShared);
    }
    const auto nNumPix = static_cast<std::size_t>(moRect.GetNumPix());
    unsigned char* pabyMask = moBandMasks[n].Get();
    if (oBand.poMask == nullptr) {
        moNodataMask.Reserve(nNumPix);
        pabyMask = moNodataMask.Get();
        std::memset(pabyMask, 1, nNumPix);
    }
    if (pabyShared != nullptr) {
        std::transform(pabyMask, pabyMask + nNumPix, pabyShared, pabyMask,
                       [](unsigned char a, unsigned char b) { return std::min(a, b); });
    }
    const utils::ResampleBuffer oGroup = moArrays.GetGroup(nGroup, pabyMask);
    if (oBand.oNodata) {
        oBand.oNodata->Mask(oBand.eType, oGroup.GetBuf(), moRect.GetNumPix(), pabyMask);
    }
    return oGroup;
}

SourceRaster::SourceRaster(const std::string& sPath, const std::optional<NodataValue>& oNodata)
    : msPath(sPath) {
    GdalMessages::ForgetFailures();
    // A raw file that is too short would else be filled up with zeros.
    const CPLConfigOptionSetter oCheckSize("RAW_CHECK_FILE_SIZE", "YES", true);
    // Blocks of an image are read about once each: its pixels need no stay in GDAL's cache, where
    // GDAL can do without. But what comes over a network is better read once.
    const bool bLocal = sPath.compare(0, 4, "/vsi") != 0;
    const CPLConfigOptionSetter oPastCache("GTIFF_DIRECT_IO", bLocal ? "YES" : nullptr, true);
    mpoDataset.reset(GDALDataset::Open(sPath.c_str(), GDAL_OF_RASTER | GDAL_OF_VERBOSE_ERROR));
    if (!mpoDataset) {
        // Most drivers name the file themselves.
        const std::string sFailure = GdalMessages::GetFailure();
        const bool bNamed = sFailure.find(sPath) != std::string::npos;
        GdalMessages::Throw(bNamed ? "can't open the source" : "can't open the source " + sPath);
    }
    const int nNumBands = mpoDataset->GetRasterCount();
    if (nNumBands == 0) {
        const bool bSeveral = mpoDataset->GetMetadata("SUBDATASETS") != nullptr;
        throw RunError("the source " + sPath + " holds no image of its own" +
                       (bSeveral ? ": name one of its subdatasets, which gdalinfo lists" : ""));
    }
    for (int nBand = 1; nBand <= nNumBands; ++nBand) {
        GDALRasterBand& oBand = *mpoDataset->GetRasterBand(nBand);
        SourceBand oInfo{GetPixelType(oBand), IsAlpha(oBand), std::nullopt, nullptr};
        const int nFlags = oBand.GetMaskFlags();
        if (!oInfo.bAlpha) {
            oInfo.oNodata = oNodata ? oNodata : NodataValue::FromBand(oBand);
            if (oInfo.oNodata && !oInfo.oNodata->Fits(oInfo.eType)) {
                oInfo.oNodata.reset();
            }
        }
        const bool bOverridden = oNodata && (nFlags & GMF_NODATA) != 0;
        if ((nFlags & GMF_PER_DATASET) != 0 && !bOverridden) {
            mpoSharedMask = oBand.GetMaskBand();
        } else if (nFlags == 0) {
            oInfo.poMask = oBand.GetMaskBand();
        }
        moBands.push_back(oInfo);
    }
    if (mpoSharedMask == nullptr && nNumBands == 1 && moBands[0].bAlpha) {
        // An image of alpha alone: there is nothing that it could mask.
        moBands[0].bAlpha = false;
    }
}

bool SourceRaster::HasAlpha() const {
    return std::any_of(moBands.begin(), moBands.end(), [](const auto& o) { return o.bAlpha; });
}

bool SourceRaster::HasOneMask() const {
    return std::all_of(moBands.begin(), moBands.end(),
                       [](const auto& o) { return !o.oNodata && o.poMask == nullptr; });
}

bool SourceRaster::HasPalette() const {
    for (int nBand = 1; nBand <= mpoDataset->GetRasterCount(); ++nBand) {
        GDALRasterBand& oBand = *mpoDataset->GetRasterBand(nBand);
        if (oBand.GetColorInterpretation() == GCI_PaletteIndex &&
            oBand.GetColorTable() != nullptr) {
            return true;
        }
    }
    return false;
}

bool SourceRaster::Owns(const std::string& sPath) {
    const auto IsSame = [&](const char* pszFile) {
        std::error_code oError;
        return sPath == pszFile || std::filesystem::equivalent(sPath, pszFile, oError);
    };
    const CPLStringList oFiles(mpoDataset->GetFileList());
    bool bOwns = IsSame(msPath.c_str());
    for (int n = 0; n < oFiles.size() && !bOwns; ++n) {
        bOwns = IsSame(oFiles[n]);
    }
    return bOwns;
}

void SourceRaster::Read(const utils::PixelRect& oRect, SourceBlock& oBlock) {
    oBlock.moRect = oRect;
    oBlock.moArrays.Resize(oRect.nCols, oRect.nRows);
    if (!oBlock.moArrays.Transfer(*mpoDataset, GF_Read, oRect)) {
        GdalMessages::Throw(GetReadFailure());
    }
    if (mpoSharedMask != nullptr) {
        ReadMask(*mpoSharedMask, oRect, oBlock.moSharedMask);
    }
    for (std::size_t n = 0; n < moBands.size(); ++n) {
        if (moBands[n].poMask != nullptr) {
            ReadMask(*moBands[n].poMask, oRect, oBlock.moBandMasks[n]);
        }
    }
    GdalMessages::ThrowIfFailed(GetReadFailure());
}

void SourceRaster::ReadMask(GDALRasterBand& oMask, const utils::PixelRect& oRect,
                            ByteArray& oBytes) {
    const long long nNumPix = oRect.GetNumPix();
    oBytes.Reserve(static_cast<std::size_t>(nNumPix));
    unsigned char* pabyMask = oBytes.Get();
    if (oMask.RasterIO(GF_Read, oRect.nCol, oRect.nRow, oRect.nCols, oRect.nRows, pabyMask,
                       oRect.nCols, oRect.nRows, GDT_Byte, 0, 0, nullptr) != CE_None) {
        GdalMessages::Throw(GetReadFailure());
    }
    // Masks of files hold 0 and 255 or anything between; the engine knows 0 and 1.
    for (long long n = 0; n < nNumPix; ++n) {
        pabyMask[n] = pabyMask[n] != 0 ? 1 : 0;
    }
}

}  // namespace vetra::tool
