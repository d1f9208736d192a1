#include "vetra/base/utils/math/fourier/complexdft.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

#include "vetra/base/utils/math/arguments.h"
#include "vetra/base/utils/math/fourier/passes.h"
#include "vetra/base/utils/math/fourier/transpose.h"

using namespace vetra::utils::math;
using std::ptrdiff_t;
using vetra::utils::low::GetBestLevel;

namespace {

// Permutes the nFloats / 2 pairs of floats by bit reversal. With index bits (high, middle, low),
// the middle being one bit or none, what stands at (r, middle, c) moves to (rev c, middle, rev r).
// So the array is a square, or two, whose row k starts at rev k, and is transposed.
//
// panRows receives the starts of the rows.
void ReverseBits(ptrdiff_t nFloats, float* paf, int* panRows) {
    panRows[0] = 0;
    ptrdiff_t l = nFloats;
    ptrdiff_t m = 1;
    while (4 * m < l) {
        l /= 2;
        for (ptrdiff_t j = 0; j < m; ++j) {
            panRows[m + j] = static_cast<int>(panRows[j] + l);
        }
        m *= 2;
    }
    const int nSquares = 4 * m == l ? 2 : 1;
    for (int nSquare = 0; nSquare < nSquares; ++nSquare) {
        float* pafSquare = paf + nSquare * 2 * m;
        const auto fnRow = [=](ptrdiff_t k) { return pafSquare + panRows[k]; };
        for (ptrdiff_t nBand = 0; nBand < fourier::BandCount(m); ++nBand) {
            fourier::TransposeBand(m, nBand, fnRow);
        }
    }
}

// The table for transforms of 4 nFloats floats, see the header.
void BuildTable(ptrdiff_t nFloats, int* ip, float* w) {
    ip[0] = static_cast<int>(nFloats);
    ip[1] = 1;
    if (nFloats < 3) {
        return;
    }
    const ptrdiff_t nHalf = nFloats / 2;
    const double dfStep = std::atan(1.0) / static_cast<double>(nHalf);
    w[0] = 1.0f;
    w[1] = 0.0f;
    w[nHalf] = static_cast<float>(std::cos(static_cast<double>(nHalf) * dfStep));
    w[nHalf + 1] = w[nHalf];
    for (ptrdiff_t j = 2; j < nHalf; j += 2) {
        const double dfAngle = static_cast<double>(j) * dfStep;
        const float fCos = static_cast<float>(std::cos(dfAngle));
        const float fSin = static_cast<float>(std::sin(dfAngle));
        w[j] = fCos;
        w[j + 1] = fSin;
        w[nFloats - j] = fSin;
        w[nFloats - j + 1] = fCos;
    }
    ReverseBits(nFloats, w, ip + 2);
}

void Transform(ptrdiff_t n, bool bFlag, FFTComplex* poData, int* ip, float* w) {
    const ptrdiff_t nFloats = 2 * n;
    float* pafData = reinterpret_cast<float*>(poData);
    if (nFloats > 4 * static_cast<ptrdiff_t>(ip[0])) {
        BuildTable(nFloats / 4, ip, w);
    }
    if (nFloats > 4) {
        ReverseBits(nFloats, pafData, ip + 2);
    }
    fourier::GetPasses(GetBestLevel()).pfnButterflies(nFloats, pafData, w, bFlag);
}

}  // namespace

void ComplexDFT1d(int n, bool flag, FFTComplex* data, int* ip, float* w) {
    CheckTransformLength(n, 1, "n", VETRA_HERE);
    CheckPointer(data, "data", VETRA_HERE);
    CheckPointer(ip, "ip", VETRA_HERE);
    if (n > 4) {
        CheckPointer(w, "w", VETRA_HERE);
    }
    Transform(n, flag, data, ip, w);
}

void ComplexDFT2d(int nRows, int nCols, bool flag, FFTComplex* data, FFTComplex* column, int* ip,
                  float* w) {
    CheckTransformLength(nRows, 1, "nRows", VETRA_HERE);
    CheckTransformLength(nCols, 1, "nCols", VETRA_HERE);
    CheckPointer(data, "data", VETRA_HERE);
    CheckPointer(column, "column", VETRA_HERE);
    CheckPointer(ip, "ip", VETRA_HERE);
    if (std::max(nRows, nCols) > 4) {
        CheckPointer(w, "w", VETRA_HERE);
    }
    for (ptrdiff_t i = 0; i < nRows; ++i) {
        Transform(nCols, flag, data + i * nCols, ip, w);
    }
    for (ptrdiff_t j = 0; j < nCols; ++j) {
        for (ptrdiff_t i = 0; i < nRows; ++i) {
            column[i] = data[i * nCols + j];
        }
        Transform(nRows, flag, column, ip, w);
        for (ptrdiff_t i = 0; i < nRows; ++i) {
            data[i * nCols + j] = column[i];
        }
    }
}
