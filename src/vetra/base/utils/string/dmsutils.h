#ifndef VETRA_BASE_UTILS_STRING_DMSUTILS_H
#define VETRA_BASE_UTILS_STRING_DMSUTILS_H

#include "vetra/export.h"

/// \file
/// Angles in degrees, minutes and seconds, as text.

/// Writes an angle as text. Reduced, folded and split as by `DecimalToDegrees`.
///
///     from     angle      text for 5.5
///     1, 4     lat, lon   "  5d30'00\" N    "
///     2, 5     lat, lon   "  5d30'00.00\" N "
///     3, 6     lat, lon   "  5d30'00.0000\"N"
///     7, 8     lat, lon   "  530'00.0\"N"
///     9        lon        "   5:30:00.0000"
///     10, 11   lat, lon   "  5d30'00.000000\"N"
///
/// The degrees keep their leading blanks, the other fields have zeros; in the forms 7 and 8 the
/// first digit of the minutes may be a blank. Form 9 has a sign instead of the letter, on the
/// degrees: it doesn't show where these are 0.
///
/// \param value  degrees, north and east positive
/// \param from   the form, 1 to 11
/// \param dst    room for 19 bytes; receives zero-terminated text
/// \throws ParameterException for another form, a null \p dst, and a value that is not finite or
///         beyond 2^53. The room is not touched then.
VETRA_EXPORT void DecToDMS(double value, int from, char* dst);

/// Reads an angle from text: up to three numbers for degrees, minutes and seconds, by their order
/// or by a mark behind each (d, ' and "), and a hemisphere letter anywhere. Upper and lower case
/// are the same; tabs, blanks, commas and colons separate. The text ends at a line feed, and only
/// its first 32 characters count.
///
/// Numbers are decimal, with a sign and a point but no exponent. Minutes and seconds are 0 to 60,
/// and only the last of the numbers that are not 0 may have a fraction. A minus sign of the degrees
/// makes the whole angle negative, also that of "-0 30"; it can't stand beside S or W.
///
/// \param text    the text, zero-terminated
/// \param result  receives the degrees, north and east positive; 0 after a failure, or the
///                magnitude when it was only too large
/// \return 0 when the text is not valid or a pointer is null, which writes nothing; 1 for a
///         latitude; 2 for a longitude; 3 for an angle without a letter of up to 90 degrees, which
///         can be either
VETRA_EXPORT int DMSToDec(const char* text, double* result);

#endif  // VETRA_BASE_UTILS_STRING_DMSUTILS_H
