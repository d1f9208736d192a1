#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_PIXELMODE_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_PIXELMODE_H

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

/// Decides the modes of pixels from what is known of their positions, requests and source masks
/// included.
class ModeChooser {
 public:
    ModeChooser(ModeRule eRule, const Window& oWindow, const unsigned char* pabySrcMask,
                int nSrcCols, NodataFillAction eFillAction)
        : meRule(eRule),
          moWindow(oWindow),
          mpabySrcMask(pabySrcMask),
          mnSrcCols(nSrcCols),
          meFillAction(eFillAction) {}

    /// The mode of a pixel.
    /// \param nRequest  the target mask's byte
    /// \param nClass    class bits of the position
    /// \param nWindow   index of the source pixel at which the window starts, if it fits
    /// \param nNearest  index of the nearest source pixel, if that is inside
    unsigned char Choose(unsigned char nRequest, unsigned char nClass, long long nWindow,
                         long long nNearest) const {
        if (nRequest == ePO_BACKGROUND || nRequest == ePO_UNTOUCHED) {
            return nRequest;
        }
        const bool bInside = (nClass & kClassNear) != 0;
        if (meRule == ModeRule::eNearestSample) {
            if (!bInside || MaskByte(nNearest) == 0) {
                return ePO_BACKGROUND;
            }
            return nRequest <= ePO_NEAREST ? ePO_NEAREST : ePO_UNTOUCHED;
        }
        if (nRequest != ePO_NEAREST && (nClass & kClassFits) != 0 && WindowIsValid(nWindow)) {
            return ePO_INTERPOLATED;
        }
        const bool bFill = nRequest == ePO_NEAREST || meFillAction != eNFA_BGD;
        return bFill && bInside && MaskByte(nNearest) == 1 ? ePO_NEAREST : ePO_BACKGROUND;
    }

 private:
    unsigned char MaskByte(long long nPixel) const {
        return mpabySrcMask == nullptr ? static_cast<unsigned char>(1) : mpabySrcMask[nPixel];
    }

    bool WindowIsValid(long long nWindow) const {
        if (mpabySrcMask == nullptr) {
            return true;
        }
        const unsigned char* pabyRow = mpabySrcMask + nWindow;
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
    NodataFillAction meFillAction;
};

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_PIXELMODE_H
