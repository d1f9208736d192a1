#include "vetra/base/utils/string/stringutils.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <random>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace {

TEST(StringUtils, IsNumeric) {
    for (const char* pszText : {"12", " -1.5 ", "1.5E-3", "2d+4", "1e5", "1D5", "1D-12", "1.", ".5",
                                "007", "+", "-", ".", "-.e0", "E5", "e+5", "\v\f+7\r\n"}) {
        EXPECT_TRUE(IsNumeric(pszText)) << pszText;
    }
    for (const char* pszText :
         {"",    " \t",   "1.2.3",  "..",    "1e",  "1e+", "E",     "e-",    "--1",
          "+-1", "- 1",   "1e5.0",  "0x10",  "1 2", "1,5", "1E5e3", "1e3E5", "1e-5E-3",
          "inf", "1e +5", "1e+ 5 ", "1e5-3", "1f",  "nan", "1-",    "\xb2",  "1_000"}) {
        EXPECT_FALSE(IsNumeric(pszText)) << pszText;
    }
    EXPECT_FALSE(IsNumeric(std::string("1\0", 2)));
}

TEST(StringUtils, TrimWhitespace) {
    EXPECT_EQ(TrimWhitespace(" \t\n\v\f\ra \t b\r\n"), "a \t b");
    EXPECT_EQ(TrimWhitespace(" \t\n\v\f\r"), "");
    EXPECT_EQ(TrimWhitespace(""), "");
    EXPECT_EQ(TrimWhitespace("x"), "x");
    EXPECT_EQ(TrimWhitespace(" \xa0\x85 "), "\xa0\x85");
    EXPECT_EQ(TrimWhitespace(std::string(" \0 ", 3)), std::string("\0", 1));
}

TEST(StringUtils, TextToDouble) {
    constexpr double kInf = std::numeric_limits<double>::infinity();
    const std::pair<const char*, double> aoCases[] = {
        {"12", 12.0},      {" -1.5 ", -1.5}, {"0.1", 0.1},    {"1.5E-3", 1.5e-3}, {"2d+4", 2e4},
        {"1.5D3", 1500.0}, {"3.9x", 3.9},    {"+", 0.0},      {".", 0.0},         {"E5", 0.0},
        {"", 0.0},         {"abc", 0.0},     {"1e999", kInf}, {"-1D999", -kInf},  {"1e-999", 0.0}};
    for (const auto& [pszText, dfValue] : aoCases) {
        EXPECT_EQ(TextToDouble(pszText), dfValue) << pszText;
    }
}

constexpr std::size_t kLong = 10'000'000;

std::string RandomText(std::mt19937& oRandom, const std::string& sAlphabet, unsigned nMax) {
    std::string s(oRandom() % (nMax + 1), ' ');
    for (char& c : s) {
        c = sAlphabet[oRandom() % sAlphabet.size()];
    }
    return s;
}

TEST(StringUtils, ByteFunctions) {
    EXPECT_EQ(CollapseWhitespace(" \tx"), " x");
    EXPECT_EQ(CollapseWhitespace("x\n"), "x ");
    EXPECT_EQ(CollapseWhitespace(" \v\f\r"), " ");
    EXPECT_EQ(CollapseWhitespace("a\xa0 \n b  c\x85"), "a\xa0 b c\x85");
    EXPECT_EQ(CollapseWhitespace(""), "");

    // The letters and nothing else: each byte's neighbours in the table are there too.
    std::string sAll(256, '\0');
    std::string sLower = sAll;
    std::string sUpper = sAll;
    for (std::size_t n = 0; n < 256; ++n) {
        sAll[n] = static_cast<char>(n);
        sLower[n] = static_cast<char>(n >= 'A' && n <= 'Z' ? n + 32 : n);
        sUpper[n] = static_cast<char>(n >= 'a' && n <= 'z' ? n - 32 : n);
    }
    EXPECT_EQ(ToLower(sAll), sLower);
    EXPECT_EQ(ToUpper(sAll), sUpper);

    EXPECT_EQ(Strip("a-b--", '-'), "ab");
    EXPECT_EQ(Strip("\xe9-", '\xe9'), "-");
    EXPECT_EQ(Strip(std::string("a\0b", 3), '\0'), std::string("a\0b", 3));
    EXPECT_EQ(Strip("a,\xff;b c", " ;\xff"), "a,bc");
    EXPECT_EQ(Strip("ab", ""), "ab");
    EXPECT_EQ(Strip("ab", nullptr), "ab");

    EXPECT_EQ(CountChar("abca", "ax"), 2u);
    EXPECT_EQ(CountChar("\xe9\xe9i", "\xe9"), 2u);
    EXPECT_EQ(CountChar("abc", ""), 0u);
    EXPECT_EQ(CountChar(std::string("a\0b\0", 4), ""), 2u);

    const std::pair<int, int> anDigits[] = {{-12, 3},
                                            {0, 1},
                                            {9, 1},
                                            {10, 2},
                                            {std::numeric_limits<int>::max(), 10},
                                            {std::numeric_limits<int>::min(), 11}};
    for (const auto& [nValue, nDigits] : anDigits) {
        EXPECT_EQ(NumDigits(nValue), nDigits);
    }
}

TEST(StringUtils, HashString) {
    EXPECT_EQ(HashString(""), 1339080641);
    EXPECT_EQ(HashString("abc"), -497093294);
    // From the published 64-bit value 85944171f73967e8 of "foobar".
    EXPECT_EQ(HashString("foobar"), static_cast<std::int32_t>(0xf73967e8U ^ 0x85944171U));
    EXPECT_NE(HashString("\xff"), HashString("\x7f"));
    EXPECT_NE(HashString(std::string(1, '\0')), HashString(""));
}

TEST(StringUtils, FindAndReplaceAsOneByOne) {
    std::mt19937 oRandom(1);
    int nChained = 0;
    for (int nCase = 0; nCase < 200'000; ++nCase) {
        const std::string sText = RandomText(oRandom, "ab", 14);
        const std::string sFrom = RandomText(oRandom, "ab", 4);
        const std::string sTo = RandomText(oRandom, "ab", 4);
        if (sFrom.empty() || sTo.find(sFrom) != std::string::npos) {
            continue;
        }
        std::string sExpected = sText;
        int nSteps = 0;
        for (std::size_t n = sExpected.find(sFrom); n != std::string::npos && nSteps < 300;
             n = sExpected.find(sFrom)) {
            sExpected.replace(n, sFrom.size(), sTo);
            ++nSteps;
        }
        if (nSteps == 300) {
            continue;  // may have no end
        }
        std::string sActual = sText;
        FindAndReplace(sActual, sFrom, sTo);
        ASSERT_EQ(sActual, sExpected) << sFrom << " by " << sTo << " in " << sText;
        nChained += nSteps > static_cast<int>(sText.size());
    }
    EXPECT_GT(nChained, 100);
}

TEST(StringUtils, FindAndReplaceBounds) {
    struct Case {
        std::string sText, sFrom, sTo, sExpected;
    };
    std::string sBrackets = std::string(kLong / 2, '(') + std::string(kLong / 2, ')');
    std::string sSeparated(2 * kLong, ';');
    for (std::size_t n = 0; n < kLong; ++n) {
        sSeparated[2 * n] = ',';
    }
    const Case aoCases[] = {
        {"abc", "", "x", "abc"},
        {"aab", "ab", "b", "b"},
        // One pass where the new text holds the old one.
        {"abab", "ab", "aabb", "aabbaabb"},
        {"aaa", "aa", "aaa", "aaaa"},
        {"aaa", "aa", "aa", "aaa"},
        {std::string("a\0b", 3), std::string("\0", 1), "-", "a-b"},
        {sBrackets, "()", "", ""},
        {std::string(kLong - 1, 'a') + 'b', "ab", "b", "b"},
        {std::string(kLong, ' '), "  ", " ", " "},
        {std::string(kLong, ','), ",", ",;", sSeparated},
        {std::string(kLong, 'a'), std::string(1000, 'a') + 'b', "", std::string(kLong, 'a')}};
    for (const Case& o : aoCases) {
        std::string sActual = o.sText;
        FindAndReplace(sActual, o.sFrom, o.sTo);
        EXPECT_TRUE(sActual == o.sExpected)
            << o.sFrom << " by " << o.sTo << " gives " << sActual.substr(0, 20);
    }

    std::string sSelf = "abab";
    FindAndReplace(sSelf, sSelf, sSelf);
    EXPECT_EQ(sSelf, "abab");

    // "aab" becomes "bbaabaa", which holds "aab" again.
    std::string sEndless = "xaab";
    EXPECT_THROW(FindAndReplace(sEndless, "ab", "bbaa"), std::length_error);
    EXPECT_EQ(sEndless, "xaab");
}

using Tokens = std::vector<std::string>;

// The rule as the documentation states it, token by token and with the quotes counted afresh.
Tokens PlainTokens(const std::string& sText, const std::string& sDelimiters, bool bQuotes,
                   bool bMerge) {
    constexpr std::size_t kNone = std::string::npos;
    Tokens vsTokens;
    std::size_t nStart = bMerge ? sText.find_first_not_of(sDelimiters) : 0;
    while (nStart != kNone) {
        std::size_t nEnd = sText.find_first_of(sDelimiters, nStart);
        std::string sToken = sText.substr(nStart, nEnd == kNone ? kNone : nEnd - nStart);
        while (bQuotes && CountChar(sToken, "\"") % 2 == 1 && nEnd != kNone) {
            const std::size_t nNext = sText.find_first_of(sDelimiters, nEnd + 1);
            sToken += sText.substr(nEnd, nNext == kNone ? kNone : nNext - nEnd);
            nEnd = nNext;
        }
        vsTokens.push_back(sToken);
        if (nEnd == kNone) {
            break;
        }
        nStart = bMerge ? sText.find_first_not_of(sDelimiters, nEnd) : nEnd + 1;
    }
    return vsTokens;
}

TEST(StringUtils, TokenizeString) {
    EXPECT_EQ(TokenizeString("a,,b", ",", false, false), (Tokens{"a", "", "b"}));
    EXPECT_EQ(TokenizeString("a,,b", ",", false, true), (Tokens{"a", "b"}));
    EXPECT_EQ(TokenizeString("", ",", false, false), (Tokens{""}));
    EXPECT_EQ(TokenizeString("", ",", true, true), (Tokens{}));
    EXPECT_EQ(TokenizeString("a,", ",", true, false), (Tokens{"a", ""}));
    EXPECT_EQ(TokenizeString(",", ",", false, false), (Tokens{"", ""}));
    EXPECT_EQ(TokenizeString("a,\"b,c\",d", ",", true, false), (Tokens{"a", "\"b,c\"", "d"}));
    EXPECT_EQ(TokenizeString("a\"b,c,,", ",", true, true), (Tokens{"a\"b,c,,"}));
    EXPECT_EQ(TokenizeString("a,b", "", true, false), (Tokens{"a,b"}));
    EXPECT_EQ(TokenizeString("", "", false, true), (Tokens{}));
    EXPECT_EQ(TokenizeString("a\xe9z;b", ";\xe9", false, false), (Tokens{"a", "z", "b"}));

    std::mt19937 oRandom(2);
    for (int nCase = 0; nCase < 100'000; ++nCase) {
        const std::string sText = RandomText(oRandom, ",;\"ab", 12);
        const std::string sDelimiters = RandomText(oRandom, ",;\"", 3);
        const bool bQuotes = nCase % 2 == 0;
        const bool bMerge = nCase / 2 % 2 == 0;
        ASSERT_EQ(TokenizeString(sText, sDelimiters, bQuotes, bMerge),
                  PlainTokens(sText, sDelimiters, bQuotes, bMerge))
            << sText << " at " << sDelimiters << (bQuotes ? " quotes" : "")
            << (bMerge ? " merge" : "");
    }

    const std::string sCommas(kLong, ',');
    EXPECT_EQ(TokenizeString(sCommas.substr(kLong / 10 * 9), ",", true, false).size(),
              kLong / 10 + 1);
    EXPECT_EQ(TokenizeString(sCommas, ",", true, true).size(), 0u);
    EXPECT_EQ(TokenizeString('"' + sCommas, ",", true, true), (Tokens{'"' + sCommas}));
}

}  // namespace
