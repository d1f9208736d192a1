// Turns an image by 10 degrees about its centre, bilinear, and writes both as PGM files.

#include <vetra/vetra.h>

#include <cmath>
#include <fstream>
#include <iostream>
#include <string>
#include <vector>

using namespace vetra::utils;

namespace {

void WritePgm(const std::string& sFile, const ResampleBuffer& oImage) {
    std::ofstream oFile(sFile, std::ios::binary);
    oFile << "P5\n" << oImage.GetNumCols() << ' ' << oImage.GetNumRows() << "\n255\n";
    oFile.write(reinterpret_cast<const char*>(oImage.GetBuf()),
                static_cast<std::streamsize>(oImage.GetNumCols()) * oImage.GetNumRows());
}

}  // namespace

int main() {
    constexpr int kSize = 256;
    try {
        ResampleBuffer oSource(vetra::gobs::eDT_8U, kSize, kSize, 1);
        ResampleBuffer oTarget(vetra::gobs::eDT_8U, kSize, kSize, 1);
        for (int i = 0; i < kSize * kSize; ++i) {
            oSource.GetBuf()[i] = (i / 16 + i / kSize / 16) % 2 != 0 ? 220 : 60;
        }

        // Where each target pixel falls in the source: column and row, whole numbers at pixel
        // centres.
        std::vector<float> vfCols(kSize * kSize);
        std::vector<float> vfRows(kSize * kSize);
        float* pafCols = vfCols.data();
        float* pafRows = vfRows.data();
        const double dfAngle = 10.0 * 3.14159265358979323846 / 180.0;
        const double dfCentre = (kSize - 1) / 2.0;
        for (int i = 0; i < kSize * kSize; ++i) {
            const double x = i % kSize - dfCentre;
            const double y = i / kSize - dfCentre;
            pafCols[i] =
                static_cast<float>(dfCentre + x * std::cos(dfAngle) - y * std::sin(dfAngle));
            pafRows[i] =
                static_cast<float>(dfCentre + x * std::sin(dfAngle) + y * std::cos(dfAngle));
        }
        const BufPosArrayTfm oPositions(kSize, kSize, pafCols, 0, pafRows, 0, false);

        BilinearResampler oResampler;
        oResampler.SetOutBgd(0.0);  // what falls outside the source becomes black
        oResampler.SetNodataFillAction(eNFA_BGD);
        oResampler.Resample(oSource, oTarget, oPositions);

        WritePgm("rotate_source.pgm", oSource);
        WritePgm("rotate_target.pgm", oTarget);
        std::cout << "wrote rotate_source.pgm and rotate_target.pgm\n";
    } catch (const vetra::Exception& oError) {
        std::cerr << oError.what() << '\n';
        return 1;
    }
    return 0;
}
