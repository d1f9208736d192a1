#include "vetra/base/utils/math/densify/rows.h"

namespace vetra::utils::math::densify {

namespace portable {
extern const Rows kRows;
}
#ifdef VETRA_X86_LEVELS
namespace v3 {
extern const Rows kRows;
}
namespace v4 {
extern const Rows kRows;
}
#endif

const Rows& GetRows(low::Level eLevel) {
#ifdef VETRA_X86_LEVELS
    switch (eLevel) {
        case low::Level::eV4:
            return v4::kRows;
        case low::Level::eV3:
            return v3::kRows;
        case low::Level::eV2:  // has no wider vectors
        case low::Level::ePortable:
            break;
    }
#else
    static_cast<void>(eLevel);
#endif
    return portable::kRows;
}

}  // namespace vetra::utils::math::densify
