#include <gtest/gtest.h>

#include <cmath>
#include <new>
#include <tuple>

#include "tests/support/refusal.h"
#include "vetra/vetra.h"

namespace vetra::utils {
namespace {

using tests::ExpectRefusal;

constexpr double kPi = 3.141592653589793;

struct Tables {
    Tables(int nWndNumCols, int nWndNumRows, double dfFc, int nNumPhases) {
        GetCplxSarCoeffs(nWndNumCols, nWndNumRows, dfFc, nNumPhases, padfAcross, padfReal,
                         padfImag);
    }
    Tables(const Tables&) = delete;
    ~Tables() {
        delete[] padfAcross;
        delete[] padfReal;
        delete[] padfImag;
    }
    double* padfAcross = nullptr;
    double* padfReal = nullptr;
    double* padfImag = nullptr;
};

// The weight of a pixel at distance t, not yet normalised.
double Weight(double t, int nHalf) {
    const double u = kPi * t;
    return (0.5 * std::cos(u / (nHalf + 1)) + 0.5) * (u == 0.0 ? 1.0 : std::sin(u) / u);
}

// Every element, by the formula and in its order of operations.
TEST(CplxSarCoeffs, Formula) {
    for (const auto& [nCols, nRows, dfFc, nPhases] :
         {std::tuple(7, 15, 0.1, 64), {31, 1, -0.5, 64}, {5, 33, 0.0, 3}, {1, 9, 0.5, 1}}) {
        SCOPED_TRACE(testing::Message() << nCols << " x " << nRows);
        const Tables oTables(nCols, nRows, dfFc, nPhases);
        for (int p = 0; p < nPhases; ++p) {
            const double f = p * (1.0 / nPhases) - 0.5;
            for (const int nTaps : {nCols, nRows}) {
                const int nHalf = (nTaps - 1) / 2;
                double dfSum = 0.0;
                double t = -f - nHalf;
                for (int j = 0; j < nTaps; ++j, t += 1.0) {
                    dfSum += Weight(t, nHalf);
                }
                t = -f - nHalf;
                double dfTotal = 0.0;
                for (int j = 0; j < nTaps; ++j, t += 1.0) {
                    const double g = Weight(t, nHalf);
                    const double a = (nHalf + t) * (dfFc * -2.0 * kPi);
                    EXPECT_NEAR(a, -2.0 * kPi * dfFc * (j - f), 1e-13);
                    const int i = p * nTaps + j;
                    if (nTaps == nCols) {
                        ASSERT_EQ(oTables.padfAcross[i], g / dfSum) << p << ' ' << j;
                        dfTotal += oTables.padfAcross[i];
                    }
                    if (nTaps == nRows) {
                        ASSERT_EQ(oTables.padfReal[i], g * std::cos(a) / dfSum) << p << ' ' << j;
                        ASSERT_EQ(oTables.padfImag[i], g * std::sin(a) / dfSum) << p << ' ' << j;
                    }
                }
                EXPECT_NEAR(nTaps == nCols ? dfTotal : 1.0, 1.0, 1e-15);
            }
        }
    }
}

TEST(CplxSarCoeffs, TellingFigures) {
    // One tap is 1 turned by the carrier; no carrier, no imaginary part, and the same taps down.
    const Tables oOne(1, 1, 0.25, 64);
    const Tables oPlain(5, 5, 0.0, 64);
    for (int p = 0; p < 64; ++p) {
        const double dfAngle = 2.0 * kPi * 0.25 * (p / 64.0 - 0.5);
        EXPECT_EQ(oOne.padfAcross[p], 1.0);
        EXPECT_NEAR(oOne.padfReal[p], std::cos(dfAngle), 1e-15);
        EXPECT_NEAR(oOne.padfImag[p], std::sin(dfAngle), 1e-15);
        for (int i = 5 * p; i < 5 * p + 5; ++i) {
            EXPECT_EQ(oPlain.padfImag[i], 0.0);
            EXPECT_EQ(oPlain.padfReal[i], oPlain.padfAcross[i]);
        }
    }
    // At a whole pixel only the centre tap stands; the carrier counts from the first row.
    const Tables oCarrier(7, 7, 0.1, 64);
    for (int j = 0; j < 7; ++j) {
        const double dfCentre = j == 3 ? 1.0 : 0.0;
        EXPECT_NEAR(oCarrier.padfAcross[32 * 7 + j], dfCentre, 1e-15);
        EXPECT_NEAR(oCarrier.padfReal[32 * 7 + j], dfCentre * std::cos(2.0 * kPi * 0.1 * 3), 1e-15);
        EXPECT_NEAR(oCarrier.padfImag[32 * 7 + j], -dfCentre * std::sin(2.0 * kPi * 0.1 * 3),
                    1e-15);
    }
}

TEST(CplxSarCoeffs, Refusals) {
    double adfOld[3];
    double *padfAcross = adfOld, *padfReal = adfOld + 1, *padfImag = adfOld + 2;
    const auto fnCall = [&](int nCols, int nRows, double dfFc, int nPhases) {
        return [=, &padfAcross, &padfReal, &padfImag] {
            GetCplxSarCoeffs(nCols, nRows, dfFc, nPhases, padfAcross, padfReal, padfImag);
        };
    };
    for (const int nSize : {0, -1, 4, -2147483647 - 1}) {
        const std::string sSize = std::to_string(nSize);
        ExpectRefusal({"nWndNumCols", 1, sSize, "Positive odd number",
                       "The given window width (" + sSize + ") must be a positive odd number"},
                      fnCall(nSize, nSize, 7.0, 0));
        ExpectRefusal({"nWndNumRows", 1, sSize, "Positive odd number",
                       "The given window height (" + sSize + ") must be a positive odd number"},
                      fnCall(3, nSize, 7.0, 0));
    }
    for (const double dfFc : {-0.6, 0.51, HUGE_VAL, std::nan("")}) {
        const std::string sFc = FormatString("%f", dfFc);
        ExpectRefusal(
            {"dfFc", 1, sFc, "[-0.5, 0.5]",
             "The given central frequency (" + sFc + ") must fall in the range [-0.5, 0.5]"},
            fnCall(3, 3, dfFc, 0));
    }
    for (const int nPhases : {0, -64}) {
        const std::string sPhases = std::to_string(nPhases);
        ExpectRefusal({"nNumPhases", 1, sPhases, "Positive number",
                       "The given number of phases (" + sPhases + ") must be a positive number"},
                      fnCall(3, 3, 0.5, nPhases));
    }
    // 2^62 taps, whose bytes don't fit 64 bits.
    constexpr int kMost = 2147483647;
    EXPECT_THROW(fnCall(kMost, 1, 0.0, kMost)(), std::bad_alloc);
    EXPECT_TRUE(padfAcross == adfOld && padfReal == adfOld + 1 && padfImag == adfOld + 2);
}

}  // namespace
}  // namespace vetra::utils
