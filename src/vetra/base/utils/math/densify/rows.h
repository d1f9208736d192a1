#ifndef VETRA_BASE_UTILS_MATH_DENSIFY_ROWS_H
#define VETRA_BASE_UTILS_MATH_DENSIFY_ROWS_H

#include "vetra/base/utils/low/processorlevel.h"

// Private: the filling of sparsely sampled grids, compiled once per processor level.
namespace vetra::utils::math::densify {

/// A grid with known samples, as `HostDensify` describes it.
struct Grid {
    float* pafData;
    int nRows;
    int nCols;
    int nRowStep;
    int nColStep;
};

/// The rows that a thread fills, at least one. Other threads may write to all others: those known
/// ones that it needs, at most one before and one behind its own, are read from copies.
struct OwnRows {
    int nFirst;
    int nEnd;
    const float* pafBefore;
    const float* pafBehind;
};

struct Rows {
    const char* pszName;
    void (*pfnFill)(const Grid& oGrid, const OwnRows& oOwn);
};

/// The rows of a level, which must be a supported one.
const Rows& GetRows(low::Level eLevel);

}  // namespace vetra::utils::math::densify

#endif  // VETRA_BASE_UTILS_MATH_DENSIFY_ROWS_H
