#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEKERNEL_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEKERNEL_H

#include <cstddef>
#include <vector>

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::utils::engine {

/// Runs a method with the weights of kernels: those of the columns for phases 0 to nSubPixels, then
/// those of the rows. vdfWeights has at least as many.
///
/// \throws ParameterException for a window of less than one column or row, or nSubPixels below 0.
template <typename Tin, typename Tout>
void SampleKernel(const SamplingArguments<Tin, Tout>& oArgs, const Method& oKernelMethod,
                  NodataFillAction eFillAction, int nWndNumCols, int nWndNumRows, int nSubPixels,
                  const std::vector<double>& vdfWeights) {
    CheckKernelSize(nWndNumCols, nWndNumRows, nSubPixels, VETRA_HERE);
    const double* padfWeights = vdfWeights.data();
    const KernelTables oTables{padfWeights,
                               padfWeights + (std::ptrdiff_t{nSubPixels} + 1) * nWndNumCols,
                               nWndNumCols, nWndNumRows, nSubPixels};
    const Method oMethod =
        WithWindow(oKernelMethod, CentredWindow(nWndNumCols, nWndNumRows, false));
    Sample(oArgs, oMethod, eFillAction, &oTables);
}

}  // namespace vetra::utils::engine

/// Separable convolution with tabulated weights; see `SampleKernel`.
template <typename Tin, typename Tout>
void ResampleKernel(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                    vetra::utils::NodataFillAction eFillAction, int nWndNumCols, int nWndNumRows,
                    int nSubPixels, const std::vector<double>& vdfWeights) {
    vetra::utils::engine::SampleKernel(oArgs, vetra::utils::engine::kKernelMethod, eFillAction,
                                       nWndNumCols, nWndNumRows, nSubPixels, vdfWeights);
}

/// As its plain twin, on the square roots of the samples, with the result squared.
template <typename Tin, typename Tout>
void ResampleSqKernel(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                      vetra::utils::NodataFillAction eFillAction, int nWndNumCols, int nWndNumRows,
                      int nSubPixels, const std::vector<double>& vdfWeights) {
    vetra::utils::engine::SampleKernel(oArgs, vetra::utils::engine::kSqKernelMethod, eFillAction,
                                       nWndNumCols, nWndNumRows, nSubPixels, vdfWeights);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEKERNEL_H
