#include "vetra/base/utils/string/jsonreader.h"

#include <algorithm>
#include <cstdlib>
#include <new>
#include <stdexcept>
#include <utility>

#include "vetra/base/utils/string/stringutils.h"
#include "vetra/base/utils/string/whitespace.h"
#include "vetra/faultcore/exceptions.h"

// The language is defined by constructors within constructors, each of which scans its own text for
// the ends of its entries and hands their texts down. Here one loop does the same, in the same
// order, on places in the whole text, with the containers that are not complete on a stack.
//
// Scanning anew at each level would be quadratic, so scans keep what they find out:
//
//   - A bracket that a scan pushed closes where that scan popped it: from there up the stack, a
//     scan that begins with this bracket does the same. A scan pushes all brackets that it meets
//     (but protected ones, where none begins), so it is asked for each part of the text once, or
//     finds the answer there. A later scan also passes over such a bracket and all within it at
//     once.
//   - A scan that begins with a quote mostly covers a string, which is not read any deeper. But an
//     unquoted key lets a map begin within such a stretch, and scans that begin with different
//     quotes could then pass over the same text again and again. Two of them go the same way from
//     where both have only their quote on the stack, and that happens behind a closing bracket: the
//     first one leaves its end there for the others.
//
// What is known stays true for ranges that end earlier, and those of later scans do: a scan that
// closes nothing takes its entry to the end of the container, and only that entry is read inside.

namespace vetra {
namespace {

constexpr std::size_t kNone = std::string_view::npos;

bool IsOpener(char c) { return c == '[' || c == '{' || c == '"'; }
bool IsClosingBracket(char c) { return c == ']' || c == '}'; }
char CloserOf(char c) { return c == '[' ? ']' : c == '{' ? '}' : '"'; }

// Whether a text begins and ends with double quotes, two of them.
bool IsQuoted(std::string_view s) { return s.size() >= 2 && s.front() == '"' && s.back() == '"'; }

[[noreturn]] void Refuse(const char* pszConstructor) {
    throw Exception("Malformed JSON string", __FILE__, pszConstructor, __LINE__);
}

}  // namespace

std::size_t JsonReader::Finder::Find(std::size_t nStart) {
    if (nStart < mnStart || nStart > mnFound) {
        mnStart = nStart;
        mnFound = msText.find(mchByte, nStart);
    }
    return mnFound;
}

JsonReader::JsonReader(std::string_view sText)
    : msText(sText), moColon(sText, ':'), moQuote(sText, '"') {}

void JsonReader::Read(JsonValue& oValue) const { ReadValue(oValue, 0, msText.size()); }

void JsonReader::Read(JsonList& oList) {
    Enter(oList, eJNT_LIST, 0, msText.size());
    ReadOpen();
}

void JsonReader::Read(JsonMap& oMap) {
    Enter(oMap, eJNT_MAP, 0, msText.size());
    ReadOpen();
}

void JsonReader::Read(JsonPair& oPair) {
    ReadPair(oPair, 0, msText.size());
    ReadOpen();
}

void JsonReader::Enter(JsonNode& oNode, JsonNodeType eType, std::size_t nStart, std::size_t nEnd) {
    const char chOpener = eType == eJNT_LIST ? '[' : '{';
    if (nStart == nEnd || msText[nStart] != chOpener || msText[nEnd - 1] != CloserOf(chOpener)) {
        Refuse(eType == eJNT_LIST ? "JsonList::JsonList" : "JsonMap::JsonMap");
    }
    moOpen.push({&oNode, eType, nStart + 1, nEnd});
}

void JsonReader::ReadOpen() {
    while (!moOpen.empty()) {
        Open& oOpen = moOpen.top();
        oOpen.nNext = SkipSpace(oOpen.nNext, oOpen.nEnd);
        const bool bList = oOpen.eType == eJNT_LIST;
        if (oOpen.nNext == oOpen.nEnd || msText[oOpen.nNext] == (bList ? ']' : '}')) {
            moOpen.pop();
        } else if (bList) {
            ReadElement(oOpen);
        } else {
            ReadEntry(oOpen);
        }
    }
}

void JsonReader::ReadElement(Open& oOpen) {
    const std::size_t nStart = oOpen.nNext;
    const std::size_t nEnd = EndOfEntry(nStart, oOpen);
    oOpen.nNext = BehindComma(nEnd, oOpen.nEnd);
    static_cast<JsonList&>(*oOpen.poNode).mvpoChildren.push_back(MakeNode(nStart, nEnd));
}

void JsonReader::ReadEntry(Open& oOpen) {
    const std::size_t nColon = moColon.Find(oOpen.nNext);
    std::size_t nValue = oOpen.nNext;
    if (nColon < oOpen.nEnd) {
        // Ends at the closing brace at the latest.
        nValue = msText.find_first_not_of(' ', nColon + 1);
    }
    const std::size_t nEnd = EndOfEntry(nValue, oOpen);
    const std::size_t nQuote = moQuote.Find(oOpen.nNext);
    if (nQuote >= oOpen.nEnd) {
        throw std::out_of_range("JsonMap::JsonMap: no double quote where a pair should stand");
    }
    oOpen.nNext = BehindComma(nEnd, oOpen.nEnd);
    auto& oPairs = static_cast<JsonMap&>(*oOpen.poNode).mmpoPairs;

    std::unique_ptr<JsonPair> poPair(new JsonPair);
    ReadPair(*poPair, std::min(nQuote, nEnd), nEnd);
    std::unique_ptr<JsonPair>& poPlace = oPairs[poPair->msId];
    if (poPlace == nullptr) {
        poPlace = std::move(poPair);
    } else {
        // Its value is read nevertheless, for the failures in it.
        mvpoDiscarded.push_back(std::move(poPair));
    }
}

void JsonReader::ReadPair(JsonPair& oPair, std::size_t nStart, std::size_t nEnd) {
    const std::size_t nColon = moColon.Find(nStart);
    if (nColon >= nEnd) {
        return;
    }
    const std::string_view sKey = Trim(msText.substr(nStart, nColon - nStart));
    if (!IsQuoted(sKey)) {
        Refuse("JsonPair::JsonPair");
    }
    oPair.msId = sKey.substr(1, sKey.size() - 2);
    const std::size_t nValue = SkipSpace(nColon + 1, nEnd);
    oPair.mpoNode = MakeNode(nValue, nValue + Trim(msText.substr(nValue, nEnd - nValue)).size());
}

void JsonReader::ReadValue(JsonValue& oValue, std::size_t nStart, std::size_t nEnd) const {
    const std::string_view sValue = Trim(msText.substr(nStart, nEnd - nStart));
    if (IsQuoted(sValue)) {
        oValue.msValue = sValue.substr(1, sValue.size() - 2);
    } else if (sValue.size() != 4 || ToLower(std::string(sValue)) != "null") {
        oValue.msValue = sValue;
    }
}

std::unique_ptr<JsonNode> JsonReader::MakeNode(std::size_t nStart, std::size_t nEnd) {
    std::unique_ptr<JsonNode> poNode;
    const char chFirst = nStart < nEnd ? msText[nStart] : '\0';
    if (chFirst == '[') {
        poNode.reset(new JsonList);
        Enter(*poNode, eJNT_LIST, nStart, nEnd);
    } else if (chFirst == '{') {
        poNode.reset(new JsonMap);
        Enter(*poNode, eJNT_MAP, nStart, nEnd);
    } else {
        std::unique_ptr<JsonValue> poValue(new JsonValue);
        ReadValue(*poValue, nStart, nEnd);
        poNode = std::move(poValue);
    }
    return poNode;
}

// Where an element of a list or the value of a pair ends, which starts at nStart.
std::size_t JsonReader::EndOfEntry(std::size_t nStart, const Open& oOpen) {
    const bool bInMap = oOpen.eType == eJNT_MAP;
    if (IsOpener(msText[nStart])) {
        return ScanBrackets(nStart, oOpen.nEnd, bInMap);
    }
    const char chCloser = bInMap ? '}' : ']';
    std::size_t n = nStart + 1;
    while (n < oOpen.nEnd && msText[n] != ',' && msText[n] != chCloser) {
        ++n;
    }
    return n;
}

// The place behind the closer of the bracket or quote at nStart; nEnd when it isn't closed. In a
// map a backslash protects the next character.
std::size_t JsonReader::ScanBrackets(std::size_t nStart, std::size_t nEnd, bool bInMap) {
    auto& pnEnds = mapnEnds[bInMap];
    const auto fnKnown = [&](std::size_t n) {
        return pnEnds == nullptr || msText[n] == '"' ? 0 : pnEnds[n];
    };
    const auto fnKeep = [&](std::size_t n, std::size_t nKnown) {
        if (msText[n] != '"') {
            if (pnEnds == nullptr) {
                pnEnds.reset(
                    static_cast<std::size_t*>(std::calloc(msText.size(), sizeof(std::size_t))));
                if (pnEnds == nullptr) {
                    throw std::bad_alloc();
                }
            }
            pnEnds[n] = nKnown;
        }
    };
    if (fnKnown(nStart) != 0) {
        return std::min(fnKnown(nStart), nEnd);
    }

    mvnStack.assign(1, nStart);
    mvnPassed.clear();
    std::size_t n = nStart + 1;
    while (n < nEnd && !mvnStack.empty()) {
        const char c = msText[n];
        const bool bQuoteAlone = mvnStack.size() == 1 && msText[nStart] == '"';
        if (bInMap && c == '\\') {
            n += 2;
        } else if (c == CloserOf(msText[mvnStack.back()])) {
            fnKeep(mvnStack.back(), ++n);
            mvnStack.pop_back();
            if (mvnStack.size() == 1 && msText[nStart] == '"') {
                mvnPassed.push_back(n - 1);
            }
        } else if (IsOpener(c) && fnKnown(n) == 0) {
            mvnStack.push_back(n++);
        } else if (IsOpener(c)) {
            n = fnKnown(n);
            if (bQuoteAlone && n <= nEnd) {
                mvnPassed.push_back(n - 1);
            }
        } else if (bQuoteAlone && IsClosingBracket(c) && fnKnown(n) != 0) {
            n = fnKnown(n);
            if (n <= nEnd) {
                mvnStack.clear();
            }
        } else {
            ++n;
        }
    }

    const bool bClosed = mvnStack.empty();
    for (const std::size_t nOpener : mvnStack) {
        fnKeep(nOpener, kNone);
    }
    for (const std::size_t nPassed : mvnPassed) {
        fnKeep(nPassed, bClosed ? n : kNone);
    }
    return bClosed ? n : nEnd;
}

// The next entry, or white space ahead of it, behind an entry and at most one comma.
std::size_t JsonReader::BehindComma(std::size_t nStart, std::size_t nEnd) const {
    const std::size_t n = SkipSpace(nStart, nEnd);
    return n < nEnd && msText[n] == ',' ? n + 1 : n;
}

std::size_t JsonReader::SkipSpace(std::size_t nStart, std::size_t nEnd) const {
    std::size_t n = nStart;
    while (n < nEnd && IsSpace(msText[n])) {
        ++n;
    }
    return n;
}

}  // namespace vetra
