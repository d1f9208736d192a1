#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLERINFO_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLERINFO_H

#include <cstdint>
#include <limits>
#include <vector>

#include "vetra/base/utils/resample/resampleinfo.h"

// Private: what the constructors of the resampler classes and the sampling templates share.
namespace vetra::utils {

/// The parameters of a new resampler: the defaults, with a method and its coefficients.
ResampleInfo MethodInfo(ResampleMethod eMethod, const CoefficientMap& oCoefficients = {});

/// The coefficients "NUMCOLS" and "NUMROWS".
CoefficientMap WindowCoefficients(int nWndNumCols, int nWndNumRows);

/// The coefficients "NUMCOLS", "NUMROWS" and "NUMSUBPIXELS".
CoefficientMap KernelCoefficients(int nWndNumCols, int nWndNumRows, int nSubPixels);

/// Sub-pixel phases of the tables that this library makes: a fraction's phases are 0 to 64.
constexpr int kTabulatedSubPixels = 64;

constexpr int kNoLimit = std::numeric_limits<int>::max();
constexpr int kSqMedianLimit = 11;

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

/// How the messages of a Gaussian resampler name it.
struct GaussianTexts {
    const char* pszCols;
    const char* pszRows;
    const char* pszSigma;
};
constexpr GaussianTexts kGaussianTexts{"gaussian", "gaussian", "gaussian"};
/// Their odd spellings are what callers know.
constexpr GaussianTexts kSqGaussianTexts{"guassian", "gaussian", "Gaussian"};

/// The largest factor that a Gaussian kernel is made for. It keeps the weights of both axes below
/// 320 MB.
constexpr int kMaxGaussianFactor = 100000;
/// The size of the kernel of that factor.
constexpr int kMaxGaussianTaps = 3 * kMaxGaussianFactor;

/// Refuses a window of less than one column or row, then a sigma that is not above 0 or not finite,
/// then a window of more than `kMaxGaussianTaps` columns or rows, columns first, with
/// `ParameterException`.
void CheckGaussian(int nWndNumCols, int nWndNumRows, float fSigmaCol, float fSigmaRow,
                   const GaussianTexts& oTexts, const char* pszFile, const char* pszFunction,
                   std::uint32_t nLine);

/// Refuses a window of less than one column or row, then a number of sub-pixels below 0, with
/// `ParameterException`.
void CheckKernelSize(int nWndNumCols, int nWndNumRows, int nSubPixels, const char* pszFile,
                     const char* pszFunction, std::uint32_t nLine);

/// The number of weights of kernels of both axes. No sizes that `CheckKernelSize` lets pass
/// overflow.
constexpr long long NumKernelWeights(int nWndNumCols, int nWndNumRows, int nSubPixels) {
    return (static_cast<long long>(nWndNumCols) + nWndNumRows) *
           (static_cast<long long>(nSubPixels) + 1);
}

/// Refuses fewer weights than a method reads, with `ParameterException`.
void CheckNumWeights(const std::vector<double>& vdfWeights, long long nNeeded, const char* pszFile,
                     const char* pszFunction, std::uint32_t nLine);

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLERINFO_H
