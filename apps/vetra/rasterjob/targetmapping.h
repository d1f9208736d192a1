#ifndef VETRA_APPS_RASTERJOB_TARGETMAPPING_H
#define VETRA_APPS_RASTERJOB_TARGETMAPPING_H

#include <optional>
#include <vector>

#include "gdalraster/grid.h"
#include "vetra/base/utils/resample/blockplanner.h"
#include "vetra/base/utils/resample/postfm/bufposblocktfm.h"
#include "vetra/base/utils/resample/postfm/bufposdoublearraytfm.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"

namespace vetra::tool {

/// How far a position moves so that a method's window lies around it. The windows of means and
/// medians start at the pixel nearest to a position; left there, images would move by half a
/// window.
struct WindowShift {
    explicit WindowShift(const utils::IRasterResampler& oResampler);

    bool IsNone() const { return dfCols == 0.0 && dfRows == 0.0; }

    double dfCols = 0.0;
    double dfRows = 0.0;
};

/// Bytes that a run keeps per pixel, and how many of them a block may have.
struct BlockBudget {
    long long nSrcPixelBytes;
    long long nTgtPixelBytes;
    long long nMaxBytes;
};

/// Positions of a block's pixels, columns then rows.
struct PositionArrays {
    std::vector<double> vdfCol;
    std::vector<double> vdfRow;
};

/// A block of the target, and where its pixels fall in its source window.
struct MappedBlock {
    utils::ResampleBlock oBlock;
    /// Positions at which the method's windows stand.
    std::optional<utils::BufPosBlockTfm> oTfm;
    /// Where the pixels are, whatever the method's window.
    std::optional<utils::BufPosBlockTfm> oUnmoved;

    /// What the transforms refer to, where positions are those of one block.
    PositionArrays oPositions;
    PositionArrays oUnmovedPositions;
    std::optional<utils::BufPosDoubleArrayTfm> oArrays;
    std::optional<utils::BufPosDoubleArrayTfm> oUnmovedArrays;
};

/// Where the pixels of a target fall in the source, block after block.
class TargetMapping {
 public:
    TargetMapping() = default;
    TargetMapping(const TargetMapping&) = delete;
    TargetMapping& operator=(const TargetMapping&) = delete;
    virtual ~TargetMapping() = default;

    /// The next block; the position of a pixel depends on neither the blocks nor the budget.
    /// \returns false when all pixels have been in a block
    virtual bool GetNext(MappedBlock& oMapped) = 0;
};

/// A target whose pixels are those of the source, coarser or finer.
class ScaledMapping : public TargetMapping {
 public:
    ScaledMapping(const Grid& oGrid, int nSrcCols, int nSrcRows,
                  const utils::IRasterResampler& oResampler, const BlockBudget& oBudget);
    bool GetNext(MappedBlock& oMapped) override;

 private:
    ScaledMapping(const Grid& oGrid, const WindowShift& oShift, int nSrcCols, int nSrcRows,
                  const utils::IRasterResampler& oResampler, const BlockBudget& oBudget);

    utils::BufPosScaleOffTfm moTfm;
    utils::BufPosScaleOffTfm moUnmoved;
    utils::BlockPlanner moPlanner;
    long long mnNext = 0;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_TARGETMAPPING_H
