#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CPLXSARCOEFFS_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CPLXSARCOEFFS_H

#include "vetra/export.h"

namespace vetra::utils {

/// Tabulates the filter of complex SAR sampling: a sinc under a raised cosine, which along the rows
/// is modulated with the carrier of a given central frequency.
///
/// Phase p stands for the shift f = p / \p nNumPhases - 0.5 of a position from its nearest pixel,
/// and tap j for the pixel at j - (n - 1) / 2 from that pixel, in a window of n. Without carrier
/// the taps of a phase add up to 1; the carrier turns tap j by the angle -2 pi \p dfFc (j - f).
///
/// The caller frees the three tables with array delete.
///
/// \param nWndNumCols     window columns, an odd number of at least 1
/// \param nWndNumRows     window rows, an odd number of at least 1
/// \param dfFc            central frequency along the rows in cycles per pixel, from -0.5 to 0.5
/// \param nNumPhases      number of sub-pixel phases, at least 1
/// \param padfHorizontal  takes the taps across, [nNumPhases x nWndNumCols]
/// \param padfVertReal    takes the real parts of the taps down, [nNumPhases x nWndNumRows]
/// \param padfVertImag    takes the imaginary parts of the taps down, [nNumPhases x nWndNumRows]
/// \throws ParameterException for an argument outside its range.
/// \throws std::bad_alloc for tables that don't fit into memory.
///         The three pointers stay as they were then.
VETRA_EXPORT void GetCplxSarCoeffs(int nWndNumCols, int nWndNumRows, double dfFc, int nNumPhases,
                                   double*& padfHorizontal, double*& padfVertReal,
                                   double*& padfVertImag);

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_CPLXSARCOEFFS_H
