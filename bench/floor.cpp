#include "floor.h"

#include <algorithm>
#include <chrono>
#include <cstring>
#include <map>
#include <string>
#include <vector>

using namespace vetra::gobs;

namespace {

// The shortest of some runs, in nanoseconds.
template <typename Function>
double ShortestTime(const Function& fnRun) {
    double dfShortest = 1e30;
    for (int i = 0; i < 7; ++i) {
        const auto oBegin = std::chrono::steady_clock::now();
        fnRun();
        const std::chrono::duration<double, std::nano> oTime =
            std::chrono::steady_clock::now() - oBegin;
        dfShortest = std::min(dfShortest, oTime.count());
    }
    return dfShortest;
}

double MeasureBytes() {
    std::vector<char> vSrc(std::size_t{1} << 27, 1);
    std::vector<char> vTgt(vSrc.size());
    return 2.0 * static_cast<double>(vSrc.size()) /
           ShortestTime([&] { std::memcpy(vTgt.data(), vSrc.data(), vSrc.size()); });
}

// As many independent chains as the units of any processor need; additions and multiplications
// by turns, as filters have them.
#if defined(__x86_64__)
__attribute__((target_clones("avx512f", "avx2", "default")))
#endif
double
Compute(int nRounds) {
    constexpr int kChains = 128;
    double adfSum[kChains];
    double adfProduct[kChains];
    for (int i = 0; i < kChains; ++i) {
        adfSum[i] = i;
        adfProduct[i] = 1.0 + i * 1e-9;
    }
    for (int n = 0; n < nRounds; ++n) {
        for (int i = 0; i < kChains; ++i) {
            adfSum[i] = adfSum[i] + 0.25;
            adfProduct[i] = adfProduct[i] * 1.0000001;
        }
    }
    double dfResult = 0.0;
    for (int i = 0; i < kChains; ++i) {
        dfResult += adfSum[i] + adfProduct[i];
    }
    return dfResult;
}

double MeasureOperations() {
    constexpr int kRounds = 20000;
    volatile double dfSink = 0.0;
    return 2.0 * 128 * kRounds / ShortestTime([&] { dfSink = Compute(kRounds); });
}

// Additions and multiplications per pixel and channel.
double OperationsOf(const Work& oWork) {
    const std::map<std::string, int> oTaps = {{"CUBIC", 4},     {"CUBICPS", 4}, {"LAGRANGE4", 4},
                                              {"LAGRANGE8", 8}, {"SINC8", 8},   {"SINC16", 16},
                                              {"GAUSSIAN", 6},  {"CPLXSAR", 7}};
    std::string sMethod = oWork.MethodName();
    if (sMethod.rfind("SQ", 0) == 0) {
        sMethod = sMethod.substr(2);
    }
    if (sMethod == "BILIN") {
        return 7.0;
    }
    if (sMethod == "AVERAGE") {
        return 4.0;  // a column comes and leaves, a row comes and leaves
    }
    const auto it = oTaps.find(sMethod);
    if (it == oTaps.end()) {
        return 0.0;
    }
    // Of one direction: a cubic or Lagrange value takes more than its taps, and is counted as if
    // it didn't.
    const double dfFilter = 2.0 * it->second;
    if (sMethod == "CPLXSAR") {
        return (it->second * dfFilter * 2.0 + it->second * 8.0) / 2.0;
    }
    const bool bRows = oWork.eGeometry != Work::Geometry::eRotated;
    return dfFilter * (bRows ? 1.0 + ScaleOf(oWork.eGeometry) : it->second + 1.0);
}

double BytesOf(const Work& oWork) {
    const double dfSample = DataTypeAdapter::ByteSize(oWork.eType) * oWork.nChan;
    const bool bRotated = oWork.eGeometry == Work::Geometry::eRotated;
    const double dfScale = bRotated ? 0.9 : ScaleOf(oWork.eGeometry);
    return (bRotated ? 2.0 * sizeof(float) : 0.0) + dfScale * dfScale * dfSample + dfSample;
}

}  // namespace

const MachineRates& GetMachineRates() {
    static const MachineRates oRates = {MeasureBytes(), MeasureOperations()};
    return oRates;
}

double FloorOf(const Work& oWork) {
    const MachineRates& oRates = GetMachineRates();
    const int nValues = oWork.nChan * (DataTypeAdapter::IsComplex(oWork.eType) ? 2 : 1);
    return std::max(BytesOf(oWork) / oRates.dfBytesPerNs,
                    OperationsOf(oWork) * nValues / oRates.dfOperationsPerNs);
}
