#ifndef VETRA_BASE_UTILS_MATH_FOURIER_PASSES_H
#define VETRA_BASE_UTILS_MATH_FOURIER_PASSES_H

#include <cstddef>

#include "vetra/base/utils/low/processorlevel.h"

// Private: the passes of both families of transforms, compiled once per processor level.
namespace vetra::utils::math::fourier {

struct Passes {
    const char* pszName;

    /// The whole of `CDFT1d`; arguments as there.
    void (*pfnTableTransform)(std::ptrdiff_t n, float* pafData, float* pafWork,
                              const float* pafTable, bool bFlag);

    /// The butterfly passes of `ComplexDFT1d` over bit-reversed data of nFloats floats, at least 2.
    void (*pfnButterflies)(std::ptrdiff_t nFloats, float* pafData, const float* pafTable,
                           bool bFlag);
};

/// The passes of a level, which must be a supported one.
const Passes& GetPasses(low::Level eLevel);

}  // namespace vetra::utils::math::fourier

#endif  // VETRA_BASE_UTILS_MATH_FOURIER_PASSES_H
