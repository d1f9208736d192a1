#include <fstream>

#include "tests/apps/vetra/tooltest.h"

namespace {

double Noise(int nBand, int nCol, int nRow) {
    return ((nBand * 31 + nCol) * 17 + nRow * nRow * 5) % 251;
}

TEST_F(ToolTest, DownsamplingTakesTheMeanOfEachCell) {
    Fill(*Create("a.tif", 61, 42, 2, GDT_Float64), Noise);
    Succeed("resample a.tif mean.tif --downsample 3 -q");
    // Of the last cell of a row there is one column of three, and its centre is outside.
    const GDALDatasetUniquePtr poMean = Open("mean.tif");
    ASSERT_EQ(20, poMean->GetRasterXSize());
    ASSERT_EQ(14, poMean->GetRasterYSize());
    const Pixels vdfMean = Read("mean.tif");
    std::size_t n = 0;
    for (int nBand = 1; nBand <= 2; ++nBand) {
        for (int nRow = 0; nRow < 14; ++nRow) {
            for (int nCol = 0; nCol < 20; ++nCol, ++n) {
                double dfSum = 0;
                for (int i = 0; i < 9; ++i)
                    dfSum += Noise(nBand, 3 * nCol + i % 3, 3 * nRow + i / 3);
                ASSERT_EQ(dfSum / 9, vdfMean[n]) << nBand << " " << nCol << " " << nRow;
            }
        }
    }
}

// A flat image with one bright pixel: windows lie around their pixel, and no pixel is lost at the
// edges or beside masked ones.
TEST_F(ToolTest, WindowsAreCentredAndTheFrameIsFilled) {
    const auto Spot = [](int, int nCol, int nRow) {
        return nCol == 7 && nRow == 5 ? 90.0 : nCol == 12 && nRow == 3 ? 255.0 : 9.0;
    };
    Fill(*Create("a.tif", 16, 11, 1, GDT_Byte), Spot);
    Succeed("resample a.tif b.tif --scale 1 --method AVERAGE,NUMCOLS=3,NUMROWS=5 --nodata 255 -q");
    const Pixels vdf = Read("b.tif");
    for (int nRow = 0; nRow < 11; ++nRow) {
        for (int nCol = 0; nCol < 16; ++nCol) {
            double dfWant = 9;
            if (std::abs(nCol - 7) <= 1 && std::abs(nRow - 5) <= 2) dfWant = 9 + 81.0 / 15;
            if (nCol == 12 && nRow == 3) dfWant = 255;
            EXPECT_NEAR(dfWant, vdf[static_cast<std::size_t>(nRow * 16 + nCol)], 0.5)
                << nCol << " " << nRow;
        }
    }
    Succeed(
        "resample a.tif c.tif --scale 1 --method AVERAGE,NUMCOLS=3,NUMROWS=5 --nodata 255 "
        "--fill bgd -q");
    const Pixels vdfHard = Read("c.tif");
    EXPECT_EQ(255, vdfHard[0]);
    EXPECT_EQ(255, vdfHard[1 * 16 + 5]);
    EXPECT_EQ(9, vdfHard[2 * 16 + 1]);
    EXPECT_EQ(255, vdfHard[4 * 16 + 11]);
    // A fill in the method string counts unless the option says otherwise.
    Succeed("resample a.tif d.tif --scale 1 --method MEDIAN,NUMCOLS=3,NUMROWS=3,FILL=BGD -q");
    EXPECT_EQ(0, Read("d.tif")[0]);
    Succeed(
        "resample a.tif d.tif --scale 1 --method MEDIAN,NUMCOLS=3,NUMROWS=3,FILL=BGD --fill nn -q");
    EXPECT_EQ(9, Read("d.tif")[0]);
}

TEST_F(ToolTest, MethodsTakeTheirKeys) {
    Fill(*Create("a.tif", 40, 40, 1, GDT_Float32), Noise);
    std::ofstream(Path("two.txt")) << "2,1\n1,0\n0.5,0.5\n";
    const auto Resample = [&](const std::string& sArgs) {
        Succeed("resample a.tif b.tif -q " + sArgs);
        return Read("b.tif");
    };
    EXPECT_EQ(Resample("--downsample 2 --method MEDIAN"),
              Resample("--scale .5 --method median,NUMCOLS=2,NUMROWS=2"));
    EXPECT_EQ(Resample("--downsample 2 --method MEDIAN,NUMCOLS=3,NUMROWS=1"),
              Resample("--scale .5 --method MEDIAN,NUMCOLS=3,NUMROWS=1"));
    EXPECT_EQ(Resample("--downsample 4 --method GAUSSIAN"),
              Resample("--scale .25 --method GAUSSIAN,DSFACTORCOL=4"));
    EXPECT_NE(Resample("--scale 2 --method SINC8"), Resample("--scale 2 --method 8PT"));
    EXPECT_EQ(Resample("--scale 2 --method 8PT"),
              Resample("--scale 2 --method 'SINC8, SHAPINGWINDOW=parabola'"));
    // Half way between two columns the kernel takes their mean.
    const Pixels vdfKernel =
        Resample("--size 20 40 --method KERNEL,FILE=" + Path("two.txt") + ",MAX=100");
    for (std::size_t i = 0; i < 20 * 39; ++i) {
        const int nCol = 2 * static_cast<int>(i % 20);
        const int nRow = static_cast<int>(i / 20);
        EXPECT_EQ(std::min(100.0, (Noise(1, nCol, nRow) + Noise(1, nCol + 1, nRow)) / 2),
                  vdfKernel[i]);
    }
}

TEST_F(ToolTest, MethodsAreDescribed) {
    const std::string sAll = Run("methods").sOut;
    for (const char* pszName : {"NEAR", "BILIN", "CUBIC", "CUBICPS", "LAGRANGE4", "LAGRANGE8",
                                "SINC8", "SINC16", "AVERAGE", "MEDIAN", "GAUSSIAN", "KERNEL"}) {
        for (const char* pszBefore : {"\n", "\nSQ"}) {
            std::string sLine = pszBefore;
            sLine.append(pszName).append(" ");
            EXPECT_NE(std::string::npos, sAll.find(sLine)) << sLine;
        }
    }
    for (const char* pszText : {"\nCPLXSAR ", "\nLAGRANGE8   8 x 8    -3 -3 4 4\n",
                                "NUMCOLS=C NUMROWS=R", "free parameter -1"}) {
        EXPECT_NE(std::string::npos, sAll.find(pszText)) << pszText;
    }
    EXPECT_EQ(
        "method: GAUSSIAN\nNUMCOLS: 6\nNUMROWS: 2\nSIGMACOL: 0.866025\nSIGMAROW: 0.229129\n"
        "window: 6 x 2\nmargins: -2 0 3 1\n",
        Run("methods gaussian,dsfactorcol=2,DSFACTORROW=1").sOut);
}

}  // namespace
