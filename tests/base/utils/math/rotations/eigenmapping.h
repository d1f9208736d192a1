#ifndef VETRA_TESTS_BASE_UTILS_MATH_ROTATIONS_EIGENMAPPING_H
#define VETRA_TESTS_BASE_UTILS_MATH_ROTATIONS_EIGENMAPPING_H

#include <array>
#include <Eigen/Geometry>

namespace vetra::tests {

constexpr double kPi = 3.141592653589793;

using Matrix9 = std::array<double, 9>;
using Quat4 = std::array<double, 4>;

/// Eigen's matrices turn vectors, ours turn frames: one is the transpose of the other.
inline Matrix9 OursOf(const Eigen::Matrix3d& oActive) {
    Matrix9 m;
    Eigen::Map<Eigen::Matrix<double, 3, 3, Eigen::RowMajor>>(m.data()) = oActive.transpose();
    return m;
}

inline Quat4 OursOf(const Eigen::Quaterniond& q) { return {q.x(), q.y(), q.z(), q.w()}; }

inline Eigen::Quaterniond EigensOf(const double* q) {
    return Eigen::Quaterniond(q[3], q[0], q[1], q[2]);
}

/// The greatest difference of two arrays of the same length; NaN if there is a NaN.
template <typename Array>
double Difference(const Array& a, const Array& b) {
    double dfMax = 0.0;
    for (std::size_t i = 0; i < a.size(); ++i) {
        const double df = std::abs(a[i] - b[i]);
        dfMax = dfMax >= df ? dfMax : df;
    }
    return dfMax;
}

}  // namespace vetra::tests

#endif  // VETRA_TESTS_BASE_UTILS_MATH_ROTATIONS_EIGENMAPPING_H
