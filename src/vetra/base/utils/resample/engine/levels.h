#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_LEVELS_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_LEVELS_H

#include "vetra/base/utils/low/processorlevel.h"
#include "vetra/base/utils/resample/engine/stages.h"

namespace vetra::utils::engine {

using low::GetBestLevel;
using low::GetSupportedLevels;
using low::Level;

/// The stages of a level, which must be a supported one.
const LevelStages& GetStages(Level eLevel);

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_LEVELS_H
