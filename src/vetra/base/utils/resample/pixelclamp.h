#ifndef VETRA_BASE_UTILS_RESAMPLE_PIXELCLAMP_H
#define VETRA_BASE_UTILS_RESAMPLE_PIXELCLAMP_H

#include <cstdint>

#include "vetra/export.h"

namespace vetra::utils {

/// A double as a value of T: the limits of T where it lies beyond them (the lowest for NaN), cut
/// toward zero for an integer T, rounded to nearest for float.
template <typename T>
VETRA_EXPORT T SaturateCast(double dfValue);

/// Turns computed doubles into samples of type T: limits, rounding, and on request a background
/// value that no computed sample may take.
///
/// T is one of the ten sample types: `signed char`, `short`, `int`, `std::int64_t`, their unsigned
/// forms, `float`, `double`.
///
/// The limits and the background are saturated to T and, for an integer T, cut toward zero. Limits
/// in the wrong order are exchanged. With a background, a limit equal to it moves one step (1, or
/// 1e-5 for floating types) inward; so limits that both equal the background end crossed, and
/// values up to the background come out above, greater ones below it.
template <typename T>
class VETRA_EXPORT PixelClamp {
 public:
    /// Limits only.
    PixelClamp(double dfClampMin, double dfClampMax);
    /// Limits and a background that computed values keep off.
    PixelClamp(double dfClampMin, double dfClampMax, double dfOutBgd);

    /// Writes \p dfValue as a sample.
    ///
    /// An integer T rounds to nearest, ties to even, and a NaN gives the low limit; a floating T
    /// doesn't round, and a NaN stays. A value inside the limits that equals the background (lies
    /// less than the tolerance from it, for a floating T) becomes the background plus one step, or
    /// minus one where that exceeds the high limit. For a floating T whose background is so large
    /// that the step is lost in rounding, a sample can still equal it.
    void Clamp(double dfValue, T* pTarget) const { mpfClamp(*this, dfValue, pTarget); }

    /// The low limit that computed samples keep to.
    T GetLow() const { return mLow; }
    /// The high limit that computed samples keep to.
    T GetHigh() const { return mHigh; }
    /// The background value, as a sample; 0 without one.
    T GetBackground() const { return mBackground; }
    /// Values closer to the background than this count as equal to it; 0 for an integer T.
    T GetTolerance() const { return mTolerance; }
    /// Whether the clamp was made with a background.
    bool HasBackground() const { return mbHasBackground; }
    /// Whether values are tested against the background: it lies between the limits.
    bool AvoidsBackground() const;

 private:
    using ClampFunction = void (*)(const PixelClamp&, double, T*);

    void SetLimits(double dfClampMin, double dfClampMax);
    static void ClampPlain(const PixelClamp& oClamp, double dfValue, T* pTarget);
    static void ClampAvoiding(const PixelClamp& oClamp, double dfValue, T* pTarget);

    ClampFunction mpfClamp;
    T mLow;
    T mHigh;
    double mdfLow;
    double mdfHigh;
    T mBackground;
    T mTolerance;
    bool mbHasBackground;
};

/// Makes clamps on the heap.
class VETRA_EXPORT PixelClampFactory {
 public:
    /// A clamp with the background when \p bClampBgd is true, without it otherwise. The caller
    /// deletes it. T is one of the ten sample types.
    template <typename T>
    static PixelClamp<T>* Create(double dfClampMin, double dfClampMax, double dfOutBgd,
                                 bool bClampBgd);
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_PIXELCLAMP_H
