#include "vetra/base/utils/resample/algorithm/cplxsarresampler.h"

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::utils {

CplxSarResampler::CplxSarResampler() = default;
CplxSarResampler::CplxSarResampler(int nWndNumCols, int nWndNumRows, double dfFc) {
    CheckCplxSarSize(nWndNumCols, nWndNumRows, VETRA_HERE);
    CheckCentralFrequency(dfFc, VETRA_HERE);
    CoefficientMap oCoefficients = WindowCoefficients(nWndNumCols, nWndNumRows);
    oCoefficients["FC"] = FormatString("%24.16e", dfFc);
    SetResampleInfo(MethodInfo(eRM_CPLXSAR, oCoefficients));
    SetWindowExtents(-((nWndNumCols - 1) / 2), -((nWndNumRows - 1) / 2), nWndNumCols, nWndNumRows,
                     eWAP_NEAREST, eWAP_NEAREST);
}

CplxSarResampler::CplxSarResampler(const CplxSarResampler& oOther) : IRasterResampler(oOther) {}
CplxSarResampler::~CplxSarResampler() = default;
CplxSarResampler* CplxSarResampler::Clone() const { return new CplxSarResampler(*this); }

void CplxSarResampler::GetParameters(int& nWndNumCols, int& nWndNumRows, double& dfFc) const {
    const ResampleInfo oInfo = GetResampleInfo();
    oInfo.GetCoefficientInt("NUMCOLS", nWndNumCols, true);
    oInfo.GetCoefficientInt("NUMROWS", nWndNumRows, true);
    oInfo.GetCoefficientDouble("FC", dfFc, true);
}

}  // namespace vetra::utils
