// A first program: an image at half its size, through a resampler that a text describes.

// [program]
#include <vetra/vetra.h>

#include <iostream>
#include <memory>
#include <vector>

using namespace vetra::utils;

int main() {
    try {
        // A ramp of 8 x 4 pixels: 10, 20 ... 80 in each row.
        std::vector<unsigned char> vbySamples;
        for (int i = 0; i < 8 * 4; ++i) {
            vbySamples.push_back(static_cast<unsigned char>(10 * (i % 8 + 1)));
        }
        // The source is a view on the caller's samples: 8 columns, 4 rows, 1 channel, no mask. The
        // target has memory of its own.
        const ResampleBuffer oSource(vetra::gobs::eDT_8U, 8, 4, 1, vbySamples.data(), nullptr,
                                     false);
        ResampleBuffer oTarget(vetra::gobs::eDT_8U, 4, 2, 1);

        // Two source pixels per target pixel, both ways, from the same upper left corner.
        const BufPosScaleOffTfm oHalve(4, 2, 2.0, 0.0, 2.0, 0.0, 0, 0);

        const std::unique_ptr<IRasterResampler> poResampler(
            ResamplerFactory().GetResampler("BILIN"));
        poResampler->SetClampBgdFlag(false);  // the target's lowest value is an ordinary one
        poResampler->Resample(oSource, oTarget, oHalve);

        for (int i = 0; i < 4; ++i) {
            std::cout << int{oTarget.GetBuf()[i]} << ' ';
        }
        std::cout << '\n';
    } catch (const vetra::Exception& oError) {
        std::cerr << oError.what() << '\n';
        return 1;
    }
    return 0;
}
// [program]
