#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_NEARESTRESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_NEARESTRESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/export.h"

namespace vetra::utils {

/// Nearest sampling: the sample at floor(position + 0.5).
class VETRA_EXPORT NearestResampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    NearestResampler();
    /// A copy with the same parameters.
    NearestResampler(const NearestResampler& oOther);
    ~NearestResampler() override;
    NearestResampler* Clone() const override;
};

/// Nearest sampling of squared quantities: as `NearestResampler`, with negative samples as 0.
class VETRA_EXPORT SqNearestResampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    SqNearestResampler();
    /// A copy with the same parameters.
    SqNearestResampler(const SqNearestResampler& oOther);
    ~SqNearestResampler() override;
    SqNearestResampler* Clone() const override;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_NEARESTRESAMPLER_H
