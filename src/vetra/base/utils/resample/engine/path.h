#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_PATH_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_PATH_H

#include <cstdint>

#include "vetra/base/utils/resample/engine/task.h"

namespace vetra::utils::engine {

/// What the choice of a path needs to know of an axis-aligned run whose columns are tabulated.
struct PathFacts {
    /// How the method is computed from rows of doubles.
    const RowStages* poRows;
    /// The source type's medians; may be null.
    MediansFunction pfnMedians;
    int nStripCols;              ///< target columns that are filled together
    std::int64_t nStripSrcCols;  ///< most source columns of their windows
    bool bReduces;               ///< most source columns are in no window
    bool bUnitSteps;             ///< each window begins one column behind the one before
};

/// Chooses among the paths of an axis-aligned run, Path::eColumns to Path::eMedians. They differ in
/// time and memory, never in the result.
PathChoice ChoosePath(const Task& oTask, const PathFacts& oFacts);

/// Whether a path works on what a RowCache keeps.
constexpr bool KeepsRows(Path ePath) { return ePath > Path::eColumns; }

/// Bytes of what a thread keeps on a path.
double GetKeptBytes(const Task& oTask, const PathFacts& oFacts, Path ePath);

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_PATH_H
