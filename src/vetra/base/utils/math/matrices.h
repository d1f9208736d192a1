#ifndef VETRA_BASE_UTILS_MATH_MATRICES_H
#define VETRA_BASE_UTILS_MATH_MATRICES_H

#include <string>

#include "vetra/export.h"

/// \file
/// Dense matrices as arrays of row pointers, and vectors of any length. Element i of the array
/// points to row i, row by row anywhere in memory. Dimensions are counts of rows and columns; with
/// counts below 1 nothing is done. Only `AllocMat` throws, and only for want of memory. An output
/// may overlap an input in `VecSclMult` and `MatSclMult` alone, and there only as the same array.

/// Makes a matrix of one array of row pointers and one contiguous block, row-major. The content is
/// not initialised. Negative counts are taken as 0.
///
/// \param papadfMat  takes the matrix, for `FreeMat`; what it held before is not freed
/// \param nRows      rows
/// \param nCols      columns
/// \throws std::bad_alloc if there is no memory; papadfMat is left as it was.
VETRA_EXPORT void AllocMat(double**& papadfMat, int nRows, int nCols);

/// Frees a matrix of `AllocMat` and sets the pointer to null. A null pointer is left alone.
VETRA_EXPORT void FreeMat(double**& papadfMat);

/// Copies row by row.
VETRA_EXPORT void CopyMat(const double* const* papadfSrc, double* const* papadfTgt, int nRows,
                          int nCols);

/// C = A B, for A of r x n and B of n x c; the sums start at 0.0 and go along n.
/// \returns 0
VETRA_EXPORT int MatMult(const double* const* A, const double* const* B, int r, int n, int c,
                         double* const* C);

/// C = s A.
/// \returns 0
VETRA_EXPORT int MatSclMult(const double* const* A, int nRows, int nCols, double s,
                            double* const* C);

/// C (nCols x nRows) = the transpose of A (nRows x nCols).
/// \returns 0
VETRA_EXPORT int MatTranspose(const double* const* A, int nRows, int nCols, double* const* C);

/// out (nRows elements) = A v (nCols elements).
/// \returns 0
VETRA_EXPORT int MatVecMult(const double* const* A, const double* v, int nRows, int nCols,
                            double* out);

/// The sum of a[i] b[i].
VETRA_EXPORT double DotProd(const double* a, const double* b, int n);

/// The Euclidean length.
VETRA_EXPORT double VecAbs(const double* v, int n);

/// The index of the element of greatest magnitude, the first of equal ones. NaN elements are passed
/// over. 0 if there are no elements.
VETRA_EXPORT int VecIdxMaxAbs(const double* v, int n);

/// Divides a vector by its length.
/// \returns 0, or -1 with the vector unchanged if its length is below 2.220446049250313e-16
VETRA_EXPORT int VecNormalize(double* v, int n);

/// out = s v.
/// \returns 0
VETRA_EXPORT int VecSclMult(const double* v, int n, double s, double* out);

/// Inverts a symmetric positive definite matrix in place, by its Cholesky factor (in n^3 steps).
///
/// \param a        n rows; only the lower triangle with the diagonal is read
/// \param n        rows and columns
/// \param bMirror  true to write the upper triangle too; else it keeps what it held
/// \returns 0, or the number of the first pivot, counted from 1, that is not positive: the matrix
///          isn't positive definite, and its lower triangle is half overwritten. A NaN pivot isn't
///          noticed; the inverse then holds NaN.
VETRA_EXPORT int mat_inv(double* const* a, int n, bool bMirror);

/// A polynomial, highest power first: ((c[0] x + c[1]) x + c[2]) x ... + c[nDegree].
///
/// \param c        nDegree + 1 coefficients
/// \param nDegree  0.0 is the result for a negative one
/// \param x        position
VETRA_EXPORT double polyval(const double* c, int nDegree, double x);

/// Prints a matrix to the standard output: a line "Matrix: name (rows by columns)", then blocks of
/// six columns with elements in the format %13.5e, then an empty line. Where there are several
/// blocks, each has a line with its first and last column, counted from 0. The decimal point is
/// a point in every locale.
///
/// \param sName      name
/// \param nRows      rows
/// \param nCols      columns
/// \param padfMatrix `[nRows x nCols]`, row-major
VETRA_EXPORT void PrintMatrix(const std::string& sName, int nRows, int nCols,
                              const double* padfMatrix);

#endif  // VETRA_BASE_UTILS_MATH_MATRICES_H
