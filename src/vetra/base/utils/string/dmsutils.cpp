#include "vetra/base/utils/string/dmsutils.h"

#include <cmath>
#include <cstddef>
#include <cstring>
#include <iterator>
#include <string>

#include "vetra/base/utils/string/anglefields.h"
#include "vetra/base/utils/string/stringutils.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace {

constexpr auto kLatitude = vetra::AngleKind::eLatitude;
constexpr auto kLongitude = vetra::AngleKind::eLongitude;

constexpr struct {
    vetra::AngleKind eKind;
    int nScale;
    const char*
        pszFormat;  // takes degrees, minutes, seconds, fraction unless the scale is 1, letter
} kForms[] = {
    {kLatitude, 1, "%3dd%2d'%2d\" %c    "},       {kLatitude, 100, "%3dd%2d'%2d.%2d\" %c "},
    {kLatitude, 10000, "%3dd%2d'%2d.%4d\"%c"},    {kLongitude, 1, "%3dd%2d'%2d\" %c    "},
    {kLongitude, 100, "%3dd%2d'%2d.%2d\" %c "},   {kLongitude, 10000, "%3dd%2d'%2d.%4d\"%c"},
    {kLatitude, 10, "%3d%2d'%2d.%d\"%c"},         {kLongitude, 10, "%3d%2d'%2d.%d\"%c"},
    {kLongitude, 10000, "%4d:%2d:%2d.%4d"},       {kLatitude, 1000000, "%3dd%2d'%2d.%6d\"%c"},
    {kLongitude, 1000000, "%3dd%2d'%2d.%6d\"%c"},
};
constexpr int kSignedForm = 9;

struct Token {
    enum class Kind { eNumber, eMark, eLetter };

    Kind eKind;
    double dfNumber = 0.0;
    char ch = '\0';  // of a mark or letter
};

struct TokenTable {
    static constexpr std::size_t kRoom = 16;

    Token aoTokens[kRoom];
    std::size_t nTokens = 0;

    bool Add(const Token& oToken) {
        if (nTokens == kRoom) {
            return false;
        }
        aoTokens[nTokens++] = oToken;
        return true;
    }
};

constexpr char kMarks[] = {'D', '\'', '"'};  // of the fields, in their order
constexpr std::size_t kFields = 3;

bool IsOneOf(char c, const char* pszSet) { return c != '\0' && std::strchr(pszSet, c) != nullptr; }
bool IsDigit(char c) { return IsOneOf(c, "0123456789"); }
bool IsSign(char c) { return IsOneOf(c, "+-"); }

// Cuts a text in upper case into tokens. False when something else stands in it, no digit does, or
// the table is full.
bool Scan(const std::string& sText, TokenTable& oTable) {
    bool bDigits = false;
    std::size_t n = 0;
    while (n < sText.size()) {
        const char c = sText[n];
        if (IsDigit(c) || c == '.' || IsSign(c)) {
            const std::size_t nStart = IsSign(c) ? n + 1 : n;
            bool bPoint = false;
            for (n = nStart; n < sText.size() && (IsDigit(sText[n]) || sText[n] == '.'); ++n) {
                if (sText[n] == '.' && bPoint) {
                    return false;
                }
                bPoint = bPoint || sText[n] == '.';
                bDigits = bDigits || sText[n] != '.';
            }
            if (n < sText.size() && IsSign(sText[n])) {
                return false;
            }
            const double dfMagnitude = TextToDouble(sText.substr(nStart, n - nStart));
            if (!oTable.Add({Token::Kind::eNumber, c == '-' ? -dfMagnitude : dfMagnitude})) {
                return false;
            }
            continue;
        }
        ++n;
        if (IsOneOf(c, "\t ,:")) {
            continue;
        }
        const bool bLetter = IsOneOf(c, "NSEW");
        if (!(bLetter || IsOneOf(c, "D'\"")) ||
            !oTable.Add({bLetter ? Token::Kind::eLetter : Token::Kind::eMark, 0.0, c})) {
            return false;
        }
    }
    return bDigits;
}

// Gives the numbers to the fields. False when one has no field, a field is marked twice, or a mark
// or letter is left over.
bool Assign(const TokenTable& oTable, double (&adfFields)[kFields], char& chLetter) {
    bool abFilled[kFields] = {};
    std::size_t nField = 0;
    for (std::size_t n = 0; n < oTable.nTokens; ++n) {
        const Token& oToken = oTable.aoTokens[n];
        if (oToken.eKind == Token::Kind::eLetter && chLetter == '\0') {
            chLetter = oToken.ch;
            continue;
        }
        if (oToken.eKind != Token::Kind::eNumber) {
            return false;
        }
        if (n + 1 < oTable.nTokens && oTable.aoTokens[n + 1].eKind == Token::Kind::eMark) {
            ++n;
            for (nField = 0; kMarks[nField] != oTable.aoTokens[n].ch;) {
                ++nField;
            }
            if (abFilled[nField]) {
                return false;
            }
        }
        if (nField == kFields) {
            return false;
        }
        abFilled[nField] = true;
        adfFields[nField++] = oToken.dfNumber;
    }
    return true;
}

bool HasFraction(double df) { return std::trunc(df) != df; }
bool IsSexagesimal(double df) { return df >= 0.0 && df <= 60.0; }

}  // namespace

void DecToDMS(double value, int from, char* dst) {
    if (from < 1 || from > static_cast<int>(std::size(kForms))) {
        throw vetra::ParameterException("from", vetra::ParameterException::eInvalid, "",
                                        "from has to be integer between 1 and 9", "", VETRA_HERE);
    }
    if (dst == nullptr) {
        throw vetra::ParameterException("dst", vetra::ParameterException::eInvalid, "NULL",
                                        "non-NULL", "The dst parameter may not be NULL",
                                        VETRA_HERE);
    }
    const auto& oForm = kForms[from - 1];
    const vetra::AngleFields o = vetra::SplitAngle(value, oForm.eKind, oForm.nScale);
    const int nDegrees = from == kSignedForm && o.bNegative ? -o.nDegrees : o.nDegrees;
    std::string sText = oForm.nScale == 1 ? FormatString(oForm.pszFormat, nDegrees, o.nMinutes,
                                                         o.nSeconds, o.chHemisphere)
                                          : FormatString(oForm.pszFormat, nDegrees, o.nMinutes,
                                                         o.nSeconds, o.nFraction, o.chHemisphere);
    for (std::size_t n = 4; n <= 14 && n < sText.size() && sText[n] != '"'; ++n) {
        if (sText[n] == ' ') {
            sText[n] = '0';
        }
    }
    std::memcpy(dst, sText.c_str(), sText.size() + 1);
}

int DMSToDec(const char* text, double* result) {
    constexpr std::size_t kMostCharacters = 32;
    if (text == nullptr || result == nullptr) {
        return 0;
    }
    *result = 0.0;
    std::size_t nLength = 0;
    while (nLength < kMostCharacters && text[nLength] != '\0' && text[nLength] != '\n') {
        ++nLength;
    }

    TokenTable oTable;
    double adfFields[kFields] = {};
    char chLetter = '\0';
    if (!Scan(ToUpper(std::string(text, nLength)), oTable) ||
        !Assign(oTable, adfFields, chLetter)) {
        return 0;
    }
    const auto [dfDegrees, dfMinutes, dfSeconds] = adfFields;
    const bool bSouthOrWest = IsOneOf(chLetter, "SW");
    const bool bNegative = std::signbit(dfDegrees);
    if (!IsSexagesimal(dfMinutes) || !IsSexagesimal(dfSeconds) ||
        (HasFraction(dfDegrees) && (dfMinutes != 0.0 || dfSeconds != 0.0)) ||
        (HasFraction(dfMinutes) && dfSeconds != 0.0) || (bSouthOrWest && bNegative)) {
        return 0;
    }

    constexpr int kInvalid = 0, kIsLatitude = 1, kIsLongitude = 2, kIsEither = 3;
    const double dfMagnitude = std::abs(dfDegrees) + dfMinutes / 60.0 + dfSeconds / 3600.0;
    *result = dfMagnitude;
    const bool bLatitude = IsOneOf(chLetter, "NS");
    if (dfMagnitude > (bLatitude ? 90.0 : 180.0)) {
        return kInvalid;
    }
    if (bSouthOrWest || bNegative) {
        *result = -dfMagnitude;
    }
    if (chLetter == '\0') {
        return dfMagnitude <= 90.0 ? kIsEither : kIsLongitude;
    }
    return bLatitude ? kIsLatitude : kIsLongitude;
}
