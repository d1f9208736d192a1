#ifndef VETRA_BASE_UTILS_RESAMPLE_RESAMPLEINFO_H
#define VETRA_BASE_UTILS_RESAMPLE_RESAMPLEINFO_H

#include <limits>
#include <map>
#include <string>
#include <vector>

#include "vetra/export.h"

/// \file
/// The sampling methods and the parameters of a run.

/// The sampling methods. A squared method (SQ) works on the square roots of the samples and squares
/// its result.
enum ResampleMethod : int {
    eRM_BILIN = 0,         ///< bilinear
    eRM_CUBIC = 1,         ///< cubic convolution
    eRM_CUBICPS = 2,       ///< cubic convolution in which masked pixels count as the nearest one
    eRM_NEAR = 3,          ///< nearest pixel
    eRM_SINC8 = 4,         ///< windowed sinc over 8 pixels
    eRM_SINC16 = 5,        ///< windowed sinc over 16 pixels
    eRM_AVERAGE = 6,       ///< mean of a window
    eRM_MEDIAN = 7,        ///< median of a window
    eRM_CPLXSAR = 8,       ///< complex radar images
    eRM_LAGRANGE4 = 9,     ///< Lagrange polynomials of degree 3
    eRM_LAGRANGE8 = 10,    ///< Lagrange polynomials of degree 7
    eRM_GAUSSIAN = 11,     ///< Gaussian kernels
    eRM_KERNEL = 12,       ///< kernels of your own
    eRM_SQBILIN = 13,      ///< `eRM_BILIN` on square roots
    eRM_SQCUBIC = 14,      ///< `eRM_CUBIC` on square roots
    eRM_SQCUBICPS = 15,    ///< `eRM_CUBICPS` on square roots
    eRM_SQNEAR = 16,       ///< nearest pixel, negative samples as 0
    eRM_SQSINC8 = 17,      ///< `eRM_SINC8` on square roots
    eRM_SQSINC16 = 18,     ///< `eRM_SINC16` on square roots
    eRM_SQAVERAGE = 19,    ///< `eRM_AVERAGE` on square roots
    eRM_SQMEDIAN = 20,     ///< `eRM_MEDIAN` on square roots
    eRM_SQLAGRANGE4 = 21,  ///< `eRM_LAGRANGE4` on square roots
    eRM_SQLAGRANGE8 = 22,  ///< `eRM_LAGRANGE8` on square roots
    eRM_SQGAUSSIAN = 23,   ///< `eRM_GAUSSIAN` on square roots
    eRM_SQKERNEL = 24,     ///< `eRM_KERNEL` on square roots
    eRM_CUSTOM = 25,       ///< for resamplers outside the library; `Resample` refuses it
};

/// Orders texts by their lower-case forms, byte by byte up to the first zero byte: the ordering of
/// coefficient maps, so that a key in any mix of cases is the same key. Case is that of ASCII.
class VETRA_EXPORT CaseInsensitiveCompare {
 public:
    /// Whether \p a comes before \p b.
    bool operator()(const std::string& a, const std::string& b) const;
};

namespace vetra::utils {

/// What replaces an interpolation whose window lacks valid pixels.
enum NodataFillAction : int {
    eNFA_NN = 0,   ///< the nearest sample if that is valid, else the background
    eNFA_BGD = 1,  ///< the background
};

/// Named parameters of a method, values as text.
using CoefficientMap = std::map<std::string, std::string, CaseInsensitiveCompare>;

/// All parameters of a resampling run.
class VETRA_EXPORT ResampleInfo {
 public:
    /// Cubic sampling with the widest clamp range, the lowest finite double as background, kept
    /// free of computed values, and the nearest sample as fill.
    ResampleInfo();

    /// As the default, with these values.
    /// \throws ParameterException when \p dfClampMin is greater than \p dfClampMax.
    ResampleInfo(ResampleMethod eMethod, const CoefficientMap& oCoefficients, double dfClampMin,
                 double dfClampMax, double dfOutBgd, NodataFillAction eFillAction);

    /// A copy of all fields.
    ResampleInfo(const ResampleInfo& oOther);
    /// A copy of all fields.
    ResampleInfo& operator=(const ResampleInfo& oOther);
    ~ResampleInfo();

    /// True when all fields are equal. Keys and values of the coefficients are compared byte for
    /// byte, so case counts here; a NaN makes two objects unequal, an object always equals itself.
    bool operator==(const ResampleInfo& oOther) const;
    /// The opposite of `operator==`.
    bool operator!=(const ResampleInfo& oOther) const { return !(*this == oOther); }

    /// Looks up a coefficient.
    /// \param sName      the key, in any case
    /// \param sValue     its text; left alone when the key is missing
    /// \param bRequired  whether a missing key is a failure
    /// \returns 0 when the key was found, -1 when it is missing and not required
    /// \throws ParameterException when it is missing and required.
    int GetCoefficient(const std::string& sName, std::string& sValue, bool bRequired) const;
    /// As `GetCoefficient`, read as a number (`IsNumeric`, `TextToDouble`).
    /// \throws ParameterException also when the text is not a number.
    int GetCoefficientDouble(const std::string& sName, double& dfValue, bool bRequired) const;
    /// As `GetCoefficientDouble`, but a missing key that is not required stores 0.
    int GetCoefficientFloat(const std::string& sName, float& fValue, bool bRequired) const;
    /// As `GetCoefficientFloat`; the number is cut toward zero ("3.9" is 3) and saturates at the
    /// limits of int.
    int GetCoefficientInt(const std::string& sName, int& nValue, bool bRequired) const;

    /// The method.
    ResampleMethod meMethod = eRM_CUBIC;
    /// The method's own parameters, as text.
    CoefficientMap moCoefficients;
    /// Lower clamp limit of the output. A NaN counts as the target type's lowest value.
    double mdfClampMin = std::numeric_limits<double>::lowest();
    /// Upper clamp limit of the output. A NaN counts as the target type's lowest value.
    double mdfClampMax = std::numeric_limits<double>::max();
    /// Background value, saturated and cut to the target type when written. Clamp limits don't
    /// apply to it.
    double mdfOutBgd = std::numeric_limits<double>::lowest();
    /// Keep computed values off the background value.
    bool mbClampBgd = true;
    /// What replaces an interpolation whose window lacks valid pixels.
    NodataFillAction meNodataFillAction = eNFA_NN;
    /// Weights of the methods that take them: for Gaussian and kernel methods (NUMCOLS + NUMROWS) x
    /// (sub-pixel count + 1) taps, column kernels first, phase-major; for sinc methods 65 phases of
    /// 8 or 16 taps.
    std::vector<double> mvdfKernelWeights;
};

/// Refuses a lower limit greater than the upper one, as the constructor of `ResampleInfo` does.
/// \throws ParameterException
VETRA_EXPORT void CheckClampRange(double dfClampMin, double dfClampMax);

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_RESAMPLEINFO_H
