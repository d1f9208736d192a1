#ifndef VETRA_BASE_UTILS_MATH_ROTATIONS_ROTATIONS_H
#define VETRA_BASE_UTILS_MATH_ROTATIONS_ROTATIONS_H

#include "vetra/export.h"

/// \file
/// Conversions between the forms of a rotation, and the conventions of all rotations in the
/// library.
///
/// Angles are radians. Frames are right-handed. A matrix M is 3 x 3, row-major (m0 m1 m2 is the
/// first row), and multiplies a column vector from the left: v' = M v.
///
/// Signs are those of a rotation of the frame: v is fixed in space, M v are its components in a
/// frame that was turned by the positive angle (counterclockwise, seen from the tip of the axis).
/// With c and s the cosine and sine of the angle the elementary matrices are
///
///          | 1  0  0 |          | c  0 -s |          | c  s  0 |
///     Rx = | 0  c  s |     Ry = | 0  1  0 |     Rz = |-s  c  0 |
///          | 0 -s  c |          | s  0  c |          | 0  0  1 |
///
/// so that Rz(a) (1, 0, 0) = (cos a, -sin a, 0). A rotation of the vector by the same angle (the
/// "active" convention) is the transposed matrix.
///
/// Quaternions are stored x, y, z and then the scalar w. A unit quaternion and its negative are the
/// same rotation. Products are Hamilton's (i j = k); for the frame rotations above they read in the
/// order in which the rotations are applied: M(a b) = M(b) M(a).

/// The forms of a rotation, with the coefficients of each and the matrix that they stand for.
///
/// An Euler form is three successive rotations about the axes of the frame as turned so far. The
/// name tells their order, the first one first: it is the rightmost factor of the matrix. The
/// coefficients are always the angle about X, the one about Y, the one about Z, whatever the
/// order.
enum RotationType : int {
    eRT_XYZ = 0,         ///< x, y, z angle: Rz(z) Ry(y) Rx(x)
    eRT_XZY = 1,         ///< x, y, z angle: Ry(y) Rz(z) Rx(x)
    eRT_YXZ = 2,         ///< x, y, z angle: Rz(z) Rx(x) Ry(y)
    eRT_YZX = 3,         ///< x, y, z angle: Rx(x) Rz(z) Ry(y)
    eRT_ZXY = 4,         ///< x, y, z angle: Ry(y) Rx(x) Rz(z)
    eRT_ZYX = 5,         ///< x, y, z angle: Rx(x) Ry(y) Rz(z), as for roll, pitch, yaw
    eRT_QUATERNION = 6,  ///< x, y, z, w: see `QuaternionToMatrixElements`
    eRT_AXIS_ANGLE = 7,  ///< axis x, y, z (length 1), angle: see `AxisAngleToQuaternion`
    eRT_MATRIX = 8,      ///< m0 to m8, row-major
};

/// Converts a rotation from one form to another.
///
/// To an Euler form, the middle angle of the three comes out in [-pi/2, pi/2], the others in
/// [-pi, pi]. Where the middle angle is so near to +-pi/2 that all four matrix elements with its
/// cosine are below 1e-10 (gimbal lock), the first rotation's angle is given as 0 and the last one
/// carries the rest. Elements below 1e-12 that decide on the first and last angle count as 0, so
/// that rounding noise doesn't choose between -pi and pi.
///
/// To a quaternion, w is positive. Within 3e-5 radians of a half turn (4 w^2 is at most 1e-9) the
/// greatest of x, y, z is positive instead; of equal ones x, then z. To axis and angle, the angle
/// is in [0, 2 pi], and not more than 3e-5 above pi unless the source is a quaternion with negative
/// w. Without a rotation the axis is (0, 0, 1). From axis and angle to a quaternion, half the angle
/// is taken as it is, so that 2 pi gives (0, 0, 0, -1).
///
/// A source of finite numbers keeps its matrix to 1e-14, but that each element that counts as 0 may
/// cost up to 1e-12, and gimbal lock, where it is one by its tolerance only, up to 3e-10. Euler
/// angles and angles that are NaN or infinite give NaN.
///
/// Source and target may be the same array. With the same type they are left to the general way in
/// that case: the coefficients may come back in another equal form. With the same type and
/// different arrays the coefficients are copied.
///
/// \param eSrcType        form of the source
/// \param padfSrcCoeffs   its coefficients: 3, 4, 4 or 9 by the type
/// \param eTgtType        form of the target
/// \param padfTgtCoeffs   takes 3, 4, 4 or 9 coefficients by the type
/// \returns 0, or -1 for a type outside 0 to 8; then the target is left as it was.
/// \throws vetra::ParameterException if `IsValidRotation` refuses the source; the target is left as
///         it was.
VETRA_EXPORT int ConvertRotation(RotationType eSrcType, const double* padfSrcCoeffs,
                                 RotationType eTgtType, double* padfTgtCoeffs);

/// Whether coefficients are a rotation, within tolerances:
///
/// - quaternion: the squared length is 1 within 1e-9;
/// - axis and angle: the squared length of the axis is 1 within 1e-9; the angle isn't looked at;
/// - matrix: no element is beyond +-1.000000001, the dot product of each pair of rows is 0 within
///   1e-9, and the determinant is 1 within 1e-8;
/// - Euler angles, and types outside 0 to 8: always.
///
/// NaN and infinities in what is looked at are refused.
VETRA_EXPORT bool IsValidRotation(RotationType eType, const double* padfCoeffs);

/// The matrix of a rotation. The coefficients aren't checked.
///
/// \param eType       form of the rotation
/// \param padfCoeffs  its coefficients: 3, 4, 4 or 9 by the type
/// \param papadfRows  three rows of three doubles
/// \returns 0, or -1 for a type outside 0 to 8; then the rows are left as they were.
VETRA_EXPORT int RotToMatrix(RotationType eType, const double* padfCoeffs,
                             double* const* papadfRows);

/// The coefficients of the rotation of a matrix, by the rules of `ConvertRotation`. The matrix
/// isn't checked.
///
/// \param papadfRows  three rows of three doubles
/// \param eType       form of the result
/// \param padfCoeffs  takes 3, 4, 4 or 9 coefficients by the type
/// \returns 0, or -1 for a type outside 0 to 8; then the coefficients are left as they were.
VETRA_EXPORT int MatrixToRot(const double* const* papadfRows, RotationType eType,
                             double* padfCoeffs);

/// The unit quaternion of a matrix, with the sign that `ConvertRotation` tells: w is positive if
/// 1 + m0 + m4 + m8, which is 4 w^2, is above 1e-9. Right to 1e-14 for every rotation, half turns
/// included (S. W. Shepperd, "Quaternion from rotation matrix", J. Guidance and Control 1, 1978).
///
/// \param padfMatrix  9 elements, row-major
/// \param padfQuat    takes x, y, z, w
/// \returns 0
VETRA_EXPORT int MatrixElementsToQuaternion(const double* padfMatrix, double* padfQuat);

/// The matrix of a unit quaternion:
///
///     | xx-yy-zz+ww   2 (xy+wz)    2 (xz-wy)  |
///     |  2 (xy-wz)   yy-xx-zz+ww   2 (yz+wx)  |
///     |  2 (xz+wy)    2 (yz-wx)   zz-xx-yy+ww |
///
/// For a quaternion of another length it is the rotation times the squared length.
///
/// \param padfQuat    x, y, z, w
/// \param padfMatrix  takes 9 elements, row-major
VETRA_EXPORT void QuaternionToMatrixElements(const double* padfQuat, double* padfMatrix);

/// The quaternion (s ax, s ay, s az, c), with s and c the sine and cosine of half the angle.
///
/// \param padfAxisAngle  axis x, y, z, angle
/// \param padfQuat       takes x, y, z, w
/// \returns 0
VETRA_EXPORT int AxisAngleToQuaternion(const double* padfAxisAngle, double* padfQuat);

/// Axis and angle of a unit quaternion: the angle is 2 acos(w), in [0, 2 pi], the axis (x, y, z)
/// divided by the sine of half the angle. The axis is (0, 0, 1) if x, y and z are 0.
///
/// Where the squared length is 1 within 1e-9, both come from the vector part and w together, so
/// that small angles keep all digits and a w beyond +-1 does no harm. Other quaternions are put
/// into the formulas as they stand: the zero quaternion gives the axis (0, 0, 0) and the angle pi,
/// a w beyond +-1 NaN.
///
/// \param padfQuat       x, y, z, w
/// \param padfAxisAngle  takes axis x, y, z, angle
/// \returns 0
VETRA_EXPORT int QuaternionToAxisAngle(const double* padfQuat, double* padfAxisAngle);

/// The elementary matrices Rx, Ry and Rz.
///
/// \param dfAngle     radians
/// \param padfMatrix  takes 9 elements, row-major
/// @{
VETRA_EXPORT void XRotToMatrix(double dfAngle, double* padfMatrix);
VETRA_EXPORT void YRotToMatrix(double dfAngle, double* padfMatrix);
VETRA_EXPORT void ZRotToMatrix(double dfAngle, double* padfMatrix);
/// @}

/// The same into three rows of three doubles.
/// @{
VETRA_EXPORT void XRotToMatrix(double dfAngle, double* const* papadfRows);
VETRA_EXPORT void YRotToMatrix(double dfAngle, double* const* papadfRows);
VETRA_EXPORT void ZRotToMatrix(double dfAngle, double* const* papadfRows);
/// @}

#endif  // VETRA_BASE_UTILS_MATH_ROTATIONS_ROTATIONS_H
