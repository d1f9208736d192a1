#ifndef VETRA_BASE_UTILS_MATH_FOURIER_COMPLEXDFT_H
#define VETRA_BASE_UTILS_MATH_FOURIER_COMPLEXDFT_H

#include "vetra/base/utils/math/fourier/fftcomplex.h"
#include "vetra/export.h"

/// \file
/// Fourier transforms in place: complex, in float, of lengths that are powers of two, in memory
/// that the caller keeps from call to call and with a table that is built when it is needed. They
/// allocate nothing and start no threads.
///
/// With flag true a transform is  X[k] = sum over j of x[j] exp(-2 pi i j k / n),  with flag false
/// the exponent is positive. Neither is scaled: one after the other multiplies every sample by n
/// (by the number of samples in two dimensions).
///
/// Work memory. Set ip[0] to 0 before the first call with a new w; what else the two hold is of no
/// account. Threads must not share an ip, and may share a w once it is built for their longest
/// transform.
///
///     ip[0]      capacity of the table in floats, a quarter of the floats of the longest transform
///                so far
///     ip[1]      1 once the table was built
///     ip[2]...   start of each row in the bit reversal of the last array of more than 2 samples
///     w          n/2 floats for the longest n: cos(t), sin(t) for t = 2 pi k / n, k below n/4,
///                rounded to float, in bit-reversed order of k. A table for a longer transform
///                starts with that of a shorter one and is not rebuilt. Up to 4 samples need none.
///
/// Arithmetic: after the bit reversal, radix-4 passes of the spans 1, 4, 16 ... samples, then a
/// radix-2 pass (u0 + u1, u0 - u1) if n is not a power of four. In group g of four spans, with
/// u0 ... u3 at the same place of each, t0 = u0 + u1, t1 = u0 - u1, t2 = u2 + u3, t3 = u2 - u3, and
/// flag false,
///
///     u0 = t0 + t2,  u1 = W1 (t1 + i t3),  u2 = W2 (t0 - t2),  u3 = W3 (t1 - i t3)
///
/// Group 0 has no factors. Group 1 has W2 = i, and with z = t1 + i t3 and z' = t1 - i t3
/// W1 z = w[2] (zr - zi) + i w[2] (zr + zi), W3 z' = w[2] (-z'i - z'r) + i w[2] (z'r - z'i). From
/// group 2 on W1 = (w[2 g], w[2 g + 1]); W2 = (w[g], w[g + 1]) for even g and (-w[g], w[g - 1]) for
/// odd g; W3 = (W1r - 2 W2i W1i, 2 W2i W1r - W1i). With flag true i is -i throughout and the
/// factors are conjugated. Every operation is rounded to float, so that the bits don't depend on
/// the processor (of a NaN only that it is one). The L2 error relative to the exact transform is
/// below 1e-7 sqrt(log2 n) for data of ordinary size, n up to 2^20.

/// Transforms \p n samples in place, into natural order.
///
/// \param n     number of samples, a power of two, at least 1
/// \param flag  the direction, see above
/// \param data  [n]
/// \param ip    2 + sqrt(n) ints, see above
/// \param w     n/2 floats, see above; neither read nor written, and may be null, for n up to 4
/// \throws ParameterException for a length or pointer that can't be used; nothing is changed.
VETRA_EXPORT void ComplexDFT1d(int n, bool flag, FFTComplex* data, int* ip, float* w);

/// Transforms an array in place: each row, then each column.
///
/// \param nRows   number of rows, a power of two, at least 1
/// \param nCols   number of columns, a power of two, at least 1
/// \param flag    the direction, see above
/// \param data    [nRows x nCols], row after row
/// \param column  [nRows] samples of work memory; holds the last column afterwards
/// \param ip      2 + sqrt(max(nRows, nCols)) ints, see above
/// \param w       max(nRows, nCols) / 2 floats, see above; may be null where both lengths are at
///                most 4
/// \throws ParameterException for a length or pointer that can't be used; nothing is changed.
VETRA_EXPORT void ComplexDFT2d(int nRows, int nCols, bool flag, FFTComplex* data,
                               FFTComplex* column, int* ip, float* w);

#endif  // VETRA_BASE_UTILS_MATH_FOURIER_COMPLEXDFT_H
