#ifndef VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSBLOCKTFM_H
#define VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSBLOCKTFM_H

#include "vetra/base/utils/resample/postfm/ibufpostfm.h"

namespace vetra::utils {

/// A rectangle of pixels: columns nCol to nCol + nCols - 1, rows likewise.
struct PixelRect {
    int nCol = 0;   ///< first column
    int nRow = 0;   ///< first row
    int nCols = 0;  ///< number of columns
    int nRows = 0;  ///< number of rows

    /// Columns times rows.
    long long GetNumPix() const { return static_cast<long long>(nCols) * nRows; }
    /// Whether place and size are equal.
    bool operator==(const PixelRect& oOther) const {
        return nCol == oOther.nCol && nRow == oOther.nRow && nCols == oOther.nCols &&
               nRows == oOther.nRows;
    }
};

/// The part of a transform that belongs to one block of its target, for a source of which only a
/// window is in memory.
///
/// A position is that of the whole transform at the block's global target index, minus the
/// window's origin. The subtraction comes last and is exact for every position inside the window,
/// so a block samples exactly what the whole run samples; folding the origin into a transform's
/// parameters instead would change the last bits of some positions.
///
/// Refers to the whole transform, which must outlive this object and its copies.
class VETRA_EXPORT BufPosBlockTfm : public IBufPosTfm {
 public:
    /// \param oWhole   the transform of the whole target
    /// \param oTarget  the block; must lie inside the whole target and hold a pixel
    /// \param nSrcCol  source column of the first column in memory
    /// \param nSrcRow  source row of the first row in memory
    /// \throws ParameterException for a block that is empty or leaves the target.
    BufPosBlockTfm(const IBufPosTfm& oWhole, const PixelRect& oTarget, int nSrcCol, int nSrcRow);
    /// A copy, which refers to the same whole transform.
    BufPosBlockTfm(const BufPosBlockTfm& oOther);
    /// A copy, which refers to the same whole transform.
    BufPosBlockTfm& operator=(const BufPosBlockTfm& oOther);
    ~BufPosBlockTfm() override;

    int GetNumCols() const override;
    int GetNumRows() const override;
    long long GetNumPix() const override;
    void GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const override;
    BufPosBlockTfm* Clone() const override;

    /// The transform of the whole target.
    const IBufPosTfm& GetWhole() const { return *mpoWhole; }
    /// The block, in pixels of the whole target.
    const PixelRect& GetTarget() const { return moTarget; }
    /// Source column of the first column in memory.
    int GetSrcCol() const { return mnSrcCol; }
    /// Source row of the first row in memory.
    int GetSrcRow() const { return mnSrcRow; }

 private:
    const IBufPosTfm* mpoWhole;
    PixelRect moTarget;
    int mnSrcCol;
    int mnSrcRow;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSBLOCKTFM_H
