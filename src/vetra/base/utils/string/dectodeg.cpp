#include "vetra/base/utils/string/dectodeg.h"

#include <cmath>

#include "vetra/base/utils/string/anglefields.h"
#include "vetra/base/utils/string/stringutils.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace {

vetra::AngleKind KindOf(const char* pszFormat) {
    const std::string sFormat = pszFormat == nullptr ? "" : ToLower(pszFormat);
    if (sFormat.rfind("lat", 0) == 0) {
        return vetra::AngleKind::eLatitude;
    }
    if (sFormat.rfind("long", 0) == 0) {
        return vetra::AngleKind::eLongitude;
    }
    throw vetra::ParameterException("szFormat", vetra::ParameterException::eInvalid, "",
                                    "Invalid format specified for decimal degrees conversion", "",
                                    VETRA_HERE);
}

// 10^nDecimals.
int Scale(int nDecimals) {
    constexpr int kMost = 9;
    if (nDecimals > kMost) {
        throw vetra::ParameterException("decimals", vetra::ParameterException::eOutOfRange,
                                        FormatString("%d", nDecimals), FormatString("<= %d", kMost),
                                        "The fraction has too many digits", VETRA_HERE);
    }
    int nScale = 1;
    for (int n = 0; n < nDecimals; ++n) {
        nScale *= 10;
    }
    return nScale;
}

template <typename T>
void Put(T* pTarget, T value) {
    if (pTarget != nullptr) {
        *pTarget = value;
    }
}

}  // namespace

void DecimalToDegrees(double value, char* szFormat, int* degrees, int* minutes, int* seconds,
                      int* fraction, int decimals, char* hemisphere) {
    const vetra::AngleFields oFields = vetra::SplitAngle(value, KindOf(szFormat), Scale(decimals));
    Put(degrees, oFields.nDegrees);
    Put(minutes, oFields.nMinutes);
    Put(seconds, oFields.nSeconds);
    Put(fraction, oFields.nFraction);
    Put(hemisphere, oFields.chHemisphere);
}

std::string FormatDouble(const double& value, const double& upper, const double& lower,
                         const char* format, const char* otherFormat) {
    const double dfMagnitude = std::abs(value);
    const bool bOrdinary = (dfMagnitude > lower && dfMagnitude < upper) || dfMagnitude < 1e-15;
    return FormatString(bOrdinary ? format : otherFormat, value);
}
