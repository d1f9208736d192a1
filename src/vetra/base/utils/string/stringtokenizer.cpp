#include "vetra/base/utils/string/stringtokenizer.h"

#include <algorithm>
#include <limits>

#include "vetra/base/utils/string/streammatcher.h"

StringTokenizer::StringTokenizer(const std::string& text, const std::string& delimiter)
    : msDelimiter(delimiter), msText(text), mbDelimitersOnly(CheckIfDelimitersOnly()) {}

StringTokenizer::StringTokenizer(const std::string& text) : StringTokenizer(text, " ") {}

StringTokenizer::StringTokenizer() = default;
StringTokenizer::StringTokenizer(const StringTokenizer&) : ITokenizer() {}
StringTokenizer& StringTokenizer::operator=(const StringTokenizer& oOther) = default;
StringTokenizer::~StringTokenizer() = default;

bool StringTokenizer::CheckIfDelimitersOnly() const {
    const std::size_t nPeriod = msDelimiter.size();
    const std::size_t nLeft = msText.size() - mnStart;
    return nPeriod != 0 && nLeft != 0 && nLeft % nPeriod == 0 &&
           msText.compare(mnStart, nPeriod, msDelimiter) == 0 &&
           // Each byte equals the one a period behind it.
           std::equal(msText.begin() + static_cast<std::ptrdiff_t>(mnStart + nPeriod), msText.end(),
                      msText.begin() + static_cast<std::ptrdiff_t>(mnStart));
}

bool StringTokenizer::HasMoreTokens() const { return mnStart < msText.size() && !mbDelimitersOnly; }

std::size_t StringTokenizer::FindToken(std::size_t& nStart) const {
    if (msDelimiter.empty()) {
        return msText.size();
    }
    vetra::StreamMatcher oMatcher(msDelimiter);
    for (std::size_t n = nStart; n < msText.size(); ++n) {
        if (!oMatcher.Take(msText[n])) {
            continue;
        }
        const std::size_t nFound = n + 1 - msDelimiter.size();
        if (nFound != nStart) {
            return nFound;
        }
        nStart = n + 1;
        oMatcher.Restart();
    }
    return msText.size();
}

std::string StringTokenizer::NextToken() {
    if (!HasMoreTokens()) {
        mnStart = msText.size();
        return {};
    }
    const std::size_t nEnd = FindToken(mnStart);
    std::string sToken = msText.substr(mnStart, nEnd - mnStart);
    mnStart = std::min(nEnd + msDelimiter.size(), msText.size());
    return sToken;
}

int StringTokenizer::CountTokens() const {
    std::ptrdiff_t nTokens = 0;
    std::size_t nStart = mnStart;
    for (std::size_t nEnd = FindToken(nStart); nEnd > nStart; nEnd = FindToken(nStart)) {
        ++nTokens;
        nStart = nEnd + msDelimiter.size();
    }
    return static_cast<int>(std::min<std::ptrdiff_t>(nTokens, std::numeric_limits<int>::max()));
}
