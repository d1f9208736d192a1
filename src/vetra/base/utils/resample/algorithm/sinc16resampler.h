#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_SINC16RESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_SINC16RESAMPLER_H

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/base/utils/resample/shapingwindow.h"
#include "vetra/export.h"

namespace vetra::utils {

/// Windowed sinc over 16 x 16 pixels.
class VETRA_EXPORT Sinc16Resampler : public IRasterResampler {
 public:
    /// Tabulates the weights; the window isn't needed afterwards.
    explicit Sinc16Resampler(const ShapingWindow& oWindow);
    /// A copy with the same parameters.
    Sinc16Resampler(const Sinc16Resampler& oOther);
    ~Sinc16Resampler() override;
    Sinc16Resampler* Clone() const override;

    /// Replaces the weights of \p oInfo by those of a window: [65 phases x 16 taps], phase p for a
    /// position p / 64 behind a whole one, tap 7 for the pixel at floor(position). The taps of a
    /// phase add up to 1. Phases 0 and 64 are 1.0 in taps 7 and 8, whatever the window.
    static void GenerateKernelWeights(const ShapingWindow& oWindow, ResampleInfo& oInfo);

 private:
    Sinc16Resampler();
};

/// As `Sinc16Resampler`, on the square roots of the samples, with the result squared.
class VETRA_EXPORT SqSinc16Resampler : public IRasterResampler {
 public:
    /// Tabulates the weights; the window isn't needed afterwards.
    explicit SqSinc16Resampler(const ShapingWindow& oWindow);
    /// A copy with the same parameters.
    SqSinc16Resampler(const SqSinc16Resampler& oOther);
    ~SqSinc16Resampler() override;
    SqSinc16Resampler* Clone() const override;

 private:
    SqSinc16Resampler();
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_SINC16RESAMPLER_H
