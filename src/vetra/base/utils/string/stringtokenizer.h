#ifndef VETRA_BASE_UTILS_STRING_STRINGTOKENIZER_H
#define VETRA_BASE_UTILS_STRING_STRINGTOKENIZER_H

#include <cstddef>
#include <string>

#include "vetra/base/utils/string/itokenizer.h"
#include "vetra/export.h"

/// Cuts a text at a delimiter string, which is searched for as a whole, from left to right without
/// overlap. Runs of delimiters, also at the ends, give no empty tokens.
///
/// A text that holds nothing but delimiters has no tokens from the start. A delimiter behind the
/// last token is another matter: `HasMoreTokens` stays true, and the `NextToken` that looks there
/// gives an empty text. `CountTokens` tells the two apart.
///
/// An empty delimiter is never found: the text is one token.
///
/// Taking all tokens is linear in the length of the text, and so is one call of `CountTokens`.
class VETRA_EXPORT StringTokenizer : public ITokenizer {
 public:
    /// \param text       the text to cut
    /// \param delimiter  what cuts it, as a whole
    StringTokenizer(const std::string& text, const std::string& delimiter);

    /// The delimiter is one blank.
    explicit StringTokenizer(const std::string& text);

    /// Takes over the text that is left, and the delimiter.
    StringTokenizer& operator=(const StringTokenizer& oOther);
    ~StringTokenizer() override;

    /// The next token; an empty text when nothing or only delimiters are left, which are then used
    /// up.
    std::string NextToken() override;

    /// Whether text is left and the whole text was not delimiters only.
    bool HasMoreTokens() const override;

    /// The number of tokens left, at most the largest int.
    int CountTokens() const override;

 protected:
    /// An empty text.
    StringTokenizer();
    /// An empty text, whatever the other holds: assign to copy a tokenizer.
    StringTokenizer(const StringTokenizer& oOther);

    /// Whether the text left is not empty and is the delimiter a whole number of times.
    bool CheckIfDelimitersOnly() const;

 private:
    /// Moves \p nStart behind the delimiters there. Returns the end of the token that starts there.
    std::size_t FindToken(std::size_t& nStart) const;

    std::string msDelimiter;
    std::string msText;
    // The text left starts here: cutting tokens off the front of a long string would be quadratic.
    std::size_t mnStart = 0;
    bool mbDelimitersOnly = false;
};

#endif  // VETRA_BASE_UTILS_STRING_STRINGTOKENIZER_H
