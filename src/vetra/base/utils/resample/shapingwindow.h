#ifndef VETRA_BASE_UTILS_RESAMPLE_SHAPINGWINDOW_H
#define VETRA_BASE_UTILS_RESAMPLE_SHAPINGWINDOW_H

#include "vetra/base/utils/resample/resampleinfo.h"
#include "vetra/export.h"

/// \file
/// The windows of the sinc methods.

namespace vetra::utils {

/// The windows, with the names that the coefficient "SHAPINGWINDOW" gives them.
enum ShapingWindowType : int {
    eSWT_NONE = 0,      ///< "NONE"
    eSWT_PARABOLA = 1,  ///< "PARABOLA"
    eSWT_KAISER = 2,    ///< "KAISER"
    eSWT_HANN = 3,      ///< "HANN"
    eSWT_HAMMING = 4,   ///< "HAMMING"
    eSWT_LANCZOS = 5,   ///< "LANCZOS"
    eSWT_GAUSSIAN = 6,  ///< "GAUSSIAN"
};

/// The taper that a truncated sinc is multiplied with. A new one is of type NONE.
class VETRA_EXPORT ShapingWindow {
 public:
    /// The type NONE.
    void SetNone();
    /// The type PARABOLA.
    void SetParabola();
    /// \param dfBeta  shape, from -25 to 25; the sign has no effect, 0 is a box
    /// \throws ParameterException for any other value, NaN included; the window stays as it was.
    void SetKaiser(double dfBeta);
    /// The type HANN.
    void SetHann();
    /// The type HAMMING.
    void SetHamming();
    /// The type LANCZOS.
    void SetLanczos();
    /// \param dfSigma  standard deviation in half widths of the window; the sign has no effect. Not
    ///                 checked: with 0, and below about 0.003, a sinc table has no weight left and
    ///                 holds NaN.
    void SetGaussian(double dfSigma);

    /// The type that was set last.
    ShapingWindowType GetType() const;
    /// The shape that `SetKaiser` set last, else 0.
    double GetBeta() const;
    /// The width that `SetGaussian` set last, else 0.
    double GetSigma() const;

    /// The window's value at an offset \p dfPos from its centre, u, with the half width H:
    ///
    ///     NONE      1
    ///     PARABOLA  1 - u^2 / H^2
    ///     KAISER    I0(beta sqrt(1 - (u / H)^2)) / I0(beta)
    ///     HANN      0.5 + 0.5 cos(pi u / H)
    ///     HAMMING   0.54 + 0.46 cos(pi u / H)
    ///     LANCZOS   sin(pi u / H) / (pi u / H)
    ///     GAUSSIAN  exp(-(u / H)^2 / (2 sigma^2))
    ///
    /// where I0 is the modified Bessel function of the first kind and order 0 (Harris, "On the use
    /// of windows for harmonic analysis with the discrete Fourier transform", Proc. IEEE 66, 1978).
    /// At the edges and outside, NONE is 1, HAMMING keeps its value at the edge, 0.08, and the
    /// others are 0.
    ///
    /// \param dfPos        offset in pixels
    /// \param dfHalfWidth  half width in pixels, above 0
    double GetValue(double dfPos, double dfHalfWidth) const;

    /// Sets "SHAPINGWINDOW" to the name of the type. KAISER also sets "BETA", GAUSSIAN "SIGMA", to
    /// six decimal places; the others leave these as they are.
    void ToCoefficients(CoefficientMap& oCoefficients) const;

 private:
    ShapingWindowType meType = eSWT_NONE;
    double mdfBeta = 0.0;
    double mdfSigma = 0.0;
};

}  // namespace vetra::utils

/// The window that the coefficients "SHAPINGWINDOW", "BETA" and "SIGMA" describe.
///
/// The name may stand in any case and between blanks. Without it "BETA" selects KAISER, else
/// "SIGMA" selects GAUSSIAN, else the window is KAISER. A KAISER window without "BETA" has 9.42, a
/// GAUSSIAN one without "SIGMA" 1.0; beside another window the two are not read.
///
/// \throws ParameterException for an unknown name, for a "BETA" or "SIGMA" that is read and is not
/// a
///         number, and for a "BETA" that `SetKaiser` refuses.
VETRA_EXPORT vetra::utils::ShapingWindow GetShapingWindow(const vetra::utils::ResampleInfo& oInfo);

#endif  // VETRA_BASE_UTILS_RESAMPLE_SHAPINGWINDOW_H
