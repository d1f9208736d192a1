#include "vetra/base/utils/resample/shapingwindow.h"

#include <cmath>
#include <cstddef>
#include <iterator>

#include "vetra/base/utils/string/stringutils.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace {

using vetra::ParameterException;
using vetra::utils::ShapingWindowType;

constexpr double kPi = 3.141592653589793;
constexpr double kMaxBeta = 25.0;
constexpr double kDefaultBeta = 9.42;
constexpr double kDefaultSigma = 1.0;

// By type.
constexpr const char* kNames[] = {"NONE",    "PARABOLA", "KAISER",  "HANN",
                                  "HAMMING", "LANCZOS",  "GAUSSIAN"};

ShapingWindowType NameToType(const std::string& sName) {
    for (std::size_t i = 0; i < std::size(kNames); ++i) {
        if (sName == kNames[i]) {
            return static_cast<ShapingWindowType>(i);
        }
    }
    throw ParameterException(
        "sVal", ParameterException::eInvalid, sName, "",
        FormatString("Shaping window type '%s' was not recognized", sName.c_str()), VETRA_HERE);
}

// The modified Bessel function of the first kind and order 0, as the power series
// sum((x / 2)^(2k) / k!^2) up to the first term of at most 1e-15. For |x| <= 25 that takes less
// than 60 terms.
double BesselI0(double dfX) {
    if (dfX == 0.0) {
        return 1.0;
    }
    const double dfHalf = dfX * 0.5;
    double dfSum = 0.0;
    double dfFactorial = 1.0;
    double dfTerm = 0.0;
    int k = 0;
    do {
        dfTerm = std::pow(dfHalf, 2.0 * k) / (dfFactorial * dfFactorial);
        ++k;
        dfFactorial *= k;
        dfSum += dfTerm;
    } while (k < 100 && std::abs(dfTerm) > 1e-15);
    return dfSum;
}

}  // namespace

namespace vetra::utils {

void ShapingWindow::SetNone() { meType = eSWT_NONE; }
void ShapingWindow::SetParabola() { meType = eSWT_PARABOLA; }

void ShapingWindow::SetKaiser(double dfBeta) {
    // A NaN is too large as well: it would make every weight a NaN.
    if (!(std::abs(dfBeta) <= kMaxBeta)) {
        throw ParameterException(
            "BETA", ParameterException::eInvalid, "", "",
            FormatString("BETA value '%f' for Kaiser shaping window is too large (must be < 25)",
                         dfBeta),
            VETRA_HERE);
    }
    meType = eSWT_KAISER;
    mdfBeta = dfBeta;
}

void ShapingWindow::SetHann() { meType = eSWT_HANN; }
void ShapingWindow::SetHamming() { meType = eSWT_HAMMING; }
void ShapingWindow::SetLanczos() { meType = eSWT_LANCZOS; }

void ShapingWindow::SetGaussian(double dfSigma) {
    meType = eSWT_GAUSSIAN;
    mdfSigma = dfSigma;
}

ShapingWindowType ShapingWindow::GetType() const { return meType; }
double ShapingWindow::GetBeta() const { return mdfBeta; }
double ShapingWindow::GetSigma() const { return mdfSigma; }

double ShapingWindow::GetValue(double dfPos, double dfHalfWidth) const {
    const double H = dfHalfWidth;
    double u = dfPos;
    if (meType == eSWT_NONE) {
        return 1.0;
    }
    if (meType == eSWT_HAMMING) {
        u = u > H ? H : (u < -H ? -H : u);
    } else if (u >= H || u <= -H) {
        return 0.0;
    }
    if (u == 0.0) {
        return 1.0;
    }
    switch (meType) {
        case eSWT_NONE:
            break;
        case eSWT_PARABOLA:
            return 1.0 - u * u / (H * H);
        case eSWT_KAISER: {
            const double r = u / H;
            return BesselI0(std::sqrt(1.0 - r * r) * mdfBeta) / BesselI0(mdfBeta);
        }
        case eSWT_HANN:
            return (std::cos(u / H * kPi) + 1.0) * 0.5;
        case eSWT_HAMMING:
            return std::cos(u / H * kPi) * 0.46 + 0.54;
        case eSWT_LANCZOS: {
            const double a = u * kPi / H;
            return std::sin(a) / a;
        }
        case eSWT_GAUSSIAN:
            return std::exp(-((u * u / (H * H)) / (mdfSigma * 2.0 * mdfSigma)));
    }
    return 1.0;
}

void ShapingWindow::ToCoefficients(CoefficientMap& oCoefficients) const {
    oCoefficients["SHAPINGWINDOW"] = kNames[meType];
    if (meType == eSWT_KAISER) {
        oCoefficients["BETA"] = FormatString("%lf", mdfBeta);
    } else if (meType == eSWT_GAUSSIAN) {
        oCoefficients["SIGMA"] = FormatString("%lf", mdfSigma);
    }
}

}  // namespace vetra::utils

vetra::utils::ShapingWindow GetShapingWindow(const vetra::utils::ResampleInfo& oInfo) {
    using namespace vetra::utils;
    std::string sName;
    if (oInfo.GetCoefficient("SHAPINGWINDOW", sName, false) != 0) {
        const auto fnHas = [&](const char* pszKey) {
            return oInfo.moCoefficients.count(pszKey) != 0;
        };
        sName = !fnHas("BETA") && fnHas("SIGMA") ? "GAUSSIAN" : "KAISER";
    }
    double dfBeta = kDefaultBeta;
    double dfSigma = kDefaultSigma;
    ShapingWindow oWindow;
    switch (NameToType(ToUpper(TrimWhitespace(sName)))) {
        case eSWT_NONE:
            oWindow.SetNone();
            break;
        case eSWT_PARABOLA:
            oWindow.SetParabola();
            break;
        case eSWT_KAISER:
            oInfo.GetCoefficientDouble("BETA", dfBeta, false);
            oWindow.SetKaiser(dfBeta);
            break;
        case eSWT_HANN:
            oWindow.SetHann();
            break;
        case eSWT_HAMMING:
            oWindow.SetHamming();
            break;
        case eSWT_LANCZOS:
            oWindow.SetLanczos();
            break;
        case eSWT_GAUSSIAN:
            oInfo.GetCoefficientDouble("SIGMA", dfSigma, false);
            oWindow.SetGaussian(dfSigma);
            break;
    }
    return oWindow;
}
