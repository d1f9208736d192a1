#ifndef VETRA_BASE_UTILS_LOW_PROCESSORLEVEL_H
#define VETRA_BASE_UTILS_LOW_PROCESSORLEVEL_H

#include <vector>

namespace vetra::utils::low {

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

}  // namespace vetra::utils::low

#endif  // VETRA_BASE_UTILS_LOW_PROCESSORLEVEL_H
