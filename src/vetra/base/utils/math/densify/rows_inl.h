// The filling of sparsely sampled grids, compiled once per processor level. A level's source
// defines VETRA_LEVEL, its namespace, and VETRA_LANES, the floats of its vectors, and includes this
// file. Everything stands in the level's namespace and nothing of the standard library is called,
// so that no code built for one processor can be linked into another's path.
//
// A known row is widened first: its columns between known ones are worked out, once for all rows
// that lie beside it. The samples of a row are then mixtures of those of two widened rows. Each
// sample goes through the operations of the plain formula in its order, so all levels give the same
// bits.

#include <cfloat>
#include <cstddef>
#include <cstdint>
#include <utility>

#include "vetra/base/utils/math/densify/rows.h"

static_assert(FLT_EVAL_METHOD == 0, "float arithmetic must be done in float");

namespace vetra::utils::math::densify::VETRA_LEVEL {

namespace {

using std::int64_t;

template <int kFloats>
struct Lanes {
    typedef float Floats __attribute__((vector_size(kFloats * 4)));
    typedef std::int32_t Bits __attribute__((vector_size(kFloats * 4)));
};
constexpr int kMost = VETRA_LANES;
template <int kFloats>
using Vector = typename Lanes<kFloats>::Floats;
using Bits = Lanes<kMost>::Bits;

template <int kFloats>
inline Vector<kFloats> Load(const float* paf) {
    Vector<kFloats> v;
    __builtin_memcpy(&v, paf, sizeof v);
    return v;
}
template <typename V>
inline void Store(float* paf, V v) {
    __builtin_memcpy(paf, &v, sizeof v);
}
// f - 0 is f also for negative zeros.
template <int kFloats>
inline Vector<kFloats> Splat(float f) {
    return f - Vector<kFloats>{};
}

template <typename T>
inline T Mix(T f, T a, T b) {
    return (1.0f - f) * a + f * b;
}

inline int64_t Least(int64_t a, int64_t b) { return a < b ? a : b; }

// The known position at or before n, the next one, and how far n is between them.
struct Interval {
    int n0;
    int n1;
    float f;

    Interval(int n, int nCount, int nStep)
        : n0(n / nStep * nStep),
          n1(static_cast<int>(Least(nCount - 1, int64_t{n0} + nStep))),
          f(n1 == n0 ? 0.0f : static_cast<float>(n - n0) / static_cast<float>(n1 - n0)) {}

    bool HasKnown(int n) const { return n == n0 || n == n1; }
};

// Of columns from a known one on, where the known ones at their left (kNext 0) or right (1) stand.
template <int kStep, int kNext, int... i>
inline Vector<sizeof...(i)> Known(Vector<sizeof...(i)> v, std::integer_sequence<int, i...>) {
    // What the last columns get, whose known ones are beyond the vector, isn't used.
    constexpr int kLast = static_cast<int>(sizeof...(i)) - 1;
    return __builtin_shufflevector(
        v, v, ((i / kStep + kNext) * kStep <= kLast ? (i / kStep + kNext) * kStep : kLast)...);
}

// A strip of columns, so narrow that what belongs to it stays in the caches.
class Strip {
 public:
    Strip(const Grid& oGrid, int nFirstCol)
        : mnFirstCol(nFirstCol),
          // Where possible a strip begins with a known column.
          mnCount(static_cast<int>(
              Least(oGrid.nColStep > kCols ? kCols : kCols / oGrid.nColStep * oGrid.nColStep,
                    oGrid.nCols - nFirstCol))),
          mnGridCols(oGrid.nCols),
          mnStep(oGrid.nColStep) {
        for (int i = 0; i < mnCount; ++i) {
            const Interval oCols(mnFirstCol + i, mnGridCols, mnStep);
            maf[i] = oCols.f;
            manKnown[i] = oCols.HasKnown(mnFirstCol + i) ? -1 : 0;
        }
    }

    int GetNumCols() const { return mnCount; }

    // Makes the widened rows those of an interval. fnKnown gives the start of a known row.
    template <typename GetRow>
    void SetRows(const Interval& oRows, const GetRow& fnKnown) {
        if (oRows.n0 != mnAbove && oRows.n0 == mnBelow) {
            float* pafFree = mpafAbove;
            mpafAbove = mpafBelow;
            mpafBelow = pafFree;
            mnAbove = mnBelow;
            mnBelow = -1;
        }
        if (oRows.n0 != mnAbove) {
            Widen(fnKnown(oRows.n0), mpafAbove);
            mnAbove = oRows.n0;
        }
        if (oRows.n1 != mnBelow) {
            Widen(fnKnown(oRows.n1), mpafBelow);
            mnBelow = oRows.n1;
        }
    }

    // Fills the strip's part of a known row.
    void FillKnown(float fy, float* pafRow) const {
        if (mnStep == 1) {
            return;
        }
        float* pafOut = pafRow + mnFirstCol;
        const float* pafAbove = mpafAbove;
        const float* pafBelow = mpafBelow;
        const int nCount = mnCount;
        const Vector<kMost> vFy = Splat<kMost>(fy);
        int i = 0;
        for (; i + kMost <= nCount; i += kMost) {
            Bits nKnown;
            __builtin_memcpy(&nKnown, manKnown + i, sizeof nKnown);
            Store(pafOut + i, nKnown != 0
                                  ? Load<kMost>(pafOut + i)
                                  : Mix(vFy, Load<kMost>(pafAbove + i), Load<kMost>(pafBelow + i)));
        }
        for (; i < nCount; ++i) {
            pafOut[i] = manKnown[i] != 0 ? pafOut[i] : Mix(fy, pafAbove[i], pafBelow[i]);
        }
    }

    // Fills the strip's part of kRows rows between known ones. Several rows share what they read.
    template <int kRows>
    void FillBetween(const float* pafFy, float* pafRow, std::ptrdiff_t nPitch) const {
        float* pafOut = pafRow + mnFirstCol;
        const float* pafAbove = mpafAbove;
        const float* pafBelow = mpafBelow;
        const int nCount = mnCount;
        Vector<kMost> avFy[kRows];
        for (int k = 0; k < kRows; ++k) {
            avFy[k] = Splat<kMost>(pafFy[k]);
        }
        int i = 0;
        for (; i + kMost <= nCount; i += kMost) {
            const Vector<kMost> vAbove = Load<kMost>(pafAbove + i);
            const Vector<kMost> vBelow = Load<kMost>(pafBelow + i);
            for (int k = 0; k < kRows; ++k) {
                Store(pafOut + k * nPitch + i, Mix(avFy[k], vAbove, vBelow));
            }
        }
        for (; i < nCount; ++i) {
            for (int k = 0; k < kRows; ++k) {
                pafOut[k * nPitch + i] = Mix(pafFy[k], pafAbove[i], pafBelow[i]);
            }
        }
    }

 private:
    static constexpr int kCols = 4096;

    // Samples behind the strip's last one may be overwritten.
    void Widen(const float* pafRow, float* pafWide) const {
        int i = 0;
        switch (mnStep) {
            case 1:
                i = WidenEach(pafRow, pafWide);
                break;
            case 2:
                i = WidenNarrow<2>(pafRow, pafWide);
                break;
            case 3:
                i = WidenNarrow<3>(pafRow, pafWide);
                break;
            case 4:
                i = WidenNarrow<4>(pafRow, pafWide);
                break;
            case 5:
                i = WidenNarrow<5>(pafRow, pafWide);
                break;
            case 6:
                i = WidenNarrow<6>(pafRow, pafWide);
                break;
            case 7:
                i = WidenNarrow<7>(pafRow, pafWide);
                break;
            default:
                break;
        }
        mnStep < kMost ? WidenRest<4>(pafRow, pafWide, i) : WidenRest<kMost>(pafRow, pafWide, i);
    }

    // How many columns from the strip's first one on have a next known one that is a whole step
    // further, not nearer.
    int CountWhole() const {
        return static_cast<int>(Least(mnCount, mnGridCols - mnFirstCol - int64_t{mnStep}));
    }

    int WidenEach(const float* pafRow, float* pafWide) const {
        const float* paf = pafRow + mnFirstCol;
        const int nWhole = CountWhole();
        int i = 0;
        for (; i < nWhole; ++i) {
            pafWide[i] = Mix(0.0f, paf[i], paf[i + 1]);
        }
        return i;
    }

    // As many whole segments at a time as a vector holds with the known column behind them. Returns
    // the place behind the last segment.
    template <int kStep>
    int WidenNarrow(const float* pafRow, float* pafWide) const {
        if constexpr (kStep < kMost) {
            constexpr auto kPlaces = std::make_integer_sequence<int, kMost>();
            constexpr int kAdvance = (kMost - 1) / kStep * kStep;
            const float* paf = pafRow + mnFirstCol;
            const Vector<kMost> vFx = Load<kMost>(maf);
            const int64_t nEnd = Least(mnCount, mnGridCols - mnFirstCol);
            int i = 0;
            for (; i + kMost <= nEnd; i += kAdvance) {
                const Vector<kMost> v = Load<kMost>(paf + i);
                Store(pafWide + i,
                      Mix(vFx, Known<kStep, 0>(v, kPlaces), Known<kStep, 1>(v, kPlaces)));
            }
            return i;
        }
        return 0;
    }

    // Segment by segment, from the i-th column on. The end of a segment is written over by the
    // next.
    template <int kFloats>
    void WidenRest(const float* pafRow, float* pafWide, int i) const {
        const std::uintptr_t nAhead =
            sizeof(float) *
            static_cast<std::uintptr_t>(mnStep < kAhead ? kAhead / mnStep * mnStep : mnStep);
        const int64_t nFirstCol = mnFirstCol;
        for (int64_t c0 = (nFirstCol + i) / mnStep * mnStep; c0 < nFirstCol + mnCount;
             c0 += mnStep) {
            // A later known sample, of the next row perhaps, to which no earlier access leads the
            // processor. An integer, since there may be nothing; a prefetch of that does nothing.
            __builtin_prefetch(reinterpret_cast<const void*>(
                reinterpret_cast<std::uintptr_t>(pafRow + c0) + nAhead));
            const Vector<kFloats> v0 = Splat<kFloats>(pafRow[c0]);
            const Vector<kFloats> v1 = Splat<kFloats>(pafRow[Least(mnGridCols - 1, c0 + mnStep)]);
            const int64_t nEnd = Least(mnCount, c0 + mnStep - nFirstCol);
            for (int64_t k = c0 < nFirstCol ? 0 : c0 - nFirstCol; k < nEnd; k += kFloats) {
                Store(pafWide + k, Mix(Load<kFloats>(maf + k), v0, v1));
            }
        }
    }

    static constexpr int kAhead = 1024;

    int mnFirstCol;
    int mnCount;
    int mnGridCols;
    int mnStep;
    float maf[kCols + kMost] = {};
    std::int32_t manKnown[kCols] = {};
    // Two widened rows, and which they are.
    float mafWide[2][kCols + kMost];
    float* mpafAbove = mafWide[0];
    float* mpafBelow = mafWide[1];
    int mnAbove = -1;
    int mnBelow = -1;
};

void Fill(const Grid& oGrid, const OwnRows& oOwn) {
    // Rows between known ones that are filled together.
    constexpr int kTogether = 4;
    const std::ptrdiff_t nPitch = oGrid.nCols;
    const auto fnKnown = [&](int nRow) -> const float* {
        return nRow < oOwn.nFirst  ? oOwn.pafBefore
               : nRow >= oOwn.nEnd ? oOwn.pafBehind
                                   : oGrid.pafData + nRow * nPitch;
    };
    int nNumCols = 0;
    for (int nCol = 0; nCol < oGrid.nCols; nCol += nNumCols) {
        Strip oStrip(oGrid, nCol);
        nNumCols = oStrip.GetNumCols();
        for (int nRow = oOwn.nFirst; nRow < oOwn.nEnd;) {
            const Interval oRows(nRow, oGrid.nRows, oGrid.nRowStep);
            oStrip.SetRows(oRows, fnKnown);
            float* pafRow = oGrid.pafData + nRow * nPitch;
            if (oRows.HasKnown(nRow)) {
                oStrip.FillKnown(oRows.f, pafRow);
                ++nRow;
            } else if (Least(oOwn.nEnd, oRows.n1) - nRow >= kTogether) {
                float afFy[kTogether];
                for (int k = 0; k < kTogether; ++k) {
                    afFy[k] = Interval(nRow + k, oGrid.nRows, oGrid.nRowStep).f;
                }
                oStrip.FillBetween<kTogether>(afFy, pafRow, nPitch);
                nRow += kTogether;
            } else {
                oStrip.FillBetween<1>(&oRows.f, pafRow, nPitch);
                ++nRow;
            }
        }
    }
}

}  // namespace

#define VETRA_TEXT(x) #x
#define VETRA_NAME(x) VETRA_TEXT(x)

extern const Rows kRows;
const Rows kRows = {VETRA_NAME(VETRA_LEVEL), &Fill};

}  // namespace vetra::utils::math::densify::VETRA_LEVEL
