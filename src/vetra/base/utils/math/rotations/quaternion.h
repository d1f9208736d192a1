#ifndef VETRA_BASE_UTILS_MATH_ROTATIONS_QUATERNION_H
#define VETRA_BASE_UTILS_MATH_ROTATIONS_QUATERNION_H

#include "vetra/export.h"

namespace vetra::qtn {

/// A quaternion x i + y j + z k + w, with Hamilton's product (i j = k). Unit quaternions are
/// rotations by the conventions of rotations.h: the scalar is stored last, and a * b is the
/// rotation a followed by b.
///
/// Nothing throws. NaN in gives NaN out. Squares of components are formed: magnitudes beyond 1e154
/// count as infinite. "Too small" is below epsilon, 2.220446049250313e-16.
class VETRA_EXPORT Quaternion {
 public:
    /// (0, 0, 0, 0), which is not a rotation; the identity is (0, 0, 0, 1).
    Quaternion() = default;
    /// The components as they are: nothing is normalised.
    Quaternion(const double& dfX, const double& dfY, const double& dfZ, const double& dfW)
        : mdfX(dfX), mdfY(dfY), mdfZ(dfZ), mdfW(dfW) {}
    /// A copy.
    Quaternion(const Quaternion& oOther) = default;
    /// A copy.
    Quaternion& operator=(const Quaternion& oOther) = default;
    virtual ~Quaternion() = default;

    /// x, y, z, w for 0 to 3; 0.0 for every other index.
    double operator[](int nIndex) const {
        switch (nIndex) {
            case 0:
                return mdfX;
            case 1:
                return mdfY;
            case 2:
                return mdfZ;
            case 3:
                return mdfW;
            default:
                return 0.0;
        }
    }

    /// All four components times the factor.
    Quaternion operator*(double dfFactor) const;
    /// Hamilton's product: this rotation, followed by the other.
    Quaternion operator*(const Quaternion& oOther) const;
    /// Component by component.
    Quaternion operator+(const Quaternion& oOther) const;
    /// Component by component.
    Quaternion operator-(const Quaternion& oOther) const;
    /// All four components negated: the same rotation.
    Quaternion operator-() const;
    /// An unchanged copy if the divisor's magnitude is not above epsilon (so for NaN, too).
    Quaternion operator/(double dfDivisor) const;
    /// This times the inverse of the other.
    Quaternion operator/(const Quaternion& oOther) const;

    /// All four components times the factor.
    Quaternion& operator*=(double dfFactor);
    /// This becomes this times the other.
    Quaternion& operator*=(const Quaternion& oOther);
    /// Component by component.
    Quaternion& operator+=(const Quaternion& oOther);
    /// Component by component.
    Quaternion& operator-=(const Quaternion& oOther);
    /// Unchanged if the divisor's magnitude is below epsilon; unlike `operator/`, it divides by
    /// epsilon itself and by NaN.
    Quaternion& operator/=(double dfDivisor);
    /// This becomes this times the inverse of the other.
    Quaternion& operator/=(const Quaternion& oOther);

    /// (-x, -y, -z, w): the inverse rotation of a unit quaternion.
    Quaternion Conj() const;
    /// The sum of the products of the four components.
    double DotProd(const Quaternion& oOther) const;
    /// The length, the square root of the sum of the four squares.
    double Mag() const;
    /// `Conj` divided by the squared length; an unchanged copy if that is too small.
    Quaternion Inv() const;
    /// A copy of length 1; (0, 0, 1, 0), a half turn about Z, if the length is too small.
    Quaternion Normalize() const;
    /// The same in place, but if the length is too small only z is set, to 1.
    void NormalizeSelf();

    /// The logarithm of the normalised copy: (h x, h y, h z, 0) for the unit axis (x, y, z) and
    /// half the rotation angle, h in [0, pi]. (0, 0, 0, 0) if w of that copy is 1 within epsilon,
    /// that is for angles up to 4e-8, and for the full turn (0, 0, 0, -1).
    Quaternion Log() const;
    /// (s x, s y, s z, cos m) for the length m of all four components and s = sin(m) / m; the
    /// identity if m is too small. For quaternions with w = 0, such as `Log` gives, that is the
    /// exponential function.
    Quaternion Exp() const;
    /// `Exp` of dfExponent times `Log`: the same rotation axis, the angle times dfExponent.
    Quaternion Pow(double dfExponent) const;

    /// Negates all four components if the rotation axes of this and the other one, as
    /// `ToAxisAndAngle` gives them, form an angle of more than 90 degrees. Looks at the axes alone:
    /// equal axes with scalars of opposite sign are left as they are.
    void MakeSameSign(const Quaternion& oOther);

    /// Axis and angle of the normalised copy.
    /// \param padfAxis  takes the axis, length 1; (0, 0, 1) if there is no vector part
    /// \param dfAngle   takes the angle in radians, in [0, 2 pi]
    void ToAxisAndAngle(double* padfAxis, double& dfAngle) const;
    /// The matrix of the normalised copy, as of `QuaternionToMatrixElements`.
    /// \param padfMatrix  takes 9 elements, row-major
    void ToMatrix(double* padfMatrix) const;
    /// Takes the rotation of a matrix, as `MatrixElementsToQuaternion`, but w is positive as soon
    /// as 1 + m0 + m4 + m8 is above epsilon.
    /// \param padfMatrix  9 elements, row-major
    void FromMatrix(const double* padfMatrix);

 private:
    double mdfX = 0.0;
    double mdfY = 0.0;
    double mdfZ = 0.0;
    double mdfW = 0.0;
};

/// All four components times the factor.
VETRA_EXPORT Quaternion operator*(double dfFactor, const Quaternion& oQuat);
/// The scalar times the inverse of the quaternion.
VETRA_EXPORT Quaternion operator/(double dfDividend, const Quaternion& oQuat);

/// Spherical linear interpolation: oStart times (conj(oStart) oEnd) to the power of t, at constant
/// angular speed. Takes the way that the signs of the two give: the shorter one if their dot
/// product is not negative. The result is not normalised. Ends that are less than 4e-8 radians
/// apart count as equal, by the rule of `Log`: the result is oStart.
///
/// \param oStart   unit quaternion, the result if t is 0 within epsilon
/// \param oEnd     unit quaternion, the result if t is 1 within epsilon
/// \param dfT      any number: below 0 and beyond 1 it extrapolates
/// \param oResult  takes the result; may be one of the others
VETRA_EXPORT void Slerp(const Quaternion& oStart, const Quaternion& oEnd, const double& dfT,
                        Quaternion& oResult);

/// Spherical cubic interpolation between q1 and q2, whose tangents at the keys depend on q0 and q3,
/// so that a sequence of keys is passed smoothly (K. Shoemake, "Quaternion calculus and fast
/// animation", SIGGRAPH course notes, 1987).
///
/// \param q0, q1, q2, q3  successive keys, unit quaternions of matching signs
/// \param dfT             q1 if it is 0 and q2 if it is 1, within epsilon
/// \param oResult         takes the result; may be one of the keys
VETRA_EXPORT void Squad(const Quaternion& q0, const Quaternion& q1, const Quaternion& q2,
                        const Quaternion& q3, const double& dfT, Quaternion& oResult);

}  // namespace vetra::qtn

#endif  // VETRA_BASE_UTILS_MATH_ROTATIONS_QUATERNION_H
