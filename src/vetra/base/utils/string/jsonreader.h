#ifndef VETRA_BASE_UTILS_STRING_JSONREADER_H
#define VETRA_BASE_UTILS_STRING_JSONREADER_H

#include <cstddef>
#include <cstdlib>
#include <memory>
#include <stack>
#include <string_view>
#include <vector>

#include "vetra/base/utils/string/jsonparser.h"

// Private: what the constructors of the JSON classes do.
namespace vetra {

/// Reads one text into an empty value, list, map or pair. A second read needs another reader.
class JsonReader {
 public:
    /// \param sText  must outlive the reader
    explicit JsonReader(std::string_view sText);

    void Read(JsonValue& oValue) const;
    void Read(JsonList& oList);
    void Read(JsonMap& oMap);
    void Read(JsonPair& oPair);

 private:
    /// Finds a byte at or behind positions that mostly grow, and looks at each part of the text
    /// once.
    class Finder {
     public:
        Finder(std::string_view sText, char c) : msText(sText), mchByte(c) {}
        std::size_t Find(std::size_t nStart);

     private:
        std::string_view msText;
        char mchByte;
        std::size_t mnStart = 1;
        std::size_t mnFound = 0;  // nothing was looked for: an empty range
    };

    struct Release {
        void operator()(std::size_t* p) const { std::free(p); }
    };

    /// A container whose entries from nNext to nEnd are still to be read.
    struct Open {
        JsonNode* poNode;
        JsonNodeType eType;
        std::size_t nNext;
        std::size_t nEnd;
    };

    void Enter(JsonNode& oNode, JsonNodeType eType, std::size_t nStart, std::size_t nEnd);
    void ReadOpen();
    void ReadElement(Open& oOpen);
    void ReadEntry(Open& oOpen);
    void ReadPair(JsonPair& oPair, std::size_t nStart, std::size_t nEnd);
    void ReadValue(JsonValue& oValue, std::size_t nStart, std::size_t nEnd) const;
    std::unique_ptr<JsonNode> MakeNode(std::size_t nStart, std::size_t nEnd);

    std::size_t EndOfEntry(std::size_t nStart, const Open& oOpen);
    std::size_t ScanBrackets(std::size_t nStart, std::size_t nEnd, bool bInMap);
    std::size_t BehindComma(std::size_t nStart, std::size_t nEnd) const;
    std::size_t SkipSpace(std::size_t nStart, std::size_t nEnd) const;

    std::string_view msText;
    Finder moColon;
    Finder moQuote;
    std::stack<Open> moOpen;
    std::vector<std::unique_ptr<JsonPair>> mvpoDiscarded;

    // What the scans learned, one array for lists and one for maps: at an opening bracket the place
    // behind its closer, at a closing bracket that of the end of a quote that is alone on the stack
    // there. 0 where nothing is known, npos where the end of the text came first.
    // From calloc: of most texts only a few pages are touched.
    std::unique_ptr<std::size_t[], Release> mapnEnds[2];
    // Working memory of the scans.
    std::vector<std::size_t> mvnStack;
    std::vector<std::size_t> mvnPassed;
};

}  // namespace vetra

#endif  // VETRA_BASE_UTILS_STRING_JSONREADER_H
