#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEMEDIAN_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEMEDIAN_H

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"
#include "vetra/faultcore/exceptions.h"

/// The median of a window that starts at the nearest pixel and runs right and down.
/// \throws ParameterException for a window of less than one column or row.
template <typename Tin, typename Tout>
void ResampleMedian(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                    vetra::utils::NodataFillAction eFillAction, int nWndNumCols, int nWndNumRows) {
    using namespace vetra::utils;
    CheckWindowSize(nWndNumCols, nWndNumRows, "median", kNoLimit, VETRA_HERE);
    const engine::WindowSize oSize{nWndNumCols, nWndNumRows};
    const engine::Method oMethod =
        engine::WithWindow(engine::kMedianMethod, {0, 0, nWndNumCols, nWndNumRows, true});
    engine::Sample(oArgs, oMethod, eFillAction, &oSize);
}

/// As its plain twin, on the square roots of the samples, with the result squared.
/// \throws ParameterException for a window that is not from 1 x 1 to 11 x 11 pixels.
template <typename Tin, typename Tout>
void ResampleSqMedian(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                      vetra::utils::NodataFillAction eFillAction, int nWndNumCols,
                      int nWndNumRows) {
    using namespace vetra::utils;
    CheckWindowSize(nWndNumCols, nWndNumRows, "median", kSqMedianLimit, VETRA_HERE);
    const engine::WindowSize oSize{nWndNumCols, nWndNumRows};
    const engine::Method oMethod =
        engine::WithWindow(engine::kSqMedianMethod, {0, 0, nWndNumCols, nWndNumRows, true});
    engine::Sample(oArgs, oMethod, eFillAction, &oSize);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLEMEDIAN_H
