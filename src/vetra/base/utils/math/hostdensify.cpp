// Every sample is worked out from the four known ones around it, four neighbours of a segment
// between known columns at a time. A row is written from left to right, and samples that are known
// are not written at all: other threads may be reading them.

#include "vetra/base/utils/math/hostdensify.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "vetra/base/utils/math/arguments.h"
#include "vetra/threadcore/ompthreads.h"

namespace vetra::utils::math {

namespace {

using std::int64_t;

// Four neighbouring samples.
typedef float Floats __attribute__((vector_size(16)));
constexpr int kLanes = 4;

inline Floats Load(const float* paf) {
    Floats v;
    std::memcpy(&v, paf, sizeof v);
    return v;
}
template <typename V>
inline void Store(float* paf, V v) {
    std::memcpy(paf, &v, sizeof v);
}
inline Floats Fill(float f) { return Floats{f, f, f, f}; }

template <typename T>
inline T Mix(T f, T a, T b) {
    return (1.0f - f) * a + f * b;
}

// The known position at or before n, the next one, and how far n is between them.
struct Interval {
    int n0;
    int n1;
    float f;

    Interval(int n, int nCount, int nStep)
        : n0(n / nStep * nStep),
          n1(static_cast<int>(std::min<int64_t>(nCount - 1, int64_t{n0} + nStep))),
          f(n1 == n0 ? 0.0f : static_cast<float>(n - n0) / static_cast<float>(n1 - n0)) {}
};

// A row to be filled, and the known rows at or above and below it, from their first columns on.
struct Row {
    const float* pafAbove;
    const float* pafBelow;
    float fy;
    bool bKnown;
    float* pafOut;
};

// A strip of columns, at most as many as a table of their fractions holds that stays in the cache.
class Strip {
 public:
    // The width of all strips but the last: where possible a strip begins with a known column.
    static int Width(int nStep) { return nStep > kCols ? kCols : kCols / nStep * nStep; }

    void SetColumns(int nFirstCol, int nGridCols, int nStep) {
        mnFirstCol = nFirstCol;
        mnEndCol = nFirstCol + std::min(Width(nStep), nGridCols - nFirstCol);
        mnGridCols = nGridCols;
        mnStep = nStep;
        mnAhead = std::max(1, 256 / nStep) * nStep;
        for (int n = mnFirstCol; n < mnEndCol; ++n) {
            maf[n - mnFirstCol] = Interval(n, nGridCols, nStep).f;
        }
    }

    int FirstCol() const { return mnFirstCol; }

    void FillRow(const Row& oRow) const {
        int64_t n = mnFirstCol;
        switch (mnStep) {
            case 1:
                n = FillEach(oRow);
                break;
            case 2:
                n = FillNarrow<2>(oRow);
                break;
            case 3:
                n = FillNarrow<3>(oRow);
                break;
            case 4:
                n = FillNarrow<4>(oRow);
                break;
            default:
                break;
        }
        if (n == mnFirstCol && n % mnStep == 0) {
            n = FillWide(oRow);
        }
        for (int64_t c0 = n / mnStep * mnStep; n < mnEndCol; c0 += mnStep) {
            const int64_t nEnd = std::min<int64_t>(mnEndCol, c0 + mnStep);
            const int64_t c1 = std::min<int64_t>(mnGridCols - 1, c0 + mnStep);
            if (oRow.bKnown) {
                FillSegment(oRow, c0, c1, n == c0 ? n + 1 : n, std::min(nEnd, c1));
            } else {
                FillSegment(oRow, c0, c1, n, nEnd);
            }
            n = nEnd;
        }
    }

 private:
    static constexpr int kCols = 4096;

    // Columns without unknown ones between them, but for the last one, where the strip has it.
    int FillEach(const Row& oRow) const {
        if (oRow.bKnown) {
            return mnEndCol;
        }
        const int nEnd = std::min(mnEndCol, mnGridCols - 1);
        const float* pafAbove = oRow.pafAbove;
        const float* pafBelow = oRow.pafBelow;
        float* __restrict pafOut = oRow.pafOut;
        const float fy = oRow.fy;
        for (int n = mnFirstCol; n < nEnd; ++n) {
            pafOut[n] = Mix(fy, Mix(0.0f, pafAbove[n], pafAbove[n + 1]),
                            Mix(0.0f, pafBelow[n], pafBelow[n + 1]));
        }
        return nEnd;
    }

    // Of four columns from a known one on, the known samples at their left. Between those other
    // threads may be writing.
    template <int kStep>
    static Floats Known(const float* paf) {
        if constexpr (kStep == 2) {
            return Floats{paf[0], paf[0], paf[2], paf[2]};
        } else {
            return Fill(*paf);
        }
    }

    // Whole segments of a small step, which must divide the strip's first column: the place behind
    // the last one.
    template <int kStep>
    int FillNarrow(const Row& oRow) const {
        constexpr int kAdvance = kStep == 3 ? 3 : kLanes;
        const float* pafAbove = oRow.pafAbove;
        const float* pafBelow = oRow.pafBelow;
        float* pafOut = oRow.pafOut;
        const Floats vFx = Load(maf);
        const Floats vFy = Fill(oRow.fy);
        const int nEnd = std::min(mnEndCol, mnGridCols - 1 - kAdvance) - kLanes;
        int n = mnFirstCol;
        const auto fnValues = [&] {
            return Mix(vFy,
                       Mix(vFx, Known<kStep>(pafAbove + n), Known<kStep>(pafAbove + n + kStep)),
                       Mix(vFx, Known<kStep>(pafBelow + n), Known<kStep>(pafBelow + n + kStep)));
        };
        if (oRow.bKnown) {
            for (; n <= nEnd; n += kAdvance) {
                const Floats v = fnValues();
                if constexpr (kStep == 2) {
                    pafOut[n + 1] = v[1];
                    pafOut[n + 3] = v[3];
                } else {
                    Store(pafOut + n + 1, __builtin_shufflevector(v, v, 1, 2));
                    if constexpr (kStep == 4) {
                        pafOut[n + 3] = v[3];
                    }
                }
            }
        } else {
            for (; n <= nEnd; n += kAdvance) {
                Store(pafOut + n, fnValues());
            }
        }
        return n;
    }

    // Whole segments from the strip's first column on, which is a known one: the place behind the
    // last one.
    int FillWide(const Row& oRow) const {
        const int nStep = mnStep;
        const int nSkip = oRow.bKnown ? 1 : 0;
        if (nStep - nSkip < kLanes) {
            return mnFirstCol;
        }
        const int nWhole = std::min(mnEndCol, mnGridCols - 1) - mnFirstCol;
        const float* pafAbove = oRow.pafAbove + mnFirstCol;
        const float* pafBelow = oRow.pafBelow + mnFirstCol;
        float* pafOut = oRow.pafOut + mnFirstCol;
        const Floats vFy = Fill(oRow.fy);
        Floats vAbove = Fill(pafAbove[0]);
        Floats vBelow = Fill(pafBelow[0]);
        int n = 0;
        for (; n + nStep <= nWhole; n += nStep) {
            const int nNext = n + nStep;
            // A later known sample, to which no earlier access leads the processor.
            __builtin_prefetch(pafBelow + std::min(nWhole, nNext + mnAhead));
            const Floats vAboveNext = Fill(pafAbove[nNext]);
            const Floats vBelowNext = Fill(pafBelow[nNext]);
            const auto fnFill = [&](int i) {
                const Floats vFx = Load(maf + i);
                Store(pafOut + i,
                      Mix(vFy, Mix(vFx, vAbove, vAboveNext), Mix(vFx, vBelow, vBelowNext)));
            };
            for (int i = n + nSkip; i < nNext - kLanes; i += kLanes) {
                fnFill(i);
            }
            fnFill(nNext - kLanes);
            vAbove = vAboveNext;
            vBelow = vBelowNext;
        }
        return mnFirstCol + n;
    }

    // The columns from nBegin to before nEnd, between the known ones c0 and c1.
    void FillSegment(const Row& oRow, int64_t c0, int64_t c1, int64_t nBegin, int64_t nEnd) const {
        const float fAbove0 = oRow.pafAbove[c0];
        const float fAbove1 = oRow.pafAbove[c1];
        const float fBelow0 = oRow.pafBelow[c0];
        const float fBelow1 = oRow.pafBelow[c1];
        const float fy = oRow.fy;
        const float* paf = maf + (nBegin - mnFirstCol);
        float* __restrict pafOut = oRow.pafOut + nBegin;
        for (int64_t i = 0; i < nEnd - nBegin; ++i) {
            pafOut[i] = Mix(fy, Mix(paf[i], fAbove0, fAbove1), Mix(paf[i], fBelow0, fBelow1));
        }
    }

    int mnFirstCol = -1;
    int mnEndCol = 0;
    int mnGridCols = 0;
    int mnStep = 1;
    int mnAhead = 0;
    float maf[kCols + kLanes] = {};
};

}  // namespace

void HostDensify(float* data, const int& rows, const int& cols, const int& rowStep,
                 const int& colStep) {
    CheckAtLeast(cols, 1, "cols", VETRA_HERE);
    CheckAtLeast(rowStep, 1, "rowStep", VETRA_HERE);
    CheckAtLeast(colStep, 1, "colStep", VETRA_HERE);
    if (rows < 1) {
        return;
    }
    CheckPointer(data, "data", VETRA_HERE);

    // Copies: a caller's int could be written by another thread.
    const int nRows = rows;
    const int nCols = cols;
    const int nRowStep = rowStep;
    const int nColStep = colStep;
    const int nWidth = Strip::Width(nColStep);
    const int64_t nStrips = (nCols - 1) / nWidth + 1;
    const auto fnRow = [=](int nRow) { return data + std::ptrdiff_t{nRow} * nCols; };
    // The last strip may be a narrow one, so every thread gets a share of each.
    const int64_t nPieces = nRows * nStrips;
    const int64_t nChunk = std::clamp<int64_t>(nPieces / (16 * OMPGetMaxThreads()), 1, 64);
#pragma omp parallel
    {
        Strip oStrip;
#pragma omp for schedule(static, nChunk)
        for (int64_t nPiece = 0; nPiece < nPieces; ++nPiece) {
            const int nFirstCol = static_cast<int>(nPiece / nRows) * nWidth;
            if (nFirstCol != oStrip.FirstCol()) {
                oStrip.SetColumns(nFirstCol, nCols, nColStep);
            }
            const int nRow = static_cast<int>(nPiece % nRows);
            const Interval oRow(nRow, nRows, nRowStep);
            oStrip.FillRow({fnRow(oRow.n0), fnRow(oRow.n1), oRow.f,
                            nRow == oRow.n0 || nRow == oRow.n1, fnRow(nRow)});
        }
    }
}

}  // namespace vetra::utils::math
