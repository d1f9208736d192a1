#ifndef VETRA_BASE_UTILS_STRING_ITOKENIZER_H
#define VETRA_BASE_UTILS_STRING_ITOKENIZER_H

#include <string>

#include "vetra/export.h"

/// Gives a text in pieces, one at a time.
class VETRA_EXPORT ITokenizer {
 public:
    virtual ~ITokenizer() = default;

    /// The next token, which is then used up; an empty text when there is none.
    virtual std::string NextToken() = 0;

    /// Whether there is text left to cut.
    virtual bool HasMoreTokens() const = 0;

    /// How many tokens are left. Uses none of them up.
    virtual int CountTokens() const = 0;
};

#endif  // VETRA_BASE_UTILS_STRING_ITOKENIZER_H
