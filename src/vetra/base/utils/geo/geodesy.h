#ifndef VETRA_BASE_UTILS_GEO_GEODESY_H
#define VETRA_BASE_UTILS_GEO_GEODESY_H

#include "vetra/export.h"

/// \file
/// Geodetic functions that take the ellipsoid on each call: a is its semi-major axis in metres, e2
/// its first eccentricity squared, from 0 to below 1. For many conversions on one ellipsoid see
/// `EllipCalc`, which has the same frames:
///
/// - geodetic: longitude (east positive, comes out in (-pi, pi]) and latitude (north positive) in
///   radians and ellipsoidal height in metres, in this order;
/// - earth-fixed: Cartesian X, Y, Z in metres from the ellipsoid's centre, X towards longitude 0 on
///   the equator, Y towards longitude pi/2, Z towards the north pole;
/// - local: east, north, up in metres, up being the ellipsoid's normal at the local origin.
///
/// A pointer is to three doubles; an output may be the same triplet as an input. Nothing is checked
/// and nothing throws: NaN and infinite coordinates give NaN or the limit. The functions keep no
/// state. Accuracy is that of `EllipCalc`.

/// (0, 0, 0) for a = 0.
/// @{
VETRA_EXPORT void GeoToXYZ(double dfLon, double dfLat, double dfHgt, double a, double e2, double& X,
                           double& Y, double& Z);
VETRA_EXPORT void GeoToXYZ(const double* padfGeo, double a, double e2, double* padfXyz);
/// @}

/// On the axis the longitude is 0, the latitude pi/2 or -pi/2 (pi/2 at the centre), and the height
/// |Z| - b. On the half plane of longitude pi the longitude is pi, never -pi.
/// @{
VETRA_EXPORT void XYZToGeo(double X, double Y, double Z, double a, double e2, double& dfLon,
                           double& dfLat, double& dfHgt);
VETRA_EXPORT void XYZToGeo(const double* padfXyz, double a, double e2, double* padfGeo);
/// @}

/// Position of a geodetic point in the local frame at a geodetic origin.
VETRA_EXPORT void GeoToLSR(const double* padfGeo, const double* padfOriginGeo, double a, double e2,
                           double* padfLocal);
/// Geodetic coordinates of a position in the local frame at a geodetic origin.
VETRA_EXPORT void LSRToGeo(const double* padfLocal, const double* padfOriginGeo, double a,
                           double e2, double* padfGeo);

/// Turns an earth-fixed vector into the directions east, north and up at a longitude and latitude:
/// a rotation without translation.
VETRA_EXPORT void XYZToLSR(const double* padfXyz, double dfLon, double dfLat, double* padfLocal);
/// The inverse of `XYZToLSR`.
VETRA_EXPORT void LSRToXYZ(const double* padfLocal, double dfLon, double dfLat, double* padfXyz);

/// The direction in the plane from point 1 to point 2, in degrees in (-180, 180], from the +y axis
/// towards the +x axis: with x to the east and y to the north, clockwise from north. 0 for equal
/// points.
VETRA_EXPORT double GetAzimuth(double x1, double y1, double x2, double y2);

/// The point in a direction from the centre, on the ellipsoid enlarged by a height.
///
/// The enlarged surface is an ellipsoid with the semi-axis a + h. For h = 0 it is the ellipsoid
/// itself; otherwise it lies, away from the equator, below the surface of constant height: by up
/// to 5 cm for 10 km, 5 m for 100 km and 400 m for 1000 km.
///
/// \param padfVector  earth-fixed direction, of any length whose square is a normal double
/// \param a           semi-major axis in metres
/// \param e2          first eccentricity squared
/// \param h           height in metres
/// \param padfPoint   out: earth-fixed X, Y, Z in metres
/// \returns 0, or -1 with nothing written for a zero vector or one with NaN
VETRA_EXPORT int ProjectOriginToEllipsoid(const double* padfVector, double a, double e2, double h,
                                          double* padfPoint);

/// The nearer intersection of a ray with the ellipsoid of `ProjectOriginToEllipsoid`.
///
/// \param padfOrigin     earth-fixed X, Y, Z in metres, outside of the enlarged ellipsoid
/// \param padfDirection  earth-fixed; should be of unit length, as it is used as given
/// \param a              semi-major axis in metres
/// \param e2             first eccentricity squared
/// \param h              height in metres
/// \param padfPoint      out: earth-fixed X, Y, Z in metres
/// \returns 0, or -1 with nothing written: the ray doesn't point to the centre's side, misses or
///          only touches the surface, starts inside or on it, or has NaN in it
VETRA_EXPORT int ProjectToEllipsoid(const double* padfOrigin, const double* padfDirection, double a,
                                    double e2, double h, double* padfPoint);

/// Moves a point on a ray to a constant ellipsoidal height.
///
/// The point that comes in says where on the ray to start, by its distance from the origin. While
/// the height is off by more than a tolerance, the range becomes the distance from the origin to
/// the place at height \p h above or below the point. Each time shrinks the error by the squared
/// sine of the ray's angle from the vertical.
///
/// \param padfOrigin      earth-fixed X, Y, Z in metres
/// \param padfDirection   earth-fixed, of unit length
/// \param a               semi-major axis in metres
/// \param e2              first eccentricity squared
/// \param h               wanted height in metres
/// \param padfPoint       in: first guess, out: the point on the ray, earth-fixed metres
/// \param dfTol           height tolerance in metres
/// \param nMaxIterations  how often the point may move at most; it is put on the ray in any case
/// \returns 0, also if the tolerance was not met
VETRA_EXPORT int ProjectToXYZ(const double* padfOrigin, const double* padfDirection, double a,
                              double e2, double h, double* padfPoint, double dfTol,
                              int nMaxIterations);

#endif  // VETRA_BASE_UTILS_GEO_GEODESY_H
