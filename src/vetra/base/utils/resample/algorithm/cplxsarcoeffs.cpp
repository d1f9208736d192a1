#include "vetra/base/utils/resample/algorithm/cplxsarcoeffs.h"

#include <cmath>
#include <cstddef>
#include <limits>
#include <memory>
#include <new>

#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::utils {
namespace {

constexpr double kPi = 3.141592653589793;

using Table = std::unique_ptr<double[]>;

// The number of elements fits 62 bits. Without the test sanitizers would end the program instead.
Table MakeTable(int nNumPhases, int nTaps) {
    const std::ptrdiff_t nSize = static_cast<std::ptrdiff_t>(nNumPhases) * nTaps;
    if (nSize > std::numeric_limits<std::ptrdiff_t>::max() / std::ptrdiff_t{sizeof(double)}) {
        throw std::bad_array_new_length();
    }
    return Table(new double[static_cast<std::size_t>(nSize)]);
}

// The taps of one phase, not yet normalised. Returns their sum.
double FillTaps(double dfShift, int nTaps, double* padfTaps) {
    const int nHalf = (nTaps - 1) / 2;
    double dfSum = 0.0;
    double t = -dfShift - nHalf;
    for (int j = 0; j < nTaps; ++j, t += 1.0) {
        const double u = kPi * t;
        const double s = u == 0.0 ? 1.0 : std::sin(u) / u;
        const double w = 0.5 * std::cos(u / (nHalf + 1)) + 0.5;
        padfTaps[j] = w * s;
        dfSum += padfTaps[j];
    }
    return dfSum;
}

void FillAcross(double dfShift, int nTaps, double* padfTaps) {
    const double dfSum = FillTaps(dfShift, nTaps, padfTaps);
    for (int j = 0; j < nTaps; ++j) {
        padfTaps[j] /= dfSum;
    }
}

// The sum is that of the taps without carrier, which therefore keeps their level.
void FillDown(double dfShift, double dfFc, int nTaps, double* padfReal, double* padfImag) {
    const double dfSum = FillTaps(dfShift, nTaps, padfReal);
    const int nHalf = (nTaps - 1) / 2;
    double t = -dfShift - nHalf;
    for (int j = 0; j < nTaps; ++j, t += 1.0) {
        const double g = padfReal[j];
        const double a = (nHalf + t) * (dfFc * (-2.0 * kPi));
        padfReal[j] = g * std::cos(a) / dfSum;
        padfImag[j] = g * std::sin(a) / dfSum;
    }
}

void CheckPositive(int nValue, bool bOdd, const char* pszArgument, const char* pszWhat) {
    if (nValue < 1 || (bOdd && nValue % 2 == 0)) {
        const char* pszKind = bOdd ? "odd number" : "number";
        throw ParameterException(
            pszArgument, ParameterException::eInvalid, FormatString("%d", nValue),
            FormatString("Positive %s", pszKind),
            FormatString("The given %s (%d) must be a positive %s", pszWhat, nValue, pszKind),
            VETRA_HERE);
    }
}

}  // namespace

void GetCplxSarCoeffs(int nWndNumCols, int nWndNumRows, double dfFc, int nNumPhases,
                      double*& padfHorizontal, double*& padfVertReal, double*& padfVertImag) {
    CheckPositive(nWndNumCols, true, "nWndNumCols", "window width");
    CheckPositive(nWndNumRows, true, "nWndNumRows", "window height");
    CheckCentralFrequency(dfFc, VETRA_HERE);
    CheckPositive(nNumPhases, false, "nNumPhases", "number of phases");

    Table oHorizontal = MakeTable(nNumPhases, nWndNumCols);
    Table oVertReal = MakeTable(nNumPhases, nWndNumRows);
    Table oVertImag = MakeTable(nNumPhases, nWndNumRows);
    const double dfStep = 1.0 / nNumPhases;
    double* padfAcross = oHorizontal.get();
    double* padfReal = oVertReal.get();
    double* padfImag = oVertImag.get();
    for (int p = 0; p < nNumPhases; ++p) {
        const double dfShift = p * dfStep - 0.5;
        FillAcross(dfShift, nWndNumCols, padfAcross);
        FillDown(dfShift, dfFc, nWndNumRows, padfReal, padfImag);
        padfAcross += nWndNumCols;
        padfReal += nWndNumRows;
        padfImag += nWndNumRows;
    }
    padfHorizontal = oHorizontal.release();
    padfVertReal = oVertReal.release();
    padfVertImag = oVertImag.release();
}

}  // namespace vetra::utils
