#ifndef VETRA_APPS_KERNEL_KERNELPLOT_H
#define VETRA_APPS_KERNEL_KERNELPLOT_H

#include <string>

#include "vetra/base/utils/resample/irasterresampler.h"

namespace vetra::tool {

/// A picture of a method, as SVG: its impulse response, its frequency response in plain numbers and
/// in decibels, and below them the figures that tell methods apart.
///
/// \param sMethod  the resampler string, for the title
/// \throws UsageError for a method that has no weights. RunError for weights that can't be drawn:
///         those that are not finite or beyond 1e100, and more than a million along an axis.
///         Interrupted.
std::string DrawKernel(const utils::IRasterResampler& oResampler, const std::string& sMethod);

}  // namespace vetra::tool

#endif  // VETRA_APPS_KERNEL_KERNELPLOT_H
