#include "vetra/textcore/formatstring.h"

#include <gtest/gtest.h>

#include <clocale>
#include <limits>
#include <string>

namespace {

TEST(FormatString, Conversions) {
    EXPECT_EQ(FormatString("< %d", -12), "< -12");
    EXPECT_EQ(FormatString("dfClampMin = %lf dfClampMax = %lf", 5.0, -0.5),
              "dfClampMin = 5.000000 dfClampMax = -0.500000");
    EXPECT_EQ(FormatString("%24.16e", 0.1), "  1.0000000000000001e-01");
    EXPECT_EQ(FormatString("%22.14f|", -1.5), "     -1.50000000000000|");
    EXPECT_EQ(FormatString("'%s' %f%%", "NUMCOLS", 1.0), "'NUMCOLS' 1.000000%");
    EXPECT_EQ(FormatString("%s", ""), "");
}

TEST(FormatString, AnyLength) {
    for (const std::size_t nLength : {255u, 256u, 1023u, 1024u, 4096u, 1000000u}) {
        const std::string sLong(nLength, 'x');
        EXPECT_EQ(FormatString("%s|%d", sLong.c_str(), 7), sLong + "|7");
    }
    EXPECT_EQ(FormatString("%f", std::numeric_limits<double>::max()).size(), 309u + 7u);
}

TEST(FormatString, DecimalPointInEveryLocale) {
    const std::string sOld = std::setlocale(LC_ALL, nullptr);
    if (std::setlocale(LC_ALL, "de_DE.UTF-8") == nullptr &&
        std::setlocale(LC_ALL, "fr_FR.UTF-8") == nullptr) {
        GTEST_SKIP() << "no locale with a decimal comma is installed";
    }
    EXPECT_EQ(FormatString("%f %24.16e", 0.5, 0.25), "0.500000   2.5000000000000000e-01");
    EXPECT_STREQ(std::localeconv()->decimal_point, ",");  // the caller's locale is back
    std::setlocale(LC_ALL, sOld.c_str());
}

}  // namespace
