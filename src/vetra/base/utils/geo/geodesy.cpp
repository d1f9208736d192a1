#include "vetra/base/utils/geo/geodesy.h"

#include <cmath>

#include "vetra/base/utils/geo/geodeticmath.h"

using namespace vetra::utils::geo;

void GeoToXYZ(double dfLon, double dfLat, double dfHgt, double a, double e2, double& X, double& Y,
              double& Z) {
    if (a == 0.0) {
        X = Y = Z = 0.0;
        return;
    }
    GeoToEarthFixed(dfLon, dfLat, dfHgt, a, e2, X, Y, Z);
}

void GeoToXYZ(const double* padfGeo, double a, double e2, double* padfXyz) {
    GeoToXYZ(padfGeo[0], padfGeo[1], padfGeo[2], a, e2, padfXyz[0], padfXyz[1], padfXyz[2]);
}

// The latitude's direction (x, y) is iterated on the height, which gains two digits a step, and is
// made exact at the end.
void XYZToGeo(double X, double Y, double Z, double a, double e2, double& dfLon, double& dfLat,
              double& dfHgt) {
    const double k = 1.0 - e2;
    const double a2 = a * a;
    const double b2 = k * a2;
    const double b = std::sqrt(b2);
    const double p = std::sqrt(X * X + Y * Y);
    dfLon = PolarAngle(X, Y);
    if (p == 0.0) {
        dfLat = PoleLatitude(Z);
        dfHgt = std::abs(Z) - b;
        return;
    }
    double x = GuessAxisPart(p, Z, a, e2);
    double dfPrevious = 0.0;
    for (int n = 0; n < kMaxIterations; ++n) {
        // With the latitude's sine Z r and cosine x r: p / c - N in a form that keeps its digits
        // near a pole (see CloseLatHgt), and N = a^2 / dfRoot.
        const double dfInvSq = 1.0 / (x * x + Z * Z);
        const double u = std::sqrt(a2 * (x * x) + b2 * (Z * Z));
        const double w = p * x + Z * Z - u;
        const double h = w * std::sqrt(dfInvSq);
        // N e2 / (h + N), of which dfInvSq w u is h dfRoot.
        x = (1.0 - e2 * a2 / (w * u * dfInvSq + a2)) * p;
        // Ends at NaN as well.
        if (!(std::abs(h - dfPrevious) > kHgtTol)) {
            break;
        }
        dfPrevious = h;
    }
    CloseLatHgt(p, Z, Z, x, a, b, e2, dfLat, dfHgt);
}

void XYZToGeo(const double* padfXyz, double a, double e2, double* padfGeo) {
    XYZToGeo(padfXyz[0], padfXyz[1], padfXyz[2], a, e2, padfGeo[0], padfGeo[1], padfGeo[2]);
}

void GeoToLSR(const double* padfGeo, const double* padfOriginGeo, double a, double e2,
              double* padfLocal) {
    double P[3];
    double O[3];
    GeoToXYZ(padfGeo, a, e2, P);
    GeoToXYZ(padfOriginGeo, a, e2, O);
    const double d[3] = {P[0] - O[0], P[1] - O[1], P[2] - O[2]};
    XYZToLSR(d, padfOriginGeo[0], padfOriginGeo[1], padfLocal);
}

void LSRToGeo(const double* padfLocal, const double* padfOriginGeo, double a, double e2,
              double* padfGeo) {
    double O[3];
    double d[3];
    GeoToXYZ(padfOriginGeo, a, e2, O);
    LSRToXYZ(padfLocal, padfOriginGeo[0], padfOriginGeo[1], d);
    XYZToGeo(O[0] + d[0], O[1] + d[1], O[2] + d[2], a, e2, padfGeo[0], padfGeo[1], padfGeo[2]);
}

void XYZToLSR(const double* padfXyz, double dfLon, double dfLat, double* padfLocal) {
    double adfAxes[9];
    FillLocalAxes(dfLon, dfLat, adfAxes);
    RotateToLocal(adfAxes, padfXyz[0], padfXyz[1], padfXyz[2], padfLocal[0], padfLocal[1],
                  padfLocal[2]);
}

void LSRToXYZ(const double* padfLocal, double dfLon, double dfLat, double* padfXyz) {
    double adfAxes[9];
    FillLocalAxes(dfLon, dfLat, adfAxes);
    RotateFromLocal(adfAxes, padfLocal[0], padfLocal[1], padfLocal[2], padfXyz[0], padfXyz[1],
                    padfXyz[2]);
}

double GetAzimuth(double x1, double y1, double x2, double y2) {
    return PolarAngle(y2 - y1, x2 - x1) * kDegPerRad;
}

int ProjectOriginToEllipsoid(const double* padfVector, double a, double e2, double h,
                             double* padfPoint) {
    const double* V = padfVector;
    const double q = InflatedAxisRatioSq(a, e2, h);
    const double Rk = (h + a) / 1000.0;
    const double A = q * V[0] * V[0] + q * V[1] * V[1] + V[2] * V[2];
    const double dfDisc = 4.0 * A * q * (Rk * Rk);
    if (!(dfDisc > 0.0)) {
        return -1;
    }
    const double t = std::sqrt(dfDisc) / (2.0 * A) * 1000.0;
    for (int i = 0; i < 3; ++i) {
        padfPoint[i] = t * V[i];
    }
    return 0;
}

int ProjectToEllipsoid(const double* padfOrigin, const double* padfDirection, double a, double e2,
                       double h, double* padfPoint) {
    double t;
    if (!IntersectInflated(padfOrigin, padfDirection, a, e2, h, t)) {
        return -1;
    }
    for (int i = 0; i < 3; ++i) {
        padfPoint[i] = padfOrigin[i] + t * padfDirection[i];
    }
    return 0;
}

int ProjectToXYZ(const double* padfOrigin, const double* padfDirection, double a, double e2,
                 double h, double* padfPoint, double dfTol, int nMaxIterations) {
    double r = Distance(padfOrigin, padfPoint);
    double adfGeo[3];
    RefineToHeight(
        padfOrigin, padfDirection, h, dfTol, nMaxIterations, r, padfPoint, adfGeo,
        [=](const double* P, double* G) { XYZToGeo(P, a, e2, G); },
        [=](const double* G, double* P) { GeoToXYZ(G, a, e2, P); });
    return 0;
}
