#include <omp.h>

#include <map>
#include <opencv2/imgproc.hpp>
#include <string>

#include "workload.h"

using namespace vetra::gobs;

namespace {

// OpenCV's kernel of the same size. Its own windows of means and medians are no interpolation.
int InterpolationOf(const std::string& sMethod) {
    const std::map<std::string, int> oMethods = {
        {"NEAR", cv::INTER_NEAREST},       {"BILIN", cv::INTER_LINEAR},
        {"CUBIC", cv::INTER_CUBIC},        {"LAGRANGE4", cv::INTER_CUBIC},
        {"LAGRANGE8", cv::INTER_LANCZOS4}, {"SINC8", cv::INTER_LANCZOS4},
        {"SINC16", cv::INTER_LANCZOS4}};
    const auto it = oMethods.find(sMethod);
    return it == oMethods.end() ? -1 : it->second;
}

}  // namespace

Case OpenCvCase(const Work& oWork) {
    const int nMethod = InterpolationOf(oWork.MethodName());
    if (!oWork.IsCommon() || DataTypeAdapter::IsComplex(oWork.eType) ||
        (nMethod < 0 && oWork.eGeometry != Work::Geometry::eUnit)) {
        return {};
    }
    const int nDepth = oWork.eType == eDT_8U ? CV_8U : oWork.eType == eDT_16U ? CV_16U : CV_32F;
    const int nType = CV_MAKETYPE(nDepth, oWork.nChan);
    const cv::Mat oSrc(kSourceSize, kSourceSize, nType, SourceSamples(oWork).data());
    const cv::Mat oTgt(kTargetSize, kTargetSize, nType, TargetSamples().data());
    const int nThreads = oWork.nThreads == 0 ? omp_get_num_procs() : oWork.nThreads;
    if (oWork.eGeometry == Work::Geometry::eRotated) {
        const cv::Mat oCols(kTargetSize, kTargetSize, CV_32F, RotatedCols().data());
        const cv::Mat oRows(kTargetSize, kTargetSize, CV_32F, RotatedRows().data());
        return {"OpenCV", [=] {
                    cv::setNumThreads(nThreads);
                    cv::remap(oSrc, oTgt, oCols, oRows, nMethod);
                }};
    }
    if (oWork.eGeometry == Work::Geometry::eUnit) {
        const cv::Mat oPart = oSrc(cv::Rect(0, 0, kTargetSize, kTargetSize));
        const int nSize = oWork.WindowSize();
        const bool bMean = oWork.MethodName() == "AVERAGE";
        return {
            "OpenCV", [=] {
                cv::setNumThreads(nThreads);
                bMean ? cv::blur(oPart, oTgt, {nSize, nSize}) : cv::medianBlur(oPart, oTgt, nSize);
            }};
    }
    const int nFirst = static_cast<int>(FirstSource(oWork.eGeometry));
    const cv::Rect oWindow(nFirst, nFirst, kSourceSize - 2 * nFirst, kSourceSize - 2 * nFirst);
    return {"OpenCV", [=, oPart = oSrc(oWindow)] {
                cv::setNumThreads(nThreads);
                cv::resize(oPart, oTgt, oTgt.size(), 0, 0, nMethod);
            }};
}
