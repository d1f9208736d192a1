// The sampling loop.
//
// Each thread of the team takes a contiguous share of the flat target index and walks it in spans
// of up to kSpanPixels pixels. A span goes through the stages positions, modes, places, values,
// store; its arrays stay in the first-level cache. Types matter at the ends only, where samples are
// read and stored: the stages come from tables with an entry per type.
//
// Two walks make the spans. The general one evaluates positions and modes for every pixel, and
// stays one span ahead of the values stage, so that the source samples are on their way to the
// cache when they are needed. The axis-aligned one reads columns from tables that are made once per
// run, and rows once per target row.

#include <omp.h>

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <vector>

#include "vetra/base/utils/resample/engine/aligneddoubles.h"
#include "vetra/base/utils/resample/engine/columntables.h"
#include "vetra/base/utils/resample/engine/maskmap.h"
#include "vetra/base/utils/resample/engine/positions.h"
#include "vetra/base/utils/resample/engine/rowcache.h"
#include "vetra/base/utils/resample/engine/task.h"

namespace vetra::utils::engine {

namespace {

constexpr int kMostTabulatedCols = 1 << 20;

// Sets of modes.
constexpr unsigned kSetBackground = 1u << ePO_BACKGROUND;
constexpr unsigned kSetInterpolated = 1u << ePO_INTERPOLATED;
constexpr unsigned kSetNearest = 1u << ePO_NEAREST;
constexpr unsigned kSetUntouched = 1u << ePO_UNTOUCHED;

// A span after the places stage.
struct Span {
    long long nFirst = 0;
    int nPix = 0;
    const unsigned char* pabyMode = nullptr;
    unsigned nModes = 0;
    // Offsets count from these samples.
    const char* pWindowSrc = nullptr;
    const char* pNearestSrc = nullptr;
    const std::int64_t* panWindow = nullptr;
    const std::int64_t* panNearest = nullptr;
    const double* padfFracCol = nullptr;
    const double* padfFracRow = nullptr;
    const unsigned char* pabyWindowMask = nullptr;
    const PairGroup* poGroups = nullptr;
    // How the values are made; those of windows with replaced samples, which have a byte of 1 here,
    // are made once more as the method says.
    ValuesRow eValues = eVR_NONE;
    const unsigned char* pabyBroken = nullptr;
    // Has the values of the windows where it isn't null; else they are made of source samples.
    RowCache* poRows = nullptr;
    int nFirstCol = 0;

    const unsigned char* ModesUnless(unsigned nSet) const {
        return nModes == nSet ? nullptr : pabyMode;
    }
};

// A span with arrays of its own.
struct SpanArrays {
    Span oSpan;
    alignas(64) double adfCol[kSpanArray] = {};
    alignas(64) double adfRow[kSpanArray] = {};
    alignas(64) double adfFracCol[kSpanArray] = {};
    alignas(64) double adfFracRow[kSpanArray] = {};
    alignas(64) std::int64_t anWindow[kSpanArray] = {};
    alignas(64) std::int64_t anNearest[kSpanArray] = {};
    alignas(64) unsigned char abyMode[kSpanArray] = {};
    alignas(64) unsigned char abyBroken[kSpanArray] = {};
};

// The windows of some pixels of a span, packed.
struct PackedWindows {
    int nPix = 0;
    int anPixel[kSpanArray] = {};
    alignas(64) std::int64_t anOffset[kSpanArray] = {};
    alignas(64) double adfFracCol[kSpanArray] = {};
    alignas(64) double adfFracRow[kSpanArray] = {};
    alignas(64) double adfValue[kSpanArray] = {};
};

// Values of the channels of a span that are made at once, and the samples that are written at once.
struct ValueArrays {
    // As many as the values stage may fill at once.
    alignas(64) double adfValue[kMostChannelsAtOnce * kSpanArray] = {};
    alignas(64) unsigned char abySample[kMostChannelsAtOnce * kSpanArray * sizeof(double)] = {};
    PackedWindows oBroken;
};

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

// Picks the broken windows out of a span.
void Pack(const Span& oSpan, PackedWindows& oBroken) {
    int n = 0;
    const auto fnAdd = [&](int i) {
        oBroken.anPixel[n] = i;
        oBroken.anOffset[n] = oSpan.panWindow[i];
        oBroken.adfFracCol[n] = oSpan.padfFracCol[i];
        oBroken.adfFracRow[n] = oSpan.padfFracRow[i];
        ++n;
    };
    for (int i = 0; i < oSpan.nPix; ++i) {
        if (oSpan.pabyBroken[i] != 0 && oSpan.pabyMode[i] == ePO_INTERPOLATED) {
            fnAdd(i);
        }
    }
    oBroken.nPix = n;
    // Whole groups are computed.
    while (n % kLanes != 0) {
        fnAdd(oBroken.anPixel[n - 1]);
    }
}

class Run {
 public:
    explicit Run(const Task& oTask);

    // What a thread needs beside the stack. Throws std::bad_alloc.
    struct ThreadMemory {
        AlignedDoubles padfScratch;
        std::unique_ptr<RowCache> poRows;
        std::unique_ptr<MaskMap> poMap;
    };
    ThreadMemory MakeThreadMemory() const;

    // Fills target pixels nBegin to nEnd - 1.
    void Walk(long long nBegin, long long nEnd, const ThreadMemory& oMemory) const {
        ValueArrays oValues;
        moColumns.vdfFrac.empty() ? WalkGeneral(nBegin, nEnd, oMemory, oValues)
                                  : WalkRows(nBegin, nEnd, oMemory, oValues);
    }

 private:
    void WalkGeneral(long long nBegin, long long nEnd, const ThreadMemory& oMemory,
                     ValueArrays& oValues) const;
    void Prepare(long long nFirst, int nPix, MaskMap* poMap, SpanArrays& oArrays) const;
    void Place(SpanArrays& oArrays) const;
    void PlaceByMap(const MaskMap& oMap, SpanArrays& oArrays) const;
    bool Provides(MaskMap& oMap, const SpanArrays& oArrays) const;
    // Inlined by force: as a function of its own GCC finds it without effect and drops the call.
    [[gnu::always_inline]] inline void Prefetch(const Span& oSpan) const;

    void WalkRows(long long nBegin, long long nEnd, const ThreadMemory& oMemory,
                  ValueArrays& oValues) const;
    void FillRow(double dfRow, long long nFirst, int nFirstCol, int nNumCols,
                 const ThreadMemory& oMemory, ValueArrays& oValues) const;

    // Of the mask, what the windows of a span see.
    struct MaskView {
        const std::uint64_t* panWhole;
        const std::uint64_t* panUsable;
        const unsigned char* pabyWindow;
        const unsigned char* pabyNearest;
    };
    MaskWindow GetMaskWindow(const MaskView& oMask) const;
    unsigned ChooseModes(long long nFirst, int nPix, const MaskView& oMask,
                         const std::int64_t* panWindow, const std::int64_t* panNearest,
                         unsigned char* pabyClassThenMode) const;
    unsigned ApplyRequests(long long nFirst, int nPix, unsigned nModes,
                           unsigned char* pabyClassThenMode) const;

    void Finish(const Span& oSpan, const ThreadMemory& oMemory, ValueArrays& oValues) const;
    void ReplaceBroken(const Span& oSpan, int nChannel, WindowSpan oWindows, PackedWindows& oBroken,
                       double* padfValue) const;
    void MakeSamples(const Span& oSpan, int nChannel, double* padfValue,
                     unsigned char* pabySample) const;
    void Deliver(const Span& oSpan, int nChannel, const unsigned char* pabySample) const;
    template <typename Function>
    void WithSampleBits(const Function& fnDo) const;
    template <typename Bits>
    void AddBackground(const Span& oSpan, unsigned char* pabySample) const;
    void CopyRuns(const Span& oSpan) const;
    void Copy(const Span& oSpan, int nBegin, int nEnd) const;
    void FillBackground(long long nFirst, int nPix) const;

    const char* SrcRow(long long nRow) const {
        return static_cast<const char*>(moTask.pSrc) + nRow * mnPitch * mnSrcBytes;
    }
    char* TgtPixel(long long nPixel) const {
        return static_cast<char*>(moTask.pTgt) + nPixel * moTask.nChan * mnTgtBytes;
    }

    const Task& moTask;
    const Method& moMethod;
    const LevelStages& moStages;
    Positions moPositions;
    ModeTable moModes;
    ClassLimits moLimits;
    // Modes by class where every request is 1.
    unsigned char mabyModeOfClass[4];
    // Neither mask has a say: modes follow from positions alone.
    bool mbOpen;
    // The mode of a pixel whose window doesn't fit but whose nearest pixel is there.
    unsigned char mnFallback;
    long long mnPitch;
    int mnSrcBytes;
    int mnTgtBytes;
    // Samples go from source to target as they are; null where they pass through a double.
    CopyFunction mpfnCopy = nullptr;
    // Makes the values of mnChannels channels at once; null where that depends on the span.
    ValuesFunction mpfnPixels = nullptr;
    int mnChannels;
    // All channels of a span are written together.
    bool mbInterleaves = false;
    ColumnTables moColumns;
    RowPlan moRowPlan;
};

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
        }
        mbInterleaves = oTask.nChan == 3 || oTask.nChan == 4;
        if (moMethod.eValues == eVR_BILINEAR && mbInterleaves) {
            mpfnPixels = moStages.apfnBilinearPixels[oTask.nChan - 3][oTask.nSrcType];
            mnChannels = oTask.nChan;
        }
        // Tables of a single row would be made for nothing, and those of very wide ones are large.
        if (oTask.nTgtRows > 1 && oTask.nTgtCols <= kMostTabulatedCols &&
            moPositions.IsAxisAligned(oTask.nTgtCols)) {
            moColumns = MakeColumnTables(oTask, moStages, moPositions, moLimits, moModes);
            moRowPlan = RowPlan(oTask, moStages, moColumns);
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
            oMemory.poMap = std::make_unique<MaskMap>(moTask, moStages);
        }
    }
    return oMemory;
}

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
    oSpan.pabyBroken = nullptr;

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
        oSpan.nModes = ChooseModes(oSpan.nFirst, nPix,
                                   {nullptr, nullptr, moTask.pabySrcMask, moTask.pabySrcMask},
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
    MaskView oMask{};
    oMask.panWhole = oMap.GetWhole(0);
    oMask.panUsable = oMap.GetUsable(0);
    oSpan.nModes = moStages.pfnMappedPlaces(
        moLimits, GetMaskWindow(oMask), oMap.GetPitch(), static_cast<double>(mnPitch), moTask.nChan,
        oArrays.adfCol, oArrays.adfRow, oSpan.nPix,
        {oArrays.abyMode, bReplacing ? oArrays.abyBroken : nullptr, oArrays.anWindow,
         oArrays.anNearest, oArrays.adfFracCol, oArrays.adfFracRow});
    oSpan.nModes = ApplyRequests(oSpan.nFirst, oSpan.nPix, oSpan.nModes, oArrays.abyMode);
    if (bReplacing) {
        oSpan.eValues = PlainRow(moMethod);
        oSpan.pabyBroken = oArrays.abyBroken;
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

MaskWindow Run::GetMaskWindow(const MaskView& oMask) const {
    // The other rules look at the nearest pixel alone, whose byte only has to differ from 0.
    const bool bWholeWindow = moMethod.eRule == ModeRule::eWindow;
    return {oMask.panWhole,
            oMask.panUsable,
            oMask.pabyWindow,
            oMask.pabyNearest,
            moTask.nSrcCols,
            moMethod.oWindow.nCols,
            bWholeWindow ? moMethod.oWindow.nRows : 0,
            bWholeWindow,
            moTask.pabyTgtMask == nullptr ? mabyModeOfClass : nullptr};
}

// Turns classes into modes. Returns the set of modes.
unsigned Run::ChooseModes(long long nFirst, int nPix, const MaskView& oMask,
                          const std::int64_t* panWindow, const std::int64_t* panNearest,
                          unsigned char* pabyClassThenMode) const {
    unsigned nModes = 0;
    if (moTask.pabySrcMask != nullptr) {
        nModes = moStages.pfnMaskClasses(GetMaskWindow(oMask), panWindow, panNearest, nPix,
                                         pabyClassThenMode);
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

void Run::WalkRows(long long nBegin, long long nEnd, const ThreadMemory& oMemory,
                   ValueArrays& oValues) const {
    const int nCols = moTask.nTgtCols;
    const std::vector<Strip> voWhole = {{0, nCols}};
    RowCache* poRows = oMemory.poRows.get();
    for (const Strip& oStrip : poRows != nullptr ? moRowPlan.GetStrips() : voWhole) {
        if (poRows != nullptr) {
            poRows->SetStrip(oStrip);
        }
        for (long long nRow = nBegin / nCols; nRow * nCols < nEnd; ++nRow) {
            // The row's share, as far as it lies in the strip.
            const long long nFirst = std::max(nBegin, nRow * nCols + oStrip.nFirstCol);
            const long long nLast =
                std::min(nEnd, nRow * nCols + oStrip.nFirstCol + oStrip.nNumCols);
            if (nFirst >= nLast) {
                continue;
            }
            double dfCol = 0.0;
            double dfRow = 0.0;
            moTask.poTfm->GetSrcPos(nFirst, dfCol, dfRow);
            FillRow(dfRow, nFirst, static_cast<int>(nFirst % nCols),
                    static_cast<int>(nLast - nFirst), oMemory, oValues);
        }
    }
}

// Fills a stretch of one target row.
void Run::FillRow(double dfRow, long long nFirst, int nFirstCol, int nNumCols,
                  const ThreadMemory& oMemory, ValueArrays& oValues) const {
    const double dfNearRow = std::floor(dfRow + 0.5);
    const double dfAnchorRow = moLimits.bAnchorNearest ? dfNearRow : std::floor(dfRow);
    const double dfFracRow = dfRow - dfAnchorRow;
    const bool bFits =
        dfAnchorRow >= moLimits.dfFitRowFirst && dfAnchorRow <= moLimits.dfFitRowLast;
    const bool bNear = dfNearRow >= 0.0 && dfNearRow <= moLimits.dfNearRowLast;
    const auto nRowClass =
        static_cast<unsigned char>((bFits ? kClassFits : 0) | (bNear ? kClassNear : 0));

    Span oSpan;
    double adfFracRow[kSpanArray];
    std::fill_n(adfFracRow, std::min(nNumCols, kSpanPixels) + kLanes, dfFracRow);
    oSpan.padfFracRow = adfFracRow;
    oSpan.eValues = moMethod.eValues;
    // Rows outside have no samples: no pixel of theirs has a mode that reads any.
    const long long nWindowRow =
        bFits ? static_cast<long long>(dfAnchorRow) + moMethod.oWindow.nRowOff : 0;
    const long long nNearestRow = bNear ? static_cast<long long>(dfNearRow) : 0;
    oSpan.pWindowSrc = SrcRow(nWindowRow);
    oSpan.pNearestSrc = SrcRow(nNearestRow);
    MaskView oMask{};
    if (moTask.pabySrcMask != nullptr) {
        oSpan.pabyWindowMask = moTask.pabySrcMask + nWindowRow * moTask.nSrcCols;
        oMask.pabyWindow = oSpan.pabyWindowMask;
        oMask.pabyNearest = moTask.pabySrcMask + nNearestRow * moTask.nSrcCols;
        Reach oRows;
        oRows.Add(nWindowRow);
        oRows.Add(nNearestRow);
        if (oMemory.poMap != nullptr && oMemory.poMap->Provide(moColumns.oReach, oRows)) {
            oMask.panWhole = oMemory.poMap->GetWhole(nWindowRow);
            oMask.panUsable = oMemory.poMap->GetUsable(nNearestRow);
        }
    }
    // Rows know nothing of replaced samples.
    const bool bReplacing =
        moMethod.eRule == ModeRule::eReplacingWindow && moTask.pabySrcMask != nullptr;
    RowCache* poRows = bReplacing && oMask.panWhole == nullptr ? nullptr : oMemory.poRows.get();
    bool bFetched = false;
    alignas(64) unsigned char abyMode[kSpanArray];
    alignas(64) unsigned char abyBroken[kSpanArray];
    for (int nDone = 0; nDone < nNumCols; nDone += kSpanPixels) {
        const std::size_t nCol = static_cast<std::size_t>(nFirstCol + nDone);
        oSpan.nFirst = nFirst + nDone;
        oSpan.nPix = std::min(kSpanPixels, nNumCols - nDone);
        oSpan.padfFracCol = moColumns.vdfFrac.data() + nCol;
        oSpan.panWindow = moColumns.vnWindow.data() + nCol;
        oSpan.panNearest = moColumns.vnNearest.data() + nCol;
        oSpan.poGroups = moColumns.voGroups.empty() || nCol % kLanes != 0
                             ? nullptr
                             : moColumns.voGroups.data() + nCol / kLanes;
        if (mbOpen) {
            oSpan.pabyMode = moColumns.avbyMode[nRowClass].data() + nCol;
            oSpan.nModes = SetOfModes(oSpan.pabyMode, oSpan.nPix);
        } else {
            const unsigned char* pabyClass = moColumns.vbyClass.data() + nCol;
            for (int i = 0; i < kSpanPixels; ++i) {
                abyMode[i] = pabyClass[i] & nRowClass;
            }
            const std::int64_t* panWindow = moColumns.vnWindowCol.data() + nCol;
            oSpan.nModes = ChooseModes(oSpan.nFirst, oSpan.nPix, oMask, panWindow,
                                       moColumns.vnNearestCol.data() + nCol, abyMode);
            oSpan.pabyMode = abyMode;
            if (bReplacing && oMask.panWhole != nullptr) {
                moStages.pfnBrokenWindows(oMask.panWhole, panWindow, abyMode, oSpan.nPix,
                                          abyBroken);
                oSpan.eValues = PlainRow(moMethod);
                oSpan.pabyBroken = abyBroken;
            }
        }
        if (poRows != nullptr && (oSpan.nModes & kSetInterpolated) != 0) {
            if (!bFetched) {
                poRows->SetWindowRow(nWindowRow, dfFracRow);
                bFetched = true;
            }
            oSpan.poRows = poRows;
            oSpan.nFirstCol = nFirstCol + nDone;
        }
        Finish(oSpan, oMemory, oValues);
    }
}

// The last stages: values and store.
void Run::Finish(const Span& oSpan, const ThreadMemory& oMemory, ValueArrays& oValues) const {
    if (moTask.oOptions.pabyOutcome != nullptr) {
        std::memcpy(moTask.oOptions.pabyOutcome + oSpan.nFirst, oSpan.pabyMode,
                    static_cast<std::size_t>(oSpan.nPix));
    }
    if (oSpan.nModes == kSetUntouched) {
        return;
    }
    if (oSpan.nModes == kSetBackground) {
        FillBackground(oSpan.nFirst, oSpan.nPix);
        return;
    }
    if (mpfnCopy != nullptr) {
        CopyRuns(oSpan);
        return;
    }
    const bool bWindows = (oSpan.nModes & kSetInterpolated) != 0;
    WindowSpan oWindows;
    oWindows.panOffset = oSpan.panWindow;
    oWindows.padfFracCol = oSpan.padfFracCol;
    oWindows.padfFracRow = oSpan.padfFracRow;
    oWindows.pabyMode = oSpan.ModesUnless(kSetInterpolated);
    oWindows.nPix = oSpan.nPix;
    oWindows.nPitch = mnPitch;
    oWindows.nChan = moTask.nChan;
    oWindows.pabyMask = oSpan.pabyWindowMask;
    oWindows.poGroups = oSpan.poGroups;
    oWindows.pParameters = moTask.pParameters;
    oWindows.padfScratch = oMemory.padfScratch.get();
    PackedWindows& oBroken = oValues.oBroken;
    if (oSpan.pabyBroken != nullptr) {
        Pack(oSpan, oBroken);
    }
    const bool bInterleave = mbInterleaves && (oSpan.nModes & kSetUntouched) == 0;
    ValuesFunction pfnValues = mpfnPixels;
    if (bWindows && pfnValues == nullptr) {
        pfnValues = moStages.apfnValues[oSpan.eValues][moTask.nSrcType];
    }
    for (int nChannel = 0; nChannel < moTask.nChan; nChannel += mnChannels) {
        double* padfValue = oValues.adfValue;
        if (bWindows && oSpan.poRows != nullptr) {
            padfValue = oSpan.poRows->GetValues(nChannel, oSpan.nFirstCol, oSpan.nPix);
        } else if (bWindows) {
            pfnValues(oWindows, oSpan.pWindowSrc + std::ptrdiff_t{nChannel} * mnSrcBytes,
                      padfValue);
        }
        if (oSpan.pabyBroken != nullptr && oBroken.nPix != 0) {
            ReplaceBroken(oSpan, nChannel, oWindows, oBroken, padfValue);
        }
        for (int i = 0; i < mnChannels; ++i) {
            unsigned char* pabySample = oValues.abySample;
            if (bInterleave) {
                pabySample += std::ptrdiff_t{nChannel + i} * kSpanArray * mnTgtBytes;
            }
            MakeSamples(oSpan, nChannel + i, padfValue + i * kSpanArray, pabySample);
            if (!bInterleave) {
                Deliver(oSpan, nChannel + i, pabySample);
            }
        }
    }
    if (bInterleave) {
        moStages.apfnInterleave[moTask.nChan - 3][moTask.nTgtType](oValues.abySample, oSpan.nPix,
                                                                   TgtPixel(oSpan.nFirst));
    }
}

// Makes the values of broken windows.
void Run::ReplaceBroken(const Span& oSpan, int nChannel, WindowSpan oWindows,
                        PackedWindows& oBroken, double* padfValue) const {
    oWindows.panOffset = oBroken.anOffset;
    oWindows.padfFracCol = oBroken.adfFracCol;
    oWindows.padfFracRow = oBroken.adfFracRow;
    oWindows.pabyMode = nullptr;
    oWindows.poGroups = nullptr;
    oWindows.nPix = oBroken.nPix;
    moStages.apfnValues[moMethod.eValues][moTask.nSrcType](
        oWindows, oSpan.pWindowSrc + std::ptrdiff_t{nChannel} * mnSrcBytes, oBroken.adfValue);
    for (int i = 0; i < oBroken.nPix; ++i) {
        padfValue[oBroken.anPixel[i]] = oBroken.adfValue[i];
    }
}

// Adds the nearest samples to the values of a channel, makes target samples of them, and puts the
// background among those.
void Run::MakeSamples(const Span& oSpan, int nChannel, double* padfValue,
                      unsigned char* pabySample) const {
    if ((oSpan.nModes & kSetNearest) != 0) {
        const auto& apfnNearest =
            moMethod.bNonNegative ? moStages.apfnNonNegativeNearest : moStages.apfnNearest;
        apfnNearest[moTask.nSrcType](oSpan.pNearestSrc + std::ptrdiff_t{nChannel} * mnSrcBytes,
                                     oSpan.panNearest, oSpan.ModesUnless(kSetNearest), oSpan.nPix,
                                     padfValue);
    }
    moStages.apfnStore[moTask.nTgtType](padfValue, oSpan.nPix, moTask.pLimits, pabySample);
    if ((oSpan.nModes & kSetBackground) != 0) {
        WithSampleBits([&](auto nBits) { AddBackground<decltype(nBits)>(oSpan, pabySample); });
    }
}

// Calls a function with a number as large as a target sample.
template <typename Function>
void Run::WithSampleBits(const Function& fnDo) const {
    switch (mnTgtBytes) {
        case 1:
            fnDo(std::uint8_t{});
            break;
        case 2:
            fnDo(std::uint16_t{});
            break;
        case 4:
            fnDo(std::uint32_t{});
            break;
        default:
            fnDo(std::uint64_t{});
            break;
    }
}

template <typename Bits>
void Run::AddBackground(const Span& oSpan, unsigned char* pabySample) const {
    Bits background;
    std::memcpy(&background, moTask.pBackground, sizeof background);
    for (std::size_t i = 0; i < static_cast<std::size_t>(oSpan.nPix); ++i) {
        Bits sample;
        std::memcpy(&sample, pabySample + i * sizeof(Bits), sizeof sample);
        sample = oSpan.pabyMode[i] == ePO_BACKGROUND ? background : sample;
        std::memcpy(pabySample + i * sizeof(Bits), &sample, sizeof sample);
    }
}

// Writes one channel of a span, but where a pixel stays untouched.
void Run::Deliver(const Span& oSpan, int nChannel, const unsigned char* pabySample) const {
    WithSampleBits([&](auto nBits) {
        constexpr std::size_t kBytes = sizeof nBits;
        const auto nPix = static_cast<std::size_t>(oSpan.nPix);
        const std::size_t nStep = static_cast<std::size_t>(moTask.nChan) * kBytes;
        char* pTgt = TgtPixel(oSpan.nFirst) + static_cast<std::size_t>(nChannel) * kBytes;
        if ((oSpan.nModes & kSetUntouched) != 0) {
            for (std::size_t i = 0; i < nPix; ++i) {
                if (oSpan.pabyMode[i] != ePO_UNTOUCHED) {
                    std::memcpy(pTgt + i * nStep, pabySample + i * kBytes, kBytes);
                }
            }
        } else if (nStep == kBytes) {
            std::memcpy(pTgt, pabySample, nPix * kBytes);
        } else {
            for (std::size_t i = 0; i < nPix; ++i) {
                std::memcpy(pTgt + i * nStep, pabySample + i * kBytes, kBytes);
            }
        }
    });
}

// Nearest sampling without a change of type: whole pixels, clamped where they arrive.
void Run::CopyRuns(const Span& oSpan) const {
    const auto fnRunEnd = [&](int nBegin) {
        int nEnd = nBegin + 1;
        while (nEnd < oSpan.nPix && oSpan.pabyMode[nEnd] == oSpan.pabyMode[nBegin]) {
            ++nEnd;
        }
        return nEnd;
    };
    if ((oSpan.nModes & kSetUntouched) == 0) {
        // Pixels of other modes have places too.
        Copy(oSpan, 0, oSpan.nPix);
        if ((oSpan.nModes & kSetBackground) == 0) {
            return;
        }
        for (int nBegin = 0; nBegin < oSpan.nPix;) {
            const void* p = std::memchr(oSpan.pabyMode + nBegin, ePO_BACKGROUND,
                                        static_cast<std::size_t>(oSpan.nPix - nBegin));
            if (p == nullptr) {
                break;
            }
            nBegin = static_cast<int>(static_cast<const unsigned char*>(p) - oSpan.pabyMode);
            const int nEnd = fnRunEnd(nBegin);
            FillBackground(oSpan.nFirst + nBegin, nEnd - nBegin);
            nBegin = nEnd;
        }
        return;
    }
    for (int nBegin = 0; nBegin < oSpan.nPix;) {
        const int nEnd = fnRunEnd(nBegin);
        if (oSpan.pabyMode[nBegin] == ePO_NEAREST) {
            Copy(oSpan, nBegin, nEnd);
        } else if (oSpan.pabyMode[nBegin] == ePO_BACKGROUND) {
            FillBackground(oSpan.nFirst + nBegin, nEnd - nBegin);
        }
        nBegin = nEnd;
    }
}

void Run::Copy(const Span& oSpan, int nBegin, int nEnd) const {
    char* pTgt = TgtPixel(oSpan.nFirst + nBegin);
    mpfnCopy(oSpan.pNearestSrc, oSpan.panNearest + nBegin, nEnd - nBegin, moTask.nChan, pTgt);
    if (!moTask.bClampIsOpen) {
        moStages.apfnClamp[moTask.nTgtType](
            pTgt, static_cast<std::int64_t>(nEnd - nBegin) * moTask.nChan, moTask.pLimits);
    }
}

void Run::FillBackground(long long nFirst, int nPix) const {
    char* pTgt = TgtPixel(nFirst);
    const long long nBytes = static_cast<long long>(nPix) * moTask.nChan * mnTgtBytes;
    for (long long i = 0; i < nBytes; i += mnTgtBytes) {
        std::memcpy(pTgt + i, moTask.pBackground, static_cast<std::size_t>(mnTgtBytes));
    }
}

}  // namespace

void Execute(const Task& oTask) {
    const Run oRun(oTask);
    const long long nNumPix = static_cast<long long>(oTask.nTgtCols) * oTask.nTgtRows;
    const int nMaxThreads = omp_get_max_threads();
    std::vector<Run::ThreadMemory> voMemory;
    for (int i = 0; i < nMaxThreads; ++i) {
        voMemory.push_back(oRun.MakeThreadMemory());
    }
#pragma omp parallel
    {
        const int nThread = omp_get_thread_num();
        const long long nThreads = omp_get_num_threads();
        const long long nShare = nNumPix / nThreads;
        const long long nRest = nNumPix % nThreads;
        const long long nBegin = nThread * nShare + std::min<long long>(nThread, nRest);
        const long long nEnd = nBegin + nShare + (nThread < nRest ? 1 : 0);
        if (nBegin < nEnd) {
            oRun.Walk(nBegin, nEnd, voMemory[static_cast<std::size_t>(nThread)]);
        }
    }
}

}  // namespace vetra::utils::engine
