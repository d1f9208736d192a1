#include "rasterjob/targetmapping.h"

#include <algorithm>

namespace vetra::tool {

namespace {

// Blocks are smaller than memory allows where an image has many, so that the progress moves and the
// steps of a run overlap.
constexpr long long kFewestBlocks = 64;
constexpr long long kSmallestBlock = 4 * 1024 * 1024;

long long GetBlockBytes(const Grid& oGrid, int nSrcCols, int nSrcRows, const BlockBudget& oBudget) {
    const long long nAllBytes =
        static_cast<long long>(nSrcCols) * nSrcRows * oBudget.nSrcPixelBytes +
        static_cast<long long>(oGrid.nCols) * oGrid.nRows * oBudget.nTgtPixelBytes;
    return std::min(oBudget.nMaxBytes, std::max(kSmallestBlock, nAllBytes / kFewestBlocks));
}

}  // namespace

WindowShift::WindowShift(const utils::IRasterResampler& oResampler) {
    int nColOff, nRowOff, nCols, nRows;
    utils::WindowAnchorPoint eColAnchor, eRowAnchor;
    oResampler.GetWindowExtents(nColOff, nRowOff, nCols, nRows, eColAnchor, eRowAnchor);
    if (eColAnchor == utils::eWAP_NEAREST) {
        dfCols = -(nColOff + (nCols - 1) / 2.0);
    }
    if (eRowAnchor == utils::eWAP_NEAREST) {
        dfRows = -(nRowOff + (nRows - 1) / 2.0);
    }
}

ScaledMapping::ScaledMapping(const Grid& oGrid, int nSrcCols, int nSrcRows,
                             const utils::IRasterResampler& oResampler, const BlockBudget& oBudget)
    : ScaledMapping(oGrid, WindowShift(oResampler), nSrcCols, nSrcRows, oResampler, oBudget) {}

ScaledMapping::ScaledMapping(const Grid& oGrid, const WindowShift& oShift, int nSrcCols,
                             int nSrcRows, const utils::IRasterResampler& oResampler,
                             const BlockBudget& oBudget)
    : moTfm(oGrid.nCols, oGrid.nRows, oGrid.dfColScale, oShift.dfCols, oGrid.dfRowScale,
            oShift.dfRows, 0, 0),
      moUnmoved(oGrid.nCols, oGrid.nRows, oGrid.dfColScale, 0.0, oGrid.dfRowScale, 0.0, 0, 0),
      moPlanner(moTfm, nSrcCols, nSrcRows, oResampler, oBudget.nSrcPixelBytes,
                oBudget.nTgtPixelBytes, GetBlockBytes(oGrid, nSrcCols, nSrcRows, oBudget)) {}

bool ScaledMapping::GetNext(MappedBlock& oMapped) {
    if (mnNext == moPlanner.GetNumBlocks()) {
        return false;
    }
    const utils::ResampleBlock oBlock = moPlanner.GetBlock(mnNext++);
    oMapped.oBlock = oBlock;
    oMapped.oTfm.emplace(moPlanner.GetLocalTfm(oBlock));
    oMapped.oUnmoved.emplace(moUnmoved, oBlock.oTarget, oBlock.oSource.nCol, oBlock.oSource.nRow);
    return true;
}

}  // namespace vetra::tool
