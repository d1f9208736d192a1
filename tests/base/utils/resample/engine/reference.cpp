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

int ChooseMode(int nRequest, const SourceMask& oMask, double dfCol, double dfRow,
               const ResampleInfo& oInfo) {
    if (nRequest == 0 || nRequest == 3) return nRequest;
    const double dfNearCol = std::floor(dfCol + 0.5);
    const double dfNearRow = std::floor(dfRow + 0.5);
    const bool bInside = oMask.Inside(dfNearCol, dfNearRow);
    if (oInfo.meMethod == eRM_NEAR) {
        if (!bInside || oMask.Byte(dfNearCol, dfNearRow) == 0) return 0;
        return nRequest <= 2 ? 2 : 3;
    }
    const int nUsable = bInside && oMask.Byte(dfNearCol, dfNearRow) == 1 ? 2 : 0;
    if (nRequest == 2) return nUsable;
    bool bWhole = true;  // the bilinear window
    for (int y = 0; y < 2; ++y) {
        for (int x = 0; x < 2; ++x) {
            const double dfX = std::floor(dfCol) + x;
            const double dfY = std::floor(dfRow) + y;
            bWhole = bWhole && oMask.Inside(dfX, dfY) && oMask.Byte(dfX, dfY) != 0;
        }
    }
    if (bWhole) return 1;
    return oInfo.meNodataFillAction == eNFA_BGD ? 0 : nUsable;
}

template <typename Tin>
double Bilinear(const Tin* p, long long nPitch, int nChan, double dx, double dy) {
    const double w00 = (1 - dx) * (1 - dy);
    const double w10 = (1 - dy) * dx;
    const double w01 = (1 - dx) * dy;
    const double w11 = dy * dx;
    double v = static_cast<double>(p[nChan]) * w10;
    v = v + static_cast<double>(p[0]) * w00;
    v = v + static_cast<double>(p[nPitch]) * w01;
    v = v + static_cast<double>(p[nPitch + nChan]) * w11;
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
            Tout* pTgt = reinterpret_cast<Tout*>(oTgt.GetBuf()) + i * nChan + c;
            if (nMode == 0) {
                *pTgt = oStorer.Background();
            } else if (nMode == 1) {
                const double x = std::floor(dfCol);
                const double y = std::floor(dfRow);
                *pTgt = oStorer.Store(Bilinear(pSrc + static_cast<long long>(y) * nPitch +
                                                   static_cast<long long>(x) * nChan + c,
                                               nPitch, nChan, dfCol - x, dfRow - y));
            } else if (nMode == 2) {
                const auto x = static_cast<long long>(std::floor(dfCol + 0.5));
                const auto y = static_cast<long long>(std::floor(dfRow + 0.5));
                *pTgt = oStorer.Store(static_cast<double>(pSrc[y * nPitch + x * nChan + c]));
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
