// The stages of the sampling loop, compiled once per processor level. A level's source defines
// VETRA_LEVEL, its namespace, and VETRA_LANES, its lane layer, and includes this file.
//
// Everything stands in the level's namespace and nothing of the standard library is called, so that
// no code built for one processor can be linked into another's path.
//
// The lane layer works on eight pixels at a time, each in a lane of its own, and every lane does
// the operations of a plain evaluation in the plain order; so all levels give the same bits. It
// offers
//   F64, B64                     eight doubles; eight truth values
//   + - * / <= < > == & Select   lane by lane; a comparison with NaN is false
//   DivideBy                     division by a Divisor, of numbers that are not tiny
//   AnyTiny                      whether there are any that DivideBy can't divide: below 2^-511 in
//                                size, except 0
//   Least Greatest               the first where it is less, or greater, else the second
//   ZeroWhere                    0.0 in the lanes where a truth value holds
//   Set Set1                     of eight doubles; of one in all lanes
//   Load Store LoadFloats        from and to memory, aligned or not
//   Floor RoundEven Sqrt         RoundEven: to nearest, ties to even
//   LeastLane GreatestLane       of the eight; none is a NaN
//   RunningSums LastLane         sums from the left, up to each lane; the last lane in all
//   Bits BytesEqual              truth values as bits; which of eight bytes have a value
//   ByteBits FullPairBits        bits: which bytes at eight offsets have a value; at which offsets
//                                neither of two adjacent bytes is 0
//   GroupBits                    bits: which of a BitGroup's columns a row of bits has
//   Cells                        eight pixels of the source, the first one where a pixel is outside
//   CellsInside Bits             pixels of whole columns and rows, NaN included, that CellLimits
//                                have; which ones are inside, as bits
//   StorePlaces                  their offsets, of so many samples a row and a pixel; Store keeps
//                                their columns and rows
//   BandBits                     bits: which of them bands of bits have, as MaskBands
//   StoreBits AddBits            64 bytes: bit 0 of each from one word, bit 1 from another; one bit
//                                of each, among those that are set
//   EqualBits                    bits: which of 64 bytes have a value
//   StoreIntegers                whole numbers from 0 to 2^52 as 64-bit integers
//   Gather GatherPair            samples (pairs of adjacent samples) at eight offsets
//   ShufflePairs                 pairs of samples out of sixteen, as a PairGroup says
//   GatherQuad                   four adjacent samples at eight offsets
//   GatherNear                   doubles at eight offsets and a shift below kNearColumns, together
//                                below kNearReach
//   LoadSamples                  eight adjacent samples
//   LoadEvery                    eight 8-bit samples, three or four apart
//   CopySamples                  samples at eight offsets, as they are (integers of up to 32 bits)
//   StoreSamples                 eight values that T can hold (float: rounds to nearest)

#include <cfloat>
#include <cstdint>

#if defined(__x86_64__)
#include <immintrin.h>
#endif

#include "vetra/base/utils/resample/engine/stages.h"

static_assert(FLT_EVAL_METHOD == 0, "double arithmetic must be done in double");

// A stage is one function: with so many of them in a source, GCC stops inlining lane operations at
// some point. Plain processors have more operations for each lane operation, which would take long
// to compile and gain little.
#if defined(__GNUC__) && !defined(__clang__) && defined(__AVX2__)
#define VETRA_STAGE [[gnu::flatten]]
#else
#define VETRA_STAGE
#endif

namespace vetra::utils::engine::VETRA_LEVEL {

namespace {

#include "vetra/base/utils/resample/engine/scalars_inl.h"
#include VETRA_LANES

// In this order: each uses names of those before it.
// clang-format off
#include "vetra/base/utils/resample/engine/positions_inl.h"
#include "vetra/base/utils/resample/engine/modes_inl.h"
#include "vetra/base/utils/resample/engine/windows_inl.h"
#include "vetra/base/utils/resample/algorithm/bilinear_inl.h"
#include "vetra/base/utils/resample/algorithm/separable_inl.h"
#include "vetra/base/utils/resample/algorithm/cubic_inl.h"
#include "vetra/base/utils/resample/algorithm/lagrange_inl.h"
#include "vetra/base/utils/resample/algorithm/kernel_inl.h"
#include "vetra/base/utils/resample/algorithm/windowstatistics_inl.h"
#include "vetra/base/utils/resample/engine/values_inl.h"
#include "vetra/base/utils/resample/engine/rows_inl.h"
#include "vetra/base/utils/resample/engine/sums_inl.h"
#include "vetra/base/utils/resample/engine/medians_inl.h"
#include "vetra/base/utils/resample/engine/stores_inl.h"
// clang-format on

}  // namespace

// One entry per sample type, in the order of the type codes.
#define VETRA_PER_TYPE(Entry, ...)                                                             \
    {                                                                                          \
        Entry(__VA_ARGS__ unsigned char), Entry(__VA_ARGS__ signed char),                      \
            Entry(__VA_ARGS__ unsigned short), Entry(__VA_ARGS__ short),                       \
            Entry(__VA_ARGS__ unsigned int), Entry(__VA_ARGS__ int), Entry(__VA_ARGS__ float), \
            Entry(__VA_ARGS__ std::uint64_t), Entry(__VA_ARGS__ std::int64_t),                 \
            Entry(__VA_ARGS__ double)                                                          \
    }
#define VETRA_PER_SHORT_INTEGER(Entry)                                                 \
    {                                                                                  \
        Entry(unsigned char), Entry(signed char), Entry(unsigned short), Entry(short), \
            Entry(unsigned int), Entry(int), nullptr, nullptr, nullptr, nullptr        \
    }
#define VETRA_PER_SMALL_INTEGER(Entry)                                                          \
    {                                                                                           \
        Entry(unsigned char), Entry(signed char), Entry(unsigned short), Entry(short), nullptr, \
            nullptr, nullptr, nullptr, nullptr, nullptr                                         \
    }
#define VETRA_VALUES(Method, T) &Values<Method, T>
#define VETRA_COMPLEX_VALUES(Method, T) &ComplexValues<Method, T>
#define VETRA_PIXELS(kNumChan, T) &BilinearPixels<kNumChan, T>
#define VETRA_TWINS(Name, Method) \
    VETRA_PER_TYPE(VETRA_VALUES, Method, ), VETRA_PER_TYPE(VETRA_VALUES, Squared<Method>, ),
#define VETRA_ROWS(Name, Method) RowStagesOf<Method>::kStages,
#define VETRA_WIDEN(T) &Widen<T, Widened::eSamples>
#define VETRA_WIDEN_ROOTS(T) &Widen<T, Widened::eRoots>
#define VETRA_WIDEN_SQUARED_ROOTS(T) &Widen<T, Widened::eSquaredRoots>
#define VETRA_ADD_ROW(T) &AddRow<T>
#define VETRA_MEDIANS(T) &Medians<T>
#define VETRA_NEAREST(T) &NearestValues<T, false>
#define VETRA_NONNEGATIVE(T) &NearestValues<T, true>
#define VETRA_STORE(T) &StoreValues<T>
#define VETRA_INTERLEAVE(kNumChan, T) &Interleave<kNumChan, T>
#define VETRA_COPY(T) &CopyPixels<T>
#define VETRA_FILL_INVALID(T) &FillInvalid<T>
#define VETRA_CLAMP(T) &ClampSamples<T>

#define VETRA_TEXT(x) #x
#define VETRA_NAME(x) VETRA_TEXT(x)

extern const LevelStages kStages;
const LevelStages kStages = {
    VETRA_NAME(VETRA_LEVEL),
    &ArrayPositions,
    &BilinearPositions,
    &Bounds,
    &Classes,
    &MaskClasses,
    &RowClasses,
    &MaskBits,
    &MakeBand,
    &MappedPlaces,
    &OpenModes,
    &Windows,
    &NearestPlaces,
    {VETRA_VALUES_ROWS(VETRA_TWINS) VETRA_PER_TYPE(VETRA_COMPLEX_VALUES, CplxSar, )},
    {VETRA_PER_TYPE(VETRA_PIXELS, 3, ), VETRA_PER_TYPE(VETRA_PIXELS, 4, )},
    VETRA_PER_TYPE(VETRA_WIDEN),
    VETRA_PER_TYPE(VETRA_WIDEN_ROOTS),
    &ColumnTaps,
    VETRA_PER_TYPE(VETRA_ADD_ROW),
    &AddUp,
    &SumValues,
    &TotalValues,
    VETRA_PER_SMALL_INTEGER(VETRA_MEDIANS),
    VETRA_PER_SMALL_INTEGER(VETRA_WIDEN_SQUARED_ROOTS),
    {VETRA_VALUES_ROWS(VETRA_ROWS)},
    VETRA_PER_TYPE(VETRA_NEAREST),
    VETRA_PER_TYPE(VETRA_NONNEGATIVE),
    VETRA_PER_TYPE(VETRA_STORE),
    {VETRA_PER_TYPE(VETRA_INTERLEAVE, 3, ), VETRA_PER_TYPE(VETRA_INTERLEAVE, 4, )},
    VETRA_PER_SHORT_INTEGER(VETRA_COPY),
    VETRA_PER_SHORT_INTEGER(VETRA_FILL_INVALID),
    VETRA_PER_SHORT_INTEGER(VETRA_CLAMP),
};

}  // namespace vetra::utils::engine::VETRA_LEVEL
