// The conversions of EllipCalc and of the free functions beside GeographicLib's and beside their
// definition in long double.

#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <GeographicLib/Geocentric.hpp>
#include <limits>
#include <random>
#include <string>
#include <vector>

#include "tests/base/utils/geo/precise.h"
#include "vetra/base/utils/geo/ellipcalc.h"
#include "vetra/base/utils/geo/geodesy.h"

namespace vetra::tests {
namespace {

constexpr double kPi = 3.141592653589793;
constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();
constexpr double kInf = std::numeric_limits<double>::infinity();

struct Triplet {
    double x, y, z;
};

struct Converter {
    std::string sName;
    std::function<Triplet(double, double, double)> fnConvert;
};

std::vector<Converter> Forwards(double a, double e2) {
    const EllipCalc oCalc(a, e2);
    return {{"EllipCalc",
             [=](double dfLon, double dfLat, double dfHgt) {
                 Triplet o;
                 oCalc.GeoToXYZ(dfLon, dfLat, dfHgt, o.x, o.y, o.z);
                 return o;
             }},
            {"function", [=](double dfLon, double dfLat, double dfHgt) {
                 const double adfGeo[3] = {dfLon, dfLat, dfHgt};
                 double p[3];
                 GeoToXYZ(adfGeo, a, e2, p);
                 return Triplet{p[0], p[1], p[2]};
             }}};
}

std::vector<Converter> Inverses(double a, double e2) {
    const EllipCalc oCalc(a, e2);
    return {{"XYZToGeo",
             [=](double X, double Y, double Z) {
                 Triplet o;
                 oCalc.XYZToGeo(X, Y, Z, o.x, o.y, o.z);
                 return o;
             }},
            {"XYZToLon and XYZToLatHgt",
             [=](double X, double Y, double Z) {
                 Triplet o;
                 oCalc.XYZToLon(X, Y, Z, o.x);
                 oCalc.XYZToLatHgt(X, Y, Z, o.y, o.z);
                 return o;
             }},
            {"function", [=](double X, double Y, double Z) {
                 const double adfXyz[3] = {X, Y, Z};
                 double g[3];
                 XYZToGeo(adfXyz, a, e2, g);
                 return Triplet{g[0], g[1], g[2]};
             }}};
}

const double kHeights[] = {-1e4, -1.0, 0.0, 1e-3, 123.0, 9e3, 7.9e5, 5e6, 2.02e7, 4e7};

TEST(Conversions, ForwardWithin15nm) {
    std::vector<Triplet> voPlaces;
    for (const double h : kHeights) {
        for (const double dfLat : {-kPi / 2, -1.5707963, -1.0, -1e-9, 0.0, 0.7853981633974483, 1.57,
                                   std::nextafter(kPi / 2, 0.0), kPi / 2}) {
            for (const double dfLon : {-kPi, -2.0, -1e-12, 0.0, kPi / 2, 3.0, kPi, 7.0}) {
                voPlaces.push_back({dfLon, dfLat, h});
            }
        }
    }
    std::mt19937_64 oRandom(3);
    std::uniform_real_distribution<double> oUnit(-1.0, 1.0);
    for (int i = 0; i < 20000; ++i) {
        voPlaces.push_back(
            {kPi * oUnit(oRandom), kPi / 2 * oUnit(oRandom), 2e7 + 2e7 * oUnit(oRandom)});
    }
    const GeographicLib::Geocentric oTruth(kA, 1.0 - std::sqrt(1.0 - kE2));
    for (const Converter& oForward : Forwards(kA, kE2)) {
        double dfWorst = 0.0;
        double dfWorstTruth = 0.0;
        for (const Triplet& g : voPlaces) {
            const Triplet p = oForward.fnConvert(g.x, g.y, g.z);
            const PrecisePoint oOurs = {p.x, p.y, p.z};
            const PrecisePoint oExact = PreciseXyz(g.x, g.y, g.z);
            dfWorst = std::max(dfWorst, Length(oOurs - oExact));
            // Its degrees don't stand for quite the same place as our radians.
            const double dfLonDeg = static_cast<double>(g.x / kPreciseRadPerDeg);
            const double dfLatDeg =
                std::clamp(static_cast<double>(g.y / kPreciseRadPerDeg), -90.0, 90.0);
            double X, Y, Z;
            oTruth.Forward(dfLatDeg, dfLonDeg, g.z, X, Y, Z);
            const PrecisePoint oTheirs = {X, Y, Z};
            dfWorstTruth = std::max(
                dfWorstTruth, Length(oTheirs - PreciseXyz(dfLonDeg * kPreciseRadPerDeg,
                                                          dfLatDeg * kPreciseRadPerDeg, g.z)));
        }
        EXPECT_LE(dfWorst, 1.5e-8) << oForward.sName;
        EXPECT_LE(dfWorstTruth, 1.5e-8) << "the yardstick itself, beside GeographicLib";
        RecordProperty(oForward.sName + " forward, nm", std::to_string(dfWorst * 1e9));
    }
}

/// Earth-fixed points everywhere from -10 km to 40000 km, with the neighbourhoods of the axis, the
/// equator and the antimeridian.
std::vector<Triplet> EarthFixedPoints() {
    std::vector<Triplet> voPoints;
    const double b = kA * std::sqrt(1.0 - kE2);
    const double adfSmall[] = {1e-300, 1e-150, 1e-12, 1e-6, 1e-3, 2e-2, 0.3, 0.6, 0.65, 5.0, 1e3};
    for (const double h : kHeights) {
        for (const double d : adfSmall) {
            for (const double dfSign : {1.0, -1.0}) {
                voPoints.push_back({d, 0.0, dfSign * (b + h)});
                voPoints.push_back({-d, dfSign * d, dfSign * (b + h)});
                voPoints.push_back({0.6 * (kA + h), 0.8 * (kA + h), dfSign * d});
                voPoints.push_back({-(kA + h), dfSign * d, 0.0});
                voPoints.push_back({-(kA + h) / 2, dfSign * d, -(kA + h) / 2});
            }
        }
        // Both sides of where the closed form takes over, at |Z| = 1e7 (1 - e2) p.
        for (const double dfTan : {9.9e6, 9.9999999e6, 1.00000001e7, 1.01e7}) {
            for (const double Z : {b + h, -b - h}) {
                voPoints.push_back({0.0, std::abs(Z) / ((1.0 - kE2) * dfTan), Z});
            }
        }
    }
    std::mt19937_64 oRandom(4);
    std::normal_distribution<double> oNormal;
    for (int i = 0; i < 20000; ++i) {
        const double x = oNormal(oRandom), y = oNormal(oRandom), z = oNormal(oRandom);
        const double r = std::sqrt(x * x + y * y + z * z);
        const double h = i % 2 == 0 ? -1e4 + 5e6 * (i / 20000.0) : 4e7 * (i / 20000.0);
        const double dfScale = (kA * (1.0 - kE2 / 2 * z * z / (r * r)) + h) / r;
        voPoints.push_back({x * dfScale, y * dfScale, z * dfScale});
    }
    return voPoints;
}

TEST(Conversions, InverseWithin20nmAndOneTenthOfAMicrometreHighUp) {
    const GeographicLib::Geocentric oTruth(kA, 1.0 - std::sqrt(1.0 - kE2));
    for (const Converter& oInverse : Inverses(kA, kE2)) {
        double adfWorst[2] = {};
        double adfWorstTruth[2] = {};
        for (const Triplet& p : EarthFixedPoints()) {
            const Triplet g = oInverse.fnConvert(p.x, p.y, p.z);
            const PrecisePoint oOurs = PreciseXyz(g.x, g.y, g.z);
            const double dfError = Length(oOurs - PrecisePoint{p.x, p.y, p.z});
            double dfLatDeg, dfLonDeg, h;
            oTruth.Reverse(p.x, p.y, p.z, dfLatDeg, dfLonDeg, h);
            const double dfApart = Length(
                oOurs - PreciseXyz(dfLonDeg * kPreciseRadPerDeg, dfLatDeg * kPreciseRadPerDeg, h));
            const int nHigh = h > 5000001.0;
            adfWorst[nHigh] = std::max(adfWorst[nHigh], dfError);
            adfWorstTruth[nHigh] = std::max(adfWorstTruth[nHigh], dfApart);
            const double dfLimit = nHigh != 0 ? 1e-7 : 2e-8;
            ASSERT_TRUE(dfError <= dfLimit && dfApart <= dfLimit)
                << oInverse.sName << ' ' << p.x << ' ' << p.y << ' ' << p.z << ": " << dfError
                << ", " << dfApart << " from GeographicLib";
            ASSERT_TRUE(g.x > -kPi && g.x <= kPi && std::abs(g.y) <= kPi / 2);
        }
        for (const int nHigh : {0, 1}) {
            RecordProperty(oInverse.sName + (nHigh != 0 ? " high, nm" : " low, nm"),
                           std::to_string(adfWorst[nHigh] * 1e9) + ", beside GeographicLib " +
                               std::to_string(adfWorstTruth[nHigh] * 1e9));
        }
    }
}

TEST(Conversions, InverseOnOtherEllipsoids) {
    // A sphere, on which Newton's first guess is exact, and one flatter than Saturn.
    for (const double e2 : {0.0, 1e-12, 0.2, 0.6}) {
        for (const Converter& oInverse : Inverses(kA, e2)) {
            for (const double h : {-1e4, 0.0, 3e4, 8e5, 5e6}) {
                for (int nLat = -90; nLat <= 90; ++nLat) {
                    const PrecisePoint p = PreciseXyz(2.5L, nLat * kPreciseRadPerDeg, h, kA, e2);
                    const double X = static_cast<double>(p.x);
                    const double Y = static_cast<double>(p.y);
                    const double Z = static_cast<double>(p.z);
                    const Triplet g = oInverse.fnConvert(X, Y, Z);
                    EXPECT_LE(Length(PreciseXyz(g.x, g.y, g.z, kA, e2) - PrecisePoint{X, Y, Z}),
                              2e-8)
                        << oInverse.sName << ' ' << e2 << ' ' << h << ' ' << nLat;
                }
            }
        }
    }
}

TEST(Conversions, SpecialPoints) {
    const double b = EllipCalc().SemiMinor();
    const struct {
        Triplet p, g;
    } aoCases[] = {{{0.0, 0.0, 0.0}, {0.0, kPi / 2, -b}},
                   {{0.0, 0.0, -0.0}, {0.0, kPi / 2, -b}},
                   {{-0.0, -0.0, b + 5.0}, {0.0, kPi / 2, b + 5.0 - b}},
                   {{0.0, 0.0, -b}, {0.0, -kPi / 2, 0.0}},
                   {{1e-170, 1e-170, -b}, {kPi / 4, -kPi / 2, 0.0}},
                   {{kA, 0.0, 0.0}, {0.0, 0.0, 0.0}},
                   {{kA, -0.0, -0.0}, {0.0, 0.0, 0.0}},
                   {{-kA, 0.0, 0.0}, {kPi, 0.0, 0.0}},
                   {{-kA, -0.0, 0.0}, {kPi, 0.0, 0.0}},
                   {{-kA, -1e-300, 0.0}, {kPi, 0.0, 0.0}},
                   {{0.0, kA + 7.0, 0.0}, {kPi / 2, 0.0, 7.0}},
                   {{0.0, -1.0, 0.0}, {-kPi / 2, 0.0, 1.0 - kA}},
                   {{1.0, 0.0, kInf}, {0.0, kPi / 2, kInf}}};
    for (const Converter& oInverse : Inverses(kA, kE2)) {
        for (const auto& [p, oExpected] : aoCases) {
            SCOPED_TRACE(testing::Message()
                         << oInverse.sName << ' ' << p.x << ' ' << p.y << ' ' << p.z);
            const Triplet g = oInverse.fnConvert(p.x, p.y, p.z);
            EXPECT_DOUBLE_EQ(g.x, oExpected.x);
            if (p.z == kInf && oInverse.sName != "XYZToGeo") {
                continue;  // only the closed form has a limit there
            }
            EXPECT_DOUBLE_EQ(g.y, oExpected.y);
            EXPECT_TRUE(g.y != 0.0 || !std::signbit(g.y) || oInverse.sName == "function");
            EXPECT_DOUBLE_EQ(g.z, oExpected.z);
        }
    }
    double X = 1.0, Y = 1.0, Z = 1.0;
    GeoToXYZ(1.0, 1.0, 5.0, 0.0, kE2, X, Y, Z);
    EXPECT_TRUE(X == 0.0 && Y == 0.0 && Z == 0.0);
}

// Whatever comes in, conversions end, angles stay in their ranges, and NaN is not turned into a
// place.
TEST(Conversions, OddInputs) {
    const double adfOdd[] = {0.0,     -0.0,     kNaN, kInf,  -kInf, 1e-320, -1e-170, 1e-3,
                             30000.0, -43000.0, 6e6,  -1e20, 1e150, 1e200,  -1.7e308};
    for (const double e2 : {0.0, kE2, 0.9, 1.0, 2.0}) {
        for (const Converter& oInverse : Inverses(kA, e2)) {
            for (const double X : adfOdd) {
                for (const double Y : adfOdd) {
                    for (const double Z : adfOdd) {
                        const Triplet g = oInverse.fnConvert(X, Y, Z);
                        ASSERT_TRUE(!(g.x <= -kPi) && !(g.x > kPi) && !(std::abs(g.y) > kPi / 2))
                            << oInverse.sName << ' ' << X << ' ' << Y << ' ' << Z;
                        if (std::isnan(X) || std::isnan(Y)) {
                            ASSERT_TRUE(std::isnan(g.x)) << oInverse.sName << ' ' << X << ' ' << Y;
                        }
                        if (std::isnan(X + Y + Z) && !std::isinf(X) && !std::isinf(Y)) {
                            ASSERT_TRUE(std::isnan(g.z)) << oInverse.sName;
                        }
                    }
                }
            }
        }
        for (const Converter& oForward : Forwards(kA, e2)) {
            for (const double df : {kNaN, kInf}) {
                EXPECT_TRUE(std::isnan(oForward.fnConvert(df, 0.5, 0.0).x)) << oForward.sName;
                EXPECT_TRUE(std::isnan(oForward.fnConvert(0.5, df, 0.0).z)) << oForward.sName;
            }
        }
    }
}

}  // namespace
}  // namespace vetra::tests
