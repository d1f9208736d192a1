#ifndef VETRA_BASE_UTILS_MATH_INTERPOLATION_H
#define VETRA_BASE_UTILS_MATH_INTERPOLATION_H

#include <vector>

#include "vetra/export.h"

/// \file
/// Interpolation of samples by Lagrange's polynomial: M. Abramowitz, I. A. Stegun, "Handbook of
/// Mathematical Functions", 25.2.1 and 25.2.2. Nodes that coincide give infinities or NaN. A
/// position is on a node if it is less than the machine epsilon of double, 2.220446049250313e-16,
/// away.

/// \p out = (1 - \p t) \p a + \p t \p b.
VETRA_EXPORT void interpolate_linear(const double& a, const double& b, const double& t,
                                     double& out);

/// The cubic through four points (xi, yi), at \p x.
///
/// On a node \p out is that node's sample itself; of several nodes the first one counts. Elsewhere
/// it is the sum, in ascending order of i, of yi times the product, in ascending order of j other
/// than i, of (x - xj) / (xi - xj).
VETRA_EXPORT void interpolate_Lagrange(const double& x0, const double& x1, const double& x2,
                                       const double& x3, const double& y0, const double& y1,
                                       const double& y2, const double& y3, const double& x,
                                       double& out);

/// The polynomial through all points (vdfX[i], vdfY[i]), at \p x.
///
/// \p out is the sum, from 0.0 and in ascending order of i, of num vdfY[i] / den, with num the
/// product of (x - xj) and den that of (xi - xj), from 1.0 and in ascending order of j other than
/// i. It is 0.0 without points. Takes time proportional to the square of their number.
///
/// \param vdfX  nodes
/// \param vdfY  samples, at least as many
/// \param x     position
/// \param out   takes the value
/// \throws ParameterException for fewer samples than nodes; \p out stays as it was.
VETRA_EXPORT void interpolate_Lagrange(const std::vector<double>& vdfX,
                                       const std::vector<double>& vdfY, const double& x,
                                       double& out);

/// The polynomial through vectors at the nodes 0, 1, ..., nNumPoints - 1, at \p x.
///
/// \p padfOut is the sum, from 0.0 and in ascending order of the node i, of w times sample i, with
/// w the quotient of the products of (x - j) and of (i - j), each from 1.0 and in ascending order
/// of j other than i. Takes time proportional to the square of the number of points.
///
/// \param nNumPoints  number of samples; below 1 the result is 0
/// \param padfSamples [nNumPoints x nDimension]
/// \param nDimension  doubles in a sample; below 1 nothing is written
/// \param x           position in units of the sample interval, from the first sample
/// \param padfOut     takes [nDimension] doubles; must not overlap the samples
VETRA_EXPORT void interpolate_Lagrange(int nNumPoints, const double* padfSamples, int nDimension,
                                       double x, double* padfOut);

/// Rate of change, at \p x, of the cubic through four points (xi, yi): its derivative between the
/// nodes.
///
/// On a node \p out is a difference quotient instead: at x0 that of points 0 and 1, at x1 of 0 and
/// 2, at x2 of 1 and 3, at x3 of 2 and 3.
VETRA_EXPORT void interpolate_Lagrange_rate(const double& x0, const double& x1, const double& x2,
                                            const double& x3, const double& y0, const double& y1,
                                            const double& y2, const double& y3, const double& x,
                                            double& out);

/// Derivative of the cubic through samples at -h, 0, h and 2 h, at t h.
///
/// \param y0,y1,y2,y3  the samples
/// \param t            position in units of \p h, counted from the node of \p y1
/// \param h            distance of the nodes
/// \param out          takes the derivative
VETRA_EXPORT void interpolate_Lagrange_rate(const double& y0, const double& y1, const double& y2,
                                            const double& y3, const double& t, const double& h,
                                            double& out);

#endif  // VETRA_BASE_UTILS_MATH_INTERPOLATION_H
