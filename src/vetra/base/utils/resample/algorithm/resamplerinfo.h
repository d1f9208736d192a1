#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLERINFO_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLERINFO_H

#include <cstdint>
#include <limits>

#include "vetra/base/utils/resample/resampleinfo.h"

// Private: what the constructors of the resampler classes share.
namespace vetra::utils {

/// The parameters of a new resampler: the defaults, with a method and its coefficients.
ResampleInfo MethodInfo(ResampleMethod eMethod, const CoefficientMap& oCoefficients = {});

/// The coefficients "NUMCOLS" and "NUMROWS".
CoefficientMap WindowCoefficients(int nWndNumCols, int nWndNumRows);

constexpr int kNoLimit = std::numeric_limits<int>::max();

/// Refuses a window size that is not from 1 to \p nMax, columns first, with `ParameterException`.
/// \p pszWhat names the method in the message.
void CheckWindowSize(int nWndNumCols, int nWndNumRows, const char* pszWhat, int nMax,
                     const char* pszFile, const char* pszFunction, std::uint32_t nLine);

/// As `CheckWindowSize`, for the window of complex SAR sampling: odd sizes from 1 to 31.
void CheckCplxSarSize(int nWndNumCols, int nWndNumRows, const char* pszFile,
                      const char* pszFunction, std::uint32_t nLine);

/// Refuses a central frequency outside -0.5 to 0.5, with `ParameterException`.
void CheckCentralFrequency(double dfFc, const char* pszFile, const char* pszFunction,
                           std::uint32_t nLine);

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLERINFO_H
