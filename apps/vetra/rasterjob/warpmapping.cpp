#include "rasterjob/warpmapping.h"

#include <algorithm>

namespace vetra::tool {

namespace {

using utils::PixelRect;

// Large enough for whole tiles of the files and whole cells of the lattice, small enough that the
// steps of a run overlap.
constexpr int kLargestSide = 1024;
constexpr long long kPositionBytes = 2 * sizeof(double);

}  // namespace

WarpMapping::WarpMapping(const GeoTransformer& oTransformer, double dfError, const Grid& oGrid,
                         int nSrcCols, int nSrcRows, const utils::IRasterResampler& oResampler,
                         const BlockBudget& oBudget, int nPieceCols)
    : moLattice(oTransformer, oGrid.nCols, oGrid.nRows, dfError),
      mnCols(oGrid.nCols),
      mnRows(oGrid.nRows),
      mnSrcCols(nSrcCols),
      mnSrcRows(nSrcRows),
      moResampler(oResampler),
      moShift(oResampler),
      moBudget(oBudget) {
    moBudget.nTgtPixelBytes += kPositionBytes * (moShift.IsNone() ? 1 : 2);
    ChooseBlockSize(nPieceCols);
}

void WarpMapping::ChooseBlockSize(int nPieceCols) {
    // The other half is for the source.
    const long long nMostPixels = moBudget.nMaxBytes / 2 / moBudget.nTgtPixelBytes;
    const auto Fits = [&] {
        return static_cast<long long>(mnBlockCols) * mnBlockRows <= nMostPixels;
    };
    mnBlockRows = kLargestSide;
    mnBlockCols = kLargestSide;
    if (nPieceCols >= mnCols) {
        mnBlockCols = mnCols;
        while (mnBlockRows > 1 &&
               (!Fits() || static_cast<long long>(mnBlockCols) * mnBlockRows >
                               static_cast<long long>(kLargestSide) * kLargestSide)) {
            mnBlockRows /= 2;
        }
    }
    mnBlockCols = std::min(mnBlockCols, mnCols);
    while (!Fits() && mnBlockCols > 1) {
        mnBlockCols = (mnBlockCols + 1) / 2;
        mnBlockRows = std::max(1, std::min(mnBlockRows, mnBlockCols));
    }
}

void WarpMapping::PushRow() {
    const int nRows = std::min(mnBlockRows, mnRows - mnNextRow);
    const int nAcross = (mnCols - 1) / mnBlockCols + 1;
    for (int n = nAcross - 1; n >= 0; --n) {
        const int nCol = n * mnBlockCols;
        moPending.push_back({nCol, mnNextRow, std::min(mnBlockCols, mnCols - nCol), nRows});
    }
    mnNextRow += nRows;
}

void WarpMapping::FillPositions(const PixelRect& oRect, MappedBlock& oMapped) {
    if (moShift.IsNone()) {
        moLattice.Fill(oRect, oMapped.oPositions);
        return;
    }
    moLattice.Fill(oRect, oMapped.oUnmovedPositions);
    oMapped.oPositions = oMapped.oUnmovedPositions;
    for (double& df : oMapped.oPositions.vdfCol) {
        df += moShift.dfCols;
    }
    for (double& df : oMapped.oPositions.vdfRow) {
        df += moShift.dfRows;
    }
}

bool WarpMapping::GetNext(MappedBlock& oMapped) {
    for (;;) {
        if (moPending.empty()) {
            if (mnNextRow == mnRows) {
                return false;
            }
            PushRow();
        }
        PixelRect oRect = moPending.back();
        moPending.pop_back();
        FillPositions(oRect, oMapped);
        const auto Wrap = [&](const PositionArrays& oPositions, auto& oArrays) {
            oArrays.emplace(oRect.nCols, oRect.nRows, oPositions.vdfCol.data(),
                            oPositions.vdfRow.data());
        };
        Wrap(oMapped.oPositions, oMapped.oArrays);
        const utils::BlockPlanner oPlanner(*oMapped.oArrays, mnSrcCols, mnSrcRows, moResampler,
                                           oRect.nCols, oRect.nRows);
        const utils::ResampleBlock oLocal = oPlanner.GetBlock(0);
        const long long nMostPixels =
            (moBudget.nMaxBytes - oRect.GetNumPix() * moBudget.nTgtPixelBytes) /
            moBudget.nSrcPixelBytes;
        if (oLocal.oSource.GetNumPix() > nMostPixels && oRect.GetNumPix() > 1) {
            PixelRect oSecond = oRect;
            int PixelRect::*const pStart =
                oRect.nCols > oRect.nRows ? &PixelRect::nCol : &PixelRect::nRow;
            int PixelRect::*const pCount =
                oRect.nCols > oRect.nRows ? &PixelRect::nCols : &PixelRect::nRows;
            oRect.*pCount /= 2;
            oSecond.*pStart += oRect.*pCount;
            oSecond.*pCount -= oRect.*pCount;
            moPending.push_back(oSecond);
            moPending.push_back(oRect);
            continue;
        }
        oMapped.oBlock = {oRect, oLocal.oSource};
        oMapped.oTfm.emplace(oPlanner.GetLocalTfm(oLocal));
        if (moShift.IsNone()) {
            oMapped.oUnmoved = oMapped.oTfm;
        } else {
            Wrap(oMapped.oUnmovedPositions, oMapped.oUnmovedArrays);
            oMapped.oUnmoved.emplace(*oMapped.oUnmovedArrays, oLocal.oTarget, oLocal.oSource.nCol,
                                     oLocal.oSource.nRow);
        }
        return true;
    }
}

}  // namespace vetra::tool
