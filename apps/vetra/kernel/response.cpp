#include "kernel/response.h"

#include <algorithm>
#include <cmath>
#include <complex>
#include <limits>
#include <numbers>

#include "rasterjob/interrupt.h"

namespace vetra::tool {

namespace {

using Complex = std::complex<double>;

constexpr double kPi = std::numbers::pi;
constexpr int kCoarsestGrid = 512;
// The response of n taps has lobes no narrower than 1/n.
constexpr int kStepsPerLobe = 4;

// The integral of exp(-2 pi i f t) from a to b.
Complex IntegrateWave(double f, double a, double b) {
    const double dfHalf = kPi * f * (b - a);
    const double dfSinc = dfHalf == 0.0 ? 1.0 : std::sin(dfHalf) / dfHalf;
    return std::polar(b - a, -kPi * f * (a + b)) * dfSinc;
}

double GetGain(const AxisFilter& oFilter, double f) {
    std::vector<Complex> vPhases;
    for (int nPhase = 0; nPhase <= oFilter.nSubPixels; ++nPhase) {
        // The fractions that round to the phase: half as many at both ends.
        const double dfSubPixels = std::max(oFilter.nSubPixels, 1);
        const double a = nPhase == 0 ? 0.0 : (nPhase - 0.5) / dfSubPixels;
        const double b = nPhase == oFilter.nSubPixels ? 1.0 : (nPhase + 0.5) / dfSubPixels;
        vPhases.push_back(IntegrateWave(f, a, b));
    }
    Complex oGain = 0.0;
    for (int nTap = 0; nTap < oFilter.nTaps; ++nTap) {
        Complex oTap = 0.0;
        for (int nPhase = 0; nPhase <= oFilter.nSubPixels; ++nPhase) {
            oTap += vPhases[static_cast<std::size_t>(nPhase)] * oFilter.GetWeight(nPhase, nTap);
        }
        oGain += oTap * std::polar(1.0, -2.0 * kPi * f * oFilter.GetFloor(nTap));
    }
    return std::abs(oGain);
}

void AddWeightFigures(const AxisFilter& oFilter, ResponseFigures& oFigures) {
    oFigures.dfSmallestSum = std::numeric_limits<double>::infinity();
    oFigures.dfLargestSum = -oFigures.dfSmallestSum;
    for (int nPhase = 0; nPhase <= oFilter.nSubPixels; ++nPhase) {
        // Sums over the first taps are the values beside a step down, one for each place of the
        // step in the window.
        double dfSum = 0.0;
        double dfLowest = 0.0;
        double dfHighest = 0.0;
        for (int nTap = 0; nTap < oFilter.nTaps; ++nTap) {
            const double w = oFilter.GetWeight(nPhase, nTap);
            dfSum += w;
            dfLowest = std::min(dfLowest, dfSum);
            dfHighest = std::max(dfHighest, dfSum);
            oFigures.dfSmallestWeight = std::min(oFigures.dfSmallestWeight, w);
        }
        // The level of a bright image is the whole sum.
        const double dfAbove = dfHighest - std::max(dfSum, 0.0);
        const double dfBelow = std::min(dfSum, 0.0) - dfLowest;
        oFigures.dfOvershoot = std::max({oFigures.dfOvershoot, dfAbove, dfBelow});
        oFigures.dfSmallestSum = std::min(oFigures.dfSmallestSum, dfSum);
        oFigures.dfLargestSum = std::max(oFigures.dfLargestSum, dfSum);
    }
}

}  // namespace

FrequencyGrid MakeGrid(const AxisFilter& oFilter, double dfFirst, double dfLast) {
    const int nLobes = (kStepsPerLobe * oFilter.nTaps + kCoarsestGrid - 1) / kCoarsestGrid;
    const int nPerCycle = kCoarsestGrid * std::max(nLobes, 1);
    return {dfFirst, 1.0 / nPerCycle, static_cast<int>((dfLast - dfFirst) * nPerCycle) + 1};
}

std::vector<double> GetGains(const AxisFilter& oFilter, const FrequencyGrid& oGrid) {
    std::vector<double> vdfGains;
    for (int n = 0; n < oGrid.nCount; ++n) {
        ThrowIfInterrupted();
        vdfGains.push_back(GetGain(oFilter, oGrid.Get(n)));
    }
    return vdfGains;
}

ResponseFigures GetFigures(const AxisFilter& oFilter) {
    ResponseFigures oFigures;
    oFigures.dfGainAtZero = GetGain(oFilter, 0.0);
    oFigures.dfGainAtHalfNyquist = GetGain(oFilter, 0.25);
    oFigures.dfGainAtNyquist = GetGain(oFilter, 0.5);
    const std::vector<double> vdfImages = GetGains(oFilter, MakeGrid(oFilter, 0.75, 2.0));
    oFigures.dfLargestImage = *std::max_element(vdfImages.begin(), vdfImages.end());
    AddWeightFigures(oFilter, oFigures);
    return oFigures;
}

}  // namespace vetra::tool
