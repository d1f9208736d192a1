#include "vetra/base/utils/resample/sizecheck.h"

#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::utils {

void CheckCount(int nCount, const char* pszArgument, const char* pszWhat, const char* pszFile,
                const char* pszFunction, std::uint32_t nLine) {
    if (nCount < 1) {
        throw ParameterException(
            pszArgument, ParameterException::eOutOfRange, FormatString("%d", nCount), "> 0",
            FormatString("Number of %s must be at least 1", pszWhat), pszFile, pszFunction, nLine);
    }
}

void CheckImageSize(int nNumCols, int nNumRows, const char* pszFile, const char* pszFunction,
                    std::uint32_t nLine) {
    CheckCount(nNumCols, "nNumCols", "columns", pszFile, pszFunction, nLine);
    CheckCount(nNumRows, "nNumRows", "rows", pszFile, pszFunction, nLine);
}

void CheckPositions(const void* pPositions, const char* pszArgument, const char* pszWhat,
                    const char* pszFile, const char* pszFunction, std::uint32_t nLine) {
    if (pPositions == nullptr) {
        throw ParameterException(pszArgument, ParameterException::eInvalid, "NULL", "non-NULL",
                                 FormatString("%s position array may not be NULL", pszWhat),
                                 pszFile, pszFunction, nLine);
    }
}

}  // namespace vetra::utils
