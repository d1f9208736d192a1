#ifndef VETRA_BASE_UTILS_MATH_FOURIER_TRANSPOSE_H
#define VETRA_BASE_UTILS_MATH_FOURIER_TRANSPOSE_H

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>

// Private: transposition of samples, in place.
namespace vetra::utils::math::fourier {

/// Samples of a tile's side: as many as a cache line holds.
constexpr std::ptrdiff_t kTile = 8;
/// Rows that are transposed together: with few rows, most of what a tile takes is a look for its
/// pages; with many, their cache lines have no room beside each other.
constexpr std::ptrdiff_t kBandRows = 32;

inline void SwapSamples(float* pafA, float* pafB) {
    std::uint64_t a;
    std::uint64_t b;
    std::memcpy(&a, pafA, sizeof a);
    std::memcpy(&b, pafB, sizeof b);
    std::memcpy(pafA, &b, sizeof b);
    std::memcpy(pafB, &a, sizeof a);
}

/// Swaps the samples (i, j) and (j, i) of a square array of n x n samples, for all j < i where i is
/// in band nBand, in squares as high as the band, and those in tiles.
///
/// \param fnRow  gives the start of a row, as floats
template <typename GetRow>
inline void TransposeBand(std::ptrdiff_t n, std::ptrdiff_t nBand, const GetRow& fnRow) {
    const std::ptrdiff_t nFirst = nBand * kBandRows;
    const std::ptrdiff_t nEnd = std::min(n, nFirst + kBandRows);
    for (std::ptrdiff_t nSquare = 0; nSquare <= nFirst; nSquare += kBandRows) {
        for (std::ptrdiff_t nRow = nFirst; nRow < nEnd; nRow += kTile) {
            const std::ptrdiff_t nSquareEnd = std::min(nRow + kTile, nSquare + kBandRows);
            for (std::ptrdiff_t nCol = nSquare; nCol < nSquareEnd; nCol += kTile) {
                for (std::ptrdiff_t i = nRow; i < std::min(nEnd, nRow + kTile); ++i) {
                    float* pafRow = fnRow(i);
                    for (std::ptrdiff_t j = nCol; j < std::min(i, nCol + kTile); ++j) {
                        SwapSamples(pafRow + 2 * j, fnRow(j) + 2 * i);
                    }
                }
            }
        }
    }
}

inline std::ptrdiff_t BandCount(std::ptrdiff_t n) { return (n + kBandRows - 1) / kBandRows; }

}  // namespace vetra::utils::math::fourier

#endif  // VETRA_BASE_UTILS_MATH_FOURIER_TRANSPOSE_H
