#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_METHODS_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_METHODS_H

#include "vetra/base/utils/resample/engine/task.h"

namespace vetra::utils::engine {

/// The window of a method of nSize x nSize pixels around the position.
constexpr Window SquareWindow(int nSize) {
    return {1 - nSize / 2, 1 - nSize / 2, nSize, nSize, false};
}

/// The methods, as the sampling loop sees them. A squared twin differs in the samples that it
/// reads.
inline constexpr Method kNearestMethod{
    ModeRule::eNearestSample, {0, 0, 1, 1, true}, eVR_NONE, false};
inline constexpr Method kBilinearMethod{ModeRule::eWindow, SquareWindow(2), eVR_BILINEAR, false};
inline constexpr Method kCubicMethod{ModeRule::eWindow, SquareWindow(4), eVR_CUBIC, false};
inline constexpr Method kCubicPsMethod{ModeRule::eReplacingWindow, SquareWindow(4), eVR_CUBICPS,
                                       false};
inline constexpr Method kLagrange4Method{ModeRule::eWindow, SquareWindow(4), eVR_LAGRANGE4, false};
inline constexpr Method kLagrange8Method{ModeRule::eWindow, SquareWindow(8), eVR_LAGRANGE8, false};

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

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_METHODS_H
