#include "vetra/base/utils/resample/algorithm/sinc8resampler.h"

#include "vetra/base/utils/resample/algorithm/sinctable.h"

namespace vetra::utils {
namespace {

constexpr int kTaps = 8;

}

Sinc8Resampler::Sinc8Resampler() = default;
Sinc8Resampler::Sinc8Resampler(const ShapingWindow& oWindow) {
    SetResampleInfo(SincInfo(eRM_SINC8, oWindow, kTaps));
    SetWindowExtents(-3, -3, kTaps, kTaps, eWAP_FLOOR, eWAP_FLOOR);
}

Sinc8Resampler::Sinc8Resampler(const Sinc8Resampler& oOther) : IRasterResampler(oOther) {}
Sinc8Resampler::~Sinc8Resampler() = default;
Sinc8Resampler* Sinc8Resampler::Clone() const { return new Sinc8Resampler(*this); }

void Sinc8Resampler::GenerateKernelWeights(const ShapingWindow& oWindow, ResampleInfo& oInfo) {
    oInfo.mvdfKernelWeights = MakeSincTable(oWindow, kTaps);
}

SqSinc8Resampler::SqSinc8Resampler() = default;
SqSinc8Resampler::SqSinc8Resampler(const ShapingWindow& oWindow) {
    SetResampleInfo(SincInfo(eRM_SQSINC8, oWindow, kTaps));
    SetWindowExtents(-3, -3, kTaps, kTaps, eWAP_FLOOR, eWAP_FLOOR);
}

SqSinc8Resampler::SqSinc8Resampler(const SqSinc8Resampler& oOther) : IRasterResampler(oOther) {}
SqSinc8Resampler::~SqSinc8Resampler() = default;
SqSinc8Resampler* SqSinc8Resampler::Clone() const { return new SqSinc8Resampler(*this); }

}  // namespace vetra::utils
