#include "vetra/base/utils/string/stringutils.h"

#include <locale.h>
#include <stdlib.h>

#include <algorithm>
#include <bitset>
#include <cstdint>
#include <stdexcept>
#include <string_view>

#include "vetra/base/utils/string/streammatcher.h"
#include "vetra/base/utils/string/whitespace.h"

namespace {

using vetra::IsSpace;
using vetra::Trim;

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

bool AllDigits(std::string_view s) { return std::all_of(s.begin(), s.end(), IsDigit); }

class ByteSet {
 public:
    explicit ByteSet(std::string_view sBytes) {
        for (const char c : sBytes) {
            moBits.set(static_cast<unsigned char>(c));
        }
    }

    bool Has(char c) const { return moBits[static_cast<unsigned char>(c)]; }

    /// The first position at or behind \p nStart whose byte is in the set, or is not in it; npos
    /// when there is none.
    std::size_t Find(std::string_view s, std::size_t nStart, bool bInSet) const {
        for (std::size_t n = nStart; n < s.size(); ++n) {
            if (Has(s[n]) == bInSet) {
                return n;
            }
        }
        return std::string_view::npos;
    }

 private:
    std::bitset<256> moBits;
};

}  // namespace

std::string TrimWhitespace(const std::string& s) { return std::string(Trim(s)); }

bool IsNumeric(const std::string& s) {
    std::string_view sMantissa = Trim(s);
    if (sMantissa.empty()) {
        return false;
    }
    if (sMantissa.front() == '+' || sMantissa.front() == '-') {
        sMantissa.remove_prefix(1);
    }

    // The first marker of this list that occurs splits the text, wherever it stands.
    for (const std::string_view sMarker :
         {"E-", "E+", "e-", "e+", "D-", "D+", "d-", "d+", "E", "e", "D", "d"}) {
        const std::size_t nMarker = sMantissa.find(sMarker);
        if (nMarker != std::string_view::npos) {
            const std::string_view sExponent = sMantissa.substr(nMarker + sMarker.size());
            if (sExponent.empty() || !AllDigits(sExponent)) {
                return false;
            }
            sMantissa = sMantissa.substr(0, nMarker);
            break;
        }
    }

    const std::size_t nPoint = sMantissa.find('.');
    if (nPoint == std::string_view::npos) {
        return AllDigits(sMantissa);
    }
    return AllDigits(sMantissa.substr(0, nPoint)) && AllDigits(sMantissa.substr(nPoint + 1));
}

double TextToDouble(const std::string& s) {
    static const locale_t kCLocale = newlocale(LC_ALL_MASK, "C", nullptr);
    std::string sText = s;
    const std::size_t nMarker = sText.find_first_of("Dd");
    if (nMarker != std::string::npos && nMarker > 0 &&
        (IsDigit(sText[nMarker - 1]) || sText[nMarker - 1] == '.')) {
        sText[nMarker] = 'E';
    }
    return strtod_l(sText.c_str(), nullptr, kCLocale);
}

std::string CollapseWhitespace(const std::string& s) {
    std::string sResult;
    bool bInRun = false;
    for (const char c : s) {
        const bool bSpace = IsSpace(c);
        if (!bSpace) {
            sResult += c;
        } else if (!bInRun) {
            sResult += ' ';
        }
        bInRun = bSpace;
    }
    return sResult;
}

std::string ToLower(const std::string& s) {
    std::string sResult = s;
    for (char& c : sResult) {
        if (c >= 'A' && c <= 'Z') {
            c = static_cast<char>(c - 'A' + 'a');
        }
    }
    return sResult;
}

std::string ToUpper(const std::string& s) {
    std::string sResult = s;
    for (char& c : sResult) {
        if (c >= 'a' && c <= 'z') {
            c = static_cast<char>(c - 'a' + 'A');
        }
    }
    return sResult;
}

std::string Strip(const std::string& s, char c) {
    const char szSet[] = {c, '\0'};
    return Strip(s, szSet);
}

std::string Strip(const std::string& s, const char* chars) {
    if (chars == nullptr) {
        return s;
    }
    const ByteSet oSet(chars);
    std::string sResult = s;
    const auto itEnd =
        std::remove_if(sResult.begin(), sResult.end(), [&oSet](char c) { return oSet.Has(c); });
    sResult.erase(itEnd, sResult.end());
    return sResult;
}

unsigned int CountChar(const std::string& s, const std::string& c) {
    return static_cast<unsigned int>(std::count(s.begin(), s.end(), c[0]));
}

void FindAndReplace(std::string& s, const std::string& from, const std::string& to) {
    if (from.empty()) {
        return;
    }
    constexpr std::size_t kChainBytes = std::size_t{1} << 27;
    // Where `to` is shorter, or can't overlap `from` both ways, every replacement takes at least
    // one byte of s for good: such a run never needs more than s.size() replacements.
    const std::size_t nLimit = s.size() + kChainBytes / (from.size() + to.size());

    vetra::StreamMatcher oMatcher(from);
    const bool bOnePass =
        std::any_of(to.begin(), to.end(), [&oMatcher](char c) { return oMatcher.Take(c); });
    oMatcher.Restart();

    // The text is sDone, which holds no occurrence, then the rests of `to` that earlier
    // replacements left to read (positions in `to`, the last one first), then s from nNext.
    std::string sDone;
    std::vector<std::size_t> vnRests;
    std::size_t nNext = 0;
    std::size_t nReplaced = 0;
    while (!vnRests.empty() || nNext < s.size()) {
        if (vnRests.empty()) {
            sDone += s[nNext++];
        } else {
            sDone += to[vnRests.back()];
            if (++vnRests.back() == to.size()) {
                vnRests.pop_back();
            }
        }
        if (!oMatcher.Take(sDone.back())) {
            continue;
        }
        if (++nReplaced > nLimit) {
            throw std::length_error("FindAndReplace: the replacements do not come to an end");
        }
        sDone.resize(sDone.size() - from.size());
        oMatcher.Restart();
        if (bOnePass) {
            sDone += to;
            continue;
        }
        if (!to.empty()) {
            vnRests.push_back(0);
        }
        // A new occurrence begins less than a length of `from` ahead of the replaced one.
        const std::size_t nBack = std::min(sDone.size(), from.size() - 1);
        for (std::size_t n = sDone.size() - nBack; n < sDone.size(); ++n) {
            oMatcher.Take(sDone[n]);
        }
    }
    s = std::move(sDone);
}

long HashString(const std::string& s) {
    std::uint64_t nHash = 0xcbf29ce484222325U;
    for (const char c : s) {
        nHash = (nHash ^ static_cast<unsigned char>(c)) * 0x100000001b3U;
    }
    return static_cast<std::int32_t>(static_cast<std::uint32_t>(nHash ^ (nHash >> 32)));
}

int NumDigits(int n) { return static_cast<int>(std::to_string(n).size()); }

std::vector<std::string> TokenizeString(const std::string& text, const std::string& delimiters,
                                        bool bHonourQuotes, bool bMergeDelimiters) {
    constexpr std::size_t kNone = std::string::npos;
    const ByteSet oDelimiters(delimiters);
    const auto fnOdd = [&text](std::size_t nFrom, std::size_t nTo) {
        return std::count(text.data() + nFrom, text.data() + nTo, '"') % 2 != 0;
    };
    std::vector<std::string> vsTokens;
    if (!bMergeDelimiters && !bHonourQuotes) {
        // Known at once, and moving millions of tokens from one room to a larger one takes longer.
        const auto nCuts =
            std::count_if(text.begin(), text.end(), [&](char c) { return oDelimiters.Has(c); });
        vsTokens.reserve(static_cast<std::size_t>(nCuts) + 1);
    }
    std::size_t nStart = bMergeDelimiters ? oDelimiters.Find(text, 0, false) : 0;
    while (nStart != kNone) {
        std::size_t nEnd = oDelimiters.Find(text, nStart, true);
        bool bOpenQuote = bHonourQuotes && nEnd != kNone && fnOdd(nStart, nEnd);
        while (bOpenQuote) {
            const std::size_t nNext = oDelimiters.Find(text, nEnd + 1, true);
            bOpenQuote = nNext != kNone && !fnOdd(nEnd, nNext);
            nEnd = nNext;
        }
        if (nEnd == kNone) {
            vsTokens.emplace_back(text, nStart);
            break;
        }
        vsTokens.emplace_back(text, nStart, nEnd - nStart);
        nStart = bMergeDelimiters ? oDelimiters.Find(text, nEnd, false) : nEnd + 1;
    }
    return vsTokens;
}
