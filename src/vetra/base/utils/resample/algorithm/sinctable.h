#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_SINCTABLE_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_SINCTABLE_H

#include <vector>

#include "vetra/base/utils/resample/resampleinfo.h"
#include "vetra/base/utils/resample/shapingwindow.h"

// Private: the weights of windowed sinc sampling, for any even number of taps.
namespace vetra::utils {

/// The taps of phases 0 to 64, [65 x nTaps]. Tap nTaps / 2 - 1 is the pixel at floor(position);
/// phases 0 and 64 are unit impulses there and one tap further, whatever the window, and the taps
/// of every phase add up to 1.
std::vector<double> MakeSincTable(const ShapingWindow& oWindow, int nTaps);

/// The parameters of a new sinc resampler: its table, and the window as coefficients.
ResampleInfo SincInfo(ResampleMethod eMethod, const ShapingWindow& oWindow, int nTaps);

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_SINCTABLE_H
