#ifndef VETRA_BASE_UTILS_MATH_ROTATIONS_QUATERNIONMATH_H
#define VETRA_BASE_UTILS_MATH_ROTATIONS_QUATERNIONMATH_H

#include <cfloat>
#include <cmath>

// Private: the formulas behind the rotation forms, the class Quaternion and the array functions.
namespace vetra::qtn {

/// By how much the squared length of a unit quaternion or axis may differ from 1.
constexpr double kUnitTolerance = 1e-9;

struct Components {
    double x;
    double y;
    double z;
    double w;
};

inline Components Load(const double* padf) { return {padf[0], padf[1], padf[2], padf[3]}; }

inline void Store(const Components& q, double* padf) {
    padf[0] = q.x;
    padf[1] = q.y;
    padf[2] = q.z;
    padf[3] = q.w;
}

inline Components Sum(const Components& a, const Components& b) {
    return {a.x + b.x, a.y + b.y, a.z + b.z, a.w + b.w};
}

inline Components Difference(const Components& a, const Components& b) {
    return {a.x - b.x, a.y - b.y, a.z - b.z, a.w - b.w};
}

inline Components Scaled(const Components& q, double s) {
    return {q.x * s, q.y * s, q.z * s, q.w * s};
}

inline Components Divided(const Components& q, double s) {
    return {q.x / s, q.y / s, q.z / s, q.w / s};
}

/// Hamilton's product.
inline Components Product(const Components& a, const Components& b) {
    return {a.x * b.w + b.x * a.w + a.y * b.z - b.y * a.z,
            a.y * b.w + b.y * a.w + a.z * b.x - b.z * a.x,
            a.z * b.w + b.z * a.w + b.y * a.x - a.y * b.x,
            a.w * b.w - a.x * b.x - a.y * b.y - a.z * b.z};
}

inline Components Conjugate(const Components& q) { return {-q.x, -q.y, -q.z, q.w}; }

inline double Dot(const Components& a, const Components& b) {
    return a.x * b.x + a.y * b.y + a.z * b.z + a.w * b.w;
}

inline double Magnitude(const Components& q) { return std::sqrt(Dot(q, q)); }

/// A quaternion that is too small to have an inverse is given back.
inline Components Inverse(const Components& q) {
    const double dfSquare = Dot(q, q);
    return dfSquare < DBL_EPSILON ? q : Divided(Conjugate(q), dfSquare);
}

/// A quaternion that is too small to have a direction becomes (0, 0, 1, 0).
inline Components Normalized(const Components& q) {
    const double dfMagnitude = Magnitude(q);
    return dfMagnitude < DBL_EPSILON ? Components{0.0, 0.0, 1.0, 0.0} : Divided(q, dfMagnitude);
}

/// Half of a quaternion's rotation angle, in [0, pi], and its sine.
struct HalfAngle {
    double dfAngle;
    double dfSine;
};

/// For unit quaternions the sine is the length of the vector part, and the angle comes from both:
/// acos(w) has no digits left near 0 and pi. A vector part whose square underflows counts as 0.
inline HalfAngle ToHalfAngle(const Components& q) {
    const double dfSquare = q.x * q.x + q.y * q.y + q.z * q.z;
    if (std::fabs(dfSquare + q.w * q.w - 1.0) <= kUnitTolerance) {
        const double dfSine = dfSquare < DBL_MIN ? 0.0 : std::sqrt(dfSquare);
        return {std::atan2(dfSine, q.w), dfSine};
    }
    const double dfAngle = std::acos(q.w);
    return {dfAngle, std::sin(dfAngle)};
}

/// Axis (x, y, z) and angle (w).
/// \param dfNoRotation  the greatest angle that counts as none
inline Components ToAxisAngle(const Components& q, double dfNoRotation) {
    const HalfAngle oHalf = ToHalfAngle(q);
    const double dfAngle = 2.0 * oHalf.dfAngle;
    if (dfAngle <= dfNoRotation || oHalf.dfSine == 0.0) {
        return {0.0, 0.0, 1.0, dfAngle};
    }
    return {q.x / oHalf.dfSine, q.y / oHalf.dfSine, q.z / oHalf.dfSine, dfAngle};
}

/// Whether the axes of two rotations, given as axis and angle, point into opposite half spaces.
inline bool AreAxesOpposed(const Components& a, const Components& b) {
    return a.x * b.x + a.y * b.y + a.z * b.z < 0.0;
}

inline Components Logarithm(const Components& q) {
    const Components n = Normalized(q);
    if (std::fabs(n.w - 1.0) < DBL_EPSILON) {
        return {0.0, 0.0, 0.0, 0.0};
    }
    const HalfAngle oHalf = ToHalfAngle(n);
    // -1 is a full turn about no axis.
    const double k = oHalf.dfSine == 0.0 ? 0.0 : oHalf.dfAngle / oHalf.dfSine;
    return {k * n.x, k * n.y, k * n.z, 0.0};
}

inline Components Exponential(const Components& q) {
    const double m = Magnitude(q);
    if (m < DBL_EPSILON) {
        return {0.0, 0.0, 0.0, 1.0};
    }
    const double s = std::sin(m) / m;
    return {s * q.x, s * q.y, s * q.z, std::cos(m)};
}

inline Components Power(const Components& q, double t) {
    return Exponential(Scaled(Logarithm(q), t));
}

/// a (conj(a) b)^t, without regard to ends and lengths.
inline Components GreatArc(const Components& a, const Components& b, double t) {
    return Product(a, Power(Product(Conjugate(a), b), t));
}

/// Squad between b and c (K. Shoemake, "Quaternion calculus and fast animation", SIGGRAPH course
/// notes, 1987).
/// \param fnSlerp  (a, b, t)
template <typename Slerp>
Components SquadBetween(const Components& a, const Components& b, const Components& c,
                        const Components& d, double t, Slerp fnSlerp) {
    if (std::fabs(t) < DBL_EPSILON) {
        return b;
    }
    if (std::fabs(t - 1.0) < DBL_EPSILON) {
        return c;
    }
    const auto fnControl = [](const Components& p, const Components& q, const Components& n) {
        const Components oInverse = Conjugate(q);
        const Components oLogs =
            Sum(Logarithm(Product(oInverse, n)), Logarithm(Product(oInverse, p)));
        return Product(q, Exponential(Scaled(oLogs, -0.25)));
    };
    const Components u = fnSlerp(b, c, t);
    const Components v = fnSlerp(fnControl(a, b, c), fnControl(b, c, d), t);
    return fnSlerp(u, v, (1.0 - t) * (t * 2.0));
}

inline void ToMatrixElements(const Components& q, double* m) {
    const double x2 = 2.0 * q.x;
    const double y2 = 2.0 * q.y;
    const double z2 = 2.0 * q.z;
    const double dfSum = q.w * q.w + q.x * q.x;
    const double dfDiff = q.w * q.w - q.x * q.x;
    const double dfSumYZ = q.y * q.y + q.z * q.z;
    const double dfDiffYZ = q.y * q.y - q.z * q.z;
    m[0] = dfSum - dfSumYZ;
    m[1] = x2 * q.y + z2 * q.w;
    m[2] = x2 * q.z - y2 * q.w;
    m[3] = x2 * q.y - z2 * q.w;
    m[4] = dfDiff + dfDiffYZ;
    m[5] = y2 * q.z + x2 * q.w;
    m[6] = x2 * q.z + y2 * q.w;
    m[7] = y2 * q.z - x2 * q.w;
    m[8] = dfDiff - dfDiffYZ;
}

/// The quaternion of a matrix: 4 times the square of each component is 1 with the diagonal elements
/// added or subtracted. The greatest of the four is the divisor for the others, so that nothing
/// cancels.
/// \param dfMinTrace  w is positive where 4 w^2 is above this; else the greatest of x, y, z is
inline Components FromMatrixElements(const double* m, double dfMinTrace) {
    const double dfTrace = m[0] + m[4] + m[8] + 1.0;
    const bool bX = m[0] >= m[4] && m[0] >= m[8];
    const bool bY = m[4] > m[8];
    const double dfMax = bX ? m[0] : (bY ? m[4] : m[8]);
    // 4 w^2 is dfTrace, and the greatest of 4 x^2, 4 y^2, 4 z^2 is 2 + 2 dfMax - dfTrace.
    const bool bW = dfTrace > dfMinTrace && dfTrace >= 1.0 + dfMax;
    const double r = std::sqrt(bW ? dfTrace : 2.0 + 2.0 * dfMax - dfTrace);
    const double k = 0.5 / r;
    if (bW) {
        return {(m[5] - m[7]) * k, (m[6] - m[2]) * k, (m[1] - m[3]) * k, 0.5 * r};
    }
    Components q;
    if (bX) {
        q = {0.5 * r, (m[3] + m[1]) * k, (m[2] + m[6]) * k, (m[5] - m[7]) * k};
    } else if (bY) {
        q = {(m[3] + m[1]) * k, 0.5 * r, (m[7] + m[5]) * k, (m[6] - m[2]) * k};
    } else {
        q = {(m[2] + m[6]) * k, (m[7] + m[5]) * k, 0.5 * r, (m[1] - m[3]) * k};
    }
    const bool bTurn = dfTrace > dfMinTrace && q.w < 0.0;
    return bTurn ? Components{-q.x, -q.y, -q.z, -q.w} : q;
}

}  // namespace vetra::qtn

#endif  // VETRA_BASE_UTILS_MATH_ROTATIONS_QUATERNIONMATH_H
