#include "rasterjob/blockrun.h"

#include <algorithm>
#include <cstring>

#include "methods.h"
#include "rasterjob/interrupt.h"
#include "vetra/base/utils/resample/resample.h"

namespace vetra::tool {

BlockRun::BlockRun(const RunPlan& oPlan, const SourceRaster& oSource)
    : moPlan(oPlan),
      moSource(oSource),
      moSrc(oSource, oPlan.bJoined),
      moTgt(std::vector(oSource.GetBands().size(), oPlan.oTarget.eType), oPlan.bJoined) {
    moAlphaInfo = oPlan.poResampler->GetResampleInfo();
    moInfo = moAlphaInfo;
    if (oSource.HasAlpha() && !oPlan.bJoined) {
        moAlphaInfo.mbClampBgd = false;
        moAlphaInfo.mdfOutBgd = 0.0;
    }
}

long long BlockRun::GetTgtPixelBytes() const {
    return moTgt.GetPixelBytes() + (NeedsOutcome() ? 1 : 0) + (moPlan.bFillApart ? 1 : 0) +
           (moPlan.oTarget.bMaskBand ? 1 : 0);
}

void BlockRun::Resample() {
    const utils::PixelRect& oRect = moMapped.oBlock.oTarget;
    const auto nNumPix = static_cast<std::size_t>(oRect.GetNumPix());
    moTgt.Resize(oRect.nCols, oRect.nRows);
    if (NeedsOutcome()) {
        moOutcome.Reserve(nNumPix);
    }
    if (moPlan.oTarget.bMaskBand) {
        moMask.Reserve(nNumPix);
        std::fill_n(moMask.Get(), nNumPix, static_cast<unsigned char>(0));
    }
    for (int nGroup = 0; nGroup < moTgt.GetNumGroups(); ++nGroup) {
        ThrowIfInterrupted();
        RunGroup(nGroup);
    }
}

long long BlockRun::Write(TargetRaster& oTarget) {
    oTarget.Write(moMapped.oBlock.oTarget, moTgt, moMask.Get());
    return moMapped.oBlock.oTarget.GetNumPix();
}

bool BlockRun::NeedsOutcome() const {
    return moPlan.oTarget.bMaskBand || moPlan.bExactNodata || moPlan.bFillApart;
}

const unsigned char* BlockRun::FillApart(const utils::ResampleBuffer& oSrc, int nGroup,
                                         utils::ResampleInfo oInfo) {
    const auto nNumPix = static_cast<std::size_t>(moMapped.oBlock.oTarget.GetNumPix());
    oInfo.meMethod = GetPlainTwin(oInfo.meMethod) == oInfo.meMethod ? eRM_NEAR : eRM_SQNEAR;
    unsigned char* pabyRequest = moOutcome.Get();
    if (std::memchr(pabyRequest, utils::ePO_BACKGROUND, nNumPix) == nullptr) {
        return pabyRequest;
    }
    std::replace_if(
        pabyRequest, pabyRequest + nNumPix,
        [](unsigned char n) { return n != utils::ePO_BACKGROUND; }, utils::ePO_UNTOUCHED);
    std::replace(pabyRequest, pabyRequest + nNumPix,
                 static_cast<unsigned char>(utils::ePO_BACKGROUND),
                 static_cast<unsigned char>(utils::ePO_NEAREST));
    moFilled.Reserve(nNumPix);
    utils::ResampleBuffer oTgt = moTgt.GetGroup(nGroup, pabyRequest);
    utils::Resample(oSrc, oTgt, *moMapped.oUnmoved, oInfo, moFilled.Get());
    return moFilled.Get();
}

void BlockRun::RunGroup(int nGroup) {
    const long long nNumPix = moMapped.oBlock.oTarget.GetNumPix();
    const bool bAlpha = moSource.GetBands()[static_cast<std::size_t>(nGroup)].bAlpha;
    const utils::ResampleInfo& oInfo = bAlpha ? moAlphaInfo : moInfo;
    const utils::ResampleBuffer oSrc = moSrc.GetGroup(nGroup);
    utils::ResampleBuffer oTgt = moTgt.GetGroup(nGroup, nullptr);
    if (!NeedsOutcome()) {
        utils::Resample(oSrc, oTgt, *moMapped.oTfm, oInfo);
        return;
    }
    utils::Resample(oSrc, oTgt, *moMapped.oTfm, oInfo, moOutcome.Get());
    const unsigned char* pabyOutcome =
        moPlan.bFillApart ? FillApart(oSrc, nGroup, oInfo) : moOutcome.Get();
    if (moPlan.bExactNodata && !bAlpha) {
        moPlan.oTarget.oNodata->StoreBackground(oTgt.GetDatatype(), pabyOutcome, nNumPix,
                                                oTgt.GetNumChan(), oTgt.GetBuf());
    }
    if (moPlan.oTarget.bMaskBand) {
        // A pixel is valid when one of its bands is.
        unsigned char* pabyMask = moMask.Get();
        for (long long n = 0; n < nNumPix; ++n) {
            pabyMask[n] = pabyOutcome[n] != utils::ePO_BACKGROUND ? 255 : pabyMask[n];
        }
    }
}

}  // namespace vetra::tool
