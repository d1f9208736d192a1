#ifndef VETRA_BASE_UTILS_TIME_USLEEP_H
#define VETRA_BASE_UTILS_TIME_USLEEP_H

#include "vetra/export.h"

/// \file
/// Waiting.

/// Suspends the calling thread for \p microseconds / 1000 whole milliseconds. Below 1000 it doesn't
/// wait, it only lets other threads go first.
VETRA_EXPORT void USleep(const unsigned long& microseconds);

#endif  // VETRA_BASE_UTILS_TIME_USLEEP_H
