#include "vetra/base/utils/geo/solarposition.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>
#include <utility>

namespace vetra::utils {
namespace {

constexpr double kDeg = 3.141592653589793 / 180.0;

struct Time {
    int nYear, nMonth, nDay;
    double dfHour;
};

/// Zenith and azimuth.
std::pair<float, float> Direction(const Time& o, float fLat, float fLon) {
    const int nHour = static_cast<int>(o.dfHour);
    const double dfMinutes = (o.dfHour - nHour) * 60.0;
    const int nMinute = static_cast<int>(dfMinutes);
    float fZenith = -1.0f, fAzimuth = -1.0f;
    SolarZenithAzimuth(o.nYear, o.nMonth, o.nDay, nHour, nMinute, (dfMinutes - nMinute) * 60.0,
                       fLat, fLon, fZenith, fAzimuth);
    return {fZenith, fAzimuth};
}

/// Days since 2000 January 1, 12h.
double DaysSince2000(const Time& o) {
    const int y = o.nMonth <= 2 ? o.nYear - 1 : o.nYear;
    const int m = o.nMonth <= 2 ? o.nMonth + 12 : o.nMonth;
    return std::floor(365.25 * y) + std::floor(30.6001 * (m + 1)) + o.nDay - y / 100 + y / 400 +
           o.dfHour / 24.0 - 730548.5;
}

struct Sun {
    double dfLongitude, dfRightAscension, dfDeclination;
};

/// Apparent place in radians, to 0.01 degrees: Meeus, "Astronomical Algorithms", 2nd edition,
/// chapter 25.
Sun ApparentSun(double dfDays) {
    const double T = dfDays / 36525.0;
    const double M = (357.52911 + 35999.05029 * T - 0.0001537 * T * T) * kDeg;
    const double C = (1.914602 - 0.004817 * T) * std::sin(M) +
                     (0.019993 - 0.000101 * T) * std::sin(2 * M) + 0.000289 * std::sin(3 * M);
    const double W = (125.04 - 1934.136 * T) * kDeg;
    const double L =
        (280.46646 + 36000.76983 * T + 0.0003032 * T * T + C - 0.00569 - 0.00478 * std::sin(W)) *
        kDeg;
    const double e = (23.4392911 - 0.0130042 * T + 0.00256 * std::cos(W)) * kDeg;
    return {L, std::atan2(std::cos(e) * std::sin(L), std::cos(L)),
            std::asin(std::sin(e) * std::sin(L))};
}

/// Degrees between our sun and the apparent one.
double Apart(const Time& o, float fLat, float fLon) {
    const double d = DaysSince2000(o);
    const Sun oSun = ApparentSun(d);
    // Greenwich mean sidereal time: chapter 12.
    const double H = (280.46061837 + 360.98564736629 * d + fLon) * kDeg - oSun.dfRightAscension;
    const double P = fLat * kDeg;
    const double c = std::cos(oSun.dfDeclination);
    const double s = std::sin(oSun.dfDeclination);
    const double adfTruth[3] = {-c * std::sin(H), s * std::cos(P) - c * std::cos(H) * std::sin(P),
                                s * std::sin(P) + c * std::cos(H) * std::cos(P)};
    const auto [fZenith, fAzimuth] = Direction(o, fLat, fLon);
    const double z = fZenith * kDeg;
    const double a = fAzimuth * kDeg;
    const double adfOurs[3] = {std::sin(z) * std::sin(a), std::sin(z) * std::cos(a), std::cos(z)};
    double dfSq = 0.0;
    for (int i = 0; i < 3; ++i) {
        dfSq += (adfTruth[i] - adfOurs[i]) * (adfTruth[i] - adfOurs[i]);
    }
    return 2.0 * std::asin(std::sqrt(dfSq) / 2.0) / kDeg;
}

TEST(SolarPosition, AgreesWithAnEphemeris) {
    // The yardstick: example 25.a of the source, and equinoxes and solstices that the US Naval
    // Observatory publishes ("Earth's seasons").
    const Sun oExample = ApparentSun(DaysSince2000({1992, 10, 13, 0.0}));
    EXPECT_NEAR(oExample.dfRightAscension / kDeg + 360.0, 198.38083, 2e-4);
    EXPECT_NEAR(oExample.dfDeclination / kDeg, -7.78507, 2e-4);
    const Time aoQuarters[] = {{2000, 3, 20, 7.58},   {2000, 6, 21, 1.80},   {2000, 9, 22, 17.45},
                               {2000, 12, 21, 13.62}, {2010, 3, 20, 17.53},  {2010, 6, 21, 11.47},
                               {2010, 9, 23, 3.15},   {2010, 12, 21, 23.63}, {2020, 3, 20, 3.83},
                               {2020, 6, 20, 21.73},  {2020, 9, 22, 13.52},  {2020, 12, 21, 10.03}};
    for (int i = 0; i < 12; ++i) {
        const double dfLongitude = ApparentSun(DaysSince2000(aoQuarters[i])).dfLongitude / kDeg;
        EXPECT_NEAR(std::remainder(dfLongitude - 90.0 * (i % 4), 360.0), 0.0, 0.012) << i;
        EXPECT_LE(Apart(aoQuarters[i], 10.0f, 20.0f), 0.5) << i;
    }

    // The series know the day only, and years of 365 days: for some hours about the equinoxes they
    // are off by a little more than half a degree.
    std::mt19937_64 oRandom(8);
    std::uniform_real_distribution<double> oUnit(0.0, 1.0);
    int nFar = 0;
    const int kTimes = 50000;
    for (int i = 0; i < kTimes; ++i) {
        const Time o = {1950 + static_cast<int>(101 * oUnit(oRandom)),
                        1 + static_cast<int>(12 * oUnit(oRandom)),
                        1 + static_cast<int>(28 * oUnit(oRandom)), 24.0 * oUnit(oRandom)};
        const float fLat = static_cast<float>(180.0 * oUnit(oRandom) - 90.0);
        const float fLon = static_cast<float>(360.0 * oUnit(oRandom) - 180.0);
        const double dfApart = Apart(o, fLat, fLon);
        ASSERT_LE(dfApart, 0.63) << o.nYear << '-' << o.nMonth << '-' << o.nDay << ' ' << o.dfHour;
        nFar += dfApart > 0.5;
    }
    EXPECT_LT(nFar, kTimes / 200);
}

TEST(SolarPosition, DayOfTheYear) {
    const auto fnOn = [](int nYear, int nMonth, int nDay) {
        return Direction({nYear, nMonth, nDay, 8.25}, 50.0f, 3.0f);
    };
    const int anDays[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    for (int m = 1; m < 12; ++m) {
        const int nLeapDay = m == 2 ? 1 : 0;
        EXPECT_EQ(fnOn(2015, m, anDays[m - 1] + 1), fnOn(2015, m + 1, 1)) << m;
        EXPECT_EQ(fnOn(2016, m, anDays[m - 1] + nLeapDay + 1), fnOn(2016, m + 1, 1)) << m;
        EXPECT_NE(fnOn(2015, m, anDays[m - 1]), fnOn(2015, m + 1, 1)) << m;
    }
    EXPECT_EQ(fnOn(2016, 2, 29), fnOn(2015, 3, 1));
    EXPECT_EQ(fnOn(2016, 3, 1), fnOn(2015, 3, 2));
    EXPECT_EQ(fnOn(2000, 3, 1), fnOn(2016, 3, 1));
    EXPECT_EQ(fnOn(1900, 3, 1), fnOn(2015, 3, 1));
    // Day 366 is day 1 again, and day 1 is not day 0.
    EXPECT_NEAR(fnOn(2016, 12, 31).first, fnOn(2017, 1, 1).first, 1e-5);
    EXPECT_NE(fnOn(2015, 12, 31), fnOn(2017, 1, 1));
}

TEST(SolarPosition, Quadrants) {
    // The hours after the true noon of a longitude on 2001 June 21, with the equation of time.
    const float fLon = static_cast<float>(1.8 / 4.0);
    for (const float fLat : {60.0f, 40.0f, -10.0f, -50.0f}) {
        const bool bSouth = fLat > 30.0f;  // where the noon sun stands
        for (int nHour = -11; nHour <= 11; ++nHour) {
            const auto [fZenith, fAzimuth] = Direction({2001, 6, 21, 12.0 + nHour}, fLat, fLon);
            SCOPED_TRACE(testing::Message() << fLat << ' ' << nHour << ": " << fAzimuth);
            EXPECT_TRUE(fAzimuth > 0.0f && fAzimuth <= 360.0f);
            if (nHour != 0) {
                EXPECT_EQ(fAzimuth < 180.0f, nHour < 0);
                // 15 degrees east are an hour.
                const auto oEast = Direction({2001, 6, 21, 12.0 + nHour - 1}, fLat, fLon + 15.0f);
                EXPECT_NEAR(oEast.first, fZenith, 1e-4);
                EXPECT_NEAR(oEast.second, fAzimuth, 1e-4);
            } else if (bSouth) {
                EXPECT_NEAR(fAzimuth, 180.0, 0.5);
            } else {
                EXPECT_NEAR(std::remainder(fAzimuth, 360.0), 0.0, 0.5);
            }
        }
    }
}

// Where a sine comes out at 1, or beyond it by rounding, and north at 360: halving intervals of
// time ends there.
TEST(SolarPosition, ExactDirections) {
    for (int nDay = 0; nDay < 12 * 28; ++nDay) {
        const auto fnAt = [&](float fLat, double dfSecond) {
            float z = -1.0f, a = -1.0f;
            SolarZenithAzimuth(2003, 1 + nDay / 28, 1 + nDay % 28, 12, 0, dfSecond, fLat, 0.0f, z,
                               a);
            EXPECT_TRUE(z >= 0.0f && z <= 180.0f && a > 0.0f && a <= 360.0f) << z << ' ' << a;
            return std::pair(z, a);
        };
        const auto fnWhen = [&](float fLat, double dfFrom, double dfTo, float fLimit) {
            for (int i = 0; i < 60; ++i) {
                const double dfMiddle = (dfFrom + dfTo) / 2.0;
                (fnAt(fLat, dfMiddle).second < fLimit ? dfFrom : dfTo) = dfMiddle;
            }
            return dfTo;
        };
        const double dfNoon = fnWhen(-60.0f, -3600.0, 3600.0, 180.0f);
        EXPECT_EQ(fnAt(-60.0f, dfNoon).second, 360.0f);
        EXPECT_EQ(fnAt(60.0f, dfNoon).second, 180.0f);
        float fOverhead = 60.0f - fnAt(60.0f, dfNoon).first;
        for (int i = 0; i < 8; ++i) {
            fOverhead = std::nextafter(fOverhead, i < 3 ? -90.0f : 90.0f);
            EXPECT_LT(fnAt(fOverhead, dfNoon).first, 1e-3f);
        }
        const double dfEast = fnWhen(60.0f, -43200.0, dfNoon, 90.0f);
        EXPECT_NEAR(fnAt(60.0f, dfEast).second, 90.0, 1e-4) << nDay;
    }
}

TEST(SolarPosition, OddInputs) {
    // Poles, the sun overhead or nearly so, and where the horizon cuts: an angle in any case.
    for (const float fLat : {-90.0f, -23.0f, 0.0f, 23.434f, 90.0f}) {
        for (int i = 0; i < 20000; ++i) {
            const auto [fZenith, fAzimuth] =
                Direction({2001, 1 + i % 12, 21, 0.0012 * i}, fLat, 0.001f * static_cast<float>(i));
            ASSERT_TRUE(fZenith >= 0.0f && fZenith <= 180.0f);
            ASSERT_TRUE(fAzimuth > 0.0f && fAzimuth <= 360.0f) << fLat << ' ' << i;
        }
    }
    const int kMax = std::numeric_limits<int>::max();
    const int kMin = std::numeric_limits<int>::min();
    float fZenith = 0.0f, fAzimuth = 0.0f;
    SolarZenithAzimuth(kMin, kMax, kMax, kMax, kMax, 1e300, 10.0f, 10.0f, fZenith, fAzimuth);
    SolarZenithAzimuth(kMax, kMin, kMin, kMin, kMin, -1e9, 10.0f, 10.0f, fZenith, fAzimuth);
    EXPECT_TRUE(fZenith >= 0.0f && fZenith <= 180.0f);
    SolarZenithAzimuth(2001, 1, 1, 0, 0, 0.0, NAN, 10.0f, fZenith, fAzimuth);
    EXPECT_TRUE(std::isnan(fZenith) && std::isnan(fAzimuth));
}

}  // namespace
}  // namespace vetra::utils
