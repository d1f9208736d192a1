#ifndef VETRA_TEXTCORE_FORMATSTRING_H
#define VETRA_TEXTCORE_FORMATSTRING_H

#include <string>

#include "vetra/export.h"

/// \file
/// Text by `printf` formats.

/// Formats like `printf` in the C locale, whatever locale the process has set, and returns the
/// text, of any length. So numbers have a decimal point everywhere, and can be read back.
///
/// \param format  a `printf` format; its arguments follow. A `%s` takes a zero-terminated text.
/// \throws std::bad_alloc when there is no memory for the text.
/// \throws std::invalid_argument when the C library can't format the arguments (for instance a
///         wide character without a form in the C locale).
VETRA_EXPORT std::string FormatString(const char* format, ...) VETRA_PRINTF(1, 2);

#endif  // VETRA_TEXTCORE_FORMATSTRING_H
