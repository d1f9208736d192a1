#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_STAGES_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_STAGES_H

#include <cstdint>

// What the sampling loop hands to the stages that are compiled once per processor level. Plain data
// and no functions: code of a header that every level includes could be merged by the linker into
// one copy, built for a processor that this machine isn't.
namespace vetra::utils::engine {

/// Pixels that go through the stages together; their arrays fit into the first-level cache. A
/// multiple of kLanes, so that stages work on whole groups and never look at a rest.
constexpr int kSpanPixels = 256;
/// Pixels that the lane layer treats at once.
constexpr int kLanes = 8;
/// Of arrays that are read in whole groups: those then lie in one cache line each.
constexpr int kAlignment = 64;
/// Size of a span's arrays: stages may write up to the end of the last group.
constexpr int kSpanArray = kSpanPixels + kLanes;
/// Where a span has a bit for each pixel: pixels of a word, and words.
constexpr int kWordPixels = 64;
constexpr int kSpanWords = kSpanPixels / kWordPixels;
/// Channels whose values a stage may make at once.
constexpr int kMostChannelsAtOnce = 4;

/// The ten real sample types, by type code.
constexpr int kNumSampleTypes = 10;
constexpr int kSampleBytes[kNumSampleTypes] = {1, 1, 2, 2, 4, 4, 4, 8, 8, 8};

/// Class bits of a position.
constexpr unsigned char kClassFits = 1;  ///< the method's window lies inside the source
constexpr unsigned char kClassNear = 2;  ///< the nearest pixel lies inside the source

/// Where the classes of a position change, in whole pixel coordinates: a window fits while the
/// anchor is from first to last, both included.
struct ClassLimits {
    double dfFitColFirst;
    double dfFitColLast;
    double dfFitRowFirst;
    double dfFitRowLast;
    double dfNearColLast;
    double dfNearRowLast;
    bool bAnchorNearest;  ///< the anchor is the nearest pixel, not the floor
    double dfColOff;      ///< first column of the window, from the anchor
    double dfRowOff;
};

/// Least and greatest columns and rows of some positions, of those that are numbers. Of none, the
/// first is behind the last.
struct PositionBounds {
    double dfFirstCol;
    double dfLastCol;
    double dfFirstRow;
    double dfLastRow;
    bool bNumbers;  ///< all are numbers, and no huge ones
};

/// Where the windows, or the nearest pixels, of neighbouring target columns find their bits in a
/// row of bits.
struct BitGroup {
    static constexpr int kColumns = 32;
    static constexpr int kBytes = 16;
    /// Of each column, the byte that has its bit, counted from nFirst, and the bit within that
    /// byte: 0 where the column is outside the source.
    unsigned char abyPlace[kColumns];
    unsigned char abyBit[kColumns];
    /// A bit for each column that is inside the source.
    std::uint32_t nInside;
    /// The first byte of kBytes; below 0 where they don't hold all bits.
    std::int64_t nFirst;
};

/// What classes of pixels mean in a run.
struct ClassRules {
    /// The mode of each class, where they are the same for all pixels; or null, and what comes out
    /// are classes.
    const unsigned char* pabyModeOfClass;
    bool bNeedsWhole;  ///< a window that isn't whole doesn't fit
    bool bExactlyOne;  ///< a nearest pixel may be used where its mask byte is 1, else where not 0
};

/// The source mask's bytes, from the window and the nearest pixel to which an index of 0 leads.
struct MaskBytes {
    const unsigned char* pabyWindow;
    const unsigned char* pabyNearest;
    int nSrcCols;
    int nWndCols;
    int nWndRows;
};

/// What is known of the source mask in a row of the source: a bit for each window, set where it is
/// whole, and one for each nearest pixel, set where it may be used. Groups and columns are those of
/// all target columns.
struct MaskRow {
    const std::uint64_t* panWhole;
    const std::uint64_t* panUsable;
    const BitGroup* poWholeGroups;
    const BitGroup* poUsableGroups;
    const std::int64_t* panWindowCol;
    const std::int64_t* panNearestCol;
};

/// The same bits of the whole source, in bands of eight rows: a byte holds those of a column, the
/// uppermost one in bit 0. Reading begins anywhere in the bands and may go on for kBandReach bytes.
struct MaskBands {
    const unsigned char* pabyWhole;
    const unsigned char* pabyUsable;
    std::int64_t nPitch;
};
constexpr int kBandRows = 8;
constexpr int kBandReach = 16;

/// Where windows, or nearest pixels, begin: nColOff columns and nRowOff rows from the anchor on,
/// which is inside where that is one of the first nCols columns and nRows rows.
struct CellLimits {
    int nColOff;
    int nRowOff;
    int nCols;
    int nRows;
};

/// Of each pixel of a span what becomes of it, and the places of its window and nearest pixel.
struct SpanPlaces {
    unsigned char* pabyClassThenMode;
    /// A bit for each pixel, kWordPixels a word, set where the window fits but isn't whole. May be
    /// null.
    std::uint64_t* panBroken;
    /// Null for a method without windows.
    std::int64_t* panWindow;
    std::int64_t* panNearest;
    double* padfFracCol;
    double* padfFracRow;
};

/// Corner positions of a bilinear transform, and its size.
struct BilinearCorners {
    double adfCol[4];
    double adfRow[4];
    int nCols;
    int nRows;
};

/// How eight neighbouring target columns take samples from a row of doubles.
struct PickGroup {
    /// Of each column's window, the place of the first sample, counted from nFirst.
    alignas(64) std::int64_t anOffset[kLanes];
    std::int64_t nFirst;
    enum Kind : unsigned char {
        eAny,
        eNear,    ///< all places, and the three behind each, are below kNearReach
        eInARow,  ///< place k is k
    } eKind;
};
constexpr int kNearReach = 16;
constexpr int kNearColumns = 4;

/// Windows of a stretch of one target row, over rows of doubles. A row has kNearReach doubles more
/// than the windows need; filtered rows begin at multiples of kAlignment bytes.
struct RowWindows {
    const double* const* papdfRow;  ///< of the windows, in order
    int nFirst;                     ///< place of the first pixel in rows that are filtered already
    const PickGroup* poGroups;      ///< one for each kLanes pixels
    const double* padfFracCol;
    double dfFracRow;
    /// For filters with tabulated weights: taps x kLanes weights for each group.
    const double* padfColumnTaps;
    const void* pParameters;
    double* padfScratch;
    int nPix;
    bool bMayBeTiny;  ///< the samples are doubles, which can be nearly 0 without being 0
};

/// How to pick the pairs of samples of eight pixels out of sixteen adjacent 8-bit samples.
struct PairGroup {
    static constexpr int kBytes = 16;
    /// Of the sixteen samples, from the start of the row; below 0 where they don't hold all pairs.
    std::int64_t nOffset;
    /// Places of the first samples, then of the second ones.
    unsigned char abyPlace[kBytes];
};

/// The windows of a span, in mode 1, as the methods see them. Pixels of other modes have offset 0:
/// a stage may compute them, but nobody uses what comes out.
struct WindowSpan {
    /// Of each window's first sample from pSrc, in samples; kSpanPixels of them.
    const std::int64_t* panOffset;
    /// Position minus anchor.
    const double* padfFracCol;
    const double* padfFracRow;
    /// The source mask, from the pixel to which offset 0 leads, or null.
    const unsigned char* pabyMask;
    /// Modes of the pixels, when others than 1 occur, else null.
    const unsigned char* pabyMode;
    int nPix;
    /// Samples from a row of the source to the next.
    std::int64_t nPitch;
    /// Samples from a pixel to the next.
    int nChan;
    /// Of each eight pixels, for 8-bit samples and windows of two columns in an axis-aligned run of
    /// one channel; else null.
    const PairGroup* poGroups;
    /// What the method prepared for the run; may be null.
    const void* pParameters;
    /// The thread's own working memory, as much as the method asked for; null if it didn't.
    double* padfScratch;
};

/// What the statistics of a window know of a run.
struct WindowSize {
    int nCols;
    int nRows;
};

/// Weights of a separable window, for nPhases positions between two pixels: phase by phase, within
/// a phase tap by tap.
struct KernelTables {
    const double* padfAcross;  ///< of the columns, [phases x columns]
    const double* padfDown;    ///< of the rows, [phases x rows]
    int nCols;
    int nRows;
    int nSubPixels;  ///< phases in a pixel; there is one phase more
};

/// The same where the rows have complex weights and phases begin half a pixel before the anchor.
struct ComplexKernelTables {
    const double* padfAcross;
    const double* padfDownReal;
    const double* padfDownImag;
    int nCols;
    int nRows;
    int nPhases;
};

/// Windows at unit scale of a stretch of one target row, over rows of the source.
struct MedianRows {
    /// Of the windows, in order; they begin at the first pixel's window.
    const void* const* papRow;
    /// Room for as many rows, each of the window's columns and kMedianReach samples.
    void* pCopy;
    const void** papCopy;
};
constexpr int kMedianReach = 64;
/// The largest window whose samples the medians stage can count.
constexpr int kMostMedianSamples = 65535;

/// What a store stage knows of the output type's clamp.
template <typename T>
struct StoreLimits {
    T low;
    T high;
    T background;
    bool bAvoid;    ///< keep values off the background
    T tolerance;    ///< how near to the background is too near (floating types)
    T replacement;  ///< what a value too near becomes
};

/// Computes an array of kSpanPixels values from the samples of one channel, or, for a method that
/// takes several channels at once, as many arrays kSpanArray apart. pSrc points at the (first)
/// channel's first sample.
using ValuesFunction = void (*)(const WindowSpan& oSpan, const void* pSrc, double* padfValue);
/// Makes doubles of nCount samples, nChan apart.
using WidenFunction = void (*)(const void* pSrc, int nChan, std::int64_t nCount, double* padf);
/// Filters a row along the columns, for all pixels of oRows.
using AcrossFunction = void (*)(const RowWindows& oRows, const double* padfRow,
                                double* padfFiltered);
/// Computes the values of all pixels of oRows.
using RowValuesFunction = void (*)(const RowWindows& oRows, double* padfValue);
/// Adds a stretch of one channel of a source row to sums, or takes it away, or adds one and takes
/// another away: nCount samples, nChan apart.
using AddRowFunction = void (*)(const void* pAdd, const void* pSubtract, int nChan,
                                std::int64_t nCount, double* padfSum);
/// Computes the medians of nPix windows at unit scale, as samples.
using MediansFunction = void (*)(const MedianRows& oRows, const WindowSize& oSize, int nPix,
                                 void* pMedians);
/// Reads the samples at panOffset of the pixels whose mode is 2.
using NearestFunction = void (*)(const void* pSrc, const std::int64_t* panOffset,
                                 const unsigned char* pabyMode, int nPix, double* padfValue);
/// Turns nPix values, rounded up to whole groups, into samples. pLimits is a StoreLimits<T>.
using StoreFunction = void (*)(const double* padfValue, int nPix, const void* pLimits,
                               void* pSamples);
/// Copies the pixels at panOffset, all channels, to pTgt.
using CopyFunction = void (*)(const void* pSrc, const std::int64_t* panOffset, int nPix, int nChan,
                              void* pTgt);
/// Puts the background among nPix samples where the mask byte at an offset is 0. Looks at the
/// offsets of whole groups.
using FillInvalidFunction = void (*)(const unsigned char* pabyMask, const std::int64_t* panOffset,
                                     int nPix, const void* pBackground, void* pTgt);
/// Writes nPix pixels of three or four channels, whose samples lie in arrays of kSpanArray one
/// behind the other.
using InterleaveFunction = void (*)(const void* pSamples, int nPix, void* pTgt);
/// Clamps samples of an integer type in place.
using ClampFunction = void (*)(void* pSamples, std::int64_t nSamples, const void* pLimits);

/// The ways of making a value out of a window: name of the row in a level's table, and the type
/// that holds the mathematics. Each row has a twin that works on the roots of the samples.
// clang-format off
#define VETRA_VALUES_ROWS(Row)                \
    Row(BILINEAR, Bilinear)                   \
    Row(CUBIC, Cubic)                         \
    Row(CUBICPS, CubicPs)                     \
    Row(LAGRANGE4, Separable<Lagrange4Filter>) \
    Row(LAGRANGE8, Separable<Lagrange8Filter>) \
    Row(SINC8, Separable<KernelFilter<8>>)    \
    Row(SINC16, Separable<KernelFilter<16>>)  \
    Row(KERNEL, Separable<KernelFilter<kAnySize>>) \
    Row(AVERAGE, Average)                     \
    Row(MEDIAN, Median)
// clang-format on

enum ValuesRow : int {
#define VETRA_ROW(Name, Type) eVR_##Name, eVR_SQ##Name,
    VETRA_VALUES_ROWS(VETRA_ROW)
#undef VETRA_ROW
        eVR_CPLXSAR,
    kNumValues,
    eVR_NONE = -1,  ///< for a method without a window
};

/// How a row of the values table is computed from rows of doubles; empty where it can't be.
struct RowStages {
    /// Null for a method that isn't separable: its values come from whole rows.
    AcrossFunction pfnAcross;
    RowValuesFunction pfnValues;
    RowValuesFunction pfnSquaredValues;
    bool bTabulated;  ///< the columns' taps are those of ColumnTaps
};

/// The stages of one processor level.
struct LevelStages {
    const char* pszName;

    // Positions: nPix columns and rows from source values. The bounds come with them, or in a step
    // of their own.
    PositionBounds (*pfnArrayPositions)(const float* pafCol, const float* pafRow, double dfColOff,
                                        double dfRowOff, int nPix, double* padfCol,
                                        double* padfRow);
    /// The first pixel is column nX of row nY; all lie in one row.
    void (*pfnBilinearPositions)(const BilinearCorners& oCorners, std::int64_t nX, std::int64_t nY,
                                 int nPix, double* padfCol, double* padfRow);
    PositionBounds (*pfnBounds)(const double* padfCol, const double* padfRow, int nPix);

    // Modes.
    /// Class bits of each position, and the source pixels at which its window and its nearest pixel
    /// stand: their indices, with nPitch entries in a row, or 0 where they are outside.
    void (*pfnClasses)(const ClassLimits& oLimits, std::int64_t nPitch, const double* padfCol,
                       const double* padfRow, int nPix, unsigned char* pabyClass,
                       std::int64_t* panWindow, std::int64_t* panNearest);
    /// Takes masked pixels out of the classes: the window bit where the window holds a mask byte of
    /// 0, the nearest bit where that pixel can't be used. Returns the set of what it wrote
    /// (1 << class or mode).
    unsigned (*pfnMaskClasses)(const ClassRules& oRules, const MaskBytes& oMask,
                               const std::int64_t* panWindow, const std::int64_t* panNearest,
                               int nPix, unsigned char* pabyClassThenMode);
    /// Classes or modes of target columns from nCol on, where all windows lie in one row and all
    /// nearest pixels, from the class of that row; and bits for pixels whose windows fit but
    /// aren't whole, as in SpanPlaces.
    unsigned (*pfnRowClasses)(const ClassRules& oRules, const MaskRow& oMask,
                              unsigned char nRowClass, int nCol, int nPix,
                              unsigned char* pabyClassThenMode, std::uint64_t* panBroken);
    /// Bits of nCount mask bytes, set where they are nValue (bEqual) or aren't; and zeros up to a
    /// whole word.
    void (*pfnMaskBits)(const unsigned char* pabyMask, std::int64_t nCount, unsigned char nValue,
                        bool bEqual, std::uint64_t* panBits);
    /// Makes a band of up to kBandRows rows of bits, nRowWords from one to the next: 64 bytes of
    /// each word.
    void (*pfnMakeBand)(const std::uint64_t* panBits, std::int64_t nRowWords, int nRows,
                        std::int64_t nWords, unsigned char* pabyBand);
    /// Classes or modes, where bits of the mask are known, and places: as pfnClasses,
    /// pfnMaskClasses, pfnWindows and pfnNearestPlaces, but places are given for all windows that
    /// fit, and nearest ones only in groups in which the class of one pixel depends on it.
    unsigned (*pfnMappedPlaces)(const ClassLimits& oLimits, const ClassRules& oRules,
                                const MaskBands& oMask, int nPitch, int nChan,
                                const double* padfCol, const double* padfRow, int nPix,
                                const SpanPlaces& oPlaces);
    /// Modes where every request is 1 and no source pixel is masked, from the positions: 1 where
    /// the window fits, else nFallback where the nearest pixel is inside, else 0. Returns the set
    /// of modes (1 << mode).
    unsigned (*pfnOpenModes)(const ClassLimits& oLimits, bool bWindow, unsigned char nFallback,
                             const double* padfCol, const double* padfRow, int nPix,
                             unsigned char* pabyMode);

    // Places: where the samples of the pixels of one mode start.
    /// Windows: offsets of the first sample and fractions, 0 where the mode isn't 1 (pabyMode may
    /// be null: all are 1).
    void (*pfnWindows)(const ClassLimits& oLimits, double dfPitch, double dfChan,
                       const double* padfCol, const double* padfRow, const unsigned char* pabyMode,
                       int nPix, std::int64_t* panOffset, double* padfFracCol, double* padfFracRow);
    /// Nearest pixels: their offsets, 0 where the mode isn't 2 (pabyMode may be null: all are 2).
    void (*pfnNearestPlaces)(double dfPitch, double dfChan, const double* padfCol,
                             const double* padfRow, const unsigned char* pabyMode, int nPix,
                             std::int64_t* panOffset);

    // Values and stores, by sample type.
    ValuesFunction apfnValues[kNumValues][kNumSampleTypes];
    /// Bilinear values of three and of four channels at once.
    ValuesFunction apfnBilinearPixels[2][kNumSampleTypes];
    WidenFunction apfnWiden[kNumSampleTypes];
    /// Makes the roots of the samples.
    WidenFunction apfnWidenRoots[kNumSampleTypes];
    /// The taps of a row's groups, by which rows are filtered.
    void (*pfnColumnTaps)(const void* pParameters, const double* padfFracCol, int nPix,
                          double* padfTaps);
    /// Means of integers: rows are added to the sums of columns (pSubtract may be null), or taken
    /// away (pAdd is null). Sums of many columns are added up from the left, n + 1 of them; the
    /// last stages take what they need from one row, of either sums.
    AddRowFunction apfnAddRow[kNumSampleTypes];
    void (*pfnAddUp)(const double* padfSum, std::int64_t nCount, double* padfTotal);
    RowValuesFunction pfnSumValues;
    RowValuesFunction pfnTotalValues;
    /// Medians, and what their squared twins make of them: the root of the median is the median of
    /// the roots. Null for most types.
    MediansFunction apfnMedians[kNumSampleTypes];
    WidenFunction apfnWidenSquaredRoots[kNumSampleTypes];
    /// By the half of a row's number, which it shares with its squared twin.
    RowStages aoRows[(kNumValues - 1) / 2];
    NearestFunction apfnNearest[kNumSampleTypes];
    /// With 0 in the place of negative samples.
    NearestFunction apfnNonNegativeNearest[kNumSampleTypes];
    StoreFunction apfnStore[kNumSampleTypes];
    /// Of three and of four channels.
    InterleaveFunction apfnInterleave[2][kNumSampleTypes];
    /// Null for the types whose samples may change on their way through a double.
    CopyFunction apfnCopy[kNumSampleTypes];
    FillInvalidFunction apfnFillInvalid[kNumSampleTypes];
    ClampFunction apfnClamp[kNumSampleTypes];
};

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_STAGES_H
