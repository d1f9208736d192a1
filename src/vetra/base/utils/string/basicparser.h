#ifndef VETRA_BASE_UTILS_STRING_BASICPARSER_H
#define VETRA_BASE_UTILS_STRING_BASICPARSER_H

#include <cstdint>
#include <string>

#include "vetra/export.h"

/// Finds words in a small text file by the keywords ahead of them.
///
/// The file is read once and has no grammar. Blanks separate its words, and "=", ";", ":", "," and
/// line ends ("\n" or "\r\n") count as blanks; tabs and lone carriage returns are parts of words.
/// The text ends at the first zero byte, and no more is read.
class VETRA_EXPORT BasicParser {
 public:
    /// Reads a file, whatever its size.
    /// \throws FileAccessException when the file is empty, isn't there, is no regular file or can't
    ///         be read.
    explicit BasicParser(const std::string& fileName);

    /// Takes over the text of another parser.
    BasicParser& operator=(const BasicParser& oOther);
    ~BasicParser();

    /// Finds the word behind a key.
    ///
    /// A key is one keyword or several with colons between them, each searched for behind the one
    /// before it: "C:Width" is the first Width behind the first C. Anything may stand between
    /// them. The search is for bytes, upper and lower case apart: a keyword is found within longer
    /// words and within values, too. A key without keywords gives the file's first word.
    ///
    /// The time is linear in the lengths of text and key.
    ///
    /// \param key    keywords, with colons between them
    /// \param value  receives the word; empty when the keywords are there but nothing behind them,
    ///               unchanged when a keyword isn't there
    /// \return whether a word was found
    bool Find(const std::string& key, std::string& value);

 protected:
    /// An empty text.
    BasicParser();
    /// An empty text, whatever the other holds: assign to copy a parser.
    BasicParser(const BasicParser& oOther);

 private:
    /// Makes blanks of the punctuation.
    void BeginSorting();

    std::string msFileName;
    std::string msContents;
    std::int64_t mnFileSize = 0;
};

#endif  // VETRA_BASE_UTILS_STRING_BASICPARSER_H
