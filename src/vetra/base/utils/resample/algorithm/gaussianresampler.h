#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_GAUSSIANRESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_GAUSSIANRESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/export.h"

namespace vetra::utils {

/// Convolution with the kernels of `GenerateGaussianKernel`, in a window around the pixel at
/// floor(position). An even size has one pixel more on the right or lower side.
class VETRA_EXPORT GaussianResampler : public IRasterResampler {
 public:
    /// \param nWndNumCols  window columns, 1 to 300000
    /// \param nWndNumRows  window rows, 1 to 300000
    /// \param fSigmaCol    standard deviation along the columns in pixels, above 0 and finite
    /// \param fSigmaRow    standard deviation along the rows in pixels, above 0 and finite
    /// \throws ParameterException for an argument outside its range.
    GaussianResampler(int nWndNumCols, int nWndNumRows, float fSigmaCol, float fSigmaRow);

    /// The kernel that keeps aliasing out of an image reduced by a factor f: sigma is
    /// sqrt(f^2 - 1) / 2, the window reaches over 3 sigma to each side and has an even size.
    /// Factors below 1.1 count as 1.1, so that even factor 1 smooths a little. The weights take
    /// about 1.6 kB times f for each axis.
    ///
    /// \param fDsFactorCol  source pixels per target pixel along the columns, 1 to 100000
    /// \param fDsFactorRow  source pixels per target pixel along the rows, 1 to 100000
    /// \throws ParameterException for a factor outside its range, NaN included.
    GaussianResampler(float fDsFactorCol, float fDsFactorRow);
    /// A copy with the same parameters.
    GaussianResampler(const GaussianResampler& oOther);
    ~GaussianResampler() override;
    GaussianResampler* Clone() const override;

    /// The window and the two sigmas, to six decimal places.
    void GetParameters(int& nWndNumCols, int& nWndNumRows, float& fSigmaCol,
                       float& fSigmaRow) const;

 protected:
    /// What the first constructor does. A refused call leaves the parameters as they were.
    void SetParameters(int nWndNumCols, int nWndNumRows, float fSigmaCol, float fSigmaRow);

 private:
    GaussianResampler();
};

/// As `GaussianResampler`, on the square roots of the samples, with the result squared.
class VETRA_EXPORT SqGaussianResampler : public IRasterResampler {
 public:
    /// As that of `GaussianResampler`.
    SqGaussianResampler(int nWndNumCols, int nWndNumRows, float fSigmaCol, float fSigmaRow);
    /// As that of `GaussianResampler`.
    SqGaussianResampler(float fDsFactorCol, float fDsFactorRow);
    /// A copy with the same parameters.
    SqGaussianResampler(const SqGaussianResampler& oOther);
    ~SqGaussianResampler() override;
    SqGaussianResampler* Clone() const override;

    /// The window and the two sigmas, to six decimal places.
    void GetParameters(int& nWndNumCols, int& nWndNumRows, float& fSigmaCol,
                       float& fSigmaRow) const;

 protected:
    /// What the first constructor does. A refused call leaves the parameters as they were.
    void SetParameters(int nWndNumCols, int nWndNumRows, float fSigmaCol, float fSigmaRow);

 private:
    SqGaussianResampler();
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_GAUSSIANRESAMPLER_H
