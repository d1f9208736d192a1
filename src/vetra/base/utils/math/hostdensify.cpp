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
    int nUnknown = 0;
    float af[kStripCols];
    int anLeft[kStripCols];
    int anRight[kStripCols];
    int anUnknown[kStripCols];
    float aafRows[2][kStripCols];
    float* pafUpper = aafRows[0];
    float* pafLower = aafRows[1];

    void SetColumns(int nFirst, int nGridCols, int nStep) {
        nFirstCol = nFirst;
        nCols = std::min(kStripCols, nGridCols - nFirst);
        nUnknown = 0;
        for (int i = 0; i < nCols; ++i) {
            const Interval oInterval(nFirst + i, nGridCols, nStep);
            af[i] = oInterval.f;
            anLeft[i] = oInterval.n0;
            anRight[i] = oInterval.n1;
            if (!oInterval.IsKnown(nFirst + i)) {
                anUnknown[nUnknown++] = i;
            }
        }
    }

    void Interpolate(const float* pafRow, float* pafOut) const {
        for (int i = 0; i < nCols; ++i) {
            pafOut[i] = (1.0f - af[i]) * pafRow[anLeft[i]] + af[i] * pafRow[anRight[i]];
        }
    }

    void Blend(float fy, float* pafRow) const {
        for (int i = 0; i < nCols; ++i) {
            pafRow[i] = (1.0f - fy) * pafUpper[i] + fy * pafLower[i];
        }
    }

    // Other threads may be reading the known samples of a known row.
    void BlendUnknown(float fy, float* pafRow) const {
        for (int nAt = 0; nAt < nUnknown; ++nAt) {
            const int i = anUnknown[nAt];
            pafRow[i] = (1.0f - fy) * pafUpper[i] + fy * pafLower[i];
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
