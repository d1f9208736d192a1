#include "vetra/base/utils/resample/pixelclamp.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>
#include <memory>
#include <optional>
#include <vector>

namespace vetra::utils {
namespace {

constexpr double kLow = std::numeric_limits<double>::lowest();
constexpr double kHigh = std::numeric_limits<double>::max();
constexpr double kInf = std::numeric_limits<double>::infinity();
constexpr std::nullopt_t kNone = std::nullopt;

template <typename T>
T Clamped(double dfMin, double dfMax, std::optional<double> odfBgd, double dfValue) {
    // Without the flag the background must not matter, so it gets the value itself.
    const std::unique_ptr<PixelClamp<T>> poClamp(
        PixelClampFactory::Create<T>(dfMin, dfMax, odfBgd.value_or(dfValue), odfBgd.has_value()));
    EXPECT_EQ(poClamp->HasBackground(), odfBgd.has_value());
    T result = T(77);
    poClamp->Clamp(dfValue, &result);
    return result;
}

template <typename T>
struct Case {
    double dfMin;
    double dfMax;
    std::optional<double> odfBgd;
    double dfValue;
    T expected;
};

template <typename T>
void ExpectAll(const std::vector<Case<T>>& aoCases) {
    for (const Case<T>& o : aoCases) {
        EXPECT_EQ(Clamped<T>(o.dfMin, o.dfMax, o.odfBgd, o.dfValue), o.expected)
            << "limits " << o.dfMin << ", " << o.dfMax << "; background " << o.odfBgd.value_or(NAN)
            << "; value " << o.dfValue;
    }
}

template <typename T>
class IntegerClamp : public testing::Test {};
using IntegerTypes = testing::Types<unsigned char, signed char, unsigned short, short, unsigned int,
                                    int, std::uint64_t, std::int64_t>;
TYPED_TEST_SUITE(IntegerClamp, IntegerTypes);

TYPED_TEST(IntegerClamp, RoundsSaturatesAndKeepsOffTheBackground) {
    using T = TypeParam;
    constexpr T low = std::numeric_limits<T>::lowest();
    constexpr T high = std::numeric_limits<T>::max();
    constexpr T second = static_cast<T>(low + 1);
    constexpr T lastButOne = static_cast<T>(high - 1);
    const double dfBeyond = std::ldexp(1.0, std::numeric_limits<T>::digits);
    // Ties to even, limits of the type, NaN.
    ExpectAll<T>({{kLow, kHigh, kNone, 2.5, 2},
                  {kLow, kHigh, kNone, 3.5, 4},
                  {kLow, kHigh, kNone, std::nextafter(2.5, 3.0), 3},
                  {kLow, kHigh, kNone, kInf, high},
                  {kLow, kHigh, kNone, dfBeyond, high},
                  {kLow, kHigh, kNone, kLow, low},
                  {kLow, kHigh, kNone, NAN, low}});
    // Limits are cut toward zero, the value is not; limits in the wrong order; limits without
    // value.
    ExpectAll<T>({{10.9, 100.9, kNone, 9.4, 10},
                  {10.9, 100.9, kNone, 100.6, 100},
                  {10.9, 100.9, kNone, NAN, 10},
                  {-0.5, 100, kNone, -0.9, 0},
                  {100, 10, kNone, 5, 10},
                  {100, 10, kNone, 500, 100},
                  {NAN, 100, kNone, -kInf, low},
                  {10, NAN, kNone, 200, 10}});
    // The background inside, on and outside the limits; a new resampler's setting.
    ExpectAll<T>({{10, 100, 50.9, 50, 51},
                  {10, 100, 50, 9, 10},
                  {10, 100, 10, 10, 11},
                  {10, 100, 100, 100, 99},
                  {10, 100, 5, 5, 10},
                  {10, 100, 101, 101, 100},
                  {kLow, kHigh, kLow, kLow, second},
                  {kLow, kHigh, kLow, NAN, second},
                  {kLow, kHigh, kHigh, kInf, lastButOne},
                  {kLow, kHigh, NAN, kLow, second}});
    // Both limits on the background end crossed: values up to it come out one above, greater ones
    // one below. At the ends of the type the moved limit wraps.
    ExpectAll<T>({{50, 50, 50, 49, 51},
                  {50, 50, 50, 50, 51},
                  {50, 50, 50, 51, 49},
                  {50, 50, 50, NAN, 51},
                  {kLow, kLow, kLow, kLow, second},
                  {kLow, kLow, kLow, kInf, high},
                  {kHigh, kHigh, kHigh, kInf, lastButOne},
                  {kHigh, kHigh, kHigh, NAN, low}});
    const PixelClamp<T> oDefault(kLow, kHigh, kLow);
    EXPECT_EQ(oDefault.GetLow(), second);
    EXPECT_EQ(oDefault.GetHigh(), high);
    EXPECT_EQ(oDefault.GetBackground(), low);
    EXPECT_EQ(oDefault.GetTolerance(), T(0));
    EXPECT_FALSE(oDefault.AvoidsBackground());
    EXPECT_TRUE(PixelClamp<T>(10.0, 100.0, 50.0).AvoidsBackground());
}

TEST(PixelClamp, SingleIntegerTypes) {
    ExpectAll<unsigned char>({{0, 254.7, kNone, 255, 254}, {-10, 300, kNone, 299, 255}});
    ExpectAll<short>(
        {{-200, -100, kNone, -100.5, -100}, {-3.9, 5, kNone, -9, -3}, {100, 200, 150, 150.4, 151}});
    // Values and limits that have no double of their own stay exact.
    ExpectAll<std::int64_t>({{kLow, kHigh, kNone, 9223372036854774784.0, 9223372036854774784},
                             {kLow, kHigh, kHigh, 1e19, 9223372036854775806},
                             {kLow, kHigh, kLow, -1e19, -9223372036854775807}});
    ExpectAll<std::uint64_t>({{kLow, kHigh, kNone, 1.8e19, 18000000000000000000u},
                              {kLow, kHigh, kHigh, 1e20, 18446744073709551614u}});
}

template <typename T>
class FloatClamp : public testing::Test {};
using FloatTypes = testing::Types<float, double>;
TYPED_TEST_SUITE(FloatClamp, FloatTypes);

TYPED_TEST(FloatClamp, KeepsValuesOffTheBackground) {
    using T = TypeParam;
    constexpr T high = std::numeric_limits<T>::max();
    constexpr T above = T(0.25) + T(1e-5);
    constexpr T below = T(0.25) - T(1e-5);
    ExpectAll<T>({{kLow, kHigh, kNone, 2.5, T(2.5)},
                  {kLow, kHigh, kNone, 0.1, T(0.1)},
                  {kLow, kHigh, kNone, kInf, high},
                  {kLow, kHigh, kNone, kLow, -high},
                  {kLow, kHigh, kLow, kLow, -high},
                  {100, 10, kNone, 9.5, T(10)},
                  {NAN, 100, kNone, -kInf, -high}});
    // Around the background; then with a limit near it, which moves; then with crossed limits.
    ExpectAll<T>({{kLow, kHigh, 0.25, 0.25, above},
                  {kLow, kHigh, 0.25, 0.250009, above},
                  {kLow, kHigh, 0.25, 0.249991, above},
                  {kLow, kHigh, 0.25, 0.250011, T(0.250011)},
                  {kLow, kHigh, 0.25, 0.249989, T(0.249989)},
                  {1, 2, 0.25, 0.25, T(1)},
                  {0, 0.250005, 0.25, 0.25, below},
                  {0.25, 1, 0.25, 0.25, above},
                  {0.249991, 1, 0.25, 0, above},
                  {0.249989, 1, 0.25, 0, T(0.249989)},
                  {0.25, 0.25, 0.25, 0.25, above},
                  {0.25, 0.25, 0.25, 0.3, below}});
    EXPECT_TRUE(std::isnan(Clamped<T>(10.0, 100.0, kNone, NAN)));
    EXPECT_TRUE(std::isnan(Clamped<T>(kLow, kHigh, 0.25, NAN)));
}

TEST(PixelClamp, StepLostInFloat) {
    EXPECT_EQ(Clamped<float>(kLow, kHigh, -9999.0, -9999.0), -9999.0f);
    EXPECT_EQ(Clamped<double>(kLow, kHigh, -9999.0, -9999.0), -9999.0 + 1e-5);
}

TEST(SaturateCast, CutsTowardZero) {
    EXPECT_EQ(SaturateCast<unsigned char>(2.9), 2);
    EXPECT_EQ(SaturateCast<unsigned char>(300.0), 255);
    EXPECT_EQ(SaturateCast<short>(-3.7), -3);
    EXPECT_EQ(SaturateCast<float>(NAN), -std::numeric_limits<float>::max());
}

}  // namespace
}  // namespace vetra::utils
