// Two steps of plain arithmetic share their work between samples: a known row is interpolated along
// the columns once for all rows that use it, then the rows between two such rows are blended. A
// thread walks down a strip of columns that is narrow enough for the cache.

#include "vetra/base/utils/math/hostdensify.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <utility>

#include "vetra/base/utils/math/arguments.h"

namespace vetra::utils::math {

namespace {

using std::int64_t;

constexpr int kStripCols = 4096;

// The known position at or before n, the next one, and how far n is between them.
struct Interval {
    int n0;
    int n1;
    float f;

    Interval(int n, int nCount, int nStep)
        : n0(n / nStep * nStep),
          n1(static_cast<int>(std::min<int64_t>(nCount - 1, int64_t{n0} + nStep))),
          f(n1 == n0 ? 0.0f : static_cast<float>(n - n0) / static_cast<float>(n1 - n0)) {}

    bool IsKnown(int n) const { return n == n0 || n == n1; }
};

// A strip of columns, and the known row above and below the samples at hand, interpolated.
struct Strip {
    int nFirstCol = -1;
    int nCols = 0;
    int nGridCols = 0;
    int nStep = 1;
    float af[kStripCols];
    float aafRows[2][kStripCols];
    float* pafUpper = aafRows[0];
    float* pafLower = aafRows[1];

    void SetColumns(int nFirst, int nAllCols, int nColStep) {
        nFirstCol = nFirst;
        nGridCols = nAllCols;
        nStep = nColStep;
        nCols = std::min(kStripCols, nGridCols - nFirst);
        for (int i = 0; i < nCols; ++i) {
            af[i] = Interval(nFirst + i, nGridCols, nStep).f;
        }
    }

    // Calls fn(c0, c1, nBegin, nEnd) for the known columns around each segment of the strip from
    // index nFrom, and the indices in the strip from the one of c0 to before the one of the next.
    template <typename Function>
    void ForSegments(int nFrom, Function fn) const {
        int64_t c0 = (nFirstCol + nFrom) / nStep * int64_t{nStep};
        for (; c0 < int64_t{nFirstCol} + nCols; c0 += nStep) {
            fn(c0, std::min<int64_t>(nGridCols - 1, c0 + nStep),
               static_cast<int>(std::max<int64_t>(0, c0 - nFirstCol)),
               static_cast<int>(std::min<int64_t>(nCols, c0 + nStep - nFirstCol)));
        }
    }

    // Segments of a small constant length, as many as are whole: their number of columns.
    template <int kStep>
    int InterpolateWhole(const float* pafRow, float* __restrict pafOut) const {
        static_assert(kStripCols % kStep == 0);
        const int nSegments = std::min(nCols, nGridCols - 1 - nFirstCol) / kStep;
        const float* pafKnown = pafRow + nFirstCol;
        for (int k = 0; k < kStep && nSegments > 0; ++k) {
            const float f = af[k];
            for (int j = 0; j < nSegments; ++j) {
                pafOut[j * kStep + k] =
                    (1.0f - f) * pafKnown[j * kStep] + f * pafKnown[(j + 1) * kStep];
            }
        }
        return nSegments * kStep;
    }

    void Interpolate(const float* pafRow, float* __restrict pafOut) const {
        const int nDone = nStep == 1   ? InterpolateWhole<1>(pafRow, pafOut)
                          : nStep == 2 ? InterpolateWhole<2>(pafRow, pafOut)
                          : nStep == 4 ? InterpolateWhole<4>(pafRow, pafOut)
                                       : 0;
        ForSegments(nDone, [=, this](int64_t c0, int64_t c1, int nBegin, int nEnd) {
            const float fLeft = pafRow[c0];
            const float fRight = pafRow[c1];
            for (int i = nBegin; i < nEnd; ++i) {
                pafOut[i] = (1.0f - af[i]) * fLeft + af[i] * fRight;
            }
        });
    }

    void Blend(float fy, float* pafRow) const { Blend(fy, pafRow, 0, nCols); }

    void Blend(float fy, float* __restrict pafRow, int nBegin, int nEnd) const {
        const float* pafAbove = pafUpper;
        const float* pafBelow = pafLower;
        for (int i = nBegin; i < nEnd; ++i) {
            pafRow[i] = (1.0f - fy) * pafAbove[i] + fy * pafBelow[i];
        }
    }

    // Other threads may be reading the known samples of a known row.
    void BlendUnknown(float fy, float* pafRow) const {
        if (nStep == 2) {
            const int nEnd = std::min(nCols, nGridCols - 1 - nFirstCol);
            const float* pafAbove = pafUpper;
            const float* pafBelow = pafLower;
            for (int i = 1; i < nEnd; i += 2) {
                pafRow[i] = (1.0f - fy) * pafAbove[i] + fy * pafBelow[i];
            }
        } else if (nStep > 2) {
            ForSegments(0, [=, this](int64_t c0, int64_t c1, int nBegin, int nEnd) {
                const int nKnown = nFirstCol + nBegin == c0 ? 1 : 0;
                Blend(fy, pafRow, nBegin + nKnown,
                      static_cast<int>(std::min<int64_t>(nEnd, c1 - nFirstCol)));
            });
        }
    }
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
    const int64_t nBands = (nRows - 1) / nRowStep + 1;
    const int64_t nStrips = (nCols - 1) / kStripCols + 1;
    const auto fnRow = [=](int nRow) { return data + std::ptrdiff_t{nRow} * nCols; };
#pragma omp parallel
    {
        Strip oStrip;
        int nLowerRow = -1;
#pragma omp for schedule(static)
        for (int64_t nPiece = 0; nPiece < nBands * nStrips; ++nPiece) {
            const int nFirstCol = static_cast<int>(nPiece / nBands) * kStripCols;
            if (nFirstCol != oStrip.nFirstCol) {
                oStrip.SetColumns(nFirstCol, nCols, nColStep);
                nLowerRow = -1;
            }
            const Interval oBand(static_cast<int>(nPiece % nBands) * nRowStep, nRows, nRowStep);
            if (nLowerRow == oBand.n0) {
                std::swap(oStrip.pafUpper, oStrip.pafLower);
            } else {
                oStrip.Interpolate(fnRow(oBand.n0), oStrip.pafUpper);
            }
            oStrip.Interpolate(fnRow(oBand.n1), oStrip.pafLower);
            nLowerRow = oBand.n1;
            const int64_t nEndRow = std::min<int64_t>(nRows, int64_t{oBand.n0} + nRowStep);
            for (int nRow = oBand.n0; nRow < nEndRow; ++nRow) {
                const Interval oRow(nRow, nRows, nRowStep);
                float* pafRow = fnRow(nRow) + nFirstCol;
                if (oRow.IsKnown(nRow)) {
                    oStrip.BlendUnknown(oRow.f, pafRow);
                } else {
                    oStrip.Blend(oRow.f, pafRow);
                }
            }
        }
    }
}

}  // namespace vetra::utils::math
