#ifndef VETRA_BASE_UTILS_MATH_ARGUMENTS_H
#define VETRA_BASE_UTILS_MATH_ARGUMENTS_H

#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

// Private: checks that transforms and grids share. The location is that of the caller.
namespace vetra::utils::math {

/// Refuses a null pointer.
inline void CheckPointer(const void* p, const char* pszArgument, const char* pszFile,
                         const char* pszFunction, std::uint32_t nLine) {
    if (p == nullptr) {
        throw ParameterException(pszArgument, ParameterException::eInvalid, "NULL", "non-NULL",
                                 FormatString("%s must be a valid pointer", pszArgument), pszFile,
                                 pszFunction, nLine);
    }
}

/// Refuses a number below nLowest.
inline void CheckAtLeast(int n, int nLowest, const char* pszArgument, const char* pszFile,
                         const char* pszFunction, std::uint32_t nLine) {
    if (n < nLowest) {
        throw ParameterException(pszArgument, ParameterException::eOutOfRange,
                                 FormatString("%d", n), FormatString(">= %d", nLowest),
                                 FormatString("%s must be at least %d", pszArgument, nLowest),
                                 pszFile, pszFunction, nLine);
    }
}

/// Refuses a length that is below nLowest or not a power of two.
inline void CheckTransformLength(int n, int nLowest, const char* pszArgument, const char* pszFile,
                                 const char* pszFunction, std::uint32_t nLine) {
    CheckAtLeast(n, nLowest, pszArgument, pszFile, pszFunction, nLine);
    if ((n & (n - 1)) != 0) {
        throw ParameterException(
            pszArgument, ParameterException::eInvalid, FormatString("%d", n), "a power of two",
            FormatString("%s must be a power of two", pszArgument), pszFile, pszFunction, nLine);
    }
}

}  // namespace vetra::utils::math

#endif  // VETRA_BASE_UTILS_MATH_ARGUMENTS_H
