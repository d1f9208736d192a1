#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLENEAREST_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLENEAREST_H

#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"

/// Nearest sampling. Needs no window and takes no fill action.
template <typename Tin, typename Tout>
void ResampleNearest(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kNearestMethod,
                                 vetra::utils::eNFA_BGD);
}

/// As its plain twin, with negative samples as 0.
template <typename Tin, typename Tout>
void ResampleSqNearest(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kSqNearestMethod,
                                 vetra::utils::eNFA_BGD);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLENEAREST_H
