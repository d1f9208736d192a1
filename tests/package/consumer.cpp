#include <vetra/vetra.h>

#include <cstdio>
#include <memory>
#include <vector>

using namespace vetra::utils;

namespace {

int gnFailures = 0;

void Check(bool bOk, const char* pszWhat) {
    if (!bOk) {
        std::printf("failed: %s\n", pszWhat);
        ++gnFailures;
    }
}

// Deriving and throwing both cross the library's boundary.
class ShiftTfm : public BufPosScaleOffTfm {
 public:
    ShiftTfm() : BufPosScaleOffTfm(3, 1, 1.0, 0.0, 1.0, 0.0, 0, 0) {}
    void GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const override {
        BufPosScaleOffTfm::GetSrcPos(nIdx, dfCol, dfRow);
        dfCol += 1.0;
    }
};

}  // namespace

int main() {
    unsigned char abySrc[] = {10, 20, 30};
    float afTgt[3] = {};
    const ResampleBuffer oSrc(vetra::gobs::eDT_8U, 3, 1, 1, abySrc, nullptr, false);
    ResampleBuffer oTgt(vetra::gobs::eDT_32R, 3, 1, 1, reinterpret_cast<unsigned char*>(afTgt),
                        nullptr, false);
    NearestResampler oNearest;
    oNearest.SetOutBgd(-1.0);
    oNearest.Resample(oSrc, oTgt, ShiftTfm());
    Check(afTgt[0] == 20.0f && afTgt[1] == 30.0f && afTgt[2] == -1.0f, "resampled samples");

    bool bCaught = false;
    try {
        ResampleBuffer oRefused(vetra::gobs::eDT_UNKNOWN, 1, 1, 1);
    } catch (const vetra::DataException& oCaught) {
        bCaught = dynamic_cast<const vetra::ParameterException*>(&oCaught) != nullptr;
    }
    Check(bCaught, "exception across the library's boundary");

    // What else a consumer links.
    float afPos[] = {0.0f};
    const BufPosArrayTfm oArray(1, 1, afPos, 0, afPos, 0, false);
    const double dfPos = 0.0;
    const BufPosDoubleArrayTfm oDoubleArray(1, 1, &dfPos, &dfPos);
    const BufPosBilinearTfm oBilinear(1, 1, 0.0, 0.0, 0.0, 0.0, 0.0, 0.0, 0.0, 0.0);
    const ShapingWindow oWindow = GetShapingWindow(ResampleInfo());
    const std::unique_ptr<IRasterResampler> apoResamplers[] = {
        std::make_unique<BilinearResampler>(),
        std::make_unique<SqBilinearResampler>(),
        std::make_unique<CubicResampler>(),
        std::make_unique<SqCubicResampler>(),
        std::make_unique<CubicPsResampler>(),
        std::make_unique<SqCubicPsResampler>(),
        std::make_unique<Lagrange4Resampler>(),
        std::make_unique<SqLagrange4Resampler>(),
        std::make_unique<Lagrange8Resampler>(),
        std::make_unique<SqLagrange8Resampler>(),
        std::make_unique<AverageResampler>(1, 1),
        std::make_unique<SqAverageResampler>(1, 1),
        std::make_unique<MedianResampler>(1, 1),
        std::make_unique<SqMedianResampler>(1, 1),
        std::make_unique<SqNearestResampler>(),
        std::make_unique<CplxSarResampler>(1, 1, 0.0),
        std::make_unique<Sinc8Resampler>(oWindow),
        std::make_unique<SqSinc8Resampler>(oWindow),
        std::make_unique<Sinc16Resampler>(oWindow),
        std::make_unique<SqSinc16Resampler>(oWindow),
        std::make_unique<GaussianResampler>(1.0f, 1.0f),
        std::make_unique<SqGaussianResampler>(1.0f, 1.0f),
        std::make_unique<KernelResampler>(1, 1, 0, std::vector<double>(2, 1.0)),
        std::make_unique<SqKernelResampler>(1, 1, 0, std::vector<double>(2, 1.0))};
    for (const auto& poResampler : apoResamplers) {
        Check(BlockPlanner(oArray, 3, 1, *poResampler, 1, 1).GetNumBlocks() == 1, "blocks");
    }
    const std::unique_ptr<IRasterResampler> poMade(ResamplerFactory().GetResampler("8pt,min=0"));
    Check(poMade->GetResampleType() == ResamplerFactory::NameToMethod("SINC8"), "factory");
    std::vector<double> vdfWeights;
    GenerateGaussianKernel(1, 2, 1.0f, 1.0f, vdfWeights);
    Check(vdfWeights.size() == 65 * 3, "Gaussian kernels");
    double *padfAcross, *padfReal, *padfImag;
    GetCplxSarCoeffs(1, 1, 0.0, 1, padfAcross, padfReal, padfImag);
    Check(padfAcross[0] == 1.0 && padfReal[0] == 1.0 && padfImag[0] == 0.0, "complex SAR taps");
    delete[] padfAcross;
    delete[] padfReal;
    delete[] padfImag;
    float fClamped = 0.0f;
    std::unique_ptr<PixelClamp<float>>(PixelClampFactory::Create<float>(0.0, 1.0, 0.5, true))
        ->Clamp(7.0, &fClamped);
    Check(fClamped == 1.0f && SaturateCast<short>(1e9) == 32767, "clamp");
    Check(ChooseResampleMode(1, nullptr, 3, 1, 0.0, 0.0, 0, 0, 1, 1, eNFA_NN) == 1 &&
              ChooseResampleModeForFilter(1, nullptr, 3, 1, 5.0, 0.0, 0, 0, 1, 1, eNFA_NN) == 0,
          "modes");
    Check(IsNumeric(TrimWhitespace(FormatString(" %d ", 7))) && TextToDouble("7") == 7.0, "texts");
    Check(StringTokenizer("a b").CountTokens() == 2 && HashString("") == 1339080641, "tokens");
    double adfGeo[3] = {0.1, 0.2, 3.0}, adfXyz[3], X = 0.0, Y = 0.0, Z = 0.0;
    EllipCalc().GeoToXYZ(adfGeo[0], adfGeo[1], adfGeo[2], X, Y, Z);
    GeoToXYZ(adfGeo, 6378137.0, 0.00669437999014, adfXyz);
    Check(X == adfXyz[0] && Y == adfXyz[1] && Z == adfXyz[2], "geodesy");
    float fZenith = -1.0f, fAzimuth = -1.0f;
    SolarZenithAzimuth(2020, 6, 21, 12, 0, 0.0, 50.0f, 0.0f, fZenith, fAzimuth);
    Check(fZenith > 26.0f && fZenith < 27.5f, "sun");
    SaveKernelFile("kernel.txt", 1, 1, 0, vdfWeights, false);
    int nKernelCols = 0, nKernelRows = 0, nSubPixels = 7;
    LoadKernelFile("kernel.txt", nKernelCols, nKernelRows, nSubPixels, vdfWeights);
    Check(nKernelCols == 1 && nKernelRows == 1 && nSubPixels == 0, "kernel file");
    Check(FindFilesByWildcard("", "kernel.tx?", false).size() == 1, "found files");
    RemoveFile("kernel.txt");
    Check(!IsFile("kernel.txt"), "removed file");
    const double adfRamp[] = {0.0, 1.0, 2.0};
    Check(Poly1D(1, adfRamp).GetValue(3.0) == 3.0 &&
              Poly2D(1, adfRamp).GetValue(2.0, poweri(2.0, 2)) == 10.0,
          "polynomials");
    InterpGrid1D oGrid1;
    InterpGrid2D oGrid2;
    InterpGrid3D oGrid3;
    oGrid1.LayoutGrid(0.0, 1.0, 1.0);
    oGrid2.LayoutGrid(0.0, 0.0, 1.0, 1.0, 1.0, 1.0);
    oGrid3.LayoutGrid(0.0, 0.0, 0.0, 1.0, 1.0, 1.0, 1.0, 1.0, 1.0);
    Check(oGrid1.GetNumGridPoints() * oGrid2.GetNumGridPoints() * oGrid3.GetNumGridPoints() == 64,
          "grids");
    double adfInterpolated[4];
    interpolate_linear(1.0, 3.0, 0.5, adfInterpolated[0]);
    interpolate_Lagrange(3, adfRamp, 1, 1.5, &adfInterpolated[1]);
    interpolate_Lagrange({0.0, 1.0}, {0.0, 1.0}, 1.5, adfInterpolated[2]);
    interpolate_Lagrange_rate(0.0, 1.0, 2.0, 3.0, 0.5, 1.0, adfInterpolated[3]);
    Check(adfInterpolated[0] == 2.0 && adfInterpolated[1] == 1.5 && adfInterpolated[2] == 1.5,
          "interpolation");
    Check(ConvexHull({{0.0, 0.0}, {1.0, 0.0}, {0.0, 1.0}}).IsInside({0.25, 0.25}), "convex hull");
    Check(FormatString("%d.%d.%d", VETRA_VERSION_MAJOR, VETRA_VERSION_MINOR, VETRA_VERSION_PATCH) ==
              VETRA_VERSION,
          "version");
    return gnFailures;
}
