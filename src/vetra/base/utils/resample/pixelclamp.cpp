#include "vetra/base/utils/resample/pixelclamp.h"

#include <cmath>
#include <limits>
#include <type_traits>
#include <utility>

namespace vetra::utils {

namespace {

template <typename T>
constexpr bool kIsInteger = std::is_integral_v<T>;

// One step off the background.
template <typename T>
constexpr T kTolerance = kIsInteger<T> ? T(0) : T(1e-5);

// value + nStep in T's own arithmetic, which wraps at the ends of an integer T.
template <typename T>
T Step(T value, int nStep) {
    if constexpr (kIsInteger<T>) {
        using U = std::make_unsigned_t<T>;
        return static_cast<T>(static_cast<U>(static_cast<U>(value) + static_cast<U>(nStep)));
    } else {
        return nStep > 0 ? value + kTolerance<T> : value - kTolerance<T>;
    }
}

template <typename T>
bool Near(T a, T b) {
    if constexpr (kIsInteger<T>) {
        return a == b;
    } else {
        return std::fabs(static_cast<double>(a) - static_cast<double>(b)) <
               static_cast<double>(kTolerance<T>);
    }
}

// Rounds to nearest, ties to even. The value of an integer T saturates; a NaN gives the lowest.
template <typename T>
T RoundCast(double dfValue) {
    if constexpr (kIsInteger<T>) {
        return SaturateCast<T>(std::nearbyint(dfValue));
    } else {
        return static_cast<T>(dfValue);
    }
}

}  // namespace

template <typename T>
T SaturateCast(double dfValue) {
    // As doubles; the highest of a 64-bit type rounds up to a power of two, which has no value of
    // T.
    constexpr double dfLowest = static_cast<double>(std::numeric_limits<T>::lowest());
    constexpr double dfHighest = static_cast<double>(std::numeric_limits<T>::max());
    if (!(dfValue > dfLowest)) {
        return std::numeric_limits<T>::lowest();
    }
    if (!(dfValue < dfHighest)) {
        return std::numeric_limits<T>::max();
    }
    return static_cast<T>(dfValue);
}

template <typename T>
void PixelClamp<T>::SetLimits(double dfClampMin, double dfClampMax) {
    mLow = SaturateCast<T>(dfClampMin);
    mHigh = SaturateCast<T>(dfClampMax);
    if (mLow > mHigh) {
        std::swap(mLow, mHigh);
    }
    mTolerance = kTolerance<T>;
}

template <typename T>
PixelClamp<T>::PixelClamp(double dfClampMin, double dfClampMax) {
    SetLimits(dfClampMin, dfClampMax);
    mBackground = T(0);
    mbHasBackground = false;
    mpfClamp = &ClampPlain;
    mdfLow = static_cast<double>(mLow);
    mdfHigh = static_cast<double>(mHigh);
}

template <typename T>
PixelClamp<T>::PixelClamp(double dfClampMin, double dfClampMax, double dfOutBgd) {
    SetLimits(dfClampMin, dfClampMax);
    mBackground = SaturateCast<T>(dfOutBgd);
    mbHasBackground = true;
    bool bInside = mLow <= mBackground && mBackground <= mHigh;
    if (Near(mLow, mBackground)) {
        mLow = Step(mBackground, 1);
        bInside = false;
    }
    if (Near(mHigh, mBackground)) {
        mHigh = Step(mBackground, -1);
        bInside = false;
    }
    mpfClamp = bInside ? &ClampAvoiding : &ClampPlain;
    mdfLow = static_cast<double>(mLow);
    mdfHigh = static_cast<double>(mHigh);
}

template <typename T>
bool PixelClamp<T>::AvoidsBackground() const {
    return mpfClamp == &ClampAvoiding;
}

template <typename T>
void PixelClamp<T>::ClampPlain(const PixelClamp& oClamp, double dfValue, T* pTarget) {
    if constexpr (kIsInteger<T>) {
        // In T, not in double: the limits of a 64-bit type may have no double of their own. A NaN
        // became the lowest of T, so that it gives the low limit.
        const T value = RoundCast<T>(dfValue);
        *pTarget = value < oClamp.mLow ? oClamp.mLow : value > oClamp.mHigh ? oClamp.mHigh : value;
    } else {
        *pTarget = dfValue < oClamp.mdfLow    ? oClamp.mLow
                   : dfValue > oClamp.mdfHigh ? oClamp.mHigh
                                              : static_cast<T>(dfValue);
    }
}

template <typename T>
void PixelClamp<T>::ClampAvoiding(const PixelClamp& oClamp, double dfValue, T* pTarget) {
    // A value cut to a limit passes the test too: the limits are off the background.
    ClampPlain(oClamp, dfValue, pTarget);
    if (Near(*pTarget, oClamp.mBackground)) {
        const T above = Step(oClamp.mBackground, 1);
        *pTarget = above > oClamp.mHigh ? Step(oClamp.mBackground, -1) : above;
    }
}

template <typename T>
PixelClamp<T>* PixelClampFactory::Create(double dfClampMin, double dfClampMax, double dfOutBgd,
                                         bool bClampBgd) {
    return bClampBgd ? new PixelClamp<T>(dfClampMin, dfClampMax, dfOutBgd)
                     : new PixelClamp<T>(dfClampMin, dfClampMax);
}

#define VETRA_INSTANTIATE(T)            \
    template T SaturateCast<T>(double); \
    template class PixelClamp<T>;       \
    template PixelClamp<T>* PixelClampFactory::Create<T>(double, double, double, bool);
VETRA_INSTANTIATE(unsigned char)
VETRA_INSTANTIATE(signed char)
VETRA_INSTANTIATE(unsigned short)
VETRA_INSTANTIATE(short)
VETRA_INSTANTIATE(unsigned int)
VETRA_INSTANTIATE(int)
VETRA_INSTANTIATE(std::uint64_t)
VETRA_INSTANTIATE(std::int64_t)
VETRA_INSTANTIATE(float)
VETRA_INSTANTIATE(double)
#undef VETRA_INSTANTIATE

}  // namespace vetra::utils
