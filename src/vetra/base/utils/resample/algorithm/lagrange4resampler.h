#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_LAGRANGE4RESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_LAGRANGE4RESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/export.h"

namespace vetra::utils {

/// Lagrange interpolation of degree 3 over 4 x 4 pixels.
class VETRA_EXPORT Lagrange4Resampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    Lagrange4Resampler();
    /// A copy with the same parameters.
    Lagrange4Resampler(const Lagrange4Resampler& oOther);
    ~Lagrange4Resampler() override;
    Lagrange4Resampler* Clone() const override;
};

/// As `Lagrange4Resampler`, on the square roots of the samples, with the result squared.
class VETRA_EXPORT SqLagrange4Resampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    SqLagrange4Resampler();
    /// A copy with the same parameters.
    SqLagrange4Resampler(const SqLagrange4Resampler& oOther);
    ~SqLagrange4Resampler() override;
    SqLagrange4Resampler* Clone() const override;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_LAGRANGE4RESAMPLER_H
