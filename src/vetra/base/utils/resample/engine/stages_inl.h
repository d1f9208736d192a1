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
//   ZeroWhere                    0.0 in the lanes where a truth value holds
//   Set1 Load Store LoadFloats   from and to memory, aligned or not
//   Floor RoundEven Sqrt         RoundEven: to nearest, ties to even
//   Bits BytesEqual              truth values as bits; which of eight bytes have a value
//   ByteBits FullPairBits        bits: which bytes at eight offsets have a value; at which offsets
//                                neither of two adjacent bytes is 0
//   StoreIntegers                whole numbers from 0 to 2^52 as 64-bit integers
//   Gather GatherPair            samples (pairs of adjacent samples) at eight offsets
//   ShufflePairs                 pairs of samples out of sixteen, as a PairGroup says
//   CopySamples                  samples at eight offsets, as they are (integers of up to 32 bits)
//   StoreSamples                 eight values that T can hold (float: rounds to nearest)

#include <cfloat>
#include <cstdint>

#if defined(__x86_64__)
#include <immintrin.h>
#endif

#include "vetra/base/utils/resample/engine/stages.h"

static_assert(FLT_EVAL_METHOD == 0, "double arithmetic must be done in double");

namespace vetra::utils::engine::VETRA_LEVEL {

namespace {

#include VETRA_LANES

// Eight bytes: bit 0 of each from nBits0, bit 1 from nBits1.
inline void StoreBits(unsigned char* p, unsigned nBits0, unsigned nBits1) {
#if defined(__BMI2__)
    constexpr std::uint64_t nLowest = 0x0101010101010101u;
    const std::uint64_t nBytes = _pdep_u64(nBits0, nLowest) | _pdep_u64(nBits1, nLowest << 1);
    __builtin_memcpy(p, &nBytes, sizeof nBytes);
#else
    for (int i = 0; i < kLanes; ++i) {
        p[i] = static_cast<unsigned char>((nBits0 >> i & 1u) | (nBits1 >> i & 1u) << 1);
    }
#endif
}

inline bool AnyByteEquals(const unsigned char* p, unsigned char nValue) {
    return Bits(BytesEqual(p, nValue)) != 0;
}

// ---- Positions ----

void ArrayPositions(const float* pafCol, const float* pafRow, double dfColOff, double dfRowOff,
                    int nPix, double* padfCol, double* padfRow) {
    const F64 vColOff = Set1(dfColOff);
    const F64 vRowOff = Set1(dfRowOff);
    // Beyond the end of a page the processor's own prefetchers don't look.
    constexpr int kAhead = 1024;
    int i = 0;
    for (; i + kLanes <= nPix; i += kLanes) {
        if (i % (2 * kLanes) == 0) {
            __builtin_prefetch(pafCol + i + kAhead);
            __builtin_prefetch(pafRow + i + kAhead);
        }
        Store(padfCol + i, LoadFloats(pafCol + i) + vColOff);
        Store(padfRow + i, LoadFloats(pafRow + i) + vRowOff);
    }
    for (; i < nPix; ++i) {
        padfCol[i] = static_cast<double>(pafCol[i]) + dfColOff;
        padfRow[i] = static_cast<double>(pafRow[i]) + dfRowOff;
    }
}

void BilinearPositions(const BilinearCorners& oCorners, std::int64_t nX, std::int64_t nY, int nPix,
                       double* padfCol, double* padfRow) {
    static const double kadfSteps[kLanes] = {0, 1, 2, 3, 4, 5, 6, 7};
    const F64 one = Set1(1.0);
    const bool bWide = oCorners.nCols > 1;
    const F64 vSpan = Set1(bWide ? oCorners.nCols - 1 : 1.0);
    const double dfV = oCorners.nRows > 1 ? static_cast<double>(nY) / (oCorners.nRows - 1) : 0.0;
    const F64 v = Set1(dfV);
    const auto fnPosition = [&](const double* padfCorner, F64 u) {
        return ((one - u) * Set1(padfCorner[2]) + u * Set1(padfCorner[3])) * v +
               ((one - u) * Set1(padfCorner[0]) + u * Set1(padfCorner[1])) * (one - v);
    };
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 x = Set1(static_cast<double>(nX + i)) + Load(kadfSteps);
        const F64 u = bWide ? x / vSpan : Set1(0.0);
        Store(padfCol + i, fnPosition(oCorners.adfCol, u));
        Store(padfRow + i, fnPosition(oCorners.adfRow, u));
    }
}

// ---- Modes ----

// floor(x) <= last is x < last + 1 for whole numbers, which saves the floor.
struct Limits {
    explicit Limits(const ClassLimits& o)
        : fitColFirst(Set1(o.dfFitColFirst)),
          fitColEnd(Set1(o.dfFitColLast + 1.0)),
          fitRowFirst(Set1(o.dfFitRowFirst)),
          fitRowEnd(Set1(o.dfFitRowLast + 1.0)),
          nearColEnd(Set1(o.dfNearColLast + 1.0)),
          nearRowEnd(Set1(o.dfNearRowLast + 1.0)),
          anchorShift(Set1(o.bAnchorNearest ? 0.5 : 0.0)) {}

    // Which windows lie inside the source.
    B64 Fit(F64 col, F64 row) const {
        const F64 anchorCol = col + anchorShift;
        const F64 anchorRow = row + anchorShift;
        return (fitColFirst <= anchorCol) & (anchorCol < fitColEnd) & (fitRowFirst <= anchorRow) &
               (anchorRow < fitRowEnd);
    }
    // Which nearest pixels do.
    B64 Near(F64 col, F64 row) const {
        const F64 zero = Set1(0.0);
        const F64 half = Set1(0.5);
        const F64 nearCol = col + half;
        const F64 nearRow = row + half;
        return (zero <= nearCol) & (nearCol < nearColEnd) & (zero <= nearRow) &
               (nearRow < nearRowEnd);
    }

    F64 fitColFirst, fitColEnd, fitRowFirst, fitRowEnd, nearColEnd, nearRowEnd, anchorShift;
};

inline F64 Nearest(F64 pos) { return Floor(pos + Set1(0.5)); }

// A whole number where lanes say so, else 0.
inline void StorePlaces(std::int64_t* p, B64 lanes, F64 place) {
    StoreIntegers(p, Select(lanes, place, Set1(0.0)));
}

// The pixel from which a window's offsets count.
inline F64 Anchor(const ClassLimits& oLimits, F64 pos) {
    return oLimits.bAnchorNearest ? Nearest(pos) : Floor(pos);
}

void Classes(const ClassLimits& oClassLimits, int nSrcCols, const double* padfCol,
             const double* padfRow, int nPix, unsigned char* pabyClass, std::int64_t* panWindow,
             std::int64_t* panNearest) {
    const Limits oLimits(oClassLimits);
    const F64 pitch = Set1(nSrcCols);
    const F64 first = Set1(oClassLimits.dfRowOff * nSrcCols + oClassLimits.dfColOff);
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        const B64 fit = oLimits.Fit(col, row);
        const B64 near = oLimits.Near(col, row);
        StoreBits(pabyClass + i, Bits(fit), Bits(near));
        StorePlaces(panWindow + i, fit,
                    Anchor(oClassLimits, row) * pitch + Anchor(oClassLimits, col) + first);
        StorePlaces(panNearest + i, near, Nearest(row) * pitch + Nearest(col));
    }
}

void MaskClasses(const MaskWindow& oWindow, const std::int64_t* panWindow,
                 const std::int64_t* panNearest, int nPix, unsigned char* pabyClass) {
    for (int i = 0; i < nPix; i += kLanes) {
        unsigned char* pabyGroup = pabyClass + i;
        // Where nothing fits the source may be smaller than a window.
        unsigned nFull = 0;
        if (AnyByteEquals(pabyGroup, kClassFits) ||
            AnyByteEquals(pabyGroup, kClassFits | kClassNear)) {
            nFull = 0xff;
            const unsigned char* pabyRow = oWindow.pabyWindow;
            for (int nRow = 0; nRow < oWindow.nWndRows; ++nRow, pabyRow += oWindow.nSrcCols) {
                int nCol = 0;
                for (; nCol + 1 < oWindow.nWndCols; nCol += 2) {
                    nFull &= FullPairBits(pabyRow + nCol, panWindow + i);
                }
                if (nCol < oWindow.nWndCols) {
                    nFull &= ~ByteBits(pabyRow + nCol, panWindow + i, 0);
                }
            }
        }
        const unsigned nUsable = oWindow.bExactlyOne
                                     ? ByteBits(oWindow.pabyNearest, panNearest + i, 1)
                                     : ~ByteBits(oWindow.pabyNearest, panNearest + i, 0);
        unsigned char abyKeep[kLanes];
        StoreBits(abyKeep, nFull & 0xffu, nUsable & 0xffu);
        for (int k = 0; k < kLanes; ++k) {
            pabyGroup[k] &= abyKeep[k];
        }
    }
}

unsigned OpenModes(const ClassLimits& oClassLimits, bool bWindow, unsigned char nFallback,
                   const double* padfCol, const double* padfRow, int nPix,
                   unsigned char* pabyMode) {
    const Limits oLimits(oClassLimits);
    unsigned nFitAny = 0;
    unsigned nNearAny = 0;
    unsigned nNoneAny = 0;
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        const unsigned nFit = bWindow ? Bits(oLimits.Fit(col, row)) : 0u;
        unsigned nNear = 0;
        if (nFit != 0xffu && nFallback != 0) {
            nNear = Bits(oLimits.Near(col, row)) & ~nFit;
        }
        StoreBits(pabyMode + i, nFit, nNear);
        nFitAny |= nFit;
        nNearAny |= nNear;
        nNoneAny |= ~(nFit | nNear) & 0xffu;
    }
    return (nNoneAny != 0 ? 1u : 0u) | (nFitAny != 0 ? 2u : 0u) | (nNearAny != 0 ? 4u : 0u);
}

// ---- Places ----

void Windows(const ClassLimits& oLimits, double dfPitch, double dfChan, const double* padfCol,
             const double* padfRow, const unsigned char* pabyMode, int nPix,
             std::int64_t* panOffset, double* padfFracCol, double* padfFracRow) {
    // Offsets are whole numbers below 2^53, so exact in double.
    const F64 pitch = Set1(dfPitch);
    const F64 chan = Set1(dfChan);
    const F64 first = Set1(oLimits.dfRowOff * dfPitch + oLimits.dfColOff * dfChan);
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        const F64 anchorCol = Anchor(oLimits, col);
        const F64 anchorRow = Anchor(oLimits, row);
        const F64 offset = anchorRow * pitch + anchorCol * chan + first;
        if (pabyMode == nullptr) {
            StoreIntegers(panOffset + i, offset);
        } else {
            StorePlaces(panOffset + i, BytesEqual(pabyMode + i, 1), offset);
        }
        Store(padfFracCol + i, col - anchorCol);
        Store(padfFracRow + i, row - anchorRow);
    }
}

void NearestPlaces(double dfPitch, double dfChan, const double* padfCol, const double* padfRow,
                   const unsigned char* pabyMode, int nPix, std::int64_t* panOffset) {
    const F64 pitch = Set1(dfPitch);
    const F64 chan = Set1(dfChan);
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 offset = Nearest(Load(padfRow + i)) * pitch + Nearest(Load(padfCol + i)) * chan;
        if (pabyMode == nullptr) {
            StoreIntegers(panOffset + i, offset);
        } else {
            StorePlaces(panOffset + i, BytesEqual(pabyMode + i, 2), offset);
        }
    }
}

// ---- Values ----

// Whether samples of this type can make a NaN.
template <typename T>
inline constexpr bool kIsFloating = T(0.5) != T(0);

// The size of a method's windows where each run has its own.
constexpr int kAnySize = 0;

// The windows of eight pixels, for one channel.
template <typename T, bool kSingleChannel>
struct WindowReader {
    const T* pFirst;
    const std::int64_t* panOffset;
    const WindowSpan& oSpan;

    // The first N samples of window row nRow.
    template <int N>
    void Row(int nRow, F64 (&p)[N]) const {
        const T* pRow = pFirst + nRow * oSpan.nPitch;
        for (int j = 0; j < N; j += 2) {
            if constexpr (kSingleChannel) {
                GatherPair(pRow + j, panOffset, p[j], p[j + 1]);
            } else {
                p[j] = Gather(pRow + j * oSpan.nChan, panOffset);
                p[j + 1] = Gather(pRow + (j + 1) * oSpan.nChan, panOffset);
            }
        }
    }

    // The sample in column nCol of window row nRow.
    F64 Sample(int nRow, int nCol) const {
        return Gather(pFirst + nRow * oSpan.nPitch + static_cast<std::int64_t>(nCol) * oSpan.nChan,
                      panOffset);
    }

    // That sample and the one of the next channel.
    void ChannelPair(int nRow, int nCol, F64& first, F64& second) const {
        GatherPair(pFirst + nRow * oSpan.nPitch + static_cast<std::int64_t>(nCol) * oSpan.nChan,
                   panOffset, first, second);
    }

    template <typename Parameters>
    const Parameters& Get() const {
        return *static_cast<const Parameters*>(oSpan.pParameters);
    }
    double* Scratch() const { return oSpan.padfScratch; }

    bool HasMask() const { return oSpan.pabyMask != nullptr; }

    // The mask bytes of the same samples.
    template <int N>
    void MaskRow(int nRow, F64 (&p)[N]) const {
        std::int64_t anPixel[kLanes];
        for (int i = 0; i < kLanes; ++i) {
            anPixel[i] = panOffset[i] / oSpan.nChan;
        }
        const unsigned char* pabyRow = oSpan.pabyMask + nRow * (oSpan.nPitch / oSpan.nChan);
        for (int j = 0; j < N; ++j) {
            p[j] = Gather(pabyRow + j, anPixel);
        }
    }
};

// The same where sixteen adjacent samples hold all pairs.
template <typename T>
struct GroupReader {
    const T* pFirst;
    const PairGroup* poGroup;
    std::int64_t nPitch;

    void Row(int nRow, F64 (&p)[2]) const {
        ShufflePairs(pFirst + nRow * nPitch + poGroup->nOffset, poGroup->abyPlace, p[0], p[1]);
    }
};

// The square root of a sample that is greater than 0; 0 for every other one, NaN included.
inline F64 Root(F64 sample) {
    const F64 zero = Set1(0.0);
    return Select(sample > zero, Sqrt(sample), zero);
}

// Windows of roots.
template <typename Window>
struct RootReader {
    const Window& oWindow;

    template <int N>
    void Row(int nRow, F64 (&p)[N]) const {
        oWindow.Row(nRow, p);
        for (int j = 0; j < N; ++j) {
            p[j] = Root(p[j]);
        }
    }
    F64 Sample(int nRow, int nCol) const { return Root(oWindow.Sample(nRow, nCol)); }
    template <typename Parameters>
    const Parameters& Get() const {
        return oWindow.template Get<Parameters>();
    }
    double* Scratch() const { return oWindow.Scratch(); }
    bool HasMask() const { return oWindow.HasMask(); }
    template <int N>
    void MaskRow(int nRow, F64 (&p)[N]) const {
        oWindow.MaskRow(nRow, p);
    }
};

// A method on the roots of the samples, its value squared.
template <typename Method>
struct Squared {
    static constexpr int kSize = Method::kSize;

    template <typename Window>
    static F64 Value(const Window& oWindow, F64 dx, F64 dy) {
        const F64 value = Method::Value(RootReader<Window>{oWindow}, dx, dy);
        return value * value;
    }
};

template <typename T>
inline void StoreValue(double* p, F64 value) {
    if constexpr (kIsFloating<T>) {
        // Which bits a NaN gets from arithmetic depends on the processor and on the order of
        // operands, which a compiler may exchange.
        value = Select(value == value, value, Set1(__builtin_nan("")));
    }
    Store(p, value);
}

// Calls fnGroup with the first pixel of each group of eight that has a window, the window reader
// and the fractions.
template <typename T, bool kSingleChannel, typename Function>
inline void ForEachGroup(const WindowSpan& oSpan, const T* pSrc, const Function& fnGroup) {
    for (int i = 0; i < oSpan.nPix; i += kLanes) {
        if (oSpan.pabyMode != nullptr && !AnyByteEquals(oSpan.pabyMode + i, 1)) {
            continue;
        }
        fnGroup(i, WindowReader<T, kSingleChannel>{pSrc, oSpan.panOffset + i, oSpan},
                Load(oSpan.padfFracCol + i), Load(oSpan.padfFracRow + i));
    }
}

template <typename Method, typename T, bool kSingleChannel>
void ValuesLoop(const WindowSpan& oSpan, const T* pSrc, double* padfValue) {
    ForEachGroup<T, kSingleChannel>(
        oSpan, pSrc, [&](int i, const WindowReader<T, kSingleChannel>& oWindow, F64 dx, F64 dy) {
            if constexpr (sizeof(T) == 1 && kSingleChannel && Method::kSize == 2) {
                const PairGroup* poGroup =
                    oSpan.poGroups != nullptr ? oSpan.poGroups + i / kLanes : nullptr;
                if (poGroup != nullptr && poGroup->nOffset >= 0) {
                    const GroupReader<T> oGroup{pSrc, poGroup, oSpan.nPitch};
                    StoreValue<T>(padfValue + i, Method::Value(oGroup, dx, dy));
                    return;
                }
            }
            StoreValue<T>(padfValue + i, Method::Value(oWindow, dx, dy));
        });
}

template <typename Method, typename T>
void Values(const WindowSpan& oSpan, const void* pSrc, double* padfValue) {
    const T* p = static_cast<const T*>(pSrc);
    oSpan.nChan == 1 ? ValuesLoop<Method, T, true>(oSpan, p, padfValue)
                     : ValuesLoop<Method, T, false>(oSpan, p, padfValue);
}

// A method that makes one complex value out of the samples of two channels.
template <typename Method, typename T>
void ComplexValues(const WindowSpan& oSpan, const void* pSrc, double* padfValue) {
    ForEachGroup<T, false>(oSpan, static_cast<const T*>(pSrc),
                           [&](int i, const WindowReader<T, false>& oWindow, F64 dx, F64 dy) {
                               F64 re;
                               F64 im;
                               Method::Value(oWindow, dx, dy, re, im);
                               StoreValue<T>(padfValue + i, re);
                               StoreValue<T>(padfValue + kSpanArray + i, im);
                           });
}

template <typename T, bool kNonNegative>
void NearestValues(const void* pSrc, const std::int64_t* panOffset, const unsigned char* pabyMode,
                   int nPix, double* padfValue) {
    const T* p = static_cast<const T*>(pSrc);
    const auto fnNearest = [&](int i) {
        const F64 sample = Gather(p, panOffset + i);
        // Not as a Select: Clang 14 makes a maximum of that which takes the sign of -0.0 away.
        return kNonNegative ? ZeroWhere(Set1(0.0) > sample, sample) : sample;
    };
    for (int i = 0; i < nPix; i += kLanes) {
        if (pabyMode == nullptr) {
            Store(padfValue + i, fnNearest(i));
        } else if (AnyByteEquals(pabyMode + i, 2)) {
            Store(padfValue + i,
                  Select(BytesEqual(pabyMode + i, 2), fnNearest(i), Load(padfValue + i)));
        }
    }
}

#include "vetra/base/utils/resample/algorithm/bilinear_inl.h"
#include "vetra/base/utils/resample/algorithm/cubic_inl.h"
#include "vetra/base/utils/resample/algorithm/kernel_inl.h"
#include "vetra/base/utils/resample/algorithm/lagrange_inl.h"
#include "vetra/base/utils/resample/algorithm/windowstatistics_inl.h"

// ---- Stores ----

// A rounded double as a 64-bit integer; it saturates, and a NaN gives the lowest value.
template <typename T>
inline T ToInteger64(double df) {
    constexpr bool bSigned = T(-1) < T(0);
    constexpr double dfEnd = bSigned ? 0x1p63 : 0x1p64;
    constexpr T lowest = bSigned ? static_cast<T>(T(1) << 63) : T(0);
    if (!(df > (bSigned ? -dfEnd : 0.0))) {
        return lowest;
    }
    return df >= dfEnd ? static_cast<T>(~lowest) : static_cast<T>(df);
}

template <typename T>
void StoreFloating(const double* padfValue, int nPix, const StoreLimits<T>& oLimits, T* p) {
    const F64 low = Set1(static_cast<double>(oLimits.low));
    const F64 high = Set1(static_cast<double>(oLimits.high));
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 v = Load(padfValue + i);
        StoreSamples(p + i, Select(v < low, low, Select(v > high, high, v)));
    }
    if (oLimits.bAvoid) {
        const double dfBackground = static_cast<double>(oLimits.background);
        const double dfTolerance = static_cast<double>(oLimits.tolerance);
        for (int i = 0; i < nPix; ++i) {
            const double dfDistance = __builtin_fabs(static_cast<double>(p[i]) - dfBackground);
            p[i] = dfDistance < dfTolerance ? oLimits.replacement : p[i];
        }
    }
}

template <typename T>
void StoreInteger(const double* padfValue, int nPix, const StoreLimits<T>& oLimits, T* p) {
    const F64 low = Set1(static_cast<double>(oLimits.low));
    const F64 high = Set1(static_cast<double>(oLimits.high));
    const F64 background = Set1(static_cast<double>(oLimits.background));
    const F64 replacement = Set1(static_cast<double>(oLimits.replacement));
    for (int i = 0; i < nPix; i += kLanes) {
        F64 v = RoundEven(Load(padfValue + i));
        // In this order: the limits can be crossed. A NaN takes the low limit.
        v = Select(low <= v, Select(v > high, high, v), low);
        if (oLimits.bAvoid) {
            v = Select(v == background, replacement, v);
        }
        StoreSamples(p + i, v);
    }
}

// Limits of 64-bit integers may have no double of their own: clamped as integers.
template <typename T>
void StoreInteger64(const double* padfValue, int nPix, const StoreLimits<T>& oLimits, T* p) {
    for (int i = 0; i < nPix; i += kLanes) {
        double adf[kLanes];
        Store(adf, RoundEven(Load(padfValue + i)));
        for (int k = 0; k < kLanes; ++k) {
            T v = ToInteger64<T>(adf[k]);
            v = v < oLimits.low ? oLimits.low : v > oLimits.high ? oLimits.high : v;
            p[i + k] = oLimits.bAvoid && v == oLimits.background ? oLimits.replacement : v;
        }
    }
}

template <typename T>
void StoreValues(const double* padfValue, int nPix, const void* pLimits, void* pSamples) {
    const StoreLimits<T>& oLimits = *static_cast<const StoreLimits<T>*>(pLimits);
    T* p = static_cast<T*>(pSamples);
    if constexpr (kIsFloating<T>) {
        StoreFloating(padfValue, nPix, oLimits, p);
    } else if constexpr (sizeof(T) == 8) {
        StoreInteger64(padfValue, nPix, oLimits, p);
    } else {
        StoreInteger(padfValue, nPix, oLimits, p);
    }
}

template <typename T>
void CopyPixels(const void* pSrc, const std::int64_t* panOffset, int nPix, int nChan, void* pTgt) {
    const T* p = static_cast<const T*>(pSrc);
    T* t = static_cast<T*>(pTgt);
    if (nChan == 1) {
        int i = 0;
        for (; i + kLanes <= nPix; i += kLanes) {
            CopySamples(t + i, p, panOffset + i);
        }
        for (; i < nPix; ++i) {
            t[i] = p[panOffset[i]];
        }
        return;
    }
    for (int i = 0; i < nPix; ++i) {
        const T* pPixel = p + panOffset[i];
        for (int c = 0; c < nChan; ++c) {
            *t++ = pPixel[c];
        }
    }
}

template <typename T>
void ClampSamples(void* pSamples, std::int64_t nSamples, const void* pLimits) {
    const StoreLimits<T> oLimits = *static_cast<const StoreLimits<T>*>(pLimits);
    T* p = static_cast<T*>(pSamples);
    for (std::int64_t i = 0; i < nSamples; ++i) {
        const T v = p[i];
        p[i] = v < oLimits.low ? oLimits.low : v > oLimits.high ? oLimits.high : v;
    }
    if (oLimits.bAvoid) {
        for (std::int64_t i = 0; i < nSamples; ++i) {
            p[i] = p[i] == oLimits.background ? oLimits.replacement : p[i];
        }
    }
}

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
#define VETRA_VALUES(Method, T) &Values<Method, T>
#define VETRA_COMPLEX_VALUES(Method, T) &ComplexValues<Method, T>
#define VETRA_TWINS(Name, Method) \
    VETRA_PER_TYPE(VETRA_VALUES, Method, ), VETRA_PER_TYPE(VETRA_VALUES, Squared<Method>, ),
#define VETRA_NEAREST(T) &NearestValues<T, false>
#define VETRA_NONNEGATIVE(T) &NearestValues<T, true>
#define VETRA_STORE(T) &StoreValues<T>
#define VETRA_COPY(T) &CopyPixels<T>
#define VETRA_CLAMP(T) &ClampSamples<T>

#define VETRA_TEXT(x) #x
#define VETRA_NAME(x) VETRA_TEXT(x)

extern const LevelStages kStages;
const LevelStages kStages = {
    VETRA_NAME(VETRA_LEVEL),
    &ArrayPositions,
    &BilinearPositions,
    &Classes,
    &MaskClasses,
    &OpenModes,
    &Windows,
    &NearestPlaces,
    {VETRA_VALUES_ROWS(VETRA_TWINS) VETRA_PER_TYPE(VETRA_COMPLEX_VALUES, CplxSar, )},
    VETRA_PER_TYPE(VETRA_NEAREST),
    VETRA_PER_TYPE(VETRA_NONNEGATIVE),
    VETRA_PER_TYPE(VETRA_STORE),
    VETRA_PER_SHORT_INTEGER(VETRA_COPY),
    VETRA_PER_SHORT_INTEGER(VETRA_CLAMP),
};

}  // namespace vetra::utils::engine::VETRA_LEVEL
