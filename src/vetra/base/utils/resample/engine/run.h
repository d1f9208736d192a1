#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_RUN_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_RUN_H

#include <cstddef>
#include <cstdint>
#include <limits>
#include <memory>

#include "vetra/base/utils/resample/engine/aligneddoubles.h"
#include "vetra/base/utils/resample/engine/columntables.h"
#include "vetra/base/utils/resample/engine/maskmap.h"
#include "vetra/base/utils/resample/engine/positions.h"
#include "vetra/base/utils/resample/engine/rowcache.h"
#include "vetra/base/utils/resample/engine/task.h"

namespace vetra::utils::engine {

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
    // With this mask nearest samples are copied where it is valid, and there are no modes.
    const unsigned char* pabyCopyMask = nullptr;
    const PairGroup* poGroups = nullptr;
    // How the values are made; those of windows with replaced samples, which have a bit here, are
    // made once more as the method says.
    ValuesRow eValues = eVR_NONE;
    const std::uint64_t* panBroken = nullptr;
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
    std::uint64_t anBroken[kSpanWords] = {};
};

// How far positions move from a target row to the next, as seen at the first pixels of rows.
class RowStep {
 public:
    // Takes notice of the positions of target pixels nFirst to nFirst + nPix - 1.
    void Look(long long nFirst, int nPix, int nTgtCols, const double* padfCol,
              const double* padfRow) {
        const long long nCol = nFirst % nTgtCols;
        for (long long i = nCol == 0 ? 0 : nTgtCols - nCol; i < nPix; i += nTgtCols) {
            mdfCols = padfCol[i] - mdfCol;
            mdfRows = padfRow[i] - mdfRow;
            mdfCol = padfCol[i];
            mdfRow = padfRow[i];
        }
    }
    // NaN where it isn't known.
    double GetCols() const { return mdfCols; }
    double GetRows() const { return mdfRows; }

 private:
    static constexpr double kUnknown = std::numeric_limits<double>::quiet_NaN();
    double mdfCol = kUnknown;
    double mdfRow = kUnknown;
    double mdfCols = kUnknown;
    double mdfRows = kUnknown;
};

// The windows of some pixels of a span, packed; in whole groups, nothing behind which is looked at.
struct PackedWindows {
    int nPix;
    int anPixel[kSpanArray];
    alignas(64) std::int64_t anOffset[kSpanArray];
    alignas(64) double adfFracCol[kSpanArray];
    alignas(64) double adfFracRow[kSpanArray];
    alignas(64) double adfValue[kSpanArray];
};

// Values of the channels of a span that are made at once, and the samples that are written at once.
struct ValueArrays {
    // As many as the values stage may fill at once.
    alignas(64) double adfValue[kMostChannelsAtOnce * kSpanArray] = {};
    alignas(64) unsigned char abySample[kMostChannelsAtOnce * kSpanArray * sizeof(double)];
    PackedWindows oBroken;
};
unsigned SetOfModes(const unsigned char* pabyMode, int nPix);

// One run of the sampling loop. Its walks make spans (run_general.cpp, run_rows.cpp), which all end
// in the same stages (run_finish.cpp).
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
    void Prepare(long long nFirst, int nPix, MaskMap* poMap, RowStep& oStep,
                 SpanArrays& oArrays) const;
    bool AllInside(const PositionBounds& oBounds) const;
    void Place(const PositionBounds& oBounds, SpanArrays& oArrays) const;
    void PlaceByMap(const MaskMap& oMap, SpanArrays& oArrays) const;
    bool Provides(MaskMap& oMap, const PositionBounds& oBounds) const;
    // Inlined by force: as a function of its own GCC finds it without effect and drops the call.
    [[gnu::always_inline]] inline void Prefetch(const Span& oSpan, const RowStep& oStep) const;

    void WalkRows(long long nBegin, long long nEnd, const ThreadMemory& oMemory,
                  ValueArrays& oValues) const;
    void FillRow(double dfRow, long long nFirst, int nFirstCol, int nNumCols,
                 const ThreadMemory& oMemory, ValueArrays& oValues) const;

    ClassRules GetClassRules() const;
    unsigned ChooseModes(long long nFirst, int nPix, const unsigned char* pabyWindowMask,
                         const unsigned char* pabyNearestMask, const std::int64_t* panWindow,
                         const std::int64_t* panNearest, unsigned char* pabyClassThenMode) const;
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
    void AddBackground(const Span& oSpan, void* pSamples) const;
    void CopyRuns(const Span& oSpan) const;
    void Copy(const Span& oSpan, int nBegin, int nEnd) const;
    void Clamp(void* pSamples, std::int64_t nSamples) const;
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
    // The source mask alone decides about pixels inside, and invalid ones are background.
    FillInvalidFunction mpfnFillInvalid = nullptr;
    // The medians of a row cache are values in the target's type.
    bool mbMediansAreSamples = false;
    // Makes the values of mnChannels channels at once; null where that depends on the span.
    ValuesFunction mpfnPixels = nullptr;
    int mnChannels;
    // All channels of a span are written together.
    bool mbInterleaves = false;
    ColumnTables moColumns;
    RowPlan moRowPlan;
};

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_RUN_H
