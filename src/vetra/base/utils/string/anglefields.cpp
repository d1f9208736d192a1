#include "vetra/base/utils/string/anglefields.h"

#include <cmath>

#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra {
namespace {

constexpr double kTurn = 360.0;
constexpr double kLargest = 9007199254740992.0;

double Normalise(double dfValue, AngleKind eKind) {
    double dfAngle = dfValue - kTurn * std::trunc(dfValue / kTurn);
    if (eKind == AngleKind::eLatitude) {
        if (dfAngle > 90.0) {
            dfAngle = 180.0 - dfAngle;
        }
        if (dfAngle < -90.0) {
            dfAngle = -(dfAngle + 180.0);
        }
    } else {
        if (dfAngle > 180.0) {
            dfAngle -= kTurn;
        }
        if (dfAngle < -180.0) {
            dfAngle += kTurn;
        }
    }
    return dfAngle;
}

char Hemisphere(AngleKind eKind, bool bNegative) {
    return eKind == AngleKind::eLatitude ? (bNegative ? 'S' : 'N') : (bNegative ? 'W' : 'E');
}

}  // namespace

AngleFields SplitAngle(double dfValue, AngleKind eKind, int nScale) {
    // Not a NaN either.
    if (!(std::abs(dfValue) <= kLargest)) {
        throw ParameterException("value", ParameterException::eOutOfRange,
                                 FormatString("%f", dfValue), FormatString("<= %.0f", kLargest),
                                 "The angle is too large or not finite", VETRA_HERE);
    }
    const double dfSigned = Normalise(dfValue, eKind);
    const bool bNegative = dfSigned < 0.0;
    const double dfAngle = std::abs(dfSigned);

    const int nDegrees = static_cast<int>(dfAngle);
    const double dfMinutes = (dfAngle - nDegrees) * 60.0;
    const int nMinutes = static_cast<int>(dfMinutes);
    const double dfSeconds = (dfMinutes - nMinutes) * 60.0;
    AngleFields oFields{nDegrees, nMinutes, 0, 0, bNegative, Hemisphere(eKind, bNegative)};
    if (nScale == 1) {
        oFields.nSeconds = static_cast<int>(dfSeconds + 0.0005);
    } else {
        oFields.nSeconds = static_cast<int>(dfSeconds);
        oFields.nFraction = static_cast<int>((dfSeconds - oFields.nSeconds) * nScale + 0.5);
        if (oFields.nFraction >= nScale) {
            oFields.nFraction -= nScale;
            ++oFields.nSeconds;
        }
    }
    if (oFields.nSeconds >= 60) {
        oFields.nSeconds -= 60;
        ++oFields.nMinutes;
    }
    if (oFields.nMinutes >= 60) {
        oFields.nMinutes -= 60;
        ++oFields.nDegrees;
    }
    return oFields;
}

}  // namespace vetra
