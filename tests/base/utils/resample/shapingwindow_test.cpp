#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <limits>
#include <vector>

#include "tests/support/refusal.h"
#include "vetra/vetra.h"

namespace vetra::utils {
namespace {

using tests::ExpectRefusal;

constexpr double kPi = 3.141592653589793;
constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

ShapingWindow Make(void (ShapingWindow::*pfnSet)()) {
    ShapingWindow oWindow;
    (oWindow.*pfnSet)();
    return oWindow;
}

ShapingWindow Kaiser(double dfBeta) {
    ShapingWindow oWindow;
    oWindow.SetKaiser(dfBeta);
    return oWindow;
}

ShapingWindow Gaussian(double dfSigma) {
    ShapingWindow oWindow;
    oWindow.SetGaussian(dfSigma);
    return oWindow;
}

struct Case {
    const char* pszName;
    ShapingWindow oWindow;
    double dfEdge;                          // at the edges and outside
    std::function<double(double)> fnValue;  // by u / H
};

std::vector<Case> AllWindows() {
    const auto fnI0 = [](double x) { return std::cyl_bessel_i(0.0, x); };
    const auto fnSquare = [](double r) { return r * r; };
    return {
        {"NONE", ShapingWindow(), 1.0, [](double) { return 1.0; }},
        {"NONE", Make(&ShapingWindow::SetNone), 1.0, [](double) { return 1.0; }},
        {"PARABOLA", Make(&ShapingWindow::SetParabola), 0.0,
         [=](double r) { return 1.0 - fnSquare(r); }},
        {"KAISER", Kaiser(9.42), 0.0,
         [=](double r) { return fnI0(9.42 * std::sqrt(1.0 - r * r)) / fnI0(9.42); }},
        {"KAISER", Kaiser(-25.0), 0.0,
         [=](double r) { return fnI0(25.0 * std::sqrt(1.0 - r * r)) / fnI0(25.0); }},
        {"KAISER", Kaiser(0.0), 0.0, [](double) { return 1.0; }},
        {"HANN", Make(&ShapingWindow::SetHann), 0.0,
         [=](double r) { return fnSquare(std::cos(0.5 * kPi * r)); }},
        {"HAMMING", Make(&ShapingWindow::SetHamming), 0.08,
         [](double r) { return 0.54 + 0.46 * std::cos(kPi * r); }},
        {"LANCZOS", Make(&ShapingWindow::SetLanczos), 0.0,
         [](double r) { return r == 0.0 ? 1.0 : std::sin(kPi * r) / (kPi * r); }},
        {"GAUSSIAN", Gaussian(1.0), 0.0, [=](double r) { return std::exp(-0.5 * fnSquare(r)); }},
        {"GAUSSIAN", Gaussian(-0.25), 0.0, [=](double r) { return std::exp(-8 * fnSquare(r)); }},
    };
}

TEST(ShapingWindow, Values) {
    for (const auto& [pszName, oWindow, dfEdge, fnValue] : AllWindows()) {
        SCOPED_TRACE(pszName);
        for (const double H : {1.0, 4.0, 7.5}) {
            for (const double r : {-0.999, -0.5, 0.0, 1e-9, 0.125, 2.0 / 3.0, 0.999}) {
                EXPECT_NEAR(oWindow.GetValue(r * H, H), fnValue(r), 1e-14) << r << ' ' << H;
            }
            for (const double u : {-1e300, -H, H, 2.0 * H, HUGE_VAL}) {
                EXPECT_NEAR(oWindow.GetValue(u, H), dfEdge, 1e-15) << u << ' ' << H;
            }
        }
    }
}

TEST(ShapingWindow, Coefficients) {
    for (const auto& [pszName, oWindow, dfEdge, fnValue] : AllWindows()) {
        SCOPED_TRACE(pszName);
        ResampleInfo oInfo;
        oInfo.moCoefficients = {{"Beta", "x"}, {"SIGMA", "y"}, {"OTHER", "z"}};
        CoefficientMap oExpected = oInfo.moCoefficients;
        oWindow.ToCoefficients(oInfo.moCoefficients);
        oExpected["SHAPINGWINDOW"] = pszName;
        if (oWindow.GetType() == eSWT_KAISER) {
            oExpected["Beta"] = FormatString("%.6f", oWindow.GetBeta());
        } else if (oWindow.GetType() == eSWT_GAUSSIAN) {
            oExpected["SIGMA"] = FormatString("%.6f", oWindow.GetSigma());
        }
        EXPECT_EQ(oInfo.moCoefficients, oExpected);
        // The other window's number isn't read, whatever it is.
        const ShapingWindow oRead = GetShapingWindow(oInfo);
        EXPECT_EQ(oRead.GetType(), oWindow.GetType());
        EXPECT_EQ(oRead.GetBeta(), oWindow.GetBeta());
        EXPECT_EQ(oRead.GetSigma(), oWindow.GetSigma());
    }
}

TEST(ShapingWindow, FromCoefficients) {
    struct {
        CoefficientMap oCoefficients;
        ShapingWindowType eType;
        double dfBeta, dfSigma;
    } const aoCases[] = {
        {{}, eSWT_KAISER, 9.42, 0.0},
        {{{"BETA", "2"}, {"SIGMA", "abc"}}, eSWT_KAISER, 2.0, 0.0},
        {{{"sigma", "5D-1"}}, eSWT_GAUSSIAN, 0.0, 0.5},
        {{{"SHAPINGWINDOW", " kaiser\t"}, {"SIGMA", "3"}}, eSWT_KAISER, 9.42, 0.0},
        {{{"ShapingWindow", "Gaussian"}, {"BETA", "3"}}, eSWT_GAUSSIAN, 0.0, 1.0},
        {{{"SHAPINGWINDOW", "hann"}, {"BETA", "99"}, {"SIGMA", "-"}}, eSWT_HANN, 0.0, 0.0},
    };
    for (const auto& oCase : aoCases) {
        ResampleInfo oInfo;
        oInfo.moCoefficients = oCase.oCoefficients;
        const ShapingWindow oWindow = GetShapingWindow(oInfo);
        EXPECT_EQ(oWindow.GetType(), oCase.eType);
        EXPECT_EQ(oWindow.GetBeta(), oCase.dfBeta);
        EXPECT_EQ(oWindow.GetSigma(), oCase.dfSigma);
    }
    const auto fnRead = [](const CoefficientMap& oCoefficients) {
        return [=] {
            ResampleInfo oInfo;
            oInfo.moCoefficients = oCoefficients;
            GetShapingWindow(oInfo);
        };
    };
    for (const char* pszName : {"KAISER2", "", "HAN"}) {
        ExpectRefusal({"sVal", 1, pszName, "",
                       FormatString("Shaping window type '%s' was not recognized", pszName)},
                      fnRead({{"SHAPINGWINDOW", " " + ToLower(pszName)}}));
    }
    for (const char* pszKey : {"BETA", "SIGMA"}) {
        ExpectRefusal(
            {"sName", 1, pszKey, "",
             FormatString("The value of '%s' is not numeric in the coefficient map.", pszKey)},
            fnRead({{pszKey, "abc"}}));
    }
    ExpectRefusal({"BETA", 1, "", "",
                   "BETA value '25.500000' for Kaiser shaping window is too large (must be < 25)"},
                  fnRead({{"BETA", "25.5"}}));
}

TEST(ShapingWindow, KaiserLimits) {
    ShapingWindow oWindow = Gaussian(0.5);
    for (const double dfBeta : {26.0, -26.0, std::nextafter(25.0, 26.0), -HUGE_VAL, kNaN}) {
        ExpectRefusal({"BETA", 1, "", "",
                       FormatString("BETA value '%f' for Kaiser shaping window is too large "
                                    "(must be < 25)",
                                    dfBeta)},
                      [&] { oWindow.SetKaiser(dfBeta); });
        EXPECT_TRUE(oWindow.GetType() == eSWT_GAUSSIAN && oWindow.GetBeta() == 0.0);
    }
    oWindow.SetKaiser(25.0);
    EXPECT_TRUE(oWindow.GetType() == eSWT_KAISER && oWindow.GetBeta() == 25.0);
}

TEST(SincTable, EveryWindowAndSize) {
    for (const auto& [pszName, oWindow, dfEdge, fnValue] : AllWindows()) {
        for (const int n : {8, 16}) {
            SCOPED_TRACE(testing::Message() << pszName << ' ' << n);
            ResampleInfo oInfo;
            oInfo.mvdfKernelWeights = {1.0, 2.0};
            (n == 8 ? Sinc8Resampler::GenerateKernelWeights
                    : Sinc16Resampler::GenerateKernelWeights)(oWindow, oInfo);
            ASSERT_EQ(oInfo.mvdfKernelWeights.size(), n == 8 ? 520u : 1040u);
            const double* padfTable = oInfo.mvdfKernelWeights.data();
            const int c = n / 2 - 1;
            for (int p = 0; p <= 64; ++p) {
                std::vector<double> vdfExpected;
                double dfSum = 0.0;
                for (int j = 0; j < n; ++j) {
                    const double d = j - (p * 0.015625 + c);
                    double w = j == c + p / 64;  // the impulses of phases 0 and 64
                    if (p % 64 != 0) {
                        w = std::sin(d * kPi) * oWindow.GetValue(d, n / 2) / (d * kPi);
                    }
                    vdfExpected.push_back(w);
                    dfSum += w;
                }
                double dfTotal = 0.0;
                for (int j = 0; j < n; ++j) {
                    const double w = padfTable[p * n + j];
                    ASSERT_EQ(w, vdfExpected[static_cast<std::size_t>(j)] / dfSum) << p << ' ' << j;
                    EXPECT_NEAR(w, padfTable[(64 - p) * n + n - 1 - j], 2e-15) << p << ' ' << j;
                    dfTotal += w;
                }
                EXPECT_NEAR(dfTotal, 1.0, 1e-15);
            }
        }
    }
}

TEST(SincTable, HalfwayTaps) {
    const std::pair<ShapingWindow, std::vector<double>> aoCases[] = {
        {Kaiser(9.42), {-0.001031, 0.018326, -0.110961, 0.593667}},
        {Make(&ShapingWindow::SetParabola), {-0.021291, 0.077498, -0.182154, 0.625946}}};
    for (const auto& [oWindow, vdfTaps] : aoCases) {
        ResampleInfo oInfo;
        Sinc8Resampler::GenerateKernelWeights(oWindow, oInfo);
        for (std::size_t j = 0; j < 4; ++j) {
            EXPECT_NEAR(oInfo.mvdfKernelWeights[32 * 8 + j], vdfTaps[j], 5e-7);
            EXPECT_NEAR(oInfo.mvdfKernelWeights[32 * 8 + 7 - j], vdfTaps[j], 5e-7);
        }
    }
}

}  // namespace
}  // namespace vetra::utils
