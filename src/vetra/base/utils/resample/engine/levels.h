#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_LEVELS_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_LEVELS_H

#include <vector>

#include "vetra/base/utils/resample/engine/stages.h"

namespace vetra::utils::engine {

/// Processor levels, lowest first.
enum class Level : int {
    ePortable,  ///< whatever the library is compiled for
    eV2,        ///< x86-64-v2: SSE4.1
    eV3,        ///< x86-64-v3: AVX2
    eV4,        ///< x86-64-v4: AVX-512
};

/// The levels that this machine can run, lowest first; ePortable always.
std::vector<Level> GetSupportedLevels();

/// The highest of them, found once.
Level GetBestLevel();

/// The stages of a level, which must be a supported one.
const LevelStages& GetStages(Level eLevel);

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_LEVELS_H
