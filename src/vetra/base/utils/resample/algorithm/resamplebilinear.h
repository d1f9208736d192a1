#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEBILINEAR_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEBILINEAR_H

#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"

/// Bilinear sampling, over the 2 x 2 pixels from the floor of the position on.
template <typename Tin, typename Tout>
void ResampleBilinear(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                      vetra::utils::NodataFillAction eFillAction) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kBilinearMethod, eFillAction);
}

/// As its plain twin, on the square roots of the samples, with the result squared.
template <typename Tin, typename Tout>
void ResampleSqBilinear(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                        vetra::utils::NodataFillAction eFillAction) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kSqBilinearMethod, eFillAction);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEBILINEAR_H
