#ifndef VETRA_BASE_UTILS_MATH_FOURIER_CDFT_H
#define VETRA_BASE_UTILS_MATH_FOURIER_CDFT_H

#include "vetra/base/utils/math/fourier/fftcomplex.h"
#include "vetra/export.h"

/// \file
/// Fourier transforms with a table that is made beforehand: complex, in float, of lengths that are
/// powers of two. For one long-lived array of work memory and less of it, see complexdft.h.
///
/// With flag true a transform is  X[k] = sum over j of x[j] exp(-2 pi i j k / n),  with flag false
/// the exponent is positive. Neither is scaled: one after the other multiplies every sample by n
/// (by n^2 in two dimensions).
///
/// Arithmetic: radix-2 passes of the strides l = 1, 2, 4 ... n/2, each from an array x to an array
/// y. For j below n / (2 l) and k below l, with u = x[j l + k], v = x[j l + k + n/2] and c, s of
/// table entry j l (s negated where flag is false),
///
///     y[2 j l + k]     = u + v
///     y[2 j l + l + k] = (dr c - di s) + i (dr s + di c),  d = u - v
///
/// Every operation is rounded to float and none is left out. So the bits depend neither on the
/// processor nor on the number of threads (of a NaN only that it is one). The L2 error relative to
/// the exact transform is below 5e-8 sqrt(log2 n) for data of ordinary size, n up to 2^20.
/// Source: P. N. Swarztrauber, "FFT algorithms for vector computers", Parallel Computing 1, 1984
/// (the self-sorting form by Stockham).

/// Fills the table for length \p n: entry k below n/2 is cos(2 pi k / n) and -sin(2 pi k / n),
/// computed in double from k times (2 pi / n) and rounded to float. Runs on all OpenMP threads.
///
/// \param n      length of the transforms, at least 2; one that isn't a power of two is only of use
///               as a table
/// \param table  [n/2 x 2] floats
/// \throws ParameterException for \p n below 2 and a null \p table.
VETRA_EXPORT void InitSinCosTable(int n, float* table);

/// Transforms \p n samples. Threads may share a table.
///
/// \param n      number of samples, a power of two, at least 2
/// \param m      its binary logarithm
/// \param a      [n x 2] floats: the samples, then the result in natural order
/// \param b      [n x 2] floats of work memory, not overlapping \p a; its contents afterwards mean
///               nothing
/// \param table  as `InitSinCosTable` fills it for this \p n
/// \param flag   the direction, see above
/// \throws ParameterException for a length or pointer that can't be used; nothing is changed.
VETRA_EXPORT void CDFT1d(int n, int m, float* a, float* b, const float* table, bool flag);

/// Transforms a square array in place, along the rows and along the columns. Runs on all OpenMP
/// threads, each of which has work memory for a row.
///
/// All rows go through `CDFT1d`, the array is transposed, and both once more.
///
/// \param n      number of rows and of columns, a power of two, at least 2
/// \param data   [n x n], row after row
/// \param table  as `InitSinCosTable` fills it for this \p n
/// \param flag   the direction, see above
/// \throws ParameterException for a length or pointer that can't be used, std::bad_alloc where
///         there is no work memory; nothing is changed.
VETRA_EXPORT void CDFT2d(int n, FFTComplex* data, const float* table, bool flag);

#endif  // VETRA_BASE_UTILS_MATH_FOURIER_CDFT_H
