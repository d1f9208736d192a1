#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CPLXSARRESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CPLXSARRESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/export.h"

namespace vetra::utils {

/// Sinc interpolation of complex radar images, in a window centred on the nearest pixel, with the
/// taps of `GetCplxSarCoeffs`. The source must be complex.
class VETRA_EXPORT CplxSarResampler : public IRasterResampler {
 public:
    /// \param nWndNumCols  window columns, an odd number from 1 to 31
    /// \param nWndNumRows  window rows, an odd number from 1 to 31
    /// \param dfFc         central frequency along the rows in cycles per pixel, from -0.5 to 0.5
    /// \throws ParameterException for any other value.
    CplxSarResampler(int nWndNumCols, int nWndNumRows, double dfFc);
    /// A copy with the same parameters.
    CplxSarResampler(const CplxSarResampler& oOther);
    ~CplxSarResampler() override;
    CplxSarResampler* Clone() const override;

    /// Gives the constructor's arguments back.
    void GetParameters(int& nWndNumCols, int& nWndNumRows, double& dfFc) const;

 private:
    CplxSarResampler();
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CPLXSARRESAMPLER_H
