#include "vetra/base/utils/resample/algorithm/kernelresampler.h"

#include "vetra/base/utils/resample/algorithm/kernelfile.h"
#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::utils {
namespace {

// What a kernel file holds.
struct Kernel {
    explicit Kernel(const std::string& sFile) {
        LoadKernelFile(sFile, nCols, nRows, nSubPixels, vdfWeights);
    }
    int nCols = 0;
    int nRows = 0;
    int nSubPixels = 0;
    std::vector<double> vdfWeights;
};

void CheckKernel(int nWndNumCols, int nWndNumRows, int nSubPixels,
                 const std::vector<double>& vdfWeights, const char* pszFile,
                 const char* pszFunction, std::uint32_t nLine) {
    CheckKernelSize(nWndNumCols, nWndNumRows, nSubPixels, pszFile, pszFunction, nLine);
    if (static_cast<long long>(vdfWeights.size()) !=
        NumKernelWeights(nWndNumCols, nWndNumRows, nSubPixels)) {
        throw DataException("Resampler kernel does not have correct number of weights.", pszFile,
                            pszFunction, nLine);
    }
}

ResampleInfo KernelInfo(ResampleMethod eMethod, int nWndNumCols, int nWndNumRows, int nSubPixels,
                        const std::vector<double>& vdfWeights) {
    ResampleInfo oInfo =
        MethodInfo(eMethod, KernelCoefficients(nWndNumCols, nWndNumRows, nSubPixels));
    oInfo.mvdfKernelWeights = vdfWeights;
    return oInfo;
}

}  // namespace

KernelResampler::KernelResampler() = default;
KernelResampler::KernelResampler(const std::string& sFile) {
    const Kernel oKernel(sFile);
    KernelResampler::SetParameters(oKernel.nCols, oKernel.nRows, oKernel.nSubPixels,
                                   oKernel.vdfWeights);
}
KernelResampler::KernelResampler(int nWndNumCols, int nWndNumRows, int nSubPixels,
                                 const std::vector<double>& vdfWeights) {
    KernelResampler::SetParameters(nWndNumCols, nWndNumRows, nSubPixels, vdfWeights);
}

KernelResampler::KernelResampler(const KernelResampler& oOther) : IRasterResampler(oOther) {}
KernelResampler::~KernelResampler() = default;
KernelResampler* KernelResampler::Clone() const { return new KernelResampler(*this); }

void KernelResampler::SetParameters(int nWndNumCols, int nWndNumRows, int nSubPixels,
                                    const std::vector<double>& vdfWeights) {
    CheckKernel(nWndNumCols, nWndNumRows, nSubPixels, vdfWeights, VETRA_HERE);
    SetResampleInfo(KernelInfo(eRM_KERNEL, nWndNumCols, nWndNumRows, nSubPixels, vdfWeights));
    SetWindowExtents(-((nWndNumCols - 1) / 2), -((nWndNumRows - 1) / 2), nWndNumCols, nWndNumRows,
                     eWAP_FLOOR, eWAP_FLOOR);
}

SqKernelResampler::SqKernelResampler() = default;
SqKernelResampler::SqKernelResampler(const std::string& sFile) {
    const Kernel oKernel(sFile);
    SqKernelResampler::SetParameters(oKernel.nCols, oKernel.nRows, oKernel.nSubPixels,
                                     oKernel.vdfWeights);
}
SqKernelResampler::SqKernelResampler(int nWndNumCols, int nWndNumRows, int nSubPixels,
                                     const std::vector<double>& vdfWeights) {
    SqKernelResampler::SetParameters(nWndNumCols, nWndNumRows, nSubPixels, vdfWeights);
}

SqKernelResampler::SqKernelResampler(const SqKernelResampler& oOther) : IRasterResampler(oOther) {}
SqKernelResampler::~SqKernelResampler() = default;
SqKernelResampler* SqKernelResampler::Clone() const { return new SqKernelResampler(*this); }

void SqKernelResampler::SetParameters(int nWndNumCols, int nWndNumRows, int nSubPixels,
                                      const std::vector<double>& vdfWeights) {
    CheckKernel(nWndNumCols, nWndNumRows, nSubPixels, vdfWeights, VETRA_HERE);
    SetResampleInfo(KernelInfo(eRM_SQKERNEL, nWndNumCols, nWndNumRows, nSubPixels, vdfWeights));
    SetWindowExtents(-((nWndNumCols - 1) / 2), -((nWndNumRows - 1) / 2), nWndNumCols, nWndNumRows,
                     eWAP_FLOOR, eWAP_FLOOR);
}

}  // namespace vetra::utils
