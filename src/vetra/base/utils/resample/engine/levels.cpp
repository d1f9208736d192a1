#include "vetra/base/utils/resample/engine/levels.h"

namespace vetra::utils::engine {

namespace portable {
extern const LevelStages kStages;
}
#ifdef VETRA_X86_LEVELS
namespace v2 {
extern const LevelStages kStages;
}
namespace v3 {
extern const LevelStages kStages;
}
namespace v4 {
extern const LevelStages kStages;
}
#endif

const LevelStages& GetStages(Level eLevel) {
#ifdef VETRA_X86_LEVELS
    switch (eLevel) {
        case Level::eV4:
            return v4::kStages;
        case Level::eV3:
            return v3::kStages;
        case Level::eV2:
            return v2::kStages;
        case Level::ePortable:
            break;
    }
#else
    static_cast<void>(eLevel);
#endif
    return portable::kStages;
}

}  // namespace vetra::utils::engine
