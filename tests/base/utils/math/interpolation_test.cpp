#include "vetra/base/utils/math/interpolation.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <vector>

#include "tests/support/refusal.h"

namespace {

double Lagrange(const double (&x)[4], const double (&y)[4], double dfAt) {
    double dfOut = -1.0;
    interpolate_Lagrange(x[0], x[1], x[2], x[3], y[0], y[1], y[2], y[3], dfAt, dfOut);
    return dfOut;
}

double Rate(const double (&x)[4], const double (&y)[4], double dfAt) {
    double dfOut = -1.0;
    interpolate_Lagrange_rate(x[0], x[1], x[2], x[3], y[0], y[1], y[2], y[3], dfAt, dfOut);
    return dfOut;
}

TEST(Interpolation, CubicsComeBack) {
    // p(x) = 2 x^3 - x^2 + 3 x - 5 at uneven nodes, by every form that takes them.
    const auto fnValue = [](double x) { return ((2.0 * x - 1.0) * x + 3.0) * x - 5.0; };
    const auto fnRate = [](double x) { return (6.0 * x - 2.0) * x + 3.0; };
    const double x[4] = {-1.0, 0.5, 2.0, 3.0};
    const double y[4] = {fnValue(x[0]), fnValue(x[1]), fnValue(x[2]), fnValue(x[3])};
    double adfEven[4];
    for (int i = 0; i < 4; ++i) {
        adfEven[i] = fnValue(i);
    }
    const double h = 0.5;
    for (double dfAt = -2.0; dfAt < 4.0; dfAt += 0.21) {
        const double dfExact = fnValue(dfAt);
        EXPECT_NEAR(Lagrange(x, y, dfAt), dfExact, 1e-12);
        EXPECT_NEAR(Rate(x, y, dfAt), fnRate(dfAt), 1e-12);
        double dfOut = 0.0;
        interpolate_Lagrange({x[0], x[1], x[2], x[3]}, {y[0], y[1], y[2], y[3], 99.0}, dfAt, dfOut);
        EXPECT_NEAR(dfOut, dfExact, 1e-12);
        interpolate_Lagrange(4, adfEven, 1, dfAt, &dfOut);
        EXPECT_NEAR(dfOut, dfExact, 1e-12);
        interpolate_Lagrange_rate(fnValue(-h), fnValue(0.0), fnValue(h), fnValue(2.0 * h), dfAt / h,
                                  h, dfOut);
        EXPECT_NEAR(dfOut, fnRate(dfAt), 1e-12);
    }
}

TEST(Interpolation, OnNodes) {
    const double x[4] = {0.1, 0.2, 0.7, 1.3};
    const double y[4] = {1.0 / 3.0, 0.1, -7.7, 1e9};
    for (int i = 0; i < 4; ++i) {
        EXPECT_EQ(Lagrange(x, y, x[i]), y[i]);
    }
    EXPECT_EQ(Lagrange(x, y, std::nextafter(0.2, 1.0)), 0.1);
    const double n[4] = {0.0, 1.0, 2.0, 3.0};
    const double adfCubes[4] = {0.0, 1.0, 8.0, 27.0};
    EXPECT_EQ(Rate(n, adfCubes, 1.5), 6.75);
    const double adfQuotients[4] = {1.0, 4.0, 13.0, 19.0};
    for (int i = 0; i < 4; ++i) {
        EXPECT_EQ(Rate(n, adfCubes, i), adfQuotients[i]);
    }
    double dfOut = 0.0;
    interpolate_Lagrange_rate(0.0, 1.0, 2.0, 3.0, 0.0, 1.0, dfOut);
    EXPECT_NEAR(dfOut, 1.0, 1e-15);
}

TEST(Interpolation, VectorsAndFewPoints) {
    const double adfSamples[] = {1.0, 10.0, 3.0, 20.0, 7.0, 30.0};
    double adfOut[3] = {-1.0, -1.0, -1.0};
    interpolate_Lagrange(3, adfSamples, 2, 1.5, adfOut);
    EXPECT_EQ(adfOut[0], 4.75);
    EXPECT_EQ(adfOut[1], 25.0);
    EXPECT_EQ(adfOut[2], -1.0);
    interpolate_Lagrange(1, adfSamples, 2, 123.0, adfOut);
    EXPECT_EQ(adfOut[1], 10.0);
    for (const int nPoints : {0, -1}) {
        adfOut[0] = 5.0;
        interpolate_Lagrange(nPoints, nullptr, 2, 1.0, adfOut);
        EXPECT_EQ(adfOut[0], 0.0);
    }
    interpolate_Lagrange(3, adfSamples, -1, 1.0, nullptr);

    double dfOut = 5.0;
    vetra::tests::ExpectRefusal({"vdfY", 8, "1", ">= 2", "There are fewer samples than nodes"},
                                [&] {
                                    interpolate_Lagrange({0.0, 1.0}, {2.0}, 0.5, dfOut);
                                });
    EXPECT_EQ(dfOut, 5.0);
    interpolate_Lagrange({}, {}, 0.5, dfOut);
    EXPECT_EQ(dfOut, 0.0);
    // The position may be where the result goes.
    double dfInOut = 0.25;
    interpolate_Lagrange({0.0, 1.0}, {2.0, 6.0}, dfInOut, dfInOut);
    EXPECT_EQ(dfInOut, 3.0);
    interpolate_linear(dfInOut, 5.0, 0.25, dfInOut);
    EXPECT_EQ(dfInOut, 3.5);
    interpolate_linear(2.0, 5.0, 1.0, dfOut);
    EXPECT_EQ(dfOut, 5.0);
}

}  // namespace
