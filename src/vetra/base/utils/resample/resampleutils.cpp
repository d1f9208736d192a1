#include "vetra/base/utils/resample/resampleutils.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "vetra/base/utils/resample/engine/pixelmode.h"

namespace engine = vetra::utils::engine;
using vetra::utils::NodataFillAction;

namespace {

// floor as an int; NaN and values beyond int give the lowest int, which is outside every source.
int FloorToInt(double df) {
    const double dfFloor = std::floor(df);
    constexpr double dfLowest = std::numeric_limits<int>::min();
    constexpr double dfHighest = std::numeric_limits<int>::max();
    return dfFloor >= dfLowest && dfFloor <= dfHighest ? static_cast<int>(dfFloor)
                                                       : std::numeric_limits<int>::min();
}

unsigned char ChooseMode(unsigned char nRequest, const unsigned char* pabySrcMask, int nSrcCols,
                         int nSrcRows, double dfCol, double dfRow, const engine::Window& oWindow,
                         NodataFillAction eFillAction) {
    // 64 bits: the sums leave int for an outside position or an extreme window.
    const long long nNearCol = FloorToInt(dfCol + 0.5);
    const long long nNearRow = FloorToInt(dfRow + 0.5);
    const long long nCol =
        (oWindow.bAnchorNearest ? nNearCol : FloorToInt(dfCol)) + oWindow.nColOff;
    const long long nRow =
        (oWindow.bAnchorNearest ? nNearRow : FloorToInt(dfRow)) + oWindow.nRowOff;
    const auto fnStarts = [](long long nFirst, int nSize, int nWindow) {
        return nFirst >= 0 && nFirst <= static_cast<long long>(nSize) - nWindow;
    };
    bool bWhole =
        fnStarts(nCol, nSrcCols, oWindow.nCols) && fnStarts(nRow, nSrcRows, oWindow.nRows);
    bool bUsable = fnStarts(nNearCol, nSrcCols, 1) && fnStarts(nNearRow, nSrcRows, 1);
    if (pabySrcMask != nullptr) {
        for (int y = 0; bWhole && y < oWindow.nRows; ++y) {
            const unsigned char* pabyRow = pabySrcMask + (nRow + y) * nSrcCols + nCol;
            bWhole = std::find(pabyRow, pabyRow + std::max(oWindow.nCols, 0), 0) ==
                     pabyRow + std::max(oWindow.nCols, 0);
        }
        bUsable = bUsable && pabySrcMask[nNearRow * nSrcCols + nNearCol] == 1;
    }
    const engine::ModeTable oModes(engine::ModeRule::eWindow, eFillAction);
    return oModes.Get(nRequest, static_cast<unsigned char>((bWhole ? engine::kClassFits : 0) |
                                                           (bUsable ? engine::kClassNear : 0)));
}

}  // namespace

unsigned char ChooseResampleMode(unsigned char nRequest, const unsigned char* pabySrcMask,
                                 int nSrcCols, int nSrcRows, double dfCol, double dfRow,
                                 int nColOff, int nRowOff, int nWndCols, int nWndRows,
                                 NodataFillAction eFillAction) {
    return ChooseMode(nRequest, pabySrcMask, nSrcCols, nSrcRows, dfCol, dfRow,
                      {nColOff, nRowOff, nWndCols, nWndRows, false}, eFillAction);
}

unsigned char ChooseResampleModeForFilter(unsigned char nRequest, const unsigned char* pabySrcMask,
                                          int nSrcCols, int nSrcRows, double dfCol, double dfRow,
                                          int nColOff, int nRowOff, int nWndCols, int nWndRows,
                                          NodataFillAction eFillAction) {
    return ChooseMode(nRequest, pabySrcMask, nSrcCols, nSrcRows, dfCol, dfRow,
                      {nColOff, nRowOff, nWndCols, nWndRows, true}, eFillAction);
}
