#include "vetra/base/utils/resample/algorithm/averageresampler.h"

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::utils {

AverageResampler::AverageResampler() = default;
AverageResampler::AverageResampler(int nWndNumCols, int nWndNumRows) {
    CheckWindowSize(nWndNumCols, nWndNumRows, "averaging", kNoLimit, VETRA_HERE);
    SetResampleInfo(MethodInfo(eRM_AVERAGE, WindowCoefficients(nWndNumCols, nWndNumRows)));
    SetWindowExtents(0, 0, nWndNumCols, nWndNumRows, eWAP_NEAREST, eWAP_NEAREST);
}

AverageResampler::AverageResampler(const AverageResampler& oOther) : IRasterResampler(oOther) {}
AverageResampler::~AverageResampler() = default;
AverageResampler* AverageResampler::Clone() const { return new AverageResampler(*this); }

SqAverageResampler::SqAverageResampler() = default;
SqAverageResampler::SqAverageResampler(int nWndNumCols, int nWndNumRows) {
    CheckWindowSize(nWndNumCols, nWndNumRows, "averaging", kNoLimit, VETRA_HERE);
    SetResampleInfo(MethodInfo(eRM_SQAVERAGE, WindowCoefficients(nWndNumCols, nWndNumRows)));
    SetWindowExtents(0, 0, nWndNumCols, nWndNumRows, eWAP_NEAREST, eWAP_NEAREST);
}

SqAverageResampler::SqAverageResampler(const SqAverageResampler& oOther)
    : IRasterResampler(oOther) {}
SqAverageResampler::~SqAverageResampler() = default;
SqAverageResampler* SqAverageResampler::Clone() const { return new SqAverageResampler(*this); }

}  // namespace vetra::utils
