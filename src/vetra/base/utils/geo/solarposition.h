#ifndef VETRA_BASE_UTILS_GEO_SOLARPOSITION_H
#define VETRA_BASE_UTILS_GEO_SOLARPOSITION_H

#include "vetra/export.h"

namespace vetra::utils {

/// The direction of the sun at a time and place, from Fourier series of the declination and the
/// equation of time over the day of the year (Spencer, "Fourier series representation of the
/// position of the sun", Search 2 (5), 1971, with 1 January counted as day 1 and a year of 365
/// days). No refraction and no parallax.
///
/// The series take the same value all day and know no leap years: between 1950 and 2050 the sun is
/// mostly within 0.5 degrees of its place and never off by more than 0.63 degrees, worst around the
/// equinoxes.
///
/// Nothing is checked: dates outside the calendar go through the same formulas.
///
/// \param year, month, day      date in the Gregorian calendar; month from 1 to 12
/// \param hour, minute, second  universal time
/// \param latitude              degrees, north positive
/// \param longitude             degrees, east positive
/// \param zenith   out: angle from the vertical in degrees, above 90 for a sun below the horizon
/// \param azimuth  out: degrees clockwise from north, in (0, 360], so that north is 360;
///                 without meaning where the sun is at the zenith
VETRA_EXPORT void SolarZenithAzimuth(int year, int month, int day, int hour, int minute,
                                     double second, float latitude, float longitude, float& zenith,
                                     float& azimuth);

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_GEO_SOLARPOSITION_H
