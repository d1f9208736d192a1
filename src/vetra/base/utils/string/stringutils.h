#ifndef VETRA_BASE_UTILS_STRING_STRINGUTILS_H
#define VETRA_BASE_UTILS_STRING_STRINGUTILS_H

#include <string>

#include "vetra/export.h"

/// The text without white space at its end and at its start. White space is what `isspace` accepts
/// in the C locale: blank, tab, line feed, carriage return, vertical tab and form feed.
VETRA_EXPORT std::string TrimWhitespace(const std::string& s);

/// Whether a text, trimmed, reads as a decimal number: an optional sign, digits with at most one
/// point among them, and optionally an exponent of E, e, D or d, an optional sign and at least one
/// digit.
///
/// Digits in the mantissa are not asked for: "+", "-", "." and "E5" are numeric, with the value 0.
/// An empty text, hexadecimal forms, infinities and NaN are not.
VETRA_EXPORT bool IsNumeric(const std::string& s);

/// The number at the start of a text, read like `atof` in the C locale whatever locale the process
/// has set: white space, sign, digits, point, exponent; 0.0 where no number starts. A D or d
/// behind the digits counts as E, so that every text that `IsNumeric` accepts is read whole:
/// "1.5D3" is 1500. A number beyond the range of double gives an infinity or 0.
VETRA_EXPORT double TextToDouble(const std::string& s);

#endif  // VETRA_BASE_UTILS_STRING_STRINGUTILS_H
