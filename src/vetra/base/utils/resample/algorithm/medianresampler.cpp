#include "vetra/base/utils/resample/algorithm/medianresampler.h"

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::utils {

MedianResampler::MedianResampler() = default;
MedianResampler::MedianResampler(int nWndNumCols, int nWndNumRows) {
    CheckWindowSize(nWndNumCols, nWndNumRows, "median", kNoLimit, VETRA_HERE);
    SetResampleInfo(MethodInfo(eRM_MEDIAN, WindowCoefficients(nWndNumCols, nWndNumRows)));
    SetWindowExtents(0, 0, nWndNumCols, nWndNumRows, eWAP_NEAREST, eWAP_NEAREST);
}

MedianResampler::MedianResampler(const MedianResampler& oOther) : IRasterResampler(oOther) {}
MedianResampler::~MedianResampler() = default;
MedianResampler* MedianResampler::Clone() const { return new MedianResampler(*this); }

SqMedianResampler::SqMedianResampler() = default;
SqMedianResampler::SqMedianResampler(int nWndNumCols, int nWndNumRows) {
    CheckWindowSize(nWndNumCols, nWndNumRows, "median", kSqMedianLimit, VETRA_HERE);
    SetResampleInfo(MethodInfo(eRM_SQMEDIAN, WindowCoefficients(nWndNumCols, nWndNumRows)));
    SetWindowExtents(0, 0, nWndNumCols, nWndNumRows, eWAP_NEAREST, eWAP_NEAREST);
}

SqMedianResampler::SqMedianResampler(const SqMedianResampler& oOther) : IRasterResampler(oOther) {}
SqMedianResampler::~SqMedianResampler() = default;
SqMedianResampler* SqMedianResampler::Clone() const { return new SqMedianResampler(*this); }

}  // namespace vetra::utils
