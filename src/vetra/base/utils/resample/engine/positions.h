#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_POSITIONS_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_POSITIONS_H

#include "vetra/base/utils/resample/engine/stages.h"
#include "vetra/base/utils/resample/postfm/bufposblocktfm.h"
#include "vetra/base/utils/resample/postfm/ibufpostfm.h"

namespace vetra::utils::engine {

/// The first stage: source positions of a stretch of target pixels. The library's own transforms
/// are evaluated inline, a caller's through its virtual call; all give what `GetSrcPos` gives.
class Positions {
 public:
    explicit Positions(const IBufPosTfm& oTfm);

    /// Whether a column position depends on the target column alone and a row position on the row
    /// alone, for a target of this width.
    bool IsAxisAligned(int nTgtCols) const;

    /// Positions of target pixels nFirst to nFirst + nPix - 1, at most kSpanPixels. The arrays have
    /// room for kLanes more, and hold copies of the last position up to a whole group.
    PositionBounds Fill(const LevelStages& oStages, long long nFirst, int nPix, double* padfCol,
                        double* padfRow) const;

 private:
    enum class Kind { eArray, eDoubleArray, eBilinear, eScaleOff, eOther };

    PositionBounds FillStretch(const LevelStages& oStages, long long nWholeCol, long long nWholeRow,
                               int nPix, double* padfCol, double* padfRow) const;

    /// The transform of the whole target, and the part of it that the run is about.
    const IBufPosTfm* mpoWhole;
    PixelRect moPart;
    int mnWholeCols;
    int mnSrcCol = 0;
    int mnSrcRow = 0;

    Kind meKind = Kind::eOther;
    const float* mpafCol = nullptr;
    const float* mpafRow = nullptr;
    const double* mpadfCol = nullptr;
    const double* mpadfRow = nullptr;
    int mnColOff = 0;
    int mnRowOff = 0;
    BilinearCorners moCorners{};
};

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_POSITIONS_H
