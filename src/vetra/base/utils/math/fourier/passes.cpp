#include "vetra/base/utils/math/fourier/passes.h"

namespace vetra::utils::math::fourier {

namespace portable {
extern const Passes kPasses;
}
#ifdef VETRA_X86_LEVELS
namespace v3 {
extern const Passes kPasses;
}
namespace v4 {
extern const Passes kPasses;
}
#endif

const Passes& GetPasses(low::Level eLevel) {
#ifdef VETRA_X86_LEVELS
    switch (eLevel) {
        case low::Level::eV4:
            return v4::kPasses;
        case low::Level::eV3:
            return v3::kPasses;
        case low::Level::eV2:  // has no wider vectors
        case low::Level::ePortable:
            break;
    }
#else
    static_cast<void>(eLevel);
#endif
    return portable::kPasses;
}

}  // namespace vetra::utils::math::fourier
