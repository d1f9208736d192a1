// A target filled block by block, each from the source pixels that the planner names, equals the
// target filled by one run.

#include <cmath>
#include <cstdint>
#include <cstring>
#include <memory>
#include <vector>

#include "randomimages.h"
#include "vetra/base/utils/resample/blockplanner.h"
#include "vetra/base/utils/resample/postfm/bufposarraytfm.h"
#include "vetra/base/utils/resample/postfm/bufposbilineartfm.h"
#include "vetra/base/utils/resample/postfm/bufposdoublearraytfm.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"

using namespace vetra::utils;
using namespace vetra::gobs;

namespace {

class Blocks : public testing::TestWithParam<ResampleMethod> {};

// Images larger than a span in every direction, cut into blocks.
TEST_P(Blocks, GiveTheBytesOfOneRun) {
    Random oRandom(7);
    // Pixels of four bytes.
    const bool bComplex = GetParam() == eRM_CPLXSAR;
    const NativeDataTypeCode eType = bComplex ? eDT_C16S : eDT_16U;
    const int nChan = bComplex ? 1 : 2;
    const int nCols = 700;
    const int nRows = 500;
    Image oSrc(eType, 611, 437, nChan, true);
    FillSamples(oRandom, eType, oSrc.oSamples.Get(), oSrc.nSamples);
    for (std::size_t i = 0; i < oSrc.oMask.Size(); ++i) {
        oSrc.oMask.Get()[i] = oRandom.Chance(0.01) ? 0 : 1;
    }
    const auto poResampler = MakeResampler(GetParam());
    poResampler->SetOutBgd(17);

    const std::size_t nPix = nCols * nRows;
    std::vector<float> vfCol(nPix);
    std::vector<float> vfRow(nPix);
    for (std::size_t i = 0; i < nPix; ++i) {
        const double x = static_cast<double>(i % nCols);
        const double y = static_cast<double>(i / nCols);
        vfCol[i] = static_cast<float>(-90 + 0.94 * x + 0.3 * y);
        vfRow[i] = static_cast<float>(150 - 0.3 * x + 0.94 * y);
        if (i % 1013 == 0) vfRow[i] = NAN;
    }
    const std::vector<double> vdfCol(vfCol.begin(), vfCol.end());
    const std::vector<double> vdfRow(vfRow.rbegin(), vfRow.rend());
    std::vector<std::unique_ptr<IBufPosTfm>> vpoTfms;
    vpoTfms.push_back(
        std::make_unique<BufPosDoubleArrayTfm>(nCols, nRows, vdfCol.data(), vdfRow.data()));
    vpoTfms.push_back(
        std::make_unique<BufPosArrayTfm>(nCols, nRows, vfCol.data(), 0, vfRow.data(), 0, false));
    vpoTfms.push_back(std::make_unique<BufPosScaleOffTfm>(nCols, nRows, 611.0 / 700, 0.0,
                                                          437.0 / 500, 0.0, 0, 0));
    vpoTfms.push_back(
        std::make_unique<BufPosScaleOffTfm>(nCols, nRows, -1.3, 633.3, 1.1, -40.7, 3, -2));
    vpoTfms.push_back(std::make_unique<BufPosBilinearTfm>(nCols, nRows, -20.1, 30.3, 500.7, -41.9,
                                                          77.0, 400.0, 650.0, 480.0));
    vpoTfms.push_back(std::make_unique<OddTfm>(nCols, nRows, 1.0));

    for (const auto& poTfm : vpoTfms) {
        SCOPED_TRACE(TransformName(*poTfm));
        ResampleBuffer oWhole(eType, nCols, nRows, nChan);
        poResampler->Resample(oSrc.oBuffer, oWhole, *poTfm);
        for (const int nSize : {64, 100, 1000}) {
            const BlockPlanner oPlanner(*poTfm, 611, 437, *poResampler, nSize, nSize);
            std::vector<std::uint16_t> vnGot(nPix * 2);
            for (long long nBlock = 0; nBlock < oPlanner.GetNumBlocks(); ++nBlock) {
                const ResampleBlock oBlock = oPlanner.GetBlock(nBlock);
                const PixelRect& oFrom = oBlock.oSource;
                const PixelRect& oTo = oBlock.oTarget;
                ResampleBuffer oPart(eType, oFrom.nCols, oFrom.nRows, nChan);
                for (int y = 0; y < oFrom.nRows; ++y) {
                    const int nFirst = (oFrom.nRow + y) * 611 + oFrom.nCol;
                    std::memcpy(oPart.GetBuf() + y * oFrom.nCols * 4,
                                oSrc.oSamples.Get() + nFirst * 4,
                                static_cast<std::size_t>(oFrom.nCols) * 4);
                    std::memcpy(oPart.GetMask() + y * oFrom.nCols, oSrc.oMask.Get() + nFirst,
                                static_cast<std::size_t>(oFrom.nCols));
                }
                ResampleBuffer oTile(eType, oTo.nCols, oTo.nRows, nChan);
                poResampler->Resample(oPart, oTile, oPlanner.GetLocalTfm(oBlock));
                for (int y = 0; y < oTo.nRows; ++y) {
                    std::memcpy(
                        &vnGot[static_cast<std::size_t>((oTo.nRow + y) * nCols + oTo.nCol) * 2],
                        oTile.GetBuf() + y * oTo.nCols * 4,
                        static_cast<std::size_t>(oTo.nCols) * 4);
                }
            }
            EXPECT_EQ(0, std::memcmp(vnGot.data(), oWhole.GetBuf(), nPix * 4)) << nSize;
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Methods, Blocks, testing::ValuesIn(AllMethods()), MethodName);

}  // namespace
