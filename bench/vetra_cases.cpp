#include <omp.h>

#include <memory>
#include <string>
#include <vector>

#include "reference.h"
#include "vetra/base/utils/resample/engine/dispatch.h"
#include "vetra/vetra.h"
#include "workload.h"

using namespace vetra::gobs;
using namespace vetra::utils;

namespace {

struct Images {
    std::shared_ptr<ResampleBuffer> poSrc;
    std::shared_ptr<ResampleBuffer> poTgt;
    std::shared_ptr<IBufPosTfm> poTfm;
    ResampleInfo oInfo;
};

Images MakeImages(const Work& oWork) {
    Images o;
    const int nSize = oWork.nTargetSize;
    o.poSrc = std::make_shared<ResampleBuffer>(oWork.eType, kSourceSize, kSourceSize, oWork.nChan,
                                               SourceSamples(oWork).data(),
                                               oWork.bMask ? SourceMask().data() : nullptr, false);
    o.poTgt = std::make_shared<ResampleBuffer>(oWork.eType, nSize, nSize, oWork.nChan,
                                               TargetSamples().data(), nullptr, false);
    const std::unique_ptr<IRasterResampler> poResampler(
        ResamplerFactory().GetResampler(std::string(oWork.pszMethod)));
    o.oInfo = poResampler->GetResampleInfo();
    if (oWork.eGeometry == Work::Geometry::eRotated) {
        // A small target takes the first of the positions.
        o.poTfm = std::make_shared<BufPosArrayTfm>(nSize, nSize, RotatedCols().data(), 0,
                                                   RotatedRows().data(), 0, false);
    } else {
        const double dfFirst = FirstSource(oWork.eGeometry);
        const double dfScale = ScaleOf(oWork.eGeometry);
        o.poTfm = std::make_shared<BufPosScaleOffTfm>(nSize, nSize, dfScale, dfFirst, dfScale,
                                                      dfFirst, 0, 0);
    }
    return o;
}

}  // namespace

Case VetraCase(const Work& oWork) {
    engine::RunOptions oOptions;
    if (oWork.bAvx2) {
        if (oOptions.eLevel <= engine::Level::eV3) {
            return {};
        }
        oOptions.eLevel = engine::Level::eV3;
    }
    const int nThreads = oWork.nThreads == 0 ? omp_get_num_procs() : oWork.nThreads;
    return {"vetra", [=, o = MakeImages(oWork)] {
                omp_set_num_threads(nThreads);
                engine::Resample(*o.poSrc, *o.poTgt, *o.poTfm, o.oInfo, oOptions);
            }};
}

Case PlainCase(const Work& oWork) {
    // It takes real samples only: a complex image is one of pairs of channels.
    if (!oWork.IsCommon() || oWork.MethodName() != "CPLXSAR") {
        return {};
    }
    return {"plain loop", [o = MakeImages(oWork)] {
                const auto fnReal = [](ResampleBuffer& oComplex) {
                    return ResampleBuffer(DataTypeAdapter::ComplexToScalar(oComplex.GetDatatype()),
                                          oComplex.GetNumCols(), oComplex.GetNumRows(),
                                          2 * oComplex.GetNumChan(), oComplex.GetBuf(), nullptr,
                                          false);
                };
                ResampleBuffer oTgt = fnReal(*o.poTgt);
                std::vector<unsigned char> vbyOutcome;
                ReferenceResample(fnReal(*o.poSrc), oTgt, *o.poTfm, o.oInfo, vbyOutcome);
            }};
}
