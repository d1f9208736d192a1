#include "methods.h"

#include <cpl_string.h>

#include "gdalraster/errors.h"
#include "vetra/base/utils/resample/algorithm/bilinearresampler.h"
#include "vetra/base/utils/resample/algorithm/cubicpsresampler.h"
#include "vetra/base/utils/resample/algorithm/cubicresampler.h"
#include "vetra/base/utils/resample/algorithm/lagrange4resampler.h"
#include "vetra/base/utils/resample/algorithm/lagrange8resampler.h"
#include "vetra/base/utils/resample/algorithm/nearestresampler.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"
#include "vetra/base/utils/resample/resample.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::tool {

namespace {

using utils::IRasterResampler;

template <class Resampler>
std::unique_ptr<IRasterResampler> Make() {
    return std::make_unique<Resampler>();
}

struct Method {
    const char* pszName;
    const char* pszDescription;
    // Null for a method that needs parameters.
    std::unique_ptr<IRasterResampler> (*fnMake)();
};

// The squared methods stand last: their line begins with SQ and the name of their twin.
const Method kMethods[] = {
    {"NEAR", "the nearest pixel", Make<utils::NearestResampler>},
    {"BILIN", "linear between the four pixels around", Make<utils::BilinearResampler>},
    {"CUBIC", "cubic convolution with free parameter -1: sharper than most programs' -0.5 or -0.75",
     Make<utils::CubicResampler>},
    {"CUBICPS", "as CUBIC; a masked pixel counts as the nearest one, and the frame is background",
     Make<utils::CubicPsResampler>},
    {"LAGRANGE4", "Lagrange polynomials of degree 3", Make<utils::Lagrange4Resampler>},
    {"LAGRANGE8", "Lagrange polynomials of degree 7", Make<utils::Lagrange8Resampler>},
    {"SINC8", "windowed sinc over 8 pixels", nullptr},
    {"SINC16", "windowed sinc over 16 pixels", nullptr},
    {"AVERAGE", "the mean of a window", nullptr},
    {"MEDIAN", "the median of a window", nullptr},
    {"GAUSSIAN", "a Gaussian kernel", nullptr},
    {"KERNEL", "a kernel of your own", nullptr},
    {"CPLXSAR", "a filter for complex radar images", nullptr},
    {"SQNEAR", "as NEAR for squared quantities: negative samples count as 0",
     Make<utils::SqNearestResampler>},
    {"SQBILIN", "as BILIN on square roots, squared again", Make<utils::SqBilinearResampler>},
    {"SQCUBIC", "as CUBIC on square roots, squared again", Make<utils::SqCubicResampler>},
    {"SQCUBICPS", "as CUBICPS on square roots, squared again", Make<utils::SqCubicPsResampler>},
    {"SQLAGRANGE4", "as LAGRANGE4 on square roots, squared again",
     Make<utils::SqLagrange4Resampler>},
    {"SQLAGRANGE8", "as LAGRANGE8 on square roots, squared again",
     Make<utils::SqLagrange8Resampler>},
    {"SQSINC8", "as SINC8 on square roots, squared again", nullptr},
    {"SQSINC16", "as SINC16 on square roots, squared again", nullptr},
    {"SQAVERAGE", "as AVERAGE on square roots, squared again", nullptr},
    {"SQMEDIAN", "as MEDIAN on square roots, squared again", nullptr},
    {"SQGAUSSIAN", "as GAUSSIAN on square roots, squared again", nullptr},
    {"SQKERNEL", "as KERNEL on square roots, squared again", nullptr},
};

bool EngineHas(const IRasterResampler& oResampler) {
    try {
        RunOnePixel(oResampler.GetResampleInfo(), gobs::eDT_8U, gobs::eDT_8U);
        return true;
    } catch (const Exception&) {
        return false;
    }
}

}  // namespace

std::unique_ptr<IRasterResampler> MakeResampler(const std::string& sMethod) {
    for (const Method& oMethod : kMethods) {
        if (EQUAL(sMethod.c_str(), oMethod.pszName)) {
            if (oMethod.fnMake == nullptr) {
                throw UsageError("--method: " + std::string(oMethod.pszName) +
                                 " needs parameters, which can't be given yet");
            }
            return oMethod.fnMake();
        }
    }
    throw UsageError("--method: there is no method " + sMethod + " (vetra methods lists all)");
}

bool IsNearest(const IRasterResampler& oResampler) {
    const ResampleMethod eMethod = oResampler.GetResampleType();
    return eMethod == eRM_NEAR || eMethod == eRM_SQNEAR;
}

void RunOnePixel(const utils::ResampleInfo& oInfo, gobs::NativeDataTypeCode eSrcType,
                 gobs::NativeDataTypeCode eTgtType) {
    const utils::ResampleBuffer oSrc(eSrcType, 1, 1, 1);
    utils::ResampleBuffer oTgt(eTgtType, 1, 1, 1);
    utils::Resample(oSrc, oTgt, utils::BufPosScaleOffTfm(1, 1, 1.0, 0.0, 1.0, 0.0, 0, 0), oInfo);
}

std::string DescribeMethods() {
    std::string sText =
        FormatString("%-12s%-8s%-18s%-6s%s\n", "NAME", "WINDOW", "MARGINS", "NOW", "WHAT IT TAKES");
    for (const Method& oMethod : kMethods) {
        std::string sWindow = "-";
        std::string sMargins = "-";
        bool bUsable = false;
        if (oMethod.fnMake != nullptr) {
            const std::unique_ptr<IRasterResampler> poResampler = oMethod.fnMake();
            int nColOff, nRowOff, nCols, nRows, nLeft, nTop, nRight, nBottom;
            utils::WindowAnchorPoint eColAnchor, eRowAnchor;
            poResampler->GetWindowExtents(nColOff, nRowOff, nCols, nRows, eColAnchor, eRowAnchor);
            poResampler->GetSrcBufferMargins(nLeft, nTop, nRight, nBottom);
            sWindow = FormatString("%d x %d", nCols, nRows);
            sMargins = FormatString("%d %d %d %d", nLeft, nTop, nRight, nBottom);
            bUsable = EngineHas(*poResampler);
        }
        sText += FormatString("%-12s%-8s%-18s%-6s%s\n", oMethod.pszName, sWindow.c_str(),
                              sMargins.c_str(), bUsable ? "yes" : "no", oMethod.pszDescription);
    }
    return sText +
           "\nMARGINS: source pixels that a position needs to the left of, above, right of and "
           "below its own.\nNOW: whether the method can be used now; the others will follow.\n";
}

}  // namespace vetra::tool
