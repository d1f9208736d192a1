#ifndef VETRA_BASE_UTILS_MATH_ORIENTATION_H
#define VETRA_BASE_UTILS_MATH_ORIENTATION_H

#include <utility>

// Private.
namespace vetra::utils::math {

/// Exactly which way the way from \p a by \p b to \p c turns: 1 counter-clockwise, -1 clockwise, 0
/// not at all. For all finite coordinates, also where differences or products of them overflow or
/// underflow.
int Orientation(const std::pair<double, double>& a, const std::pair<double, double>& b,
                const std::pair<double, double>& c);

}  // namespace vetra::utils::math

#endif  // VETRA_BASE_UTILS_MATH_ORIENTATION_H
