#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"

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

void CheckWindowSize(int nWndNumCols, int nWndNumRows, const char* pszWhat, int nMax,
                     const char* pszFile, const char* pszFunction, std::uint32_t nLine) {
    const auto fnCheck = [&](int nSize, const char* pszArgument, const char* pszAxis) {
        if (nSize < 1 || nSize > nMax) {
            std::string sMessage =
                FormatString("Num %s for %s must be a positive number", pszAxis, pszWhat);
            if (nMax != kNoLimit) {
                sMessage += FormatString(", max %d", nMax);
            }
            throw ParameterException(pszArgument, ParameterException::eInvalid,
                                     FormatString("%d", nSize), "Positive number", sMessage,
                                     pszFile, pszFunction, nLine);
        }
    };
    fnCheck(nWndNumCols, "nWndNumCols", "cols");
    fnCheck(nWndNumRows, "nWndNumRows", "rows");
}

}  // namespace vetra::utils
