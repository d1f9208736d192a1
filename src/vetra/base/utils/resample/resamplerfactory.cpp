#include "vetra/base/utils/resample/resamplerfactory.h"

#include <cmath>
#include <memory>
#include <utility>

#include "vetra/base/utils/resample/algorithm/averageresampler.h"
#include "vetra/base/utils/resample/algorithm/bilinearresampler.h"
#include "vetra/base/utils/resample/algorithm/cplxsarresampler.h"
#include "vetra/base/utils/resample/algorithm/cubicpsresampler.h"
#include "vetra/base/utils/resample/algorithm/cubicresampler.h"
#include "vetra/base/utils/resample/algorithm/gaussianresampler.h"
#include "vetra/base/utils/resample/algorithm/kernelresampler.h"
#include "vetra/base/utils/resample/algorithm/lagrange4resampler.h"
#include "vetra/base/utils/resample/algorithm/lagrange8resampler.h"
#include "vetra/base/utils/resample/algorithm/medianresampler.h"
#include "vetra/base/utils/resample/algorithm/nearestresampler.h"
#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/base/utils/resample/algorithm/sinc16resampler.h"
#include "vetra/base/utils/resample/algorithm/sinc8resampler.h"
#include "vetra/base/utils/resample/resamplerstring.h"
#include "vetra/base/utils/resample/shapingwindow.h"
#include "vetra/base/utils/string/stringutils.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::utils {
namespace {

using Resampler = std::unique_ptr<IRasterResampler>;

// What stands for a method's window in complex SAR sampling: filters of a fixed size, one by the
// source's "NUMCOLS" and "NUMROWS", the source's own one, or nothing.
enum class ComplexFilter { eSmall, eLarge, eLikeSource, eSame, eNone };

// By method. CUSTOM in place of a twin is none.
constexpr struct {
    const char* pszName;
    ResampleMethod eSquaredTwin;
    ComplexFilter eComplexFilter;
} kMethods[] = {
    {"BILIN", eRM_SQBILIN, ComplexFilter::eSmall},
    {"CUBIC", eRM_SQCUBIC, ComplexFilter::eSmall},
    {"CUBICPS", eRM_SQCUBICPS, ComplexFilter::eSmall},
    {"NEAR", eRM_SQNEAR, ComplexFilter::eSmall},
    {"SINC8", eRM_SQSINC8, ComplexFilter::eSmall},
    {"SINC16", eRM_SQSINC16, ComplexFilter::eLarge},
    {"AVERAGE", eRM_SQAVERAGE, ComplexFilter::eLikeSource},
    {"MEDIAN", eRM_SQMEDIAN, ComplexFilter::eLikeSource},
    {"CPLXSAR", eRM_CUSTOM, ComplexFilter::eSame},
    {"LAGRANGE4", eRM_SQLAGRANGE4, ComplexFilter::eSmall},
    {"LAGRANGE8", eRM_SQLAGRANGE8, ComplexFilter::eSmall},
    {"GAUSSIAN", eRM_SQGAUSSIAN, ComplexFilter::eNone},
    {"KERNEL", eRM_SQKERNEL, ComplexFilter::eNone},
    {"SQBILIN", eRM_SQBILIN, ComplexFilter::eSmall},
    {"SQCUBIC", eRM_SQCUBIC, ComplexFilter::eSmall},
    {"SQCUBICPS", eRM_SQCUBICPS, ComplexFilter::eSmall},
    {"SQNEAR", eRM_SQNEAR, ComplexFilter::eSmall},
    {"SQSINC8", eRM_SQSINC8, ComplexFilter::eSmall},
    {"SQSINC16", eRM_SQSINC16, ComplexFilter::eLarge},
    {"SQAVERAGE", eRM_SQAVERAGE, ComplexFilter::eLikeSource},
    {"SQMEDIAN", eRM_SQMEDIAN, ComplexFilter::eLikeSource},
    {"SQLAGRANGE4", eRM_SQLAGRANGE4, ComplexFilter::eSmall},
    {"SQLAGRANGE8", eRM_SQLAGRANGE8, ComplexFilter::eSmall},
    {"SQGAUSSIAN", eRM_SQGAUSSIAN, ComplexFilter::eNone},
    {"SQKERNEL", eRM_SQKERNEL, ComplexFilter::eNone},
    {"CUSTOM", eRM_CUSTOM, ComplexFilter::eNone},
};

bool IsMethod(ResampleMethod eMethod) { return eMethod >= eRM_BILIN && eMethod <= eRM_CUSTOM; }

struct WindowSize {
    explicit WindowSize(const ResampleInfo& oInfo) {
        oInfo.GetCoefficientInt("NUMCOLS", nCols, true);
        oInfo.GetCoefficientInt("NUMROWS", nRows, true);
    }
    int nCols = 0;
    int nRows = 0;
};

// Resamplers by what their constructors read from the parameters.
template <typename R>
Resampler FromWindowSize(const ResampleInfo& oInfo) {
    const WindowSize oSize(oInfo);
    return std::make_unique<R>(oSize.nCols, oSize.nRows);
}

template <typename R>
Resampler FromFrequency(const ResampleInfo& oInfo) {
    const WindowSize oSize(oInfo);
    double dfFc = 0.0;
    oInfo.GetCoefficientDouble("FC", dfFc, false);
    return std::make_unique<R>(oSize.nCols, oSize.nRows, dfFc);
}

template <typename R>
Resampler FromFactors(const ResampleInfo& oInfo) {
    float fCol = 0.0f;
    float fRow = 0.0f;
    oInfo.GetCoefficientFloat("DSFACTORCOL", fCol, true);
    if (oInfo.GetCoefficientFloat("DSFACTORROW", fRow, false) != 0) {
        fRow = fCol;
    }
    return std::make_unique<R>(fCol, fRow);
}

template <typename R>
Resampler FromWeights(const ResampleInfo& oInfo) {
    const WindowSize oSize(oInfo);
    int nSubPixels = 0;
    oInfo.GetCoefficientInt("NUMSUBPIXELS", nSubPixels, true);
    return std::make_unique<R>(oSize.nCols, oSize.nRows, nSubPixels, oInfo.mvdfKernelWeights);
}

template <typename R>
Resampler FromShapingWindow(const ResampleInfo& oInfo) {
    return std::make_unique<R>(GetShapingWindow(oInfo));
}

Resampler MakeResampler(const ResampleInfo& oInfo) {
    switch (oInfo.meMethod) {
        case eRM_BILIN:
            return std::make_unique<BilinearResampler>();
        case eRM_CUBIC:
            return std::make_unique<CubicResampler>();
        case eRM_CUBICPS:
            return std::make_unique<CubicPsResampler>();
        case eRM_NEAR:
            return std::make_unique<NearestResampler>();
        case eRM_LAGRANGE4:
            return std::make_unique<Lagrange4Resampler>();
        case eRM_LAGRANGE8:
            return std::make_unique<Lagrange8Resampler>();
        case eRM_SQBILIN:
            return std::make_unique<SqBilinearResampler>();
        case eRM_SQCUBIC:
            return std::make_unique<SqCubicResampler>();
        case eRM_SQCUBICPS:
            return std::make_unique<SqCubicPsResampler>();
        case eRM_SQNEAR:
            return std::make_unique<SqNearestResampler>();
        case eRM_SQLAGRANGE4:
            return std::make_unique<SqLagrange4Resampler>();
        case eRM_SQLAGRANGE8:
            return std::make_unique<SqLagrange8Resampler>();
        case eRM_SINC8:
            return FromShapingWindow<Sinc8Resampler>(oInfo);
        case eRM_SINC16:
            return FromShapingWindow<Sinc16Resampler>(oInfo);
        case eRM_SQSINC8:
            return FromShapingWindow<SqSinc8Resampler>(oInfo);
        case eRM_SQSINC16:
            return FromShapingWindow<SqSinc16Resampler>(oInfo);
        case eRM_AVERAGE:
            return FromWindowSize<AverageResampler>(oInfo);
        case eRM_MEDIAN:
            return FromWindowSize<MedianResampler>(oInfo);
        case eRM_SQAVERAGE:
            return FromWindowSize<SqAverageResampler>(oInfo);
        case eRM_SQMEDIAN:
            return FromWindowSize<SqMedianResampler>(oInfo);
        case eRM_CPLXSAR:
            return FromFrequency<CplxSarResampler>(oInfo);
        case eRM_GAUSSIAN:
            return FromFactors<GaussianResampler>(oInfo);
        case eRM_SQGAUSSIAN:
            return FromFactors<SqGaussianResampler>(oInfo);
        case eRM_KERNEL:
            return FromWeights<KernelResampler>(oInfo);
        case eRM_SQKERNEL:
            return FromWeights<SqKernelResampler>(oInfo);
        case eRM_CUSTOM:
            break;
    }
    throw ParameterException("eType", ParameterException::eInvalid, "", "",
                             "GetResampler(): The provided resample method was not recognized",
                             VETRA_HERE);
}

[[noreturn]] void RefuseSource(const char* pszGot, const char* pszExpected,
                               const std::string& sMessage) {
    throw ParameterException("poSrc", ParameterException::eInvalid, pszGot, pszExpected, sMessage,
                             VETRA_HERE);
}

constexpr const char* kUnknownSource = "Unrecognized method code for provided resampler";

ResampleInfo GetSourceInfo(const IRasterResampler* poSrc) {
    if (poSrc == nullptr) {
        RefuseSource("NULL", "non-NULL", "The poSrc parameter may not be NULL");
    }
    ResampleInfo oInfo = poSrc->GetResampleInfo();
    if (!IsMethod(oInfo.meMethod)) {
        RefuseSource("", "", kUnknownSource);
    }
    return oInfo;
}

// The coefficients of the complex filter that stands for a resampler.
CoefficientMap ComplexCoefficients(const ResampleInfo& oSource, double dfFc) {
    constexpr int kSmall = 7;
    constexpr int kLarge = 15;
    int nCols = kSmall;
    int nRows = kSmall;
    switch (kMethods[oSource.meMethod].eComplexFilter) {
        case ComplexFilter::eSmall:
            break;
        case ComplexFilter::eLarge:
            nCols = kLarge;
            nRows = kLarge;
            break;
        case ComplexFilter::eLikeSource: {
            const WindowSize oSize(oSource);
            nCols = oSize.nCols > 8 ? kLarge : kSmall;
            nRows = oSize.nRows > 8 ? kLarge : kSmall;
            break;
        }
        case ComplexFilter::eSame:
            return oSource.moCoefficients;
        case ComplexFilter::eNone:
            RefuseSource("", "", oSource.meMethod == eRM_CUSTOM ? "" : kUnknownSource);
    }
    if (!std::isfinite(dfFc)) {
        CheckCentralFrequency(dfFc, VETRA_HERE);  // as text it would be no number
    }
    CoefficientMap oFilter = WindowCoefficients(nCols, nRows);
    oFilter["FC"] = FormatString("%22.14f", dfFc);
    return oFilter;
}

}  // namespace

std::string ResamplerFactory::MethodToName(ResampleMethod eMethod) {
    if (!IsMethod(eMethod)) {
        throw ParameterException(
            "eMethod", ParameterException::eInvalid, "", "",
            "Given resampler method was not recognized (potentially uninitialized variable)",
            VETRA_HERE);
    }
    return kMethods[eMethod].pszName;
}

ResampleMethod ResamplerFactory::NameToMethod(std::string sName) {
    sName = TrimWhitespace(ToUpper(sName));
    for (int nMethod = eRM_BILIN; nMethod < eRM_CUSTOM; ++nMethod) {
        if (sName == kMethods[nMethod].pszName) {
            return static_cast<ResampleMethod>(nMethod);
        }
    }
    throw ParameterException("sName", ParameterException::eInvalid, sName, "",
                             FormatString("Resampler name '%s' was not recognized", sName.c_str()),
                             VETRA_HERE);
}

ResampleInfo ResamplerFactory::GetResampleInfo(std::string sResParms) const {
    return sResParms.empty() ? ResampleInfo() : ReadResamplerString(sResParms);
}

IRasterResampler* ResamplerFactory::GetResampler(const ResampleInfo& oInfo) const {
    Resampler poResampler = MakeResampler(oInfo);
    poResampler->SetClampRange(oInfo.mdfClampMin, oInfo.mdfClampMax);
    poResampler->SetOutBgd(oInfo.mdfOutBgd);
    poResampler->SetNodataFillAction(oInfo.meNodataFillAction);
    return poResampler.release();
}

IRasterResampler* ResamplerFactory::GetResampler(std::string sResParms) const {
    return GetResampler(GetResampleInfo(std::move(sResParms)));
}

IRasterResampler* ResamplerFactory::GetResampler(ResampleMethod eMethod) const {
    return GetResampler(MethodInfo(eMethod));
}

IRasterResampler* ResamplerFactory::GetResampler(ResampleMethod eMethod,
                                                 const CoefficientMap& oCoefficients) const {
    return GetResampler(MethodInfo(eMethod, oCoefficients));
}

IRasterResampler* ResamplerFactory::GetSquaredResampler(const IRasterResampler* poSrc) const {
    ResampleInfo oInfo = GetSourceInfo(poSrc);
    const auto& oMethod = kMethods[oInfo.meMethod];
    if (oMethod.eSquaredTwin == eRM_CUSTOM) {
        RefuseSource("", "",
                     FormatString("Cannot get squared version of %s resampler", oMethod.pszName));
    }
    oInfo.meMethod = oMethod.eSquaredTwin;
    return GetResampler(oInfo);
}

IRasterResampler* ResamplerFactory::GetComplexSarResampler(const IRasterResampler* poSrc,
                                                           double dfFc) const {
    ResampleInfo oInfo = GetSourceInfo(poSrc);
    oInfo.moCoefficients = ComplexCoefficients(oInfo, dfFc);
    oInfo.meMethod = eRM_CPLXSAR;
    return GetResampler(oInfo);
}

}  // namespace vetra::utils
