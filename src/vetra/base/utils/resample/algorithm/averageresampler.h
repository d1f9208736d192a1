#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_AVERAGERESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_AVERAGERESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/export.h"

namespace vetra::utils {

/// The mean of a window that starts at the nearest pixel and runs right and down.
class VETRA_EXPORT AverageResampler : public IRasterResampler {
 public:
    /// \param nWndNumCols  window columns, at least 1
    /// \param nWndNumRows  window rows, at least 1
    /// \throws ParameterException for any other size.
    AverageResampler(int nWndNumCols, int nWndNumRows);
    /// A copy with the same parameters.
    AverageResampler(const AverageResampler& oOther);
    ~AverageResampler() override;
    AverageResampler* Clone() const override;

 private:
    AverageResampler();
};

/// As `AverageResampler`, on the square roots of the samples, with the result squared.
class VETRA_EXPORT SqAverageResampler : public IRasterResampler {
 public:
    /// \param nWndNumCols  window columns, at least 1
    /// \param nWndNumRows  window rows, at least 1
    /// \throws ParameterException for any other size.
    SqAverageResampler(int nWndNumCols, int nWndNumRows);
    /// A copy with the same parameters.
    SqAverageResampler(const SqAverageResampler& oOther);
    ~SqAverageResampler() override;
    SqAverageResampler* Clone() const override;

 private:
    SqAverageResampler();
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_AVERAGERESAMPLER_H
