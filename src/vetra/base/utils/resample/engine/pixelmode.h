#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_PIXELMODE_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_PIXELMODE_H

#include <cmath>
#include <limits>

#include "vetra/base/utils/resample/engine/stages.h"
#include "vetra/base/utils/resample/resample.h"

namespace vetra::utils::engine {

/// How a method decides what becomes of a pixel.
enum class ModeRule {
    eWindow,         ///< as `ChooseResampleMode` and `ChooseResampleModeForFilter`
    eNearestSample,  ///< no window: the nearest sample, valid while its mask byte isn't 0
};

/// A method's window.
struct Window {
    int nColOff = 0;
    int nRowOff = 0;
    int nCols = 1;
    int nRows = 1;
    /// Offsets count from the nearest pixel, not from the floor.
    bool bAnchorNearest = true;
};

/// floor as an int; NaN and values beyond int give the lowest int, which is outside every source.
inline int FloorToInt(double df) {
    const double dfFloor = std::floor(df);
    constexpr double dfLowest = std::numeric_limits<int>::min();
    constexpr double dfHighest = std::numeric_limits<int>::max();
    return dfFloor >= dfLowest && dfFloor <= dfHighest ? static_cast<int>(dfFloor)
                                                       : std::numeric_limits<int>::min();
}
inline int NearestToInt(double df) { return FloorToInt(df + 0.5); }

/// Decides the mode of single pixels: requests and source masks included.
class ModeChooser {
 public:
    ModeChooser(ModeRule eRule, const Window& oWindow, const unsigned char* pabySrcMask,
                int nSrcCols, int nSrcRows, NodataFillAction eFillAction)
        : meRule(eRule),
          moWindow(oWindow),
          mpabySrcMask(pabySrcMask),
          mnSrcCols(nSrcCols),
          mnSrcRows(nSrcRows),
          meFillAction(eFillAction) {}

    /// The class bits of a position.
    unsigned char Classify(double dfCol, double dfRow) const {
        const int nNearCol = NearestToInt(dfCol);
        const int nNearRow = NearestToInt(dfRow);
        // 64 bits: the sums leave int for an outside position or an extreme window.
        const long long nFirstCol = FirstCol(dfCol);
        const long long nFirstRow = FirstRow(dfRow);
        const bool bFits = nFirstCol >= 0 && nFirstRow >= 0 &&
                           nFirstCol <= static_cast<long long>(mnSrcCols) - moWindow.nCols &&
                           nFirstRow <= static_cast<long long>(mnSrcRows) - moWindow.nRows;
        const bool bNear =
            nNearCol >= 0 && nNearCol < mnSrcCols && nNearRow >= 0 && nNearRow < mnSrcRows;
        return static_cast<unsigned char>((bFits ? kClassFits : 0) | (bNear ? kClassNear : 0));
    }

    /// The mode of a pixel with this request, position, and class.
    unsigned char Choose(unsigned char nRequest, unsigned char nClass, double dfCol,
                         double dfRow) const {
        if (nRequest == ePO_BACKGROUND || nRequest == ePO_UNTOUCHED) {
            return nRequest;
        }
        if (meRule == ModeRule::eNearestSample) {
            if ((nClass & kClassNear) == 0 || NearestMaskByte(dfCol, dfRow) == 0) {
                return ePO_BACKGROUND;
            }
            return nRequest <= ePO_NEAREST ? ePO_NEAREST : ePO_UNTOUCHED;
        }
        if (nRequest != ePO_NEAREST && (nClass & kClassFits) != 0 && WindowIsValid(dfCol, dfRow)) {
            return ePO_INTERPOLATED;
        }
        const bool bFill = nRequest == ePO_NEAREST || meFillAction != eNFA_BGD;
        const bool bUsable = (nClass & kClassNear) != 0 && NearestMaskByte(dfCol, dfRow) == 1;
        return bFill && bUsable ? ePO_NEAREST : ePO_BACKGROUND;
    }

 private:
    long long FirstCol(double dfCol) const {
        return static_cast<long long>(moWindow.bAnchorNearest ? NearestToInt(dfCol)
                                                              : FloorToInt(dfCol)) +
               moWindow.nColOff;
    }
    long long FirstRow(double dfRow) const {
        return static_cast<long long>(moWindow.bAnchorNearest ? NearestToInt(dfRow)
                                                              : FloorToInt(dfRow)) +
               moWindow.nRowOff;
    }

    unsigned char NearestMaskByte(double dfCol, double dfRow) const {
        if (mpabySrcMask == nullptr) {
            return 1;
        }
        return mpabySrcMask[static_cast<long long>(NearestToInt(dfRow)) * mnSrcCols +
                            NearestToInt(dfCol)];
    }

    bool WindowIsValid(double dfCol, double dfRow) const {
        if (mpabySrcMask == nullptr) {
            return true;
        }
        const unsigned char* pabyRow = mpabySrcMask + FirstRow(dfRow) * mnSrcCols + FirstCol(dfCol);
        for (int nRow = 0; nRow < moWindow.nRows; ++nRow, pabyRow += mnSrcCols) {
            for (int nCol = 0; nCol < moWindow.nCols; ++nCol) {
                if (pabyRow[nCol] == 0) {
                    return false;
                }
            }
        }
        return true;
    }

    ModeRule meRule;
    Window moWindow;
    const unsigned char* mpabySrcMask;
    int mnSrcCols;
    int mnSrcRows;
    NodataFillAction meFillAction;
};

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_PIXELMODE_H
