#ifndef VETRA_BASE_UTILS_RESAMPLE_RESAMPLE_H
#define VETRA_BASE_UTILS_RESAMPLE_RESAMPLE_H

#include "vetra/base/utils/resample/postfm/ibufpostfm.h"
#include "vetra/base/utils/resample/resamplebuffer.h"
#include "vetra/base/utils/resample/resampleinfo.h"
#include "vetra/export.h"

namespace vetra::utils {

/// How the sample types of source and target relate.
enum ResampleDatatypeConversion : int {
    eRDC_FLOAT_TO_DT = 0,  ///< the source is 32-bit float, the target another type
    eRDC_DT_TO_FLOAT = 1,  ///< the target is 32-bit float, the source another type
    eRDC_NONE = 2,         ///< both have the same type
};

/// What became of a target pixel.
enum PixelOutcome : unsigned char {
    ePO_BACKGROUND = 0,    ///< the background was written
    ePO_INTERPOLATED = 1,  ///< the method computed the pixel
    ePO_NEAREST = 2,    ///< the nearest sample was written, as is every pixel of nearest sampling
    ePO_UNTOUCHED = 3,  ///< nothing was written
};

/// Fills a target image from a source image.
///
/// Each target pixel is sampled at the source position that the transform gives for it, by the
/// method of \p oResParms; all arithmetic is in double, and a value is clamped and, for an integer
/// type, rounded (ties to even) when it is stored. The result does not depend on the number of
/// threads, the processor, or how a target is cut into runs. Where a computed floating-point value
/// is NaN its bits are those of the default quiet NaN.
///
/// The run forks one OpenMP team of the default size. Distinct targets may be filled from several
/// threads at once.
///
/// \param oSrc       the source; only read
/// \param oTgt       the target, of any size; its mask holds the requests and is only read
/// \param oTfm       must have at least as many pixels as the target (not checked): target pixel i
///                   takes position i of the transform, whatever the transform's columns
/// \param oResParms  method, clamp limits, background and the method's coefficients
/// \throws ParameterException when the channel counts differ, when the two sample types can't be
///         resampled into each other (they must be equal, or one of them the 32-bit float of its
///         kind), when the method is unknown or lacks a coefficient. DataException when a method
///         for complex data gets real data. Nothing has been written then.
VETRA_EXPORT void Resample(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
                           const ResampleInfo& oResParms);

/// As above, and tells what became of each target pixel, for instance to write a validity mask.
///
/// \param oSrc         the source; only read
/// \param oTgt         the target, as above
/// \param oTfm         gives the position of each target pixel
/// \param oResParms    method and parameters
/// \param pabyOutcome  `[target rows x target columns]` bytes, filled with `PixelOutcome` values;
///                     not null. Unchanged when the call throws.
/// \throws ParameterException also for a null \p pabyOutcome.
VETRA_EXPORT void Resample(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
                           const ResampleInfo& oResParms, unsigned char* pabyOutcome);

/// How the types of a pair of buffers relate; refuses pairs that `Resample` refuses.
/// \throws ParameterException when channel counts differ, when only one type is complex, or when
///         the types differ and neither is the 32-bit float of its kind. \p eConv is unchanged
///         then.
VETRA_EXPORT void GetResampleConversionType(const ResampleBuffer& oSrc, const ResampleBuffer& oTgt,
                                            ResampleDatatypeConversion& eConv);

/// Refuses real data for `eRM_CPLXSAR`.
/// \throws DataException
VETRA_EXPORT void CheckDatatypeOkForResampler(const ResampleBuffer& oSrc,
                                              const ResampleInfo& oResParms);

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_RESAMPLE_H
