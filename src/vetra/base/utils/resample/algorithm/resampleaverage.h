#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEAVERAGE_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEAVERAGE_H

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"
#include "vetra/faultcore/exceptions.h"

/// The mean of a window that starts at the nearest pixel and runs right and down.
/// \throws ParameterException for a window of less than one column or row.
template <typename Tin, typename Tout>
void ResampleAverage(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                     vetra::utils::NodataFillAction eFillAction, int nWndNumCols, int nWndNumRows) {
    using namespace vetra::utils;
    CheckWindowSize(nWndNumCols, nWndNumRows, "averaging", kNoLimit, VETRA_HERE);
    const engine::WindowSize oSize{nWndNumCols, nWndNumRows};
    const engine::Method oMethod =
        engine::WithWindow(engine::kAverageMethod, {0, 0, nWndNumCols, nWndNumRows, true});
    engine::Sample(oArgs, oMethod, eFillAction, &oSize);
}

/// As its plain twin, on the square roots of the samples, with the result squared.
/// \throws ParameterException for a window of less than one column or row.
template <typename Tin, typename Tout>
void ResampleSqAverage(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                       vetra::utils::NodataFillAction eFillAction, int nWndNumCols,
                       int nWndNumRows) {
    using namespace vetra::utils;
    CheckWindowSize(nWndNumCols, nWndNumRows, "averaging", kNoLimit, VETRA_HERE);
    const engine::WindowSize oSize{nWndNumCols, nWndNumRows};
    const engine::Method oMethod =
        engine::WithWindow(engine::kSqAverageMethod, {0, 0, nWndNumCols, nWndNumRows, true});
    engine::Sample(oArgs, oMethod, eFillAction, &oSize);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEAVERAGE_H
