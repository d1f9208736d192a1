#include "vetra/base/utils/resample/blockplanner.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <typeinfo>

#include "vetra/base/utils/resample/engine/levels.h"
#include "vetra/base/utils/resample/engine/positions.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"
#include "vetra/base/utils/resample/sizecheck.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::utils {

namespace {

// Blocks are cut into rows first, down to this many: files are read and written by rows or tiles.
constexpr int kMinStripRows = 64;

// The source columns (or rows) that the windows of a set of positions touch.
class Extent {
 public:
    Extent(int nSize, int nFirstMargin, int nLastMargin)
        : mdfSize(nSize), mdfFirstMargin(nFirstMargin), mdfLastMargin(nLastMargin) {}

    // Whether the window of a position has a pixel in the source. A NaN has none. Margins are whole
    // numbers, so that this says the same of a position as of its floor.
    bool Touches(double dfPos) const {
        return dfPos >= -mdfLastMargin && dfPos < mdfSize - mdfFirstMargin;
    }
    // Takes up the window of a position that touches the source.
    void Add(double dfPos) {
        mdfFirst = std::min(mdfFirst, dfPos);
        mdfLast = std::max(mdfLast, dfPos);
    }
    bool IsEmpty() const { return mdfFirst > mdfLast; }
    int GetFirst() const {
        return static_cast<int>(std::max(0.0, std::floor(mdfFirst) + mdfFirstMargin));
    }
    int GetLast() const {
        return static_cast<int>(std::min(mdfSize - 1.0, std::floor(mdfLast) + mdfLastMargin));
    }

 private:
    double mdfSize;
    double mdfFirstMargin;
    double mdfLastMargin;
    double mdfFirst = std::numeric_limits<double>::infinity();
    double mdfLast = -std::numeric_limits<double>::infinity();
};

// The next size to try: the largest power of two below nSize.
int NextSmaller(int nSize) {
    int nNext = 1;
    while (nNext < nSize - nNext) {
        nNext *= 2;
    }
    return nNext;
}

}  // namespace

BlockPlanner::BlockPlanner(const IBufPosTfm& oTfm, int nSrcCols, int nSrcRows,
                           const IRasterResampler& oResampler)
    : mpoTfm(&oTfm), mnSrcCols(nSrcCols), mnSrcRows(nSrcRows) {
    CheckCount(nSrcCols, "nSrcCols", "columns", VETRA_HERE);
    CheckCount(nSrcRows, "nSrcRows", "rows", VETRA_HERE);
    oResampler.GetSrcBufferMargins(mnLeft, mnTop, mnRight, mnBottom);
    // The nearest pixel, which can replace the method's value, is at the floor or one beyond.
    mnLeft = std::min(mnLeft, 0);
    mnTop = std::min(mnTop, 0);
    mnRight = std::max(mnRight, 1);
    mnBottom = std::max(mnBottom, 1);
    mnBlockCols = oTfm.GetNumCols();
    mnBlockRows = oTfm.GetNumRows();
}

BlockPlanner::BlockPlanner(const IBufPosTfm& oTfm, int nSrcCols, int nSrcRows,
                           const IRasterResampler& oResampler, int nBlockCols, int nBlockRows)
    : BlockPlanner(oTfm, nSrcCols, nSrcRows, oResampler) {
    CheckCount(nBlockCols, "nBlockCols", "columns", VETRA_HERE);
    CheckCount(nBlockRows, "nBlockRows", "rows", VETRA_HERE);
    mnBlockCols = std::min(mnBlockCols, nBlockCols);
    mnBlockRows = std::min(mnBlockRows, nBlockRows);
}

BlockPlanner::BlockPlanner(const IBufPosTfm& oTfm, int nSrcCols, int nSrcRows,
                           const IRasterResampler& oResampler, long long nSrcPixelBytes,
                           long long nTgtPixelBytes, long long nMaxBytes)
    : BlockPlanner(oTfm, nSrcCols, nSrcRows, oResampler) {
    while (!Fits(nSrcPixelBytes, nTgtPixelBytes, nMaxBytes)) {
        if (mnBlockRows > kMinStripRows || (mnBlockRows >= mnBlockCols && mnBlockRows > 1)) {
            mnBlockRows = NextSmaller(mnBlockRows);
        } else if (mnBlockCols > 1) {
            mnBlockCols = NextSmaller(mnBlockCols);
        } else {
            break;
        }
    }
}

bool BlockPlanner::Fits(long long nSrcPixelBytes, long long nTgtPixelBytes,
                        long long nMaxBytes) const {
    const long long nTgtPixels = static_cast<long long>(mnBlockCols) * mnBlockRows;
    if (nTgtPixels > nMaxBytes / std::max(1LL, nTgtPixelBytes)) {
        return false;
    }
    const long long nSrcPixels =
        (nMaxBytes - nTgtPixels * nTgtPixelBytes) / std::max(1LL, nSrcPixelBytes);
    const long long nBlocks = GetNumBlocks();
    for (long long nBlock = 0; nBlock < nBlocks; ++nBlock) {
        if (GetBlock(nBlock).oSource.GetNumPix() > nSrcPixels) {
            return false;
        }
    }
    return true;
}

long long BlockPlanner::GetNumBlocks() const {
    const long long nAcross = (mpoTfm->GetNumCols() - 1) / mnBlockCols + 1;
    const long long nDown = (mpoTfm->GetNumRows() - 1) / mnBlockRows + 1;
    return nAcross * nDown;
}

ResampleBlock BlockPlanner::GetBlock(long long nBlock) const {
    if (nBlock < 0 || nBlock >= GetNumBlocks()) {
        throw ParameterException("nBlock", ParameterException::eOutOfRange,
                                 FormatString("%lld", nBlock),
                                 FormatString("0 to %lld", GetNumBlocks() - 1),
                                 "There is no block of this number", VETRA_HERE);
    }
    const int nAcross = (mpoTfm->GetNumCols() - 1) / mnBlockCols + 1;
    ResampleBlock oBlock;
    PixelRect& oTarget = oBlock.oTarget;
    oTarget.nCol = static_cast<int>(nBlock % nAcross) * mnBlockCols;
    oTarget.nRow = static_cast<int>(nBlock / nAcross) * mnBlockRows;
    oTarget.nCols = std::min(mnBlockCols, mpoTfm->GetNumCols() - oTarget.nCol);
    oTarget.nRows = std::min(mnBlockRows, mpoTfm->GetNumRows() - oTarget.nRow);
    oBlock.oSource = FindSource(oTarget);
    return oBlock;
}

PixelRect BlockPlanner::FindSource(const PixelRect& oTarget) const {
    const BufPosBlockTfm oPositions(*mpoTfm, oTarget, 0, 0);
    const long long nNumPix = oTarget.GetNumPix();
    Extent oCols(mnSrcCols, mnLeft, mnRight);
    Extent oRows(mnSrcRows, mnTop, mnBottom);
    double dfCol = 0.0;
    double dfRow = 0.0;
    if (typeid(*mpoTfm) == typeid(BufPosScaleOffTfm)) {
        for (int nX = 0; nX < oTarget.nCols; ++nX) {
            oPositions.GetSrcPos(nX, dfCol, dfRow);
            if (oCols.Touches(dfCol)) {
                oCols.Add(dfCol);
            }
        }
        for (long long nIdx = 0; nIdx < nNumPix; nIdx += oTarget.nCols) {
            oPositions.GetSrcPos(nIdx, dfCol, dfRow);
            if (oRows.Touches(dfRow)) {
                oRows.Add(dfRow);
            }
        }
    } else {
        const engine::Positions oSpans(oPositions);
        const engine::LevelStages& oStages = engine::GetStages(engine::GetBestLevel());
        double adfCol[engine::kSpanPixels + engine::kLanes];
        double adfRow[engine::kSpanPixels + engine::kLanes];
        for (long long nIdx = 0; nIdx < nNumPix; nIdx += engine::kSpanPixels) {
            const int nPix =
                static_cast<int>(std::min<long long>(engine::kSpanPixels, nNumPix - nIdx));
            oSpans.Fill(oStages, nIdx, nPix, adfCol, adfRow);
            for (int i = 0; i < nPix; ++i) {
                if (oCols.Touches(adfCol[i]) && oRows.Touches(adfRow[i])) {
                    oCols.Add(adfCol[i]);
                    oRows.Add(adfRow[i]);
                }
            }
        }
    }
    if (oCols.IsEmpty() || oRows.IsEmpty()) {
        // No pixel of the block reads the source: any source pixel serves.
        return PixelRect{0, 0, 1, 1};
    }
    PixelRect oSource;
    oSource.nCol = oCols.GetFirst();
    oSource.nRow = oRows.GetFirst();
    oSource.nCols = oCols.GetLast() - oSource.nCol + 1;
    oSource.nRows = oRows.GetLast() - oSource.nRow + 1;
    return oSource;
}

BufPosBlockTfm BlockPlanner::GetLocalTfm(const ResampleBlock& oBlock) const {
    return BufPosBlockTfm(*mpoTfm, oBlock.oTarget, oBlock.oSource.nCol, oBlock.oSource.nRow);
}

}  // namespace vetra::utils
