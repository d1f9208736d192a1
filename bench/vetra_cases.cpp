#include <omp.h>

#include <memory>

#include "vetra/vetra.h"
#include "workload.h"

using namespace vetra::utils;

Case VetraCase(const Work& oWork) {
    auto& vbySrc = SourceSamples(oWork);
    unsigned char* pabyMask = oWork.bMask ? SourceMask().data() : nullptr;
    auto poSrc = std::make_shared<ResampleBuffer>(oWork.eType, kSourceSize, kSourceSize,
                                                  oWork.nChan, vbySrc.data(), pabyMask, false);
    auto poTgt = std::make_shared<ResampleBuffer>(
        oWork.eType, kTargetSize, kTargetSize, oWork.nChan, TargetSamples().data(), nullptr, false);
    const std::shared_ptr<IRasterResampler> poResampler(
        ResamplerFactory().GetResampler(std::string(oWork.pszMethod)));
    std::shared_ptr<IBufPosTfm> poTfm;
    if (oWork.eGeometry == Work::Geometry::eRotated) {
        poTfm = std::make_shared<BufPosArrayTfm>(kTargetSize, kTargetSize, RotatedCols().data(), 0,
                                                 RotatedRows().data(), 0, false);
    } else {
        const double dfFirst = FirstSource(oWork.eGeometry);
        const double dfScale = ScaleOf(oWork.eGeometry);
        poTfm = std::make_shared<BufPosScaleOffTfm>(kTargetSize, kTargetSize, dfScale, dfFirst,
                                                    dfScale, dfFirst, 0, 0);
    }
    const int nThreads = oWork.nThreads == 0 ? omp_get_num_procs() : oWork.nThreads;
    return {"vetra", [=] {
                omp_set_num_threads(nThreads);
                poResampler->Resample(*poSrc, *poTgt, *poTfm);
            }};
}
