#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_ROWCACHE_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_ROWCACHE_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <vector>

#include "vetra/base/utils/resample/engine/columntables.h"
#include "vetra/base/utils/resample/engine/task.h"

namespace vetra::utils::engine {

/// Neighbouring target columns of an axis-aligned run, with the source columns of their windows.
struct Strip {
    int nFirstCol = 0;  ///< a multiple of kLanes
    int nNumCols = 0;
    std::int64_t nSrcFirst = 0;
    std::int64_t nSrcCount = 0;  ///< 0 where no window fits
};

/// Target columns cut into strips, whose rows of doubles stay in the cache while the target rows
/// walk down the source.
class RowPlan {
 public:
    /// Empty where rows of doubles are no use: the method can't work on them, or the windows leave
    /// most source columns out, or they are too large to be kept.
    RowPlan() = default;
    RowPlan(const Task& oTask, const LevelStages& oStages, const ColumnTables& oColumns);

    bool IsEmpty() const { return mvoStrips.empty(); }
    const std::vector<Strip>& GetStrips() const { return mvoStrips; }

 private:
    friend class RowCache;

    bool MakeStrips(const Task& oTask, const ColumnTables& oColumns, int nStripCols);

    const LevelStages* mpoStages = nullptr;
    const RowStages* mpoRows = nullptr;
    bool mbSquared = false;
    int mnStripCols = 0;
    std::int64_t mnWidest = 0;  ///< source columns of a strip
    std::vector<Strip> mvoStrips;
    /// Counted from the first source column of the group's strip.
    std::vector<PickGroup> mvoGroups;
    const double* mpadfFracCol = nullptr;
};

/// The rows of doubles that a thread keeps: as many as a window has rows, of all channels. They are
/// source samples, roots of those, or, for separable methods, what a row's samples make along the
/// columns.
class RowCache {
 public:
    /// Allocates all that it needs. Throws std::bad_alloc.
    RowCache(const Task& oTask, const RowPlan& oPlan);

    void SetStrip(const Strip& oStrip);
    /// Fetches the rows of the windows that begin in a source row.
    void SetWindowRow(std::int64_t nSrcRow, double dfFracRow);
    /// Values of one channel for target columns nFirstCol to nFirstCol + nNumCols - 1 of the strip,
    /// at most kSpanPixels. Those of pixels whose windows don't fit mean nothing. They may be
    /// overwritten, up to kLanes behind the last one, and last until the next call.
    double* GetValues(int nChannel, int nFirstCol, int nNumCols);

 private:
    void Fetch(std::int64_t nSrcRow, std::size_t nSlot);

    const Task& moTask;
    const RowPlan& moPlan;
    const Method& moMethod;
    std::size_t mnRows;
    std::size_t mnRowDoubles;  // of a kept row
    Strip moStrip;
    RowWindows moWindows{};
    std::unique_ptr<double[]> mpadfKept;  // [channels][rows]
    std::unique_ptr<double[]> mpadfSamples;
    std::unique_ptr<double[]> mpadfTaps;
    std::unique_ptr<double[]> mpadfScratch;
    std::vector<std::int64_t> mvnSrcRow;  // which is in each slot
    std::vector<const double*> mvpadfRow;
    alignas(64) double madfValue[kSpanArray + kLanes] = {};
};

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_ROWCACHE_H
