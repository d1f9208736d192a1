#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"

#include <cmath>

#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::utils {

ResampleInfo MethodInfo(ResampleMethod eMethod, const CoefficientMap& oCoefficients) {
    ResampleInfo oInfo;
    oInfo.meMethod = eMethod;
    oInfo.moCoefficients = oCoefficients;
    return oInfo;
}

CoefficientMap WindowCoefficients(int nWndNumCols, int nWndNumRows) {
    return {{"NUMCOLS", FormatString("%d", nWndNumCols)},
            {"NUMROWS", FormatString("%d", nWndNumRows)}};
}

CoefficientMap KernelCoefficients(int nWndNumCols, int nWndNumRows, int nSubPixels) {
    CoefficientMap oCoefficients = WindowCoefficients(nWndNumCols, nWndNumRows);
    oCoefficients["NUMSUBPIXELS"] = FormatString("%d", nSubPixels);
    return oCoefficients;
}

namespace {

struct SizeRule {
    const char* pszWhat;
    const char* pszExpected;
    const char* pszKind;
    int nMax;
    bool bOdd;
};

void CheckSizes(int nWndNumCols, int nWndNumRows, const SizeRule& oRule, const char* pszFile,
                const char* pszFunction, std::uint32_t nLine) {
    const auto fnCheck = [&](int nSize, const char* pszArgument, const char* pszAxis) {
        if (nSize < 1 || nSize > oRule.nMax || (oRule.bOdd && nSize % 2 == 0)) {
            std::string sMessage =
                FormatString("Num %s for %s must be a %s", pszAxis, oRule.pszWhat, oRule.pszKind);
            if (oRule.nMax != kNoLimit) {
                sMessage += FormatString(", max %d", oRule.nMax);
            }
            throw ParameterException(pszArgument, ParameterException::eInvalid,
                                     FormatString("%d", nSize), oRule.pszExpected, sMessage,
                                     pszFile, pszFunction, nLine);
        }
    };
    fnCheck(nWndNumCols, "nWndNumCols", "cols");
    fnCheck(nWndNumRows, "nWndNumRows", "rows");
}

}  // namespace

void CheckWindowSize(int nWndNumCols, int nWndNumRows, const char* pszWhat, int nMax,
                     const char* pszFile, const char* pszFunction, std::uint32_t nLine) {
    CheckSizes(nWndNumCols, nWndNumRows,
               {pszWhat, "Positive number", "positive number", nMax, false}, pszFile, pszFunction,
               nLine);
}

void CheckCplxSarSize(int nWndNumCols, int nWndNumRows, const char* pszFile,
                      const char* pszFunction, std::uint32_t nLine) {
    CheckSizes(nWndNumCols, nWndNumRows,
               {"complex SAR resampler", "Positive odd number", "positive odd number", 31, true},
               pszFile, pszFunction, nLine);
}

void CheckCentralFrequency(double dfFc, const char* pszFile, const char* pszFunction,
                           std::uint32_t nLine) {
    // A NaN is outside too.
    if (!(dfFc >= -0.5 && dfFc <= 0.5)) {
        throw ParameterException(
            "dfFc", ParameterException::eInvalid, FormatString("%lf", dfFc), "[-0.5, 0.5]",
            FormatString("The given central frequency (%lf) must fall in the range [-0.5, 0.5]",
                         dfFc),
            pszFile, pszFunction, nLine);
    }
}

void CheckGaussian(int nWndNumCols, int nWndNumRows, float fSigmaCol, float fSigmaRow,
                   const GaussianTexts& oTexts, const char* pszFile, const char* pszFunction,
                   std::uint32_t nLine) {
    CheckWindowSize(nWndNumCols, 1, oTexts.pszCols, kNoLimit, pszFile, pszFunction, nLine);
    CheckWindowSize(1, nWndNumRows, oTexts.pszRows, kNoLimit, pszFile, pszFunction, nLine);
    const auto fnCheckSigma = [&](float fSigma, const char* pszArgument, const char* pszAxis) {
        if (!(fSigma > 0.0f) || std::isinf(fSigma)) {
            throw ParameterException(
                pszArgument, ParameterException::eInvalid,
                FormatString("%f", static_cast<double>(fSigma)), "Positive number",
                FormatString("%s sigma of %s must be a positive number", pszAxis, oTexts.pszSigma),
                pszFile, pszFunction, nLine);
        }
    };
    fnCheckSigma(fSigmaCol, "fSigmaCol", "Col");
    fnCheckSigma(fSigmaRow, "fSigmaRow", "Row");
    const auto fnCheckMost = [&](int nSize, const char* pszArgument, const char* pszAxis) {
        if (nSize > kMaxGaussianTaps) {
            throw ParameterException(
                pszArgument, ParameterException::eInvalid, FormatString("%d", nSize),
                FormatString("<= %d", kMaxGaussianTaps),
                FormatString("Num %s for gaussian must be at most %d", pszAxis, kMaxGaussianTaps),
                pszFile, pszFunction, nLine);
        }
    };
    fnCheckMost(nWndNumCols, "nWndNumCols", "cols");
    fnCheckMost(nWndNumRows, "nWndNumRows", "rows");
}

void CheckKernelSize(int nWndNumCols, int nWndNumRows, int nSubPixels, const char* pszFile,
                     const char* pszFunction, std::uint32_t nLine) {
    CheckSizes(nWndNumCols, nWndNumRows,
               {"kernel resampler", "Non-zero positive number", "non-zero positive number",
                kNoLimit, false},
               pszFile, pszFunction, nLine);
    if (nSubPixels < 0) {
        throw ParameterException("nSubPixels", ParameterException::eInvalid,
                                 FormatString("%d", nSubPixels), "Positive number",
                                 "Num of subpixels for kernel resampler must be a positive number",
                                 pszFile, pszFunction, nLine);
    }
}

void CheckNumWeights(const std::vector<double>& vdfWeights, long long nNeeded, const char* pszFile,
                     const char* pszFunction, std::uint32_t nLine) {
    if (static_cast<long long>(vdfWeights.size()) < nNeeded) {
        throw ParameterException("oResParms.mvdfKernelWeights", ParameterException::eInvalid, "",
                                 "", "The number of kernel weights is wrong for this resampler.",
                                 pszFile, pszFunction, nLine);
    }
}

}  // namespace vetra::utils
