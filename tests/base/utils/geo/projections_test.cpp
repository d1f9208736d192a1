#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>

#include "tests/base/utils/geo/precise.h"
#include "vetra/base/utils/geo/ellipcalc.h"
#include "vetra/base/utils/geo/geodesy.h"

namespace vetra::tests {
namespace {

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

struct Ray {
    double O[3];
    double D[3];
};

/// From outside towards a place at a height, at most \p dfMaxTilt off its vertical.
Ray RandomRay(std::mt19937_64& oRandom, double dfMaxTilt, double dfHgt, PrecisePoint& oTarget) {
    std::uniform_real_distribution<double> oUnit(-1.0, 1.0);
    const double dfLon = 3.1 * oUnit(oRandom);
    const double dfLat = 1.5 * oUnit(oRandom);
    oTarget = PreciseXyz(dfLon, dfLat, dfHgt);
    const double dfTilt = dfMaxTilt * std::abs(oUnit(oRandom));
    const double dfTurn = 3.0 * oUnit(oRandom);
    const double adfLocal[3] = {std::sin(dfTilt) * std::sin(dfTurn),
                                std::sin(dfTilt) * std::cos(dfTurn), std::cos(dfTilt)};
    double adfBack[3];
    LSRToXYZ(adfLocal, dfLon, dfLat, adfBack);
    const double dfRange = 8e5 * (2.0 + oUnit(oRandom));
    const double T[3] = {static_cast<double>(oTarget.x), static_cast<double>(oTarget.y),
                         static_cast<double>(oTarget.z)};
    Ray oRay;
    for (int i = 0; i < 3; ++i) {
        oRay.O[i] = T[i] + dfRange * adfBack[i];
        oRay.D[i] = -adfBack[i];
    }
    return oRay;
}

double Apart(const double* p, const PrecisePoint& o) {
    return Length(PrecisePoint{p[0], p[1], p[2]} - o);
}

TEST(Projections, NearerIntersection) {
    std::mt19937_64 oRandom(6);
    const EllipCalc oCalc;
    for (int i = 0; i < 2000; ++i) {
        PrecisePoint oTarget;
        const Ray oRay = RandomRay(oRandom, 1.2, 0.0, oTarget);
        double p[3], r, q[3];
        ASSERT_EQ(oCalc.ProjectToInflatedEllipsoid(oRay.O, oRay.D, 0.0, p, r), 0);
        EXPECT_LE(Apart(p, oTarget), 1e-7);
        EXPECT_LE(Apart(p, {oRay.O[0] + r * oRay.D[0], oRay.O[1] + r * oRay.D[1],
                            oRay.O[2] + r * oRay.D[2]}),
                  1e-8);
        ASSERT_EQ(ProjectToEllipsoid(oRay.O, oRay.D, kA, kE2, 0.0, q), 0);
        EXPECT_TRUE(q[0] == p[0] && q[1] == p[1] && q[2] == p[2]);

        // The enlarged surface, whose polar axis is that of the equatorial one times
        // (k R + h) / (R + h).
        const double h = 1e5 * (i / 1000.0 - 0.5);
        const long double R = kA + h;
        const long double k = std::sqrt(1.0L - kE2);
        const long double B = R * (k * R + h) / (R + h);
        const auto fnOnSurface = [&](const double* P) {
            return static_cast<double>((P[0] * P[0] + P[1] * P[1]) / (R * R) +
                                       P[2] * P[2] / (B * B));
        };
        if (ProjectToEllipsoid(oRay.O, oRay.D, kA, kE2, h, p) == 0) {
            EXPECT_NEAR(fnOnSurface(p), 1.0, 1e-13);
            EXPECT_LT(p[0] * oRay.D[0] + p[1] * oRay.D[1] + p[2] * oRay.D[2], 0.0);
        } else {
            EXPECT_LT(h, 0.0);
        }
        ASSERT_EQ(ProjectOriginToEllipsoid(oRay.O, kA, kE2, h, p), 0);
        EXPECT_NEAR(fnOnSurface(p), 1.0, 1e-13);
        const double dfTimes = oRay.O[0] / p[0];
        EXPECT_TRUE(dfTimes > 1.0 &&
                    Apart(oRay.O, {dfTimes * p[0], dfTimes * p[1], dfTimes * p[2]}) < 1e-6);
    }
    const double V[3] = {1.0, 0.0, 0.0};
    double p[3];
    EXPECT_EQ(ProjectOriginToEllipsoid(V, kA, kE2, 0.0, p), 0);
    EXPECT_TRUE(std::abs(p[0] - kA) <= 1e-9 && p[1] == 0.0 && p[2] == 0.0);
}

TEST(Projections, MissesWriteNothing) {
    // A sphere of a kilometre, on which the arithmetic is exact.
    const struct {
        const char* pszWhat;
        Ray oRay;
        int nResult;
    } aoCases[] = {
        {"tangent", {{-2000.0, 1000.0, 0.0}, {1.0, 0.0, 0.0}}, -1},
        {"just below the tangent", {{-2000.0, 999.999, 0.0}, {1.0, 0.0, 0.0}}, 0},
        {"beside", {{-2000.0, 1001.0, 0.0}, {1.0, 0.0, 0.0}}, -1},
        {"away", {{-2000.0, 0.0, 0.0}, {-1.0, 0.0, 0.0}}, -1},
        {"across", {{0.0, 0.0, 500.0}, {1.0, 0.0, 0.0}}, -1},
        {"from the surface down", {{0.0, 1000.0, 0.0}, {0.0, -1.0, 0.0}}, -1},
        {"from inside", {{0.0, 500.0, 0.0}, {0.0, -1.0, 0.0}}, -1},
        {"from just outside", {{0.0, 1000.001, 0.0}, {0.0, -1.0, 0.0}}, 0},
        {"from the centre", {{0.0, 0.0, 0.0}, {1.0, 0.0, 0.0}}, -1},
        {"nowhere", {{-2000.0, 0.0, 0.0}, {0.0, 0.0, 0.0}}, -1},
        {"NaN origin", {{-2000.0, kNaN, 0.0}, {1.0, 0.0, 0.0}}, -1},
        {"NaN direction", {{-2000.0, 0.0, 0.0}, {1.0, 0.0, kNaN}}, -1},
        {"infinite origin", {{-HUGE_VAL, 0.0, 0.0}, {1.0, 0.0, 0.0}}, -1},
    };
    for (const auto& oCase : aoCases) {
        SCOPED_TRACE(oCase.pszWhat);
        double p[3] = {7.0, 7.0, 7.0}, q[3] = {7.0, 7.0, 7.0}, r = 7.0;
        const Ray& oRay = oCase.oRay;
        EXPECT_EQ(EllipCalc(1000.0, 0.0).ProjectToInflatedEllipsoid(oRay.O, oRay.D, 0.0, p, r),
                  oCase.nResult);
        EXPECT_EQ(ProjectToEllipsoid(oRay.O, oRay.D, 1000.0, 0.0, 0.0, q), oCase.nResult);
        for (const double df : {p[0], p[1], p[2], q[0], q[1], q[2], r}) {
            EXPECT_EQ(df == 7.0, oCase.nResult != 0);
            if (oCase.nResult != 0) {
                continue;
            }
            EXPECT_LE(std::abs(df), 2000.0);
        }
    }
    // The centre isn't quite below: rays that fall below the horizon, to both sides of a right
    // angle with the direction from the centre.
    double O[3];
    EllipCalc().GeoToXYZ(0.0, 0.8, 1.0, O[0], O[1], O[2]);
    for (const double dfUp : {1e-3, -1e-3}) {
        const double dfTurn = std::atan2(O[2], O[0]) + dfUp;
        const double D[3] = {std::sin(dfTurn), 0.0, -std::cos(dfTurn)};
        double p[3];
        EXPECT_EQ(ProjectToEllipsoid(O, D, kA, kE2, 0.0, p), dfUp > 0.0 ? -1 : 0);
    }
    for (const double dfOdd : {0.0, kNaN}) {
        const double V[3] = {0.0, dfOdd, 0.0};
        double p[3] = {7.0, 7.0, 7.0};
        EXPECT_EQ(ProjectOriginToEllipsoid(V, kA, kE2, 0.0, p), -1);
        EXPECT_TRUE(p[0] == 7.0 && p[1] == 7.0 && p[2] == 7.0);
    }
}

TEST(Projections, ToHeight) {
    std::mt19937_64 oRandom(7);
    EllipCalc oCalc;
    oCalc.SetHgtTol(1e-6);
    for (int i = 0; i < 500; ++i) {
        const double h = 20.0 * i - 1000.0;
        PrecisePoint oTarget;
        const Ray oRay = RandomRay(oRandom, 0.9, h, oTarget);
        double r = Apart(oRay.O, oTarget) + 2000.0;
        double p[3], g[3], q[3];
        for (int k = 0; k < 3; ++k) {
            q[k] = oRay.O[k] + r * oRay.D[k];
        }
        EXPECT_EQ(oCalc.ProjectToHeight(oRay.O, oRay.D, h, r, p, g), 0);
        EXPECT_LE(Apart(p, oTarget), 1e-5);
        EXPECT_LE(std::abs(r - Apart(oRay.O, oTarget)), 1e-5);
        EXPECT_EQ(g[2], h);
        EXPECT_LE(Length(PreciseXyz(g[0], g[1], g[2]) - oTarget), 1e-5);
        EXPECT_EQ(ProjectToXYZ(oRay.O, oRay.D, kA, kE2, h, q, 1e-6, 100), 0);
        EXPECT_LE(Apart(q, oTarget), 1e-5);
    }
}

TEST(Projections, ToHeightStartsAndStops) {
    const double O[3] = {kA + 7e5, 0.0, 0.0};
    const double D[3] = {-0.8, 0.6, 0.0};
    const EllipCalc oCalc;
    double r = 5e5, p[3], g[3];
    // Where the first guess will do, it stays.
    oCalc.XYZToGeo(O[0] - 0.8 * r, 0.6 * r, 0.0, g[0], g[1], g[2]);
    const double h = g[2] + 0.00009;
    oCalc.ProjectToHeight(O, D, h, r, p);
    EXPECT_TRUE(r == 5e5 && p[0] == O[0] - 0.8 * r && p[1] == 0.6 * r && p[2] == 0.0);
    oCalc.ProjectToHeight(O, D, h + 0.0001, r, p);
    EXPECT_NE(r, 5e5);

    // Without iterations the point still comes onto the ray; each one is a step to the place above.
    for (const int n : {-1, 0, 1, 2}) {
        double q[3] = {O[0], 5e5, 0.0};
        ProjectToXYZ(O, D, kA, kE2, 0.0, q, 0.0, n);
        double dfRange = 5e5;
        for (int i = 0; i < n; ++i) {
            const PrecisePoint oBelow = {O[0] - 0.8 * dfRange, 0.6 * dfRange, 0.0};
            const long double dfShrink = kA / static_cast<long double>(Length(oBelow));
            dfRange = Length({O[0] - oBelow.x * dfShrink, oBelow.y * dfShrink, 0.0L});
        }
        EXPECT_NEAR(q[0], O[0] - 0.8 * dfRange, 1e-7) << n;
        EXPECT_NEAR(q[1], 0.6 * dfRange, 1e-7) << n;
    }

    // A ray that misses, and numbers that are none, end at the limit. In place over the origin.
    double M[3] = {kA + 7e5, 0.0, 0.0};
    const double adfUp[3] = {1.0, 0.0, 0.0};
    r = 1.0;
    EXPECT_EQ(oCalc.ProjectToHeight(M, adfUp, 0.0, r, M, g), 0);
    EXPECT_TRUE(g[2] == 0.0 && M[0] == kA + 7e5 + r);
    for (const double dfOdd : {kNaN, HUGE_VAL, 1e300}) {
        const double adfOdd[3] = {dfOdd, 1.0, 0.0};
        r = 1.0;
        EXPECT_EQ(oCalc.ProjectToHeight(adfOdd, D, 0.0, r, p, g), 0);
        EXPECT_EQ(oCalc.ProjectToHeight(O, adfOdd, 0.0, r, p, g), 0);
        EXPECT_EQ(ProjectToXYZ(adfOdd, D, kA, kE2, 0.0, p, 1e-4, 100), 0);
        EXPECT_EQ(g[2], 0.0);
    }
}

}  // namespace
}  // namespace vetra::tests
