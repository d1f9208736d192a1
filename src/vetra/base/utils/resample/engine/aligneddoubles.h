#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_ALIGNEDDOUBLES_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_ALIGNEDDOUBLES_H

#include <cstddef>
#include <memory>
#include <new>

#include "vetra/base/utils/resample/engine/stages.h"

namespace vetra::utils::engine {

struct AlignedDelete {
    void operator()(double* padf) const { ::operator delete[](padf, std::align_val_t{kAlignment}); }
};
using AlignedDoubles = std::unique_ptr<double[], AlignedDelete>;

/// nCount zeros, from a multiple of kAlignment bytes on. Throws std::bad_alloc.
inline AlignedDoubles MakeAlignedDoubles(std::size_t nCount) {
    return AlignedDoubles(new (std::align_val_t{kAlignment}) double[nCount]());
}

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_ALIGNEDDOUBLES_H
