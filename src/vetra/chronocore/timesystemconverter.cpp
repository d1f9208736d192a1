#include "vetra/chronocore/timesystemconverter.h"

namespace vetra::tsys {

namespace {

// Rounds down; the denominator is positive.
long long FloorDivide(long long nNumerator, long long nDenominator) {
    return (nNumerator >= 0 ? nNumerator : nNumerator - nDenominator + 1) / nDenominator;
}

}  // namespace

void TimeSystemConverter::CalendarToJulian(const int& year, const int& month, const int& day,
                                           const int& hour, const int& minute, const double& second,
                                           Timestamp& result) const {
    // Years from March to February: the leap day is the last one, and the days ahead of month m,
    // counted from March as 0, are (153 m + 2) / 5.
    const long long nMonths = 12LL * year + month - 3;
    const long long nYear = FloorDivide(nMonths, 12);
    const long long nMonth = nMonths - 12 * nYear;
    const long long nDays = 365 * nYear + FloorDivide(nYear, 4) - FloorDivide(nYear, 100) +
                            FloorDivide(nYear, 400) + (153 * nMonth + 2) / 5 + day - 1;
    // The midnight that begins 1 March of year 0 has the Julian date 1721119.5.
    const double dfMinutes = static_cast<double>(60LL * hour + minute);
    result =
        Timestamp(static_cast<double>(nDays) + 1721119.5, (60.0 * dfMinutes + second) / 86400.0);
}

}  // namespace vetra::tsys
