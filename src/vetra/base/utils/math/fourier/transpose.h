#ifndef VETRA_BASE_UTILS_MATH_FOURIER_TRANSPOSE_H
#define VETRA_BASE_UTILS_MATH_FOURIER_TRANSPOSE_H

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>

// Private: transposition of samples, in place.
namespace vetra::utils::math::fourier {

/// Rows that are transposed together: as many samples as a cache line holds.
constexpr std::ptrdiff_t kBandRows = 8;

inline void SwapSamples(float* pafA, float* pafB) {
    std::uint64_t a;
    std::uint64_t b;
    std::memcpy(&a, pafA, sizeof a);
    std::memcpy(&b, pafB, sizeof b);
    std::memcpy(pafA, &b, sizeof b);
    std::memcpy(pafB, &a, sizeof a);
}

/// Swaps the samples (i, j) and (j, i) of a square array of n x n samples, for all j < i where i is
/// in band nBand, in tiles whose cache lines stay in the cache.
///
/// \param fnRow  gives the start of a row, as floats
template <typename GetRow>
inline void TransposeBand(std::ptrdiff_t n, std::ptrdiff_t nBand, const GetRow& fnRow) {
    const std::ptrdiff_t nFirst = nBand * kBandRows;
    const std::ptrdiff_t nEnd = std::min(n, nFirst + kBandRows);
    for (std::ptrdiff_t nTile = 0; nTile < nFirst; nTile += kBandRows) {
        for (std::ptrdiff_t i = nFirst; i < nEnd; ++i) {
            float* pafRow = fnRow(i);
            for (std::ptrdiff_t j = nTile; j < nTile + kBandRows; ++j) {
                SwapSamples(pafRow + 2 * j, fnRow(j) + 2 * i);
            }
        }
    }
    for (std::ptrdiff_t i = nFirst; i < nEnd; ++i) {
        for (std::ptrdiff_t j = nFirst; j < i; ++j) {
            SwapSamples(fnRow(i) + 2 * j, fnRow(j) + 2 * i);
        }
    }
}

inline std::ptrdiff_t BandCount(std::ptrdiff_t n) { return (n + kBandRows - 1) / kBandRows; }

}  // namespace vetra::utils::math::fourier

#endif  // VETRA_BASE_UTILS_MATH_FOURIER_TRANSPOSE_H
