#include "reference.h"

#include <cmath>
#include <cstdint>
#include <limits>
#include <type_traits>

using namespace vetra::utils;
using namespace vetra::gobs;

namespace {

// A limit or background as T.
template <typename T>
T Saturate(double df) {
    if (std::isnan(df)) return std::numeric_limits<T>::lowest();
    const long double v = df;
    const long double lowest = std::numeric_limits<T>::lowest();
    const long double highest = std::numeric_limits<T>::max();
    return static_cast<T>(v < lowest ? lowest : v > highest ? highest : v);
}

// Clamp limits moved off the background, and the storing of values.
template <typename T>
class Storer {
 public:
    static constexpr bool kInteger = std::is_integral_v<T>;

    explicit Storer(const ResampleInfo& oInfo)
        : mLow(Saturate<T>(oInfo.mdfClampMin)),
          mHigh(Saturate<T>(oInfo.mdfClampMax)),
          mBackground(Saturate<T>(oInfo.mdfOutBgd)) {
        if (!oInfo.mbClampBgd) return;
        mbAvoid = mLow <= mBackground && mBackground <= mHigh;
        if (IsBackground(mLow)) {
            mLow = Above();
            mbAvoid = false;
        }
        if (IsBackground(mHigh)) {
            mHigh = Below();
            mbAvoid = false;
        }
    }

    T Background() const { return mBackground; }

    T Store(double df) const {
        T value;
        if constexpr (kInteger) {
            const double dfRounded = std::nearbyint(df);
            if (!(static_cast<long double>(dfRounded) >= static_cast<long double>(mLow))) {
                return mLow;
            }
            if (static_cast<long double>(dfRounded) > static_cast<long double>(mHigh)) return mHigh;
            value = static_cast<T>(dfRounded);
        } else {
            if (df < static_cast<double>(mLow)) return mLow;
            if (df > static_cast<double>(mHigh)) return mHigh;
            value = static_cast<T>(df);
        }
        if (mbAvoid && IsBackground(value)) {
            value = Above();
            if (value > mHigh) value = Below();
        }
        return value;
    }

 private:
    bool IsBackground(T value) const {
        if constexpr (kInteger) return value == mBackground;
        return std::fabs(static_cast<double>(value) - static_cast<double>(mBackground)) <
               static_cast<double>(T(1e-5));
    }
    T Above() const {
        if constexpr (kInteger) return static_cast<T>(static_cast<std::uint64_t>(mBackground) + 1);
        return mBackground + T(1e-5);
    }
    T Below() const {
        if constexpr (kInteger) return static_cast<T>(static_cast<std::uint64_t>(mBackground) - 1);
        return mBackground - T(1e-5);
    }

    T mLow;
    T mHigh;
    T mBackground;
    bool mbAvoid = false;
};

struct SourceMask {
    const unsigned char* pabyMask;
    int nCols;
    int nRows;

    bool Inside(double dfCol, double dfRow) const {  // whole numbers
        return dfCol >= 0 && dfRow >= 0 && dfCol < nCols && dfRow < nRows;
    }
    int Byte(double dfCol, double dfRow) const {
        return pabyMask == nullptr ? 1
                                   : pabyMask[static_cast<long long>(dfRow) * nCols +
                                              static_cast<long long>(dfCol)];
    }
};

bool IsSquared(ResampleMethod eMethod) { return eMethod >= eRM_SQBILIN && eMethod != eRM_CUSTOM; }

ResampleMethod PlainTwin(ResampleMethod eMethod) {
    const ResampleMethod aePlain[] = {eRM_BILIN,     eRM_CUBIC,     eRM_CUBICPS,  eRM_NEAR,
                                      eRM_SINC8,     eRM_SINC16,    eRM_AVERAGE,  eRM_MEDIAN,
                                      eRM_LAGRANGE4, eRM_LAGRANGE8, eRM_GAUSSIAN, eRM_KERNEL};
    return IsSquared(eMethod) ? aePlain[eMethod - eRM_SQBILIN] : eMethod;
}

// What a run's method needs, with its squared twin apart.
struct PlainMethod {
    explicit PlainMethod(const ResampleInfo& oInfo)
        : eMethod(PlainTwin(oInfo.meMethod)),
          bSquared(IsSquared(oInfo.meMethod)),
          pdfWeights(oInfo.mvdfKernelWeights.data()) {
        switch (eMethod) {
            case eRM_NEAR:
                nCols = nRows = 1;
                bAnchorNearest = true;
                break;
            case eRM_BILIN:
                nCols = nRows = 2;
                break;
            case eRM_LAGRANGE8:
            case eRM_SINC8:
                nCols = nRows = 8;
                break;
            case eRM_SINC16:
                nCols = nRows = 16;
                break;
            case eRM_AVERAGE:
            case eRM_MEDIAN:
            case eRM_GAUSSIAN:
            case eRM_KERNEL:
            case eRM_CPLXSAR:
                oInfo.GetCoefficientInt("NUMCOLS", nCols, true);
                oInfo.GetCoefficientInt("NUMROWS", nRows, true);
                if (eMethod == eRM_KERNEL) {
                    oInfo.GetCoefficientInt("NUMSUBPIXELS", nSubPixels, true);
                }
                oInfo.GetCoefficientDouble("FC", dfFc, false);
                bAnchorNearest = eMethod != eRM_GAUSSIAN && eMethod != eRM_KERNEL;
                break;
            default:
                nCols = nRows = 4;
                break;
        }
        nBeforeCol = (nCols - 1) / 2;
        nBeforeRow = (nRows - 1) / 2;
        if (eMethod == eRM_AVERAGE || eMethod == eRM_MEDIAN) nBeforeCol = nBeforeRow = 0;
    }

    double Anchor(double dfPos) const { return std::floor(bAnchorNearest ? dfPos + 0.5 : dfPos); }

    ResampleMethod eMethod;
    bool bSquared;
    const double* pdfWeights;
    int nCols = 0;
    int nRows = 0;
    int nBeforeCol = 0;  // pixels of the window before the anchor
    int nBeforeRow = 0;
    bool bAnchorNearest = false;
    int nSubPixels = 64;
    double dfFc = 0;
};

using Samples = std::vector<double>;  // of a window, row by row

double Cubic(const double* p, double t) {
    double a = p[0] + p[0];
    a = a - p[1];
    a = a - p[1];
    a = a + p[2];
    a = a - p[3];
    double b = p[1] - p[0];
    b = b - p[2];
    b = b + p[3];
    const double c = p[2] - p[0];
    return ((a + b * t) * t + c) * t + p[1];
}

double Lagrange4(const double* p, double t) {
    if (t == 0.0) return p[1];
    const double u = t + 1.0;
    const double d0 = u;
    const double d1 = u - 1.0;
    const double d2 = u - 2.0;
    const double d3 = u - 3.0;
    double value = p[1] * d0 * d2 * d3 * 0.5;
    value = value - (d1 * p[0] * d2 * d3) / 6.0;
    value = value - p[2] * d0 * d1 * d3 * 0.5;
    return value + (p[3] * d0 * d1 * d2) / 6.0;
}

double Lagrange8(const double* p, double t) {
    if (t == 0.0) return p[3];
    const double u = t + 3.0;
    const double kadfDivisor[] = {5040, 720, 240, 144, 144, 240, 720, 5040};
    double term[8];
    for (int k = 0; k < 8; ++k) {
        double product = 1.0;
        for (int j = 0; j < 8; ++j) {
            if (j != k) product = product * (u - j);
        }
        term[k] = p[k] * product / kadfDivisor[k];
    }
    return term[1] - term[0] - term[2] + term[3] - term[4] + term[5] - term[6] + term[7];
}

int ChooseMode(int nRequest, const SourceMask& oMask, double dfCol, double dfRow,
               const PlainMethod& oMethod, NodataFillAction eFillAction) {
    const bool bReplaces = oMethod.eMethod == eRM_CUBICPS;
    if (!bReplaces && (nRequest == 0 || nRequest == 3)) return nRequest;
    const double dfNearCol = std::floor(dfCol + 0.5);
    const double dfNearRow = std::floor(dfRow + 0.5);
    const bool bInside = oMask.Inside(dfNearCol, dfNearRow);
    if (oMethod.eMethod == eRM_NEAR) {
        if (!bInside || oMask.Byte(dfNearCol, dfNearRow) == 0) return 0;
        return nRequest <= 2 ? 2 : 3;
    }
    const int nUsable = bInside && oMask.Byte(dfNearCol, dfNearRow) == 1 ? 2 : 0;
    if (!bReplaces && nRequest == 2) return nUsable;
    bool bWhole = true;
    for (int y = 0; y < oMethod.nRows && bWhole; ++y) {
        for (int x = 0; x < oMethod.nCols && bWhole; ++x) {
            const double dfX = oMethod.Anchor(dfCol) - oMethod.nBeforeCol + x;
            const double dfY = oMethod.Anchor(dfRow) - oMethod.nBeforeRow + y;
            bWhole = oMask.Inside(dfX, dfY) && (bReplaces || oMask.Byte(dfX, dfY) != 0);
        }
    }
    if (bReplaces) {
        if (!bWhole || !bInside || oMask.Byte(dfNearCol, dfNearRow) == 0) return 0;
        return nRequest <= 2 ? nRequest : 3;
    }
    if (bWhole) return 1;
    return eFillAction == eNFA_BGD ? 0 : nUsable;
}

double Bilinear(const Samples& p, double dx, double dy) {
    const double w00 = (1 - dx) * (1 - dy);
    const double w10 = (1 - dy) * dx;
    const double w01 = (1 - dx) * dy;
    const double w11 = dy * dx;
    double v = p[1] * w10;
    v = v + p[0] * w00;
    v = v + p[2] * w01;
    return v + p[3] * w11;
}

// First along each row, then along the row values.
double AlongBoth(const Samples& p, int nSize, double (*fnAlong)(const double*, double), double dx,
                 double dy) {
    double rows[8];
    for (int y = 0; y < nSize; ++y) rows[y] = fnAlong(&p[static_cast<std::size_t>(y * nSize)], dx);
    return fnAlong(rows, dy);
}

int Phase(double dfFrac, int nSubPixels, int nLast) {
    const double dfPhase = std::floor(dfFrac * nSubPixels + 0.5);
    return dfPhase < 0 ? 0 : dfPhase > nLast ? nLast : static_cast<int>(dfPhase);
}

double Convolve(const PlainMethod& oMethod, const Samples& p, const double* pdfAcross,
                const double* pdfDown) {
    std::size_t i = 0;
    double sum = 0.0;
    for (int y = 0; y < oMethod.nRows; ++y) {
        double row = 0.0;
        for (int x = 0; x < oMethod.nCols; ++x) row += p[i++] * pdfAcross[x];
        sum += row * pdfDown[y];
    }
    return sum;
}

double Kernel(const PlainMethod& oMethod, const Samples& p, double dx, double dy) {
    const int S = oMethod.nSubPixels;
    const double* pdfDown = oMethod.pdfWeights;
    if (oMethod.eMethod == eRM_GAUSSIAN || oMethod.eMethod == eRM_KERNEL) {
        pdfDown += (S + 1) * oMethod.nCols;
    }
    return Convolve(oMethod, p, oMethod.pdfWeights + Phase(dx, S, S) * oMethod.nCols,
                    pdfDown + Phase(dy, S, S) * oMethod.nRows);
}

double Mean(const Samples& p) {
    double sum = 0.0;
    for (const double s : p) sum += s;
    return sum / static_cast<double>(p.size());
}

// Hoare's selection; a copy, since it reorders.
double Median(Samples a) {
    const int n = static_cast<int>(a.size());
    const int k = n % 2 == 1 ? n / 2 : n / 2 - 1;
    const auto at = [&](int i) -> double& { return a[static_cast<std::size_t>(i)]; };
    int left = 0;
    int right = n - 1;
    while (left < right) {
        const double p = at(k);
        int i = left;
        int j = right;
        do {
            while (p > at(i)) i++;
            while (at(j) > p) j--;
            if (i <= j) {
                std::swap(at(i), at(j));
                i++;
                j--;
            }
        } while (i <= j);
        if (j < k) left = i;
        if (k < i) right = j;
    }
    return at(k);
}

// Taps of the radar filter in one phase: the raised cosine times sinc, not yet normalised.
Samples RadarTaps(int n, int nPhase, double* pdfSum, Samples* pvdfAngle, double dfFc) {
    const double pi = 3.141592653589793;
    const double f = nPhase * (1.0 / 64) - 0.5;
    const int half = (n - 1) / 2;
    Samples g;
    *pdfSum = 0.0;
    double t = -f - half;
    for (int j = 0; j < n; ++j) {
        const double u = pi * t;
        const double s = u == 0.0 ? 1.0 : std::sin(u) / u;
        g.push_back((0.5 * std::cos(u / (half + 1)) + 0.5) * s);
        *pdfSum += g.back();
        pvdfAngle->push_back((half + t) * (dfFc * -2 * pi));
        t += 1.0;
    }
    return g;
}

// The real part, or the imaginary one.
double Radar(const PlainMethod& oMethod, const Samples& re, const Samples& im, double dx, double dy,
             bool bImaginary) {
    double dfSumX;
    double dfSumY;
    Samples angle;
    const Samples across =
        RadarTaps(oMethod.nCols, Phase(dx + 0.5, 64, 63), &dfSumX, &angle, oMethod.dfFc);
    angle.clear();
    const Samples down =
        RadarTaps(oMethod.nRows, Phase(dy + 0.5, 64, 63), &dfSumY, &angle, oMethod.dfFc);
    double out = 0.0;
    std::size_t i = 0;
    for (std::size_t y = 0; y < down.size(); ++y) {
        double rowRe = 0.0;
        double rowIm = 0.0;
        for (std::size_t x = 0; x < across.size(); ++x, ++i) {
            rowRe += re[i] * (across[x] / dfSumX);
            rowIm += im[i] * (across[x] / dfSumX);
        }
        const double c = down[y] * std::cos(angle[y]) / dfSumY;
        const double d = down[y] * std::sin(angle[y]) / dfSumY;
        out += bImaginary ? d * rowRe + c * rowIm : c * rowRe - d * rowIm;
    }
    return out;
}

double PlainValue(const PlainMethod& oMethod, const Samples& p, double dx, double dy) {
    switch (oMethod.eMethod) {
        case eRM_BILIN:
            return Bilinear(p, dx, dy);
        case eRM_CUBIC:
        case eRM_CUBICPS:
            return AlongBoth(p, 4, &Cubic, dx, dy);
        case eRM_LAGRANGE4:
            return AlongBoth(p, 4, &Lagrange4, dx, dy);
        case eRM_LAGRANGE8:
            return AlongBoth(p, 8, &Lagrange8, dx, dy);
        case eRM_AVERAGE:
            return Mean(p);
        case eRM_MEDIAN:
            return Median(p);
        default:
            return Kernel(oMethod, p, dx, dy);
    }
}

// The value of channel nChannel in mode 1. fnSample gives a channel's sample at a source pixel.
template <typename Function>
double Interpolate(const PlainMethod& oMethod, const SourceMask& oMask, double dfCol, double dfRow,
                   int nChannel, const Function& fnSample) {
    const double dfX0 = oMethod.Anchor(dfCol) - oMethod.nBeforeCol;
    const double dfY0 = oMethod.Anchor(dfRow) - oMethod.nBeforeRow;
    const auto fnWindow = [&](int c) {
        Samples p;
        for (int y = 0; y < oMethod.nRows; ++y) {
            for (int x = 0; x < oMethod.nCols; ++x) {
                double dfX = dfX0 + x;
                double dfY = dfY0 + y;
                if (oMethod.eMethod == eRM_CUBICPS && oMask.Byte(dfX, dfY) == 0) {
                    dfX = std::floor(dfCol + 0.5);
                    dfY = std::floor(dfRow + 0.5);
                }
                const double s =
                    fnSample(static_cast<long long>(dfX), static_cast<long long>(dfY), c);
                p.push_back(!oMethod.bSquared ? s : s > 0.0 ? std::sqrt(s) : 0.0);
            }
        }
        return p;
    };
    const double dx = dfCol - oMethod.Anchor(dfCol);
    const double dy = dfRow - oMethod.Anchor(dfRow);
    double v;
    if (oMethod.eMethod == eRM_CPLXSAR) {
        const int nReal = nChannel / 2 * 2;
        v = Radar(oMethod, fnWindow(nReal), fnWindow(nReal + 1), dx, dy, nChannel % 2 == 1);
    } else {
        v = PlainValue(oMethod, fnWindow(nChannel), dx, dy);
    }
    v = oMethod.bSquared ? v * v : v;
    return std::isnan(v) ? std::numeric_limits<double>::quiet_NaN() : v;
}

template <typename Tin, typename Tout>
void Run(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
         const ResampleInfo& oInfo, std::vector<unsigned char>& vbyOutcome) {
    const Storer<Tout> oStorer(oInfo);
    const PlainMethod oMethod(oInfo);
    const int nChan = oSrc.GetNumChan();
    const long long nPitch = static_cast<long long>(oSrc.GetNumCols()) * nChan;
    const Tin* pSrc = reinterpret_cast<const Tin*>(oSrc.GetBuf());
    const SourceMask oMask{oSrc.GetMask(), oSrc.GetNumCols(), oSrc.GetNumRows()};
    const auto fnSample = [&](long long x, long long y, int c) {
        return static_cast<double>(pSrc[y * nPitch + x * nChan + c]);
    };
    // These two take negative nearest samples as they are.
    const bool bNonNegative =
        oMethod.bSquared && oMethod.eMethod != eRM_GAUSSIAN && oMethod.eMethod != eRM_KERNEL;
    const long long nPix = static_cast<long long>(oTgt.GetNumCols()) * oTgt.GetNumRows();
    vbyOutcome.assign(static_cast<std::size_t>(nPix), 0);
    for (long long i = 0; i < nPix; ++i) {
        double dfCol = 0;
        double dfRow = 0;
        oTfm.GetSrcPos(i, dfCol, dfRow);
        const int nRequest = oTgt.GetMask() == nullptr ? 1 : oTgt.GetMask()[i];
        const int nMode =
            ChooseMode(nRequest, oMask, dfCol, dfRow, oMethod, oInfo.meNodataFillAction);
        vbyOutcome[static_cast<std::size_t>(i)] = static_cast<unsigned char>(nMode);
        for (int c = 0; c < nChan; ++c) {
            Tout* pTgt = reinterpret_cast<Tout*>(oTgt.GetBuf()) + i * nChan + c;
            if (nMode == 0) {
                *pTgt = oStorer.Background();
            } else if (nMode == 1) {
                *pTgt = oStorer.Store(Interpolate(oMethod, oMask, dfCol, dfRow, c, fnSample));
            } else if (nMode == 2) {
                const double s = fnSample(static_cast<long long>(std::floor(dfCol + 0.5)),
                                          static_cast<long long>(std::floor(dfRow + 0.5)), c);
                *pTgt = oStorer.Store(bNonNegative && 0.0 > s ? 0.0 : s);
            }
        }
    }
}

template <typename Function>
void WithType(NativeDataTypeCode eType, const Function& fn) {
    switch (eType) {
        case eDT_8U:
            return fn(static_cast<unsigned char>(0));
        case eDT_8S:
            return fn(static_cast<signed char>(0));
        case eDT_16U:
            return fn(static_cast<unsigned short>(0));
        case eDT_16S:
            return fn(static_cast<short>(0));
        case eDT_32U:
            return fn(0u);
        case eDT_32S:
            return fn(0);
        case eDT_32R:
            return fn(0.0f);
        case eDT_64U:
            return fn(std::uint64_t{0});
        case eDT_64S:
            return fn(std::int64_t{0});
        default:
            return fn(0.0);
    }
}

}  // namespace

void ReferenceResample(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
                       const ResampleInfo& oInfo, std::vector<unsigned char>& vbyOutcome) {
    WithType(oSrc.GetDatatype(), [&]<typename Tin>(Tin) {
        if (oSrc.GetDatatype() == oTgt.GetDatatype()) {
            Run<Tin, Tin>(oSrc, oTgt, oTfm, oInfo, vbyOutcome);
        } else if (oTgt.GetDatatype() == eDT_32R) {
            Run<Tin, float>(oSrc, oTgt, oTfm, oInfo, vbyOutcome);
        } else {
            WithType(oTgt.GetDatatype(), [&]<typename Tout>(Tout) {
                Run<float, Tout>(oSrc, oTgt, oTfm, oInfo, vbyOutcome);
            });
        }
    });
}
