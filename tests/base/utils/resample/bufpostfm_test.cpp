#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <functional>
#include <limits>
#include <memory>
#include <vector>

#include "tests/support/refusal.h"
#include "vetra/vetra.h"

namespace vetra::utils {
namespace {

using tests::ExpectRefusal;

constexpr int kMax = std::numeric_limits<int>::max();

float gafCols[] = {1.5f, 16777216.0f, -0.25f, 3.0f, NAN, 5.0f};
float gafRows[] = {0.0f, 1.0f, 2.0f, 3.0f, 4.0f, INFINITY};

// NaN equals NaN here.
void ExpectPos(const IBufPosTfm& oTfm, long long nIdx, double dfCol, double dfRow) {
    double dfGotCol = 0.0;
    double dfGotRow = 0.0;
    oTfm.GetSrcPos(nIdx, dfGotCol, dfGotRow);
    EXPECT_TRUE(dfGotCol == dfCol || (std::isnan(dfGotCol) && std::isnan(dfCol)))
        << nIdx << ": column " << dfGotCol << " and not " << dfCol;
    EXPECT_TRUE(dfGotRow == dfRow || (std::isnan(dfGotRow) && std::isnan(dfRow)))
        << nIdx << ": row " << dfGotRow << " and not " << dfRow;
}

TEST(BufPosTfm, Array) {
    const BufPosArrayTfm oTfm(3, 2, gafCols, 10, gafRows, -kMax, false);
    ExpectPos(oTfm, 0, 11.5, -2147483647.0);
    ExpectPos(oTfm, 1, 16777226.0, -2147483646.0);
    ExpectPos(oTfm, 4, NAN, -2147483643.0);
    ExpectPos(oTfm, 5, 15.0, INFINITY);
    // A sum that no float holds.
    ExpectPos(BufPosArrayTfm(2, 1, gafCols, 1, gafRows, 0, false), 1, 16777217.0, 1.0);
}

TEST(BufPosTfm, DoubleArray) {
    // A position that a float would move by a pixel.
    const double adfCols[] = {16777217.25, NAN, -0.1};
    const double adfRows[] = {1e9 + 0.125, 2.0, INFINITY};
    const BufPosDoubleArrayTfm oTfm(3, 1, adfCols, adfRows);
    BufPosDoubleArrayTfm oCopy(1, 1, adfRows, adfCols);
    oCopy = *std::unique_ptr<BufPosDoubleArrayTfm>(oTfm.Clone());
    EXPECT_EQ(oCopy.GetNumPix(), 3);
    for (int i = 0; i < 3; ++i) {
        ExpectPos(oTfm, i, adfCols[i], adfRows[i]);
        ExpectPos(oCopy, i, adfCols[i], adfRows[i]);
    }
}

TEST(BufPosTfm, Bilinear) {
    const BufPosBilinearTfm oTfm(4, 3, 0.1, 0.2, 3.7, -0.3, -1.9, 2.3, 4.1, 1e9);
    ExpectPos(oTfm, 0, 0.1, 0.2);
    ExpectPos(oTfm, 3, 3.7, -0.3);
    ExpectPos(oTfm, 8, -1.9, 2.3);
    ExpectPos(oTfm, 11, 4.1, 1e9);
    const BufPosBilinearTfm oFive(5, 5, 0.0, 0.0, 8.0, 4.0, 16.0, 32.0, 40.0, 20.0);
    ExpectPos(oFive, 5 + 2, 10.0, 8.0);  // u = 1/2, v = 1/4
    // One column or row: positions stay finite, on the left or upper side.
    ExpectPos(BufPosBilinearTfm(1, 3, 1.0, 2.0, 9.0, 9.0, 3.0, 6.0, 9.0, 9.0), 1, 2.0, 4.0);
    ExpectPos(BufPosBilinearTfm(3, 1, 1.0, 2.0, 3.0, 6.0, 9.0, 9.0, 9.0, 9.0), 1, 2.0, 4.0);
    ExpectPos(BufPosBilinearTfm(1, 1, 1.0, 2.0, 9.0, 9.0, 9.0, 9.0, 9.0, 9.0), 0, 1.0, 2.0);
}

TEST(BufPosTfm, ScaleOff) {
    ExpectPos(BufPosScaleOffTfm(10, 9, 1.0, 0.0, 1.0, 0.0, 0, 0), 87, 7.0, 8.0);
    ExpectPos(BufPosScaleOffTfm(10, 9, 2.0, 0.0, 3.0, 0.0, 0, 0), 0, 0.5, 1.0);
    ExpectPos(BufPosScaleOffTfm(10, 9, 1.0, 0.0, 1.0, 0.0, 5, -2), 10, 5.0, -1.0);
    ExpectPos(BufPosScaleOffTfm(10, 9, -1.0, 10.0, 0.0, 4.25, 0, 0), 32, 7.0, 3.75);
    // Starts near the limits: the sum is one of 32 bits, the half is added in double.
    ExpectPos(BufPosScaleOffTfm(2, 1, 1.0, 0.0, 1.0, 0.0, kMax, -kMax - 1), 0, kMax, -2147483648.0);
    ExpectPos(BufPosScaleOffTfm(2, 2, 1.0, 0.0, 1.0, 0.0, kMax, kMax), 3, -2147483648.0,
              -2147483648.0);
}

TEST(BufPosTfm, CountsIn64Bits) {
    const int n = 100000;
    const BufPosScaleOffTfm oScale(n, n, 1.0, 0.0, 1.0, 0.0, 0, 0);
    const BufPosBilinearTfm oBilinear(n, n, 0.0, 0.0, n - 1, 0.0, 0.0, n - 1, n - 1, n - 1);
    const BufPosArrayTfm oArray(n, n, gafCols, 0, gafRows, 0, false);
    const BufPosBlockTfm oBlock(oScale, {0, 1, n, n - 1}, 0, 0);
    EXPECT_EQ(oScale.GetNumPix(), 10000000000);
    EXPECT_EQ(oBilinear.GetNumPix(), 10000000000);
    EXPECT_EQ(oArray.GetNumPix(), 10000000000);
    EXPECT_EQ(oBlock.GetNumPix(), 9999900000);
    ExpectPos(oScale, 9999999999, n - 1, n - 1);
    ExpectPos(oBilinear, 9999999999, n - 1, n - 1);
    ExpectPos(oBlock, 9999899998, n - 2, n - 1);
}

BufPosArrayTfm MakeArrayTfm(bool bOwner, int nOff) {
    float* pafCols = bOwner ? new float[6] : gafCols;
    float* pafRows = bOwner ? new float[6] : gafRows;
    if (bOwner) {
        std::copy_n(gafCols, 6, pafCols);
        std::copy_n(gafRows, 6, pafRows);
    }
    return BufPosArrayTfm(3, 2, pafCols, nOff, pafRows, -nOff, bOwner);
}

TEST(BufPosTfm, ArrayCopies) {
    for (const bool bOwner : {false, true}) {
        BufPosArrayTfm oSource = MakeArrayTfm(bOwner, 7);
        const BufPosArrayTfm& oItself = oSource;
        oSource = oItself;
        BufPosArrayTfm oOwner = MakeArrayTfm(true, 1);
        BufPosArrayTfm oView(1, 1, gafRows, 0, gafCols, 0, false);
        oOwner = oSource;
        oView = oSource;
        const std::unique_ptr<BufPosArrayTfm> poClone(oSource.Clone());
        for (const BufPosArrayTfm* poCopy : {&oOwner, &oView, poClone.get()}) {
            const float *pafCols, *pafRows, *pafSourceCols, *pafSourceRows;
            int nColOff, nRowOff;
            oSource.GetTfmParameters(pafSourceCols, nColOff, pafSourceRows, nRowOff);
            poCopy->GetTfmParameters(pafCols, nColOff, pafRows, nRowOff);
            EXPECT_EQ(pafCols == pafSourceCols, !bOwner);
            EXPECT_EQ(pafRows == pafSourceRows, !bOwner);
            EXPECT_TRUE(nColOff == 7 && nRowOff == -7 && poCopy->GetNumPix() == 6);
            ExpectPos(*poCopy, 3, 10.0, -4.0);
        }
    }
}

TEST(BufPosTfm, ParametersAndCopies) {
    const BufPosBilinearTfm oBilinear(4, 3, 1.0, 2.0, 3.0, 4.0, 5.0, 6.0, 7.0, 8.0);
    const BufPosScaleOffTfm oScale(4, 3, 1.5, 2.5, 3.5, 4.5, 5, 6);
    BufPosBilinearTfm oBilinear2(1, 1, 0.0, 0.0, 0.0, 0.0, 0.0, 0.0, 0.0, 0.0);
    BufPosScaleOffTfm oScale2(1, 1, 0.0, 0.0, 0.0, 0.0, 0, 0);
    oBilinear2 = *std::unique_ptr<BufPosBilinearTfm>(oBilinear.Clone());
    oScale2 = *std::unique_ptr<BufPosScaleOffTfm>(oScale.Clone());
    double adf[8];
    int an[2];
    oBilinear2.GetTfmParameters(adf[0], adf[1], adf[2], adf[3], adf[4], adf[5], adf[6], adf[7]);
    EXPECT_EQ(std::vector<double>(adf, adf + 8),
              (std::vector<double>{1.0, 2.0, 3.0, 4.0, 5.0, 6.0, 7.0, 8.0}));
    oScale2.GetTfmParameters(adf[0], adf[1], adf[2], adf[3], an[0], an[1]);
    EXPECT_EQ(std::vector<double>(adf, adf + 4), (std::vector<double>{1.5, 2.5, 3.5, 4.5}));
    EXPECT_TRUE(an[0] == 5 && an[1] == 6);
    ExpectPos(oBilinear2, 11, 7.0, 8.0);
    ExpectPos(oScale2, 11, (3 + 5.5) * 1.5 + 2.5 - 0.5, (2 + 6.5) * 3.5 + 4.5 - 0.5);
}

TEST(BufPosTfm, Block) {
    const BufPosScaleOffTfm oWhole(7, 5, 0.3, 0.1, 0.7, 0.2, 0, 0);
    const BufPosBlockTfm oBlock(oWhole, {2, 1, 4, 3}, 1, -2);
    const std::unique_ptr<BufPosBlockTfm> poClone(oBlock.Clone());
    double dfCol = 0.0;
    double dfRow = 0.0;
    for (int nY = 0; nY < 3; ++nY) {
        for (int nX = 0; nX < 4; ++nX) {
            oWhole.GetSrcPos((nY + 1) * 7 + nX + 2, dfCol, dfRow);
            ExpectPos(*poClone, nY * 4 + nX, dfCol - 1, dfRow + 2);
        }
    }
    for (const PixelRect& oRect :
         {PixelRect{0, 0, 0, 1}, PixelRect{0, 0, 1, 0}, PixelRect{-1, 0, 2, 2},
          PixelRect{0, -1, 2, 2}, PixelRect{4, 0, 4, 1}, PixelRect{0, 4, 1, 2},
          PixelRect{kMax, 0, 1, 1}, PixelRect{0, 1, 1, kMax}}) {
        EXPECT_THROW(BufPosBlockTfm(oWhole, oRect, 0, 0), ParameterException)
            << oRect.nCol << ' ' << oRect.nRow;
    }
}

TEST(BufPosTfm, RefusalsInOrder) {
    const std::function<void(int, int)> afnMake[] = {
        [](int nCols, int nRows) { BufPosArrayTfm(nCols, nRows, nullptr, 0, nullptr, 0, true); },
        [](int nCols, int nRows) { BufPosDoubleArrayTfm(nCols, nRows, nullptr, nullptr); },
        [](int nCols, int nRows) { BufPosBilinearTfm(nCols, nRows, 0, 0, 0, 0, 0, 0, 0, 0); },
        [](int nCols, int nRows) { BufPosScaleOffTfm(nCols, nRows, 1, 0, 1, 0, 0, 0); },
    };
    for (const auto& fnMake : afnMake) {
        ExpectRefusal({"nNumCols", 6, "0", "> 0", "Number of columns must be at least 1"},
                      [&] { fnMake(0, 0); });
        ExpectRefusal({"nNumRows", 6, "-5", "> 0", "Number of rows must be at least 1"},
                      [&] { fnMake(1, -5); });
    }
    ExpectRefusal({"pafColPos", 1, "NULL", "non-NULL", "Column position array may not be NULL"},
                  [] { BufPosArrayTfm(1, 1, nullptr, 0, nullptr, 0, false); });
    ExpectRefusal({"pafRowPos", 1, "NULL", "non-NULL", "Row position array may not be NULL"},
                  [] { BufPosArrayTfm(1, 1, gafCols, 0, nullptr, 0, true); });
    const double dfPos = 0.0;
    ExpectRefusal({"padfColPos", 1, "NULL", "non-NULL", "Column position array may not be NULL"},
                  [&] { BufPosDoubleArrayTfm(1, 1, nullptr, &dfPos); });
    ExpectRefusal({"padfRowPos", 1, "NULL", "non-NULL", "Row position array may not be NULL"},
                  [&] { BufPosDoubleArrayTfm(1, 1, &dfPos, nullptr); });
}

}  // namespace
}  // namespace vetra::utils
