#ifndef VETRA_BASE_UTILS_MATH_POLYCOEFFS_H
#define VETRA_BASE_UTILS_MATH_POLYCOEFFS_H

#include <cstdint>
#include <limits>

// Private: what Poly1D and Poly2D do alike with their coefficients. The location of a refusal is
// that of the caller.
namespace vetra::utils::math {

/// Below this a coefficient, a difference of two, or a derivative counts as zero.
inline constexpr double kPolyEpsilon = std::numeric_limits<double>::epsilon();

/// Refuses a null array.
void CheckCoeffPointer(const double* padfCoeffs, const char* pszFile, const char* pszFunction,
                       std::uint32_t nLine);

/// Refuses an index that is negative or not below the number of coefficients.
void CheckCoeffIndex(int nWhich, int nNumCoeffs, const char* pszFile, const char* pszFunction,
                     std::uint32_t nLine);

/// Index of the last coefficient with an absolute value above the epsilon; 0 if there is none.
/// Without any coefficients (\p nNumCoeffs below 1) the array is not looked at, else a null one is
/// refused.
int LastSignificantCoeff(int nNumCoeffs, const double* padfCoeffs, const char* pszFile,
                         const char* pszFunction, std::uint32_t nLine);

/// Whether no pair of coefficients differs by more than the epsilon.
bool CoeffsEqual(int nNumCoeffs, const double* padfLeft, const double* padfRight);

}  // namespace vetra::utils::math

#endif  // VETRA_BASE_UTILS_MATH_POLYCOEFFS_H
