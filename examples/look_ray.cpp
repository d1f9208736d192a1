// A camera above the ground looks down: from a geodetic point by its local frame and a look vector
// to the place that the ray meets, and back.

#include <vetra/vetra.h>

#include <cmath>
#include <cstdio>

int main() {
    // [camera]
    const double kRadPerDeg = 3.14159265358979323846 / 180.0;
    const EllipCalc oWgs84;

    // The camera: longitude, latitude, height.
    const double adfCamera[3] = {11.5 * kRadPerDeg, 48.1 * kRadPerDeg, 5000.0};
    double O[3];
    oWgs84.GeoToXYZ(adfCamera[0], adfCamera[1], adfCamera[2], O[0], O[1], O[2]);
    // [camera]

    // [look]
    // It looks to the north-east, 30 degrees off the vertical: east, north, up.
    const double dfAzimuth = 45.0 * kRadPerDeg;
    const double dfOffNadir = 30.0 * kRadPerDeg;
    const double adfLook[3] = {std::sin(dfOffNadir) * std::sin(dfAzimuth),
                               std::sin(dfOffNadir) * std::cos(dfAzimuth), -std::cos(dfOffNadir)};
    double D[3];
    LSRToXYZ(adfLook, adfCamera[0], adfCamera[1], D);
    // [look]

    // [ground]
    // Where the ray meets the ellipsoid, and terrain at 520 m.
    double P[3];
    double dfRange;
    if (oWgs84.ProjectToInflatedEllipsoid(O, D, 0.0, P, dfRange) != 0) {
        std::puts("the ray misses the earth");
        return 1;
    }
    std::printf("range to the ellipsoid %.3f m\n", dfRange);
    double adfGround[3];
    oWgs84.ProjectToHeight(O, D, 520.0, dfRange, P, adfGround);
    std::printf("range to 520 m height  %.3f m\n", dfRange);
    std::printf("longitude %.7f, latitude %.7f degrees\n", adfGround[0] / kRadPerDeg,
                adfGround[1] / kRadPerDeg);
    // [ground]

    // [back]
    // The same place as the camera sees it: where it is in the local frame.
    EllipCalc oLocal(oWgs84);
    oLocal.SetLsrOrigin(adfCamera[0], adfCamera[1], adfCamera[2]);
    double e, n, u;
    oLocal.GeoToLsr(adfGround[0], adfGround[1], adfGround[2], e, n, u);
    std::printf("east %.3f, north %.3f, up %.3f m\n", e, n, u);
    std::printf("azimuth %.4f, off nadir %.4f degrees\n", GetAzimuth(0.0, 0.0, e, n),
                std::atan2(std::hypot(e, n), -u) / kRadPerDeg);
    // [back]
    return 0;
}
