#ifndef VETRA_BASE_UTILS_MATH_SINCOS_H
#define VETRA_BASE_UTILS_MATH_SINCOS_H

#include "vetra/export.h"

/// \file
/// Sine and cosine together.

/// Sine and cosine of one angle, as `std::sin` and `std::cos` give them.
///
/// \param x  angle in radians; an infinity or NaN gives NaN
/// \param s  receives the sine
/// \param c  receives the cosine
VETRA_EXPORT void sincos(double x, double& s, double& c);

#endif  // VETRA_BASE_UTILS_MATH_SINCOS_H
