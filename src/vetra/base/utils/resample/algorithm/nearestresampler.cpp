#include "vetra/base/utils/resample/algorithm/nearestresampler.h"

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"

namespace vetra::utils {

NearestResampler::NearestResampler() {
    SetResampleInfo(MethodInfo(eRM_NEAR));
    SetWindowExtents(0, 0, 1, 1, eWAP_NEAREST, eWAP_NEAREST);
}

NearestResampler::NearestResampler(const NearestResampler& oOther) : IRasterResampler(oOther) {}
NearestResampler::~NearestResampler() = default;
NearestResampler* NearestResampler::Clone() const { return new NearestResampler(*this); }

SqNearestResampler::SqNearestResampler() {
    SetResampleInfo(MethodInfo(eRM_SQNEAR));
    SetWindowExtents(0, 0, 1, 1, eWAP_NEAREST, eWAP_NEAREST);
}

SqNearestResampler::SqNearestResampler(const SqNearestResampler& oOther)
    : IRasterResampler(oOther) {}
SqNearestResampler::~SqNearestResampler() = default;
SqNearestResampler* SqNearestResampler::Clone() const { return new SqNearestResampler(*this); }

}  // namespace vetra::utils
