#ifndef VETRA_BASE_UTILS_RESAMPLE_SIZECHECK_H
#define VETRA_BASE_UTILS_RESAMPLE_SIZECHECK_H

#include <cstdint>

// Private: the checks that buffers and position transforms share.
namespace vetra::utils {

/// Refuses fewer than one column, then fewer than one row, with `ParameterException`. The location
/// is that of the caller.
void CheckImageSize(int nNumCols, int nNumRows, const char* pszFile, const char* pszFunction,
                    std::uint32_t nLine);

/// Refuses a count below 1. \p pszWhat is its name in the message, for instance "columns".
void CheckCount(int nCount, const char* pszArgument, const char* pszWhat, const char* pszFile,
                const char* pszFunction, std::uint32_t nLine);

/// Refuses a null array of positions. \p pszWhat is "Column" or "Row".
void CheckPositions(const void* pPositions, const char* pszArgument, const char* pszWhat,
                    const char* pszFile, const char* pszFunction, std::uint32_t nLine);

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_SIZECHECK_H
