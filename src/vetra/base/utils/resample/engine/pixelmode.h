#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_PIXELMODE_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_PIXELMODE_H

#include "vetra/base/utils/resample/engine/stages.h"
#include "vetra/base/utils/resample/resample.h"

namespace vetra::utils::engine {

/// How a method decides what becomes of a pixel.
enum class ModeRule {
    eWindow,  ///< as `ChooseResampleMode` and `ChooseResampleModeForFilter`
    /// The window has to lie inside the source and the nearest pixel has to be valid (its mask byte
    /// isn't 0); else the background, whatever is requested.
    eReplacingWindow,
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

/// What becomes of a pixel, by its request and by what its position and the source mask allow: the
/// window bit of a class says that the window is whole, the nearest bit that the nearest sample may
/// be used.
class ModeTable {
 public:
    ModeTable(ModeRule eRule, NodataFillAction eFillAction) {
        for (unsigned char nRequest = 0; nRequest < kRequests; ++nRequest) {
            for (unsigned char nClass = 0; nClass < kClasses; ++nClass) {
                mabyMode[nRequest * kClasses + nClass] =
                    Choose(eRule, eFillAction, nRequest, nClass);
            }
        }
    }

    unsigned char Get(unsigned char nRequest, unsigned char nClass) const {
        // Requests above 3 are all the same.
        const int nRow = nRequest < kRequests ? nRequest : kRequests - 1;
        return mabyMode[nRow * kClasses + nClass];
    }

 private:
    static constexpr int kRequests = 5;
    static constexpr int kClasses = 4;

    static unsigned char Choose(ModeRule eRule, NodataFillAction eFillAction,
                                unsigned char nRequest, unsigned char nClass) {
        const bool bWhole = (nClass & kClassFits) != 0;
        const bool bUsable = (nClass & kClassNear) != 0;
        if (eRule == ModeRule::eReplacingWindow) {
            if (!bWhole || !bUsable) {
                return ePO_BACKGROUND;
            }
            return nRequest <= ePO_UNTOUCHED ? nRequest : static_cast<unsigned char>(ePO_UNTOUCHED);
        }
        if (nRequest == ePO_BACKGROUND || nRequest == ePO_UNTOUCHED) {
            return nRequest;
        }
        if (eRule == ModeRule::eNearestSample) {
            if (!bUsable) {
                return ePO_BACKGROUND;
            }
            return nRequest <= ePO_NEAREST ? ePO_NEAREST : ePO_UNTOUCHED;
        }
        if (nRequest != ePO_NEAREST && bWhole) {
            return ePO_INTERPOLATED;
        }
        const bool bFill = nRequest == ePO_NEAREST || eFillAction != eNFA_BGD;
        return bFill && bUsable ? ePO_NEAREST : ePO_BACKGROUND;
    }

    unsigned char mabyMode[kRequests * kClasses];
};

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_PIXELMODE_H
