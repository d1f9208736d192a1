#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_KERNELFILE_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_KERNELFILE_H

#include <iosfwd>
#include <string>
#include <vector>

#include "vetra/export.h"

/// \file
/// A kernel file is a table of weights as text. Its first line is the header, two or three integers
/// with commas between them:
///
///     KernelSize,NumSubPixels          one kernel for both axes
///     NumCols,NumRows,NumSubPixels     a kernel for each axis
///
/// All that follows are the weights, decimal numbers with commas or line ends between them: the
/// kernels of phases 0 to NumSubPixels, each from its first tap to its last, first those of the
/// columns and then, in the second form, those of the rows. That is the layout of
/// `ResampleInfo::mvdfKernelWeights`, where the first form's kernels stand twice. Empty lines,
/// blank ones and those that begin with "#" are passed over, and so are commas with nothing between
/// them. Lines end in "\n" or "\r\n". Numbers don't depend on the process's locale.

/// Reads a kernel file. What the numbers mean is for the resampler to check; here only their count
/// must be right.
///
/// A header field that is no integer counts as 0, one beyond the range of int as the nearest int.
/// A weight may have an exponent of E, e, D or d (`IsNumeric`) and is read whole (`TextToDouble`).
/// Memory grows with the weights in the file and not with what the header promises.
///
/// \param sFile       the file's path
/// \param nCols       taps of a column kernel
/// \param nRows       taps of a row kernel
/// \param nSubPixels  the number of the last phase
/// \param vdfWeights  (nCols + nRows) x (nSubPixels + 1) weights
/// \throws FileNotFoundException when there is no such file (`IsFile`).
/// \throws DataTypeException when the file can't be opened, or is a pipe or a device.
/// \throws FormatException when the header has not two or three fields or more than 65536 bytes,
///         or a weight is not numeric or has more than 2^20 bytes. A line of more than 65536 bytes
///         is shown cut.
/// \throws DataException when there are more or fewer weights than the header says.
/// \throws std::length_error when the header says less than none, or more than a vector can hold.
///         On any failure the results hold what was read so far.
VETRA_EXPORT void LoadKernelFile(std::string sFile, int& nCols, int& nRows, int& nSubPixels,
                                 std::vector<double>& vdfWeights);

/// Writes a kernel file, one phase a line, weights with 15 significant digits. A file that can't be
/// opened or written is not reported. Infinities and NaN are written as such, and can't be read.
///
/// \param sFile          the file's path; a file that is there is replaced
/// \param nCols          taps of a column kernel, at least 1
/// \param nRows          taps of a row kernel, at least 0
/// \param nSubPixels     the number of the last phase, at least 0
/// \param vdfWeights     at least (nCols + nRows) x (nSubPixels + 1) weights
/// \param bSingleKernel  write the form with one kernel, the column kernels: \p nRows counts as 0
/// \throws DataException when there are too few weights, or a size is out of range; no file is
///         touched.
VETRA_EXPORT void SaveKernelFile(std::string sFile, int nCols, int nRows, int nSubPixels,
                                 std::vector<double>& vdfWeights, bool bSingleKernel);

/// As above, into a stream, whose own number format and locale don't count. A failure to write
/// shows in the stream's state.
VETRA_EXPORT void SaveKernelFile(std::ostream& oStream, int nCols, int nRows, int nSubPixels,
                                 const std::vector<double>& vdfWeights, bool bSingleKernel);

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_KERNELFILE_H
