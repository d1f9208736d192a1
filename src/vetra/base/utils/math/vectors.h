#ifndef VETRA_BASE_UTILS_MATH_VECTORS_H
#define VETRA_BASE_UTILS_MATH_VECTORS_H

#include "vetra/export.h"

/// \file
/// Vectors of three doubles and 3 x 3 matrices of nine, row-major. Outputs may be inputs. Nothing
/// throws. There are two families, whose cross products differ: `CrossProd` gives a unit vector,
/// `CrossProduct` doesn't.

/// Stores the dot product of two vectors.
VETRA_EXPORT void DotProduct(const double* a, const double* b, double* pdfResult);

/// Stores the length of v, and v divided by it in out; with length 0.0 out is left as it was.
VETRA_EXPORT void Normalize(const double* v, double* out, double* pdfLength);

/// The unit vector of a x b. A cross product that is shorter than 2.220446049250313e-16 is given as
/// it is.
VETRA_EXPORT void CrossProd(const double* a, const double* b, double* out);

/// Solves three linear equations by Gauss-Jordan elimination with full pivoting.
///
/// \param row1, row2, row3  the rows of the matrix
/// \param b                 the right-hand sides
/// \param x                 takes the unknowns; on failure it holds intermediate values
/// \param pnStatus          takes 0, or -1 if the matrix is singular (a pivot is exactly 0) or
///                          elimination meets NaN only
VETRA_EXPORT void SolveEqn(const double* row1, const double* row2, const double* row3,
                           const double* b, double* x, int* pnStatus);

/// out = a x b.
VETRA_EXPORT void CrossProduct(const double* a, const double* b, double* out);

/// The dot product.
VETRA_EXPORT double DotProduct(const double* a, const double* b);

/// out = a - b.
VETRA_EXPORT void VecDiff(const double* a, const double* b, double* out);

/// The length of a - b.
VETRA_EXPORT double VecDistance(const double* a, const double* b);

/// The length.
VETRA_EXPORT double VecLength(const double* v);

/// Divides v by its length in place. The zero vector becomes NaN.
VETRA_EXPORT void VecNormalize(double* v);

/// out = s v.
VETRA_EXPORT void VecScale(double s, const double* v, double* out);

/// C = A B.
VETRA_EXPORT void MM3_Mult(const double* A, const double* B, double* C);

/// out = M v.
VETRA_EXPORT void MV3_Mult(const double* M, const double* v, double* out);

/// out = the transpose of M times v.
VETRA_EXPORT void MtV3_Mult(const double* M, const double* v, double* out);

#endif  // VETRA_BASE_UTILS_MATH_VECTORS_H
