#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CUBICRESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CUBICRESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/export.h"

namespace vetra::utils {

/// Cubic convolution over 4 x 4 pixels with free parameter -1, which is sharper than the -0.5 or
/// -0.75 that most programs use.
class VETRA_EXPORT CubicResampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    CubicResampler();
    /// A copy with the same parameters.
    CubicResampler(const CubicResampler& oOther);
    ~CubicResampler() override;
    CubicResampler* Clone() const override;
};

/// As `CubicResampler`, on the square roots of the samples, with the result squared.
class VETRA_EXPORT SqCubicResampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    SqCubicResampler();
    /// A copy with the same parameters.
    SqCubicResampler(const SqCubicResampler& oOther);
    ~SqCubicResampler() override;
    SqCubicResampler* Clone() const override;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CUBICRESAMPLER_H
