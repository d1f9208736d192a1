#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_MEDIANRESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_MEDIANRESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/export.h"

namespace vetra::utils {

/// The median of a window that starts at the nearest pixel and runs right and down; of an even
/// number of samples the lower of the two middle ones.
class VETRA_EXPORT MedianResampler : public IRasterResampler {
 public:
    /// \param nWndNumCols  window columns, at least 1
    /// \param nWndNumRows  window rows, at least 1
    /// \throws ParameterException for any other size.
    MedianResampler(int nWndNumCols, int nWndNumRows);
    /// A copy with the same parameters.
    MedianResampler(const MedianResampler& oOther);
    ~MedianResampler() override;
    MedianResampler* Clone() const override;

 private:
    MedianResampler();
};

/// As `MedianResampler`, on the square roots of the samples, with the result squared.
class VETRA_EXPORT SqMedianResampler : public IRasterResampler {
 public:
    /// \param nWndNumCols  window columns, at least 1 and at most 11
    /// \param nWndNumRows  window rows, at least 1 and at most 11
    /// \throws ParameterException for any other size.
    SqMedianResampler(int nWndNumCols, int nWndNumRows);
    /// A copy with the same parameters.
    SqMedianResampler(const SqMedianResampler& oOther);
    ~SqMedianResampler() override;
    SqMedianResampler* Clone() const override;

 private:
    SqMedianResampler();
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_MEDIANRESAMPLER_H
