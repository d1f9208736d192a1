#include "vetra/base/utils/resample/resampleutils.h"

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
    const bool bFits =
        fnStarts(nCol, nSrcCols, oWindow.nCols) && fnStarts(nRow, nSrcRows, oWindow.nRows);
    const bool bNear = fnStarts(nNearCol, nSrcCols, 1) && fnStarts(nNearRow, nSrcRows, 1);
    const engine::ModeChooser oChooser(engine::ModeRule::eWindow, oWindow, pabySrcMask, nSrcCols,
                                       eFillAction);
    return oChooser.Choose(nRequest,
                           static_cast<unsigned char>((bFits ? engine::kClassFits : 0) |
                                                      (bNear ? engine::kClassNear : 0)),
                           nRow * nSrcCols + nCol, nNearRow * nSrcCols + nNearCol);
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
