#ifndef VETRA_BASE_UTILS_STRING_WHITESPACE_H
#define VETRA_BASE_UTILS_STRING_WHITESPACE_H

#include <string_view>

// Private: white space for code that works on views. The C library's classes follow the process's
// locale; these are fixed.
namespace vetra {

// Blank, tab, line feed, vertical tab, form feed and carriage return.
constexpr bool IsSpace(char c) { return c == ' ' || (c >= '\t' && c <= '\r'); }

/// The text without white space at its ends.
constexpr std::string_view Trim(std::string_view s) {
    while (!s.empty() && IsSpace(s.front())) {
        s.remove_prefix(1);
    }
    while (!s.empty() && IsSpace(s.back())) {
        s.remove_suffix(1);
    }
    return s;
}

}  // namespace vetra

#endif  // VETRA_BASE_UTILS_STRING_WHITESPACE_H
