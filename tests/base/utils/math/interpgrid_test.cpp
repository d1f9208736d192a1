#include "vetra/base/utils/math/interpgrid.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>
#include <new>
#include <utility>
#include <vector>

#include "tests/base/utils/math/arrayallocations.h"

namespace {

using vetra::tests::goArrayAllocations;

const double kNan = std::numeric_limits<double>::quiet_NaN();
const double kInf = std::numeric_limits<double>::infinity();

TEST(InterpGrid, Layout) {
    const struct {
        double dfStart, dfEnd, dfSpacing;
        unsigned int nPoints;
        double dfStored;
    } aoCases[] = {{0, 10, 2, 6, 2},    {0, 10, 3, 5, 3},      {5, 5, 1, 2, 1},
                   {10, 0, -2, 6, -2},  {0, 10, -1, 2, -1},    {10, 0, 1, 2, 1},
                   {0, 10, 0, 5, 2.5},  {0, 10, -0.0, 5, 2.5}, {10, 0, 0, 5, -2.5},
                   {3, 3, 0, 2, 1},     {0, 10, 100, 2, 100},  {0, kInf, kInf, 2, kInf},
                   {0, 1, 0.1, 11, 0.1}};
    for (const auto& o : aoCases) {
        InterpGrid1D oGrid;
        oGrid.LayoutGrid(o.dfStart, o.dfEnd, o.dfSpacing);
        unsigned int nPoints = 0;
        double dfOffset = 0.0;
        double dfSpacing = 0.0;
        oGrid.GetGridSize(nPoints);
        oGrid.GetOffset(dfOffset);
        oGrid.GetSpacing(dfSpacing);
        EXPECT_EQ(nPoints, o.nPoints) << o.dfStart << ' ' << o.dfEnd << ' ' << o.dfSpacing;
        EXPECT_EQ(std::make_pair(dfOffset, dfSpacing), std::make_pair(o.dfStart, o.dfStored));
        EXPECT_EQ(goArrayAllocations.nLastSize, o.nPoints * sizeof(double));
    }
    InterpGrid1D oGrid;
    oGrid.LayoutGrid(0, kNan, 1);
    EXPECT_EQ(oGrid.GetNumGridPoints(), 2u);
}

// Component c of a function that is linear along each axis.
double Multilinear(std::size_t c, double x, double y, double z) {
    const double a = static_cast<double>(c + 1);
    return 1.0 + a * x - 2.0 * y + 3.0 * z + a * x * y - x * z + 0.5 * y * z + a * x * y * z;
}

TEST(InterpGrid, MultilinearFunctionsComeBackInsideAndOutside) {
    InterpGrid1D o1;
    InterpGrid2D o2;
    InterpGrid3D o3;
    o1.SetDimension(2);
    o2.SetDimension(3);
    o3.SetDimension(3);
    o1.LayoutGrid(-1, 3, 0.5);
    o2.LayoutGrid(-1, 2, 3, 4, 0.5, 0.25);
    o3.LayoutGrid(-1, 2, 8, 3, 4, 0, 0.5, 0.25, -4);
    EXPECT_EQ(o3.GetNumGridPoints(), 9u * 9 * 3);
    EXPECT_EQ(o3.GetArraySizeBytes(), 9u * 9 * 3 * 3 * 8);

    const auto fnFill = [](auto& oGrid, std::size_t nAxes) {
        std::vector<double> vdfPositions(oGrid.GetNumGridPoints() * nAxes);
        oGrid.GetGridPositions(vdfPositions.data());
        double* pdf = oGrid.GetArray();
        for (std::size_t n = 0; n < vdfPositions.size(); n += nAxes) {
            for (std::size_t c = 0; c < oGrid.GetDimension(); ++c) {
                *pdf++ = Multilinear(c, vdfPositions[n], nAxes > 1 ? vdfPositions[n + 1] : 0.0,
                                     nAxes > 2 ? vdfPositions[n + 2] : 0.0);
            }
        }
        return vdfPositions;
    };
    fnFill(o1, 1);
    fnFill(o2, 2);
    const std::vector<double> vdfPositions = fnFill(o3, 3);
    // X is the outermost, Z the innermost.
    const std::size_t n = (std::size_t{7} * 9 + 3) * 3 + 2;
    EXPECT_EQ(std::vector<double>(&vdfPositions[n * 3], &vdfPositions[n * 3] + 3),
              (std::vector<double>{2.5, 2.75, 0.0}));

    const std::size_t nAllocations = goArrayAllocations.nCount;
    for (const double x : {-3.0, -1.0, 0.1875, 3.0, 5.5}) {
        for (const double y : {0.0, 2.0, 3.96875, 4.0, 9.0}) {
            for (const double z : {-5.0, 0.0, 1.0, 6.0, 8.0, 20.0}) {
                double adfOut[4] = {0, 0, 0, 77};
                o3.GetVal(x, y, z, adfOut);
                for (std::size_t c = 0; c < 3; ++c) {
                    EXPECT_EQ(adfOut[c], Multilinear(c, x, y, z)) << x << ' ' << y << ' ' << z;
                }
                EXPECT_EQ(adfOut[3], 77.0);
            }
            double adfOut[3];
            o2.GetVal(x, y, adfOut);
            EXPECT_EQ(adfOut[2], Multilinear(2, x, y, 0.0));
        }
        double adfOut[2];
        o1.GetVal(x, adfOut);
        EXPECT_EQ(adfOut[1], Multilinear(1, x, 0.0, 0.0));
    }
    EXPECT_EQ(goArrayAllocations.nCount, nAllocations);
    double adfOut[3];
    for (const double x : {kNan, kInf, -kInf, 1e300}) {
        o3.GetVal(x, 2.0, 0.0, adfOut);
        EXPECT_FALSE(std::abs(adfOut[0]) < 1e299);
    }
}

TEST(InterpGrid, CopiesAndDimensions) {
    InterpGrid2D oEmpty;
    double adfOut[2] = {1.0, 2.0};
    oEmpty.GetVal(0.0, 0.0, adfOut);
    EXPECT_TRUE(std::isnan(adfOut[0]));
    EXPECT_EQ(adfOut[1], 2.0);
    EXPECT_EQ(InterpGrid2D(oEmpty).GetArray(), nullptr);

    InterpGrid2D oGrid;
    oGrid.LayoutGrid(0, 0, 1, 1, 1, 1);
    for (int i = 0; i < 4; ++i) {
        oGrid.GetArray()[i] = i;
    }
    const double* padfArray = oGrid.GetArray();
    oGrid.SetDimension(1);
    oGrid = *&oGrid;
    EXPECT_EQ(oGrid.GetArray(), padfArray);
    InterpGrid2D oCopy(oEmpty);
    oCopy = oGrid;
    oGrid.GetArray()[3] = 9.0;
    oCopy.GetVal(1.0, 1.0, adfOut);
    EXPECT_EQ(adfOut[0], 3.0);
    oCopy.SetDimension(5);
    EXPECT_EQ(goArrayAllocations.nLastSize, 4 * 5 * sizeof(double));
    EXPECT_EQ(oCopy.GetNumGridPoints(), 4u);
    oCopy = oEmpty;
    EXPECT_EQ(std::make_pair(oCopy.GetArray(), oCopy.GetDimension()),
              std::make_pair(static_cast<double*>(nullptr), 1u));
}

TEST(InterpGrid, SizesBeyond32Bits) {
    const auto fnExpectNoLayout = [](const InterpGrid3D& oGrid) {
        unsigned int n[3] = {1, 1, 1};
        oGrid.GetGridSize(n[0], n[1], n[2]);
        EXPECT_EQ(n[0] + n[1] + n[2], 0u);
        EXPECT_EQ(oGrid.GetArray(), nullptr);
        EXPECT_EQ(oGrid.GetNumGridPoints(), 0u);
    };
    InterpGrid3D oGrid;
    oGrid.SetDimension(3);
    oGrid.LayoutGrid(0, 0, 0, 1, 1, 1, 1, 1, 1);
    // More than 2^32 points.
    EXPECT_THROW(oGrid.LayoutGrid(0, 0, 0, 69999, 69999, 1, 1, 1, 1), std::bad_alloc);
    EXPECT_EQ(goArrayAllocations.nLastSize, std::uint64_t{70000} * 70000 * 2 * 3 * 8);
    fnExpectNoLayout(oGrid);
    EXPECT_EQ(oGrid.GetDimension(), 3u);

    // A dimension of 32 bits.
    oGrid.LayoutGrid(0, 0, 0, 99, 99, 99, 1, 1, 1);
    EXPECT_THROW(oGrid.SetDimension(4000000000u), std::bad_alloc);
    EXPECT_EQ(goArrayAllocations.nLastSize, std::uint64_t{4000000000} * 1000000 * 8);
    fnExpectNoLayout(oGrid);

    // Not even 64 bits hold these; nothing is asked for.
    const std::size_t nAllocations = goArrayAllocations.nCount;
    EXPECT_THROW(oGrid.LayoutGrid(0, 0, 0, 4e9, 4e9, 4e9, 1, 1, 1), std::bad_alloc);
    EXPECT_THROW(oGrid.LayoutGrid(0, 0, 0, 4294967295.0, 1, 1, 1, 1, 1), std::bad_alloc);
    oGrid.SetDimension(0);
    EXPECT_THROW(oGrid.LayoutGrid(0, 0, 0, 4e9, 4e9, 4e9, 1, 1, 1), std::bad_alloc);
    EXPECT_EQ(goArrayAllocations.nCount, nAllocations);
    fnExpectNoLayout(oGrid);
}

}  // namespace
