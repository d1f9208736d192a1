#ifndef VETRA_BASE_UTILS_RESAMPLE_BLOCKPLANNER_H
#define VETRA_BASE_UTILS_RESAMPLE_BLOCKPLANNER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/base/utils/resample/postfm/bufposblocktfm.h"
#include "vetra/export.h"

namespace vetra::utils {

/// One block of a target, and the source pixels that it needs.
struct ResampleBlock {
    /// The block, in pixels of the whole target.
    PixelRect oTarget;
    /// Holds at least one pixel, also for a block that maps outside the source.
    PixelRect oSource;
};

/// Cuts a resampling run into blocks, for images that don't fit into memory or that several workers
/// share. Knows no files and starts no threads.
///
/// For each block: read the source pixels (and mask) of `oSource`, make a target buffer of the size
/// of `oTarget`, and resample with `GetLocalTfm`. The pixels are those of one run over the whole
/// images, bit for bit, whatever the block size.
///
/// The planner refers to the transform, which must outlive it. Its const operations may run from
/// several threads at once.
class VETRA_EXPORT BlockPlanner {
 public:
    /// \param oTfm        transform of the whole target
    /// \param nSrcCols    source columns, at least 1
    /// \param nSrcRows    source rows, at least 1
    /// \param oResampler  gives the margins that a position needs; not kept
    /// \param nBlockCols  columns of a block, at least 1; the last ones of a row may be narrower
    /// \param nBlockRows  rows of a block, at least 1
    /// \throws ParameterException for a size below 1.
    BlockPlanner(const IBufPosTfm& oTfm, int nSrcCols, int nSrcRows,
                 const IRasterResampler& oResampler, int nBlockCols, int nBlockRows);

    /// Chooses blocks that need no more than \p nMaxBytes for source and target pixels together: as
    /// many whole rows as possible, or, where 64 whole rows need more, narrower blocks. The size is
    /// a power of two where the target is cut. Where even a single pixel needs more, blocks are
    /// single pixels.
    ///
    /// \param oTfm            transform of the whole target
    /// \param nSrcCols        source columns, at least 1
    /// \param nSrcRows        source rows, at least 1
    /// \param oResampler      gives the margins that a position needs; not kept
    /// \param nSrcPixelBytes  bytes that the caller keeps per source pixel, masks included
    /// \param nTgtPixelBytes  bytes per target pixel
    /// \param nMaxBytes       limit for one block
    BlockPlanner(const IBufPosTfm& oTfm, int nSrcCols, int nSrcRows,
                 const IRasterResampler& oResampler, long long nSrcPixelBytes,
                 long long nTgtPixelBytes, long long nMaxBytes);

    /// Columns of a block; the last ones of a row may be narrower.
    int GetBlockCols() const { return mnBlockCols; }
    /// Rows of a block; the last ones may be lower.
    int GetBlockRows() const { return mnBlockRows; }
    /// How many blocks cover the target.
    long long GetNumBlocks() const;
    /// A block, from 0 to `GetNumBlocks() - 1`, counted row by row.
    ///
    /// Asks the transform for every position of the block (for a `BufPosScaleOffTfm` those of one
    /// row and one column) to find the source pixels.
    /// \throws ParameterException for any other number.
    ResampleBlock GetBlock(long long nBlock) const;
    /// The block's transform: its positions count from the first pixel of `oSource`.
    BufPosBlockTfm GetLocalTfm(const ResampleBlock& oBlock) const;

 private:
    BlockPlanner(const IBufPosTfm& oTfm, int nSrcCols, int nSrcRows,
                 const IRasterResampler& oResampler);
    PixelRect FindSource(const PixelRect& oTarget) const;
    bool Fits(long long nSrcPixelBytes, long long nTgtPixelBytes, long long nMaxBytes) const;

    const IBufPosTfm* mpoTfm;
    int mnSrcCols;
    int mnSrcRows;
    int mnLeft;
    int mnTop;
    int mnRight;
    int mnBottom;
    int mnBlockCols;
    int mnBlockRows;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_BLOCKPLANNER_H
