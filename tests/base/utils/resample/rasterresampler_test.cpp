#include <gtest/gtest.h>

#include <array>
#include <limits>
#include <memory>
#include <typeinfo>
#include <vector>

#include "tests/support/refusal.h"
#include "vetra/vetra.h"

namespace vetra::utils {
namespace {

using tests::ExpectRefusal;

constexpr double kLowest = std::numeric_limits<double>::lowest();
constexpr double kHighest = std::numeric_limits<double>::max();

// Column and row offset, window, anchors; then left, top, right and bottom margin.
using Geometry = std::vector<int>;
Geometry GetGeometry(const IRasterResampler& oResampler) {
    Geometry an(10);
    WindowAnchorPoint eCol, eRow;
    oResampler.GetWindowExtents(an[0], an[1], an[2], an[3], eCol, eRow);
    an[4] = eCol;
    an[5] = eRow;
    oResampler.GetSrcBufferMargins(an[6], an[7], an[8], an[9]);
    return an;
}

// Clamp range, background, its flag, fill action.
using Settings = std::vector<double>;
Settings GetSettings(const IRasterResampler& oResampler) {
    Settings adf(5);
    oResampler.GetClampRange(adf[0], adf[1]);
    adf[2] = oResampler.GetOutBgd();
    adf[3] = oResampler.GetClampBgdFlag();
    adf[4] = oResampler.GetNodataFillAction();
    return adf;
}

template <typename R, typename... Args>
void CheckClass(int nMethod, const Geometry& anGeometry, const CoefficientMap& oCoefficients,
                Args... args) {
    SCOPED_TRACE(nMethod);
    R oResampler(args...);
    EXPECT_EQ(oResampler.GetResampleType(), nMethod);
    EXPECT_EQ(GetGeometry(oResampler), anGeometry);
    EXPECT_EQ(oResampler.GetCoefficients(), oCoefficients);
    EXPECT_EQ(GetSettings(oResampler), (Settings{kLowest, kHighest, kLowest, 1, 0}));

    // A clone takes the settings of the moment, and setters on one don't reach the other.
    oResampler.SetClampRange(1.0, 2.0);
    oResampler.SetOutBgd(3.0);
    oResampler.SetClampBgdFlag(false);
    oResampler.SetNodataFillAction(eNFA_BGD);
    const std::unique_ptr<R> poClone(oResampler.Clone());
    EXPECT_TRUE(poClone->GetResampleInfo() == oResampler.GetResampleInfo());
    EXPECT_EQ(GetGeometry(*poClone), anGeometry);
    poClone->SetOutBgd(5.0);
    oResampler.SetClampRange(-1.0, 4.0);
    ExpectRefusal(
        {"dfClampMin & dfClampMax", 1, "dfClampMin = 2.000000 dfClampMax = 1.000000",
         "dfClampMin <= dfClampMax", "Min clamp range cannot be greater than max clamp range"},
        [&] { oResampler.SetClampRange(2.0, 1.0); });
    EXPECT_EQ(GetSettings(*poClone), (Settings{1, 2, 5, 0, 1}));
    EXPECT_EQ(GetSettings(oResampler), (Settings{-1, 4, 3, 0, 1}));
}

TEST(RasterResampler, AllClasses) {
    const Geometry kOne = {0, 0, 1, 1, 1, 1, 0, 0, 1, 1};
    const Geometry kTwo = {0, 0, 2, 2, 0, 0, 0, 0, 1, 1};
    const Geometry kFour = {-1, -1, 4, 4, 0, 0, -1, -1, 2, 2};
    const Geometry kEight = {-3, -3, 8, 8, 0, 0, -3, -3, 4, 4};
    const Geometry kSixteen = {-7, -7, 16, 16, 0, 0, -7, -7, 8, 8};
    const Geometry kThreeFive = {0, 0, 3, 5, 1, 1, 0, 0, 3, 5};
    const Geometry kFourFive = {-1, -2, 4, 5, 0, 0, -1, -2, 2, 2};
    const CoefficientMap oWindow = {{"NUMCOLS", "3"}, {"NUMROWS", "5"}};
    CheckClass<BilinearResampler>(0, kTwo, {});
    CheckClass<CubicResampler>(1, kFour, {});
    CheckClass<CubicPsResampler>(2, kFour, {});
    CheckClass<NearestResampler>(3, kOne, {});
    ShapingWindow oKaiser, oHann;
    oKaiser.SetKaiser(2.5);
    oHann.SetHann();
    CheckClass<Sinc8Resampler>(4, kEight, {{"SHAPINGWINDOW", "KAISER"}, {"BETA", "2.500000"}},
                               oKaiser);
    CheckClass<Sinc16Resampler>(5, kSixteen, {{"SHAPINGWINDOW", "HANN"}}, oHann);
    CheckClass<AverageResampler>(6, kThreeFive, oWindow, 3, 5);
    CheckClass<MedianResampler>(7, kThreeFive, oWindow, 3, 5);
    CheckClass<CplxSarResampler>(
        8, {-2, -3, 5, 7, 1, 1, -2, -3, 3, 4},
        {{"NUMCOLS", "5"}, {"NUMROWS", "7"}, {"FC", "  2.5000000000000000e-01"}}, 5, 7, 0.25);
    CheckClass<Lagrange4Resampler>(9, kFour, {});
    CheckClass<Lagrange8Resampler>(10, kEight, {});
    const CoefficientMap oGaussian = {
        {"NUMCOLS", "4"}, {"NUMROWS", "5"}, {"SIGMACOL", "0.500000"}, {"SIGMAROW", "1.250000"}};
    CheckClass<GaussianResampler>(11, kFourFive, oGaussian, 4, 5, 0.5f, 1.25f);
    const CoefficientMap oKernel = {{"NUMCOLS", "4"}, {"NUMROWS", "5"}, {"NUMSUBPIXELS", "2"}};
    const std::vector<double> vdfWeights(9 * 3, 0.25);
    CheckClass<KernelResampler>(12, kFourFive, oKernel, 4, 5, 2, vdfWeights);
    CheckClass<SqBilinearResampler>(13, kTwo, {});
    CheckClass<SqCubicResampler>(14, kFour, {});
    CheckClass<SqCubicPsResampler>(15, kFour, {});
    CheckClass<SqNearestResampler>(16, kOne, {});
    CheckClass<SqSinc8Resampler>(17, kEight, {{"SHAPINGWINDOW", "HANN"}}, oHann);
    CheckClass<SqSinc16Resampler>(18, kSixteen, {{"SHAPINGWINDOW", "KAISER"}, {"BETA", "2.500000"}},
                                  oKaiser);
    CheckClass<SqAverageResampler>(19, kThreeFive, oWindow, 3, 5);
    CheckClass<SqMedianResampler>(20, kThreeFive, oWindow, 3, 5);
    CheckClass<SqLagrange4Resampler>(21, kFour, {});
    CheckClass<SqLagrange8Resampler>(22, kEight, {});
    CheckClass<SqGaussianResampler>(23, kFourFive, oGaussian, 4, 5, 0.5f, 1.25f);
    CheckClass<SqKernelResampler>(24, kFourFive, oKernel, 4, 5, 2, vdfWeights);
}

TEST(RasterResampler, SincWeights) {
    ShapingWindow oWindow;
    oWindow.SetLanczos();
    ResampleInfo oEight, oSixteen;
    Sinc8Resampler::GenerateKernelWeights(oWindow, oEight);
    Sinc16Resampler::GenerateKernelWeights(oWindow, oSixteen);
    const auto fnWeights = [](const IRasterResampler& oResampler) {
        return oResampler.GetResampleInfo().mvdfKernelWeights;
    };
    EXPECT_EQ(fnWeights(Sinc8Resampler(oWindow)), oEight.mvdfKernelWeights);
    EXPECT_EQ(fnWeights(SqSinc8Resampler(oWindow)), oEight.mvdfKernelWeights);
    EXPECT_EQ(fnWeights(Sinc16Resampler(oWindow)), oSixteen.mvdfKernelWeights);
    EXPECT_EQ(fnWeights(SqSinc16Resampler(oWindow)), oSixteen.mvdfKernelWeights);
}

template <typename R>
void CheckWindowSizes(const char* pszMethod, int nTooLarge, const char* pszLimit) {
    R(1, 1);
    R(11, 11);
    for (const int nSize : {0, -3, nTooLarge}) {
        const std::string sRest = std::string(pszMethod) + " must be a positive number" + pszLimit;
        const std::string sSize = std::to_string(nSize);
        ExpectRefusal({"nWndNumCols", 1, sSize, "Positive number", "Num cols for " + sRest},
                      [&] { R(nSize, nSize); });
        ExpectRefusal({"nWndNumRows", 1, sSize, "Positive number", "Num rows for " + sRest},
                      [&] { R(3, nSize); });
    }
}

TEST(RasterResampler, WindowSizes) {
    CheckWindowSizes<AverageResampler>("averaging", 0, "");
    CheckWindowSizes<SqAverageResampler>("averaging", 0, "");
    CheckWindowSizes<MedianResampler>("median", 0, "");
    CheckWindowSizes<SqMedianResampler>("median", 12, ", max 11");
    MedianResampler(12, 3);
}

TEST(RasterResampler, CplxSar) {
    for (const double dfFc : {-0.5, -1.0 / 3.0, 0.0, 0.5}) {
        int nCols = 0, nRows = 0;
        double dfRead = 7.0;
        CplxSarResampler(31, 1, dfFc).GetParameters(nCols, nRows, dfRead);
        EXPECT_TRUE(nCols == 31 && nRows == 1 && dfRead == dfFc) << dfFc;
    }
    for (const int nSize : {0, -3, 6, 32, 33}) {
        const std::string sSize = std::to_string(nSize);
        const std::string sRest = "for complex SAR resampler must be a positive odd number, max 31";
        ExpectRefusal({"nWndNumCols", 1, sSize, "Positive odd number", "Num cols " + sRest},
                      [&] { CplxSarResampler(nSize, nSize, 0.6); });
        ExpectRefusal({"nWndNumRows", 1, sSize, "Positive odd number", "Num rows " + sRest},
                      [&] { CplxSarResampler(7, nSize, 0.6); });
    }
    for (const double dfFc : {-0.75, 0.6}) {
        const std::string sFc = FormatString("%f", dfFc);
        ExpectRefusal(
            {"dfFc", 1, sFc, "[-0.5, 0.5]",
             "The given central frequency (" + sFc + ") must fall in the range [-0.5, 0.5]"},
            [&] { CplxSarResampler(5, 7, dfFc); });
    }
    EXPECT_THROW(CplxSarResampler(5, 7, std::numeric_limits<double>::quiet_NaN()),
                 ParameterException);
}

template <typename R>
void CheckKernels() {
    const std::vector<double> vdfWeights = {1.0, 0.25, 0.5, 0.75};
    EXPECT_EQ(R(1, 1, 1, vdfWeights).GetResampleInfo().mvdfKernelWeights, vdfWeights);
    EXPECT_EQ(R(3, 1, 0, vdfWeights).GetResampleInfo().mvdfKernelWeights, vdfWeights);
    constexpr int kMost = std::numeric_limits<int>::max();
    for (const int nSize : {0, -3, -kMost - 1}) {
        const std::string sSize = std::to_string(nSize);
        const std::string sRest = " for kernel resampler must be a non-zero positive number";
        ExpectRefusal({"nWndNumCols", 1, sSize, "Non-zero positive number", "Num cols" + sRest},
                      [&] { R(nSize, nSize, -1, vdfWeights); });
        ExpectRefusal({"nWndNumRows", 1, sSize, "Non-zero positive number", "Num rows" + sRest},
                      [&] { R(1, nSize, -1, vdfWeights); });
    }
    for (const int nSubPixels : {-1, -kMost - 1}) {
        ExpectRefusal({"nSubPixels", 1, std::to_string(nSubPixels), "Positive number",
                       "Num of subpixels for kernel resampler must be a positive number"},
                      [&] { R(1, 1, nSubPixels, vdfWeights); });
    }
    // One weight too few, one too many, none, and products that are 0 in 32 or 64 bits.
    for (const auto& anSizes : {std::array{2, 3, 0},
                                {1, 2, 0},
                                {4, 4, 4},
                                {1 << 30, 1 << 30, 1},
                                {kMost, kMost, kMost}}) {
        try {
            R(anSizes[0], anSizes[1], anSizes[2], vdfWeights);
            ADD_FAILURE() << anSizes[0];
        } catch (const DataException& oCaught) {
            EXPECT_TRUE(typeid(oCaught) == typeid(DataException));
            EXPECT_EQ(oCaught.GetMessage(),
                      "Resampler kernel does not have correct number of weights.");
        }
    }
}

TEST(RasterResampler, Kernels) {
    CheckKernels<KernelResampler>();
    CheckKernels<SqKernelResampler>();
}

// A caller's own class, whose axes have different anchors.
class OwnResampler : public IRasterResampler {
 public:
    OwnResampler() = default;
    OwnResampler* Clone() const override { return new OwnResampler(*this); }
    void Set(WindowAnchorPoint eCol, WindowAnchorPoint eRow) {
        ResampleInfo oInfo;
        oInfo.mvdfKernelWeights = {0.5};
        SetResampleInfo(oInfo);
        SetWindowExtents(-2, -5, 6, 4, eCol, eRow);
    }
};

TEST(RasterResampler, OwnClass) {
    OwnResampler oOwn;
    EXPECT_EQ(GetGeometry(oOwn), (Geometry{0, 0, 1, 1, 1, 1, 0, 0, 1, 1}));
    oOwn.Set(eWAP_FLOOR, eWAP_NEAREST);
    EXPECT_EQ(GetGeometry(oOwn), (Geometry{-2, -5, 6, 4, 0, 1, -2, -5, 3, -1}));
    oOwn.Set(eWAP_NEAREST, eWAP_FLOOR);
    const std::unique_ptr<OwnResampler> poClone(oOwn.Clone());
    EXPECT_EQ(GetGeometry(*poClone), (Geometry{-2, -5, 6, 4, 1, 0, -2, -5, 4, -2}));
    EXPECT_EQ(poClone->GetResampleInfo().mvdfKernelWeights, std::vector<double>{0.5});
}

TEST(RasterResampler, SettingsReachTheRun) {
    unsigned char abySrc[] = {10, 20, 30};
    unsigned char abyTgt[4] = {};
    const ResampleBuffer oSrc(gobs::eDT_8U, 3, 1, 1, abySrc, nullptr, false);
    ResampleBuffer oTgt(gobs::eDT_8U, 4, 1, 1, abyTgt, nullptr, false);
    NearestResampler oResampler;
    oResampler.SetClampRange(15.0, 25.0);
    oResampler.SetOutBgd(20.0);
    oResampler.Resample(oSrc, oTgt, BufPosScaleOffTfm(4, 1, 1.0, 0.0, 1.0, 0.0, 0, 0));
    EXPECT_EQ(std::vector<unsigned char>(abyTgt, abyTgt + 4),
              (std::vector<unsigned char>{15, 21, 25, 20}));
}

}  // namespace
}  // namespace vetra::utils
