#include "vetra/base/utils/resample/algorithm/lagrange8resampler.h"

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"

namespace vetra::utils {

Lagrange8Resampler::Lagrange8Resampler() {
    SetResampleInfo(MethodInfo(eRM_LAGRANGE8));
    SetWindowExtents(-3, -3, 8, 8, eWAP_FLOOR, eWAP_FLOOR);
}

Lagrange8Resampler::Lagrange8Resampler(const Lagrange8Resampler& oOther)
    : IRasterResampler(oOther) {}
Lagrange8Resampler::~Lagrange8Resampler() = default;
Lagrange8Resampler* Lagrange8Resampler::Clone() const { return new Lagrange8Resampler(*this); }

SqLagrange8Resampler::SqLagrange8Resampler() {
    SetResampleInfo(MethodInfo(eRM_SQLAGRANGE8));
    SetWindowExtents(-3, -3, 8, 8, eWAP_FLOOR, eWAP_FLOOR);
}

SqLagrange8Resampler::SqLagrange8Resampler(const SqLagrange8Resampler& oOther)
    : IRasterResampler(oOther) {}
SqLagrange8Resampler::~SqLagrange8Resampler() = default;
SqLagrange8Resampler* SqLagrange8Resampler::Clone() const {
    return new SqLagrange8Resampler(*this);
}

}  // namespace vetra::utils
