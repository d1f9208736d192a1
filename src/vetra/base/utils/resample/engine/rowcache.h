#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_ROWCACHE_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_ROWCACHE_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <vector>

#include "vetra/base/utils/resample/engine/aligneddoubles.h"
#include "vetra/base/utils/resample/engine/columntables.h"
#include "vetra/base/utils/resample/engine/path.h"
#include "vetra/base/utils/resample/engine/task.h"

namespace vetra::utils::engine {

/// Neighbouring target columns of an axis-aligned run, with the source columns of their windows.
struct Strip {
    int nFirstCol = 0;  ///< a multiple of kLanes
    int nNumCols = 0;
    std::int64_t nSrcFirst = 0;
    std::int64_t nSrcCount = 0;  ///< 0 where no window fits
    /// The target columns whose windows fit, where they are neighbours.
    int nFitFirst = 0;
    int nFitCount = 0;
};

/// Target columns cut into strips, whose rows of doubles stay in the cache while the target rows
/// walk down the source.
class RowPlan {
 public:
    /// Empty: of a run that isn't axis-aligned.
    RowPlan() = default;
    RowPlan(const Task& oTask, const LevelStages& oStages, const ColumnTables& oColumns);

    /// Path::eColumns where no rows are kept.
    const PathChoice& GetPath() const { return moPath; }
    const std::vector<Strip>& GetStrips() const { return mvoStrips; }

 private:
    friend class RowCache;

    void MakeStrips(const Task& oTask, const ColumnTables& oColumns, int nStripCols);

    PathChoice moPath;
    PathFacts moFacts{};
    const LevelStages* mpoStages = nullptr;
    bool mbSquared = false;
    std::vector<Strip> mvoStrips;
    /// Counted from the first source column of the group's strip.
    std::vector<PickGroup> mvoGroups;
    const double* mpadfFracCol = nullptr;
};

/// What a thread keeps of the source's rows, for all channels.
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
    /// On the path of the medians, the medians of one channel's samples, in the source's type; for
    /// a method that isn't squared they are its values. Otherwise as above.
    unsigned char* GetMedians(int nFirstCol, int nNumCols);

 private:
    void Fetch(std::int64_t nSrcRow, std::size_t nSlot);
    void MoveSums(std::int64_t nSrcRow);
    const char* SrcSamples(std::int64_t nSrcRow, int nChannel) const;
    // Sums from the left begin with a 0, behind which whole groups begin.
    double* Totals(double* padfSum) const { return padfSum + mnRowDoubles + kLanes - 1; }

    const Task& moTask;
    const RowPlan& moPlan;
    const Method& moMethod;
    std::size_t mnRows;
    std::size_t mnRowDoubles;  // of a kept row
    Strip moStrip;
    RowWindows moWindows{};
    AlignedDoubles mpadfKept;  // [channels][rows]
    AlignedDoubles mpadfSamples;
    AlignedDoubles mpadfTaps;
    AlignedDoubles mpadfScratch;
    std::vector<std::int64_t> mvnSrcRow;  // which is in each slot
    std::vector<const double*> mvpadfRow;
    std::int64_t mnWindowRow = -1;
    std::unique_ptr<char[]> mpabyCopy;  // for medians
    std::vector<const void*> mvpRow;
    std::vector<const void*> mvpCopy;
    alignas(64) unsigned char mabyMedian[2 * kSpanArray] = {};
    alignas(64) double madfValue[kSpanArray + kLanes] = {};
};

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_ROWCACHE_H
