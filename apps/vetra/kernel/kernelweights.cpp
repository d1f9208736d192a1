#include "kernel/kernelweights.h"

#include <algorithm>
#include <limits>
#include <sstream>

#include "gdalraster/errors.h"
#include "methods.h"
#include "vetra/base/utils/resample/algorithm/kernelfile.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"
#include "vetra/base/utils/resample/resample.h"
#include "vetra/base/utils/resample/resamplerfactory.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::tool {

namespace {

using utils::IRasterResampler;
using utils::ResampleBuffer;
using utils::ResampleInfo;

constexpr int kSubPixels = 64;
// The work of sampling an average grows with the square of its size.
constexpr int kLargestAverage = 1024;

enum Axis { eAxisCols, eAxisRows };

// A method's window along one axis, and the least kernel window that holds it.
struct AxisWindow {
    AxisWindow(int nBefore, int nAfter)
        : nFirst(nBefore), nLast(nAfter), nTaps(std::max(1 - 2 * nBefore, 2 * nAfter)) {}

    int nFirst;  // from the floor of a position
    int nLast;
    int nTaps;
};

// The engine's answer to a bright line across the axis: along the line the method meets a constant
// image, so that only this axis counts. Positions run from where the line lies under the last tap
// to where it lies under the first one.
std::vector<double> SampleAxis(ResampleInfo oInfo, Axis eAxis, const AxisWindow& oWindow,
                               const AxisWindow& oOther) {
    // The mean along the line is the same for any size, and large ones cost much.
    const auto oSize = oInfo.moCoefficients.find(eAxis == eAxisCols ? "NUMROWS" : "NUMCOLS");
    if (oSize != oInfo.moCoefficients.end()) {
        oSize->second = std::to_string(1);
    }
    const int nTaps = oWindow.nTaps;
    const int nLine = nTaps;
    const int nAcross = oOther.nLast - oOther.nFirst + 1;
    const int nAlong = nLine + nTaps + 1;
    const int nPositions = nTaps * kSubPixels + 1;
    const int nStart = nLine - nTaps / 2;
    const double dfStep = 1.0 / kSubPixels;
    const double dfEdge = nStart + 0.5 - 0.5 * dfStep;

    const auto Oriented = [&](int nLong, int nShort, std::vector<double>& vdf) {
        auto* pabySamples = reinterpret_cast<unsigned char*>(vdf.data());
        return eAxis == eAxisCols
                   ? ResampleBuffer(gobs::eDT_64R, nLong, nShort, 1, pabySamples, nullptr, false)
                   : ResampleBuffer(gobs::eDT_64R, nShort, nLong, 1, pabySamples, nullptr, false);
    };
    std::vector<double> vdfSource(static_cast<std::size_t>(nAlong) *
                                  static_cast<std::size_t>(nAcross));
    for (int n = 0; n < nAcross; ++n) {
        vdfSource[static_cast<std::size_t>(eAxis == eAxisCols ? n * nAlong + nLine
                                                              : nLine * nAcross + n)] = 1.0;
    }
    std::vector<double> vdfResponse(static_cast<std::size_t>(nPositions));
    const ResampleBuffer oSrc = Oriented(nAlong, nAcross, vdfSource);
    ResampleBuffer oTgt = Oriented(nPositions, 1, vdfResponse);
    if (eAxis == eAxisCols) {
        utils::Resample(
            oSrc, oTgt,
            utils::BufPosScaleOffTfm(nPositions, 1, dfStep, dfEdge, 1.0, -oOther.nFirst, 0, 0),
            oInfo);
    } else {
        utils::Resample(
            oSrc, oTgt,
            utils::BufPosScaleOffTfm(1, nPositions, 1.0, -oOther.nFirst, dfStep, dfEdge, 0, 0),
            oInfo);
    }

    std::vector<double> vdfWeights;
    for (int nPhase = 0; nPhase <= kSubPixels; ++nPhase) {
        for (int nTap = 0; nTap < nTaps; ++nTap) {
            // The sum turns -0 into 0.
            vdfWeights.push_back(
                0.0 +
                vdfResponse[static_cast<std::size_t>((nTaps - 1 - nTap) * kSubPixels + nPhase)]);
        }
    }
    return vdfWeights;
}

KernelWeights SampleMethod(const IRasterResampler& oResampler, ResampleMethod eMethod) {
    int nLeft, nTop, nRight, nBottom;
    oResampler.GetSrcBufferMargins(nLeft, nTop, nRight, nBottom);
    if (std::max(nRight, nBottom) > kLargestAverage) {
        throw UsageError(FormatString(
            "a window of more than %d columns or rows is too large for a kernel", kLargestAverage));
    }
    const AxisWindow oCols(nLeft, nRight);
    const AxisWindow oRows(nTop, nBottom);
    ResampleInfo oInfo(eMethod, oResampler.GetCoefficients(), std::numeric_limits<double>::lowest(),
                       std::numeric_limits<double>::max(), 0.0, utils::eNFA_BGD);
    oInfo.mbClampBgd = false;
    KernelWeights oWeights{oCols.nTaps, oRows.nTaps, kSubPixels,
                           SampleAxis(oInfo, eAxisCols, oCols, oRows)};
    const std::vector<double> vdfRows = SampleAxis(oInfo, eAxisRows, oRows, oCols);
    oWeights.vdfWeights.insert(oWeights.vdfWeights.end(), vdfRows.begin(), vdfRows.end());
    return oWeights;
}

}  // namespace

bool KernelWeights::HasOneKernel() const {
    const auto oMiddle = vdfWeights.begin() + static_cast<std::ptrdiff_t>(nSubPixels + 1) * nCols;
    return nCols == nRows && std::equal(vdfWeights.begin(), oMiddle, oMiddle);
}

KernelWeights GetKernelWeights(const IRasterResampler& oResampler) {
    const ResampleMethod eMethod = GetPlainTwin(oResampler.GetResampleType());
    const ResampleInfo oInfo = oResampler.GetResampleInfo();
    const std::string sName = utils::ResamplerFactory::MethodToName(oResampler.GetResampleType());
    int nColOff, nRowOff;
    utils::WindowAnchorPoint eColAnchor, eRowAnchor;
    KernelWeights oWeights;
    oResampler.GetWindowExtents(nColOff, nRowOff, oWeights.nCols, oWeights.nRows, eColAnchor,
                                eRowAnchor);
    switch (eMethod) {
        case eRM_KERNEL:
            oInfo.GetCoefficientInt("NUMSUBPIXELS", oWeights.nSubPixels, true);
            oWeights.vdfWeights = oInfo.mvdfKernelWeights;
            return oWeights;
        case eRM_GAUSSIAN:
            oWeights.nSubPixels = kSubPixels;
            oWeights.vdfWeights = oInfo.mvdfKernelWeights;
            return oWeights;
        case eRM_SINC8:
        case eRM_SINC16:
            // One table serves both axes.
            oWeights.nSubPixels = kSubPixels;
            oWeights.vdfWeights = oInfo.mvdfKernelWeights;
            oWeights.vdfWeights.insert(oWeights.vdfWeights.end(), oInfo.mvdfKernelWeights.begin(),
                                       oInfo.mvdfKernelWeights.end());
            return oWeights;
        case eRM_MEDIAN:
            throw UsageError(sName +
                             " takes one of the pixels and doesn't weigh them: it has no "
                             "weights to write or draw");
        case eRM_CPLXSAR:
            throw UsageError(sName +
                             " has complex weights, which a kernel file can't hold (--plot "
                             "draws them)");
        default:
            return SampleMethod(oResampler, eMethod);
    }
}

std::string ToKernelFileText(const KernelWeights& oWeights) {
    std::ostringstream oText;
    SaveKernelFile(oText, oWeights.nCols, oWeights.nRows, oWeights.nSubPixels, oWeights.vdfWeights,
                   oWeights.HasOneKernel());
    return oText.str();
}

}  // namespace vetra::tool
