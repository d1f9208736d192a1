#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_KERNELRESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_KERNELRESAMPLER_H

#include <string>
#include <vector>

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/export.h"

namespace vetra::utils {

/// Convolution with kernels of the caller, in a window around the pixel at floor(position). An even
/// size has one pixel more on the right or lower side.
class VETRA_EXPORT KernelResampler : public IRasterResampler {
 public:
    /// Takes size and weights from a kernel file.
    /// \param sFile  its path
    /// \throws as `LoadKernelFile`, and as the other constructor for what the file holds.
    explicit KernelResampler(const std::string& sFile);

    /// \param nWndNumCols  window columns C, at least 1
    /// \param nWndNumRows  window rows R, at least 1
    /// \param nSubPixels   number S of sub-pixel steps, at least 0; phase p stands for a position
    ///                     p / S behind a whole one
    /// \param vdfWeights   the columns' kernels, [S + 1 phases x C taps], then the rows',
    ///                     [S + 1 phases x R taps]. The taps of a phase should add up to 1: they
    ///                     are used as they are.
    /// \throws ParameterException for an argument outside its range, DataException for any other
    ///         number of weights than (C + R) x (S + 1).
    KernelResampler(int nWndNumCols, int nWndNumRows, int nSubPixels,
                    const std::vector<double>& vdfWeights);
    /// A copy with the same parameters.
    KernelResampler(const KernelResampler& oOther);
    ~KernelResampler() override;
    KernelResampler* Clone() const override;

 protected:
    /// What the second constructor does. A refused call leaves the parameters as they were.
    void SetParameters(int nWndNumCols, int nWndNumRows, int nSubPixels,
                       const std::vector<double>& vdfWeights);

 private:
    KernelResampler();
};

/// As `KernelResampler`, on the square roots of the samples, with the result squared.
class VETRA_EXPORT SqKernelResampler : public IRasterResampler {
 public:
    /// As that of `KernelResampler`.
    explicit SqKernelResampler(const std::string& sFile);
    /// As that of `KernelResampler`.
    SqKernelResampler(int nWndNumCols, int nWndNumRows, int nSubPixels,
                      const std::vector<double>& vdfWeights);
    /// A copy with the same parameters.
    SqKernelResampler(const SqKernelResampler& oOther);
    ~SqKernelResampler() override;
    SqKernelResampler* Clone() const override;

 protected:
    /// What the second constructor does. A refused call leaves the parameters as they were.
    void SetParameters(int nWndNumCols, int nWndNumRows, int nSubPixels,
                       const std::vector<double>& vdfWeights);

 private:
    SqKernelResampler();
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_KERNELRESAMPLER_H
