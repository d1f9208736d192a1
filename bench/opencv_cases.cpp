#include <omp.h>

#include <opencv2/imgproc.hpp>

#include "workload.h"

using namespace vetra::gobs;

Case OpenCvCase(const Work& oWork) {
    if (oWork.bMask) {
        return {};
    }
    const int nDepth = oWork.eType == eDT_8U ? CV_8U : oWork.eType == eDT_16U ? CV_16U : CV_32F;
    const int nType = CV_MAKETYPE(nDepth, oWork.nChan);
    const cv::Mat oSrc(kSourceSize, kSourceSize, nType, SourceSamples(oWork).data());
    const cv::Mat oTgt(kTargetSize, kTargetSize, nType, TargetSamples().data());
    const int nMethod = oWork.bBilinear ? cv::INTER_LINEAR : cv::INTER_NEAREST;
    const int nThreads = oWork.nThreads == 0 ? omp_get_num_procs() : oWork.nThreads;
    if (oWork.eGeometry == Work::Geometry::eRotated) {
        const cv::Mat oCols(kTargetSize, kTargetSize, CV_32F, RotatedCols().data());
        const cv::Mat oRows(kTargetSize, kTargetSize, CV_32F, RotatedRows().data());
        return {"OpenCV", [=] {
                    cv::setNumThreads(nThreads);
                    cv::remap(oSrc, oTgt, oCols, oRows, nMethod);
                }};
    }
    const int nFirst = static_cast<int>(FirstSource(oWork.eGeometry));
    const cv::Rect oWindow(nFirst, nFirst, kSourceSize - 2 * nFirst, kSourceSize - 2 * nFirst);
    return {"OpenCV", [=, oPart = oSrc(oWindow)] {
                cv::setNumThreads(nThreads);
                cv::resize(oPart, oTgt, oTgt.size(), 0, 0, nMethod);
            }};
}
