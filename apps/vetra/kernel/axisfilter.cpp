#include "kernel/axisfilter.h"

#include <complex>
#include <memory>
#include <numbers>

#include "kernel/kernelweights.h"
#include "vetra/base/utils/resample/algorithm/cplxsarcoeffs.h"

namespace vetra::tool {

namespace {

constexpr int kRadarPhases = 64;

// The tables of complex radar sampling count from the nearest pixel: a fraction of a half or more
// is a negative shift from the next pixel. As a filter that counts from the floor they have one tap
// more.
template <typename Table>
AxisFilter CountFromFloor(int nTaps, const Table& fnWeight) {
    AxisFilter oFilter{nTaps + 1, kRadarPhases, {}, 0.0};
    for (int nPhase = 0; nPhase <= kRadarPhases; ++nPhase) {
        const int nNearest = nPhase < kRadarPhases / 2 ? 0 : 1;
        const int nTablePhase = nPhase + kRadarPhases / 2 - nNearest * kRadarPhases;
        for (int nTap = 0; nTap <= nTaps; ++nTap) {
            const int nTableTap = nTap - nNearest;
            oFilter.vdfWeights.push_back(
                nTableTap >= 0 && nTableTap < nTaps ? fnWeight(nTablePhase, nTableTap) : 0.0);
        }
    }
    return oFilter;
}

MethodFilters GetRadarFilters(const utils::ResampleInfo& oInfo) {
    int nCols, nRows;
    double dfFc = 0.0;
    oInfo.GetCoefficientInt("NUMCOLS", nCols, true);
    oInfo.GetCoefficientInt("NUMROWS", nRows, true);
    oInfo.GetCoefficientDouble("FC", dfFc, true);
    double* padfCols = nullptr;
    double* padfReal = nullptr;
    double* padfImag = nullptr;
    utils::GetCplxSarCoeffs(nCols, nRows, dfFc, kRadarPhases, padfCols, padfReal, padfImag);
    const std::unique_ptr<double[]> poCols(padfCols);
    const std::unique_ptr<double[]> poReal(padfReal);
    const std::unique_ptr<double[]> poImag(padfImag);
    const auto At = [](int nTaps, int nPhase, int nTap) {
        return static_cast<std::size_t>(nPhase * nTaps + nTap);
    };
    const auto ColWeight = [&](int nPhase, int nTap) { return padfCols[At(nCols, nPhase, nTap)]; };
    const auto RowWeight = [&](int nPhase, int nTap) {
        const std::size_t n = At(nRows, nPhase, nTap);
        const double dfShift = static_cast<double>(nPhase) / kRadarPhases - 0.5;
        const double dfTurn = 2.0 * std::numbers::pi * dfFc * (nTap - dfShift);
        return (std::complex<double>(padfReal[n], padfImag[n]) * std::polar(1.0, dfTurn)).real();
    };
    MethodFilters oFilters{CountFromFloor(nCols, ColWeight), CountFromFloor(nRows, RowWeight)};
    oFilters.oRows.dfCarrier = dfFc;
    return oFilters;
}

}  // namespace

MethodFilters GetMethodFilters(const utils::IRasterResampler& oResampler) {
    if (oResampler.GetResampleType() == eRM_CPLXSAR) {
        return GetRadarFilters(oResampler.GetResampleInfo());
    }
    const KernelWeights oWeights = GetKernelWeights(oResampler);
    const auto oFirst = oWeights.vdfWeights.begin();
    const auto oMiddle =
        oFirst + static_cast<std::ptrdiff_t>(oWeights.nSubPixels + 1) * oWeights.nCols;
    return {{oWeights.nCols, oWeights.nSubPixels, {oFirst, oMiddle}, 0.0},
            {oWeights.nRows, oWeights.nSubPixels, {oMiddle, oWeights.vdfWeights.end()}, 0.0}};
}

}  // namespace vetra::tool
