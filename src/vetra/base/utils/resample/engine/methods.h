#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_METHODS_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_METHODS_H

#include "vetra/base/utils/resample/engine/task.h"

namespace vetra::utils::engine {

/// A window whose middle pixel, or the one before the middle, is the anchor.
constexpr Window CentredWindow(int nCols, int nRows, bool bAnchorNearest) {
    return {-((nCols - 1) / 2), -((nRows - 1) / 2), nCols, nRows, bAnchorNearest};
}
constexpr Window SquareWindow(int nSize) { return CentredWindow(nSize, nSize, false); }

/// The methods, as the sampling loop sees them. A squared twin differs in the samples that it
/// reads.
inline constexpr Method kNearestMethod{
    ModeRule::eNearestSample, {0, 0, 1, 1, true}, eVR_NONE, false};
inline constexpr Method kBilinearMethod{ModeRule::eWindow, SquareWindow(2), eVR_BILINEAR, false};
inline constexpr Method kCubicMethod{ModeRule::eWindow, SquareWindow(4), eVR_CUBIC, false};
inline constexpr Method kCubicPsMethod{ModeRule::eReplacingWindow, SquareWindow(4), eVR_CUBICPS,
                                       false};
inline constexpr Method kSinc8Method{ModeRule::eWindow, SquareWindow(8), eVR_SINC8, false};
inline constexpr Method kSinc16Method{ModeRule::eWindow, SquareWindow(16), eVR_SINC16, false};
inline constexpr Method kLagrange4Method{ModeRule::eWindow, SquareWindow(4), eVR_LAGRANGE4, false};
inline constexpr Method kLagrange8Method{ModeRule::eWindow, SquareWindow(8), eVR_LAGRANGE8, false};

/// Methods whose windows have a size of their own in each run; see `WithWindow`.
inline constexpr Method kAverageMethod{ModeRule::eWindow, {}, eVR_AVERAGE, false};
inline constexpr Method kMedianMethod{ModeRule::eWindow, {}, eVR_MEDIAN, false, 1, 1};
inline constexpr Method kKernelMethod{ModeRule::eWindow, {}, eVR_KERNEL, false};
inline constexpr Method kCplxSarMethod{ModeRule::eWindow, {}, eVR_CPLXSAR, false, 2};

/// The method with the window of a run.
constexpr Method WithWindow(Method oMethod, const Window& oWindow) {
    oMethod.oWindow = oWindow;
    return oMethod;
}

/// A method on the roots of the samples: its own row of values, and no negative nearest samples.
constexpr Method SquaredTwin(Method oPlain, ValuesRow eValues) {
    oPlain.eValues = eValues;
    oPlain.bNonNegative = true;
    return oPlain;
}

inline constexpr Method kSqNearestMethod = SquaredTwin(kNearestMethod, eVR_NONE);
inline constexpr Method kSqBilinearMethod = SquaredTwin(kBilinearMethod, eVR_SQBILINEAR);
inline constexpr Method kSqCubicMethod = SquaredTwin(kCubicMethod, eVR_SQCUBIC);
inline constexpr Method kSqCubicPsMethod = SquaredTwin(kCubicPsMethod, eVR_SQCUBICPS);
inline constexpr Method kSqLagrange4Method = SquaredTwin(kLagrange4Method, eVR_SQLAGRANGE4);
inline constexpr Method kSqLagrange8Method = SquaredTwin(kLagrange8Method, eVR_SQLAGRANGE8);
inline constexpr Method kSqSinc8Method = SquaredTwin(kSinc8Method, eVR_SQSINC8);
inline constexpr Method kSqSinc16Method = SquaredTwin(kSinc16Method, eVR_SQSINC16);
inline constexpr Method kSqAverageMethod = SquaredTwin(kAverageMethod, eVR_SQAVERAGE);
inline constexpr Method kSqMedianMethod = SquaredTwin(kMedianMethod, eVR_SQMEDIAN);
/// Unlike the others it leaves negative nearest samples as they are.
inline constexpr Method kSqKernelMethod{ModeRule::eWindow, {}, eVR_SQKERNEL, false};

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_METHODS_H
