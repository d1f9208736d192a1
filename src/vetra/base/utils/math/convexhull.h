#ifndef VETRA_BASE_UTILS_MATH_CONVEXHULL_H
#define VETRA_BASE_UTILS_MATH_CONVEXHULL_H

#include <utility>
#include <vector>

#include "vetra/export.h"

/// The convex hull of points in the plane, each a pair of x and y.
///
/// The hull's vertices are given counter-clockwise, beginning at the lowest point (lowest y; among
/// those, lowest x). The first one is not repeated at the end, points on an edge are no vertices,
/// and of equal points there is one. One point, or two, are their own hull, and points on a line
/// have the hull of their two ends.
///
/// **Rounding.** Gift wrapping decides which of two points is farther to the right by the sign of a
/// cross product in double. It is right wherever the products are exact, as for integers up to
/// 2^25, and else within rounding: where three points nearly line up, one may be left out or stay
/// that would not by exact arithmetic. The hull is exact where gift wrapping doesn't come back to
/// its start, which nearly collinear points can bring about, where the extent of the points is so
/// large or small that products leave the range of double, and where points times vertices exceed
/// 2^30.
///
/// Time is proportional to points times vertices up to that product, and to n log n beyond.
///
/// Const operations of one object may run concurrently.
class VETRA_EXPORT ConvexHull {
 public:
    /// \param points  at least one; coordinates are finite
    /// \throws ParameterException for no points, and for coordinates that are NaN or infinite.
    explicit ConvexHull(std::vector<std::pair<double, double>> points);
    /// Takes over points and hull.
    ConvexHull& operator=(const ConvexHull& oOther);
    ~ConvexHull();

    /// There is no cloning: null.
    ConvexHull* Clone() const;

    /// The vertices.
    std::vector<std::pair<double, double>> GetConvexHull() const;

    /// Extends the hull, whose vertices take part in place of the points that it was made from.
    ///
    /// \param extra  more points, or none; coordinates are finite
    /// \return the new vertices
    /// \throws ParameterException for coordinates that are NaN or infinite; the hull stays as it
    ///         was.
    std::vector<std::pair<double, double>> GetNewConvexHull(
        std::vector<std::pair<double, double>> extra);

    /// Whether a point is inside the hull, by the number of edges above it.
    ///
    /// The hull is half open: of a square along the axes, points on the right and the top side are
    /// inside, those on the left and the bottom side are not. An edge that is narrower than 1e-6
    /// counts as one of the slope 1e6. A hull of one or two vertices contains nothing.
    bool IsInside(std::pair<double, double> point) const;

 protected:
    /// No points, and no hull.
    ConvexHull();
    /// No points and no hull, whatever the other holds: assign to copy a hull.
    ConvexHull(const ConvexHull& oOther);

 private:
    void Init();

    std::vector<std::pair<double, double>> mvoPoints;
    std::vector<std::pair<double, double>> mvoHull;
};

#endif  // VETRA_BASE_UTILS_MATH_CONVEXHULL_H
