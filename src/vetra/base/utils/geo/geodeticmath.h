#ifndef VETRA_BASE_UTILS_GEO_GEODETICMATH_H
#define VETRA_BASE_UTILS_GEO_GEODETICMATH_H

#include <algorithm>
#include <cmath>

#include "vetra/base/utils/geo/trigonometry.h"

/// What `EllipCalc` and the free functions share. Lengths are in metres, angles in radians; a and b
/// are the semi-axes, e2 is the first eccentricity squared.
namespace vetra::utils::geo {

constexpr double kPi = 3.141592653589793;
constexpr double kHalfPi = 1.5707963267948966;
constexpr double kDegPerRad = 57.29577951308232;
constexpr double kHgtTol = 0.0001;
constexpr int kMaxIterations = 100;

/// The angle of (x, y) from the x axis towards the y axis, in (-pi, pi]; 0 for the zero vector.
inline double PolarAngle(double x, double y) {
    if (y == 0.0) {
        return x >= 0.0 ? 0.0 : (x < 0.0 ? kPi : x);
    }
    const double dfAngle = Atan2(y, x);
    return dfAngle == -kPi ? kPi : dfAngle;
}

/// The latitude on the axis: north at the centre, NaN for NaN.
inline double PoleLatitude(double Z) { return Z >= 0.0 ? kHalfPi : (Z < 0.0 ? -kHalfPi : Z); }

/// a + b as a rounded sum and what its rounding left (Knuth).
inline void TwoSum(double a, double b, double& dfSum, double& dfRest) {
    dfSum = a + b;
    const double dfPart = dfSum - a;
    dfRest = (a - (dfSum - dfPart)) + (b - dfPart);
}

/// Earth-fixed coordinates of geodetic ones, X = (N + h) cos(lat) cos(lon) and so on. What the
/// rounding of sums, sines and cosines leaves is carried along: at 40000 km, where a unit in the
/// last place is 7 nm, it would add up.
inline void GeoToEarthFixed(double dfLon, double dfLat, double dfHgt, double a, double e2,
                            double& X, double& Y, double& Z) {
    const SinCosPair o = SinCos(dfLon, dfLat);
    const double s = o.s[1];
    const double c = o.c[1];
    const double N = a / std::sqrt(1.0 - e2 * (s * s));
    double R, RRest, V, VRest;
    TwoSum(N, dfHgt, R, RRest);
    TwoSum(N * (1.0 - e2), dfHgt, V, VRest);
    const double t = R * c;
    const double tRest = R * o.cRest[1] + RRest * c;
    X = t * o.c[0] + (t * o.cRest[0] + tRest * o.c[0]);
    Y = t * o.s[0] + (t * o.sRest[0] + tRest * o.s[0]);
    Z = V * s + (V * o.sRest[1] + VRest * s);
}

/// The part of p in a first guess of the latitude, tan(lat) = Z / result: (1 - e2) p, which is
/// exact on the surface, and above the sphere of radius a, where that would leave half a dozen more
/// iterations, nearly as exact by the distance from the centre.
inline double GuessAxisPart(double p, double Z, double a, double e2) {
    const double r = std::sqrt(p * p + Z * Z);
    return r > a ? p * (1.0 - e2 * a / r) : p * (1.0 - e2);
}

/// Latitude and height from a latitude that is nearly right, given by its tangent y / x.
///
/// One step of Bowring's iteration ("Transformation from spatial to geographical coordinates",
/// Survey Review 23, 1976) squares the latitude's error, which makes it as exact as doubles are
/// after any iteration that came near. The height is the length of the projection on the normal,
/// p cos(lat) + Z sin(lat) - a^2 / N: it keeps its digits at the poles, where p / cos(lat) - N
/// divides one vanishing number by another, and errs only by the square of the latitude's error.
inline void CloseLatHgt(double p, double Z, double y, double x, double a, double b, double e2,
                        double& dfLat, double& dfHgt) {
    const double u = a * x;
    const double v = b * y;
    const double q = 1.0 / std::sqrt(u * u + v * v);
    const double cb = u * q;
    const double sb = v * q;
    double dfNum = Z + e2 * a * (a / b) * (sb * sb * sb);
    double dfDen = p - e2 * a * (cb * cb * cb);
    if (!(dfDen > 0.0)) {  // deep inside, where several normals meet
        dfNum = y;
        dfDen = std::abs(x);
    }
    const double dfNumSq = dfNum * dfNum;
    const double dfDenSq = dfDen * dfDen;
    const double r = 1.0 / std::sqrt(dfNumSq + dfDenSq);
    dfLat = Atan2(dfNum, dfDen);
    dfHgt = p * (dfDen * r) + Z * (dfNum * r) - std::sqrt(b * b * dfNumSq + a * a * dfDenSq) * r;
}

/// Fills a rotation, row-major, whose columns are the directions east, north and up at a longitude
/// and latitude. Element 6 is exactly 0.
inline void FillLocalAxes(double dfLon, double dfLat, double* padfM) {
    const SinCosPair o = SinCos(dfLon, dfLat);
    const double sL = o.s[0];
    const double cL = o.c[0];
    const double sP = o.s[1];
    const double cP = o.c[1];
    padfM[0] = -sL;
    padfM[1] = -sP * cL;
    padfM[2] = cP * cL;
    padfM[3] = cL;
    padfM[4] = -sP * sL;
    padfM[5] = cP * sL;
    padfM[6] = 0.0;
    padfM[7] = cP;
    padfM[8] = sP;
}

/// East, north and up of an earth-fixed vector.
inline void RotateToLocal(const double* padfM, double dx, double dy, double dz, double& e,
                          double& n, double& u) {
    e = padfM[0] * dx + padfM[3] * dy;
    n = padfM[1] * dx + padfM[4] * dy + padfM[7] * dz;
    u = padfM[2] * dx + padfM[5] * dy + padfM[8] * dz;
}

/// The earth-fixed vector of an east, north, up one.
inline void RotateFromLocal(const double* padfM, double e, double n, double u, double& dx,
                            double& dy, double& dz) {
    dx = padfM[0] * e + padfM[1] * n + padfM[2] * u;
    dy = padfM[3] * e + padfM[4] * n + padfM[5] * u;
    dz = padfM[7] * n + padfM[8] * u;
}

/// The squared ratio of the axes, semi-minor over semi-major, of an ellipsoid that is enlarged by
/// a height h. 1 - e2 for h = 0.
inline double InflatedAxisRatioSq(double a, double e2, double h) {
    const double R = h + a;
    const double g = 2.0 * R * h;
    const double k = std::sqrt(1.0 - e2);
    return 1.0 - ((1.0 - k) * g + R * R * e2) / (g + R * R + h * h);
}

/// Distance, in multiples of D, from O along D to the nearer intersection with the ellipsoid
/// enlarged by h.
/// \returns false for a miss or a tangent, for O inside or on the surface, for a surface behind O,
///          and where NaN is among the arguments; then \p t is not written.
inline bool IntersectInflated(const double* O, const double* D, double a, double e2, double h,
                              double& t) {
    // Kilometres, so that the squares below are of moderate size.
    const double Ox = O[0] / 1000.0;
    const double Oy = O[1] / 1000.0;
    const double Oz = O[2] / 1000.0;
    const double dfLength = std::sqrt(Ox * Ox + Oy * Oy + Oz * Oz);
    const double dfInward = -(Ox / dfLength * D[0] + Oy / dfLength * D[1] + Oz / dfLength * D[2]);
    if (!(dfInward > 0.0)) {
        return false;
    }
    const double q = InflatedAxisRatioSq(a, e2, h);
    const double Rk = (h + a) / 1000.0;
    const double A = q * D[0] * D[0] + q * D[1] * D[1] + D[2] * D[2];
    const double B = 2.0 * q * D[0] * Ox + 2.0 * q * D[1] * Oy + 2.0 * D[2] * Oz;
    const double C = q * Ox * Ox + q * Oy * Oy + Oz * Oz - q * (Rk * Rk);
    const double dfDisc = B * B - 4.0 * A * C;
    if (!(dfDisc > 0.0)) {
        return false;
    }
    const double dfNearer = (-B - std::sqrt(dfDisc)) / (2.0 * A) * 1000.0;
    if (!(dfNearer > 0.0)) {
        return false;
    }
    t = dfNearer;
    return true;
}

inline double Distance(const double* A, const double* B) {
    const double dx = B[0] - A[0];
    const double dy = B[1] - A[1];
    const double dz = B[2] - A[2];
    return std::sqrt(dx * dx + dy * dy + dz * dz);
}

/// Moves a point along the ray O + r D towards a height: as long as the point's height is off by
/// more than a tolerance, the range becomes the distance from O to the place at the wanted height
/// above or below the point.
///
/// \param r       in: first guess of the range, out: the last range
/// \param padfPoint, padfGeo  out: the last point on the ray, earth-fixed and geodetic
/// \param fnToGeo, fnToXyz    conversions between triplets (const double* in, double* out)
template <typename ToGeo, typename ToXyz>
void RefineToHeight(const double* O, const double* D, double H, double dfTol, int nMaxIterations,
                    double& r, double* padfPoint, double* padfGeo, ToGeo fnToGeo, ToXyz fnToXyz) {
    double P[3];  // the caller's point may be the origin
    const auto fnAlongRay = [&] {
        for (int i = 0; i < 3; ++i) {
            P[i] = O[i] + r * D[i];
        }
        fnToGeo(P, padfGeo);
    };
    fnAlongRay();
    for (int n = 0; n < nMaxIterations && std::abs(padfGeo[2] - H) > dfTol; ++n) {
        padfGeo[2] = H;
        fnToXyz(padfGeo, P);
        r = Distance(O, P);
        fnAlongRay();
    }
    std::copy(P, P + 3, padfPoint);
}

}  // namespace vetra::utils::geo

#endif  // VETRA_BASE_UTILS_GEO_GEODETICMATH_H
