#ifndef VETRA_BASE_UTILS_MATH_ROTATIONS_QUATFUNCTIONS_H
#define VETRA_BASE_UTILS_MATH_ROTATIONS_QUATFUNCTIONS_H

#include "vetra/export.h"

/// \file
/// Quaternions as arrays of four doubles x, y, z, w, by the conventions of rotations.h; the same
/// operations as those of the class vetra::qtn::Quaternion, with some other thresholds.
///
/// Results go into the last argument, which may be one of the inputs. Nothing throws. NaN in gives
/// NaN out. Magnitudes beyond 1e154 count as infinite. Epsilon is 2.220446049250313e-16.

/// Component by component.
/// @{
VETRA_EXPORT void QuatAdd(const double* padfA, const double* padfB, double* padfOut);
VETRA_EXPORT void QuatSubtract(const double* padfA, const double* padfB, double* padfOut);
/// @}

/// (-x, -y, -z, w). For unit quaternions that is the inverse.
/// @{
VETRA_EXPORT void QuatConj(const double* padfQuat, double* padfOut);
VETRA_EXPORT void UnitQuatInv(const double* padfQuat, double* padfOut);
/// @}

/// The sum of the products of the four components.
VETRA_EXPORT double QuatDotProd(const double* padfA, const double* padfB);
/// The length, the square root of the sum of the four squares.
VETRA_EXPORT double QuatMag(const double* padfQuat);

/// Hamilton's product (i j = k): the rotation a followed by b.
VETRA_EXPORT void QuatMult(const double* padfA, const double* padfB, double* padfOut);
/// All four components times the factor.
VETRA_EXPORT void QuatMultScalar(const double* padfQuat, const double& dfFactor, double* padfOut);

/// The conjugate divided by the squared length; a copy if that is below epsilon.
VETRA_EXPORT void QuatInv(const double* padfQuat, double* padfOut);

/// The quaternion divided by its length; (0, 0, 1, 0), a half turn about Z, if the length is below
/// epsilon.
VETRA_EXPORT void QuatNormalize(const double* padfQuat, double* padfOut);
/// The same in place.
VETRA_EXPORT void QuatNormalizeSelf(double* padfQuat);

/// The logarithm, exponential function and power: see `Log`, `Exp` and `Pow` of the class.
/// @{
VETRA_EXPORT void QuatLog(const double* padfQuat, double* padfOut);
VETRA_EXPORT void QuatExp(const double* padfQuat, double* padfOut);
VETRA_EXPORT void QuatPow(const double* padfQuat, const double& dfExponent, double* padfOut);
/// @}

/// (1 - t) a + t b, normalised by `QuatNormalize`.
VETRA_EXPORT void QuatLerp(const double* padfA, const double* padfB, const double& dfT,
                           double* padfOut);

/// Spherical linear interpolation: see `vetra::qtn::Slerp`. The limits at the ends are 1e-14, the
/// result is normalised, and if the dot product of a and b is 1 within 1e-8 it is that of
/// `QuatLerp`.
VETRA_EXPORT void QuatSlerp(const double* padfA, const double* padfB, const double& dfT,
                            double* padfOut);

/// Spherical cubic interpolation between q1 and q2: see `vetra::qtn::Squad`. It uses `QuatSlerp`.
VETRA_EXPORT void QuatSquad(const double* padfQ0, const double* padfQ1, const double* padfQ2,
                            const double* padfQ3, const double& dfT, double* padfOut);

/// Negates all four components of a quaternion if its rotation axis and that of the reference, as
/// `QuaternionToAxisAngle` gives them without normalising, form an angle of more than 90 degrees.
///
/// \param padfReference  not changed
/// \param padfQuat       changed in place
VETRA_EXPORT void QuatMakeSameSign(const double* padfReference, double* padfQuat);

/// Rotates a vector: the matrix of `QuaternionToMatrixElements` times v, that is conj(q) v q. For a
/// vector that is fixed in space these are its components in the rotated frame.
///
/// \param padfQuat  unit quaternion; another one also scales, by its squared length
/// \param padfVec   3 elements
/// \param padfOut   takes 3 elements
VETRA_EXPORT void QuatVecRot(const double* padfQuat, const double* padfVec, double* padfOut);

#endif  // VETRA_BASE_UTILS_MATH_ROTATIONS_QUATFUNCTIONS_H
