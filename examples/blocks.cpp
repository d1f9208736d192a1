// Halves an image in blocks, as for one that doesn't fit into memory, and shows that the result is
// that of a single run. Also counts what became of the target's pixels.

#include <vetra/vetra.h>

#include <algorithm>
#include <iostream>
#include <vector>

using namespace vetra::utils;

namespace {

constexpr int kSize = 1000;
constexpr int kHalf = kSize / 2;

// Stands for reading a window of a file.
ResampleBuffer Read(const ResampleBuffer& oFile, const PixelRect& oWindow) {
    ResampleBuffer oPart(oFile.GetDatatype(), oWindow.nCols, oWindow.nRows, 1);
    for (int y = 0; y < oWindow.nRows; ++y) {
        std::copy_n(oFile.GetBuf() + (oWindow.nRow + y) * kSize + oWindow.nCol, oWindow.nCols,
                    oPart.GetBuf() + y * oWindow.nCols);
    }
    return oPart;
}

}  // namespace

int main() {
    ResampleBuffer oFile(vetra::gobs::eDT_8U, kSize, kSize, 1);
    for (int i = 0; i < kSize * kSize; ++i) {
        oFile.GetBuf()[i] = static_cast<unsigned char>(i % 251);
    }
    const BufPosScaleOffTfm oHalve(kHalf, kHalf, 2.0, 0.0, 2.0, 0.0, 0, 0);
    BilinearResampler oResampler;
    oResampler.SetClampBgdFlag(false);  // 0 is an ordinary value of this image

    ResampleBuffer oWhole(vetra::gobs::eDT_8U, kHalf, kHalf, 1);
    std::vector<unsigned char> vbyOutcome(kHalf * kHalf);
    Resample(oFile, oWhole, oHalve, oResampler.GetResampleInfo(), vbyOutcome.data());

    // [blocks]
    // At most 100 kB for a block's source and target.
    const BlockPlanner oPlanner(oHalve, kSize, kSize, oResampler, 2, 2, 100000);
    ResampleBuffer oTarget(vetra::gobs::eDT_8U, kHalf, kHalf, 1);
    for (long long nBlock = 0; nBlock < oPlanner.GetNumBlocks(); ++nBlock) {
        const ResampleBlock oBlock = oPlanner.GetBlock(nBlock);
        const PixelRect& oTo = oBlock.oTarget;
        const ResampleBuffer oPart = Read(oFile, oBlock.oSource);
        ResampleBuffer oTile(vetra::gobs::eDT_8U, oTo.nCols, oTo.nRows, 1);
        oResampler.Resample(oPart, oTile, oPlanner.GetLocalTfm(oBlock));
        for (int y = 0; y < oTo.nRows; ++y) {
            std::copy_n(oTile.GetBuf() + y * oTo.nCols, oTo.nCols,
                        oTarget.GetBuf() + (oTo.nRow + y) * kHalf + oTo.nCol);
        }
    }
    // [blocks]

    const bool bSame =
        std::equal(oWhole.GetBuf(), oWhole.GetBuf() + kHalf * kHalf, oTarget.GetBuf());
    std::cout << oPlanner.GetNumBlocks() << " blocks, "
              << std::count(vbyOutcome.begin(), vbyOutcome.end(), ePO_INTERPOLATED)
              << " pixels interpolated, " << (bSame ? "equal to" : "DIFFERENT from")
              << " one run\n";
    return bSame ? 0 : 1;
}
