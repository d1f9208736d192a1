// The walk for every transform: positions and modes are evaluated for each pixel.

#include <algorithm>
#include <cmath>

#include "vetra/base/utils/resample/engine/run.h"

namespace vetra::utils::engine {

void Run::WalkGeneral(long long nBegin, long long nEnd, const ThreadMemory& oMemory,
                      ValueArrays& oValues) const {
    SpanArrays oArrays;
    for (long long nFirst = nBegin; nFirst < nEnd; nFirst += kSpanPixels) {
        Prepare(nFirst, static_cast<int>(std::min<long long>(kSpanPixels, nEnd - nFirst)),
                oMemory.poMap.get(), oArrays);
        Finish(oArrays.oSpan, oMemory, oValues);
    }
}

void Run::Prepare(long long nFirst, int nPix, MaskMap* poMap, SpanArrays& oArrays) const {
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

    moPositions.Fill(moStages, nFirst, nPix, oArrays.adfCol, oArrays.adfRow);
    if (poMap != nullptr && Provides(*poMap, oArrays)) {
        PlaceByMap(*poMap, oArrays);
    } else {
        Place(oArrays);
    }
    Prefetch(oSpan);
}

// Modes first, then the places of each mode.
void Run::Place(SpanArrays& oArrays) const {
    Span& oSpan = oArrays.oSpan;
    const int nPix = oSpan.nPix;
    if (mbOpen) {
        oSpan.nModes = moStages.pfnOpenModes(moLimits, moMethod.eValues != eVR_NONE, mnFallback,
                                             oArrays.adfCol, oArrays.adfRow, nPix, oArrays.abyMode);
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

// Makes the bits of a span's windows and nearest pixels. Neither begins farther from a position
// than a pixel beyond the window's offset.
bool Run::Provides(MaskMap& oMap, const SpanArrays& oArrays) const {
    const PositionBounds oBounds =
        moStages.pfnBounds(oArrays.adfCol, oArrays.adfRow, oArrays.oSpan.nPix);
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

// Asks for the source rows that the next target rows will need. A target row crosses many source
// rows at a slant, a few pixels each, which no prefetcher of the processor foresees; each target
// row reaches a little further up or down than the one before.
void Run::Prefetch(const Span& oSpan) const {
    constexpr int kStep = 8;
    constexpr int kRowsAhead = 4;
    const bool bWindows = (oSpan.nModes & kSetInterpolated) != 0;
    if (!bWindows && (oSpan.nModes & kSetNearest) == 0) {
        return;
    }
    const std::int64_t* panOffset = bWindows ? oSpan.panWindow : oSpan.panNearest;
    // Integers, since the addresses may lie outside the source; a prefetch of those does nothing.
    const auto nSrc = reinterpret_cast<std::uintptr_t>(moTask.pSrc);
    const auto nRowBytes = static_cast<std::uintptr_t>(mnPitch * mnSrcBytes);
    const std::uintptr_t nAbove = nSrc - kRowsAhead * nRowBytes;
    const std::uintptr_t nBelow =
        nSrc + static_cast<std::uintptr_t>(moMethod.oWindow.nRows - 1 + kRowsAhead) * nRowBytes;
    for (int i = 0; i < oSpan.nPix; i += kStep) {
        const auto nOffset = static_cast<std::uintptr_t>(panOffset[i] * mnSrcBytes);
        __builtin_prefetch(reinterpret_cast<const void*>(nAbove + nOffset));
        __builtin_prefetch(reinterpret_cast<const void*>(nBelow + nOffset));
    }
}

}  // namespace vetra::utils::engine
