#include "randomimages.h"

#include <typeinfo>

#include "vetra/base/utils/resample/algorithm/kernelresampler.h"
#include "vetra/base/utils/resample/resamplerfactory.h"

using namespace vetra::utils;
using namespace vetra::gobs;

namespace {

bool IsFloating(NativeDataTypeCode eType) { return eType == eDT_32R || eType == eDT_64R; }

}  // namespace

void FillSamples(Random& oRandom, NativeDataTypeCode eType, unsigned char* pabyBuf,
                 std::size_t nCount) {
    if (DataTypeAdapter::IsComplex(eType)) {
        FillSamples(oRandom, DataTypeAdapter::ComplexToScalar(eType), pabyBuf, 2 * nCount);
        return;
    }
    const int nBytes = DataTypeAdapter::ByteSize(eType);
    const int nKind = oRandom.Int(0, 2);
    for (std::size_t i = 0; i < nCount; ++i) {
        std::uint64_t nBits = oRandom.Bits();
        if (IsFloating(eType)) {
            double df = oRandom.Real(-300, 300);
            if (nKind == 1) df = std::ldexp(df, oRandom.Int(-80, 80));
            if (nKind == 2 && oRandom.Chance(0.1)) {
                df = oRandom.Pick<double>(
                    {NAN, INFINITY, -INFINITY, -0.0, 0.25, -9999.0, 3e38, -3e38});
            }
            const float f = static_cast<float>(df);
            std::memcpy(&nBits, eType == eDT_32R ? static_cast<const void*>(&f) : &df,
                        static_cast<std::size_t>(nBytes));
        } else if (nKind == 1) {
            nBits %= 5;
        } else if (nKind == 2 && oRandom.Chance(0.3)) {
            nBits = oRandom.Pick<std::uint64_t>({0, ~0ull, 1ull << 63, ~0ull >> 1, 0x7f, 0x80,
                                                 0x7fff, 0x8000, 0x7fffffff, 0x80000000});
        }
        std::memcpy(pabyBuf + i * static_cast<std::size_t>(nBytes), &nBits,
                    static_cast<std::size_t>(nBytes));
    }
}

ResampleBuffer RealView(ResampleBuffer& oBuffer) {
    const bool bComplex = DataTypeAdapter::IsComplex(oBuffer.GetDatatype());
    return ResampleBuffer(DataTypeAdapter::ComplexToScalar(oBuffer.GetDatatype()),
                          oBuffer.GetNumCols(), oBuffer.GetNumRows(),
                          (bComplex ? 2 : 1) * oBuffer.GetNumChan(), oBuffer.GetBuf(),
                          oBuffer.GetMask(), false);
}

std::unique_ptr<IRasterResampler> MakeResampler(ResampleMethod eMethod) {
    std::string sParms = ResamplerFactory::MethodToName(eMethod);
    switch (eMethod) {
        case eRM_AVERAGE:
        case eRM_MEDIAN:
        case eRM_SQAVERAGE:
        case eRM_SQMEDIAN:
            sParms += ",NUMCOLS=3,NUMROWS=4";
            break;
        case eRM_CPLXSAR:
            sParms += ",NUMCOLS=5,NUMROWS=7,FC=0.2";
            break;
        case eRM_GAUSSIAN:
        case eRM_SQGAUSSIAN:
            sParms += ",DSFACTORCOL=2,DSFACTORROW=1.5";
            break;
        case eRM_KERNEL:
        case eRM_SQKERNEL: {
            std::vector<double> vdfWeights((3 + 6) * (5 + 1), 0.2);
            vdfWeights[7] = -0.4;
            const KernelResampler oPlain(3, 6, 5, vdfWeights);
            ResampleInfo oInfo = oPlain.GetResampleInfo();
            oInfo.meMethod = eMethod;
            return std::unique_ptr<IRasterResampler>(ResamplerFactory().GetResampler(oInfo));
        }
        default:
            break;
    }
    return std::unique_ptr<IRasterResampler>(ResamplerFactory().GetResampler(sParms));
}

const char* TransformName(const IBufPosTfm& oTfm) { return typeid(oTfm).name(); }

std::vector<ResampleMethod> AllMethods() {
    std::vector<ResampleMethod> veMethods;
    for (int nMethod = eRM_BILIN; nMethod < eRM_CUSTOM; ++nMethod) {
        veMethods.push_back(static_cast<ResampleMethod>(nMethod));
    }
    return veMethods;
}

std::string MethodName(const testing::TestParamInfo<ResampleMethod>& oInfo) {
    return ResamplerFactory::MethodToName(oInfo.param);
}
