#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEKERNEL_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEKERNEL_H

#include <cstddef>
#include <vector>

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"
#include "vetra/faultcore/exceptions.h"

/// Separable convolution with tabulated weights: the columns' kernels of phases 0 to nSubPixels,
/// then the rows'. vdfWeights has at least as many weights. \throws ParameterException for a window
/// of less than one column or row, or nSubPixels below 0.
template <typename Tin, typename Tout>
void ResampleKernel(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                    vetra::utils::NodataFillAction eFillAction, int nWndNumCols, int nWndNumRows,
                    int nSubPixels, const std::vector<double>& vdfWeights) {
    using namespace vetra::utils;
    CheckKernelSize(nWndNumCols, nWndNumRows, nSubPixels, VETRA_HERE);
    const double* padfWeights = vdfWeights.data();
    const engine::KernelTables oTables{padfWeights,
                                       padfWeights + (std::ptrdiff_t{nSubPixels} + 1) * nWndNumCols,
                                       nWndNumCols, nWndNumRows, nSubPixels};
    const engine::Method oMethod = engine::WithWindow(
        engine::kKernelMethod, engine::CentredWindow(nWndNumCols, nWndNumRows, false));
    engine::Sample(oArgs, oMethod, eFillAction, &oTables);
}

/// As its plain twin, on the square roots of the samples, with the result squared.
/// \throws ParameterException for a window of less than one column or row, or nSubPixels below 0.
template <typename Tin, typename Tout>
void ResampleSqKernel(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                      vetra::utils::NodataFillAction eFillAction, int nWndNumCols, int nWndNumRows,
                      int nSubPixels, const std::vector<double>& vdfWeights) {
    using namespace vetra::utils;
    CheckKernelSize(nWndNumCols, nWndNumRows, nSubPixels, VETRA_HERE);
    const double* padfWeights = vdfWeights.data();
    const engine::KernelTables oTables{padfWeights,
                                       padfWeights + (std::ptrdiff_t{nSubPixels} + 1) * nWndNumCols,
                                       nWndNumCols, nWndNumRows, nSubPixels};
    const engine::Method oMethod = engine::WithWindow(
        engine::kSqKernelMethod, engine::CentredWindow(nWndNumCols, nWndNumRows, false));
    engine::Sample(oArgs, oMethod, eFillAction, &oTables);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEKERNEL_H
