#include "methods.h"

#include <cstring>

#include "gdalraster/errors.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"
#include "vetra/base/utils/resample/resample.h"
#include "vetra/base/utils/resample/resamplerfactory.h"
#include "vetra/base/utils/string/stringutils.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::tool {

namespace {

using utils::IRasterResampler;
using utils::ResamplerFactory;

struct Method {
    ResampleMethod eMethod;
    const char* pszDescription;
    const char* pszKeys = "";
    // Of a method whose window depends on its keys; else null.
    const char* pszWindow = nullptr;
    const char* pszMargins = nullptr;
};

constexpr const char* kSizeKeys = "NUMCOLS=C NUMROWS=R";
constexpr const char* kSincKeys =
    "[SHAPINGWINDOW=KAISER [BETA=9.42] | GAUSSIAN [SIGMA=1] | PARABOLA | HANN | HAMMING | LANCZOS "
    "| NONE]";

// All but the squared methods, which go by their twins.
const Method kMethods[] = {
    {eRM_NEAR, "the nearest pixel"},
    {eRM_BILIN, "linear between the four pixels around"},
    {eRM_CUBIC,
     "cubic convolution with free parameter -1: sharper than most programs' -0.5 or -0.75"},
    {eRM_CUBICPS,
     "as CUBIC; a masked pixel counts as the nearest one, and the frame is background"},
    {eRM_LAGRANGE4, "Lagrange polynomials of degree 3"},
    {eRM_LAGRANGE8, "Lagrange polynomials of degree 7"},
    {eRM_SINC8, "windowed sinc over 8 pixels; 8PT is SINC8,SHAPINGWINDOW=PARABOLA", kSincKeys},
    {eRM_SINC16, "windowed sinc over 16 pixels; 16PT is SINC16,SHAPINGWINDOW=PARABOLA", kSincKeys},
    {eRM_AVERAGE, "the mean of a window", kSizeKeys, "C x R", "0 0 C R"},
    {eRM_MEDIAN, "the median of a window, the lower one of an even number of pixels", kSizeKeys,
     "C x R", "0 0 C R"},
    {eRM_GAUSSIAN, "Gaussian for images reduced by the factor f; n is 2 x round(1.5 sqrt(f^2 - 1))",
     "DSFACTORCOL=f [DSFACTORROW=f]", "n x n", "1-n/2 1-n/2 n/2 n/2"},
    {eRM_KERNEL, "the weights of a kernel file of C x R taps (vetra kernel writes them)",
     "FILE=PATH", "C x R", "-(C-1)/2 -(R-1)/2 C/2 R/2"},
    {eRM_CPLXSAR,
     "complex radar images with carrier F, -0.5 to 0.5 cycles per row; C and R odd, at most 31. "
     "The "
     "carrier's phase counts from the window's first row: every result has the same turn",
     "NUMCOLS=C NUMROWS=R [FC=F]", "C x R", "-(C-1)/2 -(R-1)/2 (C+1)/2 (R+1)/2"},
};

constexpr const char* kSquaredPrefix = "SQ";

void Describe(const Method& oMethod, bool bSquared, std::string& sText) {
    const std::string sPlain = ResamplerFactory::MethodToName(oMethod.eMethod);
    const std::string sName = (bSquared ? kSquaredPrefix : "") + sPlain;
    std::string sDescription = oMethod.pszDescription;
    if (bSquared) {
        sDescription = oMethod.eMethod == eRM_NEAR
                           ? "as NEAR for squared quantities: negative samples count as 0"
                           : "as " + sPlain + " on square roots, squared again";
        if (oMethod.eMethod == eRM_MEDIAN) {
            sDescription += "; C and R at most 11";
        }
    }
    std::string sWindow;
    std::string sMargins;
    if (oMethod.pszWindow != nullptr) {
        sWindow = oMethod.pszWindow;
        sMargins = oMethod.pszMargins;
    } else {
        const WindowText oText = DescribeWindow(*MakeResampler(sName));
        sWindow = oText.sWindow;
        sMargins = oText.sMargins;
    }
    sText += FormatString("%-12s%-9s%s\n", sName.c_str(), sWindow.c_str(), sMargins.c_str());
    if (*oMethod.pszKeys != '\0') {
        sText += FormatString("%12s%s\n", "", oMethod.pszKeys);
    }
    sText += FormatString("%12s%s\n", "", sDescription.c_str());
}

}  // namespace

std::unique_ptr<IRasterResampler> MakeResampler(const std::string& sMethod) {
    // The library takes nothing for CUBIC; here nothing is a variable that wasn't set.
    if (TrimWhitespace(sMethod).empty()) {
        throw UsageError("the method is empty (vetra methods lists all)");
    }
    try {
        return std::unique_ptr<IRasterResampler>(ResamplerFactory().GetResampler(sMethod));
    } catch (const Exception& oError) {
        throw UsageError("method " + sMethod + ": " + oError.GetMessage() +
                         " (vetra methods lists all)");
    }
}

bool IsNearest(const IRasterResampler& oResampler) {
    return GetPlainTwin(oResampler.GetResampleType()) == eRM_NEAR;
}

ResampleMethod GetPlainTwin(ResampleMethod eMethod) {
    const std::string sName = ResamplerFactory::MethodToName(eMethod);
    return sName.starts_with(kSquaredPrefix)
               ? ResamplerFactory::NameToMethod(sName.substr(std::strlen(kSquaredPrefix)))
               : eMethod;
}

void RunOnePixel(const utils::ResampleInfo& oInfo, gobs::NativeDataTypeCode eSrcType,
                 gobs::NativeDataTypeCode eTgtType) {
    const utils::ResampleBuffer oSrc(eSrcType, 1, 1, 1);
    utils::ResampleBuffer oTgt(eTgtType, 1, 1, 1);
    utils::Resample(oSrc, oTgt, utils::BufPosScaleOffTfm(1, 1, 1.0, 0.0, 1.0, 0.0, 0, 0), oInfo);
}

WindowText DescribeWindow(const IRasterResampler& oResampler) {
    int nColOff, nRowOff, nCols, nRows, nLeft, nTop, nRight, nBottom;
    utils::WindowAnchorPoint eColAnchor, eRowAnchor;
    oResampler.GetWindowExtents(nColOff, nRowOff, nCols, nRows, eColAnchor, eRowAnchor);
    oResampler.GetSrcBufferMargins(nLeft, nTop, nRight, nBottom);
    return {FormatString("%d x %d", nCols, nRows),
            FormatString("%d %d %d %d", nLeft, nTop, nRight, nBottom)};
}

std::string DescribeMethods() {
    std::string sText = FormatString("%-12s%-9s%s\n", "NAME", "WINDOW", "MARGINS");
    for (const bool bSquared : {false, true}) {
        for (const Method& oMethod : kMethods) {
            if (!bSquared || oMethod.eMethod != eRM_CPLXSAR) {
                Describe(oMethod, bSquared, sText);
            }
        }
    }
    return sText +
           "\nWINDOW: columns x rows of source pixels that make a target pixel.\n"
           "MARGINS: first and last of them, as left, top, right, bottom, counted from the pixel "
           "at "
           "or before a position.\n"
           "A method with keys: NAME,KEY=VALUE,KEY=VALUE. Keys in [ ] can be left out. All methods "
           "take MIN=v MAX=v (limits of the result) and FILL=NN|BGD (see --fill).\n";
}

std::string DescribeMethod(const std::string& sMethod) {
    const std::unique_ptr<IRasterResampler> poResampler = MakeResampler(sMethod);
    const WindowText oText = DescribeWindow(*poResampler);
    std::string sText = "method: " + ResamplerFactory::MethodToName(poResampler->GetResampleType());
    for (const auto& [sKey, sValue] : poResampler->GetCoefficients()) {
        sText += "\n" + sKey + ": " + sValue;
    }
    return sText + "\nwindow: " + oText.sWindow + "\nmargins: " + oText.sMargins + "\n";
}

}  // namespace vetra::tool
