// Halves a colour image of which some pixels are missing.

#include <cstdio>
#include <vector>

// [halve]
#include <vetra/vetra.h>

using namespace vetra::utils;

// pabySamples: [4096 rows x 4096 columns x 3 channels]; pabyMask: [4096 x 4096], 0 where a pixel is
// missing and 1 elsewhere, or null.
ResampleBuffer Halve(unsigned char* pabySamples, unsigned char* pabyMask) {
    const ResampleBuffer oSource(vetra::gobs::eDT_8U, 4096, 4096, 3, pabySamples, pabyMask, false);
    ResampleBuffer oTarget(vetra::gobs::eDT_8U, 2048, 2048, 3);
    const BufPosScaleOffTfm oHalve(2048, 2048, 2.0, 0.0, 2.0, 0.0, 0, 0);

    BilinearResampler oResampler;
    oResampler.SetClampBgdFlag(false);  // the target's lowest value is an ordinary one
    oResampler.Resample(oSource, oTarget, oHalve);
    return oTarget;
}
// [halve]

int main() {
    constexpr int kPixels = 4096 * 4096;
    std::vector<unsigned char> vbySamples(3 * kPixels, 100);
    std::vector<unsigned char> vbyMask(kPixels, 1);
    vbyMask[0] = 0;
    vbySamples[3 * (4096 + 1)] = 140;
    const ResampleBuffer oHalf = Halve(vbySamples.data(), vbyMask.data());
    // The window of the first pixel isn't whole: it takes the nearest pixel, (1, 1).
    std::printf("first pixel %d, last pixel %d\n", oHalf.GetBuf()[0],
                oHalf.GetBuf()[3 * 2048 * 2048 - 1]);
    return 0;
}
