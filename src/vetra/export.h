#ifndef VETRA_EXPORT_H
#define VETRA_EXPORT_H

/// Marks what the shared library exports; everything else is hidden.
#if defined(__GNUC__)
#define VETRA_EXPORT __attribute__((visibility("default")))
#define VETRA_PRINTF(nFormat, nFirst) __attribute__((format(printf, nFormat, nFirst)))
#else
#define VETRA_EXPORT
#define VETRA_PRINTF(nFormat, nFirst)
#endif

#endif  // VETRA_EXPORT_H
