#include "vetra/base/utils/string/stringutils.h"

#include <locale.h>
#include <stdlib.h>

#include <algorithm>
#include <string_view>

namespace {

// The C library's classes follow the process's locale; these are fixed.
constexpr std::string_view kWhitespace = " \t\n\v\f\r";

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

bool AllDigits(std::string_view s) { return std::all_of(s.begin(), s.end(), IsDigit); }

std::string_view Trim(std::string_view s) {
    const std::size_t nFirst = s.find_first_not_of(kWhitespace);
    if (nFirst == std::string_view::npos) {
        return {};
    }
    return s.substr(nFirst, s.find_last_not_of(kWhitespace) - nFirst + 1);
}

}  // namespace

std::string TrimWhitespace(const std::string& s) { return std::string(Trim(s)); }

bool IsNumeric(const std::string& s) {
    std::string_view sMantissa = Trim(s);
    if (sMantissa.empty()) {
        return false;
    }
    if (sMantissa.front() == '+' || sMantissa.front() == '-') {
        sMantissa.remove_prefix(1);
    }

    // The first marker of this list that occurs splits the text, wherever it stands.
    for (const std::string_view sMarker :
         {"E-", "E+", "e-", "e+", "D-", "D+", "d-", "d+", "E", "e", "D", "d"}) {
        const std::size_t nMarker = sMantissa.find(sMarker);
        if (nMarker != std::string_view::npos) {
            const std::string_view sExponent = sMantissa.substr(nMarker + sMarker.size());
            if (sExponent.empty() || !AllDigits(sExponent)) {
                return false;
            }
            sMantissa = sMantissa.substr(0, nMarker);
            break;
        }
    }

    const std::size_t nPoint = sMantissa.find('.');
    if (nPoint == std::string_view::npos) {
        return AllDigits(sMantissa);
    }
    return AllDigits(sMantissa.substr(0, nPoint)) && AllDigits(sMantissa.substr(nPoint + 1));
}

double TextToDouble(const std::string& s) {
    static const locale_t kCLocale = newlocale(LC_ALL_MASK, "C", nullptr);
    std::string sText = s;
    const std::size_t nMarker = sText.find_first_of("Dd");
    if (nMarker != std::string::npos && nMarker > 0 &&
        (IsDigit(sText[nMarker - 1]) || sText[nMarker - 1] == '.')) {
        sText[nMarker] = 'E';
    }
    return strtod_l(sText.c_str(), nullptr, kCLocale);
}
