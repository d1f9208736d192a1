#include "vetra/base/utils/resample/algorithm/gaussiankernel.h"

#include <cmath>
#include <cstddef>

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/faultcore/exceptions.h"

namespace {

using vetra::utils::kTabulatedSubPixels;

// Fills the phases of one axis. Returns the end of what was written.
double* FillKernels(int nTaps, double dfSigma, double* padfTaps) {
    constexpr double kStep = 1.0 / kTabulatedSubPixels;
    const int nCentre = (nTaps - 1) / 2;
    for (int p = 0; p <= kTabulatedSubPixels; ++p) {
        const double dfOffset = p * kStep;
        double dfSum = 0.0;
        for (int j = 0; j < nTaps; ++j) {
            const double d = j - (nCentre + dfOffset);
            padfTaps[j] = d == 0.0 ? 1.0 : std::exp(-(d * d / (dfSigma * 2.0 * dfSigma)));
            dfSum += padfTaps[j];
        }
        double dfQuotients = 0.0;
        for (int j = 0; j < nTaps; ++j) {
            padfTaps[j] /= dfSum;
            dfQuotients += padfTaps[j];
        }
        padfTaps[nCentre] += 1.0 - dfQuotients;
        padfTaps += nTaps;
    }
    return padfTaps;
}

}  // namespace

void GenerateGaussianKernel(int nWndNumCols, int nWndNumRows, float fSigmaCol, float fSigmaRow,
                            std::vector<double>& vdfWeights) {
    using namespace vetra::utils;
    CheckGaussian(nWndNumCols, nWndNumRows, fSigmaCol, fSigmaRow, kGaussianTexts, VETRA_HERE);
    const std::size_t nTaps =
        static_cast<std::size_t>(nWndNumCols) + static_cast<std::size_t>(nWndNumRows);
    std::vector<double> vdfTable((kTabulatedSubPixels + std::size_t{1}) * nTaps);
    double* padfRows = FillKernels(nWndNumCols, fSigmaCol, vdfTable.data());
    FillKernels(nWndNumRows, fSigmaRow, padfRows);
    vdfWeights.swap(vdfTable);
}
