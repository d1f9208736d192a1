#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <iterator>
#include <limits>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "tests/support/refusal.h"
#include "vetra/base/utils/string/dectodeg.h"
#include "vetra/base/utils/string/dmsutils.h"

namespace vetra {
namespace {

using tests::ExpectRefusal;

constexpr double kInf = std::numeric_limits<double>::infinity();
constexpr double kNan = std::numeric_limits<double>::quiet_NaN();

// "degrees minutes seconds fraction hemisphere"
std::string Fields(double dfValue, std::string sFormat, int nDecimals) {
    int anFields[4] = {-1, -1, -1, -1};
    char chHemisphere = '?';
    DecimalToDegrees(dfValue, sFormat.data(), &anFields[0], &anFields[1], &anFields[2],
                     &anFields[3], nDecimals, &chHemisphere);
    std::string sResult;
    for (const int n : anFields) {
        sResult += std::to_string(n) + ' ';
    }
    return sResult + chHemisphere;
}

TEST(DecimalToDegrees, Fields) {
    const struct {
        double dfValue;
        const char* pszFormat;
        int nDecimals;
        const char* pszFields;
    } aoCases[] = {
        {12.5, "Lat", 0, "12 30 0 0 N"},
        {-12.5, "LONGITUDE", 0, "12 30 0 0 W"},
        {100.0, "latitude", 0, "80 0 0 0 N"},
        {200.0, "Lat", 0, "20 0 0 0 S"},
        {300.0, "Lat", -1, "60 0 0 0 S"},
        {-100.0, "Lat", 0, "80 0 0 0 S"},
        {-300.0, "Lat", 0, "120 0 0 0 N"},
        {190.0, "Long", 0, "170 0 0 0 W"},
        {370.0, "Long", 0, "10 0 0 0 E"},
        {-190.0, "long", 0, "170 0 0 0 E"},
        {-720.5, "Long", 0, "0 30 0 0 W"},
        {180.0, "Long", 0, "180 0 0 0 E"},
        {-180.0, "Long", 0, "180 0 0 0 W"},
        {10.99999999, "Lat", 2, "11 0 0 0 N"},
        {59.9 / 3600.0, "Lat", 0, "0 0 59 0 N"},
        {59.9994 / 3600.0, "Lat", 0, "0 0 59 0 N"},
        {59.9996 / 3600.0, "Lat", 0, "0 1 0 0 N"},
        {1.5 / 3600.0, "Lat", 9, "0 0 1 500000000 N"},
        {-0.0, "Long", 0, "0 0 0 0 E"},
        {0x1p53, "Long", 0, "32 0 0 0 E"},
    };
    for (const auto& [dfValue, pszFormat, nDecimals, pszFields] : aoCases) {
        EXPECT_EQ(Fields(dfValue, pszFormat, nDecimals), pszFields) << dfValue;
    }
    char szFormat[] = "Lat";
    DecimalToDegrees(1.0, szFormat, nullptr, nullptr, nullptr, nullptr, 0, nullptr);
}

TEST(DecimalToDegrees, Refusals) {
    const std::string sInvalid = "Invalid format specified for decimal degrees conversion";
    for (const char* pszFormat : {"", "La", "Lon", "xLat", "degrees"}) {
        ExpectRefusal({"szFormat", 1, "", sInvalid, ""}, [&] { Fields(1.0, pszFormat, 0); });
    }
    ExpectRefusal({"szFormat", 1, "", sInvalid, ""}, [] {
        DecimalToDegrees(1.0, nullptr, nullptr, nullptr, nullptr, nullptr, 0, nullptr);
    });
    EXPECT_THROW(Fields(1.0, "Lat", 10), ParameterException);
    for (const double dfValue : {kInf, -kInf, kNan, 1e300, -0x1.0000000000001p53}) {
        EXPECT_THROW(Fields(dfValue, "Long", 0), ParameterException) << dfValue;
    }
}

// The text, in a room of exactly 19 bytes.
std::string Text(double dfValue, int nForm) {
    std::vector<char> vchRoom(19, '#');
    DecToDMS(dfValue, nForm, vchRoom.data());
    return vchRoom.data();
}

TEST(DecToDMS, Forms) {
    const struct {
        double dfValue;
        int nForm;
        const char* pszText;
    } aoCases[] = {
        {5.5, 1, "  5d30'00\" N    "},       {-5.5, 4, "  5d30'00\" W    "},
        {-5.5, 2, "  5d30'00.00\" S "},      {100.51, 5, "100d30'36.00\" E "},
        {5.5, 3, "  5d30'00.0000\"N"},       {-179.999999, 6, "179d59'59.9964\"W"},
        {5.085, 7, "  5 5'06.0\"N"},         {-120.5, 8, "12030'00.0\"W"},
        {-5.5, 9, "  -5:30:00.0000"},        {0.5, 9, "   0:30:00.0000"},
        {-0.5, 9, "   0:30:00.0000"},        {-180.0, 9, "-180:00:00.0000"},
        {5.5, 10, "  5d30'00.000000\"N"},    {-100.0, 11, "100d00'00.000000\"W"},
        {100.0, 1, " 80d00'00\" N    "},     {190.0, 4, "170d00'00\" W    "},
        {0x1p53, 11, " 32d00'00.000000\"E"},
    };
    for (const auto& [dfValue, nForm, pszText] : aoCases) {
        EXPECT_EQ(Text(dfValue, nForm), pszText) << nForm;
    }
}

TEST(DecToDMS, RefusalsLeaveTheRoom) {
    char achRoom[19];
    std::memset(achRoom, '#', sizeof achRoom);
    for (const int nForm : {0, 12, -1, std::numeric_limits<int>::min()}) {
        ExpectRefusal({"from", 1, "", "from has to be integer between 1 and 9", ""},
                      [&] { DecToDMS(1.0, nForm, achRoom); });
    }
    for (const double dfValue : {kInf, -kInf, kNan, 1e300, 0x1.0000000000001p53}) {
        for (int nForm = 1; nForm <= 11; ++nForm) {
            try {
                DecToDMS(dfValue, nForm, achRoom);
                ADD_FAILURE() << dfValue;
            } catch (const ParameterException& oCaught) {
                EXPECT_EQ(oCaught.GetArgument(), "value");
            }
        }
    }
    EXPECT_THROW(DecToDMS(1.0, 1, nullptr), ParameterException);
    EXPECT_EQ(std::count(std::begin(achRoom), std::end(achRoom), '#'), 19);
}

TEST(DMSToDec, Texts) {
    const struct {
        const char* pszText;
        int nKind;
        double dfAngle;
    } aoCases[] = {
        {"12 30 0 N", 1, 12.5},
        {"12d30'00\" S", 1, -12.5},
        {"100 30 W", 2, -100.5},
        {"100.5", 2, 100.5},
        {"45", 3, 45.0},
        {"N 12 30", 1, 12.5},
        {"n12D30'", 1, 12.5},
        {"12:30:15", 3, 12.0 + 30.0 / 60.0 + 15.0 / 3600.0},
        {"12 60 60", 3, 13.0 + 1.0 / 60.0},
        {"30' 12d", 3, 12.5},
        {"30\"", 3, 30.0 / 3600.0},
        {"-0 30", 3, -0.5},
        {"-0d30'", 3, -0.5},
        {"-.0 0 36", 3, -0.01},
        {"+0 30", 3, 0.5},
        {"-12 30", 3, -12.5},
        {"12 30\n#", 3, 12.5},
        {"12 30.5", 3, 12.0 + 30.5 / 60.0},
        {"5.,30", 3, 5.5},
        {"180 W", 2, -180.0},
        {"12                              #", 3, 12.0},
        {"1.0000000000000000000000000000009", 3, 1.0},
        // Failures after which the magnitude stays.
        {"91 N", 0, 91.0},
        {"181 E", 0, 181.0},
        {"180 0 1", 0, 180.0 + 1.0 / 3600.0},
        {"99999999999999999999999999999999", 0, 1e32},
        // Others.
        {"", 0, 0.0},
        {"N", 0, 0.0},
        {".", 0, 0.0},
        {"12.5 30", 0, 0.0},
        {"12 30.5 10", 0, 0.0},
        {"12 61", 0, 0.0},
        {"12 -1", 0, 0.0},
        {"-12 30 S", 0, 0.0},
        {"-0 30 S", 0, 0.0},
        {"12 30 15 20", 0, 0.0},
        {"12 N E", 0, 0.0},
        {"1.2.3", 0, 0.0},
        {"1-2", 0, 0.0},
        {"12#", 0, 0.0},
        {"12\xb0", 0, 0.0},
        {"1e5x", 0, 0.0},
        {"d12", 0, 0.0},
        {"12dd", 0, 0.0},
        {"1d2d", 0, 0.0},
        {"12 \r", 0, 0.0},
        // 16 tokens and 17.
        {"1ddddddddddddddd", 0, 0.0},
        {"1 2 3 4 5 6 7 8 9 0 1 2 3 4 5 6 7", 0, 0.0},
        {"1ddddddddddddddddddddddddddddddd", 0, 0.0},
    };
    for (const auto& [pszText, nKind, dfAngle] : aoCases) {
        double dfResult = kNan;
        EXPECT_EQ(DMSToDec(pszText, &dfResult), nKind) << pszText;
        EXPECT_NEAR(dfResult, dfAngle, 1e-15 * std::max(10.0, std::abs(dfAngle))) << pszText;
    }
    double dfResult = kNan;
    EXPECT_EQ(DMSToDec(nullptr, &dfResult), 0);
    EXPECT_TRUE(std::isnan(dfResult));
    EXPECT_EQ(DMSToDec("1", nullptr), 0);
}

// What is written is read back, as far as the form has digits.
TEST(DMSToDec, ReadsWhatDecToDMSWrites) {
    std::mt19937_64 oRandom(3);
    std::uniform_real_distribution<double> oAngle(-90.0, 90.0);
    for (int n = 0; n < 20000; ++n) {
        const double dfAngle = oAngle(oRandom);
        for (const int nForm : {1, 2, 3, 4, 5, 6, 10, 11}) {
            const std::string sText = Text(dfAngle, nForm);
            double dfResult = 0.0;
            EXPECT_EQ(DMSToDec(sText.c_str(), &dfResult), nForm <= 3 || nForm == 10 ? 1 : 2);
            const double dfStep = nForm == 1 || nForm == 4 ? 1.0 : nForm % 3 == 2 ? 0.006 : 6e-5;
            EXPECT_NEAR(dfResult, dfAngle, (nForm == 11 ? 6e-7 : dfStep) / 3600.0) << sText;
        }
    }
}

// In rooms of their own size, where a step beyond the text shows.
TEST(DMSToDec, HostileTexts) {
    const std::string sAlphabet = "0123456789.+-dD'\"NSEW \t,:\n#e\xff";
    std::mt19937 oRandom(4);
    for (int n = 0; n < 200000; ++n) {
        std::vector<char> vchText(oRandom() % 48);
        for (char& c : vchText) {
            c = sAlphabet[oRandom() % (n % 2 == 0 ? sAlphabet.size() : 20)];
        }
        vchText.push_back('\0');
        double dfAngle = kNan;
        const int nKind = DMSToDec(vchText.data(), &dfAngle);
        ASSERT_TRUE(nKind >= 0 && nKind <= 3) << vchText.data();
        ASSERT_TRUE(nKind == 0 ? dfAngle >= 0.0 : std::abs(dfAngle) <= (nKind == 2 ? 180.0 : 90.0))
            << vchText.data();
    }
}

TEST(FormatDouble, Bounds) {
    const std::pair<double, const char*> aoCases[] = {
        {0.0, "0.0"},     {5.0, "5.0"},     {-5.0, "-5.0"}, {1e-16, "0.0"},
        {1e7, "1e+07"},   {1e-5, "1e-05"},  {1e6, "1e+06"}, {1e-3, "1e-03"},
        {-1e7, "-1e+07"}, {1e-15, "1e-15"}, {kInf, "inf"},  {-2e-3, "-0.0"},
    };
    for (const auto& [dfValue, pszText] : aoCases) {
        EXPECT_EQ(FormatDouble(dfValue, 1e6, 1e-3, "%.1f", "%.0e"), pszText);
    }
}

}  // namespace
}  // namespace vetra
