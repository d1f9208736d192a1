#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_BILINEARRESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_BILINEARRESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/export.h"

namespace vetra::utils {

/// Bilinear interpolation over the 2 x 2 pixels around the position.
class VETRA_EXPORT BilinearResampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    BilinearResampler();
    /// A copy with the same parameters.
    BilinearResampler(const BilinearResampler& oOther);
    ~BilinearResampler() override;
    BilinearResampler* Clone() const override;
};

/// As `BilinearResampler`, on the square roots of the samples, with the result squared.
class VETRA_EXPORT SqBilinearResampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    SqBilinearResampler();
    /// A copy with the same parameters.
    SqBilinearResampler(const SqBilinearResampler& oOther);
    ~SqBilinearResampler() override;
    SqBilinearResampler* Clone() const override;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_BILINEARRESAMPLER_H
