#include "vetra/base/utils/resample/algorithm/sinc16resampler.h"

#include "vetra/base/utils/resample/algorithm/sinctable.h"

namespace vetra::utils {
namespace {

constexpr int kTaps = 16;

}

Sinc16Resampler::Sinc16Resampler() = default;
Sinc16Resampler::Sinc16Resampler(const ShapingWindow& oWindow) {
    SetResampleInfo(SincInfo(eRM_SINC16, oWindow, kTaps));
    SetWindowExtents(-7, -7, kTaps, kTaps, eWAP_FLOOR, eWAP_FLOOR);
}

Sinc16Resampler::Sinc16Resampler(const Sinc16Resampler& oOther) : IRasterResampler(oOther) {}
Sinc16Resampler::~Sinc16Resampler() = default;
Sinc16Resampler* Sinc16Resampler::Clone() const { return new Sinc16Resampler(*this); }

void Sinc16Resampler::GenerateKernelWeights(const ShapingWindow& oWindow, ResampleInfo& oInfo) {
    oInfo.mvdfKernelWeights = MakeSincTable(oWindow, kTaps);
}

SqSinc16Resampler::SqSinc16Resampler() = default;
SqSinc16Resampler::SqSinc16Resampler(const ShapingWindow& oWindow) {
    SetResampleInfo(SincInfo(eRM_SQSINC16, oWindow, kTaps));
    SetWindowExtents(-7, -7, kTaps, kTaps, eWAP_FLOOR, eWAP_FLOOR);
}

SqSinc16Resampler::SqSinc16Resampler(const SqSinc16Resampler& oOther) : IRasterResampler(oOther) {}
SqSinc16Resampler::~SqSinc16Resampler() = default;
SqSinc16Resampler* SqSinc16Resampler::Clone() const { return new SqSinc16Resampler(*this); }

}  // namespace vetra::utils
