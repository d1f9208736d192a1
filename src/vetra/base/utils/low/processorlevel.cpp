#include "vetra/base/utils/low/processorlevel.h"

namespace vetra::utils::low {

std::vector<Level> GetSupportedLevels() {
    std::vector<Level> veLevels{Level::ePortable};
#ifdef VETRA_X86_LEVELS
    // A processor with the named features has the rest of its level too; compilers differ in the
    // names of the whole levels.
    __builtin_cpu_init();
    const bool bV2 = __builtin_cpu_supports("sse4.2") && __builtin_cpu_supports("popcnt");
    const bool bV3 = bV2 && __builtin_cpu_supports("avx2") && __builtin_cpu_supports("fma") &&
                     __builtin_cpu_supports("bmi") && __builtin_cpu_supports("bmi2");
    const bool bV4 = bV3 && __builtin_cpu_supports("avx512f") &&
                     __builtin_cpu_supports("avx512bw") && __builtin_cpu_supports("avx512cd") &&
                     __builtin_cpu_supports("avx512dq") && __builtin_cpu_supports("avx512vl");
    if (bV2) {
        veLevels.push_back(Level::eV2);
    }
    if (bV3) {
        veLevels.push_back(Level::eV3);
    }
    if (bV4) {
        veLevels.push_back(Level::eV4);
    }
#endif
    return veLevels;
}

Level GetBestLevel() {
    static const Level keBest = GetSupportedLevels().back();
    return keBest;
}

}  // namespace vetra::utils::low
