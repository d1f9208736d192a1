#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLECUBIC_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLECUBIC_H

#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"

/// Cubic convolution over 4 x 4 pixels.
template <typename Tin, typename Tout>
void ResampleCubic(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                   vetra::utils::NodataFillAction eFillAction) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kCubicMethod, eFillAction);
}

/// As its plain twin, on the square roots of the samples, with the result squared.
template <typename Tin, typename Tout>
void ResampleSqCubic(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                     vetra::utils::NodataFillAction eFillAction) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kSqCubicMethod, eFillAction);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLECUBIC_H
