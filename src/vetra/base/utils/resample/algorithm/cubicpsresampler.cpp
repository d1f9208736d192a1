#include "vetra/base/utils/resample/algorithm/cubicpsresampler.h"

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"

namespace vetra::utils {

CubicPsResampler::CubicPsResampler() {
    SetResampleInfo(MethodInfo(eRM_CUBICPS));
    SetWindowExtents(-1, -1, 4, 4, eWAP_FLOOR, eWAP_FLOOR);
}

CubicPsResampler::CubicPsResampler(const CubicPsResampler& oOther) : IRasterResampler(oOther) {}
CubicPsResampler::~CubicPsResampler() = default;
CubicPsResampler* CubicPsResampler::Clone() const { return new CubicPsResampler(*this); }

SqCubicPsResampler::SqCubicPsResampler() {
    SetResampleInfo(MethodInfo(eRM_SQCUBICPS));
    SetWindowExtents(-1, -1, 4, 4, eWAP_FLOOR, eWAP_FLOOR);
}

SqCubicPsResampler::SqCubicPsResampler(const SqCubicPsResampler& oOther)
    : IRasterResampler(oOther) {}
SqCubicPsResampler::~SqCubicPsResampler() = default;
SqCubicPsResampler* SqCubicPsResampler::Clone() const { return new SqCubicPsResampler(*this); }

}  // namespace vetra::utils
