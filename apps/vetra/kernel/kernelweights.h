#ifndef VETRA_APPS_KERNEL_KERNELWEIGHTS_H
#define VETRA_APPS_KERNEL_KERNELWEIGHTS_H

#include <string>
#include <vector>

#include "vetra/base/utils/resample/irasterresampler.h"

namespace vetra::tool {

/// The weights of a separable linear method, as KERNEL takes them: phases 0 to nSubPixels stand for
/// fractions of a position, and a window of n begins (n - 1) / 2, truncated, before its floor.
struct KernelWeights {
    int nCols = 0;
    int nRows = 0;
    int nSubPixels = 0;
    /// Column kernels `[nSubPixels + 1 x nCols]`, then row kernels `[nSubPixels + 1 x nRows]`.
    std::vector<double> vdfWeights;

    /// Whether columns and rows have the same kernels.
    bool HasOneKernel() const;
};

/// The weights of a method; of a squared one those that its plain twin has for square roots.
/// Methods that the engine evaluates anew at each position are sampled at 64 sub-pixels. The keys
/// MIN, MAX and FILL don't count.
/// \throws UsageError for a method without weights, and for an average of more than 1024 columns or
///         rows.
KernelWeights GetKernelWeights(const utils::IRasterResampler& oResampler);

/// The text of the kernel file that holds these weights.
std::string ToKernelFileText(const KernelWeights& oWeights);

}  // namespace vetra::tool

#endif  // VETRA_APPS_KERNEL_KERNELWEIGHTS_H
