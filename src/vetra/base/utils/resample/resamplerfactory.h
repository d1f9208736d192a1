#ifndef VETRA_BASE_UTILS_RESAMPLE_RESAMPLERFACTORY_H
#define VETRA_BASE_UTILS_RESAMPLE_RESAMPLERFACTORY_H

#include <string>

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/base/utils/resample/resampleinfo.h"
#include "vetra/export.h"

namespace vetra::utils {

/// Makes resamplers from names, texts, parameters and other resamplers. It has no state: one object
/// serves all threads.
///
/// A resampler string names a method, then key=value pairs, separated by commas:
///
///     SINC8,SHAPINGWINDOW=KAISER,BETA=2,MIN=0,MAX=255,FILL=BGD
///
/// Names, keys and the values that are words may stand in any case. Blanks around tokens, keys and
/// values don't count, nor do tokens of nothing but blanks; a comma in double quotes doesn't
/// separate, and the quotes stay in the value. Of a key that stands twice the last value counts.
/// Keys that the method doesn't know are ignored.
///
///     key                     methods               value
///     NUMCOLS, NUMROWS        averages, medians,    window size, required
///                             CPLXSAR
///     FC                      CPLXSAR               cycles per pixel, else 0
///     DSFACTORCOL             GAUSSIAN              factor, required by `GetResampler`
///     DSFACTORROW             GAUSSIAN              factor, else that of the columns
///     FILE                    KERNEL                path of a kernel file, required
///     SHAPINGWINDOW           SINC8, SINC16         name of a window (`GetShapingWindow`)
///     BETA                    SINC8, SINC16         number; beside KAISER or no window
///     SIGMA                   SINC8, SINC16         number; beside GAUSSIAN or no window
///     MIN, MAX                all                   clamp limits
///     FILL                    all                   NN or BGD
///
/// A squared method reads the keys of its plain twin.
///
/// 8PT, 16PT, SQ8PT and SQ16PT stand for SINC8, SINC16, SQSINC8 and SQSINC16 with the window
/// PARABOLA, whatever the string says.
class VETRA_EXPORT ResamplerFactory {
 public:
    /// The name of a method, such as "BILIN".
    /// \throws ParameterException for a value that is no method.
    static std::string MethodToName(ResampleMethod eMethod);

    /// The method of a name in any case, blanks around it allowed. "CUSTOM" names none.
    /// \throws ParameterException for any other text.
    static ResampleMethod NameToMethod(std::string sName);

    /// Reads a resampler string; the empty one is cubic sampling. Clamp limits in the wrong order
    /// pass, and so does a BETA or SIGMA that is no number: `GetResampler` refuses them.
    /// \throws ParameterException for an unknown name or an unusable value, DataException for a
    ///         string of nothing but commas and blanks or one that lacks a required key, and as
    ///         `LoadKernelFile` for a kernel file.
    ResampleInfo GetResampleInfo(std::string sResParms) const;

    /// Makes the resampler that some parameters describe. The caller owns it.
    ///
    /// Clamp limits, background and fill action are taken over; the background is kept free of
    /// computed values, as by any new resampler. Sinc and Gaussian weights are made anew, Gaussian
    /// ones from "DSFACTORCOL" and "DSFACTORROW" only: the parameters of a `GaussianResampler` lack
    /// them.
    ///
    /// \throws ParameterException for a method without class, a missing coefficient or clamp limits
    ///         in the wrong order, and as the constructor of the class.
    IRasterResampler* GetResampler(const ResampleInfo& oInfo) const;
    /// As `GetResampler(GetResampleInfo(sResParms))`.
    IRasterResampler* GetResampler(std::string sResParms) const;
    /// As for default parameters with this method, which serves those without coefficients and the
    /// sinc methods.
    IRasterResampler* GetResampler(ResampleMethod eMethod) const;
    /// As for default parameters with this method and these coefficients.
    IRasterResampler* GetResampler(ResampleMethod eMethod,
                                   const CoefficientMap& oCoefficients) const;

    /// Makes the squared twin of a resampler, with its coefficients, clamp limits, background and
    /// fill action; of a squared one, another such. The caller owns it.
    /// \throws ParameterException for null, CPLXSAR, CUSTOM, and as `GetResampler`: for Gaussian
    ///         resamplers, too.
    IRasterResampler* GetSquaredResampler(const IRasterResampler* poSrc) const;

    /// Makes a complex SAR resampler with a window like that of another resampler, 7 or 15 pixels
    /// along each axis, and its clamp limits, background and fill action. The caller owns it.
    /// \param poSrc  the other resampler; one of CPLXSAR gives another such
    /// \param dfFc   central frequency in cycles per pixel, from -0.5 to 0.5; kept to 14 decimal
    ///               places. Not used when \p poSrc is of CPLXSAR
    /// \throws ParameterException for null, for Gaussian and kernel methods, CUSTOM, and a
    /// frequency
    ///         outside its range.
    IRasterResampler* GetComplexSarResampler(const IRasterResampler* poSrc, double dfFc) const;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_RESAMPLERFACTORY_H
