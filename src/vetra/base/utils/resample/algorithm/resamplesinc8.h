#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLESINC8_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLESINC8_H

#include <vector>

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"
#include "vetra/faultcore/exceptions.h"

/// Windowed sinc over 8 x 8 pixels. vdfWeights holds 8 taps for each of 65 phases.
/// \throws ParameterException when it holds fewer.
template <typename Tin, typename Tout>
void ResampleSinc8(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                   vetra::utils::NodataFillAction eFillAction,
                   const std::vector<double>& vdfWeights) {
    using namespace vetra::utils;
    CheckNumWeights(vdfWeights, 8 * (kTabulatedSubPixels + 1), VETRA_HERE);
    const engine::KernelTables oTables{vdfWeights.data(), vdfWeights.data(), 8, 8,
                                       kTabulatedSubPixels};
    engine::Sample(oArgs, engine::kSinc8Method, eFillAction, &oTables);
}

/// As its plain twin, on the square roots of the samples, with the result squared.
template <typename Tin, typename Tout>
void ResampleSqSinc8(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                     vetra::utils::NodataFillAction eFillAction,
                     const std::vector<double>& vdfWeights) {
    using namespace vetra::utils;
    CheckNumWeights(vdfWeights, 8 * (kTabulatedSubPixels + 1), VETRA_HERE);
    const engine::KernelTables oTables{vdfWeights.data(), vdfWeights.data(), 8, 8,
                                       kTabulatedSubPixels};
    engine::Sample(oArgs, engine::kSqSinc8Method, eFillAction, &oTables);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLESINC8_H
