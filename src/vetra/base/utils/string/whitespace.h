#ifndef VETRA_BASE_UTILS_STRING_WHITESPACE_H
#define VETRA_BASE_UTILS_STRING_WHITESPACE_H

#include <cstddef>
#include <string_view>

// Private: white space for code that works on views. The C library's classes follow the process's
// locale; these are fixed.
namespace vetra {

inline constexpr std::string_view kWhitespace = " \t\n\v\f\r";

inline bool IsSpace(char c) { return kWhitespace.find(c) != std::string_view::npos; }

/// The text without white space at its ends.
inline std::string_view Trim(std::string_view s) {
    const std::size_t nFirst = s.find_first_not_of(kWhitespace);
    if (nFirst == std::string_view::npos) {
        return {};
    }
    return s.substr(nFirst, s.find_last_not_of(kWhitespace) - nFirst + 1);
}

}  // namespace vetra

#endif  // VETRA_BASE_UTILS_STRING_WHITESPACE_H
