#ifndef VETRA_BASE_UTILS_LOW_COPYPIXEL_H
#define VETRA_BASE_UTILS_LOW_COPYPIXEL_H

#include "vetra/basic/gobs/raster/datatypeadapter.h"
#include "vetra/export.h"

/// \file
/// Copies of pixels between buffers whose types are known at run time. A buffer is a pointer to
/// bytes, of any alignment; a pixel is a run of samples, and a complex sample has its real part
/// first, then its imaginary part. Source and target may not overlap.
///
/// Conversions work on eight real types, the copy types: 8U, 8S, 16U, 16S, 32U, 32S, 32R, 64R. A
/// complex type converts to a complex type, part by part. Conversions are the plain ones of the
/// language: an integer is extended by its sign or loses its high bits, a floating value is cut
/// toward zero on its way to an integer. Nothing saturates and nothing rounds; what a floating
/// value beyond the range of an integer target, or a NaN, gives is undefined.
///
/// The converting functions throw ParameterException, and nothing has been written then: when only
/// one of the types is complex, when a real type is not a copy type, and for `eDT_UNKNOWN`.

namespace vetra::utils::low {

/// Copies \p nCount samples of one type, any that has a size, as they are.
/// \throws ParameterException for a type without a size
VETRA_EXPORT void CopyPixel(unsigned char* pabyOut, const unsigned char* pabyIn,
                            gobs::NativeDataTypeCode eType, unsigned int nCount);

/// Converts \p nCount samples.
VETRA_EXPORT void CopyPixel(unsigned char* pabyOut, const unsigned char* pabyIn,
                            gobs::NativeDataTypeCode eTypeOut, gobs::NativeDataTypeCode eTypeIn,
                            unsigned int nCount);

/// Converts the one sample at \p pabyIn, and stores it as sample \p nIndex of the target.
VETRA_EXPORT void CopyPixelValue(unsigned char* pabyOut, const unsigned char* pabyIn,
                                 gobs::NativeDataTypeCode eTypeOut,
                                 gobs::NativeDataTypeCode eTypeIn, unsigned int nIndex);

/// Converts one pixel of \p nCount samples, and writes it \p nNumPix times, side by side.
VETRA_EXPORT void CopyPixelToRaster(unsigned char* pabyOut, const unsigned char* pabyIn,
                                    gobs::NativeDataTypeCode eTypeOut,
                                    gobs::NativeDataTypeCode eTypeIn, unsigned int nCount,
                                    unsigned long long nNumPix);

/// As the function without the T in front, with the type of the source known: T is the type of a
/// copy type, and \p eTypeOut must be a copy type.
/// @{
template <typename T>
VETRA_EXPORT void TCopyPixel(unsigned char* pabyOut, const T* pIn,
                             gobs::NativeDataTypeCode eTypeOut, unsigned int nCount);

template <typename T>
VETRA_EXPORT void TCopyPixelValue(unsigned char* pabyOut, T value,
                                  gobs::NativeDataTypeCode eTypeOut, unsigned int nIndex);

template <typename T>
VETRA_EXPORT void TCopyPixelToRaster(unsigned char* pabyOut, const T* pIn,
                                     gobs::NativeDataTypeCode eTypeOut, unsigned int nCount,
                                     unsigned long long nNumPix);
/// @}

}  // namespace vetra::utils::low

#endif  // VETRA_BASE_UTILS_LOW_COPYPIXEL_H
