#include "vetra/base/utils/resample/resampleutils.h"

#include "vetra/base/utils/resample/engine/pixelmode.h"

namespace engine = vetra::utils::engine;
using vetra::utils::NodataFillAction;

namespace {

unsigned char ChooseMode(unsigned char nRequest, const unsigned char* pabySrcMask, int nSrcCols,
                         int nSrcRows, double dfCol, double dfRow, const engine::Window& oWindow,
                         NodataFillAction eFillAction) {
    const engine::ModeChooser oChooser(engine::ModeRule::eWindow, oWindow, pabySrcMask, nSrcCols,
                                       nSrcRows, eFillAction);
    return oChooser.Choose(nRequest, oChooser.Classify(dfCol, dfRow), dfCol, dfRow);
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
