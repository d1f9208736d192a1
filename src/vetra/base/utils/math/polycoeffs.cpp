#include "vetra/base/utils/math/polycoeffs.h"

#include <algorithm>
#include <cmath>

#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::utils::math {

void CheckCoeffPointer(const double* padfCoeffs, const char* pszFile, const char* pszFunction,
                       std::uint32_t nLine) {
    if (padfCoeffs == nullptr) {
        throw ParameterException("padfCoeffs", ParameterException::eInvalid, "NULL", "not NULL",
                                 "Coefficient array pointer cannot be NULL", pszFile, pszFunction,
                                 nLine);
    }
}

void CheckCoeffIndex(int nWhich, int nNumCoeffs, const char* pszFile, const char* pszFunction,
                     std::uint32_t nLine) {
    if (nWhich < 0 || nWhich >= nNumCoeffs) {
        throw ParameterException("nWhich", ParameterException::eInvalid, FormatString("%d", nWhich),
                                 FormatString("< %d", nNumCoeffs), "Index is out of range", pszFile,
                                 pszFunction, nLine);
    }
}

int LastSignificantCoeff(int nNumCoeffs, const double* padfCoeffs, const char* pszFile,
                         const char* pszFunction, std::uint32_t nLine) {
    if (nNumCoeffs > 0) {
        CheckCoeffPointer(padfCoeffs, pszFile, pszFunction, nLine);
    }
    int nLast = std::max(nNumCoeffs, 1) - 1;
    while (nLast > 0 && !(std::abs(padfCoeffs[nLast]) > kPolyEpsilon)) {
        --nLast;
    }
    return nLast;
}

bool CoeffsEqual(int nNumCoeffs, const double* padfLeft, const double* padfRight) {
    return std::equal(
        padfLeft, padfLeft + nNumCoeffs, padfRight,
        [](double dfLeft, double dfRight) { return !(std::abs(dfLeft - dfRight) > kPolyEpsilon); });
}

}  // namespace vetra::utils::math
