#ifndef VETRA_EXPORT_H
#define VETRA_EXPORT_H

/// \file
/// Attributes of declarations.

#if defined(__GNUC__)
/// Marks what the shared library exports; everything else is hidden.
#define VETRA_EXPORT __attribute__((visibility("default")))
/// Lets the compiler compare a `printf` format, argument \p nFormat, to the arguments from
/// \p nFirst on.
#define VETRA_PRINTF(nFormat, nFirst) __attribute__((format(printf, nFormat, nFirst)))
#else
#define VETRA_EXPORT
#define VETRA_PRINTF(nFormat, nFirst)
#endif

#endif  // VETRA_EXPORT_H
