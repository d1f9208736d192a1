#ifndef VETRA_BASE_UTILS_MATH_HOSTDENSIFY_H
#define VETRA_BASE_UTILS_MATH_HOSTDENSIFY_H

#include "vetra/export.h"

namespace vetra::utils::math {

/// Fills a sparsely sampled grid in place, bilinearly.
///
/// Known are the samples that stand in a row that is a multiple of \p rowStep or the last one, and
/// in a column that is a multiple of \p colStep or the last one. They stay; every other sample,
/// whatever it holds, is replaced. With r0 the last known row at or above a sample's row, r1 the
/// next known row (the same one where r0 is the last row), c0 and c1 likewise, and d the known
/// samples:
///
///     fx = (col - c0) / (c1 - c0), or 0 where c1 = c0
///     fy = (row - r0) / (r1 - r0), or 0 where r1 = r0
///     (1 - fy) ((1 - fx) d[r0, c0] + fx d[r0, c1]) + fy ((1 - fx) d[r1, c0] + fx d[r1, c1])
///
/// all in float, in this order, each operation rounded: the bits don't depend on the number of
/// threads. All four samples count, also those with a factor of 0: an infinity or NaN among them
/// gives NaN.
///
/// Runs on all OpenMP threads where there are rows enough, and takes memory for two rows of the
/// grid per thread then. The time is linear in the size of the grid.
///
/// \param data     [rows x cols], row after row
/// \param rows     number of rows; below 1 there is nothing to do
/// \param cols     number of columns, at least 1
/// \param rowStep  distance of known rows, at least 1
/// \param colStep  distance of known columns, at least 1
/// \throws ParameterException for \p cols, \p rowStep or \p colStep below 1, and for a null
///         \p data where there are rows; nothing is changed.
/// \throws std::bad_alloc where there is no memory for the rows; nothing is changed.
VETRA_EXPORT void HostDensify(float* data, const int& rows, const int& cols, const int& rowStep,
                              const int& colStep);

}  // namespace vetra::utils::math

#endif  // VETRA_BASE_UTILS_MATH_HOSTDENSIFY_H
