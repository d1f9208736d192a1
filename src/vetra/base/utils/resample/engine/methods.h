#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_METHODS_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_METHODS_H

#include "vetra/base/utils/resample/engine/task.h"

namespace vetra::utils::engine {

/// The methods, as the sampling loop sees them.
inline constexpr Method kNearestMethod{ModeRule::eNearestSample, Window{0, 0, 1, 1, true}, nullptr};
inline constexpr Method kBilinearMethod{ModeRule::eWindow, Window{0, 0, 2, 2, false},
                                        &LevelStages::apfnBilinear};

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_METHODS_H
