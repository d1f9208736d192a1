#include "vetra/base/utils/resample/algorithm/sinctable.h"

#include <cmath>
#include <cstddef>

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"

namespace vetra::utils {

std::vector<double> MakeSincTable(const ShapingWindow& oWindow, int nTaps) {
    constexpr double kPi = 3.141592653589793;
    constexpr double kStep = 1.0 / kTabulatedSubPixels;
    const double dfHalfWidth = nTaps / 2;
    const int nFloorTap = nTaps / 2 - 1;
    std::vector<double> vdfTable(static_cast<std::size_t>(nTaps * (kTabulatedSubPixels + 1)));
    double* padfTaps = vdfTable.data();
    padfTaps[nFloorTap] = 1.0;
    for (int p = 1; p < kTabulatedSubPixels; ++p) {
        padfTaps += nTaps;
        const double dfCentre = p * kStep + nFloorTap;
        double dfSum = 0.0;
        for (int j = 0; j < nTaps; ++j) {
            const double d = j - dfCentre;  // never 0
            padfTaps[j] = std::sin(d * kPi) * oWindow.GetValue(d, dfHalfWidth) / (d * kPi);
            dfSum += padfTaps[j];
        }
        for (int j = 0; j < nTaps; ++j) {
            padfTaps[j] /= dfSum;
        }
    }
    padfTaps += nTaps;
    padfTaps[nFloorTap + 1] = 1.0;
    return vdfTable;
}

ResampleInfo SincInfo(ResampleMethod eMethod, const ShapingWindow& oWindow, int nTaps) {
    ResampleInfo oInfo = MethodInfo(eMethod);
    oInfo.mvdfKernelWeights = MakeSincTable(oWindow, nTaps);
    oWindow.ToCoefficients(oInfo.moCoefficients);
    return oInfo;
}

}  // namespace vetra::utils
