#include "vetra/base/utils/geo/ellipcalc.h"

#include <gtest/gtest.h>

#include <cmath>
#include <GeographicLib/LocalCartesian.hpp>
#include <type_traits>

#include "tests/base/utils/geo/precise.h"
#include "tests/support/refusal.h"
#include "vetra/base/utils/geo/geodesy.h"

namespace vetra::tests {
namespace {

TEST(EllipCalc, PublishedConstants) {
    // NIMA TR8350.2, "Department of Defense World Geodetic System 1984", tables 3.1 and 3.3.
    const EllipCalc o;
    EXPECT_EQ(o.SemiMajor(), 6378137.0);
    EXPECT_EQ(o.EccSq(), 0.00669437999014);
    EXPECT_NEAR(o.SemiMinor(), 6356752.3142, 5e-5);
    EXPECT_NEAR(o.Ecc(), 8.1819190842622e-2, 1e-14);
    EXPECT_NEAR(o.SecondEcc(), 8.2094437949696e-2, 1e-14);
    EXPECT_NEAR(o.InvFlattening(), 298.257223563, 5e-9);
    EXPECT_NEAR(o.Flattening(), 0.00335281066474, 2e-14);
    EXPECT_NEAR(EllipCalc::EccSq(o.SemiMajor(), o.SemiMinor()), o.EccSq(), 1e-16);
    EXPECT_NEAR(o.PrimeVerticalRadius(M_PI / 2), 6399593.6258, 5e-5);  // at a pole both radii are c
    EXPECT_NEAR(o.MeridianRadius(-M_PI / 2), 6399593.6258, 5e-5);
    EXPECT_EQ(o.PrimeVerticalRadius(0.0), 6378137.0);
    EXPECT_NEAR(o.MeridianRadius(0.0), 6378137.0 * (1.0 - 0.00669437999014), 1e-8);
    EXPECT_EQ(o.PrimeVerticalRadius(0.6, 0.8), o.PrimeVerticalRadius(-0.6, 0.8));
    // At 45 degrees sin^2 is a half.
    EXPECT_NEAR(o.PrimeVerticalRadius(M_PI / 4), 6378137.0 / std::sqrt(1.0 - kE2 / 2), 1e-8);
    EXPECT_NEAR(o.MeridianRadius(M_PI / 4), 6378137.0 * (1 - kE2) / std::pow(1 - kE2 / 2, 1.5),
                1e-8);
    static_assert(std::is_same_v<decltype(o.SemiMajor()), const double&>);
    static_assert(std::is_same_v<decltype(o.EccSq()), const double&>);

    const EllipCalc oSphere(1000.0, 0.0);
    EXPECT_EQ(oSphere.MeridianRadius(0.7), 1000.0);
    EXPECT_NEAR(oSphere.PrimeVerticalRadius(0.7), 1000.0, 1e-12);
    EXPECT_EQ(oSphere.InvFlattening(), HUGE_VAL);
    EXPECT_TRUE(oSphere.Flattening() == 0.0 && oSphere.SecondEcc() == 0.0);
    EXPECT_EQ(EllipCalc::EccSq(0.0, 5.0), 0.0);
}

TEST(EllipCalc, Refusals) {
    EllipCalc o(7e6, 0.01);
    const EllipCalc oBefore(o);
    const Refusal oNotPositive = {"dfSemiMajor", 1, "0.000000", "> 0.0",
                                  "Semi-major axis length must be a positive number"};
    ExpectRefusal(oNotPositive, [&] { o.SetEllipsoid(0.0, -1.0); });
    ExpectRefusal(oNotPositive, [] { EllipCalc(0.0, 0.0); });
    ExpectRefusal({"dfEccSq", 1, "-0.100000", ">= 0.0",
                   "Eccentricity squared must be zero or a positive number"},
                  [&] { o.SetEllipsoid(1.0, -0.1); });
    EXPECT_TRUE(o == oBefore && o.SemiMinor() == oBefore.SemiMinor());
    o.SetEllipsoid(1.0, 0.0);
    EXPECT_EQ(o.SemiMinor(), 1.0);
}

TEST(EllipCalc, StateAndEquality) {
    EllipCalc o;
    EXPECT_EQ(o.GetHgtTol(), 0.0001);
    double dfLon, dfLat, dfHgt, e, n, u;
    o.GetLsrOrigin(dfLon, dfLat, dfHgt);
    EXPECT_TRUE(dfLon == 0.0 && dfLat == 0.0 && dfHgt == 0.0);

    o.SetHgtTol(0.5);
    o.SetLsrOrigin(1.0, -0.5, 30.0);
    o.GetLsrOrigin(dfLon, dfLat, dfHgt);
    EXPECT_TRUE(dfLon == 1.0 && dfLat == -0.5 && dfHgt == 30.0);
    // The frame stays where the earlier ellipsoid had it, also in copies.
    o.SetEllipsoid(6377397.0, 0.0066743722);
    double X, Y, Z;
    EllipCalc().GeoToXYZ(1.0, -0.5, 30.0, X, Y, Z);
    EllipCalc oCopy;
    EXPECT_NE(oCopy, o);
    oCopy = o;
    for (const EllipCalc& oAny : {o, EllipCalc(o), oCopy}) {
        oAny.EcfToLsr(X, Y, Z, e, n, u);
        EXPECT_TRUE(e == 0.0 && n == 0.0 && u == 0.0);
        oAny.GetLsrOrigin(dfLon, dfLat, dfHgt);
        EXPECT_TRUE(oAny == o && oAny.GetHgtTol() == 0.5 && dfHgt == 30.0);
    }
    o.SetLsrOrigin(1.0, -0.5, 30.0);
    EXPECT_NE(o, oCopy);

    const EllipCalc oPlain;
    EllipCalc oNear;
    oNear.SetLsrOrigin(0.0, 0.0, 1e-7);
    EXPECT_TRUE(oPlain == oNear);
    oNear.SetLsrOrigin(0.0, 0.0, 3e-6);
    EXPECT_TRUE(oPlain != oNear);
    EXPECT_NE(EllipCalc(kA, kE2), EllipCalc(kA + 1e-7, kE2));
    EXPECT_NE(EllipCalc(kA, kE2), EllipCalc(kA, kE2 + 1e-15));
    oNear = oPlain;
    oNear.SetHgtTol(0.0001 + 1e-15);
    EXPECT_NE(oPlain, oNear);
    EllipCalc oNaN;
    oNaN.SetHgtTol(NAN);
    const EllipCalc& oSame = oNaN;
    EXPECT_TRUE(oNaN == oSame);
    EXPECT_FALSE(oNaN == EllipCalc(oNaN));
}

TEST(EllipCalc, LocalFrames) {
    const double adfOrigins[][3] = {{0.3, 0.8, 120.0}, {-2.0, -1.2, -50.0}, {3.1, 0.0, 9000.0}};
    const double adfPlaces[][3] = {{0.31, 0.79, 800.0}, {3.0, 0.1, 7e5}, {-1.0, -1.5, 3.0}};
    for (const auto& O : adfOrigins) {
        EllipCalc oCalc;
        oCalc.SetLsrOrigin(O[0], O[1], O[2]);
        const GeographicLib::LocalCartesian oTruth(
            O[1] * (180.0 / M_PI), O[0] * (180.0 / M_PI), O[2],
            GeographicLib::Geocentric(kA, 1.0 - std::sqrt(1.0 - kE2)));
        for (const auto& P : adfPlaces) {
            double x, y, z, e, n, u, g[3], f[3], l[3];
            oTruth.Forward(P[1] * (180.0 / M_PI), P[0] * (180.0 / M_PI), P[2], x, y, z);
            oCalc.GeoToLsr(P[0], P[1], P[2], e, n, u);
            EXPECT_LE(Length(PrecisePoint{e, n, u} - PrecisePoint{x, y, z}), 2e-8);
            // Another origin than the object's own, and the functions.
            EllipCalc().GeoToLsr(P[0], P[1], P[2], O[0], O[1], O[2], l[0], l[1], l[2]);
            EXPECT_TRUE(l[0] == e && l[1] == n && l[2] == u);
            GeoToLSR(P, O, kA, kE2, l);
            EXPECT_LE(Length(PrecisePoint{e, n, u} - PrecisePoint{l[0], l[1], l[2]}), 1e-8);
            const PrecisePoint oPlace = PreciseXyz(P[0], P[1], P[2]);
            oCalc.LsrToGeo(e, n, u, g[0], g[1], g[2]);
            EXPECT_LE(Length(PreciseXyz(g[0], g[1], g[2]) - oPlace), 2e-8);
            EllipCalc().LsrToGeo(e, n, u, O[0], O[1], O[2], f[0], f[1], f[2]);
            EXPECT_TRUE(f[0] == g[0] && f[1] == g[1] && f[2] == g[2]);
            LSRToGeo(l, O, kA, kE2, l);  // in place
            EXPECT_LE(Length(PreciseXyz(l[0], l[1], l[2]) - oPlace), 2e-8);
        }
        double e, n, u;
        oCalc.GeoToLsr(O[0], O[1], O[2], e, n, u);
        EXPECT_TRUE(e == 0.0 && n == 0.0 && u == 0.0);
    }
    // Directions alone, in place: X is up, Y east and Z north where the axes meet the equator.
    double v[3] = {7.0, 2.0, 3.0};
    XYZToLSR(v, 0.0, 0.0, v);
    EXPECT_TRUE(v[0] == 2.0 && v[1] == 3.0 && v[2] == 7.0);
    XYZToLSR(v, 1.0, -0.7, v);
    EXPECT_GT(std::abs(v[0] - 2.0), 1.0);
    LSRToXYZ(v, 1.0, -0.7, v);
    EXPECT_NEAR(v[0], 2.0, 1e-15);
    EXPECT_NEAR(v[1], 3.0, 1e-15);
    EXPECT_NEAR(v[2], 7.0, 2e-15);
}

TEST(GetAzimuth, AllDirections) {
    for (int n = -179; n <= 180; ++n) {
        const double a = n * M_PI / 180.0;
        EXPECT_NEAR(GetAzimuth(5.0, 6.0, 5.0 + std::sin(a), 6.0 + std::cos(a)),
                    n == 180 ? 180.0 : n, 1e-12);
    }
    EXPECT_EQ(GetAzimuth(0.0, 0.0, 1.0, 0.0), 90.0);
    EXPECT_EQ(GetAzimuth(0.0, 0.0, 0.0, -1.0), 180.0);
    EXPECT_EQ(GetAzimuth(0.0, 0.0, -0.0, -1.0), 180.0);
    EXPECT_EQ(GetAzimuth(3.0, 4.0, 3.0, 4.0), 0.0);
    // Just west of south, where the angle rounds to -180 degrees.
    for (const double dfEast : {-1e-300, -1e-20, -1e-16, -4e-16}) {
        const double dfAzimuth = GetAzimuth(0.0, 0.0, dfEast, -1.0);
        EXPECT_TRUE(dfAzimuth > -180.0 && std::abs(std::abs(dfAzimuth) - 180.0) < 1e-13) << dfEast;
    }
    EXPECT_TRUE(std::isnan(GetAzimuth(0.0, 0.0, 0.0, NAN)));
    EXPECT_TRUE(std::isnan(GetAzimuth(0.0, NAN, 1.0, 0.0)));
}

}  // namespace
}  // namespace vetra::tests
