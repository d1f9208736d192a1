#include "vetra/base/utils/math/vectors.h"

#include <algorithm>
#include <cfloat>
#include <cmath>
#include <utility>

namespace {

void Store(double x, double y, double z, double* out) {
    out[0] = x;
    out[1] = y;
    out[2] = z;
}

void Divide(const double* v, double dfDivisor, double* out) {
    Store(v[0] / dfDivisor, v[1] / dfDivisor, v[2] / dfDivisor, out);
}

}  // namespace

void DotProduct(const double* a, const double* b, double* pdfResult) {
    *pdfResult = DotProduct(a, b);
}

void Normalize(const double* v, double* out, double* pdfLength) {
    const double dfLength = VecLength(v);
    if (dfLength != 0.0) {
        Divide(v, dfLength, out);
    }
    *pdfLength = dfLength;
}

void CrossProd(const double* a, const double* b, double* out) {
    CrossProduct(a, b, out);
    const double dfLength = VecLength(out);
    if (!(dfLength < DBL_EPSILON)) {
        Divide(out, dfLength, out);
    }
}

void SolveEqn(const double* row1, const double* row2, const double* row3, const double* b,
              double* x, int* pnStatus) {
    double m[3][3];
    std::copy_n(row1, 3, m[0]);
    std::copy_n(row2, 3, m[1]);
    std::copy_n(row3, 3, m[2]);
    const double r[3] = {b[0], b[1], b[2]};
    std::copy_n(r, 3, x);
    *pnStatus = 0;
    bool abUsed[3] = {false, false, false};
    for (int nPass = 0; nPass < 3; ++nPass) {
        int nRow = -1;
        int nCol = -1;
        double dfMax = 0.0;
        for (int i = 0; i < 3; ++i) {
            for (int j = 0; j < 3; ++j) {
                if (!abUsed[i] && !abUsed[j] && std::fabs(m[i][j]) >= dfMax) {
                    dfMax = std::fabs(m[i][j]);
                    nRow = i;
                    nCol = j;
                }
            }
        }
        // Only NaN is left.
        if (nCol < 0) {
            *pnStatus = -1;
            return;
        }
        abUsed[nCol] = true;
        if (nRow != nCol) {
            std::swap(m[nRow], m[nCol]);
            std::swap(x[nRow], x[nCol]);
        }
        double* padfPivotRow = m[nCol];
        if (padfPivotRow[nCol] == 0.0) {
            *pnStatus = -1;
            return;
        }
        const double dfInverse = 1.0 / padfPivotRow[nCol];
        padfPivotRow[nCol] = 1.0;
        for (int j = 0; j < 3; ++j) {
            padfPivotRow[j] *= dfInverse;
        }
        x[nCol] *= dfInverse;
        for (int i = 0; i < 3; ++i) {
            if (i == nCol) {
                continue;
            }
            const double f = m[i][nCol];
            m[i][nCol] = 0.0;
            for (int j = 0; j < 3; ++j) {
                m[i][j] -= f * padfPivotRow[j];
            }
            x[i] -= f * x[nCol];
        }
    }
}

void CrossProduct(const double* a, const double* b, double* out) {
    Store(a[1] * b[2] - a[2] * b[1], a[2] * b[0] - a[0] * b[2], a[0] * b[1] - a[1] * b[0], out);
}

double DotProduct(const double* a, const double* b) {
    return a[0] * b[0] + a[1] * b[1] + a[2] * b[2];
}

void VecDiff(const double* a, const double* b, double* out) {
    Store(a[0] - b[0], a[1] - b[1], a[2] - b[2], out);
}

double VecDistance(const double* a, const double* b) {
    double d[3];
    VecDiff(a, b, d);
    return VecLength(d);
}

double VecLength(const double* v) { return std::sqrt(DotProduct(v, v)); }

void VecNormalize(double* v) { Divide(v, VecLength(v), v); }

void VecScale(double s, const double* v, double* out) { Store(s * v[0], s * v[1], s * v[2], out); }

void MM3_Mult(const double* A, const double* B, double* C) {
    double m[9];
    for (int i = 0; i < 3; ++i) {
        for (int j = 0; j < 3; ++j) {
            m[3 * i + j] = A[3 * i] * B[j] + A[3 * i + 1] * B[3 + j] + A[3 * i + 2] * B[6 + j];
        }
    }
    std::copy_n(m, 9, C);
}

void MV3_Mult(const double* M, const double* v, double* out) {
    Store(DotProduct(M, v), DotProduct(M + 3, v), DotProduct(M + 6, v), out);
}

void MtV3_Mult(const double* M, const double* v, double* out) {
    Store(M[0] * v[0] + M[3] * v[1] + M[6] * v[2], M[1] * v[0] + M[4] * v[1] + M[7] * v[2],
          M[2] * v[0] + M[5] * v[1] + M[8] * v[2], out);
}
