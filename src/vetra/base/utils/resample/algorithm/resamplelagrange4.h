#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLELAGRANGE4_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLELAGRANGE4_H

#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"

/// Lagrange interpolation of degree 3 over 4 x 4 pixels.
template <typename Tin, typename Tout>
void ResampleLagrange4(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                       vetra::utils::NodataFillAction eFillAction) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kLagrange4Method, eFillAction);
}

/// As its plain twin, on the square roots of the samples, with the result squared.
template <typename Tin, typename Tout>
void ResampleSqLagrange4(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                         vetra::utils::NodataFillAction eFillAction) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kSqLagrange4Method, eFillAction);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLELAGRANGE4_H
