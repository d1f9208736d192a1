#include "vetra/base/utils/math/convexhull.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <limits>
#include <random>
#include <set>
#include <utility>
#include <vector>

#include "tests/support/refusal.h"
#include "vetra/base/utils/math/orientation.h"

namespace {

using Point = std::pair<double, double>;
using Points = std::vector<Point>;
__extension__ using Wide = __int128;

Points Hull(const Points& voPoints) { return ConvexHull(voPoints).GetConvexHull(); }

Wide Cross(const Point& a, const Point& b, const Point& c) {
    const auto fn = [](double df) { return static_cast<Wide>(df); };
    return (fn(b.first) - fn(a.first)) * (fn(c.second) - fn(a.second)) -
           (fn(b.second) - fn(a.second)) * (fn(c.first) - fn(a.first));
}

// By definition, for whole numbers: edges are the pairs with every point on their left or between
// them.
Points PlainHull(const Points& voPoints) {
    const std::set<Point> oPoints(voPoints.begin(), voPoints.end());
    const auto fnIsEdge = [&](const Point& a, const Point& b) {
        return std::all_of(oPoints.begin(), oPoints.end(), [&](const Point& p) {
            const Wide nCross = Cross(a, b, p);
            return nCross > 0 ||
                   (nCross == 0 && std::minmax(a, b).first <= p && p <= std::minmax(a, b).second);
        });
    };
    Point oVertex = *std::min_element(oPoints.begin(), oPoints.end(), [](Point a, Point b) {
        return std::make_pair(a.second, a.first) < std::make_pair(b.second, b.first);
    });
    const Point oStart = oVertex;
    Points voHull;
    do {
        voHull.push_back(oVertex);
        for (const Point& p : oPoints) {
            if (p != oVertex && fnIsEdge(oVertex, p)) {
                oVertex = p;
                break;
            }
        }
    } while (oVertex != oStart);
    return voHull;
}

TEST(ConvexHull, EqualsThePlainHullOfRandomIntegers) {
    std::mt19937 oEngine(17);
    for (int nSet = 0; nSet < 6000; ++nSet) {
        // Down to sets full of duplicates and points in line.
        const int nRange = 1 << (nSet % 13 + 1);
        std::uniform_int_distribution<int> oRange(-nRange, nRange);
        Points voPoints(1 + static_cast<std::size_t>(nSet % 23));
        for (Point& o : voPoints) {
            o = {oRange(oEngine), nSet % 7 == 0 ? 1 : oRange(oEngine)};
        }
        const Points voHull = PlainHull(voPoints);
        ASSERT_EQ(Hull(voPoints), voHull) << nSet;
        // The same at scales where the products leave the range of double.
        for (const int nScale : {-1074, -600, 600, 1000}) {
            const auto fnScaled = [&](Points vo) {
                for (Point& o : vo) {
                    o = {std::ldexp(o.first, nScale), std::ldexp(o.second, nScale)};
                }
                return vo;
            };
            ASSERT_EQ(Hull(fnScaled(voPoints)), fnScaled(voHull)) << nSet << ' ' << nScale;
        }
        // In two steps.
        const auto itHalf = voPoints.begin() + static_cast<int>(voPoints.size() / 2);
        if (itHalf != voPoints.begin()) {
            ConvexHull oHull(Points(voPoints.begin(), itHalf));
            ASSERT_EQ(oHull.GetNewConvexHull(Points(itHalf, voPoints.end())), voHull) << nSet;
            ASSERT_EQ(oHull.GetNewConvexHull({}), voHull);
            ASSERT_EQ(oHull.GetConvexHull(), voHull);
        }
    }
}

// Gift wrapping as it is told; nothing if it doesn't return within the number of points.
Points PlainWrap(const Points& voPoints) {
    Points voHull;
    const Point oStart = *std::min_element(voPoints.begin(), voPoints.end(), [](Point a, Point b) {
        return std::make_pair(a.second, a.first) < std::make_pair(b.second, b.first);
    });
    for (Point c = oStart; voHull.empty() || c != oStart;) {
        if (voHull.size() == voPoints.size()) {
            return {};
        }
        voHull.push_back(c);
        Point oNext = c;
        for (const Point& p : voPoints) {
            const auto fnFar = [&](const Point& o) {
                return std::hypot(o.first - c.first, o.second - c.second);
            };
            const double dfCross = (p.first - c.first) * (oNext.second - c.second) -
                                   (p.second - c.second) * (oNext.first - c.first);
            if (dfCross > 0.0 || (dfCross == 0.0 && fnFar(p) > fnFar(oNext))) {
                oNext = p;
            }
        }
        c = oNext;
    }
    return voHull;
}

TEST(ConvexHull, NearlyCollinearPointsEnd) {
    std::mt19937_64 oEngine(23);
    std::uniform_real_distribution<double> oSlope(0.5, 1.0);
    std::uniform_int_distribution<int> oRange(1, 1 << 20);
    int nOpen = 0;
    for (int nSet = 0; nSet < 4000; ++nSet) {
        const double dfSlope = oSlope(oEngine);
        Points voPoints(3 + static_cast<std::size_t>(nSet % 20));
        Points voWhole;  // the same in units that make the rounded heights whole numbers
        for (Point& o : voPoints) {
            const int x = oRange(oEngine);
            o = {x, x * dfSlope};
            voWhole.emplace_back(x, std::ldexp(o.second, 53));
        }
        Points voHull = PlainWrap(voPoints);
        if (voHull.empty()) {
            ++nOpen;
            for (const Point& o : PlainHull(voWhole)) {
                voHull.emplace_back(o.first, std::ldexp(o.second, -53));
            }
        }
        ASSERT_EQ(Hull(voPoints), voHull) << nSet;
    }
    EXPECT_GT(nOpen, 400);
}

TEST(ConvexHull, ManyVertices) {
    // A parabola: every point is a vertex, and the lowest one stands in the middle.
    Points voPoints;
    for (int x = -20000; x <= 20000; ++x) {
        voPoints.emplace_back(x, double(x) * x);
    }
    Points voHull = voPoints;
    std::rotate(voHull.begin(), voHull.begin() + 20000, voHull.end());
    EXPECT_EQ(Hull(voPoints), voHull);
}

TEST(ConvexHull, ZerosOfBothSigns) {
    // Of equal points the first one counts, by either method.
    for (const double dfScale : {1.0, 1e-300}) {
        const Points voHull =
            Hull({{dfScale, dfScale}, {-0.0, -0.0}, {0.0, 0.0}, {dfScale, 0.0}, {dfScale, -0.0}});
        ASSERT_EQ(voHull.size(), 3u);
        EXPECT_TRUE(std::signbit(voHull[0].first) && std::signbit(voHull[0].second));
        EXPECT_FALSE(std::signbit(voHull[1].second));
    }
}

TEST(ConvexHull, Inside) {
    const ConvexHull oSquare({{1, 1}, {0, 1}, {0.5, 0}, {0, 0}, {1, 0}});
    EXPECT_EQ(oSquare.GetConvexHull(), (Points{{0, 0}, {1, 0}, {1, 1}, {0, 1}}));
    for (const Point& o : Points{{0.5, 0.5}, {1, 0.5}, {0.5, 1}, {1, 1}}) {
        EXPECT_TRUE(oSquare.IsInside(o)) << o.first << ' ' << o.second;
    }
    const double dfNan = std::numeric_limits<double>::quiet_NaN();
    for (const Point& o :
         Points{{0, 0.5}, {0.5, 0}, {2, 0.5}, {0.5, 2}, {0.5, -1}, {dfNan, 0.5}, {0.5, dfNan}}) {
        EXPECT_FALSE(oSquare.IsInside(o)) << o.first << ' ' << o.second;
    }
    // An edge 1e-7 wide has the slope 1e6 and so reaches 0.1 up, not 1.
    const ConvexHull oSteep({{0, 0}, {1, 0}, {1 - 1e-7, 1}, {0, 1}});
    EXPECT_FALSE(oSteep.IsInside({1 - 5e-8, 0.5}));
    for (const Points& vo : {Points{{1, 1}}, Points{{0, 0}, {2, 2}}}) {
        const ConvexHull oFlat(vo);
        for (const Point& o : Points{{1, 1}, {0, 0}, {2, 2}, {1, 0}}) {
            EXPECT_FALSE(oFlat.IsInside(o));
        }
    }
}

TEST(ConvexHull, Refusals) {
    try {
        Hull({});
        ADD_FAILURE();
    } catch (const vetra::ParameterException& o) {
        EXPECT_EQ(o.GetArgument() + "|" + o.GetGot() + "|" + o.GetExpected() + "|" + o.GetMessage(),
                  "pPoints|Empty|NonEmpty|There should be at least one point");
        EXPECT_EQ(o.GetType(), 1);
        EXPECT_EQ(o.GetFile() + o.GetFunction(), "");
        EXPECT_EQ(o.GetLine(), 0u);
    }
    const Points voTriangle = {{0, 0}, {1, 0}, {0, 1}};
    ConvexHull oHull(voTriangle);
    const double dfNan = std::numeric_limits<double>::quiet_NaN();
    const double dfInf = std::numeric_limits<double>::infinity();
    const std::pair<Point, const char*> aoBad[] = {
        {{1, dfNan}, "(1, nan)"}, {{dfInf, 2}, "(inf, 2)"}, {{-dfInf, 2}, "(-inf, 2)"}};
    for (const auto& [oBad, pszGot] : aoBad) {
        const vetra::tests::Refusal oRefusal{"pPoints", 1, pszGot, "Finite coordinates",
                                             "Coordinates of points must be finite numbers"};
        const Points voBad = {{5, 5}, oBad};
        vetra::tests::ExpectRefusal(oRefusal, [&] { Hull(voBad); });
        vetra::tests::ExpectRefusal(oRefusal, [&] { oHull.GetNewConvexHull(voBad); });
        EXPECT_EQ(oHull.GetConvexHull(), voTriangle);
        EXPECT_EQ(oHull.GetNewConvexHull({}), voTriangle);
    }
    EXPECT_EQ(oHull.Clone(), nullptr);
    ConvexHull oOther(Points{{3, 3}});
    oOther = oHull;
    EXPECT_EQ(oOther.GetNewConvexHull({{1, 1}}), (Points{{0, 0}, {1, 0}, {1, 1}, {0, 1}}));
    EXPECT_EQ(oHull.GetConvexHull(), voTriangle);
}

TEST(Orientation, AtTheEndsOfTheRange) {
    const double M = std::numeric_limits<double>::max();
    const double d = std::numeric_limits<double>::denorm_min();
    const struct {
        Point b, c;
        int nTurn;
    } aoCases[] = {
        {{M, d}, {-M, -d}, 0}, {{M, d}, {-M, 0}, 1},     {{M, d}, {-M, -2 * d}, -1},
        {{d, 0}, {0, d}, 1},   {{0, M}, {M, 0}, -1},     {{M, M}, {-M, -M}, 0},
        {{d, d}, {M, M}, 0},   {{d, 2 * d}, {M, M}, -1}, {{1, 1 + 1e-15}, {1e-300, 1e-300}, -1},
        {{0, 0}, {M, d}, 0}};
    for (const auto& o : aoCases) {
        EXPECT_EQ(vetra::utils::math::Orientation({0, 0}, o.b, o.c), o.nTurn) << o.b.first;
        EXPECT_EQ(vetra::utils::math::Orientation(o.c, o.b, {0, 0}), -o.nTurn) << o.b.first;
        EXPECT_EQ(vetra::utils::math::Orientation(o.b, o.c, {-0.0, 0}), o.nTurn) << o.b.first;
    }
}

}  // namespace
