#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLECUBICPS_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLECUBICPS_H

#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"

/// Cubic convolution with the nearest sample in the place of masked ones. Takes no fill action.
template <typename Tin, typename Tout>
void ResampleCubicPs(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kCubicPsMethod,
                                 vetra::utils::eNFA_BGD);
}

/// As its plain twin, on the square roots of the samples, with the result squared.
template <typename Tin, typename Tout>
void ResampleSqCubicPs(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kSqCubicPsMethod,
                                 vetra::utils::eNFA_BGD);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLECUBICPS_H
