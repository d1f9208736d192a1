#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_COLUMNTABLES_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_COLUMNTABLES_H

#include <algorithm>
#include <cstdint>
#include <vector>

#include "vetra/base/utils/resample/engine/positions.h"
#include "vetra/base/utils/resample/engine/task.h"

namespace vetra::utils::engine {

/// The range of some numbers; of none, the first is behind the last.
struct Reach {
    std::int64_t nFirst = 0;
    std::int64_t nLast = -1;

    void Add(std::int64_t n) {
        nFirst = nLast < 0 ? n : std::min(n, nFirst);
        nLast = std::max(n, nLast);
    }
};

/// What an axis-aligned run tabulates per target column, once. Places of columns outside the source
/// are 0. All tables reach kSpanArray entries beyond the last column, so that groups of pixels can;
/// the places there are inside the source too.
struct ColumnTables {
    std::vector<double> vdfFrac;
    // Of windows and nearest pixels: source columns, and offsets of samples.
    std::vector<std::int64_t> vnWindowCol;
    std::vector<std::int64_t> vnNearestCol;
    std::vector<std::int64_t> vnWindow;
    std::vector<std::int64_t> vnNearest;
    std::vector<unsigned char> vbyClass;
    // Whether all nearest columns are inside.
    bool bAllNear = true;
    // Of the windows that fit, where they begin, and of the nearest pixels that are inside.
    Reach oReach;
    // Modes by the class of the row, if those are asked for.
    std::vector<unsigned char> avbyMode[4];
    // One for every eight columns, where pairs of 8-bit samples can be picked out of a row.
    std::vector<PairGroup> voGroups;
    // One for every BitGroup::kColumns columns, of a masked source's windows and nearest pixels.
    std::vector<BitGroup> voWholeGroups;
    std::vector<BitGroup> voUsableGroups;
};

/// Modes are tabulated where poModes isn't null. Throws std::bad_alloc.
ColumnTables MakeColumnTables(const Task& oTask, const LevelStages& oStages,
                              const Positions& oPositions, const ClassLimits& oLimits,
                              const ModeTable* poModes);

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_COLUMNTABLES_H
