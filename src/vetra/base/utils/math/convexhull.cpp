#include "vetra/base/utils/math/convexhull.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

#include "vetra/base/utils/math/orientation.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

// Gift wrapping: R. A. Jarvis, "On the identification of the convex hull of a finite set of points
// in the plane", Information Processing Letters 2, 1973. The exact method is the monotone chain: A.
// M. Andrew, "Another efficient algorithm for convex hulls in two dimensions", ibid. 9, 1979.

using vetra::ParameterException;

namespace {

using Point = std::pair<double, double>;
using Points = std::vector<Point>;

// Tests of a point that gift wrapping may make: a second or so.
constexpr std::size_t kMaxTests = std::size_t{1} << 30;

bool IsLower(const Point& oLeft, const Point& oRight) {
    return oLeft.second < oRight.second ||
           (oLeft.second == oRight.second && oLeft.first < oRight.first);
}

void CheckFinite(const Points& voPoints) {
    for (const Point& oPoint : voPoints) {
        if (!std::isfinite(oPoint.first) || !std::isfinite(oPoint.second)) {
            throw ParameterException("pPoints", ParameterException::eInvalid,
                                     FormatString("(%g, %g)", oPoint.first, oPoint.second),
                                     "Finite coordinates",
                                     "Coordinates of points must be finite numbers", VETRA_HERE);
        }
    }
}

// Whether products of differences stay within the range of double, where they matter.
bool ProductsFit(const Points& voPoints) {
    Point oMin = voPoints.front();
    Point oMax = oMin;
    for (const Point& oPoint : voPoints) {
        oMin.first = std::min(oMin.first, oPoint.first);
        oMin.second = std::min(oMin.second, oPoint.second);
        oMax.first = std::max(oMax.first, oPoint.first);
        oMax.second = std::max(oMax.second, oPoint.second);
    }
    const auto fnFits = [](double dfExtent) {
        return dfExtent == 0.0 || (dfExtent > 1e-140 && dfExtent < 1e150);
    };
    return fnFits(oMax.first - oMin.first) && fnFits(oMax.second - oMin.second);
}

// The point that follows a vertex: the one farthest to the right as seen from there, and among
// those in line the farthest away. Null if all points equal the vertex.
const Point* NextVertex(const Points& voPoints, const Point& oVertex) {
    const auto fnSquare = [](double dx, double dy) { return dx * dx + dy * dy; };
    const Point* poNext = nullptr;
    double dfNextX = 0.0;
    double dfNextY = 0.0;
    for (const Point& oPoint : voPoints) {
        const double dx = oPoint.first - oVertex.first;
        const double dy = oPoint.second - oVertex.second;
        const double dfCross = dx * dfNextY - dy * dfNextX;
        // Without a candidate so far, or for the vertex itself, the product is 0.
        if (dfCross > 0.0 ||
            (dfCross == 0.0 && oPoint != oVertex &&
             (poNext == nullptr || fnSquare(dx, dy) > fnSquare(dfNextX, dfNextY)))) {
            poNext = &oPoint;
            dfNextX = dx;
            dfNextY = dy;
        }
    }
    return poNext;
}

// The hull, or nothing if the wrap doesn't close within a number of vertices.
Points Wrap(const Points& voPoints, std::size_t nMaxVertices) {
    Points voHull;
    const Point oStart = *std::min_element(voPoints.begin(), voPoints.end(), IsLower);
    const Point* poVertex = &oStart;
    do {
        if (voHull.size() == nMaxVertices) {
            return {};
        }
        voHull.push_back(*poVertex);
        poVertex = NextVertex(voPoints, *poVertex);
    } while (poVertex != nullptr && *poVertex != oStart);
    return voHull;
}

// Appends the points of a range, each of which drops those before it where the way doesn't turn to
// the left. The vertices before nFirst stay.
template <typename Iterator>
void AppendChain(Iterator itBegin, Iterator itEnd, std::size_t nFirst, Points& voHull) {
    for (; itBegin != itEnd; ++itBegin) {
        while (voHull.size() > nFirst &&
               vetra::utils::math::Orientation(*(voHull.end() - 2), voHull.back(), *itBegin) <= 0) {
            voHull.pop_back();
        }
        voHull.push_back(*itBegin);
    }
}

Points ExactHull(Points voPoints) {
    // Of equal points, which may differ in the sign of a zero, the first one counts.
    std::stable_sort(voPoints.begin(), voPoints.end(), IsLower);
    voPoints.erase(std::unique(voPoints.begin(), voPoints.end()), voPoints.end());
    Points voHull = {voPoints.front()};
    // Up on the right to the highest point, then down on the left.
    AppendChain(voPoints.begin() + 1, voPoints.end(), 1, voHull);
    AppendChain(voPoints.rbegin() + 1, voPoints.rend(), voHull.size(), voHull);
    if (voHull.size() > 1) {
        voHull.pop_back();
    }
    return voHull;
}

}  // namespace

ConvexHull::ConvexHull() = default;
ConvexHull::ConvexHull(const ConvexHull& oOther) = default;
ConvexHull::~ConvexHull() = default;

ConvexHull::ConvexHull(std::vector<std::pair<double, double>> points) {
    if (points.empty()) {
        throw ParameterException("pPoints", ParameterException::eInvalid, "Empty", "NonEmpty",
                                 "There should be at least one point", "", "", 0);
    }
    CheckFinite(points);
    mvoPoints = std::move(points);
    Init();
}

ConvexHull& ConvexHull::operator=(const ConvexHull& oOther) {
    if (this != &oOther) {
        Points voPoints = oOther.mvoPoints;
        mvoHull = oOther.mvoHull;
        mvoPoints.swap(voPoints);
    }
    return *this;
}

ConvexHull* ConvexHull::Clone() const { return nullptr; }

void ConvexHull::Init() {
    const std::size_t nPoints = mvoPoints.size();
    if (nPoints == 0) {
        return;
    }
    if (ProductsFit(mvoPoints)) {
        mvoHull = Wrap(mvoPoints, std::min(nPoints, std::max<std::size_t>(kMaxTests / nPoints, 1)));
    }
    if (mvoHull.empty()) {
        mvoHull = ExactHull(mvoPoints);
    }
}

std::vector<std::pair<double, double>> ConvexHull::GetConvexHull() const { return mvoHull; }

std::vector<std::pair<double, double>> ConvexHull::GetNewConvexHull(
    std::vector<std::pair<double, double>> extra) {
    CheckFinite(extra);
    ConvexHull oNew;
    oNew.mvoPoints = mvoHull;
    oNew.mvoPoints.insert(oNew.mvoPoints.end(), extra.begin(), extra.end());
    oNew.Init();
    Points voResult = oNew.mvoHull;
    mvoPoints.swap(oNew.mvoPoints);
    mvoHull.swap(oNew.mvoHull);
    return voResult;
}

bool ConvexHull::IsInside(std::pair<double, double> point) const {
    const auto [x, y] = point;
    const std::size_t nVertices = mvoHull.size();
    if (nVertices < 3) {
        return false;
    }
    bool bInside = false;
    for (std::size_t i = 0; i < nVertices; ++i) {
        const auto [xi, yi] = mvoHull[i];
        const auto [xj, yj] = mvoHull[(i + 1) % nVertices];
        const bool bCrosses = x > std::min(xi, xj) && std::max(xi, xj) >= x;
        const bool bReaches = yi > y || yj >= y;
        if (bCrosses && bReaches) {
            const double m = std::abs(xj - xi) < 1e-6 ? 1e6 : (yj - yi) / (xj - xi);
            if (yi - xi * m + x * m >= y) {
                bInside = !bInside;
            }
        }
    }
    return bInside;
}
