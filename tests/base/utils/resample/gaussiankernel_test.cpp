#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <tuple>
#include <vector>

#include "tests/support/refusal.h"
#include "vetra/vetra.h"

namespace vetra::utils {
namespace {

using tests::ExpectRefusal;

constexpr int kMost = std::numeric_limits<int>::max();

std::vector<double> Kernel(int nCols, int nRows, float fSigmaCol, float fSigmaRow) {
    std::vector<double> vdfWeights = {1.0, 2.0};
    GenerateGaussianKernel(nCols, nRows, fSigmaCol, fSigmaRow, vdfWeights);
    return vdfWeights;
}

// Every weight, by the formula and in its order of operations.
TEST(GaussianKernel, Formula) {
    for (const auto& [nCols, nRows, fSigmaCol, fSigmaRow] :
         {std::tuple(6, 3, 0.866f, 1.7f), {1, 2, 0.3f, 1e30f}, {25, 12, 4.0f, 0.1f}}) {
        SCOPED_TRACE(testing::Message() << nCols << " x " << nRows);
        const std::vector<double> vdfWeights = Kernel(nCols, nRows, fSigmaCol, fSigmaRow);
        ASSERT_EQ(vdfWeights.size(), static_cast<std::size_t>(65 * (nCols + nRows)));
        const double* padfTap = vdfWeights.data();
        for (const auto& [n, fSigma] : {std::pair(nCols, fSigmaCol), {nRows, fSigmaRow}}) {
            const double s = fSigma;
            const int h = (n - 1) / 2;
            for (int p = 0; p <= 64; ++p) {
                std::vector<double> w;
                double dfSum = 0.0;
                for (int j = 0; j < n; ++j) {
                    const double d = j - (h + p * 0.015625);
                    w.push_back(std::exp(-(d * d / (s * 2.0 * s))));
                    dfSum += w.back();
                }
                double dfSum2 = 0.0;
                for (double& dfWeight : w) {
                    dfWeight /= dfSum;
                    dfSum2 += dfWeight;
                }
                w[static_cast<std::size_t>(h)] += 1.0 - dfSum2;
                for (const double dfWeight : w) {
                    ASSERT_EQ(*padfTap++, dfWeight) << p;
                }
            }
        }
    }
}

TEST(GaussianKernel, TellingFigures) {
    const std::vector<double> vdfWeights = Kernel(6, 6, 0.8660254f, 0.8660254f);
    const double aadfTaps[2][6] = {{0.032045, 0.236785, 0.461195, 0.236785, 0.032045, 0.001143},
                                   {0.007144, 0.102814, 0.390042, 0.390042, 0.102814, 0.007144}};
    for (std::size_t j = 0; j < 6; ++j) {
        EXPECT_NEAR(vdfWeights[j], aadfTaps[0][j], 5e-7);
        EXPECT_NEAR(vdfWeights[32 * 6 + j], aadfTaps[1][j], 5e-7);
        // The last phase is the first one moved by a pixel, and the rows are as the columns.
        EXPECT_NEAR(vdfWeights[64 * 6 + 5 - j], vdfWeights[j], 1e-15);
        EXPECT_EQ(vdfWeights[65 * 6 + j], vdfWeights[j]);
    }
    // With a tiny sigma phase 0 is an impulse, and the middle one has nothing left.
    const std::vector<double> vdfTiny = Kernel(3, 1, 0.01f, 0.01f);
    EXPECT_EQ(std::vector<double>(vdfTiny.begin(), vdfTiny.begin() + 3),
              (std::vector<double>{0.0, 1.0, 0.0}));
    EXPECT_TRUE(std::isnan(vdfTiny[32 * 3 + 1]));
}

// The checks of a window and its sigmas, with what a method calls itself in the messages.
template <typename Function>
void CheckRefusals(const char* pszCols, const char* pszSigma, Function fnCall) {
    const std::string sMust = " must be a positive number";
    for (const int nSize : {0, -1, -kMost - 1}) {
        const std::string sSize = std::to_string(nSize);
        ExpectRefusal({"nWndNumCols", 1, sSize, "Positive number",
                       std::string("Num cols for ") + pszCols + sMust},
                      [&] { fnCall(nSize, nSize, 0.0f, 0.0f); });
        ExpectRefusal({"nWndNumRows", 1, sSize, "Positive number", "Num rows for gaussian" + sMust},
                      [&] { fnCall(kMost, nSize, 0.0f, 0.0f); });
    }
    for (const float fSigma : {0.0f, -0.5f, std::nanf(""), HUGE_VALF}) {
        const std::string sSigma = FormatString("%f", static_cast<double>(fSigma));
        ExpectRefusal({"fSigmaCol", 1, sSigma, "Positive number",
                       std::string("Col sigma of ") + pszSigma + sMust},
                      [&] { fnCall(kMost, kMost, fSigma, fSigma); });
        ExpectRefusal({"fSigmaRow", 1, sSigma, "Positive number",
                       std::string("Row sigma of ") + pszSigma + sMust},
                      [&] { fnCall(kMost, kMost, 1.0f, fSigma); });
    }
    for (const int nSize : {300001, kMost}) {
        const std::string sSize = std::to_string(nSize);
        ExpectRefusal(
            {"nWndNumCols", 1, sSize, "<= 300000", "Num cols for gaussian must be at most 300000"},
            [&] { fnCall(nSize, nSize, 1.0f, 1.0f); });
        ExpectRefusal(
            {"nWndNumRows", 1, sSize, "<= 300000", "Num rows for gaussian must be at most 300000"},
            [&] { fnCall(1, nSize, 1.0f, 1.0f); });
    }
}

TEST(GaussianKernel, Refusals) {
    CheckRefusals("gaussian", "gaussian", Kernel);
    std::vector<double> vdfWeights = {1.0, 2.0};
    EXPECT_THROW(GenerateGaussianKernel(0, 1, 1.0f, 1.0f, vdfWeights), ParameterException);
    EXPECT_EQ(vdfWeights, (std::vector<double>{1.0, 2.0}));
}

template <typename R>
void CheckFactors() {
    const std::tuple<float, int, double> aoFactors[] = {
        {1.0f, 2, 0.229129},  {1.1f, 2, 0.229129}, {2.0f, 6, 0.866025},
        {4.0f, 12, 1.936492}, {1.5f, 4, 0.559017}, {100.0f, 300, 49.9975}};
    for (const auto& [fFactor, nSize, dfSigma] : aoFactors) {
        SCOPED_TRACE(fFactor);
        int nCols = 0, nRows = 0;
        float fSigmaCol = 0.0f, fSigmaRow = 0.0f;
        const R oResampler(fFactor, 1.0f);
        oResampler.GetParameters(nCols, nRows, fSigmaCol, fSigmaRow);
        EXPECT_TRUE(nCols == nSize && nRows == 2) << nCols << ' ' << nRows;
        EXPECT_NEAR(fSigmaCol, dfSigma, 2e-6);
        EXPECT_NEAR(fSigmaRow, 0.229129, 1e-6);
        EXPECT_EQ(oResampler.GetResampleInfo().mvdfKernelWeights,
                  Kernel(nSize, 2,
                         std::sqrt(std::max(fFactor, 1.1f) * std::max(fFactor, 1.1f) - 1.0f) * 0.5f,
                         std::sqrt(1.1f * 1.1f - 1.0f) * 0.5f));
    }
    for (const float fFactor :
         {0.999f, 0.0f, -3.0f, std::nanf(""), 100001.0f, 433333333.0f, 1e30f, HUGE_VALF}) {
        const std::string sFactor = FormatString("%f", static_cast<double>(fFactor));
        const bool bMuch = fFactor > 1.0f;
        const std::string sExpected = bMuch ? "<= 100000" : ">= 1.0";
        const std::string sRest = std::string(" downsampling factor for gaussian must be ") +
                                  (bMuch ? "at most 100000" : "a positive number");
        ExpectRefusal({"fDsFactorCol", 1, sFactor, sExpected, "Col" + sRest},
                      [&] { R(fFactor, 0.0f); });
        ExpectRefusal({"fDsFactorRow", 1, sFactor, sExpected, "Row" + sRest},
                      [&] { R(1.0f, fFactor); });
    }
}

TEST(GaussianResampler, Factors) {
    CheckFactors<GaussianResampler>();
    CheckFactors<SqGaussianResampler>();
    // The largest factor has the largest kernel.
    EXPECT_EQ(GaussianResampler(100000.0f, 1.0f).GetResampleInfo().mvdfKernelWeights.size(),
              65u * 300002u);
}

TEST(GaussianResampler, Refusals) {
    CheckRefusals("gaussian", "gaussian", [](int nCols, int nRows, float fCol, float fRow) {
        GaussianResampler(nCols, nRows, fCol, fRow);
    });
    CheckRefusals("guassian", "Gaussian", [](int nCols, int nRows, float fCol, float fRow) {
        SqGaussianResampler(nCols, nRows, fCol, fRow);
    });
}

}  // namespace
}  // namespace vetra::utils
