#include "vetra/base/utils/math/rotations/rotations.h"

#include <algorithm>
#include <cfloat>
#include <cmath>
#include <cstddef>
#include <cstring>

#include "vetra/base/utils/math/rotations/quaternionmath.h"
#include "vetra/faultcore/exceptions.h"

// The matrix is the hub: a form has one function that makes the matrix and one that reads it.
// Quaternion and axis with angle are also converted directly.

namespace {

using vetra::ParameterException;
using namespace vetra::qtn;

// Matrix elements that are rounding noise, when it comes to the signs of 0 and pi.
constexpr double kNoise = 1e-12;
constexpr double kGimbalLock = 1e-10;
constexpr double kMaxElement = 1.000000001;
// From this sine of the middle angle on (61 degrees) its arcsine, and the other two angles found
// each on its own, lose digits that matter.
constexpr double kSteep = 0.875;
constexpr double kMinTrace = 1e-9;

constexpr int Index(int nRow, int nCol) { return 3 * nRow + nCol; }

double Snap(double df) { return std::fabs(df) < kNoise ? 0.0 : df; }

bool IsNear(double df, double dfExpected, double dfTolerance) {
    return std::fabs(df - dfExpected) <= dfTolerance;
}

double RowDot(const double* a, const double* b) { return a[0] * b[0] + a[1] * b[1] + a[2] * b[2]; }

// The Euler form that turns about axis I first, then J, then K. All six are one: a cyclic order
// differs from XYZ by the names of its axes, any other one also by the direction of its angles,
// since renaming the axes turns the frame into a left-handed one.
template <int I, int J, int K>
struct Euler {
    static constexpr double kSign = (J - I + 3) % 3 == 1 ? 1.0 : -1.0;

    static void ToMatrix(const double* padfAngles, double* m) {
        const double si = kSign * std::sin(padfAngles[I]);
        const double ci = std::cos(padfAngles[I]);
        const double sj = kSign * std::sin(padfAngles[J]);
        const double cj = std::cos(padfAngles[J]);
        const double sk = kSign * std::sin(padfAngles[K]);
        const double ck = std::cos(padfAngles[K]);
        m[Index(I, I)] = ck * cj;
        m[Index(I, J)] = ck * sj * si + sk * ci;
        m[Index(I, K)] = sk * si - ck * sj * ci;
        m[Index(J, I)] = -sk * cj;
        m[Index(J, J)] = ck * ci - sk * sj * si;
        m[Index(J, K)] = sk * sj * ci + ck * si;
        m[Index(K, I)] = sj;
        m[Index(K, J)] = -cj * si;
        m[Index(K, K)] = cj * ci;
    }

    static void FromMatrix(const double* m, double* padfAngles) {
        double dfSine = kSign * m[Index(K, I)];
        if (std::fabs(dfSine) > 1.0 && std::fabs(dfSine) <= kMaxElement) {
            dfSine = std::copysign(1.0, dfSine);
        }
        // The four elements with the cosine of the middle angle.
        const double ii = Snap(m[Index(I, I)]);
        const double ji = Snap(m[Index(J, I)]);
        double kj = Snap(m[Index(K, J)]);
        double kk = Snap(m[Index(K, K)]);
        const bool bSteep = std::fabs(dfSine) > kSteep && std::fabs(dfSine) <= 1.0;
        const double dfCosine = bSteep ? std::sqrt(ii * ii + ji * ji) : 0.0;
        const double dfMiddle = bSteep ? std::atan2(dfSine, dfCosine) : std::asin(dfSine);
        double dfFirst = 0.0;
        double dfLast;
        if (std::fabs(ii) < kGimbalLock && std::fabs(ji) < kGimbalLock &&
            std::fabs(kj) < kGimbalLock && std::fabs(kk) < kGimbalLock) {
            if (kSign > 0.0) {
                dfLast = std::atan2(Snap(m[Index(I, J)]), Snap(m[Index(J, J)]));
            } else {
                const double dfSide = dfMiddle >= 0.0 ? 1.0 : -1.0;
                dfLast = std::atan2(dfSide * Snap(m[Index(J, K)]), dfSide * Snap(m[Index(I, K)]));
            }
        } else {
            dfLast = std::atan2(-kSign * ji, ii);
            if (bSteep && dfCosine > 0.0) {
                // The first and last axis nearly agree, so that only the sum or difference of
                // their angles is well determined. The first one is what remains after the last
                // one, whatever that is, has been undone.
                const double s = -ji / dfCosine;
                const double c = ii / dfCosine;
                kj = Snap(-(s * m[Index(I, K)] + c * m[Index(J, K)]));
                kk = Snap(s * m[Index(I, J)] + c * m[Index(J, J)]);
            }
            dfFirst = std::atan2(-kSign * kj, kk);
        }
        padfAngles[I] = dfFirst;
        padfAngles[J] = dfMiddle;
        padfAngles[K] = dfLast;
    }
};

Components AxisAngleToComponents(const double* padfAxisAngle) {
    const double s = std::sin(0.5 * padfAxisAngle[3]);
    const double c = std::cos(0.5 * padfAxisAngle[3]);
    return {s * padfAxisAngle[0], s * padfAxisAngle[1], s * padfAxisAngle[2], c};
}

int CoeffsToMatrix(RotationType eType, const double* padfCoeffs, double* m) {
    switch (eType) {
        case eRT_XYZ:
            Euler<0, 1, 2>::ToMatrix(padfCoeffs, m);
            return 0;
        case eRT_XZY:
            Euler<0, 2, 1>::ToMatrix(padfCoeffs, m);
            return 0;
        case eRT_YXZ:
            Euler<1, 0, 2>::ToMatrix(padfCoeffs, m);
            return 0;
        case eRT_YZX:
            Euler<1, 2, 0>::ToMatrix(padfCoeffs, m);
            return 0;
        case eRT_ZXY:
            Euler<2, 0, 1>::ToMatrix(padfCoeffs, m);
            return 0;
        case eRT_ZYX:
            Euler<2, 1, 0>::ToMatrix(padfCoeffs, m);
            return 0;
        case eRT_QUATERNION:
            ToMatrixElements(Load(padfCoeffs), m);
            return 0;
        case eRT_AXIS_ANGLE:
            ToMatrixElements(AxisAngleToComponents(padfCoeffs), m);
            return 0;
        case eRT_MATRIX:
            std::memmove(m, padfCoeffs, 9 * sizeof(double));
            return 0;
    }
    return -1;
}

int MatrixToCoeffs(const double* m, RotationType eType, double* padfCoeffs) {
    switch (eType) {
        case eRT_XYZ:
            Euler<0, 1, 2>::FromMatrix(m, padfCoeffs);
            return 0;
        case eRT_XZY:
            Euler<0, 2, 1>::FromMatrix(m, padfCoeffs);
            return 0;
        case eRT_YXZ:
            Euler<1, 0, 2>::FromMatrix(m, padfCoeffs);
            return 0;
        case eRT_YZX:
            Euler<1, 2, 0>::FromMatrix(m, padfCoeffs);
            return 0;
        case eRT_ZXY:
            Euler<2, 0, 1>::FromMatrix(m, padfCoeffs);
            return 0;
        case eRT_ZYX:
            Euler<2, 1, 0>::FromMatrix(m, padfCoeffs);
            return 0;
        case eRT_QUATERNION:
            Store(FromMatrixElements(m, kMinTrace), padfCoeffs);
            return 0;
        case eRT_AXIS_ANGLE:
            Store(ToAxisAngle(FromMatrixElements(m, kMinTrace), DBL_EPSILON), padfCoeffs);
            return 0;
        case eRT_MATRIX:
            std::memmove(padfCoeffs, m, 9 * sizeof(double));
            return 0;
    }
    return -1;
}

// The number of coefficients, 0 for a type outside 0 to 8.
std::size_t NumCoeffs(RotationType eType) {
    switch (eType) {
        case eRT_XYZ:
        case eRT_XZY:
        case eRT_YXZ:
        case eRT_YZX:
        case eRT_ZXY:
        case eRT_ZYX:
            return 3;
        case eRT_QUATERNION:
        case eRT_AXIS_ANGLE:
            return 4;
        case eRT_MATRIX:
            return 9;
    }
    return 0;
}

void CopyToRows(const double* m, double* const* papadfRows) {
    for (int i = 0; i < 3; ++i) {
        std::copy_n(m + 3 * i, 3, papadfRows[i]);
    }
}

using ElementaryMatrix = void (*)(double, double*);

void ToRows(ElementaryMatrix fnMatrix, double dfAngle, double* const* papadfRows) {
    double m[9];
    fnMatrix(dfAngle, m);
    CopyToRows(m, papadfRows);
}

}  // namespace

bool IsValidRotation(RotationType eType, const double* padfCoeffs) {
    const double* p = padfCoeffs;
    switch (eType) {
        case eRT_QUATERNION:
            return IsNear(p[0] * p[0] + p[1] * p[1] + p[2] * p[2] + p[3] * p[3], 1.0,
                          kUnitTolerance);
        case eRT_AXIS_ANGLE:
            return IsNear(RowDot(p, p), 1.0, kUnitTolerance);
        case eRT_MATRIX: {
            const double dfDeterminant = p[0] * (p[4] * p[8] - p[5] * p[7]) -
                                         p[1] * (p[3] * p[8] - p[5] * p[6]) +
                                         p[2] * (p[3] * p[7] - p[4] * p[6]);
            return std::all_of(p, p + 9, [](double df) { return std::fabs(df) <= kMaxElement; }) &&
                   IsNear(RowDot(p, p + 3), 0.0, 1e-9) && IsNear(RowDot(p + 6, p), 0.0, 1e-9) &&
                   IsNear(RowDot(p + 6, p + 3), 0.0, 1e-9) && IsNear(dfDeterminant, 1.0, 1e-8);
        }
        default:
            return true;
    }
}

int ConvertRotation(RotationType eSrcType, const double* padfSrcCoeffs, RotationType eTgtType,
                    double* padfTgtCoeffs) {
    if (!IsValidRotation(eSrcType, padfSrcCoeffs)) {
        throw ParameterException(
            "padfSrcCoeffs", ParameterException::eInvalid, "", "",
            "The provided coefficient arrray did not pass tests designed to ensure that it "
            "represents a valid rotation.  Please consult the IsValidRotation() documentation for "
            "a description of validity criteria",
            VETRA_HERE);
    }
    if (eSrcType == eTgtType && padfSrcCoeffs != padfTgtCoeffs) {
        const std::size_t nCoeffs = NumCoeffs(eSrcType);
        std::memmove(padfTgtCoeffs, padfSrcCoeffs, nCoeffs * sizeof(double));
        return nCoeffs == 0 ? -1 : 0;
    }
    if (eSrcType == eRT_QUATERNION && eTgtType == eRT_AXIS_ANGLE) {
        return QuaternionToAxisAngle(padfSrcCoeffs, padfTgtCoeffs);
    }
    if (eSrcType == eRT_AXIS_ANGLE && eTgtType == eRT_QUATERNION) {
        return AxisAngleToQuaternion(padfSrcCoeffs, padfTgtCoeffs);
    }
    if (eSrcType == eRT_MATRIX) {
        return MatrixToCoeffs(padfSrcCoeffs, eTgtType, padfTgtCoeffs);
    }
    if (eTgtType == eRT_MATRIX) {
        return CoeffsToMatrix(eSrcType, padfSrcCoeffs, padfTgtCoeffs);
    }
    double m[9];
    const int nResult = CoeffsToMatrix(eSrcType, padfSrcCoeffs, m);
    return nResult != 0 ? nResult : MatrixToCoeffs(m, eTgtType, padfTgtCoeffs);
}

int RotToMatrix(RotationType eType, const double* padfCoeffs, double* const* papadfRows) {
    double m[9];
    const int nResult = CoeffsToMatrix(eType, padfCoeffs, m);
    if (nResult == 0) {
        CopyToRows(m, papadfRows);
    }
    return nResult;
}

int MatrixToRot(const double* const* papadfRows, RotationType eType, double* padfCoeffs) {
    double m[9];
    for (int i = 0; i < 3; ++i) {
        std::copy_n(papadfRows[i], 3, m + 3 * i);
    }
    return MatrixToCoeffs(m, eType, padfCoeffs);
}

int MatrixElementsToQuaternion(const double* padfMatrix, double* padfQuat) {
    Store(FromMatrixElements(padfMatrix, kMinTrace), padfQuat);
    return 0;
}

void QuaternionToMatrixElements(const double* padfQuat, double* padfMatrix) {
    ToMatrixElements(Load(padfQuat), padfMatrix);
}

int AxisAngleToQuaternion(const double* padfAxisAngle, double* padfQuat) {
    Store(AxisAngleToComponents(padfAxisAngle), padfQuat);
    return 0;
}

int QuaternionToAxisAngle(const double* padfQuat, double* padfAxisAngle) {
    Store(ToAxisAngle(Load(padfQuat), 0.0), padfAxisAngle);
    return 0;
}

void XRotToMatrix(double dfAngle, double* padfMatrix) {
    const double c = std::cos(dfAngle);
    const double s = std::sin(dfAngle);
    const double m[9] = {1.0, 0.0, 0.0, 0.0, c, s, 0.0, -s, c};
    std::copy_n(m, 9, padfMatrix);
}

void YRotToMatrix(double dfAngle, double* padfMatrix) {
    const double c = std::cos(dfAngle);
    const double s = std::sin(dfAngle);
    const double m[9] = {c, 0.0, -s, 0.0, 1.0, 0.0, s, 0.0, c};
    std::copy_n(m, 9, padfMatrix);
}

void ZRotToMatrix(double dfAngle, double* padfMatrix) {
    const double c = std::cos(dfAngle);
    const double s = std::sin(dfAngle);
    const double m[9] = {c, s, 0.0, -s, c, 0.0, 0.0, 0.0, 1.0};
    std::copy_n(m, 9, padfMatrix);
}

void XRotToMatrix(double dfAngle, double* const* papadfRows) {
    ToRows(&XRotToMatrix, dfAngle, papadfRows);
}

void YRotToMatrix(double dfAngle, double* const* papadfRows) {
    ToRows(&YRotToMatrix, dfAngle, papadfRows);
}

void ZRotToMatrix(double dfAngle, double* const* papadfRows) {
    ToRows(&ZRotToMatrix, dfAngle, papadfRows);
}
