#include "vetra/base/utils/math/orientation.h"

#include <array>
#include <cmath>
#include <cstddef>
#include <cstdint>

// The sign of the determinant of (b - a, c - a): by floating point where its error bound allows
// (J. R. Shewchuk, "Adaptive precision floating-point arithmetic and fast robust geometric
// predicates", Discrete & Computational Geometry 18, 1997), else by integers. A double is an
// integer times a power of 2, so the determinant, multiplied out, is a sum of six such products,
// and they are added in fixed point over the whole range of exponents.

namespace vetra::utils::math {
namespace {

constexpr int kDigitBits = 32;
// A finite double is a multiple of 2^-1074.
constexpr int kMinExponent = -1074;
// Products are multiples of 2^-2148 and below 2^2048.
constexpr std::size_t kDigits = (2 * 1074 + 2048) / kDigitBits + 3;

// A double's absolute value as m * 2^e with an integer m of 53 bits.
struct Integer {
    explicit Integer(double df) {
        int nExponent = 0;
        const double dfFraction = std::frexp(std::abs(df), &nExponent);
        m = static_cast<std::uint64_t>(std::ldexp(dfFraction, 53));
        // Bits below the unit of the range are zeros.
        e = nExponent - 53;
        if (e < kMinExponent) {
            m >>= kMinExponent - e;
            e = kMinExponent;
        }
    }

    std::uint64_t m;
    int e;
};

// A sum of products of doubles.
class ExactSum {
 public:
    /// Adds \p nSign * \p x * \p y.
    void Add(int nSign, double x, double y) {
        if (x == 0.0 || y == 0.0) {
            return;
        }
        nSign = std::signbit(x) != std::signbit(y) ? -nSign : nSign;
        const Integer oLeft(x);
        const Integer oRight(y);
        const auto nShift = static_cast<std::size_t>(oLeft.e + oRight.e - 2 * kMinExponent);
        const std::size_t nFirst = nShift / kDigitBits;
        // The left factor is shifted within its digits, by less than one of them.
        const std::uint64_t nLow = (oLeft.m & kMask) << (nShift % kDigitBits);
        const std::uint64_t nHigh =
            ((oLeft.m >> kDigitBits) << (nShift % kDigitBits)) + (nLow >> kDigitBits);
        const std::array<std::uint64_t, 3> anLeft = {nLow & kMask, nHigh & kMask,
                                                     nHigh >> kDigitBits};
        const std::array<std::uint64_t, 2> anRight = {oRight.m & kMask, oRight.m >> kDigitBits};
        for (std::size_t i = 0; i < anLeft.size(); ++i) {
            for (std::size_t j = 0; j < anRight.size(); ++j) {
                const std::uint64_t nProduct = anLeft[i] * anRight[j];
                manDigits[nFirst + i + j] += nSign * static_cast<std::int64_t>(nProduct & kMask);
                manDigits[nFirst + i + j + 1] +=
                    nSign * static_cast<std::int64_t>(nProduct >> kDigitBits);
            }
        }
    }

    int Sign() const {
        std::int64_t nCarry = 0;
        bool bNonZero = false;
        for (const std::int64_t nDigit : manDigits) {
            const std::int64_t nSum = nDigit + nCarry;
            bNonZero = bNonZero || (nSum & static_cast<std::int64_t>(kMask)) != 0;
            nCarry = nSum >> kDigitBits;
        }
        return nCarry < 0 ? -1 : bNonZero || nCarry > 0;
    }

 private:
    static constexpr std::uint64_t kMask = 0xffffffff;

    // From the least one; between additions they are signed and may be larger than a digit.
    std::array<std::int64_t, kDigits> manDigits = {};
};

}  // namespace

int Orientation(const std::pair<double, double>& a, const std::pair<double, double>& b,
                const std::pair<double, double>& c) {
    // Relative to the sum of the products' sizes; and above what underflow could hide.
    constexpr double kErrorBound = 3.3306690738754716e-16;
    constexpr double kSmallest = 1e-290;
    const double dfLeft = (b.first - a.first) * (c.second - a.second);
    const double dfRight = (b.second - a.second) * (c.first - a.first);
    const double dfDet = dfLeft - dfRight;
    const double dfBound = kErrorBound * (std::abs(dfLeft) + std::abs(dfRight));
    // Where something overflowed the bound is infinite or NaN, or there is no sign.
    if (std::abs(dfDet) > dfBound && std::abs(dfDet) > kSmallest) {
        return dfDet > 0.0 ? 1 : -1;
    }
    ExactSum oSum;
    oSum.Add(1, b.first, c.second);
    oSum.Add(-1, b.first, a.second);
    oSum.Add(-1, a.first, c.second);
    oSum.Add(-1, b.second, c.first);
    oSum.Add(1, b.second, a.first);
    oSum.Add(1, a.second, c.first);
    return oSum.Sign();
}

}  // namespace vetra::utils::math
