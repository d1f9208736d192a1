#include "vetra/base/utils/string/stringtokenizer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <random>
#include <string>
#include <type_traits>
#include <vector>

namespace {

// The rules on a text that shrinks.
struct PlainTokenizer {
    std::string sDelimiter;
    std::string sLeft;
    bool bDelimitersOnly;

    PlainTokenizer(const std::string& sText, const std::string& sDelim)
        : sDelimiter(sDelim), sLeft(sText) {
        std::string sRepeated;
        while (sRepeated.size() < sText.size()) {
            sRepeated += sDelim;
        }
        bDelimitersOnly = !sText.empty() && sRepeated == sText;
    }

    bool HasMore() const { return !sLeft.empty() && !bDelimitersOnly; }

    std::string Next() {
        if (bDelimitersOnly) {
            sLeft.clear();
        }
        if (!HasMore()) {
            return "";
        }
        const std::size_t nFound = sLeft.find(sDelimiter);
        if (nFound == 0) {
            sLeft.erase(0, sDelimiter.size());
            return Next();
        }
        const std::string sToken = sLeft.substr(0, nFound);
        sLeft.erase(0, nFound == std::string::npos ? nFound : nFound + sDelimiter.size());
        return sToken;
    }

    int Count() const {
        int nTokens = 0;
        std::size_t nStart = 0;
        while (HasMore()) {
            const std::size_t nFound = sLeft.find(sDelimiter, nStart);
            nTokens += nStart < std::min(nFound, sLeft.size());
            if (nFound == std::string::npos) {
                break;
            }
            nStart = nFound + sDelimiter.size();
        }
        return nTokens;
    }
};

TEST(StringTokenizer, EqualsTheShrinkingText) {
    std::mt19937 oRandom(3);
    const auto fnText = [&oRandom](std::size_t nMin, std::size_t nMax) {
        std::string s(nMin + oRandom() % (nMax - nMin + 1), 'a');
        for (char& c : s) {
            c = "ab"[oRandom() % 2];
        }
        return s;
    };
    for (int nCase = 0; nCase < 20'000; ++nCase) {
        const std::string sText = fnText(0, 12);
        const std::string sDelimiter = fnText(1, 3);
        SCOPED_TRACE(sText + " at " + sDelimiter);
        StringTokenizer oTokenizer(sText, sDelimiter);
        PlainTokenizer oPlain(sText, sDelimiter);
        for (int nCall = 0; nCall < 14; ++nCall) {
            ASSERT_EQ(oTokenizer.HasMoreTokens(), oPlain.HasMore());
            ASSERT_EQ(oTokenizer.CountTokens(), oPlain.Count());
            ASSERT_EQ(oTokenizer.NextToken(), oPlain.Next());
        }
    }
}

TEST(StringTokenizer, DelimitersBehindTheLastToken) {
    StringTokenizer oTokenizer("a,,", ",");
    EXPECT_EQ(oTokenizer.NextToken(), "a");
    EXPECT_TRUE(oTokenizer.HasMoreTokens());
    EXPECT_EQ(oTokenizer.CountTokens(), 0);
    EXPECT_EQ(oTokenizer.NextToken(), "");
    EXPECT_FALSE(oTokenizer.HasMoreTokens());

    StringTokenizer oOnly(",,,", ",");
    EXPECT_FALSE(oOnly.HasMoreTokens());
    EXPECT_EQ(oOnly.CountTokens(), 0);
    EXPECT_EQ(oOnly.NextToken(), "");
}

TEST(StringTokenizer, BlanksAndAssignment) {
    StringTokenizer oBlanks(" a\tb  c ");
    EXPECT_EQ(oBlanks.NextToken(), "a\tb");
    StringTokenizer oCopy("x", "y");
    oCopy = oBlanks;
    EXPECT_EQ(oBlanks.NextToken(), "c");
    EXPECT_EQ(oCopy.CountTokens(), 1);
    EXPECT_EQ(oCopy.NextToken(), "c");

    struct Derived : StringTokenizer {
        Derived() = default;
        explicit Derived(const StringTokenizer& oOther) : StringTokenizer(oOther) {}
    };
    EXPECT_FALSE(Derived().HasMoreTokens());
    EXPECT_FALSE(Derived(StringTokenizer("a b")).HasMoreTokens());
    static_assert(!std::is_copy_constructible_v<StringTokenizer>);
}

TEST(StringTokenizer, EmptyDelimiterDoesNotCut) {
    StringTokenizer oTokenizer("a b", "");
    EXPECT_TRUE(oTokenizer.HasMoreTokens());
    EXPECT_EQ(oTokenizer.CountTokens(), 1);
    EXPECT_EQ(oTokenizer.NextToken(), "a b");
    EXPECT_FALSE(oTokenizer.HasMoreTokens());
    EXPECT_EQ(oTokenizer.CountTokens(), 0);
    EXPECT_FALSE(StringTokenizer("", "").HasMoreTokens());
}

TEST(StringTokenizer, LongTexts) {
    constexpr int kTokens = 5'000'000;
    std::string sText;
    for (int n = 0; n < kTokens; ++n) {
        sText += "x,";
    }
    StringTokenizer oTokenizer(sText, ",");
    EXPECT_EQ(oTokenizer.CountTokens(), kTokens);
    int nTokens = 0;
    while (oTokenizer.NextToken() == "x") {
        ++nTokens;
    }
    EXPECT_EQ(nTokens, kTokens);

    StringTokenizer oLead(std::string(10'000'000, ',') + "x", ",");
    EXPECT_EQ(oLead.NextToken(), "x");
    // A delimiter that nearly matches everywhere.
    const std::string sSame(10'000'000, 'a');
    EXPECT_EQ(StringTokenizer(sSame, std::string(5000, 'a') + 'b').CountTokens(), 1);
}

}  // namespace
