#ifndef VETRA_APPS_KERNEL_AXISFILTER_H
#define VETRA_APPS_KERNEL_AXISFILTER_H

#include <cstddef>
#include <vector>

#include "vetra/base/utils/resample/irasterresampler.h"

namespace vetra::tool {

/// What a method does along one axis: the weight of each pixel for each fraction of a position. The
/// window of n taps begins (n - 1) / 2, truncated, before the floor of the position.
///
/// Complex radar sampling multiplies the weight of a pixel at distance x before the position by
/// exp(2 pi i dfCarrier x).
struct AxisFilter {
    int nTaps = 0;
    int nSubPixels = 0;
    std::vector<double> vdfWeights;  ///< `[nSubPixels + 1 x nTaps]`
    double dfCarrier = 0.0;          ///< cycles per pixel

    bool operator==(const AxisFilter&) const = default;
    double GetWeight(int nPhase, int nTap) const {
        return vdfWeights[static_cast<std::size_t>(nPhase) * static_cast<std::size_t>(nTaps) +
                          static_cast<std::size_t>(nTap)];
    }
    /// The floor of a position, counted from the pixel of a tap.
    int GetFloor(int nTap) const { return (nTaps - 1) / 2 - nTap; }
};

struct MethodFilters {
    AxisFilter oCols;
    AxisFilter oRows;
};

/// The filters of a method: its kernel weights, or those of complex radar sampling, of which the
/// turn that all results have in common is left out.
/// \throws UsageError for a method that has no weights.
MethodFilters GetMethodFilters(const utils::IRasterResampler& oResampler);

}  // namespace vetra::tool

#endif  // VETRA_APPS_KERNEL_AXISFILTER_H
