#include "vetra/base/utils/math/rotations/rotations.h"

#include <algorithm>
#include <cfloat>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <iterator>

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

    static int ToMatrix(const double* padfAngles, double* m) {
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
        return 0;
    }

    static int FromMatrix(const double* m, double* padfAngles) {
        double dfSine = kSign * m[Index(K, I)];
        if (std::fabs(dfSine) > 1.0 && std::fabs(dfSine) <= kMaxElement) {
            dfSine = std::copysign(1.0, dfSine);
        }
        const bool bSteep = std::fabs(dfSine) > kSteep && std::fabs(dfSine) <= 1.0;
        const double dfCosine =
            std::sqrt(m[Index(I, I)] * m[Index(I, I)] + m[Index(J, I)] * m[Index(J, I)]);
        const double dfMiddle = bSteep ? std::atan2(dfSine, dfCosine) : std::asin(dfSine);
        // The four elements with the cosine of the middle angle.
        double ii = Snap(m[Index(I, I)]);
        double ji = Snap(m[Index(J, I)]);
        double kj = Snap(m[Index(K, J)]);
        double kk = Snap(m[Index(K, K)]);
        double dfFirst = 0.0;
        double dfLast;
        if (std::fabs(ii) < kGimbalLock && std::fabs(ji) < kGimbalLock &&
            std::fabs(kj) < kGimbalLock && std::fabs(kk) < kGimbalLock) {
            // Only elements without the cosine tell something.
            if (kSign > 0.0) {
                dfLast = std::atan2(Snap(m[Index(I, J)]), Snap(m[Index(J, J)]));
            } else {
                const double dfSide = dfMiddle >= 0.0 ? 1.0 : -1.0;
                dfLast = std::atan2(dfSide * Snap(m[Index(J, K)]), dfSide * Snap(m[Index(I, K)]));
            }
        } else {
            const bool bNoise = ii != m[Index(I, I)] || ji != m[Index(J, I)] ||
                                kj != m[Index(K, J)] || kk != m[Index(K, K)];
            if ((bSteep || bNoise) && dfCosine > 0.0) {
                // Where the first and the last axis nearly agree, only the sum or difference of
                // their angles is well determined, and noise that was taken from one angle shows
                // in the other. So the first angle is what remains when the last one, whatever it
                // is, has been undone. Noise is judged without the cosine.
                ii = Snap(m[Index(I, I)] / dfCosine);
                ji = Snap(m[Index(J, I)] / dfCosine);
                kj = Snap(ji * m[Index(I, K)] - ii * m[Index(J, K)]);
                kk = Snap(ii * m[Index(J, J)] - ji * m[Index(I, J)]);
            }
            dfFirst = std::atan2(-kSign * kj, kk);
            dfLast = std::atan2(-kSign * ji, ii);
        }
        padfAngles[I] = dfFirst;
        padfAngles[J] = dfMiddle;
        padfAngles[K] = dfLast;
        return 0;
    }
};

Components AxisAngleToComponents(const double* padfAxisAngle) {
    const double s = std::sin(0.5 * padfAxisAngle[3]);
    const double c = std::cos(0.5 * padfAxisAngle[3]);
    return {s * padfAxisAngle[0], s * padfAxisAngle[1], s * padfAxisAngle[2], c};
}

bool IsUnitQuaternion(const double* padfQuat) {
    const Components q = Load(padfQuat);
    return IsNear((q.w * q.w + q.x * q.x) + (q.y * q.y + q.z * q.z), 1.0, kUnitTolerance);
}

bool IsUnitAxis(const double* padfAxis) {
    return IsNear(RowDot(padfAxis, padfAxis), 1.0, kUnitTolerance);
}

// A quick test that nearly all rotations pass: it asks for a tenth of the tolerances. With two
// orthogonal unit rows and their cross product as the third, all else follows.
bool IsPreciseRotation(const double* m) {
    const double dfSquare0 = RowDot(m, m) - 1.0;
    const double dfSquare1 = RowDot(m + 3, m + 3) - 1.0;
    const double dfDot = RowDot(m, m + 3);
    const double x = m[1] * m[5] - m[2] * m[4] - m[6];
    const double y = m[2] * m[3] - m[0] * m[5] - m[7];
    const double z = m[0] * m[4] - m[1] * m[3] - m[8];
    return dfSquare0 * dfSquare0 + dfSquare1 * dfSquare1 + dfDot * dfDot + x * x + y * y + z * z <=
           1e-20;
}

[[gnu::noinline]] bool IsTolerableRotation(const double* m) {
    const double dfDeterminant = m[0] * (m[4] * m[8] - m[5] * m[7]) -
                                 m[1] * (m[3] * m[8] - m[5] * m[6]) +
                                 m[2] * (m[3] * m[7] - m[4] * m[6]);
    return std::all_of(m, m + 9, [](double df) { return std::fabs(df) <= kMaxElement; }) &&
           IsNear(RowDot(m, m + 3), 0.0, kUnitTolerance) &&
           IsNear(RowDot(m + 6, m), 0.0, kUnitTolerance) &&
           IsNear(RowDot(m + 6, m + 3), 0.0, kUnitTolerance) && IsNear(dfDeterminant, 1.0, 1e-8);
}

bool IsValid(RotationType eType, const double* padfCoeffs) {
    switch (eType) {
        case eRT_QUATERNION:
            return IsUnitQuaternion(padfCoeffs);
        case eRT_AXIS_ANGLE:
            return IsUnitAxis(padfCoeffs);
        case eRT_MATRIX:
            return IsPreciseRotation(padfCoeffs) || IsTolerableRotation(padfCoeffs);
        default:
            return true;
    }
}

int QuaternionToMatrix(const double* padfQuat, double* m) {
    ToMatrixElements(Load(padfQuat), m);
    return 0;
}

int MatrixToQuaternion(const double* m, double* padfQuat) {
    Store(FromMatrixElements(m, kMinTrace), padfQuat);
    return 0;
}

int AxisAngleToMatrix(const double* padfAxisAngle, double* m) {
    ToMatrixElements(AxisAngleToComponents(padfAxisAngle), m);
    return 0;
}

int MatrixToAxisAngle(const double* m, double* padfAxisAngle) {
    Store(ToAxisAngle(FromMatrixElements(m, kMinTrace), DBL_EPSILON), padfAxisAngle);
    return 0;
}

int CopyMatrix(const double* padfFrom, double* padfTo) {
    std::memmove(padfTo, padfFrom, 9 * sizeof(double));
    return 0;
}

// What can be done with a form. Source and target of a function may be the same array.
struct Form {
    std::size_t nCoeffs;
    int (*fnToMatrix)(const double* padfCoeffs, double* m);
    int (*fnFromMatrix)(const double* m, double* padfCoeffs);
};

template <int I, int J, int K>
constexpr Form EulerForm() {
    return {3, &Euler<I, J, K>::ToMatrix, &Euler<I, J, K>::FromMatrix};
}

// By type.
constexpr Form kForms[] = {EulerForm<0, 1, 2>(),
                           EulerForm<0, 2, 1>(),
                           EulerForm<1, 0, 2>(),
                           EulerForm<1, 2, 0>(),
                           EulerForm<2, 0, 1>(),
                           EulerForm<2, 1, 0>(),
                           {4, &QuaternionToMatrix, &MatrixToQuaternion},
                           {4, &AxisAngleToMatrix, &MatrixToAxisAngle},
                           {9, &CopyMatrix, &CopyMatrix}};

// Null for a type outside 0 to 8.
const Form* FindForm(RotationType eType) {
    const auto nType = static_cast<std::size_t>(eType);
    return nType < std::size(kForms) ? kForms + nType : nullptr;
}

// Apart from its caller, whose cheapest ways need no registers saved.
[[gnu::noinline]] int ConvertValid(RotationType eSrcType, const double* padfSrcCoeffs,
                                   RotationType eTgtType, double* padfTgtCoeffs) {
    const Form* poSrc = FindForm(eSrcType);
    const Form* poTgt = FindForm(eTgtType);
    if (poSrc == nullptr || poTgt == nullptr) {
        return -1;
    }
    if (eSrcType == eRT_MATRIX) {
        return poTgt->fnFromMatrix(padfSrcCoeffs, padfTgtCoeffs);
    }
    if (eTgtType == eRT_MATRIX) {
        return poSrc->fnToMatrix(padfSrcCoeffs, padfTgtCoeffs);
    }
    if (eSrcType == eTgtType && padfSrcCoeffs != padfTgtCoeffs) {
        std::memmove(padfTgtCoeffs, padfSrcCoeffs, poSrc->nCoeffs * sizeof(double));
        return 0;
    }
    if (eSrcType == eRT_QUATERNION && eTgtType == eRT_AXIS_ANGLE) {
        return QuaternionToAxisAngle(padfSrcCoeffs, padfTgtCoeffs);
    }
    if (eSrcType == eRT_AXIS_ANGLE && eTgtType == eRT_QUATERNION) {
        return AxisAngleToQuaternion(padfSrcCoeffs, padfTgtCoeffs);
    }
    double m[9];
    poSrc->fnToMatrix(padfSrcCoeffs, m);
    return poTgt->fnFromMatrix(m, padfTgtCoeffs);
}

// Apart from its caller, like ConvertValid. The location is the caller's.
[[noreturn, gnu::cold, gnu::noinline]] void RefuseRotation(const char* pszFile,
                                                           const char* pszFunction,
                                                           std::uint32_t nLine) {
    throw ParameterException(
        "padfSrcCoeffs", ParameterException::eInvalid, "", "",
        "The provided coefficient arrray did not pass tests designed to ensure that it represents "
        "a valid rotation.  Please consult the IsValidRotation() documentation for a description "
        "of validity criteria",
        pszFile, pszFunction, nLine);
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
    return IsValid(eType, padfCoeffs);
}

int ConvertRotation(RotationType eSrcType, const double* padfSrcCoeffs, RotationType eTgtType,
                    double* padfTgtCoeffs) {
    if (!IsValid(eSrcType, padfSrcCoeffs)) {
        RefuseRotation(VETRA_HERE);
    }
    // Takes no longer than finding out what to do, so that is left out.
    if (eSrcType == eRT_QUATERNION && eTgtType == eRT_MATRIX) {
        return QuaternionToMatrix(padfSrcCoeffs, padfTgtCoeffs);
    }
    return ConvertValid(eSrcType, padfSrcCoeffs, eTgtType, padfTgtCoeffs);
}

int RotToMatrix(RotationType eType, const double* padfCoeffs, double* const* papadfRows) {
    const Form* poForm = FindForm(eType);
    if (poForm == nullptr) {
        return -1;
    }
    double m[9];
    poForm->fnToMatrix(padfCoeffs, m);
    CopyToRows(m, papadfRows);
    return 0;
}

int MatrixToRot(const double* const* papadfRows, RotationType eType, double* padfCoeffs) {
    const Form* poForm = FindForm(eType);
    if (poForm == nullptr) {
        return -1;
    }
    double m[9];
    for (int i = 0; i < 3; ++i) {
        std::copy_n(papadfRows[i], 3, m + 3 * i);
    }
    return poForm->fnFromMatrix(m, padfCoeffs);
}

int MatrixElementsToQuaternion(const double* padfMatrix, double* padfQuat) {
    return MatrixToQuaternion(padfMatrix, padfQuat);
}

void QuaternionToMatrixElements(const double* padfQuat, double* padfMatrix) {
    QuaternionToMatrix(padfQuat, padfMatrix);
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
