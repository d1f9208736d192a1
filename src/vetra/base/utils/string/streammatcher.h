#ifndef VETRA_BASE_UTILS_STRING_STREAMMATCHER_H
#define VETRA_BASE_UTILS_STRING_STREAMMATCHER_H

#include <cstddef>
#include <string_view>
#include <vector>

namespace vetra {

/// Finds a pattern in a text that comes byte by byte, in constant time per byte on average.
/// Source: D. E. Knuth, J. H. Morris, V. R. Pratt, "Fast pattern matching in strings", SIAM
/// J. Comput. 6(2), 1977.
class StreamMatcher {
 public:
    /// \param sPattern  not empty; must outlive the matcher
    explicit StreamMatcher(std::string_view sPattern)
        : msPattern(sPattern), mvnBorder(sPattern.size(), 0) {
        for (std::size_t n = 1; n + 1 < sPattern.size(); ++n) {
            Take(sPattern[n]);
            mvnBorder[n + 1] = mnMatched;
        }
        Restart();
    }

    /// Forgets the text so far.
    void Restart() { mnMatched = 0; }

    /// Whether an occurrence ends with this byte. `Restart` must follow a true answer.
    bool Take(char c) {
        while (mnMatched > 0 && msPattern[mnMatched] != c) {
            mnMatched = mvnBorder[mnMatched];
        }
        if (msPattern[mnMatched] == c) {
            ++mnMatched;
        }
        return mnMatched == msPattern.size();
    }

 private:
    std::string_view msPattern;
    // Entry n: the longest proper prefix of the first n bytes that is also their suffix.
    std::vector<std::size_t> mvnBorder;
    std::size_t mnMatched = 0;
};

}  // namespace vetra

#endif  // VETRA_BASE_UTILS_STRING_STREAMMATCHER_H
