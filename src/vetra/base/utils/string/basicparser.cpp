#include "vetra/base/utils/string/basicparser.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <string_view>
#include <system_error>

#include "vetra/base/utils/fs/fileutils.h"
#include "vetra/base/utils/string/streammatcher.h"
#include "vetra/base/utils/string/stringtokenizer.h"
#include "vetra/faultcore/exceptions.h"

namespace {

constexpr const char* kCannotOpen = "Error when trying to open this file";
// Counts as blanks.
constexpr std::string_view kPunctuation = "=;:,\n";

[[noreturn]] void Refuse(const std::string& sFile, const char* pszMessage) {
    throw vetra::FileAccessException(sFile, vetra::FileAccessException::eCannotRead, pszMessage,
                                     VETRA_HERE);
}

// The size that the file system says. Pipes and devices have none: they may have no end, or keep
// the process waiting.
std::int64_t SizeOf(const std::string& sFile) {
    std::error_code oError;
    // `IsFile` knows paths with zero bytes, of which the system would see the front only.
    if (IsFile(sFile)) {
        const std::uintmax_t nSize = std::filesystem::file_size(sFile, oError);
        if (!oError) {
            return static_cast<std::int64_t>(nSize);
        }
    }
    Refuse(sFile, kCannotOpen);
}

// A text file up to its end or first zero byte, its line ends as "\n".
std::string ReadText(const std::string& sFile) {
    std::ifstream oStream(sFile, std::ios::binary);
    std::string sText;
    char achBuffer[1 << 16];
    bool bZero = false;
    while (oStream && !bZero) {
        oStream.read(achBuffer, sizeof achBuffer);
        const std::string_view sRead(achBuffer, static_cast<std::size_t>(oStream.gcount()));
        const std::size_t nZero = sRead.find('\0');
        bZero = nZero != std::string_view::npos;
        for (const char c : sRead.substr(0, nZero)) {
            if (c == '\n' && !sText.empty() && sText.back() == '\r') {
                sText.back() = '\n';
            } else {
                sText += c;
            }
        }
    }
    if (!oStream.is_open() || oStream.bad()) {
        Refuse(sFile, kCannotOpen);
    }
    return sText;
}

// Moves nStart behind the first occurrence of a keyword there; false when there is none.
bool Skip(const std::string& sText, const std::string& sKeyword, std::size_t& nStart) {
    vetra::StreamMatcher oMatcher(sKeyword);
    for (std::size_t n = nStart; n < sText.size(); ++n) {
        if (oMatcher.Take(sText[n])) {
            nStart = n + 1;
            return true;
        }
    }
    return false;
}

}  // namespace

BasicParser::BasicParser(const std::string& fileName)
    : msFileName(fileName), mnFileSize(SizeOf(fileName)) {
    if (mnFileSize == 0) {
        Refuse(fileName, "File has 0 size");
    }
    msContents = ReadText(fileName);
    BeginSorting();
}

BasicParser::BasicParser() = default;
BasicParser::BasicParser(const BasicParser&) : BasicParser() {}
BasicParser& BasicParser::operator=(const BasicParser& oOther) = default;
BasicParser::~BasicParser() = default;

void BasicParser::BeginSorting() {
    std::replace_if(
        msContents.begin(), msContents.end(),
        [](char c) { return kPunctuation.find(c) != std::string_view::npos; }, ' ');
}

bool BasicParser::Find(const std::string& key, std::string& value) {
    StringTokenizer oKeywords(key, ":");
    std::size_t nStart = 0;
    for (int nLeft = oKeywords.CountTokens(); nLeft > 0; --nLeft) {
        if (!Skip(msContents, oKeywords.NextToken(), nStart)) {
            return false;
        }
    }
    const std::size_t nWord =
        std::min(msContents.find_first_not_of(' ', nStart), msContents.size());
    value = msContents.substr(nWord, msContents.find(' ', nWord) - nWord);
    return !value.empty();
}
