#include "workload.h"

#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <map>
#include <random>

using namespace vetra::gobs;

std::string Work::Name() const {
    const char* apszGeometry[] = {"rotated", "scale down", "scale up", "unit scale"};
    const std::string sType = DataTypeAdapter::TypeToString(eType);
    return std::string(apszGeometry[static_cast<int>(eGeometry)]) + " " + pszMethod + ", " + sType +
           " x " + std::to_string(nChan) + (bMask ? ", mask" : "") +
           (nThreads == 0 ? ", all threads" : "") +
           (nTargetSize != kTargetSize ? ", target of " + std::to_string(nTargetSize) : "") +
           (bAvx2 ? ", AVX2" : "");
}

Work Work::Baseline() const {
    Work oBase = *this;
    oBase.bMask = false;
    oBase.nThreads = 1;
    oBase.nTargetSize = kTargetSize;
    oBase.bAvx2 = false;
    if (oBase.Name() == Name() && MethodName().rfind("SQ", 0) == 0) {
        oBase.pszMethod += 2;
    }
    return oBase;
}

bool Work::IsCommon() const { return !bMask && nTargetSize == kTargetSize && !bAvx2; }

std::string Work::MethodName() const {
    return std::string(pszMethod, std::strcspn(pszMethod, ","));
}

int Work::WindowSize() const {
    const char* pszSize = std::strchr(pszMethod, '=');
    return pszSize == nullptr ? 1 : std::atoi(pszSize + 1);
}

double FirstSource(Work::Geometry eGeometry) {
    return eGeometry == Work::Geometry::eUp ? kSourceSize / 4 : 0;
}

double ScaleOf(Work::Geometry eGeometry) {
    if (eGeometry == Work::Geometry::eUnit) {
        return 1.0;
    }
    return (kSourceSize - 2 * FirstSource(eGeometry)) / kTargetSize;
}

std::vector<unsigned char>& SourceSamples(const Work& oWork) {
    static std::map<std::pair<int, int>, std::vector<unsigned char>> oImages;
    auto& vbySamples = oImages[{oWork.eType, oWork.nChan}];
    if (vbySamples.empty()) {
        const bool bComplex = DataTypeAdapter::IsComplex(oWork.eType);
        const NativeDataTypeCode eReal = DataTypeAdapter::ComplexToScalar(oWork.eType);
        const std::size_t nBytes = static_cast<std::size_t>(DataTypeAdapter::ByteSize(eReal));
        const std::size_t nSamples = std::size_t{kSourceSize} * kSourceSize *
                                     static_cast<std::size_t>(oWork.nChan * (bComplex ? 2 : 1));
        vbySamples.resize(nSamples * nBytes);
        std::minstd_rand oRandom(1);
        for (std::size_t i = 0; i < nSamples; ++i) {
            const auto nValue = static_cast<std::uint16_t>(oRandom() % 200);
            const auto fValue = static_cast<float>(nValue);
            std::memcpy(&vbySamples[i * nBytes],
                        eReal == eDT_32R ? static_cast<const void*>(&fValue) : &nValue, nBytes);
        }
    }
    return vbySamples;
}

std::vector<unsigned char>& SourceMask() {
    static std::vector<unsigned char> vbyMask = [] {
        std::vector<unsigned char> vby(std::size_t{kSourceSize} * kSourceSize, 1);
        std::minstd_rand oRandom(2);
        for (auto& by : vby) {
            by = oRandom() % 100 != 0;
        }
        return vby;
    }();
    return vbyMask;
}

std::vector<unsigned char>& TargetSamples() {
    static std::vector<unsigned char> vbySamples(std::size_t{kTargetSize} * kTargetSize * 16);
    return vbySamples;
}

namespace {

std::vector<float> MakeRotated(double dfFirst, double dfPerCol, double dfPerRow) {
    std::vector<float> vfPositions(std::size_t{kTargetSize} * kTargetSize);
    for (std::size_t i = 0; i < vfPositions.size(); ++i) {
        const double x = static_cast<double>(i % kTargetSize);
        const double y = static_cast<double>(i / kTargetSize);
        vfPositions[i] = static_cast<float>(dfFirst + x * dfPerCol + y * dfPerRow);
    }
    return vfPositions;
}

const double kdfCos = 0.9 * std::cos(0.17);
const double kdfSin = 0.9 * std::sin(0.17);

}  // namespace

std::vector<float>& RotatedCols() {
    static std::vector<float> vfCols = MakeRotated(900.0, kdfCos, -kdfSin);
    return vfCols;
}
std::vector<float>& RotatedRows() {
    static std::vector<float> vfRows = MakeRotated(100.0, kdfSin, kdfCos);
    return vfRows;
}

std::int64_t RotatedAhead(double dfTgtRows) {
    return std::llround(dfTgtRows * kdfCos) * kSourceSize - std::llround(dfTgtRows * kdfSin);
}

std::vector<Work> AllWorks() {
    using Geometry = Work::Geometry;
    const char* const apszWindows[] = {"NEAR",    "BILIN",     "CUBIC",
                                       "CUBICPS", "LAGRANGE4", "LAGRANGE8",
                                       "SINC8",   "SINC16",    "GAUSSIAN,DSFACTORCOL=2"};
    std::vector<Work> voWorks;
    for (const Geometry eGeometry : {Geometry::eRotated, Geometry::eDown, Geometry::eUp}) {
        for (const char* pszMethod : apszWindows) {
            const Work oWork{eGeometry, pszMethod};
            voWorks.push_back(oWork);
            if (eGeometry != Geometry::eUp) {
                voWorks.push_back(oWork);
                voWorks.back().bMask = true;
                voWorks.push_back(oWork);
                voWorks.back().bAvx2 = true;
            }
        }
        for (const char* pszMethod : {"NEAR", "BILIN", "CUBIC"}) {
            for (const int nChan : {3, 4}) {
                voWorks.push_back({eGeometry, pszMethod, eDT_8U, nChan});
            }
            for (const NativeDataTypeCode eType : {eDT_16U, eDT_32R}) {
                voWorks.push_back({eGeometry, pszMethod, eType});
            }
            voWorks.push_back({eGeometry, pszMethod});
            voWorks.back().nThreads = 0;
            voWorks.push_back({eGeometry, pszMethod});
            voWorks.back().nTargetSize = 64;
        }
        for (const char* pszMethod : {"SQBILIN", "SQCUBIC", "SQSINC8"}) {
            voWorks.push_back({eGeometry, pszMethod});
        }
    }
    for (const char* pszMethod : {"AVERAGE,NUMCOLS=3,NUMROWS=3", "AVERAGE,NUMCOLS=31,NUMROWS=31",
                                  "MEDIAN,NUMCOLS=3,NUMROWS=3", "MEDIAN,NUMCOLS=5,NUMROWS=5",
                                  "MEDIAN,NUMCOLS=9,NUMROWS=9"}) {
        voWorks.push_back({Geometry::eUnit, pszMethod});
        voWorks.push_back({Geometry::eUnit, pszMethod});
        voWorks.back().bAvx2 = true;
    }
    voWorks.push_back({Geometry::eRotated, "CPLXSAR,NUMCOLS=7,NUMROWS=7", eDT_C32R});
    return voWorks;
}
