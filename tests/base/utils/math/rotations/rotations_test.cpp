#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>
#include <vector>

#include "tests/base/utils/math/rotations/eigenmapping.h"
#include "tests/support/refusal.h"
#include "vetra/vetra.h"

namespace vetra::tests {
namespace {

using Eigen::AngleAxisd;
using Eigen::Vector3d;

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();
constexpr const char* kOrders[] = {"XYZ", "XZY", "YXZ", "YZX", "ZXY", "ZYX"};
constexpr RotationType kNine = static_cast<RotationType>(9);
constexpr RotationType kMinusOne = static_cast<RotationType>(-1);

Refusal NotARotation() {
    return {"padfSrcCoeffs", 1, "", "",
            "The provided coefficient arrray did not pass tests designed to ensure that it "
            "represents a valid rotation.  Please consult the IsValidRotation() documentation for "
            "a description of validity criteria"};
}

// Large enough for every form.
using Coeffs = std::array<double, 9>;

RotationType Type(int n) { return static_cast<RotationType>(n); }

int Axis(int nOrder, int nPlace) { return kOrders[nOrder][nPlace] - 'X'; }

Coeffs Convert(RotationType eFrom, const Coeffs& adfFrom, RotationType eTo) {
    Coeffs adfTo;
    adfTo.fill(-99.0);
    EXPECT_EQ(ConvertRotation(eFrom, adfFrom.data(), eTo, adfTo.data()), 0);
    return adfTo;
}

// Turns about the axes of the turned frame, angles in the order of turning.
Eigen::Quaterniond Turns(int nOrder, double dfFirst, double dfMiddle, double dfLast) {
    return AngleAxisd(dfFirst, Vector3d::Unit(Axis(nOrder, 0))) *
           AngleAxisd(dfMiddle, Vector3d::Unit(Axis(nOrder, 1))) *
           AngleAxisd(dfLast, Vector3d::Unit(Axis(nOrder, 2)));
}

class Random {
 public:
    double Angle() { return moAngle(moEngine); }
    Vector3d Axis() {
        const double z = moAngle(moEngine) / kPi;
        const double a = Angle();
        const double r = std::sqrt(1.0 - z * z);
        return Vector3d(r * std::cos(a), r * std::sin(a), z);
    }

 private:
    std::mt19937 moEngine{20240607};
    std::uniform_real_distribution<double> moAngle{-kPi, kPi};
};

TEST(Rotations, FormsAgreeWithEigen) {
    Random oRandom;
    for (int n = 0; n < 1000; ++n) {
        const double adfTurns[3] = {oRandom.Angle(), oRandom.Angle(), oRandom.Angle()};
        for (int nOrder = 0; nOrder < 6; ++nOrder) {
            Coeffs adfAngles{};
            Eigen::Matrix3d oActive = Eigen::Matrix3d::Identity();
            for (int i = 0; i < 3; ++i) {
                const int nAxis = Axis(nOrder, i);
                adfAngles[static_cast<std::size_t>(nAxis)] = adfTurns[i];
                oActive *= AngleAxisd(adfTurns[i], Vector3d::Unit(nAxis)).toRotationMatrix();
            }
            EXPECT_LT(Difference(Convert(Type(nOrder), adfAngles, eRT_MATRIX), OursOf(oActive)),
                      1e-15)
                << kOrders[nOrder];
        }
        const AngleAxisd oTurn(oRandom.Angle(), oRandom.Axis());
        const Vector3d& a = oTurn.axis();
        const Coeffs adfAxisAngle = {a.x(), a.y(), a.z(), oTurn.angle()};
        const Matrix9 adfMatrix = OursOf(oTurn.toRotationMatrix());
        EXPECT_LT(Difference(Convert(eRT_AXIS_ANGLE, adfAxisAngle, eRT_MATRIX), adfMatrix), 2e-15);
        const Quat4 q = OursOf(Eigen::Quaterniond(oTurn));
        const Coeffs adfQuat = {q[0], q[1], q[2], q[3]};
        EXPECT_LT(Difference(Convert(eRT_QUATERNION, adfQuat, eRT_MATRIX), adfMatrix), 2e-15);
        // Angles within half a turn, so w is positive on both sides.
        Quat4 adfOurs;
        MatrixElementsToQuaternion(adfMatrix.data(), adfOurs.data());
        EXPECT_LT(Difference(adfOurs, q), 1e-15);
    }
}

TEST(Rotations, ElementaryMatrices) {
    const double c = std::cos(0.3);
    const double s = std::sin(0.3);
    const struct {
        void (*fnFlat)(double, double*);
        void (*fnRows)(double, double* const*);
        Matrix9 m;
    } aoCases[] = {{&XRotToMatrix, &XRotToMatrix, {1, 0, 0, 0, c, s, 0, -s, c}},
                   {&YRotToMatrix, &YRotToMatrix, {c, 0, -s, 0, 1, 0, s, 0, c}},
                   {&ZRotToMatrix, &ZRotToMatrix, {c, s, 0, -s, c, 0, 0, 0, 1}}};
    for (const auto& oCase : aoCases) {
        Matrix9 m;
        oCase.fnFlat(0.3, m.data());
        EXPECT_EQ(m, oCase.m);
        Matrix9 n;
        double* apadfRows[] = {&n[6], &n[0], &n[3]};
        oCase.fnRows(0.3, apadfRows);
        EXPECT_EQ(n, (Matrix9{m[3], m[4], m[5], m[6], m[7], m[8], m[0], m[1], m[2]}));
    }
}

// Random rotations, and those in which a form loses an angle, an axis or a sign.
std::vector<std::pair<Matrix9, bool>> DifficultMatrices() {
    std::vector<std::pair<Matrix9, bool>> vo;  // and whether within gimbal lock's tolerance
    Random oRandom;
    const double adfSteps[] = {0.0,   1e-17, 1e-16, 1e-15, 1e-14, 1e-13, 1e-11, 9e-11,
                               2e-10, 1e-9,  1e-8,  3e-8,  1e-7,  1e-6,  1e-5,  1e-4,
                               1e-3,  1e-2,  0.1,   0.5,   0.51,  1.0};
    for (const double dfStep : adfSteps) {
        const bool bLocked = dfStep > 4e-13 && dfStep < 1.5e-10;
        for (int n = 0; n < 20; ++n) {
            for (int nOrder = 0; nOrder < 6; ++nOrder) {
                for (const double dfMiddle : {kPi / 2 - dfStep, dfStep - kPi / 2}) {
                    vo.emplace_back(OursOf(Turns(nOrder, oRandom.Angle(), dfMiddle, oRandom.Angle())
                                               .toRotationMatrix()),
                                    bLocked);
                }
            }
            vo.emplace_back(OursOf(AngleAxisd(dfStep, oRandom.Axis()).toRotationMatrix()), false);
            vo.emplace_back(OursOf(AngleAxisd(kPi - dfStep, oRandom.Axis()).toRotationMatrix()),
                            false);
        }
        for (int i = 0; i < 3; ++i) {
            Vector3d oDiagonal(1.0, 1.0, 1.0);
            oDiagonal[i] = 0.0;
            for (const Vector3d& oAxis : {Vector3d(Vector3d::Unit(i)), oDiagonal.normalized()}) {
                for (const double dfAngle : {kPi / 2, kPi - dfStep, kPi + dfStep}) {
                    vo.emplace_back(OursOf(AngleAxisd(dfAngle, oAxis).toRotationMatrix()), bLocked);
                }
            }
        }
    }
    for (const Matrix9& m : {Matrix9{1, 0, 0, 0, -1, 0, 0, 0, -1},
                             {-1, 0, 0, 0, 1, 0, 0, 0, -1},
                             {-1, 0, 0, 0, -1, 0, 0, 0, 1},
                             {0, 1, 0, 0, 0, 1, 1, 0, 0},
                             {0, 0, -1, 0, -1, 0, -1, 0, 0},
                             {0, 1, 0, 1, 0, 0, 0, 0, -1}}) {
        vo.emplace_back(m, false);
    }
    return vo;
}

TEST(Rotations, EveryPairKeepsTheMatrix) {
    for (const auto& [m, bLocked] : DifficultMatrices()) {
        const double dfTolerance = bLocked ? 3e-10 : 1e-12;
        for (int nFrom = 0; nFrom < 9; ++nFrom) {
            const Coeffs adfFrom = Convert(eRT_MATRIX, m, Type(nFrom));
            for (int nTo = 0; nTo < 9; ++nTo) {
                const Coeffs adfTo = Convert(Type(nFrom), adfFrom, Type(nTo));
                ASSERT_LT(Difference(Convert(Type(nTo), adfTo, eRT_MATRIX), m), dfTolerance)
                    << nFrom << ' ' << nTo << ' ' << testing::PrintToString(m);
            }
        }
    }
}

TEST(Rotations, RangesOfResults) {
    for (const auto& [m, bLocked] : DifficultMatrices()) {
        for (int nOrder = 0; nOrder < 6; ++nOrder) {
            const Coeffs adf = Convert(eRT_MATRIX, m, Type(nOrder));
            for (int i = 0; i < 3; ++i) {
                ASSERT_LE(std::abs(adf[static_cast<std::size_t>(Axis(nOrder, i))]),
                          i == 1 ? kPi / 2 : kPi);
            }
        }
        const Coeffs q = Convert(eRT_MATRIX, m, eRT_QUATERNION);
        const double dfTrace = 1.0 + m[0] + m[4] + m[8];
        ASSERT_NEAR(q[0] * q[0] + q[1] * q[1] + q[2] * q[2] + q[3] * q[3], 1.0, 1e-14);
        if (dfTrace > 1e-9) {
            ASSERT_GT(q[3], 0.0);
        } else {
            const std::size_t nGreatest = m[0] >= m[4] && m[0] >= m[8] ? 0 : m[4] > m[8] ? 1 : 2;
            ASSERT_GT(q[nGreatest], 0.5);
        }
    }
}

TEST(Rotations, EulerAnglesComeBack) {
    Random oRandom;
    for (int n = 0; n < 200; ++n) {
        for (int nOrder = 0; nOrder < 6; ++nOrder) {
            const auto fnAt = [&](int i) { return static_cast<std::size_t>(Axis(nOrder, i)); };
            Coeffs adf{};
            adf[fnAt(0)] = oRandom.Angle();
            adf[fnAt(1)] = 0.49 * oRandom.Angle();
            adf[fnAt(2)] = oRandom.Angle();
            Coeffs adfBack =
                Convert(eRT_MATRIX, Convert(Type(nOrder), adf, eRT_MATRIX), Type(nOrder));
            const double dfTolerance = 1e-15 / std::cos(adf[fnAt(1)]);
            for (int i = 0; i < 3; ++i) {
                EXPECT_NEAR(adfBack[fnAt(i)], adf[fnAt(i)], dfTolerance);
            }
            // In gimbal lock the first angle becomes 0 and the last one takes it over.
            for (const double dfSide : {-1.0, 1.0}) {
                adf[fnAt(1)] = dfSide * (kPi / 2 - 5e-11);
                adfBack = Convert(eRT_MATRIX, Convert(Type(nOrder), adf, eRT_MATRIX), Type(nOrder));
                EXPECT_EQ(adfBack[fnAt(0)], 0.0);
                EXPECT_NEAR(adfBack[fnAt(1)], adf[fnAt(1)], 5e-16);
                const double dfSign = (Axis(nOrder, 1) - Axis(nOrder, 0) + 3) % 3 == 1 ? 1 : -1;
                const double dfSum = adf[fnAt(2)] + dfSign * dfSide * adf[fnAt(0)];
                EXPECT_NEAR(std::remainder(adfBack[fnAt(2)] - dfSum, 2 * kPi), 0.0, 1e-14)
                    << kOrders[nOrder] << ' ' << dfSide;
                // Not so just outside its tolerance.
                adf[fnAt(1)] = dfSide * (kPi / 2 - 2e-10);
                adfBack = Convert(eRT_MATRIX, Convert(Type(nOrder), adf, eRT_MATRIX), Type(nOrder));
                EXPECT_NEAR(std::remainder(adfBack[fnAt(0)] - adf[fnAt(0)], 2 * kPi), 0.0, 1e-5);
            }
        }
    }
}

TEST(Rotations, NoiseDoesNotChooseSigns) {
    for (const double dfNoise : {0.0, -9e-13, 9e-13}) {
        // Half a turn about Y.
        const Coeffs m = {-1, dfNoise, 0, dfNoise, 1, dfNoise, 0, dfNoise, -1};
        const Coeffs adf = Convert(eRT_MATRIX, m, eRT_XYZ);
        EXPECT_EQ(adf[0], -kPi);
        EXPECT_EQ(adf[1], 0.0);
        EXPECT_EQ(adf[2], -kPi);
        // The identity: no negative zero becomes -pi.
        const Coeffs e = {1, dfNoise, 0, dfNoise, 1, dfNoise, 0, dfNoise, 1};
        for (int nOrder = 0; nOrder < 6; ++nOrder) {
            const Coeffs adfNone = Convert(eRT_MATRIX, e, Type(nOrder));
            EXPECT_NEAR(std::abs(adfNone[0]) + std::abs(adfNone[1]) + std::abs(adfNone[2]), 0.0,
                        std::abs(dfNoise));
        }
    }
    // Elements that are not noise are taken as they are.
    EXPECT_EQ(Convert(eRT_MATRIX, {1, 0, 0, 0, 1, 0, 0, -2e-12, 1}, eRT_XYZ)[0], 2e-12);
}

TEST(Rotations, SpecialValues) {
    const Coeffs adfIdentity = {1, 0, 0, 0, 1, 0, 0, 0, 1};
    const auto fnFour = [](const Coeffs& adf) { return Quat4{adf[0], adf[1], adf[2], adf[3]}; };
    EXPECT_EQ(fnFour(Convert(eRT_MATRIX, adfIdentity, eRT_QUATERNION)), (Quat4{0, 0, 0, 1}));
    EXPECT_EQ(fnFour(Convert(eRT_MATRIX, adfIdentity, eRT_AXIS_ANGLE)), (Quat4{0, 0, 1, 0}));
    EXPECT_EQ(fnFour(Convert(eRT_MATRIX, {1, 0, 0, 0, -1, 0, 0, 0, -1}, eRT_QUATERNION)),
              (Quat4{1, 0, 0, 0}));
    EXPECT_LT(
        Difference(fnFour(Convert(eRT_MATRIX, {-1, 0, 0, 0, 0, -1, 0, -1, 0}, eRT_QUATERNION)),
                   (Quat4{0, -std::sqrt(0.5), std::sqrt(0.5), 0})),
        1e-15);

    const auto fnToAxisAngle = [](const Quat4& q) {
        Quat4 a;
        EXPECT_EQ(QuaternionToAxisAngle(q.data(), a.data()), 0);
        return a;
    };
    const double dfOver = 1.0 + 4e-10;
    EXPECT_EQ(fnToAxisAngle({0, 0, 0, dfOver}), (Quat4{0, 0, 1, 0}));
    EXPECT_EQ(fnToAxisAngle({0, 0, 0, -dfOver}), (Quat4{0, 0, 1, 2 * kPi}));
    EXPECT_EQ(fnToAxisAngle({0, 0, 0, 0}), (Quat4{0, 0, 0, kPi}));
    EXPECT_LT(Difference(fnToAxisAngle({3e-9, 0, -4e-9, 1}), (Quat4{0.6, 0, -0.8, 1e-8})), 1e-15);
    // Not a unit quaternion: the formulas as they stand.
    EXPECT_LT(Difference(fnToAxisAngle({0.3, 0, 0, 0.5}),
                         (Quat4{0.3 / std::sin(kPi / 3), 0, 0, 2 * kPi / 3})),
              1e-15);
    EXPECT_TRUE(std::isnan(fnToAxisAngle({0, 0, 0, 2})[3]));

    const Coeffs q = Convert(eRT_AXIS_ANGLE, {0.6, 0, 0.8, 2 * kPi}, eRT_QUATERNION);
    EXPECT_EQ(q[3], -1.0);
    const Coeffs a = Convert(eRT_QUATERNION, q, eRT_AXIS_ANGLE);
    EXPECT_LT(Difference(fnFour(a), (Quat4{0.6, 0, 0.8, 2 * kPi})), 1e-15);
}

TEST(Rotations, Validity) {
    const auto fnIsValid = [](RotationType eType, const Coeffs& adf) {
        const bool bValid = IsValidRotation(eType, adf.data());
        Coeffs adfTarget{};
        const auto fnConvert = [&] {
            ConvertRotation(eType, adf.data(), eRT_MATRIX, adfTarget.data());
        };
        if (bValid) {
            fnConvert();
        } else {
            ExpectRefusal(NotARotation(), fnConvert);
            EXPECT_EQ(adfTarget, Coeffs{});
        }
        return bValid;
    };
    for (const RotationType eType : {eRT_QUATERNION, eRT_AXIS_ANGLE}) {
        EXPECT_TRUE(fnIsValid(eType, {0, 0, std::sqrt(1.0 + 5e-10), 0}));
        EXPECT_TRUE(fnIsValid(eType, {0, 0, std::sqrt(1.0 - 5e-10), 0}));
        EXPECT_FALSE(fnIsValid(eType, {0, 0, 1.0 + 2e-9, 0}));
        EXPECT_FALSE(fnIsValid(eType, {0, 0, 1.0 - 2e-9, 0}));
        EXPECT_FALSE(fnIsValid(eType, {0, 0, 0, 0}));
        EXPECT_FALSE(fnIsValid(eType, {0, kNaN, 1, 0}));
        EXPECT_FALSE(fnIsValid(eType, {HUGE_VAL, 0, 0, 0}));
    }
    EXPECT_FALSE(fnIsValid(eRT_QUATERNION, {0, 0, 1, kNaN}));
    EXPECT_TRUE(fnIsValid(eRT_AXIS_ANGLE, {0, 0, 1, kNaN}));

    const Coeffs adfHalfTurn = {1, 0, 0, 0, -1, 0, 0, 0, -1};
    EXPECT_TRUE(fnIsValid(eRT_MATRIX, adfHalfTurn));
    EXPECT_FALSE(fnIsValid(eRT_MATRIX, {1, 0, 0, 0, 1, 0, 0, 0, -1}));  // a reflection
    // Row lengths count by their product and by the greatest element.
    EXPECT_TRUE(fnIsValid(eRT_MATRIX, {1, 0, 0, 0, 1 + 9e-10, 0, 0, 0, 1 - 9e-9}));
    EXPECT_FALSE(fnIsValid(eRT_MATRIX, {1, 0, 0, 0, 1 - 2e-8, 0, 0, 0, 1}));
    EXPECT_FALSE(fnIsValid(eRT_MATRIX, {1, 0, 0, 0, 1 + 2e-9, 0, 0, 0, 1}));
    for (std::size_t i = 0; i < 9; ++i) {
        for (const double df : {kNaN, HUGE_VAL, i % 4 == 0 ? 0.0 : 2e-9}) {
            Coeffs m = adfHalfTurn;
            m[i] = df;
            EXPECT_FALSE(fnIsValid(eRT_MATRIX, m)) << i << ' ' << df;
        }
    }
    EXPECT_TRUE(fnIsValid(eRT_ZYX, {kNaN, 1e300, HUGE_VAL}));
    EXPECT_TRUE(IsValidRotation(kNine, nullptr));
}

TEST(Rotations, ValidityOfPerturbedMatrices) {
    Random oRandom;
    int anCounts[2] = {0, 0};
    for (int n = 0; n < 20000; ++n) {
        Matrix9 m = OursOf(
            Turns(n % 6, oRandom.Angle(), n % 7 == 0 ? kPi / 2 : 0.3, 0.0).toRotationMatrix());
        const double dfSize = std::pow(10.0, -7.0 - n % 50 * 0.1);
        for (double& df : m) {
            df += dfSize * oRandom.Angle();
        }
        const Eigen::Map<const Eigen::Matrix<double, 3, 3, Eigen::RowMajor>> o(m.data());
        const bool bExpected =
            o.cwiseAbs().maxCoeff() <= 1.000000001 && std::abs(o.row(0).dot(o.row(1))) <= 1e-9 &&
            std::abs(o.row(2).dot(o.row(0))) <= 1e-9 && std::abs(o.row(2).dot(o.row(1))) <= 1e-9 &&
            std::abs(o.determinant() - 1.0) <= 1e-8;
        ASSERT_EQ(IsValidRotation(eRT_MATRIX, m.data()), bExpected) << n;
        ++anCounts[bExpected];
    }
    EXPECT_GT(std::min(anCounts[0], anCounts[1]), 1000);
}

TEST(Rotations, ElementsBeyondOneCountAsOne) {
    const double df = 1.0 + 5e-10;
    const Coeffs adf = Convert(eRT_MATRIX, {0, 1, 0, 0, 0, 1, df, 0, 0}, eRT_XYZ);
    EXPECT_EQ(adf[0], 0.0);
    EXPECT_EQ(adf[1], kPi / 2);
    EXPECT_EQ(adf[2], kPi / 2);
    EXPECT_EQ(Convert(eRT_MATRIX, {0, 1, 0, 0, 0, -1, -df, 0, 0}, eRT_XYZ)[1], -kPi / 2);
}

TEST(Rotations, UnknownTypesAndSharedArrays) {
    const Coeffs adfAngles = {0.1, 0.2, 0.3};
    for (const RotationType eUnknown : {kNine, kMinusOne}) {
        Coeffs adf = adfAngles;
        EXPECT_EQ(ConvertRotation(eUnknown, adfAngles.data(), eRT_XYZ, adf.data()), -1);
        EXPECT_EQ(ConvertRotation(eUnknown, adfAngles.data(), eRT_MATRIX, adf.data()), -1);
        EXPECT_EQ(ConvertRotation(eUnknown, adfAngles.data(), eUnknown, adf.data()), -1);
        EXPECT_EQ(ConvertRotation(eUnknown, adf.data(), eUnknown, adf.data()), -1);
        EXPECT_EQ(ConvertRotation(eRT_XYZ, adfAngles.data(), eUnknown, adf.data()), -1);
        double* apadfRows[] = {&adf[0], &adf[3], &adf[6]};
        EXPECT_EQ(RotToMatrix(eUnknown, adfAngles.data(), apadfRows), -1);
        EXPECT_EQ(MatrixToRot(apadfRows, eUnknown, adf.data()), -1);
        EXPECT_EQ(adf, adfAngles);
    }
    // In place, between all forms.
    const Coeffs m = Convert(eRT_XYZ, adfAngles, eRT_MATRIX);
    for (int nFrom = 0; nFrom < 9; ++nFrom) {
        for (int nTo = 0; nTo < 9; ++nTo) {
            Coeffs adf = Convert(eRT_MATRIX, m, Type(nFrom));
            EXPECT_EQ(ConvertRotation(Type(nFrom), adf.data(), Type(nTo), adf.data()), 0);
            EXPECT_LT(Difference(Convert(Type(nTo), adf, eRT_MATRIX), m), 1e-15);
        }
    }
    // The same form: a copy of so many elements, or the way through the matrix.
    Coeffs adf = {0, 0, 0, -1, 7, 7, 7, 7, 7};
    const Coeffs adfCopy = Convert(eRT_QUATERNION, adf, eRT_QUATERNION);
    EXPECT_EQ(adfCopy, (Coeffs{0, 0, 0, -1, -99, -99, -99, -99, -99}));
    ConvertRotation(eRT_QUATERNION, adf.data(), eRT_QUATERNION, adf.data());
    EXPECT_EQ(adf, (Coeffs{0, 0, 0, 1, 7, 7, 7, 7, 7}));
    EXPECT_EQ(Convert(eRT_YXZ, {4, 5, 6}, eRT_YXZ),
              (Coeffs{4, 5, 6, -99, -99, -99, -99, -99, -99}));
}

TEST(Rotations, RowsAreTheFlatMatrix) {
    const Coeffs adfAngles = {0.1, 0.2, 0.3};
    const Coeffs m = Convert(eRT_ZXY, adfAngles, eRT_MATRIX);
    Coeffs n{};
    double* apadfRows[] = {&n[6], &n[0], &n[3]};
    EXPECT_EQ(RotToMatrix(eRT_ZXY, adfAngles.data(), apadfRows), 0);
    EXPECT_EQ(n, (Coeffs{m[3], m[4], m[5], m[6], m[7], m[8], m[0], m[1], m[2]}));
    double q[4];
    EXPECT_EQ(MatrixToRot(apadfRows, eRT_QUATERNION, q), 0);
    EXPECT_LT(Difference(OursOf(EigensOf(q).toRotationMatrix()), m), 1e-15);
}

TEST(Rotations, NaNStaysNaN) {
    for (const double df : {kNaN, HUGE_VAL, -HUGE_VAL}) {
        for (int nTo = 0; nTo < 9; ++nTo) {
            for (int nFrom = 0; nFrom < 6; ++nFrom) {
                if (nFrom != nTo) {
                    const Coeffs adf = Convert(Type(nFrom), {df, df, df}, Type(nTo));
                    EXPECT_TRUE(std::isnan(adf[0])) << nFrom << ' ' << nTo;
                }
            }
            if (nTo != eRT_AXIS_ANGLE) {
                const Coeffs adf = Convert(eRT_AXIS_ANGLE, {0, 0.6, 0.8, df}, Type(nTo));
                EXPECT_TRUE(std::isnan(adf[0]) && std::isnan(adf[2])) << nTo;
            }
        }
        const Matrix9 m = {df, df, df, df, df, df, df, df, df};
        const double* apadfRows[] = {&m[0], &m[3], &m[6]};
        for (int nTo = 0; nTo < 8; ++nTo) {
            double adf[4];
            EXPECT_EQ(MatrixToRot(apadfRows, Type(nTo), adf), 0);
            EXPECT_TRUE(std::isnan(adf[0]) || std::isnan(adf[1]) || std::isnan(adf[2])) << nTo;
        }
    }
}

}  // namespace
}  // namespace vetra::tests
