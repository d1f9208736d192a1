#include "vetra/base/utils/resample/algorithm/bilinearresampler.h"

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"

namespace vetra::utils {

BilinearResampler::BilinearResampler() {
    SetResampleInfo(MethodInfo(eRM_BILIN));
    SetWindowExtents(0, 0, 2, 2, eWAP_FLOOR, eWAP_FLOOR);
}

BilinearResampler::BilinearResampler(const BilinearResampler& oOther) : IRasterResampler(oOther) {}
BilinearResampler::~BilinearResampler() = default;
BilinearResampler* BilinearResampler::Clone() const { return new BilinearResampler(*this); }

SqBilinearResampler::SqBilinearResampler() {
    SetResampleInfo(MethodInfo(eRM_SQBILIN));
    SetWindowExtents(0, 0, 2, 2, eWAP_FLOOR, eWAP_FLOOR);
}

SqBilinearResampler::SqBilinearResampler(const SqBilinearResampler& oOther)
    : IRasterResampler(oOther) {}
SqBilinearResampler::~SqBilinearResampler() = default;
SqBilinearResampler* SqBilinearResampler::Clone() const { return new SqBilinearResampler(*this); }

}  // namespace vetra::utils
