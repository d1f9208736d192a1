#include <cpl_minixml.h>

#include <algorithm>
#include <cmath>
#include <fstream>
#include <map>
#include <memory>
#include <numbers>
#include <sstream>
#include <utility>

#include "kernel/axisfilter.h"
#include "kernel/response.h"
#include "methods.h"
#include "tests/apps/vetra/tooltest.h"
#include "vetra/base/utils/resample/algorithm/kernelfile.h"
#include "vetra/textcore/formatstring.h"

namespace {

using namespace vetra::tool;

constexpr double kPi = std::numbers::pi;

double Noise(int, int nCol, int nRow) { return (nCol * 37 + nRow * nRow * 11 + nCol * nRow) % 251; }

std::string ReadText(const std::string& sPath) {
    std::ostringstream oText;
    oText << std::ifstream(sPath).rdbuf();
    return oText.str();
}

// Cubic convolution (Keys 1981) with free parameter a.
double Keys(double x, double a) {
    x = std::abs(x);
    return x < 1   ? (a + 2) * x * x * x - (a + 3) * x * x + 1
           : x < 2 ? a * (x * x * x - 5 * x * x + 8 * x - 4)
                   : 0;
}

double Sinc(double x) { return x == 0 ? 1 : std::sin(kPi * x) / (kPi * x); }

MethodFilters FiltersOf(const std::string& sMethod) {
    return GetMethodFilters(*MakeResampler(sMethod));
}

TEST_F(ToolTest, AMethodsWeightsDoWhatItDoes) {
    constexpr int kCols = 48;
    constexpr int kRows = 44;
    constexpr int kScale = 4;
    Fill(*Create("a.tif", kCols, kRows, 1, GDT_Float64), Noise);
    struct Case {
        std::string sMethod;
        std::string sHeader;
        std::string sKernel = "KERNEL";
        // How far the tool moves the method and not the kernel, in target pixels.
        int nColShift = 0;
        int nRowShift = 0;
    };
    const Case kCases[] = {
        {"NEAR", "2,64"},
        {"BILIN", "2,64"},
        {"CUBIC,MIN=100,MAX=101,FILL=BGD", "4,64"},
        {"CUBICPS", "4,64"},
        {"LAGRANGE4", "4,64"},
        {"LAGRANGE8", "8,64"},
        {"SINC8", "8,64"},
        {"SINC16,SHAPINGWINDOW=HANN", "16,64"},
        {"GAUSSIAN,DSFACTORCOL=2,DSFACTORROW=1", "6,2,64"},
        {"AVERAGE,NUMCOLS=3,NUMROWS=2", "6,4,64", "KERNEL", 4, 2},
        {"SQNEAR", "2,64", "SQKERNEL"},
        {"SQCUBIC", "4,64", "SQKERNEL"},
        {"SQSINC8", "8,64", "SQKERNEL"},
        {"SQAVERAGE,NUMCOLS=1,NUMROWS=4", "2,8,64", "SQKERNEL", 0, 6},
    };
    for (const Case& oCase : kCases) {
        SCOPED_TRACE(oCase.sMethod);
        Succeed("kernel " + oCase.sMethod + " -o k.txt");
        const std::string sText = ReadText(Path("k.txt"));
        EXPECT_EQ(oCase.sHeader, sText.substr(0, sText.find('\n')));
        EXPECT_TRUE(sText == Run("kernel " + oCase.sMethod).sOut);
        EXPECT_TRUE(sText == Run("kernel " + oCase.sKernel + ",FILE=k.txt").sOut);

        const std::string sPlain = oCase.sMethod.substr(0, oCase.sMethod.find(",MIN"));
        Succeed("resample a.tif m.tif -q --scale 4 --fill bgd --method " + sPlain);
        Succeed("resample a.tif k.tif -q --scale 4 --fill bgd --method " + oCase.sKernel +
                ",FILE=k.txt");
        const Pixels vdfMethod = Read("m.tif");
        const Pixels vdfKernel = Read("k.tif");
        const auto At = [](int nCol, int nRow) {
            return static_cast<std::size_t>(nRow * kScale * kCols + nCol);
        };
        double dfWorst = 0;
        // Away from the edges, where the kernel's window may be larger.
        constexpr int kMargin = 8 * kScale + 6;
        for (int nRow = kMargin; nRow < kScale * kRows - kMargin; ++nRow) {
            for (int nCol = kMargin; nCol < kScale * kCols - kMargin; ++nCol) {
                dfWorst = std::max(
                    dfWorst,
                    std::abs(vdfMethod[At(nCol, nRow)] -
                             vdfKernel[At(nCol - oCase.nColShift, nRow - oCase.nRowShift)]));
            }
        }
        EXPECT_LT(dfWorst, 1e-11);
    }
}

TEST(KernelResponse, GainsAreThoseOfTheFormulas) {
    const auto Check = [](const AxisFilter& oFilter, double dfTolerance, auto fnGain) {
        const FrequencyGrid oGrid = MakeGrid(oFilter, -0.5, 2.0);
        EXPECT_GE(oGrid.nCount, 1281);
        EXPECT_DOUBLE_EQ(2.0, oGrid.Get(oGrid.nCount - 1));
        const std::vector<double> vdfGains = GetGains(oFilter, oGrid);
        double dfWorst = 0;
        for (int n = 0; n < oGrid.nCount; ++n) {
            dfWorst = std::max(dfWorst, std::abs(vdfGains[static_cast<std::size_t>(n)] -
                                                 std::abs(fnGain(oGrid.Get(n)))));
        }
        EXPECT_LT(dfWorst, dfTolerance);
    };
    Check(FiltersOf("NEAR").oCols, 1e-13, Sinc);
    Check(FiltersOf("BILIN").oRows, 1e-4, [](double f) { return Sinc(f) * Sinc(f); });
    Check(FiltersOf("AVERAGE,NUMCOLS=3,NUMROWS=200").oCols, 1e-13,
          [](double f) { return Sinc(3 * f); });
    Check(FiltersOf("AVERAGE,NUMCOLS=3,NUMROWS=200").oRows, 1e-13,
          [](double f) { return Sinc(200 * f); });
    Check(FiltersOf("CUBIC").oCols, 1e-4, [](double f) {
        double dfSum = 0;
        constexpr int kSteps = 500;
        for (int n = 0; n < 2 * kSteps; ++n) {
            const double x = (n + 0.5) / kSteps;
            dfSum += 2 * Keys(x, -1) * std::cos(2 * kPi * f * x) / kSteps;
        }
        return dfSum;
    });
    // Without sub-pixels each weight holds for a whole pixel.
    Check({3, 0, {0.25, 0.5, 0.25}, 0.0}, 1e-13,
          [](double f) { return Sinc(f) * (0.5 + 0.5 * std::cos(2 * kPi * f)); });
    // Of four sub-pixels the outer two hold for half as many fractions as the others.
    const AxisFilter oSteps{1, 4, {8, 0, 0, 0, 0}, 0.0};
    Check(oSteps, 1e-13, [](double f) { return Sinc(f / 8); });
}

TEST_F(ToolTest, FiguresAreThoseOfPictures) {
    constexpr int kCols = 60;
    Fill(*Create("step.tif", kCols, 24, 1, GDT_Float64),
         [](int, int nCol, int) { return nCol < kCols / 2 ? 0 : 1; });
    for (const std::string sMethod : {"BILIN", "CUBIC", "LAGRANGE4", "LAGRANGE8", "SINC8",
                                      "SINC16,SHAPINGWINDOW=NONE", "GAUSSIAN,DSFACTORCOL=3"}) {
        SCOPED_TRACE(sMethod);
        const ResponseFigures oFigures = GetFigures(FiltersOf(sMethod).oCols);
        EXPECT_NEAR(1, oFigures.dfGainAtZero, 1e-13);
        EXPECT_NEAR(1, oFigures.dfSmallestSum, 1e-14);
        EXPECT_NEAR(1, oFigures.dfLargestSum, 1e-14);
        Succeed("resample step.tif fine.tif -q --scale 64 1 --method " + sMethod);
        const Pixels vdfFine = Read("fine.tif");
        EXPECT_NEAR(*std::max_element(vdfFine.begin(), vdfFine.end()) - 1, oFigures.dfOvershoot,
                    2e-4);
    }
    const ResponseFigures oCubic = GetFigures(FiltersOf("CUBIC").oCols);
    EXPECT_NEAR(4.0 / 27, oCubic.dfOvershoot, 1e-4);
    EXPECT_NEAR(-4.0 / 27, oCubic.dfSmallestWeight, 1e-4);
    EXPECT_NEAR(2 / kPi, GetFigures(FiltersOf("NEAR").oCols).dfGainAtNyquist, 1e-13);
    const ResponseFigures oBilinear = GetFigures(FiltersOf("BILIN").oCols);
    EXPECT_NEAR(std::pow(Sinc(0.25), 2), oBilinear.dfGainAtHalfNyquist, 1e-4);
    EXPECT_NEAR(std::pow(Sinc(0.75), 2), oBilinear.dfLargestImage, 1e-4);
    EXPECT_EQ(0, oBilinear.dfSmallestWeight);
    // Levels other than 1: the overshoot counts from them.
    const ResponseFigures oDouble = GetFigures({2, 1, {2.5, -0.5, -0.25, 1.25}, 0.0});
    EXPECT_EQ(1, oDouble.dfSmallestSum);
    EXPECT_EQ(2, oDouble.dfLargestSum);
    EXPECT_EQ(0.5, oDouble.dfOvershoot);
}

TEST(KernelResponse, ARadarFilterIsItsPlainOneAroundTheCarrier) {
    const MethodFilters oFilters = FiltersOf("CPLXSAR,NUMCOLS=5,NUMROWS=7,FC=-0.3");
    EXPECT_EQ(0, oFilters.oCols.dfCarrier);
    EXPECT_EQ(-0.3, oFilters.oRows.dfCarrier);
    for (const AxisFilter* po : {&oFilters.oCols, &oFilters.oRows}) {
        const int nHalf = po == &oFilters.oCols ? 2 : 3;
        ASSERT_EQ(2 * nHalf + 2, po->nTaps);
        for (int nPhase = 0; nPhase <= 64; ++nPhase) {
            double dfSum = 0;
            const auto Formula = [&](int nTap) {
                // The window is that of the nearest pixel.
                const double t = nPhase / 64.0;
                const double x = nHalf - nTap + t;
                return std::abs(nHalf + (t < 0.5 ? 0 : 1) - nTap) > nHalf
                           ? 0
                           : Sinc(x) * (0.5 + 0.5 * std::cos(kPi * x / (nHalf + 1)));
            };
            for (int nTap = 0; nTap < po->nTaps; ++nTap) dfSum += Formula(nTap);
            for (int nTap = 0; nTap < po->nTaps; ++nTap) {
                EXPECT_NEAR(Formula(nTap) / dfSum, po->GetWeight(nPhase, nTap), 1e-14);
            }
        }
    }
}

TEST_F(ToolTest, MethodsAreDrawn) {
    std::ofstream(Path("a<&>\xc3\xa4.txt")) << "1,0\n0\n";
    std::ofstream(Path("\xff\x01.txt"))
        << "2,1,4\n1.2,0\n.9,.1\n.5,.5\n.1,.9\n0,1\n1\n1\n1\n1\n1\n";
    struct Case {
        const char* pszMethod;
        std::vector<std::string> oTexts;
        int nNumSeries;
    };
    const auto Gain = [](double df) {
        return FormatString("%.3f (%.1f dB)", df, 20 * std::log10(df));
    };
    const Case kCases[] = {
        {"NEAR", {"1", Gain(Sinc(0.25)), Gain(2 / kPi), Gain(Sinc(0.75)), "0.0 %", "0.000"}, 1},
        {"BILIN", {"2", "0.405 (-7.8 dB)", "BILIN"}, 1},
        {"CUBIC", {"4", "14.8 %", "-0.148"}, 1},
        {"SQCUBIC", {"14.8 %", "The method does this to the square roots of samples."}, 1},
        {"AVERAGE,NUMCOLS=2,NUMROWS=5", {"2", "5", "0 (below -120 dB)"}, 2},
        {"CPLXSAR,NUMCOLS=3,NUMROWS=7,FC=0.25",
         {"7",
          "Rows: real part and envelope around the carrier of 0.25 cycles per row, from which "
          "their gains count. All results carry a phase of 90 degrees."},
         2},
        {"KERNEL,FILE=a<&>\xc3\xa4.txt", {"KERNEL,FILE=a<&>\xc3\xa4.txt"}, 1},
        {"KERNEL,FILE=\xff\x01.txt",
         {"KERNEL,FILE=? .txt",
          "columns: the weights of a phase sum to 1 to 1.2, not to 1: the level changes."},
         2},
    };
    for (const Case& oCase : kCases) {
        SCOPED_TRACE(oCase.pszMethod);
        Succeed("kernel '" + std::string(oCase.pszMethod) + "' --plot p.svg");
        const std::string sSvg = ReadText(Path("p.svg"));
        EXPECT_LT(sSvg.size(), 50000u);
        EXPECT_EQ(std::string::npos, sSvg.find("nan"));
        EXPECT_EQ(std::string::npos, sSvg.find("inf"));
        CPLXMLTreeCloser oTree(CPLParseXMLString(sSvg.c_str()));
        ASSERT_TRUE(oTree);
        const CPLXMLNode* poSvg = CPLGetXMLNode(oTree.get(), "=svg");
        ASSERT_TRUE(poSvg);
        std::set<std::string> oTexts;
        std::map<std::string, int> oNumCurves;
        for (const CPLXMLNode* po = poSvg->psChild; po != nullptr; po = po->psNext) {
            const std::string sClass = CPLGetXMLValue(po, "class", "");
            if (EQUAL(po->pszValue, "text")) oTexts.insert(CPLGetXMLValue(po, nullptr, ""));
            if (EQUAL(po->pszValue, "polyline")) ++oNumCurves[sClass];
        }
        for (const std::string& sText : oCase.oTexts) {
            EXPECT_TRUE(oTexts.count(sText)) << sText;
        }
        // Weights, gains and the line in the table; decibels where there are any.
        EXPECT_GE(oNumCurves["cols"], 3);
        EXPECT_EQ(oCase.nNumSeries > 1, oNumCurves["rows"] >= 3);
        EXPECT_TRUE(oCase.nNumSeries > 1 || oNumCurves["rows"] == 0);
    }
}

TEST_F(ToolTest, CurvesAreDrawnTrue) {
    Succeed("kernel BILIN --plot p.svg");
    const std::string sSvg = ReadText(Path("p.svg"));
    // The points of a curve, its first at (x0, y0) and its last at (x1, y1).
    std::size_t nStart = 0;
    const auto ReadCurve = [&](double x0, double y0, double x1, double y1) {
        nStart = sSvg.find("class=\"cols\" points=\"", nStart) + 21;
        std::istringstream oText(sSvg.substr(nStart, sSvg.find('"', nStart) - nStart));
        std::vector<std::pair<double, double>> oPoints;
        char c;
        for (double x, y; oText >> x >> c >> y;) oPoints.emplace_back(x, y);
        const auto [a, b] = oPoints.front();
        const auto [p, q] = oPoints.back();
        for (auto& [x, y] : oPoints) {
            x = x0 + (x - a) / (p - a) * (x1 - x0);
            y = q == b ? b - y : y0 + (y - b) / (q - b) * (y1 - y0);
        }
        return oPoints;
    };
    const auto oWeights = ReadCurve(-2, 0, 2, 0);
    double dfPeak = 0;
    for (const auto& [x, y] : oWeights) dfPeak = std::max(dfPeak, y);
    for (const auto& [x, y] : oWeights) {
        EXPECT_NEAR(std::max(0.0, 1 - std::abs(x)), y / dfPeak, 2e-3) << x;
    }
    const auto oGains = ReadCurve(0, 1, 2, 0);
    EXPECT_GT(oGains.size(), 20u);
    for (const auto& [x, y] : oGains) EXPECT_NEAR(Sinc(x) * Sinc(x), y, 2e-3) << x;
    // The first part ends where the gain is 1e-4.
    const auto oDecibels = ReadCurve(0, 0, 0.99, -80);
    EXPECT_GT(oDecibels.size(), 10u);
    for (const auto& [x, y] : oDecibels) {
        EXPECT_NEAR(std::pow(10, y / 20), Sinc(x) * Sinc(x), 1e-2) << x;
    }
}

TEST_F(ToolTest, KernelRefusalsLeaveNothing) {
    std::ofstream(Path("old.txt")) << "old";
    std::ofstream(Path("huge.txt")) << "1,0\n1e200\n";
    std::ofstream(Path("few.txt")) << "2,1\n1,0\n";
    std::filesystem::create_directory(Path("folder"));
    const std::set<std::string> oBefore = List();
    struct Case {
        int nStatus;
        const char* pszArgs;
        const char* pszMessage;
        const char* pszBefore = "";
    };
    const Case kCases[] = {
        {2, "kernel", "METHOD"},
        {2, "kernel BEST -o old.txt", "BEST"},
        {2, "kernel MEDIAN,NUMCOLS=3,NUMROWS=3 -o old.txt", "MEDIAN takes one of the pixels"},
        {2, "kernel MEDIAN,NUMCOLS=3,NUMROWS=3 --plot old.txt", "MEDIAN takes one of the pixels"},
        {2, "kernel SQMEDIAN,NUMCOLS=3,NUMROWS=3", "SQMEDIAN takes one of the pixels"},
        {2, "kernel CPLXSAR,NUMCOLS=3,NUMROWS=3", "complex weights"},
        {2, "kernel CPLXSAR,NUMCOLS=3,NUMROWS=3 -o old.txt --plot p.svg", "complex weights"},
        {2, "kernel AVERAGE,NUMCOLS=3,NUMROWS=1025", "1024"},
        {2, "kernel AVERAGE,NUMCOLS=2147483647,NUMROWS=1 --plot p.svg", "1024"},
        {2, "kernel KERNEL,FILE=few.txt", "number of weights"},
        {2, "kernel CUBIC -o new.txt --plot ./new.txt", "same file"},
        {1, "kernel KERNEL,FILE=huge.txt --plot old.txt", "too large"},
        {1, "kernel CUBIC -o folder", "not a file"},
        {1, "kernel CUBIC -o none/new.txt", "none"},
        {1, "kernel CUBIC --plot folder", "not a file"},
        {1, "kernel SINC16 -o old.txt", "old.txt", "ulimit -f 1;"},
    };
    for (const Case& oCase : kCases) {
        SCOPED_TRACE(oCase.pszArgs);
        const Outcome oOutcome = Run(oCase.pszArgs, oCase.pszBefore);
        EXPECT_EQ(oCase.nStatus, oOutcome.nStatus);
        EXPECT_NE(std::string::npos, oOutcome.sErr.find(oCase.pszMessage)) << oOutcome.sErr;
        EXPECT_EQ("", oOutcome.sOut);
        EXPECT_EQ(oBefore, List());
        EXPECT_EQ("old", ReadText(Path("old.txt")));
    }
    EXPECT_EQ(1, Run("kernel CUBIC >/dev/full 2>&1 #").nStatus);
}

TEST(KernelFiles, SharedOnesHoldTheFormula) {
    for (const double a : {-0.5, -0.75}) {
        int nCols, nRows, nSubPixels;
        std::vector<double> vdfWeights;
        LoadKernelFile(VETRA_SHARE + FormatString("/kernels/cubic%g.txt", a), nCols, nRows,
                       nSubPixels, vdfWeights);
        ASSERT_EQ(4, nCols);
        ASSERT_EQ(4, nRows);
        ASSERT_EQ(64, nSubPixels);
        for (std::size_t n = 0; n < vdfWeights.size(); ++n) {
            const std::size_t nPhase = n / 4 % 65;
            const double x = static_cast<double>(nPhase) / 64 + 1 - static_cast<double>(n % 4);
            EXPECT_NEAR(Keys(x, a), vdfWeights[n], 1e-14) << a << " " << nPhase << " " << n % 4;
        }
    }
}

}  // namespace
