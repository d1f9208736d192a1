#ifndef VETRA_BASE_UTILS_STRING_DECTODEG_H
#define VETRA_BASE_UTILS_STRING_DECTODEG_H

#include <string>

#include "vetra/export.h"

/// \file
/// Angles in degrees, minutes and seconds, as fields; numbers in two formats.

/// Splits an angle into degrees, minutes and seconds.
///
/// The angle is reduced to one turn first. A latitude is folded at the poles (100 is 80 north), a
/// longitude is wrapped (190 is 170 west). The fields are those of the absolute value, and carry
/// when they are rounded.
///
/// The outputs may be null each.
///
/// \param value       degrees, north and east positive
/// \param szFormat    begins with "Lat" or "Long", in upper or lower case
/// \param degrees     0 to 90 for a latitude between -270 and 360, 0 to 180 else
/// \param minutes     0 to 59
/// \param seconds     0 to 59
/// \param fraction    of the second, rounded, in units of 10^-decimals; 0 without decimals
/// \param decimals    digits of the fraction, at most 9. With 0 or less the seconds are cut, not
///                    rounded, but for the last 0.0005.
/// \param hemisphere  N or S, E or W
/// \throws ParameterException for another \p szFormat or null, too many decimals, and a value that
///         is not finite or beyond 2^53. No output is written then.
VETRA_EXPORT void DecimalToDegrees(double value, char* szFormat, int* degrees, int* minutes,
                                   int* seconds, int* fraction, int decimals, char* hemisphere);

/// Formats a number in one of two ways (`FormatString`): with \p format when its magnitude lies
/// between the bounds or is below 1e-15, else with \p otherFormat. A magnitude that equals a bound
/// doesn't lie between them, nor does a NaN.
///
/// \param value                the number
/// \param upper, lower         the bounds of the magnitude
/// \param format, otherFormat  `printf` formats for one double
VETRA_EXPORT std::string FormatDouble(const double& value, const double& upper, const double& lower,
                                      const char* format, const char* otherFormat);

#endif  // VETRA_BASE_UTILS_STRING_DECTODEG_H
