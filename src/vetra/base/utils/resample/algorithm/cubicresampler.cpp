#include "vetra/base/utils/resample/algorithm/cubicresampler.h"

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"

namespace vetra::utils {

CubicResampler::CubicResampler() {
    SetResampleInfo(MethodInfo(eRM_CUBIC));
    SetWindowExtents(-1, -1, 4, 4, eWAP_FLOOR, eWAP_FLOOR);
}

CubicResampler::CubicResampler(const CubicResampler& oOther) : IRasterResampler(oOther) {}
CubicResampler::~CubicResampler() = default;
CubicResampler* CubicResampler::Clone() const { return new CubicResampler(*this); }

SqCubicResampler::SqCubicResampler() {
    SetResampleInfo(MethodInfo(eRM_SQCUBIC));
    SetWindowExtents(-1, -1, 4, 4, eWAP_FLOOR, eWAP_FLOOR);
}

SqCubicResampler::SqCubicResampler(const SqCubicResampler& oOther) : IRasterResampler(oOther) {}
SqCubicResampler::~SqCubicResampler() = default;
SqCubicResampler* SqCubicResampler::Clone() const { return new SqCubicResampler(*this); }

}  // namespace vetra::utils
