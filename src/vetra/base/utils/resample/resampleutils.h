#ifndef VETRA_BASE_UTILS_RESAMPLE_RESAMPLEUTILS_H
#define VETRA_BASE_UTILS_RESAMPLE_RESAMPLEUTILS_H

#include "vetra/base/utils/resample/resampleinfo.h"
#include "vetra/export.h"

/// \file
/// What becomes of a target pixel, for one position.

/// What becomes of a target pixel, for a method whose window is counted from the floor of the
/// position.
///
/// The pixel nearest to the position, floor(position + 0.5), is *usable* when it lies inside the
/// source and its mask byte is exactly 1 (or there is no mask). The window *fits* when it lies
/// inside the source and none of its mask bytes is 0.
///
/// \param nRequest    the target mask's byte: 0 background, 1 sample, 2 nearest sample only,
///                    3 leave the pixel; other values count as 1
/// \param pabySrcMask `[nSrcRows x nSrcCols]` or null
/// \param nSrcCols    source columns
/// \param nSrcRows    source rows
/// \param dfCol       source column; NaN and values beyond int count as outside
/// \param dfRow       source row
/// \param nColOff     column of the window's first pixel, relative to the anchor pixel
/// \param nRowOff     row of the window's first pixel
/// \param nWndCols    window columns
/// \param nWndRows    window rows; below 1 no mask byte is looked at
/// \param eFillAction what replaces a sample whose window doesn't fit
/// \returns 0 background, 1 compute by the method, 2 take the nearest sample, 3 leave the pixel
VETRA_EXPORT unsigned char ChooseResampleMode(unsigned char nRequest,
                                              const unsigned char* pabySrcMask, int nSrcCols,
                                              int nSrcRows, double dfCol, double dfRow, int nColOff,
                                              int nRowOff, int nWndCols, int nWndRows,
                                              vetra::utils::NodataFillAction eFillAction);

/// As `ChooseResampleMode`, for a method whose window is counted from the nearest pixel.
VETRA_EXPORT unsigned char ChooseResampleModeForFilter(unsigned char nRequest,
                                                       const unsigned char* pabySrcMask,
                                                       int nSrcCols, int nSrcRows, double dfCol,
                                                       double dfRow, int nColOff, int nRowOff,
                                                       int nWndCols, int nWndRows,
                                                       vetra::utils::NodataFillAction eFillAction);

#endif  // VETRA_BASE_UTILS_RESAMPLE_RESAMPLEUTILS_H
