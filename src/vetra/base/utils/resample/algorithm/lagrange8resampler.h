#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_LAGRANGE8RESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_LAGRANGE8RESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/export.h"

namespace vetra::utils {

/// Lagrange interpolation of degree 7 over 8 x 8 pixels.
class VETRA_EXPORT Lagrange8Resampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    Lagrange8Resampler();
    /// A copy with the same parameters.
    Lagrange8Resampler(const Lagrange8Resampler& oOther);
    ~Lagrange8Resampler() override;
    Lagrange8Resampler* Clone() const override;
};

/// As `Lagrange8Resampler`, on the square roots of the samples, with the result squared.
class VETRA_EXPORT SqLagrange8Resampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    SqLagrange8Resampler();
    /// A copy with the same parameters.
    SqLagrange8Resampler(const SqLagrange8Resampler& oOther);
    ~SqLagrange8Resampler() override;
    SqLagrange8Resampler* Clone() const override;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_LAGRANGE8RESAMPLER_H
