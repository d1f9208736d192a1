#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLENEAREST_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLENEAREST_H

#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"

/// Nearest sampling. Needs no window and takes no fill action.
template <typename Tin, typename Tout>
void ResampleNearest(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs) {
    vetra::utils::engine::Sample(oArgs, vetra::utils::engine::kNearestMethod,
                                 vetra::utils::eNFA_NN);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLENEAREST_H
