#include "vetra/base/utils/resample/algorithm/gaussianresampler.h"

#include <cmath>
#include <string>

#include "vetra/base/utils/resample/algorithm/gaussiankernel.h"
#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::utils {
namespace {

// One axis of the window: its size, and sigma in pixels.
struct Axis {
    int nSize;
    float fSigma;
};

struct Axes {
    Axis oCols;
    Axis oRows;
};

Axis AxisOfFactor(float fFactor, const char* pszArgument, const char* pszAxis) {
    const auto fnRefuse = [&](const std::string& sExpected, const std::string& sMust) {
        throw ParameterException(
            pszArgument, ParameterException::eInvalid,
            FormatString("%f", static_cast<double>(fFactor)), sExpected,
            FormatString("%s downsampling factor for gaussian must be %s", pszAxis, sMust.c_str()),
            VETRA_HERE);
    };
    // A NaN is refused too.
    if (!(fFactor >= 1.0f)) {
        fnRefuse(">= 1.0", "a positive number");
    }
    if (fFactor > static_cast<float>(kMaxGaussianFactor)) {
        fnRefuse(FormatString("<= %d", kMaxGaussianFactor),
                 FormatString("at most %d", kMaxGaussianFactor));
    }
    // In single precision throughout.
    const float f = fFactor <= 1.1f ? 1.1f : fFactor;
    const float fSigma = std::sqrt(f * f - 1.0f) * 0.5f;
    const int nHalf = static_cast<int>(std::floor(fSigma * 3.0f + 0.5f));
    return {2 * (nHalf < 1 ? 1 : nHalf), fSigma};
}

Axes AxesOfFactors(float fDsFactorCol, float fDsFactorRow) {
    const Axis oCols = AxisOfFactor(fDsFactorCol, "fDsFactorCol", "Col");
    return {oCols, AxisOfFactor(fDsFactorRow, "fDsFactorRow", "Row")};
}

ResampleInfo GaussianInfo(ResampleMethod eMethod, int nWndNumCols, int nWndNumRows, float fSigmaCol,
                          float fSigmaRow) {
    ResampleInfo oInfo = MethodInfo(eMethod, WindowCoefficients(nWndNumCols, nWndNumRows));
    oInfo.moCoefficients["SIGMACOL"] = FormatString("%f", static_cast<double>(fSigmaCol));
    oInfo.moCoefficients["SIGMAROW"] = FormatString("%f", static_cast<double>(fSigmaRow));
    GenerateGaussianKernel(nWndNumCols, nWndNumRows, fSigmaCol, fSigmaRow, oInfo.mvdfKernelWeights);
    return oInfo;
}

void ReadParameters(const ResampleInfo& oInfo, int& nWndNumCols, int& nWndNumRows, float& fSigmaCol,
                    float& fSigmaRow) {
    oInfo.GetCoefficientInt("NUMCOLS", nWndNumCols, true);
    oInfo.GetCoefficientInt("NUMROWS", nWndNumRows, true);
    oInfo.GetCoefficientFloat("SIGMACOL", fSigmaCol, true);
    oInfo.GetCoefficientFloat("SIGMAROW", fSigmaRow, true);
}

}  // namespace

GaussianResampler::GaussianResampler() = default;
GaussianResampler::GaussianResampler(int nWndNumCols, int nWndNumRows, float fSigmaCol,
                                     float fSigmaRow) {
    GaussianResampler::SetParameters(nWndNumCols, nWndNumRows, fSigmaCol, fSigmaRow);
}
GaussianResampler::GaussianResampler(float fDsFactorCol, float fDsFactorRow) {
    const Axes oAxes = AxesOfFactors(fDsFactorCol, fDsFactorRow);
    GaussianResampler::SetParameters(oAxes.oCols.nSize, oAxes.oRows.nSize, oAxes.oCols.fSigma,
                                     oAxes.oRows.fSigma);
}

GaussianResampler::GaussianResampler(const GaussianResampler& oOther) : IRasterResampler(oOther) {}
GaussianResampler::~GaussianResampler() = default;
GaussianResampler* GaussianResampler::Clone() const { return new GaussianResampler(*this); }

void GaussianResampler::GetParameters(int& nWndNumCols, int& nWndNumRows, float& fSigmaCol,
                                      float& fSigmaRow) const {
    ReadParameters(GetResampleInfo(), nWndNumCols, nWndNumRows, fSigmaCol, fSigmaRow);
}

void GaussianResampler::SetParameters(int nWndNumCols, int nWndNumRows, float fSigmaCol,
                                      float fSigmaRow) {
    CheckGaussian(nWndNumCols, nWndNumRows, fSigmaCol, fSigmaRow, kGaussianTexts, VETRA_HERE);
    SetResampleInfo(GaussianInfo(eRM_GAUSSIAN, nWndNumCols, nWndNumRows, fSigmaCol, fSigmaRow));
    SetWindowExtents(-((nWndNumCols - 1) / 2), -((nWndNumRows - 1) / 2), nWndNumCols, nWndNumRows,
                     eWAP_FLOOR, eWAP_FLOOR);
}

SqGaussianResampler::SqGaussianResampler() = default;
SqGaussianResampler::SqGaussianResampler(int nWndNumCols, int nWndNumRows, float fSigmaCol,
                                         float fSigmaRow) {
    SqGaussianResampler::SetParameters(nWndNumCols, nWndNumRows, fSigmaCol, fSigmaRow);
}
SqGaussianResampler::SqGaussianResampler(float fDsFactorCol, float fDsFactorRow) {
    const Axes oAxes = AxesOfFactors(fDsFactorCol, fDsFactorRow);
    SqGaussianResampler::SetParameters(oAxes.oCols.nSize, oAxes.oRows.nSize, oAxes.oCols.fSigma,
                                       oAxes.oRows.fSigma);
}

SqGaussianResampler::SqGaussianResampler(const SqGaussianResampler& oOther)
    : IRasterResampler(oOther) {}
SqGaussianResampler::~SqGaussianResampler() = default;
SqGaussianResampler* SqGaussianResampler::Clone() const { return new SqGaussianResampler(*this); }

void SqGaussianResampler::GetParameters(int& nWndNumCols, int& nWndNumRows, float& fSigmaCol,
                                        float& fSigmaRow) const {
    ReadParameters(GetResampleInfo(), nWndNumCols, nWndNumRows, fSigmaCol, fSigmaRow);
}

void SqGaussianResampler::SetParameters(int nWndNumCols, int nWndNumRows, float fSigmaCol,
                                        float fSigmaRow) {
    CheckGaussian(nWndNumCols, nWndNumRows, fSigmaCol, fSigmaRow, kSqGaussianTexts, VETRA_HERE);
    SetResampleInfo(GaussianInfo(eRM_SQGAUSSIAN, nWndNumCols, nWndNumRows, fSigmaCol, fSigmaRow));
    SetWindowExtents(-((nWndNumCols - 1) / 2), -((nWndNumRows - 1) / 2), nWndNumCols, nWndNumRows,
                     eWAP_FLOOR, eWAP_FLOOR);
}

}  // namespace vetra::utils
