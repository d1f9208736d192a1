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

}  // namespace

SourceRaster::SourceRaster(const std::string& sPath, const std::optional<NodataValue>& oNodata)
    : msPath(sPath) {
    GdalMessages::ForgetFailures();
    // A raw file that is too short would else be filled up with zeros.
    const CPLConfigOptionSetter oCheckSize("RAW_CHECK_FILE_SIZE", "YES", true);
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

int SourceRaster::GetMaskBytes() const {
    return (mpoSharedMask != nullptr ? 1 : 0) + (HasOneMask() ? 0 : 1);
}

void SourceRaster::Read(const utils::PixelRect& oRect, BandArrays& oArrays) {
    moRect = oRect;
    oArrays.Resize(oRect.nCols, oRect.nRows);
    GdalMessages::ForgetFailures();
    if (!oArrays.Transfer(*mpoDataset, GF_Read, oRect)) {
        ThrowUnreadable();
    }
    if (mpoSharedMask != nullptr) {
        moSharedMask.Reserve(static_cast<std::size_t>(oRect.GetNumPix()));
        ReadMask(*mpoSharedMask, moSharedMask.Get());
    }
    if (!GdalMessages::GetFailure().empty()) {
        ThrowUnreadable();
    }
}

unsigned char* SourceRaster::GetMask(int nGroup, BandArrays& oArrays) {
    const SourceBand& oBand = moBands[static_cast<std::size_t>(nGroup)];
    unsigned char* pabyShared = mpoSharedMask != nullptr ? moSharedMask.Get() : nullptr;
    if (!oBand.oNodata && oBand.poMask == nullptr) {
        return pabyShared;
    }
    const auto nNumPix = static_cast<std::size_t>(moRect.GetNumPix());
    moBandMask.Reserve(nNumPix);
    unsigned char* pabyMask = moBandMask.Get();
    if (oBand.poMask != nullptr) {
        ReadMask(*oBand.poMask, pabyMask);
    } else {
        std::memset(pabyMask, 1, nNumPix);
    }
    if (pabyShared != nullptr) {
        std::transform(pabyMask, pabyMask + nNumPix, pabyShared, pabyMask,
                       [](unsigned char a, unsigned char b) { return std::min(a, b); });
    }
    if (oBand.oNodata) {
        oBand.oNodata->Mask(oBand.eType, oArrays.GetGroup(nGroup, nullptr).GetBuf(),
                            moRect.GetNumPix(), pabyMask);
    }
    return pabyMask;
}

void SourceRaster::ReadMask(GDALRasterBand& oMask, unsigned char* pabyMask) {
    if (oMask.RasterIO(GF_Read, moRect.nCol, moRect.nRow, moRect.nCols, moRect.nRows, pabyMask,
                       moRect.nCols, moRect.nRows, GDT_Byte, 0, 0, nullptr) != CE_None) {
        ThrowUnreadable();
    }
    // Masks of files hold 0 and 255 or anything between; the engine knows 0 and 1.
    const long long nNumPix = moRect.GetNumPix();
    for (long long n = 0; n < nNumPix; ++n) {
        pabyMask[n] = pabyMask[n] != 0 ? 1 : 0;
    }
}

void SourceRaster::ThrowUnreadable() const {
    GdalMessages::Throw("can't read the pixels of the source " + msPath);
}

}  // namespace vetra::tool
