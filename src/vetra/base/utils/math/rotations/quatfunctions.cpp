#include "vetra/base/utils/math/rotations/quatfunctions.h"

#include <cmath>

#include "vetra/base/utils/math/rotations/quaternionmath.h"

namespace {

using namespace vetra::qtn;

constexpr double kSlerpEnd = 1e-14;
// Quaternions whose arc is so short that its chord will do.
constexpr double kNearlyEqual = 1e-8;

Components LerpBetween(const Components& a, const Components& b, double t) {
    return Normalized(Sum(Scaled(a, 1.0 - t), Scaled(b, t)));
}

Components SlerpBetween(const Components& a, const Components& b, double t) {
    if (std::fabs(t) < kSlerpEnd) {
        return a;
    }
    if (std::fabs(t - 1.0) < kSlerpEnd) {
        return b;
    }
    if (std::fabs(Dot(a, b) - 1.0) < kNearlyEqual) {
        return LerpBetween(a, b, t);
    }
    return Normalized(GreatArc(a, b, t));
}

}  // namespace

void QuatAdd(const double* padfA, const double* padfB, double* padfOut) {
    Store(Sum(Load(padfA), Load(padfB)), padfOut);
}

void QuatSubtract(const double* padfA, const double* padfB, double* padfOut) {
    Store(Difference(Load(padfA), Load(padfB)), padfOut);
}

void QuatConj(const double* padfQuat, double* padfOut) {
    Store(Conjugate(Load(padfQuat)), padfOut);
}

void UnitQuatInv(const double* padfQuat, double* padfOut) { QuatConj(padfQuat, padfOut); }

double QuatDotProd(const double* padfA, const double* padfB) {
    return Dot(Load(padfA), Load(padfB));
}

double QuatMag(const double* padfQuat) { return Magnitude(Load(padfQuat)); }

void QuatMult(const double* padfA, const double* padfB, double* padfOut) {
    Store(Product(Load(padfA), Load(padfB)), padfOut);
}

void QuatMultScalar(const double* padfQuat, const double& dfFactor, double* padfOut) {
    Store(Scaled(Load(padfQuat), dfFactor), padfOut);
}

void QuatInv(const double* padfQuat, double* padfOut) { Store(Inverse(Load(padfQuat)), padfOut); }

void QuatNormalize(const double* padfQuat, double* padfOut) {
    Store(Normalized(Load(padfQuat)), padfOut);
}

void QuatNormalizeSelf(double* padfQuat) { QuatNormalize(padfQuat, padfQuat); }

void QuatLog(const double* padfQuat, double* padfOut) { Store(Logarithm(Load(padfQuat)), padfOut); }

void QuatExp(const double* padfQuat, double* padfOut) {
    Store(Exponential(Load(padfQuat)), padfOut);
}

void QuatPow(const double* padfQuat, const double& dfExponent, double* padfOut) {
    Store(Power(Load(padfQuat), dfExponent), padfOut);
}

void QuatLerp(const double* padfA, const double* padfB, const double& dfT, double* padfOut) {
    Store(LerpBetween(Load(padfA), Load(padfB), dfT), padfOut);
}

void QuatSlerp(const double* padfA, const double* padfB, const double& dfT, double* padfOut) {
    Store(SlerpBetween(Load(padfA), Load(padfB), dfT), padfOut);
}

void QuatSquad(const double* padfQ0, const double* padfQ1, const double* padfQ2,
               const double* padfQ3, const double& dfT, double* padfOut) {
    Store(SquadBetween(Load(padfQ0), Load(padfQ1), Load(padfQ2), Load(padfQ3), dfT, &SlerpBetween),
          padfOut);
}

void QuatMakeSameSign(const double* padfReference, double* padfQuat) {
    const Components q = Load(padfQuat);
    if (AreAxesOpposed(ToAxisAngle(Load(padfReference), 0.0), ToAxisAngle(q, 0.0))) {
        Store(Scaled(q, -1.0), padfQuat);
    }
}

void QuatVecRot(const double* padfQuat, const double* padfVec, double* padfOut) {
    const Components q = Load(padfQuat);
    const double u[3] = {-q.x, -q.y, -q.z};
    const double v[3] = {padfVec[0], padfVec[1], padfVec[2]};
    const double dfAlong = 2.0 * (u[0] * v[0] + u[1] * v[1] + u[2] * v[2]);
    const double dfKept = q.w * q.w - (u[0] * u[0] + u[1] * u[1] + u[2] * u[2]);
    const double dfAcross = 2.0 * q.w;
    padfOut[0] = dfKept * v[0] + dfAlong * u[0] + dfAcross * (u[1] * v[2] - u[2] * v[1]);
    padfOut[1] = dfKept * v[1] + dfAlong * u[1] + dfAcross * (u[2] * v[0] - u[0] * v[2]);
    padfOut[2] = dfKept * v[2] + dfAlong * u[2] + dfAcross * (u[0] * v[1] - u[1] * v[0]);
}
