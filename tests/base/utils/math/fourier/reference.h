#ifndef VETRA_TESTS_BASE_UTILS_MATH_FOURIER_REFERENCE_H
#define VETRA_TESTS_BASE_UTILS_MATH_FOURIER_REFERENCE_H

#include <complex>
#include <cstddef>
#include <vector>

#include "vetra/base/utils/math/fourier/fftcomplex.h"

// Plain evaluations that share no code with the library.
namespace vetra::tests {

using Samples = std::vector<FFTComplex>;

/// Work memory of the in-place family.
struct Work {
    std::vector<int> vnIp;
    std::vector<float> vfW;
};
/// Work memory for transforms of up to n samples, of exactly the size that is asked for.
Work MakeWork(std::size_t n);

/// Random samples with components between -1 and 1.
Samples RandomSamples(std::size_t n, unsigned nSeed);

std::vector<float> PlainSinCosTable(std::size_t n);

/// The table family's passes, one loop after the other.
void PlainTableTransform(std::size_t n, FFTComplex* poData, const std::vector<float>& vfTable,
                         bool bFlag);

/// The in-place family: table, bit reversal and passes, one loop after the other.
void PlainInPlaceTransform(std::size_t n, bool bFlag, FFTComplex* poData, Work& oWork);

/// The transform in double precision.
std::vector<std::complex<double>> ExactTransform(const Samples& voData, bool bFlag);

/// The L2 error of a result, relative to the L2 norm of the exact one.
double RelativeError(const Samples& voResult, const std::vector<std::complex<double>>& vExact);

}  // namespace vetra::tests

#endif  // VETRA_TESTS_BASE_UTILS_MATH_FOURIER_REFERENCE_H
