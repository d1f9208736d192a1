#include "vetra/base/utils/string/stringutils.h"

#include <gtest/gtest.h>

#include <limits>
#include <utility>

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

}  // namespace
