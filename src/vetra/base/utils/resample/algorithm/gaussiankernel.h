#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_GAUSSIANKERNEL_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_GAUSSIANKERNEL_H

#include <vector>

#include "vetra/export.h"

/// \file
/// Weights of Gaussian kernels.

/// Tabulates Gaussian kernels for kernel sampling: 65 phases, phase p for a position p / 64 behind
/// tap h = (n - 1) / 2 of a kernel of n taps. First the columns' kernels, [65 x nWndNumCols], then
/// the rows', [65 x nWndNumRows].
///
/// The taps of a phase add up to 1. A small window cuts the tails and keeps the shape. With a sigma
/// below about 0.013 all taps of the middle phases underflow, and these phases hold NaN.
///
/// \param nWndNumCols  taps of a column kernel, 1 to 300000
/// \param nWndNumRows  taps of a row kernel, 1 to 300000
/// \param fSigmaCol    standard deviation of the column kernels in pixels, above 0 and finite
/// \param fSigmaRow    standard deviation of the row kernels in pixels, above 0 and finite
/// \param vdfWeights   takes the kernels; unchanged when the call throws
/// \throws ParameterException for an argument outside its range.
VETRA_EXPORT void GenerateGaussianKernel(int nWndNumCols, int nWndNumRows, float fSigmaCol,
                                         float fSigmaRow, std::vector<double>& vdfWeights);

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_GAUSSIANKERNEL_H
