#ifndef VETRA_BASE_UTILS_LOW_FILEPOSITION_H
#define VETRA_BASE_UTILS_LOW_FILEPOSITION_H

#include <cstdio>

#include "vetra/export.h"

/// \file
/// Positions in files of any size.

/// `fseek` with a 64-bit offset.
/// \param file    an open file
/// \param offset  bytes from the origin, forwards
/// \param origin  SEEK_SET, SEEK_CUR or SEEK_END
/// \return 0 on success
VETRA_EXPORT int FSeek(std::FILE* file, long long offset, int origin);

/// The 64-bit position of a file, or -1 on failure.
VETRA_EXPORT long long FTell(std::FILE* file);

#endif  // VETRA_BASE_UTILS_LOW_FILEPOSITION_H
