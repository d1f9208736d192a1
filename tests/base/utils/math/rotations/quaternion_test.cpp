#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>
#include <vector>

#include "tests/base/utils/math/rotations/eigenmapping.h"
#include "vetra/vetra.h"

namespace vetra::qtn {
namespace {

using tests::Difference;
using tests::EigensOf;
using tests::kPi;
using tests::Matrix9;
using tests::OursOf;
using tests::Quat4;

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();
constexpr double kEps = 2.220446049250313e-16;

Quat4 ToArray(const Quaternion& q) { return {q[0], q[1], q[2], q[3]}; }

Quaternion ToObject(const Quat4& q) { return {q[0], q[1], q[2], q[3]}; }

// A rotation by an angle about an axis that needn't have length 1.
Quat4 Turn(double dfAngle, double x, double y, double z) {
    return OursOf(
        Eigen::Quaterniond(Eigen::AngleAxisd(dfAngle, Eigen::Vector3d(x, y, z).normalized())));
}

std::vector<Quat4> RandomQuats(int nCount, bool bUnit) {
    std::mt19937 oRandom(7);
    std::normal_distribution<double> oNormal;
    std::vector<Quat4> vo;
    for (int i = 0; i < nCount; ++i) {
        Quat4 q = {oNormal(oRandom), oNormal(oRandom), oNormal(oRandom), oNormal(oRandom)};
        vo.push_back(bUnit ? OursOf(EigensOf(q.data()).normalized()) : q);
    }
    return vo;
}

// The two families side by side: what one gives must be what the other gives.
using Unary = void (*)(const double*, double*);
using Binary = void (*)(const double*, const double*, double*);

Quat4 Call(Unary fn, const Quat4& q) {
    Quat4 adfOut = q;
    fn(adfOut.data(), adfOut.data());  // in place
    return adfOut;
}

Quat4 Call(Binary fn, const Quat4& a, const Quat4& b) {
    Quat4 adfOut = b;
    fn(a.data(), adfOut.data(), adfOut.data());
    return adfOut;
}

TEST(Quaternion, AlgebraAgreesWithEigen) {
    const std::vector<Quat4> vo = RandomQuats(200, false);
    for (std::size_t i = 0; i + 1 < vo.size(); ++i) {
        const Quat4& a = vo[i];
        const Quat4& b = vo[i + 1];
        const Quaternion oA = ToObject(a);
        const Quaternion oB = ToObject(b);
        const Eigen::Quaterniond p = EigensOf(a.data());
        const Eigen::Quaterniond q = EigensOf(b.data());
        const double s = b[0];
        const struct {
            Quaternion oObject;
            Quat4 adfArray;
            Eigen::Quaterniond oEigen;
        } aoCases[] = {
            {oA * oB, Call(&QuatMult, a, b), p * q},
            {oA + oB, Call(&QuatAdd, a, b), Eigen::Quaterniond(p.coeffs() + q.coeffs())},
            {oA - oB, Call(&QuatSubtract, a, b), Eigen::Quaterniond(p.coeffs() - q.coeffs())},
            {oA.Conj(), Call(&QuatConj, a), p.conjugate()},
            {oA.Conj(), Call(&UnitQuatInv, a), p.conjugate()},
            {oA.Inv(), Call(&QuatInv, a), p.inverse()},
            {oA.Normalize(), Call(&QuatNormalize, a), p.normalized()},
            {oA / oB, Call(&QuatMult, a, Call(&QuatInv, b)), p * q.inverse()},
            {s / oB, ToArray(s * oB.Inv()), Eigen::Quaterniond(s * q.inverse().coeffs())},
            {-oA, ToArray(oA * -1.0), Eigen::Quaterniond(-p.coeffs())},
            {oA / s, ToArray((1.0 / s) * oA), Eigen::Quaterniond(p.coeffs() / s)},
        };
        for (const auto& [oObject, adfArray, oEigen] : aoCases) {
            const double dfTolerance = 2e-15 * (1.0 + oEigen.norm());
            EXPECT_LT(Difference(ToArray(oObject), OursOf(oEigen)), dfTolerance);
            EXPECT_LT(Difference(adfArray, OursOf(oEigen)), dfTolerance);
        }
        EXPECT_NEAR(oA.DotProd(oB), p.dot(q), 1e-14);
        EXPECT_EQ(oA.DotProd(oB), QuatDotProd(a.data(), b.data()));
        EXPECT_NEAR(oA.Mag(), p.norm(), 1e-14);
        EXPECT_EQ(oA.Mag(), QuatMag(a.data()));

        Quaternion o = oA;
        EXPECT_EQ(ToArray(o *= oB), ToArray(oA * oB));
        EXPECT_EQ(ToArray(o /= oB), ToArray(oA * oB / oB));
        o = oA;
        EXPECT_EQ(ToArray(o += oB), ToArray(oA + oB));
        o = oA;
        EXPECT_EQ(ToArray(o -= oB), ToArray(oA - oB));
        o = oA;
        EXPECT_EQ(ToArray(o *= s), ToArray(s * oA));
        EXPECT_EQ(ToArray(o /= s), ToArray(oA * s / s));
        Quat4 adfScaled = a;
        QuatMultScalar(adfScaled.data(), s, adfScaled.data());
        EXPECT_EQ(adfScaled, ToArray(oA * s));
        o = oA;
        o.NormalizeSelf();
        EXPECT_EQ(ToArray(o), ToArray(oA.Normalize()));
        Quat4 adfSelf = a;
        QuatNormalizeSelf(adfSelf.data());
        EXPECT_EQ(adfSelf, ToArray(o));
    }
}

TEST(Quaternion, RotatesLikeItsMatrix) {
    const std::vector<Quat4> vo = RandomQuats(200, true);
    for (std::size_t i = 0; i + 1 < vo.size(); ++i) {
        const Eigen::Quaterniond p = EigensOf(vo[i].data());
        Matrix9 m;
        ToObject(vo[i]).ToMatrix(m.data());
        EXPECT_LT(Difference(m, OursOf(p.toRotationMatrix())), 1e-15);
        double v[3] = {1.0, -2.0, 0.5};
        QuatVecRot(vo[i].data(), v, v);
        const Eigen::Vector3d oExpected = p.conjugate() * Eigen::Vector3d(1.0, -2.0, 0.5);
        EXPECT_LT((Eigen::Vector3d(v) - oExpected).norm(), 3e-15);
        // The product a b is a, then b.
        Matrix9 n;
        Matrix9 mn;
        ToObject(vo[i + 1]).ToMatrix(n.data());
        (ToObject(vo[i]) * ToObject(vo[i + 1])).ToMatrix(mn.data());
        MM3_Mult(n.data(), m.data(), n.data());
        EXPECT_LT(Difference(mn, n), 2e-15);
        // A length doesn't matter to the object's matrix; it does to the vector.
        ToObject(vo[i]).operator*(3.0).ToMatrix(n.data());
        EXPECT_LT(Difference(m, n), 1e-15);
    }
    double v[3] = {1.0, 2.0, 3.0};
    QuatVecRot(Quat4{0, 0, 0, 2}.data(), v, v);
    EXPECT_EQ(v[2], 12.0);
}

TEST(Quaternion, MatrixNearHalfTurns) {
    for (const double dfStep : {0.0, 1e-15, 3e-9, 1e-8, 2e-8, 1e-5, 4e-5, 1e-3, 0.5}) {
        for (const auto& v : RandomQuats(40, false)) {
            for (const double dfAngle : {kPi - dfStep, kPi + dfStep}) {
                Quat4 q = Turn(dfAngle, v[0], v[1], v[2]);
                const Matrix9 m = OursOf(EigensOf(q.data()).toRotationMatrix());
                Quaternion o;
                o.FromMatrix(m.data());
                Quat4 adfArray;
                MatrixElementsToQuaternion(m.data(), adfArray.data());
                EXPECT_NEAR(std::abs(o.DotProd(ToObject(q))), 1.0, 1e-15);
                for (const Quat4& adf : {ToArray(o), adfArray}) {
                    const Quat4 adfNegative = {-q[0], -q[1], -q[2], -q[3]};
                    EXPECT_LT(std::min(Difference(adf, q), Difference(adf, adfNegative)), 1e-14);
                }
                // The object takes w positive from 1 + trace = eps on, the array from 1e-9.
                const double dfTrace = m[0] + m[4] + m[8] + 1.0;
                EXPECT_TRUE(dfTrace <= kEps || o[3] >= 0.0) << dfTrace;
                EXPECT_TRUE(dfTrace <= 1e-9 || adfArray[3] >= 0.0);
                if (dfTrace < 0.99e-9) {
                    const std::size_t nMax = m[0] >= m[4] && m[0] >= m[8] ? 0 : m[4] > m[8] ? 1 : 2;
                    EXPECT_GT(adfArray[nMax], 0.5);
                }
            }
        }
    }
    Quaternion o;
    o.FromMatrix(Matrix9{-1, 0, 0, 0, 1, 0, 0, 0, -1}.data());
    EXPECT_EQ(ToArray(o), (Quat4{0, 1, 0, 0}));
}

TEST(Quaternion, AxisAndAngle) {
    for (const double dfAngle : {1e-12, 1e-5, 0.3, 3.0, kPi, 4.0, 2 * kPi - 1e-5}) {
        double adfAxis[3];
        double df;
        (ToObject(Turn(dfAngle, 0.48, -0.6, 0.64)) * 5.0).ToAxisAndAngle(adfAxis, df);
        EXPECT_NEAR(df, dfAngle, 1e-15 + 1e-15 * dfAngle);
        EXPECT_LT((Eigen::Vector3d(adfAxis) - Eigen::Vector3d(0.48, -0.6, 0.64)).norm(), 1e-10);
        EXPECT_NEAR(Eigen::Vector3d(adfAxis).norm(), 1.0, 1e-15);
    }
    double adfAxis[3];
    double df;
    Quaternion(0, 0, 0, 3).ToAxisAndAngle(adfAxis, df);
    EXPECT_TRUE(adfAxis[0] == 0.0 && adfAxis[1] == 0.0 && adfAxis[2] == 1.0 && df == 0.0);
}

TEST(Quaternion, SmallOnes) {
    const Quaternion oZero;
    EXPECT_EQ(ToArray(oZero), (Quat4{0, 0, 0, 0}));
    EXPECT_EQ(ToArray(oZero.Normalize()), (Quat4{0, 0, 1, 0}));
    EXPECT_EQ(ToArray(oZero.Log()), (Quat4{0, 0, kPi / 2, 0}));
    const Quat4 adfSmall = {1e-17, 2e-17, 3e-17, 4e-17};
    Quaternion oSmall = ToObject(adfSmall);
    oSmall.NormalizeSelf();
    EXPECT_EQ(ToArray(oSmall), (Quat4{1e-17, 2e-17, 1, 4e-17}));
    Quat4 adfSelf = adfSmall;
    QuatNormalizeSelf(adfSelf.data());
    EXPECT_EQ(adfSelf, (Quat4{0, 0, 1, 0}));
    // 1e-9 has a length, but no inverse.
    EXPECT_EQ(ToArray(Quaternion(0, 0, 0, 1e-9).Inv()), (Quat4{0, 0, 0, 1e-9}));
    EXPECT_EQ(ToArray(Quaternion(0, 0, 0, 1e-9).Normalize()), (Quat4{0, 0, 0, 1}));
    EXPECT_EQ(ToArray(Quaternion(1, 2, 3, 4) / Quaternion(0, 0, 0, 1e-9)),
              ToArray(Quaternion(1, 2, 3, 4) * 1e-9));
    EXPECT_EQ(ToArray(oZero.Exp()), (Quat4{0, 0, 0, 1}));

    const Quaternion o(1, 2, 3, 4);
    EXPECT_TRUE(o[-1] == 0.0 && o[4] == 0.0 && o[3] == 4.0);
    EXPECT_EQ(ToArray(o / kEps), ToArray(o));
    EXPECT_EQ((o / std::nextafter(kEps, 1.0))[0], 1.0 / std::nextafter(kEps, 1.0));
    EXPECT_EQ(ToArray(o / kNaN), ToArray(o));
    Quaternion oDivided = o;
    EXPECT_EQ((oDivided /= -kEps)[0], -1.0 / kEps);
    oDivided = o;
    EXPECT_EQ(ToArray(oDivided /= 2e-16), ToArray(o));
    EXPECT_TRUE(std::isnan((oDivided /= kNaN)[0]));
}

TEST(Quaternion, LogarithmsAndPowers) {
    for (const double dfAngle : {1e-7, 1e-3, 1.0, 3.0, kPi, 5.0, 2 * kPi - 1e-3, 2 * kPi - 1e-7}) {
        const Quat4 q = Turn(dfAngle, 0.48, -0.6, 0.64);
        const double h = dfAngle / 2;
        const Quat4 adfLog = ToArray(ToObject(q).Log());
        // Next to a full turn the axis has few digits.
        const double dfTolerance = dfAngle > 6.0 ? 1e-8 : 1e-15;
        EXPECT_LT(Difference(adfLog, (Quat4{0.48 * h, -0.6 * h, 0.64 * h, 0})), dfTolerance);
        EXPECT_EQ(Call(&QuatLog, q), adfLog);
        EXPECT_LT(Difference(ToArray(ToObject(adfLog).Exp()), q), 1e-15);
        EXPECT_EQ(Call(&QuatExp, adfLog), ToArray(ToObject(adfLog).Exp()));
        const Quat4 adfRoot = ToArray(ToObject(q).Pow(0.5));
        EXPECT_LT(Difference(adfRoot, Turn(dfAngle / 2, 0.48, -0.6, 0.64)), dfTolerance);
        Quat4 adfPower = q;
        QuatPow(adfPower.data(), 0.5, adfPower.data());
        EXPECT_EQ(adfPower, adfRoot);
    }
    EXPECT_EQ(ToArray(Quaternion(0, 0, 0, 7).Log()), (Quat4{0, 0, 0, 0}));
    EXPECT_EQ(ToArray(Quaternion(0, 0, 0, -1).Log()), (Quat4{0, 0, 0, 0}));
    EXPECT_EQ(ToArray(Quaternion(1e-9, 0, 0, 1).Log()), (Quat4{0, 0, 0, 0}));
    // The scalar counts in the length alone.
    const double s = std::sin(5.0) / 5.0;
    EXPECT_LT(
        Difference(ToArray(Quaternion(0, 3, 0, 4).Exp()), (Quat4{0, 3 * s, 0, std::cos(5.0)})),
        1e-16);
}

Quat4 Slerped(const Quat4& a, const Quat4& b, double t) {
    Quaternion o = ToObject(a);
    Slerp(o, ToObject(b), t, o);
    return ToArray(o);
}

Quat4 ArraySlerped(const Quat4& a, const Quat4& b, double t) {
    Quat4 adf = b;
    QuatSlerp(a.data(), adf.data(), t, adf.data());
    return adf;
}

TEST(Quaternion, SlerpGoesAlongTheArc) {
    const Quat4 a = Turn(0.4, 1, 2, 3);
    for (const double dfAngle : {1e-3, 1.0, 3.0, 5.0}) {
        const Quat4 b = ToArray(ToObject(a) * ToObject(Turn(dfAngle, -1, 0, 2)));
        for (const double t : {-0.5, 0.0, 1e-9, 0.25, 0.5, 1.0, 2.0}) {
            const Quat4 adf = ToArray(ToObject(a) * ToObject(Turn(t * dfAngle, -1, 0, 2)));
            EXPECT_LT(Difference(Slerped(a, b, t), adf), 3e-15) << dfAngle << ' ' << t;
            EXPECT_LT(Difference(ArraySlerped(a, b, t), adf), 3e-15) << dfAngle << ' ' << t;
            if (dfAngle < kPi && t >= 0.0 && t <= 1.0) {
                const Quat4 adfEigens = OursOf(EigensOf(a.data()).slerp(t, EigensOf(b.data())));
                EXPECT_LT(Difference(Slerped(a, b, t), adfEigens), 3e-15);
            }
        }
        EXPECT_EQ(Slerped(a, b, 0.0), a);
        EXPECT_EQ(Slerped(a, b, 1.0), b);
        EXPECT_EQ(Slerped(a, b, 2e-16), a);
        EXPECT_EQ(ArraySlerped(a, b, -9e-15), a);
        EXPECT_EQ(ArraySlerped(a, b, 1.0 + 9e-15), b);
    }
    for (const double t : {-3.0, 0.3, 1.5}) {
        EXPECT_LT(Difference(Slerped(a, a, t), a), 1e-15);
        EXPECT_LT(Difference(ArraySlerped(a, a, t), a), 1e-15);
    }
    // Ends aren't normalised, results of the arrays are.
    const Quat4 adfLong = ToArray(ToObject(a) * 2.0);
    EXPECT_NEAR(QuatMag(Slerped(adfLong, Turn(1, 0, 0, 1), 0.5).data()), 2.0, 1e-15);
    EXPECT_NEAR(QuatMag(ArraySlerped(adfLong, Turn(1, 0, 0, 1), 0.5).data()), 1.0, 1e-15);
}

TEST(Quaternion, ArraySlerpOfNearlyEqualOnesIsLerp) {
    const Quat4 a = {0, 0, 0, 1};
    for (const double dfAngle : {2.82e-4, 2.84e-4}) {  // the dot product is 1 - 1e-8 in between
        const Quat4 b = Turn(dfAngle, 0, 0, 1);
        Quat4 adfLerp;
        QuatLerp(a.data(), b.data(), 0.25, adfLerp.data());
        EXPECT_EQ(ArraySlerped(a, b, 0.25) == adfLerp, dfAngle < 2.83e-4);
        EXPECT_LT(Difference(Slerped(a, b, 0.25), Turn(0.25 * dfAngle, 0, 0, 1)), 1e-15);
    }
    Quat4 adfLerp;
    QuatLerp(a.data(), Turn(kPi / 2, 0, 0, 1).data(), 0.5, adfLerp.data());
    EXPECT_LT(Difference(adfLerp, Turn(kPi / 4, 0, 0, 1)), 1e-15);
}

TEST(Quaternion, SquadPassesTheKeysSmoothly) {
    // On a great circle at constant speed it stays there.
    const auto fnKey = [](double t) { return Turn(0.4 * t, 1, 2, 3); };
    std::vector<Quat4> vo = {fnKey(-1), fnKey(0), fnKey(1), fnKey(2)};
    const auto fnSquad = [&](double t) {
        Quaternion o = ToObject(vo[0]);
        Squad(o, ToObject(vo[1]), ToObject(vo[2]), ToObject(vo[3]), t, o);
        Quat4 adf = vo[3];
        QuatSquad(vo[0].data(), vo[1].data(), vo[2].data(), adf.data(), t, adf.data());
        EXPECT_LT(Difference(adf, ToArray(o)), 1e-14);
        return ToArray(o);
    };
    for (const double t : {0.1, 0.5, 0.9}) {
        EXPECT_LT(Difference(fnSquad(t), fnKey(t)), 1e-15);
    }
    // By hand from its definition, at t = 0.5.
    vo = {Turn(0.3, 1, 0, 0), Turn(0.9, 0, 1, 0), Turn(1.2, 0, 1, 1), Turn(0.5, 1, 1, 1)};
    const auto fnControl = [&](std::size_t i) {
        const Quaternion c = ToObject(vo[i]);
        const Quaternion oLogs =
            (c.Conj() * ToObject(vo[i + 1])).Log() + (c.Conj() * ToObject(vo[i - 1])).Log();
        return ToArray(c * (oLogs * -0.25).Exp());
    };
    EXPECT_LT(Difference(fnSquad(0.5), Slerped(Slerped(vo[1], vo[2], 0.5),
                                               Slerped(fnControl(1), fnControl(2), 0.5), 0.5)),
              1e-15);
    EXPECT_EQ(fnSquad(0.0), vo[1]);
    EXPECT_EQ(fnSquad(1.0 - 1e-16), vo[2]);
    // The speed at a key is the same from both sides.
    const Quat4 q1 = vo[1];
    const double h = 1e-5;
    const Quaternion oAfter = (ToObject(q1).Conj() * ToObject(fnSquad(h))).Log();
    vo = {Turn(0.1, 0, 0, 1), vo[0], vo[1], vo[2]};
    const Quaternion oBefore = (ToObject(fnSquad(1 - h)).Conj() * ToObject(q1)).Log();
    EXPECT_LT((oAfter - oBefore).Mag(), 1e-3 * oAfter.Mag());
}

TEST(Quaternion, MakeSameSign) {
    const struct {
        Quat4 adfReference, adfQuat;
        bool bNegated;
    } aoCases[] = {
        {Turn(1, 0, 0, 1), Turn(2, 1, 0, 1), false},
        {Turn(1, 0, 0, 1), Turn(2, 1, 0, -1), true},
        {Turn(1, 0, 0, 1), Turn(2, 1, 0, 0), false},            // at right angles
        {Turn(1, 0, 0, 1), Turn(2 * kPi - 1, 0, 0, 1), false},  // the scalar doesn't count
        {{0, 0, 0, 1}, Turn(1, 1, 0, -1), true},                // no rotation: its axis is Z
        {Turn(1, 1, 0, -1), {0, 0, 0, 1}, true},
    };
    for (const auto& [adfReference, adfQuat, bNegated] : aoCases) {
        const Quat4 adfExpected = bNegated ? ToArray(-ToObject(adfQuat)) : adfQuat;
        Quaternion o = ToObject(adfQuat) * 2.0;
        o.MakeSameSign(ToObject(adfReference) * 0.1);
        EXPECT_EQ(ToArray(o * 0.5), adfExpected);
        Quat4 adf = adfQuat;
        QuatMakeSameSign(adfReference.data(), adf.data());
        EXPECT_EQ(adf, adfExpected);
    }
}

TEST(Quaternion, NaNStaysNaN) {
    for (const Quat4& q : {Quat4{kNaN, 0, 0, 1}, Quat4{0, 0, 0, kNaN}, Quat4{HUGE_VAL, 0, 0, 1}}) {
        for (const Unary fn : {&QuatNormalize, &QuatLog, &QuatExp}) {
            const Quat4 adf = Call(fn, q);
            EXPECT_TRUE(std::isnan(adf[0] + adf[1] + adf[2] + adf[3]));
        }
        const Quat4 adf = Slerped(q, Turn(1, 0, 0, 1), 0.5);
        EXPECT_TRUE(std::isnan(adf[0] + adf[1] + adf[2] + adf[3]));
        double adfAxis[3];
        double dfAngle;
        ToObject(q).ToAxisAndAngle(adfAxis, dfAngle);
        EXPECT_TRUE(std::isnan(adfAxis[0] + dfAngle));
    }
}

}  // namespace
}  // namespace vetra::qtn
