// Earth-fixed to geodetic: Newton's method on a quartic in t = tan(latitude), three steps from the
// surface to any height.

#include "vetra/base/utils/geo/ellipcalc.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "vetra/base/utils/geo/geodeticmath.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

using namespace vetra::utils::geo;

namespace {

constexpr double kWgs84SemiMajor = 6378137.0;
constexpr double kWgs84EccSq = 0.00669437999014;
constexpr double kEpsilon = std::numeric_limits<double>::epsilon();

void CheckEllipsoid(double dfSemiMajor, double dfEccSq) {
    using vetra::ParameterException;
    if (dfSemiMajor <= 0.0) {
        throw ParameterException("dfSemiMajor", ParameterException::eInvalid,
                                 FormatString("%lf", dfSemiMajor), "> 0.0",
                                 "Semi-major axis length must be a positive number", VETRA_HERE);
    }
    if (dfEccSq < 0.0) {
        throw ParameterException(
            "dfEccSq", ParameterException::eInvalid, FormatString("%lf", dfEccSq), ">= 0.0",
            "Eccentricity squared must be zero or a positive number", VETRA_HERE);
    }
}

}  // namespace

EllipCalc::EllipCalc() : EllipCalc(kWgs84SemiMajor, kWgs84EccSq) {}

EllipCalc::EllipCalc(double dfSemiMajor, double dfEccSq) : hgtTol(kHgtTol) {
    SetEllipsoid(dfSemiMajor, dfEccSq);
    SetLsrOrigin(0.0, 0.0, 0.0);
}

bool EllipCalc::operator==(const EllipCalc& oOther) const {
    const auto fnNear = [](double x, double y, double dfTol) { return std::abs(x - y) <= dfTol; };
    return this == &oOther ||
           (fnNear(semiMajor, oOther.semiMajor, kEpsilon) &&
            fnNear(eccSq, oOther.eccSq, kEpsilon) && fnNear(hgtTol, oOther.hgtTol, kEpsilon) &&
            fnNear(lsrOriginEcf[0], oOther.lsrOriginEcf[0], 1e-6) &&
            fnNear(lsrOriginEcf[1], oOther.lsrOriginEcf[1], 1e-6) &&
            fnNear(lsrOriginEcf[2], oOther.lsrOriginEcf[2], 1e-6));
}

void EllipCalc::SetEllipsoid(double dfSemiMajor, double dfEccSq) {
    CheckEllipsoid(dfSemiMajor, dfEccSq);
    semiMajor = dfSemiMajor;
    eccSq = dfEccSq;
    semiMajorSq = dfSemiMajor * dfSemiMajor;
    oneMinusEccSq = 1.0 - dfEccSq;
    semiMinorSq = oneMinusEccSq * semiMajorSq;
    semiMinor = std::sqrt(semiMinorSq);
    axisRatioSq = semiMinorSq / semiMajorSq;
    eccFourth = dfEccSq * dfEccSq;
}

void EllipCalc::SetHgtTol(double dfHgtTol) { hgtTol = dfHgtTol; }
double EllipCalc::GetHgtTol() const { return hgtTol; }

void EllipCalc::SetLsrOrigin(double dfLon, double dfLat, double dfHgt) {
    lsrOriginGeo[0] = dfLon;
    lsrOriginGeo[1] = dfLat;
    lsrOriginGeo[2] = dfHgt;
    GeoToXYZ(dfLon, dfLat, dfHgt, lsrOriginEcf[0], lsrOriginEcf[1], lsrOriginEcf[2]);
    FillLocalAxes(dfLon, dfLat, lsrMatrix);
}

void EllipCalc::GetLsrOrigin(double& dfLon, double& dfLat, double& dfHgt) const {
    dfLon = lsrOriginGeo[0];
    dfLat = lsrOriginGeo[1];
    dfHgt = lsrOriginGeo[2];
}

const double& EllipCalc::SemiMajor() const { return semiMajor; }
double EllipCalc::SemiMinor() const { return semiMinor; }
const double& EllipCalc::EccSq() const { return eccSq; }
double EllipCalc::EccSq(double a, double b) { return a == 0.0 ? 0.0 : (a - b) * (a + b) / (a * a); }
double EllipCalc::Ecc() const { return std::sqrt(eccSq); }
// 1 - sqrt(1 - e^2), without the difference of two numbers that are nearly equal.
double EllipCalc::Flattening() const { return eccSq / (1.0 + std::sqrt(oneMinusEccSq)); }
double EllipCalc::InvFlattening() const { return (1.0 + std::sqrt(oneMinusEccSq)) / eccSq; }
double EllipCalc::SecondEcc() const { return std::sqrt(eccSq / oneMinusEccSq); }

double EllipCalc::MeridianRadius(double dfLat) const {
    const double s = std::sin(dfLat);
    const double w = 1.0 - eccSq * (s * s);
    return oneMinusEccSq * semiMajor / (w * std::sqrt(w));
}

double EllipCalc::PrimeVerticalRadius(double dfLat) const {
    return PrimeVerticalRadius(std::sin(dfLat), std::cos(dfLat));
}

double EllipCalc::PrimeVerticalRadius(double dfSinLat, double dfCosLat) const {
    return semiMajorSq /
           std::sqrt(semiMinorSq * (dfSinLat * dfSinLat) + semiMajorSq * (dfCosLat * dfCosLat));
}

void EllipCalc::GeoToXYZ(double dfLon, double dfLat, double dfHgt, double& X, double& Y,
                         double& Z) const {
    GeoToEarthFixed(dfLon, dfLat, dfHgt, semiMajor, eccSq, X, Y, Z);
}

void EllipCalc::XYZToGeo(double X, double Y, double Z, double& dfLon, double& dfLat,
                         double& dfHgt) const {
    const double p2 = X * X + Y * Y;
    dfLon = PolarAngle(X, Y);
    LatHgt(p2, Z, true, dfLat, dfHgt);
}

void EllipCalc::XYZToLatHgt(double X, double Y, double Z, double& dfLat, double& dfHgt) const {
    LatHgt(X * X + Y * Y, Z, false, dfLat, dfHgt);
}

void EllipCalc::XYZToLon(double X, double Y, double /*Z*/, double& dfLon) const {
    dfLon = PolarAngle(X, Y);
}

void EllipCalc::LatHgt(double p2, double Z, bool bPoleForm, double& dfLat, double& dfHgt) const {
    if (p2 == 0.0) {
        dfLat = PoleLatitude(Z);
        dfHgt = std::abs(Z) - semiMinor;
        return;
    }
    const double p = std::sqrt(p2);
    if (Z == 0.0) {
        dfLat = 0.0;
        dfHgt = p - semiMajor;
        return;
    }
    if (bPoleForm && std::abs(Z) >= 1e7 * (oneMinusEccSq * p)) {
        // The angle from the pole, seen from the pole's centre of curvature, and the little that
        // the surface has fallen by then.
        const double h = std::abs(Z) - semiMinor;
        const double dfAngle = p / (semiMajorSq / semiMinor + h);
        dfLat = Z >= 0.0 ? kHalfPi - dfAngle : dfAngle - kHalfPi;
        dfHgt = h + 0.5 * p * dfAngle;
        return;
    }
    // Beyond 1e100 nothing changes any more, but squares would overflow.
    const double t = std::clamp(NewtonTanLat(p, Z), -1e100, 1e100);
    dfLat = Atan2(t, 1.0);
    // The length of the projection on the normal, p cos(lat) + Z sin(lat) - a^2 / N: p / cos(lat) -
    // N would divide one vanishing number by another near a pole.
    dfHgt = (p + Z * t - std::sqrt(semiMajorSq + semiMinorSq * (t * t))) / std::sqrt(1.0 + t * t);
}

// The quartic f(t) = p2 t^4 + k1 t^3 + k2 t^2 + k3 t + k4 has, with c = 1 - e^2, the coefficients
// k1 = -2 p Z, k2 = (p2 - e^4 a^2) / c + Z^2, k3 = k1 / c and k4 = Z^2 / c. It is evaluated as
// w^2 (t^2 + 1 / c) - e^4 a^2 / c t^2 with w = p t - Z, which doesn't subtract nearly equal
// products of large numbers.
double EllipCalc::NewtonTanLat(double p, double Z) const {
    const double dfInvC = 1.0 / oneMinusEccSq;
    const double g = eccFourth * semiMajorSq * dfInvC;
    double t = Z / GuessAxisPart(p, Z, semiMajor, eccSq);
    for (int n = 0; n < kMaxIterations; ++n) {
        const double w = p * t - Z;
        const double q = t * t + dfInvC;
        const double f = w * w * q - g * t * t;
        const double dfHalfSlope = w * (p * q + w * t) - g * t;
        const double dfStep = 0.5 * f / dfHalfSlope;
        // On a sphere the guess is exact, a double root: 0 / 0.
        if (!std::isfinite(dfStep)) {
            break;
        }
        t -= dfStep;
        // Relative, as 1e-10 is millimetres at great height for a small t, and less than a unit in
        // the last place for a large one.
        if (std::abs(dfStep) <= 1e-10 * std::abs(t)) {
            break;
        }
    }
    return t;
}

void EllipCalc::EcfToLsr(double X, double Y, double Z, double& dfEast, double& dfNorth,
                         double& dfUp) const {
    RotateToLocal(lsrMatrix, X - lsrOriginEcf[0], Y - lsrOriginEcf[1], Z - lsrOriginEcf[2], dfEast,
                  dfNorth, dfUp);
}

void EllipCalc::LsrToEcf(double dfEast, double dfNorth, double dfUp, double& X, double& Y,
                         double& Z) const {
    double dx, dy, dz;
    RotateFromLocal(lsrMatrix, dfEast, dfNorth, dfUp, dx, dy, dz);
    X = lsrOriginEcf[0] + dx;
    Y = lsrOriginEcf[1] + dy;
    Z = lsrOriginEcf[2] + dz;
}

void EllipCalc::GeoToLsr(double dfLon, double dfLat, double dfHgt, double& dfEast, double& dfNorth,
                         double& dfUp) const {
    double X, Y, Z;
    GeoToXYZ(dfLon, dfLat, dfHgt, X, Y, Z);
    EcfToLsr(X, Y, Z, dfEast, dfNorth, dfUp);
}

void EllipCalc::LsrToGeo(double dfEast, double dfNorth, double dfUp, double& dfLon, double& dfLat,
                         double& dfHgt) const {
    double X, Y, Z;
    LsrToEcf(dfEast, dfNorth, dfUp, X, Y, Z);
    XYZToGeo(X, Y, Z, dfLon, dfLat, dfHgt);
}

void EllipCalc::GeoToLsr(double dfLon, double dfLat, double dfHgt, double dfLon0, double dfLat0,
                         double dfHgt0, double& dfEast, double& dfNorth, double& dfUp) const {
    EllipCalc oThere(*this);
    oThere.SetLsrOrigin(dfLon0, dfLat0, dfHgt0);
    oThere.GeoToLsr(dfLon, dfLat, dfHgt, dfEast, dfNorth, dfUp);
}

void EllipCalc::LsrToGeo(double dfEast, double dfNorth, double dfUp, double dfLon0, double dfLat0,
                         double dfHgt0, double& dfLon, double& dfLat, double& dfHgt) const {
    EllipCalc oThere(*this);
    oThere.SetLsrOrigin(dfLon0, dfLat0, dfHgt0);
    oThere.LsrToGeo(dfEast, dfNorth, dfUp, dfLon, dfLat, dfHgt);
}

int EllipCalc::ProjectToHeight(const double* padfOrigin, const double* padfDirection, double dfHgt,
                               double& dfRange, double* padfPoint, double* padfGeo) const {
    RefineToHeight(
        padfOrigin, padfDirection, dfHgt, hgtTol, kMaxIterations, dfRange, padfPoint, padfGeo,
        [this](const double* p, double* g) { XYZToGeo(p[0], p[1], p[2], g[0], g[1], g[2]); },
        [this](const double* g, double* p) { GeoToXYZ(g[0], g[1], g[2], p[0], p[1], p[2]); });
    padfGeo[2] = dfHgt;
    return 0;
}

int EllipCalc::ProjectToHeight(const double* padfOrigin, const double* padfDirection, double dfHgt,
                               double& dfRange, double* padfPoint) const {
    double adfGeo[3];
    return ProjectToHeight(padfOrigin, padfDirection, dfHgt, dfRange, padfPoint, adfGeo);
}

int EllipCalc::ProjectToInflatedEllipsoid(const double* padfOrigin, const double* padfDirection,
                                          double dfHgt, double* padfPoint, double& dfRange) const {
    if (!IntersectInflated(padfOrigin, padfDirection, semiMajor, eccSq, dfHgt, dfRange)) {
        return -1;
    }
    for (int i = 0; i < 3; ++i) {
        padfPoint[i] = padfOrigin[i] + dfRange * padfDirection[i];
    }
    return 0;
}
