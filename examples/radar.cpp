// Radar images: a complex one whose phase turns from row to row, shifted by half a row, and an
// intensity image made coarser and finer.

#include <vetra/vetra.h>

#include <cmath>
#include <complex>
#include <cstdio>
#include <vector>

using namespace vetra::utils;
using Complex = std::complex<float>;

namespace {

constexpr double kTwoPi = 6.283185307179586;
constexpr int kCols = 32;
constexpr int kRows = 64;

Complex* Samples(const ResampleBuffer& oImage) {
    return reinterpret_cast<Complex*>(const_cast<unsigned char*>(oImage.GetBuf()));
}

}  // namespace

int main() {
    // [image]
    // One complex value for each pixel, its real part first. The Doppler centroid, divided by the
    // pulse repetition frequency, is 0.2: the phase turns by 72 degrees from row to row.
    const double dfFc = 0.2;
    std::vector<Complex> voPixels;
    for (int i = 0; i < kCols * kRows; ++i) {
        const double dfPhase = kTwoPi * dfFc * (i / kCols);
        voPixels.emplace_back(static_cast<float>(std::cos(dfPhase)),
                              static_cast<float>(std::sin(dfPhase)));
    }
    const ResampleBuffer oSource(vetra::gobs::eDT_C32R, kCols, kRows, 1,
                                 reinterpret_cast<unsigned char*>(voPixels.data()), nullptr, false);
    // [image]

    // [shift]
    // Half a row down, by a filter around the carrier and by one around zero.
    constexpr int kTaps = 7;
    const BufPosScaleOffTfm oShift(kCols, kRows, 1.0, 0.0, 1.0, 0.5, 0, 0);
    ResampleBuffer oCarrier(vetra::gobs::eDT_C32R, kCols, kRows, 1);
    CplxSarResampler(kTaps, kTaps, dfFc).Resample(oSource, oCarrier, oShift);
    ResampleBuffer oLinear(vetra::gobs::eDT_C32R, kCols, kRows, 1);
    BilinearResampler().Resample(oSource, oLinear, oShift);

    // Every result of the first carries the carrier's phase from the first row of its window to the
    // middle one. It cancels in an interferogram of two images resampled alike; else take it off.
    const int nPixel = 32 * kCols + 16;
    const std::complex<double> oTurn = std::polar(1.0, kTwoPi * dfFc * (kTaps - 1) / 2);
    const std::complex<double> oWanted = std::polar(1.0, kTwoPi * dfFc * 32.5);
    const std::complex<double> oGot = std::complex<double>(Samples(oCarrier)[nPixel]) * oTurn;
    // [shift]
    std::printf("around the carrier: amplitude %.3f, phase off by %.3f degrees\n", std::abs(oGot),
                std::arg(oGot / oWanted) * 360.0 / kTwoPi);
    std::printf("bilinear: amplitude %.3f\n", std::abs(Samples(oLinear)[nPixel]));

    // [intensity]
    // Intensities: the mean of 2 x 2 looks is a mean of intensities; what is interpolated between
    // two pixels are amplitudes, by the squared methods.
    float afIntensity[] = {1, 9, 1, 9,  //
                           1, 9, 1, 9};
    const ResampleBuffer oIntensity(vetra::gobs::eDT_32R, 4, 2, 1,
                                    reinterpret_cast<unsigned char*>(afIntensity), nullptr, false);
    // The window starts at the pixel nearest to the position: scale 2, offset (1 - 2) / 2.
    const BufPosScaleOffTfm oLooks(2, 1, 2.0, -0.5, 2.0, -0.5, 0, 0);
    ResampleBuffer oMultilook(vetra::gobs::eDT_32R, 2, 1, 1);
    AverageResampler(2, 2).Resample(oIntensity, oMultilook, oLooks);

    const BufPosScaleOffTfm oBetween(3, 1, 1.0, 0.5, 1.0, 0.0, 0, 0);
    ResampleBuffer oAmplitudes(vetra::gobs::eDT_32R, 3, 1, 1);
    SqBilinearResampler().Resample(oIntensity, oAmplitudes, oBetween);
    // [intensity]
    std::printf("mean of looks: %g, between two pixels: %g\n",
                static_cast<double>(*reinterpret_cast<const float*>(oMultilook.GetBuf())),
                static_cast<double>(*reinterpret_cast<const float*>(oAmplitudes.GetBuf())));
    return 0;
}
