#include "vetra/base/utils/math/rotations/quaternion.h"

#include <cfloat>
#include <cmath>

#include "vetra/base/utils/math/rotations/quaternionmath.h"

namespace vetra::qtn {

namespace {

Components ToComponents(const Quaternion& q) { return {q[0], q[1], q[2], q[3]}; }

Quaternion ToQuaternion(const Components& q) { return {q.x, q.y, q.z, q.w}; }

Components SlerpBetween(const Components& a, const Components& b, double t) {
    if (std::fabs(t) < DBL_EPSILON) {
        return a;
    }
    if (std::fabs(t - 1.0) < DBL_EPSILON) {
        return b;
    }
    return GreatArc(a, b, t);
}

}  // namespace

Quaternion Quaternion::operator*(double dfFactor) const {
    return ToQuaternion(Scaled(ToComponents(*this), dfFactor));
}

Quaternion Quaternion::operator*(const Quaternion& oOther) const {
    return ToQuaternion(Product(ToComponents(*this), ToComponents(oOther)));
}

Quaternion Quaternion::operator+(const Quaternion& oOther) const {
    return ToQuaternion(Sum(ToComponents(*this), ToComponents(oOther)));
}

Quaternion Quaternion::operator-(const Quaternion& oOther) const {
    return ToQuaternion(Difference(ToComponents(*this), ToComponents(oOther)));
}

Quaternion Quaternion::operator-() const { return {-mdfX, -mdfY, -mdfZ, -mdfW}; }

Quaternion Quaternion::operator/(double dfDivisor) const {
    return std::fabs(dfDivisor) > DBL_EPSILON
               ? ToQuaternion(Divided(ToComponents(*this), dfDivisor))
               : *this;
}

Quaternion Quaternion::operator/(const Quaternion& oOther) const { return *this * oOther.Inv(); }

Quaternion& Quaternion::operator*=(double dfFactor) { return *this = *this * dfFactor; }

Quaternion& Quaternion::operator*=(const Quaternion& oOther) { return *this = *this * oOther; }

Quaternion& Quaternion::operator+=(const Quaternion& oOther) { return *this = *this + oOther; }

Quaternion& Quaternion::operator-=(const Quaternion& oOther) { return *this = *this - oOther; }

Quaternion& Quaternion::operator/=(double dfDivisor) {
    if (!(std::fabs(dfDivisor) < DBL_EPSILON)) {
        *this = ToQuaternion(Divided(ToComponents(*this), dfDivisor));
    }
    return *this;
}

Quaternion& Quaternion::operator/=(const Quaternion& oOther) { return *this = *this / oOther; }

Quaternion Quaternion::Conj() const { return {-mdfX, -mdfY, -mdfZ, mdfW}; }

double Quaternion::DotProd(const Quaternion& oOther) const {
    return Dot(ToComponents(*this), ToComponents(oOther));
}

double Quaternion::Mag() const { return Magnitude(ToComponents(*this)); }

Quaternion Quaternion::Inv() const { return ToQuaternion(Inverse(ToComponents(*this))); }

Quaternion Quaternion::Normalize() const { return ToQuaternion(Normalized(ToComponents(*this))); }

void Quaternion::NormalizeSelf() {
    const double dfMagnitude = Mag();
    if (dfMagnitude < DBL_EPSILON) {
        mdfZ = 1.0;
    } else {
        *this /= dfMagnitude;
    }
}

Quaternion Quaternion::Log() const { return ToQuaternion(Logarithm(ToComponents(*this))); }

Quaternion Quaternion::Exp() const { return ToQuaternion(Exponential(ToComponents(*this))); }

Quaternion Quaternion::Pow(double dfExponent) const {
    return ToQuaternion(Power(ToComponents(*this), dfExponent));
}

void Quaternion::MakeSameSign(const Quaternion& oOther) {
    if (AreAxesOpposed(ToAxisAngle(Normalized(ToComponents(*this)), 0.0),
                       ToAxisAngle(Normalized(ToComponents(oOther)), 0.0))) {
        *this = -*this;
    }
}

void Quaternion::ToAxisAndAngle(double* padfAxis, double& dfAngle) const {
    const Components oAxisAngle = ToAxisAngle(Normalized(ToComponents(*this)), 0.0);
    padfAxis[0] = oAxisAngle.x;
    padfAxis[1] = oAxisAngle.y;
    padfAxis[2] = oAxisAngle.z;
    dfAngle = oAxisAngle.w;
}

void Quaternion::ToMatrix(double* padfMatrix) const {
    ToMatrixElements(Normalized(ToComponents(*this)), padfMatrix);
}

void Quaternion::FromMatrix(const double* padfMatrix) {
    *this = ToQuaternion(FromMatrixElements(padfMatrix, DBL_EPSILON));
}

Quaternion operator*(double dfFactor, const Quaternion& oQuat) { return oQuat * dfFactor; }

Quaternion operator/(double dfDividend, const Quaternion& oQuat) {
    return oQuat.Inv() * dfDividend;
}

void Slerp(const Quaternion& oStart, const Quaternion& oEnd, const double& dfT,
           Quaternion& oResult) {
    oResult = ToQuaternion(SlerpBetween(ToComponents(oStart), ToComponents(oEnd), dfT));
}

void Squad(const Quaternion& q0, const Quaternion& q1, const Quaternion& q2, const Quaternion& q3,
           const double& dfT, Quaternion& oResult) {
    oResult = ToQuaternion(SquadBetween(ToComponents(q0), ToComponents(q1), ToComponents(q2),
                                        ToComponents(q3), dfT, &SlerpBetween));
}

}  // namespace vetra::qtn
