// The walk for every transform: positions and modes are evaluated for each pixel.

#include <algorithm>
#include <cmath>
#include <cstring>

#include "vetra/base/utils/resample/engine/run.h"

namespace vetra::utils::engine {

void Run::WalkGeneral(long long nBegin, long long nEnd, const ThreadMemory& oMemory,
                      ValueArrays& oValues) const {
    SpanArrays oArrays;
    RowStep oStep;
    for (long long nFirst = nBegin; nFirst < nEnd; nFirst += kSpanPixels) {
        Prepare(nFirst, static_cast<int>(std::min<long long>(kSpanPixels, nEnd - nFirst)),
                oMemory.poMap.get(), oStep, oArrays);
        Finish(oArrays.oSpan, oMemory, oValues);
    }
}

void Run::Prepare(long long nFirst, int nPix, MaskMap* poMap, RowStep& oStep,
                  SpanArrays& oArrays) const {
    Span& oSpan = oArrays.oSpan;
    oSpan.nFirst = nFirst;
    oSpan.nPix = nPix;
    oSpan.pabyMode = oArrays.abyMode;
    oSpan.pWindowSrc = static_cast<const char*>(moTask.pSrc);
    oSpan.pNearestSrc = oSpan.pWindowSrc;
    oSpan.pabyWindowMask = moTask.pabySrcMask;
    oSpan.panWindow = oArrays.anWindow;
    oSpan.panNearest = oArrays.anNearest;
    oSpan.padfFracCol = oArrays.adfFracCol;
    oSpan.padfFracRow = oArrays.adfFracRow;
    oSpan.eValues = moMethod.eValues;
    oSpan.panBroken = nullptr;

    const PositionBounds oBounds =
        moPositions.Fill(moStages, nFirst, nPix, oArrays.adfCol, oArrays.adfRow);
    oSpan.pabyCopyMask =
        mpfnFillInvalid != nullptr && AllInside(oBounds) ? moTask.pabySrcMask : nullptr;
    if (oSpan.pabyCopyMask != nullptr) {
        oSpan.nModes = kSetNearest;
        moStages.pfnNearestPlaces(static_cast<double>(mnPitch), 1.0, oArrays.adfCol, oArrays.adfRow,
                                  nullptr, nPix, oArrays.anNearest);
    } else if (poMap != nullptr && Provides(*poMap, oBounds)) {
        PlaceByMap(*poMap, oArrays);
    } else {
        Place(oBounds, oArrays);
    }
    oStep.Look(nFirst, nPix, moTask.nTgtCols, oArrays.adfCol, oArrays.adfRow);
    Prefetch(oSpan, oStep);
}

// Modes first, then the places of each mode.
void Run::Place(const PositionBounds& oBounds, SpanArrays& oArrays) const {
    Span& oSpan = oArrays.oSpan;
    const int nPix = oSpan.nPix;
    const bool bWindow = moMethod.eValues != eVR_NONE;
    if (mbOpen && AllInside(oBounds)) {
        const unsigned char nMode = mabyModeOfClass[bWindow ? kClassFits | kClassNear : kClassNear];
        std::memset(oArrays.abyMode, nMode, sizeof oArrays.abyMode);
        oSpan.nModes = 1u << nMode;
    } else if (mbOpen) {
        oSpan.nModes = moStages.pfnOpenModes(moLimits, bWindow, mnFallback, oArrays.adfCol,
                                             oArrays.adfRow, nPix, oArrays.abyMode);
    } else {
        moStages.pfnClasses(moLimits, moTask.nSrcCols, oArrays.adfCol, oArrays.adfRow, nPix,
                            oArrays.abyMode, oArrays.anWindow, oArrays.anNearest);
        oSpan.nModes = ChooseModes(oSpan.nFirst, nPix, moTask.pabySrcMask, moTask.pabySrcMask,
                                   oArrays.anWindow, oArrays.anNearest, oArrays.abyMode);
    }
    if ((oSpan.nModes & kSetInterpolated) != 0) {
        moStages.pfnWindows(moLimits, static_cast<double>(mnPitch), moTask.nChan, oArrays.adfCol,
                            oArrays.adfRow, oSpan.ModesUnless(kSetInterpolated), nPix,
                            oArrays.anWindow, oArrays.adfFracCol, oArrays.adfFracRow);
    }
    if ((oSpan.nModes & kSetNearest) != 0) {
        moStages.pfnNearestPlaces(static_cast<double>(mnPitch), moTask.nChan, oArrays.adfCol,
                                  oArrays.adfRow, oSpan.ModesUnless(kSetNearest), nPix,
                                  oArrays.anNearest);
    }
}

// All at once.
void Run::PlaceByMap(const MaskMap& oMap, SpanArrays& oArrays) const {
    Span& oSpan = oArrays.oSpan;
    const bool bReplacing = moMethod.eRule == ModeRule::eReplacingWindow;
    oSpan.nModes = moStages.pfnMappedPlaces(
        moLimits, GetClassRules(), oMap.GetBands(), static_cast<int>(mnPitch), moTask.nChan,
        oArrays.adfCol, oArrays.adfRow, oSpan.nPix,
        {oArrays.abyMode, bReplacing ? oArrays.anBroken : nullptr,
         moMethod.eValues != eVR_NONE ? oArrays.anWindow : nullptr, oArrays.anNearest,
         oArrays.adfFracCol, oArrays.adfFracRow});
    oSpan.nModes = ApplyRequests(oSpan.nFirst, oSpan.nPix, oSpan.nModes, oArrays.abyMode);
    if (bReplacing) {
        oSpan.eValues = PlainRow(moMethod);
        oSpan.panBroken = oArrays.anBroken;
    }
}

// Whether the windows of a span, or the nearest pixels of a method without, all lie inside the
// source. What holds for the first and the last position holds for those between.
bool Run::AllInside(const PositionBounds& o) const {
    const ClassLimits& l = moLimits;
    if (moMethod.eValues == eVR_NONE) {
        return o.bNumbers && o.dfFirstCol + 0.5 >= 0.0 &&
               o.dfLastCol + 0.5 < l.dfNearColLast + 1.0 && o.dfFirstRow + 0.5 >= 0.0 &&
               o.dfLastRow + 0.5 < l.dfNearRowLast + 1.0;
    }
    const double dfShift = l.bAnchorNearest ? 0.5 : 0.0;
    return o.bNumbers && o.dfFirstCol + dfShift >= l.dfFitColFirst &&
           o.dfLastCol + dfShift < l.dfFitColLast + 1.0 &&
           o.dfFirstRow + dfShift >= l.dfFitRowFirst &&
           o.dfLastRow + dfShift < l.dfFitRowLast + 1.0;
}

// Makes the bits of a span's windows and nearest pixels. Neither begins farther from a position
// than a pixel beyond the window's offset.
bool Run::Provides(MaskMap& oMap, const PositionBounds& oBounds) const {
    const auto fnReach = [](double dfFirst, double dfLast, double dfOff, int nSize) {
        const double dfEnd = nSize - 1.0;
        Reach oReach;
        if (dfFirst <= dfLast) {
            const double dfLow = std::floor(dfFirst) + std::min(dfOff, 0.0);
            const double dfHigh = std::floor(dfLast) + 1.0 + std::max(dfOff, 0.0);
            oReach.Add(static_cast<std::int64_t>(std::clamp(dfLow, 0.0, dfEnd)));
            oReach.Add(static_cast<std::int64_t>(std::clamp(dfHigh, 0.0, dfEnd)));
        }
        return oReach;
    };
    return oMap.Provide(
        fnReach(oBounds.dfFirstCol, oBounds.dfLastCol, moLimits.dfColOff, moTask.nSrcCols),
        fnReach(oBounds.dfFirstRow, oBounds.dfLastRow, moLimits.dfRowOff, moTask.nSrcRows));
}

// Asks for the samples that pixels some target rows ahead will need. A target row crosses many
// source rows at a slant, a few pixels each, which no prefetcher of the processor foresees.
void Run::Prefetch(const Span& oSpan, const RowStep& oStep) const {
    constexpr int kStep = 8;
    constexpr double kTgtRowsAhead = 4.0;
    const bool bWindows = (oSpan.nModes & kSetInterpolated) != 0;
    const double dfCols = kTgtRowsAhead * oStep.GetCols();
    const double dfRows = kTgtRowsAhead * oStep.GetRows();
    const bool bKnown = std::abs(dfCols) < moTask.nSrcCols && std::abs(dfRows) < moTask.nSrcRows;
    if (!bKnown || (!bWindows && (oSpan.nModes & kSetNearest) == 0)) {
        return;
    }
    // Of a window the row that is new.
    const long long nRows = std::llround(dfRows) + (dfRows > 0.0 ? moMethod.oWindow.nRows - 1 : 0);
    const long long nAhead = nRows * mnPitch + std::llround(dfCols) * moTask.nChan;
    const std::int64_t* panOffset = bWindows ? oSpan.panWindow : oSpan.panNearest;
    // Integers, since the addresses may lie outside the source; a prefetch of those does nothing.
    const auto nSrc = reinterpret_cast<std::uintptr_t>(moTask.pSrc);
    const auto nMask = reinterpret_cast<std::uintptr_t>(oSpan.pabyCopyMask);
    for (int i = 0; i < oSpan.nPix; i += kStep) {
        const auto nOffset = static_cast<std::uintptr_t>(panOffset[i] + nAhead);
        __builtin_prefetch(reinterpret_cast<const void*>(
            nSrc + nOffset * static_cast<std::uintptr_t>(mnSrcBytes)));
        if (oSpan.pabyCopyMask != nullptr) {
            __builtin_prefetch(reinterpret_cast<const void*>(nMask + nOffset));
        }
    }
}

}  // namespace vetra::utils::engine
