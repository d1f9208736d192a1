#include "vetra/chronocore/timesystemconverter.h"

#include <gtest/gtest.h>

#include <chrono>
#include <limits>
#include <random>

namespace vetra::tsys {
namespace {

struct Parts {
    double dfDays;
    double dfFraction;
    bool operator==(const Parts&) const = default;
};

Parts Julian(int nYear, int nMonth, int nDay, int nHour = 0, int nMinute = 0, double dfSecond = 0) {
    Timestamp oTime;
    TimeSystemConverter().CalendarToJulian(nYear, nMonth, nDay, nHour, nMinute, dfSecond, oTime);
    Parts oParts;
    oTime.GetTime(oParts.dfDays, oParts.dfFraction);
    return oParts;
}

TEST(TimeSystemConverter, JulianDates) {
    EXPECT_EQ(Julian(2000, 1, 1, 12), (Parts{2451544.5, 0.5}));
    EXPECT_EQ(Julian(-4713, 11, 24, 12), (Parts{-0.5, 0.5}));
    EXPECT_EQ(Julian(1987, 6, 19, 12, 30, 15.5), (Parts{2446965.5, 45015.5 / 86400.0}));
    // Beyond the usual ranges.
    EXPECT_EQ(Julian(1999, 13, 1), Julian(2000, 1, 1));
    EXPECT_EQ(Julian(2001, -10, 0), Julian(2000, 1, 31));
    for (const int n : {std::numeric_limits<int>::min(), std::numeric_limits<int>::max()}) {
        EXPECT_NEAR(Julian(n, n, n, n, n).dfDays, n * (365.2425 + 365.2425 / 12 + 1), 2e6);
    }

    std::mt19937 oRandom(1);
    for (int n = 0; n < 2000; ++n) {
        using namespace std::chrono;
        const sys_days day{days{static_cast<int>(oRandom() % 20'000'000) - 10'000'000}};
        const year_month_day oDate(day);
        EXPECT_EQ(
            Julian(int(oDate.year()), int(unsigned(oDate.month())), int(unsigned(oDate.day())))
                .dfDays,
            static_cast<double>(day.time_since_epoch().count()) + 2440587.5);
    }
}

TEST(Timestamp, DifferencesKeepTheirDigits) {
    Timestamp oFirst;
    Timestamp oSecond;
    const TimeSystemConverter oConverter;
    oConverter.CalendarToJulian(2023, 12, 31, 23, 59, 59.9995, oFirst);
    oConverter.CalendarToJulian(2024, 1, 1, 0, 0, 0.0005, oSecond);
    double dfDays = 0.0;
    double dfFraction = 0.0;
    (oSecond - oFirst).GetTime(dfDays, dfFraction);
    EXPECT_NEAR((dfDays + dfFraction) * 86400.0, 0.001, 1e-10);
}

}  // namespace
}  // namespace vetra::tsys
