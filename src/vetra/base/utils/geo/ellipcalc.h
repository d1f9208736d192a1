#ifndef VETRA_BASE_UTILS_GEO_ELLIPCALC_H
#define VETRA_BASE_UTILS_GEO_ELLIPCALC_H

#include "vetra/export.h"

/// A reference ellipsoid with a local frame, and conversions between three kinds of coordinates:
///
/// - geodetic (Geo): longitude and latitude in radians and ellipsoidal height in metres, always in
///   this order. Longitude is positive to the east and comes out in (-pi, pi], latitude is positive
///   to the north, height is positive outside.
/// - earth-fixed (XYZ, Ecf): Cartesian metres with the origin at the ellipsoid's centre, X towards
///   longitude 0 on the equator, Y towards longitude pi/2, Z towards the north pole.
/// - local (Lsr): Cartesian metres with the axes east, north and up at a local origin, up being
///   the ellipsoid's normal.
///
/// Nothing converts to degrees. Conversions have no failure path: NaN and infinite coordinates
/// give NaN or the limit, after a bounded number of steps. Const operations may run concurrently on
/// one object. A new calculator has the ellipsoid of WGS 84 and its local origin at longitude 0,
/// latitude 0, height 0.
///
/// Accuracy: `GeoToXYZ` is within 1.5e-8 m up to 40000 km height. `XYZToGeo` and `XYZToLatHgt` are
/// within 2e-8 m from -10 km to 5000 km and within 1e-7 m up to 40000 km, everywhere on the earth.
/// Within about 50 km of the centre, where a point has several normals, they give one of them.
class VETRA_EXPORT EllipCalc {
 public:
    /// The ellipsoid of WGS 84: a = 6378137 m, e squared = 0.00669437999014.
    EllipCalc();
    /// \throws ParameterException as `SetEllipsoid` does
    EllipCalc(double dfSemiMajor, double dfEccSq);

    /// Same ellipsoid and height tolerance, both to 2.220446049250313e-16, and the same earth-fixed
    /// local origin, to 1e-6 m.
    bool operator==(const EllipCalc& oOther) const;
    /// The opposite of `operator==`.
    bool operator!=(const EllipCalc& oOther) const { return !(*this == oOther); }

    /// Sets the ellipsoid. The local frame stays as it was computed on the earlier ellipsoid, until
    /// the next `SetLsrOrigin`.
    ///
    /// \param dfSemiMajor  semi-major axis in metres, above 0
    /// \param dfEccSq      first eccentricity squared, at least 0; 0 is a sphere. 1 and more, which
    ///                     isn't checked, is no ellipsoid, and results are without meaning.
    /// \throws ParameterException for other values; nothing changes then
    void SetEllipsoid(double dfSemiMajor, double dfEccSq);

    /// Height tolerance of `ProjectToHeight` in metres, not checked. 0.0001 by default.
    void SetHgtTol(double dfHgtTol);
    /// Height tolerance of `ProjectToHeight` in metres.
    double GetHgtTol() const;

    /// Puts the local frame at a geodetic point of the current ellipsoid.
    void SetLsrOrigin(double dfLon, double dfLat, double dfHgt);
    /// What `SetLsrOrigin` was given.
    void GetLsrOrigin(double& dfLon, double& dfLat, double& dfHgt) const;

    /// a, in metres.
    const double& SemiMajor() const;
    /// b = a sqrt(1 - e squared), in metres.
    double SemiMinor() const;
    /// First eccentricity squared, (a^2 - b^2) / a^2.
    const double& EccSq() const;
    /// First eccentricity squared of semi-axes a and b; 0 for a = 0.
    static double EccSq(double a, double b);
    /// First eccentricity.
    double Ecc() const;
    /// (a - b) / a.
    double Flattening() const;
    /// a / (a - b); infinite for a sphere.
    double InvFlattening() const;
    /// Second eccentricity, sqrt((a^2 - b^2) / b^2).
    double SecondEcc() const;

    /// Radius of curvature in the meridian at a latitude: a (1 - e^2) / (1 - e^2 sin^2 lat)^1.5.
    double MeridianRadius(double dfLat) const;
    /// Radius of curvature in the prime vertical at a latitude, which is the length of the normal
    /// down to the axis: N = a^2 / sqrt(b^2 sin^2 lat + a^2 cos^2 lat).
    double PrimeVerticalRadius(double dfLat) const;
    /// The same from the latitude's sine and cosine.
    double PrimeVerticalRadius(double dfSinLat, double dfCosLat) const;

    /// Geodetic to earth-fixed coordinates.
    void GeoToXYZ(double dfLon, double dfLat, double dfHgt, double& X, double& Y, double& Z) const;

    /// On the axis the longitude is 0, the latitude pi/2 or -pi/2 (pi/2 at the centre), and the
    /// height |Z| - b. In the equatorial plane the latitude is 0 and the height the distance to the
    /// axis less a. On the half plane of longitude pi the longitude is pi, never -pi.
    void XYZToGeo(double X, double Y, double Z, double& dfLon, double& dfLat, double& dfHgt) const;
    /// Latitude and height of `XYZToGeo`.
    void XYZToLatHgt(double X, double Y, double Z, double& dfLat, double& dfHgt) const;
    /// Longitude of `XYZToGeo`.
    void XYZToLon(double X, double Y, double Z, double& dfLon) const;

    /// Position of an earth-fixed point in the local frame: translated and turned.
    void EcfToLsr(double X, double Y, double Z, double& dfEast, double& dfNorth,
                  double& dfUp) const;
    /// Earth-fixed coordinates of a point of the local frame.
    void LsrToEcf(double dfEast, double dfNorth, double dfUp, double& X, double& Y,
                  double& Z) const;
    /// Position of a geodetic point in the local frame.
    void GeoToLsr(double dfLon, double dfLat, double dfHgt, double& dfEast, double& dfNorth,
                  double& dfUp) const;
    /// Geodetic coordinates of a point of the local frame, as of `XYZToGeo`.
    void LsrToGeo(double dfEast, double dfNorth, double dfUp, double& dfLon, double& dfLat,
                  double& dfHgt) const;
    /// Against the local origin (\p dfLon0, \p dfLat0, \p dfHgt0) in place of the object's own.
    void GeoToLsr(double dfLon, double dfLat, double dfHgt, double dfLon0, double dfLat0,
                  double dfHgt0, double& dfEast, double& dfNorth, double& dfUp) const;
    /// Against the local origin (\p dfLon0, \p dfLat0, \p dfHgt0) in place of the object's own.
    void LsrToGeo(double dfEast, double dfNorth, double dfUp, double dfLon0, double dfLat0,
                  double dfHgt0, double& dfLon, double& dfLat, double& dfHgt) const;

    /// Follows a ray to a constant ellipsoidal height, from a first guess of the range.
    ///
    /// At most 100 times, while the height of the point on the ray is off by more than the height
    /// tolerance, the range becomes the distance from the origin to the place at height \p dfHgt
    /// above or below that point. Each time shrinks the error by the squared sine of the ray's
    /// angle from the vertical, so that 100 are enough up to about 60 degrees. Whether the
    /// tolerance was met, and at which of two intersections, is not reported: compare the height of
    /// \p padfPoint with \p dfHgt.
    ///
    /// \param padfOrigin     earth-fixed X, Y, Z in metres
    /// \param padfDirection  earth-fixed; should be of unit length, as it is used as given
    /// \param dfHgt          wanted height in metres
    /// \param dfRange        in: first guess, out: range, in multiples of the direction
    /// \param padfPoint      out: earth-fixed X, Y, Z on the ray
    /// \param padfGeo        out: longitude and latitude of the point, and \p dfHgt
    /// \returns 0
    int ProjectToHeight(const double* padfOrigin, const double* padfDirection, double dfHgt,
                        double& dfRange, double* padfPoint, double* padfGeo) const;
    /// The same without the geodetic coordinates.
    int ProjectToHeight(const double* padfOrigin, const double* padfDirection, double dfHgt,
                        double& dfRange, double* padfPoint) const;

    /// The nearer intersection of a ray with the ellipsoid enlarged by a height.
    ///
    /// The enlarged surface is an ellipsoid with the semi-axis a + h. For h = 0 it is the ellipsoid
    /// itself; otherwise it lies, away from the equator, below the surface of constant height: by
    /// up to 5 cm for 10 km, 5 m for 100 km and 400 m for 1000 km.
    ///
    /// \param padfOrigin     earth-fixed X, Y, Z in metres, outside of the enlarged ellipsoid
    /// \param padfDirection  earth-fixed; should be of unit length, as it is used as given
    /// \param dfHgt          height in metres
    /// \param padfPoint      out: earth-fixed X, Y, Z
    /// \param dfRange        out: multiples of the direction from origin to point, metres for a
    ///                       unit direction
    /// \returns 0, or -1 with nothing written: the ray doesn't point to the centre's side, misses
    ///          or only touches the surface, starts inside or on it, or has NaN in it
    int ProjectToInflatedEllipsoid(const double* padfOrigin, const double* padfDirection,
                                   double dfHgt, double* padfPoint, double& dfRange) const;

 private:
    /// With the pole form a closed form takes the place of the iteration very close to a pole.
    void LatHgt(double p2, double Z, bool bPoleForm, double& dfLat, double& dfHgt) const;
    /// Newton's method for the tangent of the latitude.
    double NewtonTanLat(double p, double Z) const;

    double semiMajor;
    double eccSq;
    double semiMajorSq;
    double semiMinor;
    double semiMinorSq;
    double axisRatioSq;
    double oneMinusEccSq;
    double eccFourth;
    double hgtTol;
    double lsrOriginEcf[3];
    double lsrOriginGeo[3];
    /// Row-major; its columns are the directions east, north and up.
    double lsrMatrix[9];
};

#endif  // VETRA_BASE_UTILS_GEO_ELLIPCALC_H
