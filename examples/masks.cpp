// Which target pixels are computed, which are filled and which are left alone: a source with a
// hole, requests, a background, and the outcome of each pixel.

#include <vetra/vetra.h>

#include <iostream>
#include <string>
#include <vector>

using namespace vetra::utils;

namespace {

void Print(const char* pszWhat, const ResampleBuffer& oImage) {
    std::cout << pszWhat;
    const float* pafSamples = reinterpret_cast<const float*>(oImage.GetBuf());
    for (int i = 0; i < oImage.GetNumCols(); ++i) {
        std::cout << ' ' << pafSamples[i];
    }
    std::cout << '\n';
}

}  // namespace

int main() {
    // [source]
    // Two rows of six heights. One is missing: its mask byte is 0, and its value never counts.
    float afHeights[] = {100, 110, 120, -9999, 140, 150,  //
                         100, 110, 120, 130,   140, 150};
    unsigned char abyValid[] = {1, 1, 1, 0, 1, 1,  //
                                1, 1, 1, 1, 1, 1};
    const ResampleBuffer oSource(vetra::gobs::eDT_32R, 6, 2, 1,
                                 reinterpret_cast<unsigned char*>(afHeights), abyValid, false);

    // A target of one row, half a pixel to the right: columns 0.5, 1.5 ... 5.5, row 0.
    const BufPosScaleOffTfm oShift(6, 1, 1.0, 0.5, 1.0, 0.0, 0, 0);
    // [source]

    // [fill]
    BilinearResampler oResampler;
    oResampler.SetOutBgd(-9999.0);

    ResampleBuffer oNearest(vetra::gobs::eDT_32R, 6, 1, 1);
    oResampler.Resample(oSource, oNearest, oShift);

    ResampleBuffer oStrict(vetra::gobs::eDT_32R, 6, 1, 1);
    oResampler.SetNodataFillAction(eNFA_BGD);
    oResampler.Resample(oSource, oStrict, oShift);
    // [fill]
    Print("filled with the nearest:", oNearest);
    Print("background only:        ", oStrict);

    // [requests]
    // The target's mask says what to do: 0 background, 1 sample, 2 nearest, 3 leave alone.
    float afTarget[] = {7, 7, 7, 7, 7, 7};
    unsigned char abyRequests[] = {1, 2, 0, 1, 3, 1};
    ResampleBuffer oTarget(vetra::gobs::eDT_32R, 6, 1, 1,
                           reinterpret_cast<unsigned char*>(afTarget), abyRequests, false);

    // What became of each pixel, for instance to write a validity mask.
    std::vector<unsigned char> vbyOutcome(6);
    Resample(oSource, oTarget, oShift, oResampler.GetResampleInfo(), vbyOutcome.data());
    // [requests]
    Print("as requested:           ", oTarget);
    std::cout << "outcome:                ";
    for (const unsigned char byOutcome : vbyOutcome) {
        std::cout << ' ' << int{byOutcome};
    }
    std::cout << '\n';

    // [background]
    // No computed sample takes the background's value, so that the two can be told apart. In an
    // image of whole numbers whose background is 0 zeros become ones.
    unsigned char abyDark[] = {0, 0, 200};
    const ResampleBuffer oDark(vetra::gobs::eDT_8U, 3, 1, 1, abyDark, nullptr, false);
    const BufPosScaleOffTfm oSame(3, 1, 1.0, 0.0, 1.0, 0.0, 0, 0);
    NearestResampler oCopy;
    oCopy.SetOutBgd(0.0);
    ResampleBuffer oApart(vetra::gobs::eDT_8U, 3, 1, 1);
    oCopy.Resample(oDark, oApart, oSame);

    ResampleBuffer oAlike(vetra::gobs::eDT_8U, 3, 1, 1);
    oCopy.SetClampBgdFlag(false);  // zeros are ordinary values
    oCopy.Resample(oDark, oAlike, oSame);
    // [background]
    for (const ResampleBuffer* poImage : {&oApart, &oAlike}) {
        std::cout << (poImage == &oApart ? "kept apart:" : "alike:     ");
        for (int i = 0; i < 3; ++i) {
            std::cout << ' ' << int{poImage->GetBuf()[i]};
        }
        std::cout << '\n';
    }
    return 0;
}
