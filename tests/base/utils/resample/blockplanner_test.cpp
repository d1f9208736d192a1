#include "vetra/base/utils/resample/blockplanner.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <memory>
#include <utility>
#include <vector>

#include "tests/support/refusal.h"
#include "vetra/vetra.h"

namespace vetra::utils {
namespace {

using tests::ExpectRefusal;

// The pixels of one axis that margins around some positions reach.
struct Reach {
    int nSize, nFirstMargin, nLastMargin;
    int nFirst = nSize;
    int nLast = -1;

    bool Touches(double dfPos) const {
        const double dfFloor = std::floor(dfPos);
        return dfFloor + nLastMargin >= 0 && dfFloor + nFirstMargin <= nSize - 1;
    }
    void Add(double dfPos) {
        for (int n = 0; n < nSize; ++n) {
            if (n >= std::floor(dfPos) + nFirstMargin && n <= std::floor(dfPos) + nLastMargin) {
                nFirst = std::min(nFirst, n);
                nLast = std::max(nLast, n);
            }
        }
    }
};

// Expects the blocks to cover each target pixel once, and each block's source window to be the
// bounding box of what its positions reach, found pixel by pixel.
void CheckBlocks(const IBufPosTfm& oTfm, const IRasterResampler& oResampler, int nCols, int nRows) {
    const BlockPlanner oPlanner(oTfm, 31, 23, oResampler, nCols, nRows);
    std::vector<int> anCovered(static_cast<std::size_t>(oTfm.GetNumPix()));
    for (long long nBlock = 0; nBlock < oPlanner.GetNumBlocks(); ++nBlock) {
        const auto [oTarget, oSource] = oPlanner.GetBlock(nBlock);
        ASSERT_TRUE(oTarget.nCols <= nCols && oTarget.nRows <= nRows);
        ASSERT_TRUE(oTarget.nCol + oTarget.nCols <= oTfm.GetNumCols());
        Reach oCols{31, 0, 0}, oRows{23, 0, 0};
        oResampler.GetSrcBufferMargins(oCols.nFirstMargin, oRows.nFirstMargin, oCols.nLastMargin,
                                       oRows.nLastMargin);
        const BufPosBlockTfm oLocal = oPlanner.GetLocalTfm({oTarget, oSource});
        ASSERT_EQ(oLocal.GetNumPix(), oTarget.GetNumPix());
        for (long long nIdx = 0; nIdx < oTarget.GetNumPix(); ++nIdx) {
            const long long nWhole = (oTarget.nRow + nIdx / oTarget.nCols) * oTfm.GetNumCols() +
                                     oTarget.nCol + nIdx % oTarget.nCols;
            ++anCovered.at(static_cast<std::size_t>(nWhole));
            double dfCol, dfRow, dfLocalCol, dfLocalRow;
            oTfm.GetSrcPos(nWhole, dfCol, dfRow);
            oLocal.GetSrcPos(nIdx, dfLocalCol, dfLocalRow);
            if (oCols.Touches(dfCol) && oRows.Touches(dfRow)) {
                oCols.Add(dfCol);
                oRows.Add(dfRow);
                EXPECT_EQ(dfLocalCol + oSource.nCol, dfCol);
                EXPECT_EQ(dfLocalRow + oSource.nRow, dfRow);
            }
        }
        const PixelRect oReached{oCols.nFirst, oRows.nFirst, oCols.nLast - oCols.nFirst + 1,
                                 oRows.nLast - oRows.nFirst + 1};
        EXPECT_TRUE(oSource == (oCols.nLast < 0 ? PixelRect{0, 0, 1, 1} : oReached)) << nBlock;
    }
    EXPECT_EQ(std::count(anCovered.begin(), anCovered.end(), 1), oTfm.GetNumPix());
}

TEST(BlockPlanner, BlocksTileTheTargetAndHoldWhatTheyRead) {
    // Positions beyond int, without a value, and at or just off the source's edges.
    const float afOdd[] = {NAN, INFINITY, -INFINITY, 3e9f, -3e9f, -1.0f, -4.5f, 30.5f, 4.25f, 7.0f};
    float afCols[20], afRows[20];
    for (int i = 0; i < 20; ++i) {
        afCols[i] = afOdd[i % 10];
        afRows[i] = afOdd[(i * 7 + 8) % 10];
    }
    const std::unique_ptr<IBufPosTfm> apoTfms[] = {
        std::make_unique<BufPosArrayTfm>(5, 4, afCols, 0, afRows, 0, false),
        std::make_unique<BufPosBilinearTfm>(20, 13, 12.0, -4.0, 34.0, 9.0, -3.0, 14.0, 19.0, 27.0),
        std::make_unique<BufPosScaleOffTfm>(20, 13, 1.6, 0.3, 1.8, -0.2, 0, 0),
        std::make_unique<BufPosScaleOffTfm>(20, 13, -1.6, 31.2, -1.8, 23.1, 0, 0),
        std::make_unique<BufPosScaleOffTfm>(20, 13, 0.0, 4.5, 2.5, -6.0, 0, 0),
        std::make_unique<BufPosScaleOffTfm>(20, 13, 1.0, 100.0, 1.0, 0.0, 0, 0),
        std::make_unique<BufPosScaleOffTfm>(20, 13, 1e300, -10.0, 0.1, 22.0, 0, -3),
        std::make_unique<BufPosScaleOffTfm>(20, 13, NAN, 0.0, 1.0, 0.0, 0, 0)};
    const std::unique_ptr<IRasterResampler> apoResamplers[] = {
        std::make_unique<NearestResampler>(), std::make_unique<BilinearResampler>(),
        std::make_unique<Lagrange8Resampler>(), std::make_unique<AverageResampler>(3, 5)};
    for (const auto& poTfm : apoTfms) {
        for (const auto& poResampler : apoResamplers) {
            for (const auto& [nCols, nRows] : {std::pair(1, 1), {4, 3}, {20, 2}, {100, 100}}) {
                SCOPED_TRACE(testing::Message() << "transform " << &poTfm - apoTfms << ", method "
                                                << poResampler->GetResampleType() << ", blocks of "
                                                << nCols << " x " << nRows);
                CheckBlocks(*poTfm, *poResampler, nCols, nRows);
            }
        }
    }
}

TEST(BlockPlanner, KeepsToTheByteBudget) {
    const BufPosBilinearTfm oRotated(150, 130, 150.0, 0.0, 300.0, 130.0, 0.0, 130.0, 150.0, 260.0);
    long long nLastBlocks = 0;
    for (const long long nMaxBytes : {10000000, 200000, 30000, 4000, 300, 31, 0}) {
        SCOPED_TRACE(nMaxBytes);
        const BlockPlanner oPlanner(oRotated, 300, 260, BilinearResampler(), 3, 5, nMaxBytes);
        const long long nBlocks = oPlanner.GetNumBlocks();
        long long nLargest = 0;
        for (long long nBlock = 0; nBlock < nBlocks; ++nBlock) {
            const ResampleBlock oBlock = oPlanner.GetBlock(nBlock);
            const long long nBytes =
                oBlock.oSource.GetNumPix() * 3 + oBlock.oTarget.GetNumPix() * 5;
            EXPECT_TRUE(nBytes <= nMaxBytes || oBlock.oTarget.GetNumPix() == 1);
            nLargest = std::max(nLargest, nBytes);
        }
        // One block where it fits, and never much smaller blocks than would fit.
        EXPECT_EQ(nBlocks == 1, nMaxBytes == 10000000);
        EXPECT_TRUE(nBlocks == 1 || nLargest * 8 > nMaxBytes) << nLargest;
        EXPECT_GE(nBlocks, nLastBlocks);
        nLastBlocks = nBlocks;
    }
    EXPECT_EQ(nLastBlocks, 150 * 130);
}

TEST(BlockPlanner, Refusals) {
    const BufPosScaleOffTfm oTfm(5, 4, 1.0, 0.0, 1.0, 0.0, 0, 0);
    const NearestResampler oResampler;
    const int aanSizes[][4] = {{0, 4, 3, 3}, {5, 0, 3, 3}, {5, 4, 0, 3}, {5, 4, 3, 0}};
    const char* const apszArguments[] = {"nSrcCols", "nSrcRows", "nBlockCols", "nBlockRows"};
    for (int i = 0; i < 4; ++i) {
        const int* pan = aanSizes[i];
        ExpectRefusal({apszArguments[i], 6, "0", "> 0",
                       i % 2 == 0 ? "Number of columns must be at least 1"
                                  : "Number of rows must be at least 1"},
                      [&] { BlockPlanner(oTfm, pan[0], pan[1], oResampler, pan[2], pan[3]); });
    }
    const BlockPlanner oPlanner(oTfm, 5, 4, oResampler, 3, 3);
    EXPECT_EQ(oPlanner.GetNumBlocks(), 4);
    EXPECT_THROW(oPlanner.GetBlock(-1), ParameterException);
    EXPECT_THROW(oPlanner.GetBlock(4), ParameterException);
}

}  // namespace
}  // namespace vetra::utils
