#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLESINC16_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLESINC16_H

#include <vector>

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"
#include "vetra/faultcore/exceptions.h"

/// Windowed sinc over 16 x 16 pixels. vdfWeights holds 16 taps for each of 65 phases.
/// \throws ParameterException when it holds fewer.
template <typename Tin, typename Tout>
void ResampleSinc16(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                    vetra::utils::NodataFillAction eFillAction,
                    const std::vector<double>& vdfWeights) {
    using namespace vetra::utils;
    CheckNumWeights(vdfWeights, 16 * (kTabulatedSubPixels + 1), VETRA_HERE);
    const engine::KernelTables oTables{vdfWeights.data(), vdfWeights.data(), 16, 16,
                                       kTabulatedSubPixels};
    engine::Sample(oArgs, engine::kSinc16Method, eFillAction, &oTables);
}

/// As its plain twin, on the square roots of the samples, with the result squared.
template <typename Tin, typename Tout>
void ResampleSqSinc16(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                      vetra::utils::NodataFillAction eFillAction,
                      const std::vector<double>& vdfWeights) {
    using namespace vetra::utils;
    CheckNumWeights(vdfWeights, 16 * (kTabulatedSubPixels + 1), VETRA_HERE);
    const engine::KernelTables oTables{vdfWeights.data(), vdfWeights.data(), 16, 16,
                                       kTabulatedSubPixels};
    engine::Sample(oArgs, engine::kSqSinc16Method, eFillAction, &oTables);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLESINC16_H
