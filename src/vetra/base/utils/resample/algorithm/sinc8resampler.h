#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_SINC8RESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_SINC8RESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/base/utils/resample/shapingwindow.h"
#include "vetra/export.h"

namespace vetra::utils {

/// Windowed sinc over 8 x 8 pixels.
class VETRA_EXPORT Sinc8Resampler : public IRasterResampler {
 public:
    /// Tabulates the weights; the window isn't needed afterwards.
    explicit Sinc8Resampler(const ShapingWindow& oWindow);
    /// A copy with the same parameters.
    Sinc8Resampler(const Sinc8Resampler& oOther);
    ~Sinc8Resampler() override;
    Sinc8Resampler* Clone() const override;

    /// Replaces the weights of \p oInfo by those of a window: [65 phases x 8 taps], phase p for a
    /// position p / 64 behind a whole one, tap 3 for the pixel at floor(position). The taps of a
    /// phase add up to 1. Phases 0 and 64 are 1.0 in taps 3 and 4, whatever the window.
    static void GenerateKernelWeights(const ShapingWindow& oWindow, ResampleInfo& oInfo);

 private:
    Sinc8Resampler();
};

/// As `Sinc8Resampler`, on the square roots of the samples, with the result squared.
class VETRA_EXPORT SqSinc8Resampler : public IRasterResampler {
 public:
    /// Tabulates the weights; the window isn't needed afterwards.
    explicit SqSinc8Resampler(const ShapingWindow& oWindow);
    /// A copy with the same parameters.
    SqSinc8Resampler(const SqSinc8Resampler& oOther);
    ~SqSinc8Resampler() override;
    SqSinc8Resampler* Clone() const override;

 private:
    SqSinc8Resampler();
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_SINC8RESAMPLER_H
