#include "vetra/base/utils/geo/solarposition.h"

#include <algorithm>
#include <cmath>

#include "vetra/base/utils/geo/geodeticmath.h"

namespace vetra::utils {

namespace {

using geo::kDegPerRad;
using geo::kPi;

constexpr double kTwoPi = 6.283185307179586;
constexpr double kRadPerDeg = 0.017453292519943295;

// Long long, so that no date overflows.
long long DayOfYear(long long nYear, long long nMonth, long long nDay) {
    if (nMonth <= 2) {
        return 31 * nMonth + nDay - 31;
    }
    const bool bLeap = (nYear % 4 == 0 && nYear % 100 != 0) || nYear % 400 == 0;
    const long long m = nMonth <= 8 ? nMonth - 1 : nMonth - 2;
    return nDay - 33 + 31 * nMonth - m / 2 + (bLeap ? 1 : 0);
}

}  // namespace

void SolarZenithAzimuth(int year, int month, int day, int hour, int minute, double second,
                        float latitude, float longitude, float& zenith, float& azimuth) {
    const double T = minute / 60.0 + hour + second / 3600.0;
    const double g = static_cast<double>(DayOfYear(year, month, day)) * kTwoPi / 365.0;
    const double dfDeclination = 0.006918 - 0.399912 * std::cos(g) + 0.070257 * std::sin(g) -
                                 0.006758 * std::cos(2.0 * g) + 0.000907 * std::sin(2.0 * g) -
                                 0.002697 * std::cos(3.0 * g) + 0.00148 * std::sin(3.0 * g);
    const double E = 7.5e-5 + 0.001868 * std::cos(g) - 0.032077 * std::sin(g) -
                     0.014615 * std::cos(2.0 * g) - 0.040849 * std::sin(2.0 * g);
    const double dfEquationHours = E * 12.0 * 60.0 / kPi / 60.0;
    const double H = (dfEquationHours + longitude / 15.0 + T - 12.0) * 15.0 * kRadPerDeg;

    const double P = latitude * kRadPerDeg;
    const double sP = std::sin(P);
    const double cP = std::cos(P);
    const double sD = std::sin(dfDeclination);
    const double cD = std::cos(dfDeclination);
    // Rounding can carry the sine of a sun at the zenith beyond 1.
    const double e = std::asin(std::clamp(cP * cD * std::cos(H) + sP * sD, -1.0, 1.0));
    const double a = std::clamp(std::sin(H) * cD / std::cos(e), -1.0, 1.0);
    const double b = (sP * cD * std::cos(H) - sD * cP) / std::cos(e);

    double A = std::asin(a);
    if (b <= 0.0) {
        A = kPi - A;
    } else if (a <= 0.0) {
        A += kTwoPi;
    }
    A += kPi;
    if (A > kTwoPi) {
        A -= kTwoPi;
    }
    zenith = static_cast<float>(90.0 - e * kDegPerRad);
    azimuth = static_cast<float>(A / kRadPerDeg);
}

}  // namespace vetra::utils
