#include "vetra/base/utils/geo/trigonometry.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>
#include <vector>

namespace vetra::utils::geo {
namespace {

/// How many units in the last place of the exact value lie between.
double Ulps(double df, long double dfExact) {
    const double dfRounded = std::abs(static_cast<double>(dfExact));
    const long double dfUlp = std::nextafter(dfRounded, HUGE_VAL) - dfRounded;
    return static_cast<double>(std::abs(df - dfExact) / dfUlp);
}

TEST(Trigonometry, WithinTwoUlps) {
    std::vector<double> vdfValues;
    std::mt19937_64 oRandom(5);
    for (const double dfRange : {1e-8, 0.1, 1.0, 3.2, 100.0, 1e5}) {
        std::uniform_real_distribution<double> oUniform(-dfRange, dfRange);
        for (int i = 0; i < 20000; ++i) {
            vdfValues.push_back(oUniform(oRandom));
        }
    }
    // Multiples of pi/4, where the reduction takes away nearly all digits and the quadrant changes.
    for (int n = -2000; n <= 2000; ++n) {
        const double df = n * 0.7853981633974483;
        vdfValues.insert(vdfValues.end(), {df, std::nextafter(df, 1e9), std::nextafter(df, -1e9)});
    }
    double dfWorst = 0.0;
    double dfWorstSum = 0.0;
    double dfWorstAngle = 0.0;
    for (std::size_t i = 0; i < vdfValues.size(); ++i) {
        const double x = vdfValues[i];
        const double y = vdfValues[(i * 7919 + 13) % vdfValues.size()];
        const SinCosPair o = SinCos(x, y);
        for (const int n : {0, 1}) {
            const long double dfAngle = n == 0 ? x : y;
            const long double s = std::sin(dfAngle);
            const long double c = std::cos(dfAngle);
            dfWorst = std::max({dfWorst, Ulps(o.s[n], s), Ulps(o.c[n], c)});
            dfWorstSum = std::max(
                {dfWorstSum,
                 static_cast<double>(std::abs(s - o.s[n] - static_cast<long double>(o.sRest[n]))),
                 static_cast<double>(std::abs(c - o.c[n] - static_cast<long double>(o.cRest[n])))});
        }
        dfWorstAngle =
            std::max(dfWorstAngle, Ulps(Atan2(y, x), std::atan2(static_cast<long double>(y),
                                                                static_cast<long double>(x))));
    }
    EXPECT_LT(dfWorst, 1.0);
    EXPECT_LT(dfWorstSum, 5e-17);  // of sums with their rests
    EXPECT_LT(dfWorstAngle, 2.0);
    RecordProperty("sine and cosine, ulps", std::to_string(dfWorst));
    RecordProperty("sine and cosine with their rests", std::to_string(dfWorstSum * 1e17));
    RecordProperty("angle, ulps", std::to_string(dfWorstAngle));
}

// Signs of zero, quadrants, infinities, NaN and sizes at which squares overflow.
TEST(Trigonometry, OddInputs) {
    const double kInf = HUGE_VAL;
    const double kNaN = std::numeric_limits<double>::quiet_NaN();
    const double adfOdd[] = {0.0,  -0.0,   1.0,   -1.0,  1e-320,  -1e-320, 1e-291, 1e291,
                             kInf, -1e300, -kInf, 1e200, -1e-200, 2e5,     1e22,   kNaN};
    for (const double x : adfOdd) {
        for (const double y : adfOdd) {
            const double dfExpected = std::atan2(y, x);
            const double df = Atan2(y, x);
            EXPECT_TRUE(std::isnan(df) ? std::isnan(dfExpected)
                                       : std::abs(df - dfExpected) <= 1e-15 &&
                                             std::signbit(df) == std::signbit(dfExpected))
                << y << ' ' << x << ": " << df;
        }
        const SinCosPair o = SinCos(1.0, x);
        EXPECT_NEAR(o.s[0], std::sin(1.0), 2e-16) << x;
        EXPECT_TRUE(std::isfinite(x) ? std::abs(o.s[1] - std::sin(x)) < 2e-16 &&
                                           std::abs(o.c[1] - std::cos(x)) < 2e-16
                                     : std::isnan(o.s[1]) && std::isnan(o.c[1]))
            << x;
    }
}

}  // namespace
}  // namespace vetra::utils::geo
