#include "vetra/base/utils/math/matrices.h"

#include <algorithm>
#include <cfloat>
#include <cmath>
#include <cstddef>
#include <cstdio>
#include <memory>

#include "vetra/textcore/formatstring.h"

namespace {

constexpr int kPrintedCols = 6;

std::size_t Count(int n) { return static_cast<std::size_t>(std::max(n, 0)); }

// Replaces the lower triangle by Cholesky's factor L, with a = L L^T.
// Returns 0 or the number of the pivot that isn't positive, from 1.
int Factor(double* const* a, int n) {
    for (int j = 0; j < n; ++j) {
        for (int i = j; i < n; ++i) {
            double x = a[i][j];
            for (int k = 0; k < j; ++k) {
                x -= a[j][k] * a[i][k];
            }
            if (i != j) {
                a[i][j] = x / a[j][j];
            } else if (x <= 0.0) {
                return j + 1;
            } else {
                a[j][j] = std::sqrt(x);
            }
        }
    }
    return 0;
}

// Replaces L by its inverse.
void InvertFactor(double* const* a, int n) {
    for (int j = 0; j < n; ++j) {
        a[j][j] = 1.0 / a[j][j];
        for (int i = j + 1; i < n; ++i) {
            double dfSum = 0.0;
            for (int k = j; k < i; ++k) {
                dfSum += a[k][j] * a[i][k];
            }
            a[i][j] = -dfSum / a[i][i];
        }
    }
}

// Replaces L by the lower triangle of L^T L. An element is written after its last use.
void MultiplyByTranspose(double* const* a, int n) {
    for (int j = 0; j < n; ++j) {
        for (int i = j; i < n; ++i) {
            double dfSum = 0.0;
            for (int k = i; k < n; ++k) {
                dfSum += a[k][j] * a[k][i];
            }
            a[i][j] = dfSum;
        }
    }
}

}  // namespace

void AllocMat(double**& papadfMat, int nRows, int nCols) {
    std::unique_ptr<double[]> padfBlock(new double[Count(nRows) * Count(nCols)]);
    // FreeMat finds the block in row 0, which must be there without rows too.
    auto** papadfRows = new double*[std::max<std::size_t>(Count(nRows), 1)];
    papadfRows[0] = padfBlock.release();
    for (int i = 1; i < nRows; ++i) {
        papadfRows[i] = papadfRows[i - 1] + nCols;
    }
    papadfMat = papadfRows;
}

void FreeMat(double**& papadfMat) {
    if (papadfMat != nullptr) {
        delete[] papadfMat[0];
        delete[] papadfMat;
        papadfMat = nullptr;
    }
}

void CopyMat(const double* const* papadfSrc, double* const* papadfTgt, int nRows, int nCols) {
    for (int i = 0; i < nRows; ++i) {
        std::copy_n(papadfSrc[i], Count(nCols), papadfTgt[i]);
    }
}

int MatMult(const double* const* A, const double* const* B, int r, int n, int c, double* const* C) {
    for (int i = 0; i < r; ++i) {
        std::fill_n(C[i], Count(c), 0.0);
        // Each sum goes along k; the rows of B are read in their order in memory.
        for (int k = 0; k < n; ++k) {
            for (int j = 0; j < c; ++j) {
                C[i][j] += A[i][k] * B[k][j];
            }
        }
    }
    return 0;
}

int MatSclMult(const double* const* A, int nRows, int nCols, double s, double* const* C) {
    for (int i = 0; i < nRows; ++i) {
        VecSclMult(A[i], nCols, s, C[i]);
    }
    return 0;
}

int MatTranspose(const double* const* A, int nRows, int nCols, double* const* C) {
    for (int i = 0; i < nRows; ++i) {
        for (int j = 0; j < nCols; ++j) {
            C[j][i] = A[i][j];
        }
    }
    return 0;
}

int MatVecMult(const double* const* A, const double* v, int nRows, int nCols, double* out) {
    for (int i = 0; i < nRows; ++i) {
        out[i] = DotProd(A[i], v, nCols);
    }
    return 0;
}

double DotProd(const double* a, const double* b, int n) {
    double dfSum = 0.0;
    for (int i = 0; i < n; ++i) {
        dfSum += a[i] * b[i];
    }
    return dfSum;
}

double VecAbs(const double* v, int n) { return std::sqrt(DotProd(v, v, n)); }

int VecIdxMaxAbs(const double* v, int n) {
    int nIndex = 0;
    double dfMax = -1.0;
    for (int i = 0; i < n; ++i) {
        if (std::fabs(v[i]) > dfMax) {
            dfMax = std::fabs(v[i]);
            nIndex = i;
        }
    }
    return nIndex;
}

int VecNormalize(double* v, int n) {
    const double dfLength = VecAbs(v, n);
    if (dfLength < DBL_EPSILON) {
        return -1;
    }
    for (int i = 0; i < n; ++i) {
        v[i] /= dfLength;
    }
    return 0;
}

int VecSclMult(const double* v, int n, double s, double* out) {
    for (int i = 0; i < n; ++i) {
        out[i] = s * v[i];
    }
    return 0;
}

int mat_inv(double* const* a, int n, bool bMirror) {
    const int nPivot = Factor(a, n);
    if (nPivot != 0) {
        return nPivot;
    }
    InvertFactor(a, n);
    MultiplyByTranspose(a, n);
    if (bMirror) {
        for (int i = 0; i < n; ++i) {
            for (int j = 0; j < i; ++j) {
                a[j][i] = a[i][j];
            }
        }
    }
    return 0;
}

double polyval(const double* c, int nDegree, double x) {
    if (nDegree < 0) {
        return 0.0;
    }
    double dfValue = c[0];
    for (int i = 1; i <= nDegree; ++i) {
        dfValue = dfValue * x + c[i];
    }
    return dfValue;
}

void PrintMatrix(const std::string& sName, int nRows, int nCols, const double* padfMatrix) {
    const auto fnPrint = [](const std::string& sText) { std::fputs(sText.c_str(), stdout); };
    fnPrint(FormatString("Matrix: %s (%d by %d)\n", sName.c_str(), nRows, nCols));
    int nNext = 0;
    while (nNext < nCols) {
        const int nFirst = nNext;
        nNext += std::min(kPrintedCols, nCols - nFirst);
        if (nCols > kPrintedCols) {
            fnPrint(FormatString("Columns %d though %d\n", nFirst, nNext - 1));
        }
        for (int i = 0; i < nRows; ++i) {
            const double* padfRow = padfMatrix + Count(i) * Count(nCols);
            std::string sLine;
            for (int j = nFirst; j < nNext; ++j) {
                sLine += FormatString("%13.5e", padfRow[j]);
            }
            fnPrint(sLine + '\n');
        }
    }
    fnPrint("\n");
}
