#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <limits>
#include <memory>
#include <random>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include "tests/base/utils/math/arrayallocations.h"
#include "tests/support/refusal.h"
#include "vetra/base/utils/math/poly1d.h"
#include "vetra/base/utils/math/poly2d.h"

namespace {

using vetra::tests::ExpectRefusal;
using vetra::tests::goArrayAllocations;

constexpr double kEpsilon = std::numeric_limits<double>::epsilon();
const double kNan = std::numeric_limits<double>::quiet_NaN();

template <typename Poly>
std::vector<double> Coeffs(const Poly& oPoly) {
    return {oPoly.GetCoeffs(), oPoly.GetCoeffs() + oPoly.GetNumCoeffs()};
}

std::vector<double> Random(std::mt19937& oEngine, std::size_t nCount) {
    std::uniform_real_distribution<double> oRange(-2.0, 2.0);
    std::vector<double> vdf(nCount);
    for (double& df : vdf) {
        df = oRange(oEngine);
    }
    return vdf;
}

TEST(Poly1D, SumsInAscendingPowers) {
    // 1 + 1e16 loses the 1, which Horner's scheme would keep.
    EXPECT_EQ(Poly1D({1.0, 1e16, -1e16}).GetValue(1.0), 0.0);
    const double x = 1.1;
    EXPECT_EQ(Poly1D({0.0, 0.0, 0.0, 0.3}).GetValue(x), 0.3 * (x * x * x));
    EXPECT_EQ(Poly1D().GetValue(5.0), 0.0);
    EXPECT_EQ(Poly1D().GetPolyOrder(), 0);
}

TEST(Poly1D, InverseTakesTheStatedPasses) {
    // Newton's iteration halves x for x^2 = 0, which counts the passes.
    Poly1D oSquare({0.0, 0.0, 1.0});
    const auto fnSolve = [&](unsigned int nMax, double dfTolerance, double dfTarget, double x) {
        oSquare.SetInverseParams(nMax, dfTolerance);
        const int nResult = oSquare.GetInverse(dfTarget, x);
        return std::make_pair(nResult, x);
    };
    EXPECT_EQ(fnSolve(20, 0.0, 0.0, 1.0), std::make_pair(-1, std::ldexp(1.0, -21)));
    EXPECT_EQ(fnSolve(0, 0.0, 0.0, 1.0), std::make_pair(-1, 0.5));
    EXPECT_EQ(fnSolve(20, 0.1, 0.0, 1.0), std::make_pair(0, 0.125));  // a step beyond 0.25
    EXPECT_EQ(fnSolve(2, 0.1, 0.0, 1.0), std::make_pair(0, 0.125));
    EXPECT_EQ(fnSolve(1, 0.1, 0.0, 1.0), std::make_pair(-1, 0.25));
    EXPECT_EQ(fnSolve(20, 1e-8, 4.0, 0.0), std::make_pair(-1, 0.0));  // no slope
    EXPECT_EQ(fnSolve(20, 1e-8, 0.0, 0.0), std::make_pair(0, 0.0));
    // Ends at once, although there would be 2^32 passes.
    EXPECT_EQ(fnSolve(UINT_MAX, 1e-8, 4.0, 0.0), std::make_pair(-1, 0.0));
    EXPECT_EQ(fnSolve(UINT_MAX, 0.0, 4.0, 3.0).first, -1);
    EXPECT_EQ(fnSolve(UINT_MAX, 1e-8, kNan, 3.0), std::make_pair(-1, 3.0));
    EXPECT_EQ(fnSolve(UINT_MAX, 1e-8, 4.0, kNan).first, -1);

    double x = 7.0;
    EXPECT_EQ(Poly1D({3.0}).GetInverse(3.0 + 0.9e-8, x), 0);
    EXPECT_EQ(Poly1D({3.0}).GetInverse(3.0 + 1.1e-8, x), -1);
    EXPECT_EQ(x, 7.0);
    EXPECT_EQ(Poly1D({1.0, -3.0, 0.0, 2.0}).GetInverse(0.0, x = 2.0), 0);
    EXPECT_NEAR(x, 1.0, 1e-5);
}

TEST(Poly1D, ChangesAndRefusals) {
    Poly1D oPoly({1.0, 2.0, 3.0});
    oPoly.SetInverseParams(5, 0.25);
    const Poly1D oBefore = oPoly;
    const double adfNew[] = {7.0, 8.0, 9.0, 10.0};
    ExpectRefusal({"vdfCoeffs", 8, "0", "> 0", "Number of coefficients must be greater than zero"},
                  [&] { oPoly.SetCoeffs({}); });
    ExpectRefusal(
        {"nOrder", 1, "-1", ">= 0", "Order of polynomial must be greater than or equal to zero"},
        [&] { oPoly.SetCoeffs(-1, nullptr); });
    ExpectRefusal({"nOrder", 1, "2147483647", "< 2147483647", "Order of polynomial is too large"},
                  [&] { Poly1D(INT_MAX, adfNew); });
    const vetra::tests::Refusal oNull{"padfCoeffs", 1, "NULL", "not NULL",
                                      "Coefficient array pointer cannot be NULL"};
    ExpectRefusal(oNull, [&] { Poly1D(0, nullptr); });
    ExpectRefusal(oNull, [&] { oPoly.UpdateCoeffs(1, nullptr); });
    ExpectRefusal(oNull, [&] { Poly1D::GetRequiredOrder(1, nullptr); });
    ExpectRefusal({"nCount", 1, "-1", ">= 0", "Index is out of range"},
                  [&] { oPoly.UpdateCoeffs(-1, adfNew); });
    for (const int nWhich : {3, -1, INT_MIN}) {
        ExpectRefusal({"nWhich", 1, std::to_string(nWhich), "< 3", "Index is out of range"},
                      [&] { oPoly.UpdateCoeff(nWhich, 0.0); });
    }
    EXPECT_TRUE(oPoly == oBefore);

    oPoly.UpdateCoeffs(0, nullptr);
    oPoly.UpdateCoeffs(2, adfNew);
    EXPECT_EQ(Coeffs(oPoly), (std::vector<double>{7.0, 8.0, 3.0}));
    oPoly.UpdateCoeff(2, 4.0);
    oPoly.SetCoeffs(1, oPoly.GetCoeffs() + 1);  // its own array
    EXPECT_EQ(Coeffs(oPoly), (std::vector<double>{8.0, 4.0}));
    oPoly.UpdateCoeffs(4, adfNew);
    EXPECT_EQ(Coeffs(oPoly), (std::vector<double>{7.0, 8.0, 9.0, 10.0}));
    unsigned int nMax = 0;
    double dfTolerance = 0.0;
    oPoly.GetInverseParams(nMax, dfTolerance);
    EXPECT_EQ(std::make_pair(nMax, dfTolerance), std::make_pair(5u, 0.25));

    const std::unique_ptr<Poly1D> poClone(oPoly.Clone());
    EXPECT_TRUE(*poClone == oPoly);
    poClone->SetInverseParams(6, 0.25);
    EXPECT_FALSE(*poClone == oPoly);
    oPoly = *poClone;
    EXPECT_TRUE(*poClone == oPoly);
    oPoly.UpdateCoeff(0, 7.0 + 4 * kEpsilon);
    EXPECT_FALSE(*poClone == oPoly);

    const double adfOrders[] = {0.0, -2.0 * kEpsilon, kEpsilon};
    EXPECT_EQ(Poly1D::GetRequiredOrder(3, adfOrders), 1);
    EXPECT_EQ(Poly1D::GetRequiredOrder(1, adfOrders), 0);
    EXPECT_EQ(Poly1D::GetRequiredOrder(-1, nullptr), 0);
    EXPECT_EQ(Poly1D::GetNumCoeffsForOrder(4), 5);
}

// The coefficient of x^i y^j by the rule of the index, powers by running products.
double Plain(int nOrder, const std::vector<double>& vdfCoeffs, double x, double y) {
    double dfSum = 0.0;
    for (int d = 0; d <= nOrder; ++d) {
        for (int j = 0; j <= d; ++j) {
            const auto k = static_cast<std::size_t>(d * (d + 1) / 2 + j);
            dfSum += poweri(x, d - j) * vdfCoeffs[k] * poweri(y, j);
        }
    }
    return dfSum;
}

TEST(Poly2D, SumsInTheOrderOfTheCoefficients) {
    std::mt19937 oEngine(5);
    for (int nOrder = 0; nOrder <= 9; ++nOrder) {
        const int nNumCoeffs = Poly2D::GetNumCoeffsForOrder(nOrder);
        EXPECT_EQ(Poly2D::GetOrderForNumCoeffs(nNumCoeffs), nOrder);
        for (int nRepeat = 0; nRepeat < 200; ++nRepeat) {
            const auto vdfCoeffs = Random(oEngine, static_cast<std::size_t>(nNumCoeffs));
            const auto vdfAt = Random(oEngine, 2);
            const Poly2D oPoly(nOrder, vdfCoeffs);
            const std::size_t nAllocations = goArrayAllocations.nCount;
            const double dfValue = oPoly.GetValue(vdfAt[0], vdfAt[1]);
            EXPECT_EQ(goArrayAllocations.nCount - nAllocations, nOrder > 5 ? 2u : 0u);
            EXPECT_EQ(dfValue, Plain(nOrder, vdfCoeffs, vdfAt[0], vdfAt[1])) << nOrder;
        }
    }
    std::vector<double> vdfLast(28, 0.0);
    vdfLast[21] = 1.0;
    vdfLast[27] = 3.0;
    EXPECT_EQ(Poly2D(6, vdfLast).GetValue(2.0, 10.0), 64.0 + 3e6);
    EXPECT_EQ(poweri(2.0, 10), 1024.0);
    EXPECT_EQ(poweri(2.0, 0), 1.0);
    EXPECT_EQ(poweri(2.0, -3), 1.0);
}

TEST(Poly2D, Zero) {
    Poly2D oPoly;
    EXPECT_EQ(std::make_tuple(oPoly.GetPolyOrder(), oPoly.GetNumCoeffs(), oPoly.IsNonZero()),
              std::make_tuple(0, 1, false));
    oPoly = Poly2D(3, std::vector<double>(10, 0.0));
    EXPECT_FALSE(oPoly.IsNonZero());
    EXPECT_EQ(oPoly.GetValue(kNan, 1.0), 0.0);
    oPoly.UpdateCoeff(1, 2.0);
    EXPECT_TRUE(oPoly.IsNonZero());
    EXPECT_EQ(oPoly.GetValue(3.0, 5.0), 6.0);
    oPoly.UpdateCoeffs({0.0, 0.0});
    EXPECT_FALSE(oPoly.IsNonZero());
    oPoly.UpdateCoeffs({kEpsilon / 2, -kEpsilon / 4});
    EXPECT_FALSE(oPoly.IsNonZero());
    EXPECT_EQ(oPoly.GetValue(1.0, 1.0), 0.0);
    oPoly.UpdateCoeff(1, -kEpsilon / 2);
    EXPECT_TRUE(oPoly.IsNonZero());
    oPoly.UpdateCoeffs({kNan});
    EXPECT_TRUE(oPoly.IsNonZero());
}

TEST(Poly2D, ChangesAndRefusals) {
    const std::vector<double> vdf6 = {1.0, 2.0, 3.0, 4.0, 5.0, 6.0};
    const std::vector<double> vdf7(7, 1.0);
    Poly2D oPoly(2, vdf6);
    const auto fnCount = [](int n) {
        const std::string s = std::to_string(n);
        return vetra::tests::Refusal{"nNumCoeffs", 1, s, "Valid num coeffs",
                                     "The provided number of coefficients (" + s +
                                         ") does not correspond to a 2D polynomial order"};
    };
    const vetra::tests::Refusal oNull{"padfCoeffs", 1, "NULL", "not NULL",
                                      "Coefficient array pointer cannot be NULL"};
    const vetra::tests::Refusal oNegative{"nOrder", 1, "-1", ">= 0",
                                          "Polynomial order must be zero or greater"};
    const double* padfNull = nullptr;
    ExpectRefusal(oNull, [&] { Poly2D(-1, padfNull); });
    ExpectRefusal(oNegative, [&] { Poly2D(-1, vdf6.data()); });
    ExpectRefusal(oNegative, [&] { Poly2D(-1, vdf6); });
    ExpectRefusal({"nOrder", 1, "46340", "<= 46339", "Polynomial order is too large"},
                  [&] { Poly2D(46340, vdf6.data()); });
    for (const auto& [nOrder, sExpected] :
         {std::make_pair(1, "3 entries"), {46339, "1073720970 entries"}}) {
        ExpectRefusal(
            {"vdfCoeffs", 1, "6 entries", sExpected,
             "Coefficient array has the wrong number of entries for the given polynomial order"},
            [&, n = nOrder] { Poly2D(n, vdf6); });
    }
    ExpectRefusal(fnCount(7), [&] { oPoly.UpdateCoeffs(vdf7); });
    ExpectRefusal(fnCount(-1), [&] { oPoly.UpdateCoeffs(-1, vdf6.data()); });
    ExpectRefusal(oNull, [&] { oPoly.UpdateCoeffs(1, nullptr); });
    ExpectRefusal(oNull, [&] { Poly2D::GetRequiredOrder(1, nullptr); });
    for (const int nWhich : {6, -1}) {
        ExpectRefusal({"nWhich", 1, std::to_string(nWhich), "< 6", "Index is out of range"},
                      [&] { oPoly.UpdateCoeff(nWhich, 0.0); });
    }
    for (const int n : {0, 2, 4, 5, -3, INT_MAX, INT_MIN}) {
        ExpectRefusal(fnCount(n), [&] { Poly2D::GetOrderForNumCoeffs(n); });
    }
    EXPECT_EQ(Coeffs(oPoly), vdf6);
    EXPECT_EQ(oPoly.GetValue(1.0, 1.0), 21.0);

    oPoly.UpdateCoeffs({});
    oPoly.UpdateCoeffs({9.0, 8.0});
    EXPECT_EQ(Coeffs(oPoly), (std::vector<double>{9.0, 8.0, 3.0, 4.0, 5.0, 6.0}));
    const std::vector<double> vdf10(10, 0.5);
    oPoly.UpdateCoeffs(vdf10);
    EXPECT_EQ(oPoly.GetPolyOrder(), 3);
    EXPECT_EQ(Coeffs(oPoly), vdf10);
    EXPECT_EQ(oPoly.GetValue(1.0, 1.0), 5.0);

    const std::unique_ptr<Poly2D> poClone(oPoly.Clone());
    EXPECT_TRUE(*poClone == oPoly);
    oPoly.UpdateCoeff(9, 0.5 + 2 * kEpsilon);
    EXPECT_FALSE(*poClone == oPoly);
    EXPECT_FALSE(*poClone == Poly2D(2, vdf6));

    std::vector<double> vdfOrders(8, kEpsilon);
    const int anOrders[] = {0, 1, 1, 2, 2, 2, 3, 3};
    EXPECT_EQ(Poly2D::GetRequiredOrder(8, vdfOrders.data()), 0);
    EXPECT_EQ(Poly2D::GetRequiredOrder(-1, nullptr), 0);
    for (std::size_t k = 0; k < vdfOrders.size(); ++k) {
        vdfOrders[k] = -1.0;
        EXPECT_EQ(Poly2D::GetRequiredOrder(8, vdfOrders.data()), anOrders[k]) << k;
    }
}

}  // namespace
