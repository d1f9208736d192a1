#ifndef VETRA_TESTS_BASE_UTILS_STRING_LITERALJSON_H
#define VETRA_TESTS_BASE_UTILS_STRING_LITERALJSON_H

#include <algorithm>
#include <cstddef>
#include <map>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "vetra/base/utils/string/jsonparser.h"
#include "vetra/base/utils/string/stringutils.h"
#include "vetra/faultcore/exceptions.h"

// The four constructors of the JSON reader as the language is defined, on texts of their own: each
// cuts the texts of its entries out and calls the next. Each gives a description of what it makes.
namespace vetra::tests::literal {

inline std::string List(const std::string& sText);
inline std::string Map(const std::string& sText);

struct Malformed {
    std::string sLocator;
};

inline std::string Quote(const std::string& s) { return std::to_string(s.size()) + ":" + s; }

inline bool IsOpener(char c) { return c == '[' || c == '{' || c == '"'; }

inline std::size_t BracketEnd(const std::string& s, std::size_t nStart, bool bBackslash) {
    std::string sStack(1, s[nStart]);
    for (std::size_t n = nStart + 1; n < s.size(); ++n) {
        const char chTop = sStack.back();
        if (bBackslash && s[n] == '\\') {
            ++n;
        } else if (s[n] == (chTop == '[' ? ']' : chTop == '{' ? '}' : '"')) {
            sStack.pop_back();
            if (sStack.empty()) {
                return n + 1;
            }
        } else if (IsOpener(s[n])) {
            sStack += s[n];
        }
    }
    return s.size();
}

inline std::size_t ScalarEnd(const std::string& s, std::size_t nStart, const char* pszEnds) {
    return std::min(s.find_first_of(pszEnds, nStart + 1), s.size());
}

inline std::string Behind(const std::string& sRest, std::size_t nEnd) {
    const std::string s = TrimWhitespace(sRest.substr(nEnd));
    return !s.empty() && s[0] == ',' ? TrimWhitespace(s.substr(1)) : s;
}

inline std::string Value(const std::string& sText) {
    std::string s = TrimWhitespace(sText);
    if (s.size() >= 2 && s.front() == '"' && s.back() == '"') {
        s = s.substr(1, s.size() - 2);
    } else if (s.size() >= 2 && ToLower(s) == "null") {
        s.clear();
    }
    return Quote(s);
}

inline std::string List(const std::string& sText) {
    if (sText.empty() || sText.front() != '[' || sText.back() != ']') {
        throw Malformed{"JsonList::JsonList"};
    }
    std::string sResult = "[";
    std::string sRest = TrimWhitespace(sText.substr(1));
    while (!sRest.empty() && sRest[0] != ']') {
        const std::size_t nEnd =
            IsOpener(sRest[0]) ? BracketEnd(sRest, 0, false) : ScalarEnd(sRest, 0, ",]");
        const std::string sElement = sRest.substr(0, nEnd);
        sResult += (sRest[0] == '['   ? List(sElement)
                    : sRest[0] == '{' ? Map(sElement)
                                      : Value(sElement)) +
                   ' ';
        sRest = Behind(sRest, nEnd);
    }
    return sResult + ']';
}

// The id, and a description of the node.
inline std::pair<std::string, std::string> Pair(const std::string& sText) {
    const std::size_t nColon = sText.find(':');
    if (nColon == std::string::npos) {
        return {"", "-"};
    }
    const std::string sKey = TrimWhitespace(sText.substr(0, nColon));
    if (sKey.size() < 2 || sKey.front() != '"' || sKey.back() != '"') {
        throw Malformed{"JsonPair::JsonPair"};
    }
    const std::string sValue = TrimWhitespace(sText.substr(nColon + 1));
    return {sKey.substr(1, sKey.size() - 2), sValue[0] == '['   ? List(sValue)
                                             : sValue[0] == '{' ? Map(sValue)
                                                                : Value(sValue)};
}

inline std::string Map(const std::string& sText) {
    if (sText.empty() || sText.front() != '{' || sText.back() != '}') {
        throw Malformed{"JsonMap::JsonMap"};
    }
    std::map<std::string, std::string> oPairs;
    std::string sRest = TrimWhitespace(sText.substr(1));
    while (!sRest.empty() && sRest[0] != '}') {
        const std::size_t nColon = sRest.find(':');
        std::size_t nValue = nColon == std::string::npos ? 0 : nColon + 1;
        while (nValue < sRest.size() && sRest[nValue] == ' ') {
            ++nValue;
        }
        const std::size_t nEnd = IsOpener(sRest[nValue]) ? BracketEnd(sRest, nValue, true)
                                                         : ScalarEnd(sRest, nValue, ",}");
        const std::size_t nQuote = sRest.find('"');
        if (nQuote == std::string::npos) {
            throw std::out_of_range("");
        }
        oPairs.insert(Pair(nQuote < nEnd ? sRest.substr(nQuote, nEnd - nQuote) : ""));
        sRest = Behind(sRest, nEnd);
    }
    std::string sResult = "{";
    for (const auto& [sId, sNode] : oPairs) {
        sResult += Quote(sId) + '=' + sNode + ' ';
    }
    return sResult + '}';
}

/// What the reader made, described in the same way.
inline std::string Describe(JsonNode* poNode) {
    if (poNode == nullptr) {
        return "-";
    }
    std::string sResult;
    switch (poNode->GetType()) {
        case eJNT_VALUE:
            return Quote(static_cast<JsonValue*>(poNode)->GetValue());
        case eJNT_LIST: {
            std::vector<JsonNode*> vpoChildren;
            static_cast<JsonList*>(poNode)->GetChildren(&vpoChildren);
            for (JsonNode* poChild : vpoChildren) {
                sResult += Describe(poChild) + ' ';
            }
            return '[' + sResult + ']';
        }
        case eJNT_MAP: {
            std::vector<JsonPair*> vpoPairs;
            static_cast<JsonMap*>(poNode)->GetPairs(&vpoPairs);
            for (JsonPair* poPair : vpoPairs) {
                sResult += Quote(poPair->GetId()) + '=' + Describe(poPair->GetNode()) + ' ';
            }
            return '{' + sResult + '}';
        }
        default:
            return "?";
    }
}

/// The description, or the failure, of what \p fnMake gives.
template <typename Make>
std::string Outcome(Make fnMake) {
    try {
        return fnMake();
    } catch (const Malformed& oCaught) {
        return "fails in " + oCaught.sLocator;
    } catch (const Exception& oCaught) {
        return oCaught.GetMessage() == "Malformed JSON string"
                   ? "fails in " + oCaught.GetFunction()
                   : "fails with " + oCaught.GetMessage();
    } catch (const std::out_of_range&) {
        return "fails with out_of_range";
    }
}

inline std::string ReadDocument(const std::string& sText) {
    return Outcome([&] { return Describe(JsonParser(sText).GetRoot()); });
}

inline std::string ReadLiterally(const std::string& sText) {
    return Outcome([&] { return Map(TrimWhitespace(sText)); });
}

}  // namespace vetra::tests::literal

#endif  // VETRA_TESTS_BASE_UTILS_STRING_LITERALJSON_H
