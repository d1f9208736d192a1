#ifndef VETRA_BASE_UTILS_STRING_STRINGUTILS_H
#define VETRA_BASE_UTILS_STRING_STRINGUTILS_H

#include <string>
#include <vector>

#include "vetra/export.h"

/// \file
/// A character is one byte: no encoding is recognised, zero bytes are ordinary, and bytes above 127
/// are neither space nor letter. Character classes are those of the C locale, whatever locale the
/// process has set. Where nothing else is said the time is linear in the length of the arguments.

/// The text without white space at its end and at its start. White space is what `isspace` accepts
/// in the C locale: blank, tab, line feed, carriage return, vertical tab and form feed.
VETRA_EXPORT std::string TrimWhitespace(const std::string& s);

/// Whether a text, trimmed, reads as a decimal number: an optional sign, digits with at most one
/// point among them, and optionally an exponent of E, e, D or d, an optional sign and at least one
/// digit.
///
/// Digits in the mantissa are not asked for: "+", "-", "." and "E5" are numeric, with the value 0.
/// An empty text, hexadecimal forms, infinities and NaN are not.
VETRA_EXPORT bool IsNumeric(const std::string& s);

/// The number at the start of a text, read like `atof` in the C locale whatever locale the process
/// has set: white space, sign, digits, point, exponent; 0.0 where no number starts. A D or d
/// behind the digits counts as E, so that every text that `IsNumeric` accepts is read whole:
/// "1.5D3" is 1500. A number beyond the range of double gives an infinity or 0.
VETRA_EXPORT double TextToDouble(const std::string& s);

/// The text with every run of white space, at the ends too, replaced by one blank.
VETRA_EXPORT std::string CollapseWhitespace(const std::string& s);

/// The text with A to Z in lower case.
VETRA_EXPORT std::string ToLower(const std::string& s);

/// The text with a to z in upper case.
VETRA_EXPORT std::string ToUpper(const std::string& s);

/// The text without any \p c; the text itself when \p c is 0.
VETRA_EXPORT std::string Strip(const std::string& s, char c);

/// The text without any of the characters of a zero-terminated set; the text itself when \p chars
/// is null.
VETRA_EXPORT std::string Strip(const std::string& s, const char* chars);

/// How many bytes of \p s equal the first byte of \p c. An empty \p c counts zero bytes.
VETRA_EXPORT unsigned int CountChar(const std::string& s, const std::string& c);

/// Replaces the first occurrence of \p from by \p to, again and again, until there is none: text
/// that a replacement made takes part in the next one. "ab" by "b" turns "aab" into "b".
///
/// An empty \p from changes nothing. When \p to contains \p from, the occurrences are replaced in
/// one pass from left to right, without overlap.
///
/// The time is linear in the length of \p s, and each replacement adds the lengths of \p from and
/// \p to. When \p to is not the shorter one, replacements may feed each other far beyond the
/// length of the text ("ab" by "ba" sorts it), or for ever ("ab" by "bbaa" in "aab").
///
/// \throws std::length_error after s.size() + 2^27 / (from.size() + to.size()) replacements, which
///         only such a chain reaches; \p s is unchanged.
VETRA_EXPORT void FindAndReplace(std::string& s, const std::string& from, const std::string& to);

/// The 64-bit FNV-1a hash of the bytes, folded: its low 32 bits xored with its high 32 bits, as a
/// signed 32-bit number. The same on all platforms, whatever the width of long.
/// Source: G. Fowler, L. C. Noll, K.-P. Vo, D. Eastlake, "The FNV Non-Cryptographic Hash
/// Algorithm", Internet draft draft-eastlake-fnv.
VETRA_EXPORT long HashString(const std::string& s);

/// The number of characters of \p n as "%d" prints it: a minus sign counts.
VETRA_EXPORT int NumDigits(int n);

/// Cuts a text at every character of a set.
///
/// \param text              the text; its quotes stay in the tokens
/// \param delimiters        the characters that cut; with an empty set the text is one token
/// \param bHonourQuotes     a delimiter doesn't cut while the token has an odd number of double
///                          quotes; a quote that isn't closed carries the token to the end
/// \param bMergeDelimiters  runs of delimiters cut once, and those at the ends of the text vanish:
///                          there are no empty tokens, and no token at all in an empty text.
///                          Without it n delimiters that cut give n + 1 tokens, some of them empty.
VETRA_EXPORT std::vector<std::string> TokenizeString(const std::string& text,
                                                     const std::string& delimiters,
                                                     bool bHonourQuotes, bool bMergeDelimiters);

#endif  // VETRA_BASE_UTILS_STRING_STRINGUTILS_H
