#include "vetra/base/utils/resample/engine/run.h"

#include <algorithm>
#include <cstring>

namespace vetra::utils::engine {

namespace {

constexpr int kMostTabulatedCols = 1 << 20;

}  // namespace

unsigned SetOfModes(const unsigned char* pabyMode, int nPix) {
    // Mostly they are all the same: every byte equals the one behind it.
    if (std::memcmp(pabyMode, pabyMode + 1, static_cast<std::size_t>(nPix) - 1) == 0) {
        return 1u << pabyMode[0];
    }
    unsigned nModes = 0;
    for (int nMode = 0; nMode < 4; ++nMode) {
        if (std::memchr(pabyMode, nMode, static_cast<std::size_t>(nPix)) != nullptr) {
            nModes |= 1u << nMode;
        }
    }
    return nModes;
}
Run::Run(const Task& oTask)
    : moTask(oTask),
      moMethod(*oTask.poMethod),
      moStages(GetStages(oTask.oOptions.eLevel)),
      moPositions(*oTask.poTfm),
      moModes(moMethod.eRule, oTask.eFillAction),
      mbOpen(oTask.pabySrcMask == nullptr && oTask.pabyTgtMask == nullptr),
      mnPitch(static_cast<long long>(oTask.nSrcCols) * oTask.nChan),
      mnSrcBytes(kSampleBytes[oTask.nSrcType]),
      mnTgtBytes(kSampleBytes[oTask.nTgtType]),
      mnChannels(moMethod.nChannels) {
    const Window& oWindow = moMethod.oWindow;
    moLimits.dfFitColFirst = -static_cast<double>(oWindow.nColOff);
    moLimits.dfFitRowFirst = -static_cast<double>(oWindow.nRowOff);
    moLimits.dfFitColLast = static_cast<double>(oTask.nSrcCols) - oWindow.nCols - oWindow.nColOff;
    moLimits.dfFitRowLast = static_cast<double>(oTask.nSrcRows) - oWindow.nRows - oWindow.nRowOff;
    if (moMethod.eValues == eVR_NONE) {
        moLimits.dfFitColLast = moLimits.dfFitColFirst - 1.0;  // nothing to fit
    }
    moLimits.dfNearColLast = oTask.nSrcCols - 1.0;
    moLimits.dfNearRowLast = oTask.nSrcRows - 1.0;
    moLimits.bAnchorNearest = oWindow.bAnchorNearest;
    moLimits.dfColOff = oWindow.nColOff;
    moLimits.dfRowOff = oWindow.nRowOff;

    const bool bNearest = moMethod.eRule == ModeRule::eNearestSample;
    for (unsigned char nClass = 0; nClass < 4; ++nClass) {
        mabyModeOfClass[nClass] = moModes.Get(ePO_INTERPOLATED, nClass);
    }
    mnFallback = mabyModeOfClass[kClassNear];
    if (oTask.oOptions.ePath != Path::ePlain) {
        if (bNearest && !moMethod.bNonNegative && oTask.nSrcType == oTask.nTgtType) {
            mpfnCopy = moStages.apfnCopy[oTask.nSrcType];
            if (oTask.pabySrcMask != nullptr && oTask.pabyTgtMask == nullptr && oTask.nChan == 1 &&
                oTask.oOptions.pabyOutcome == nullptr && mabyModeOfClass[0] == ePO_BACKGROUND) {
                mpfnFillInvalid = moStages.apfnFillInvalid[oTask.nSrcType];
            }
        }
        mbInterleaves = oTask.nChan == 3 || oTask.nChan == 4;
        if (moMethod.eValues == eVR_BILINEAR && mbInterleaves) {
            mpfnPixels = moStages.apfnBilinearPixels[oTask.nChan - 3][oTask.nSrcType];
            mnChannels = oTask.nChan;
        }
        // Tables of a single row would be made for nothing, and those of very wide ones are large.
        if (oTask.nTgtRows > 1 && oTask.nTgtCols <= kMostTabulatedCols &&
            moPositions.IsAxisAligned(oTask.nTgtCols)) {
            moColumns = MakeColumnTables(oTask, moStages, moPositions, moLimits,
                                         mbOpen ? &moModes : nullptr);
            moRowPlan = RowPlan(oTask, moStages, moColumns);
            mbMediansAreSamples = moRowPlan.GetPath().ePath == Path::eMedians &&
                                  moMethod.eValues == eVR_MEDIAN &&
                                  oTask.nSrcType == oTask.nTgtType;
        }
    }
    if (oTask.oOptions.poTaken != nullptr) {
        *oTask.oOptions.poTaken = moRowPlan.GetPath();
    }
}

Run::ThreadMemory Run::MakeThreadMemory() const {
    ThreadMemory oMemory;
    const Window& oWindow = moMethod.oWindow;
    // Where no window fits none is computed, and its size is only a number.
    if (oWindow.nCols <= moTask.nSrcCols && oWindow.nRows <= moTask.nSrcRows) {
        if (KeepsRows(moRowPlan.GetPath().ePath)) {
            oMemory.poRows = std::make_unique<RowCache>(moTask, moRowPlan);
        } else if (moMethod.eScratch != Scratch::eNone) {
            oMemory.padfScratch = MakeAlignedDoubles(GetScratchSize(moMethod));
        }
        if (moTask.oOptions.ePath != Path::ePlain && moTask.pabySrcMask != nullptr) {
            const bool bBands = moColumns.vdfFrac.empty();
            // Bands are for places that 32-bit integers can hold, with as much left for the offsets
            // of windows.
            constexpr long long nMost = 1 << 30;
            if (!bBands || std::max<long long>(mnPitch, moTask.nSrcRows) <= nMost) {
                oMemory.poMap = std::make_unique<MaskMap>(moTask, moStages, bBands);
            }
        }
    }
    return oMemory;
}

ClassRules Run::GetClassRules() const {
    // The other rules look at the nearest pixel alone, whose byte only has to differ from 0.
    const bool bWholeWindow = moMethod.eRule == ModeRule::eWindow;
    return {moTask.pabyTgtMask == nullptr ? mabyModeOfClass : nullptr, bWholeWindow, bWholeWindow};
}

// Turns classes into modes. Returns the set of modes.
unsigned Run::ChooseModes(long long nFirst, int nPix, const unsigned char* pabyWindowMask,
                          const unsigned char* pabyNearestMask, const std::int64_t* panWindow,
                          const std::int64_t* panNearest, unsigned char* pabyClassThenMode) const {
    unsigned nModes = 0;
    if (moTask.pabySrcMask != nullptr) {
        const Window& oWindow = moMethod.oWindow;
        nModes = moStages.pfnMaskClasses(
            GetClassRules(),
            {pabyWindowMask, pabyNearestMask, moTask.nSrcCols, oWindow.nCols, oWindow.nRows},
            panWindow, panNearest, nPix, pabyClassThenMode);
    }
    return ApplyRequests(nFirst, nPix, nModes, pabyClassThenMode);
}

// Modes of classes by the target mask; without one they are modes already.
unsigned Run::ApplyRequests(long long nFirst, int nPix, unsigned nModes,
                            unsigned char* pabyClassThenMode) const {
    if (moTask.pabyTgtMask != nullptr) {
        // A copy that no store can reach, so that it needs no reading again.
        const ModeTable oModes = moModes;
        const unsigned char* pabyRequest = moTask.pabyTgtMask + nFirst;
        for (int i = 0; i < nPix; ++i) {
            pabyClassThenMode[i] = oModes.Get(pabyRequest[i], pabyClassThenMode[i]);
        }
        nModes = SetOfModes(pabyClassThenMode, nPix);
    }
    // The group of the last pixel holds classes of pixels that don't exist.
    for (int i = nPix; i % kLanes != 0; ++i) {
        pabyClassThenMode[i] = pabyClassThenMode[nPix - 1];
    }
    return nModes;
}

}  // namespace vetra::utils::engine
