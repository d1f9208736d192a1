#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLELAGRANGE8_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLELAGRANGE8_H

#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"

/// Lagrange interpolation of degree 7 over 8 x 8 pixels.
template <typename Tin, typename Tout>
void ResampleLagrange8(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                       vetra::utils::NodataFillAction eFillAction) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kLagrange8Method, eFillAction);
}

/// As its plain twin, on the square roots of the samples, with the result squared.
template <typename Tin, typename Tout>
void ResampleSqLagrange8(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                         vetra::utils::NodataFillAction eFillAction) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kSqLagrange8Method, eFillAction);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLELAGRANGE8_H
