#ifndef VETRA_TESTS_BASE_UTILS_GEO_PRECISE_H
#define VETRA_TESTS_BASE_UTILS_GEO_PRECISE_H

#include <cmath>

/// Geodesy in long double, the yardstick of the tests.
namespace vetra::tests {

constexpr double kA = 6378137.0;
constexpr double kE2 = 0.00669437999014;
constexpr long double kPreciseRadPerDeg = 3.14159265358979323846264338327950288L / 180.0L;

struct PrecisePoint {
    long double x, y, z;

    PrecisePoint operator+(const PrecisePoint& o) const { return {x + o.x, y + o.y, z + o.z}; }
    PrecisePoint operator-(const PrecisePoint& o) const { return {x - o.x, y - o.y, z - o.z}; }
};

inline double Length(const PrecisePoint& o) {
    return static_cast<double>(std::sqrt(o.x * o.x + o.y * o.y + o.z * o.z));
}

/// Earth-fixed metres of longitude, latitude (radians) and height.
inline PrecisePoint PreciseXyz(long double dfLon, long double dfLat, long double dfHgt,
                               long double a = kA, long double e2 = kE2) {
    const long double s = std::sin(dfLat);
    const long double c = std::cos(dfLat);
    const long double N = a / std::sqrt(1.0L - e2 * s * s);
    return {(N + dfHgt) * c * std::cos(dfLon), (N + dfHgt) * c * std::sin(dfLon),
            (N * (1.0L - e2) + dfHgt) * s};
}

}  // namespace vetra::tests

#endif  // VETRA_TESTS_BASE_UTILS_GEO_PRECISE_H
