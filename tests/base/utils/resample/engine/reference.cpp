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

// What a method does with a window of nSize x nSize pixels, nBefore of them before the position's.
struct PlainMethod {
    int nSize;
    int nBefore;
    double (*fnAlong)(const double* p, double t);  // null: bilinear
};

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

bool IsSquared(ResampleMethod eMethod) { return eMethod >= eRM_SQBILIN && eMethod != eRM_CUSTOM; }
bool IsOneOf(ResampleMethod eMethod, ResampleMethod ePlain, ResampleMethod eSquared) {
    return eMethod == ePlain || eMethod == eSquared;
}

PlainMethod GetMethod(ResampleMethod eMethod) {
    if (IsOneOf(eMethod, eRM_BILIN, eRM_SQBILIN)) return {2, 0, nullptr};
    if (IsOneOf(eMethod, eRM_LAGRANGE4, eRM_SQLAGRANGE4)) return {4, 1, &Lagrange4};
    if (IsOneOf(eMethod, eRM_LAGRANGE8, eRM_SQLAGRANGE8)) return {8, 3, &Lagrange8};
    return {4, 1, &Cubic};
}

int ChooseMode(int nRequest, const SourceMask& oMask, double dfCol, double dfRow,
               const ResampleInfo& oInfo) {
    const bool bReplaces = IsOneOf(oInfo.meMethod, eRM_CUBICPS, eRM_SQCUBICPS);
    if (!bReplaces && (nRequest == 0 || nRequest == 3)) return nRequest;
    const double dfNearCol = std::floor(dfCol + 0.5);
    const double dfNearRow = std::floor(dfRow + 0.5);
    const bool bInside = oMask.Inside(dfNearCol, dfNearRow);
    if (IsOneOf(oInfo.meMethod, eRM_NEAR, eRM_SQNEAR)) {
        if (!bInside || oMask.Byte(dfNearCol, dfNearRow) == 0) return 0;
        return nRequest <= 2 ? 2 : 3;
    }
    const int nUsable = bInside && oMask.Byte(dfNearCol, dfNearRow) == 1 ? 2 : 0;
    if (!bReplaces && nRequest == 2) return nUsable;
    const PlainMethod oMethod = GetMethod(oInfo.meMethod);
    bool bWhole = true;
    for (int y = 0; y < oMethod.nSize; ++y) {
        for (int x = 0; x < oMethod.nSize; ++x) {
            const double dfX = std::floor(dfCol) - oMethod.nBefore + x;
            const double dfY = std::floor(dfRow) - oMethod.nBefore + y;
            bWhole = bWhole && oMask.Inside(dfX, dfY) && (bReplaces || oMask.Byte(dfX, dfY) != 0);
        }
    }
    if (bReplaces) {
        if (!bWhole || !bInside || oMask.Byte(dfNearCol, dfNearRow) == 0) return 0;
        return nRequest <= 2 ? nRequest : 3;
    }
    if (bWhole) return 1;
    return oInfo.meNodataFillAction == eNFA_BGD ? 0 : nUsable;
}

double Bilinear(const double (&p)[8][8], double dx, double dy) {
    const double w00 = (1 - dx) * (1 - dy);
    const double w10 = (1 - dy) * dx;
    const double w01 = (1 - dx) * dy;
    const double w11 = dy * dx;
    double v = p[0][1] * w10;
    v = v + p[0][0] * w00;
    v = v + p[1][0] * w01;
    return v + p[1][1] * w11;
}

// The value in mode 1. fnSample gives the channel's sample at a source pixel.
template <typename Function>
double Interpolate(const ResampleInfo& oInfo, const SourceMask& oMask, double dfCol, double dfRow,
                   const Function& fnSample) {
    const PlainMethod oMethod = GetMethod(oInfo.meMethod);
    const bool bReplaces = IsOneOf(oInfo.meMethod, eRM_CUBICPS, eRM_SQCUBICPS);
    const bool bSquared = IsSquared(oInfo.meMethod);
    double p[8][8];
    for (int y = 0; y < oMethod.nSize; ++y) {
        for (int x = 0; x < oMethod.nSize; ++x) {
            double dfX = std::floor(dfCol) - oMethod.nBefore + x;
            double dfY = std::floor(dfRow) - oMethod.nBefore + y;
            if (bReplaces && oMask.Byte(dfX, dfY) == 0) {
                dfX = std::floor(dfCol + 0.5);
                dfY = std::floor(dfRow + 0.5);
            }
            const double s = fnSample(static_cast<long long>(dfX), static_cast<long long>(dfY));
            p[y][x] = !bSquared ? s : s > 0.0 ? std::sqrt(s) : 0.0;
        }
    }
    const double dx = dfCol - std::floor(dfCol);
    const double dy = dfRow - std::floor(dfRow);
    double v;
    if (oMethod.fnAlong == nullptr) {
        v = Bilinear(p, dx, dy);
    } else {
        double rows[8];
        for (int y = 0; y < oMethod.nSize; ++y) rows[y] = oMethod.fnAlong(p[y], dx);
        v = oMethod.fnAlong(rows, dy);
    }
    v = bSquared ? v * v : v;
    return std::isnan(v) ? std::numeric_limits<double>::quiet_NaN() : v;
}

template <typename Tin, typename Tout>
void Run(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
         const ResampleInfo& oInfo, std::vector<unsigned char>& vbyOutcome) {
    const Storer<Tout> oStorer(oInfo);
    const int nChan = oSrc.GetNumChan();
    const long long nPitch = static_cast<long long>(oSrc.GetNumCols()) * nChan;
    const Tin* pSrc = reinterpret_cast<const Tin*>(oSrc.GetBuf());
    const SourceMask oMask{oSrc.GetMask(), oSrc.GetNumCols(), oSrc.GetNumRows()};
    const long long nPix = static_cast<long long>(oTgt.GetNumCols()) * oTgt.GetNumRows();
    vbyOutcome.assign(static_cast<std::size_t>(nPix), 0);
    for (long long i = 0; i < nPix; ++i) {
        double dfCol = 0;
        double dfRow = 0;
        oTfm.GetSrcPos(i, dfCol, dfRow);
        const int nRequest = oTgt.GetMask() == nullptr ? 1 : oTgt.GetMask()[i];
        const int nMode = ChooseMode(nRequest, oMask, dfCol, dfRow, oInfo);
        vbyOutcome[static_cast<std::size_t>(i)] = static_cast<unsigned char>(nMode);
        for (int c = 0; c < nChan; ++c) {
            const auto fnSample = [&](long long x, long long y) {
                return static_cast<double>(pSrc[y * nPitch + x * nChan + c]);
            };
            Tout* pTgt = reinterpret_cast<Tout*>(oTgt.GetBuf()) + i * nChan + c;
            if (nMode == 0) {
                *pTgt = oStorer.Background();
            } else if (nMode == 1) {
                *pTgt = oStorer.Store(Interpolate(oInfo, oMask, dfCol, dfRow, fnSample));
            } else if (nMode == 2) {
                const double s = fnSample(static_cast<long long>(std::floor(dfCol + 0.5)),
                                          static_cast<long long>(std::floor(dfRow + 0.5)));
                *pTgt = oStorer.Store(IsSquared(oInfo.meMethod) && 0.0 > s ? 0.0 : s);
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
