#include "vetra/base/utils/resample/algorithm/lagrange4resampler.h"

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"

namespace vetra::utils {

Lagrange4Resampler::Lagrange4Resampler() {
    SetResampleInfo(MethodInfo(eRM_LAGRANGE4));
    SetWindowExtents(-1, -1, 4, 4, eWAP_FLOOR, eWAP_FLOOR);
}

Lagrange4Resampler::Lagrange4Resampler(const Lagrange4Resampler& oOther)
    : IRasterResampler(oOther) {}
Lagrange4Resampler::~Lagrange4Resampler() = default;
Lagrange4Resampler* Lagrange4Resampler::Clone() const { return new Lagrange4Resampler(*this); }

SqLagrange4Resampler::SqLagrange4Resampler() {
    SetResampleInfo(MethodInfo(eRM_SQLAGRANGE4));
    SetWindowExtents(-1, -1, 4, 4, eWAP_FLOOR, eWAP_FLOOR);
}

SqLagrange4Resampler::SqLagrange4Resampler(const SqLagrange4Resampler& oOther)
    : IRasterResampler(oOther) {}
SqLagrange4Resampler::~SqLagrange4Resampler() = default;
SqLagrange4Resampler* SqLagrange4Resampler::Clone() const {
    return new SqLagrange4Resampler(*this);
}

}  // namespace vetra::utils
