#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CUBICPSRESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CUBICPSRESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/export.h"

namespace vetra::utils {

/// As `CubicResampler`, but a masked pixel in the window is replaced by the nearest sample instead
/// of giving the window up, and a window that leaves the source gives the background.
class VETRA_EXPORT CubicPsResampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    CubicPsResampler();
    /// A copy with the same parameters.
    CubicPsResampler(const CubicPsResampler& oOther);
    ~CubicPsResampler() override;
    CubicPsResampler* Clone() const override;
};

/// As `CubicPsResampler`, on the square roots of the samples, with the result squared.
class VETRA_EXPORT SqCubicPsResampler : public IRasterResampler {
 public:
    /// With the parameters of any new resampler, see `IRasterResampler`.
    SqCubicPsResampler();
    /// A copy with the same parameters.
    SqCubicPsResampler(const SqCubicPsResampler& oOther);
    ~SqCubicPsResampler() override;
    SqCubicPsResampler* Clone() const override;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CUBICPSRESAMPLER_H
