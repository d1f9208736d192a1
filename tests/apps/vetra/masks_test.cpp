#include <cpl_conv.h>

#include <cmath>
#include <limits>

#include "tests/apps/vetra/tooltest.h"

namespace {

constexpr int kCols = 40;
constexpr int kRows = 30;

// A different part of the image for each band.
bool IsHole(int nBand, int nCol, int nRow) { return (nCol + 7 * nBand) % 20 < 7 && nRow % 11 > 2; }

struct NodataCase {
    GDALDataType eType;
    double dfNodata;
    const char* pszArgs;
    double dfTarget;  // what a target pixel without data becomes
};

TEST_F(ToolTest, NodataValuesNeverMixWithData) {
    const double dfNan = std::numeric_limits<double>::quiet_NaN();
    const NodataCase kCases[] = {
        {GDT_Int16, -32768, "", -32768},
        {GDT_Byte, 0, "", 0},
        {GDT_Byte, 255, "--threads 1", 255},
        {GDT_Float32, dfNan, "", dfNan},
        {GDT_Float32, -3.4028234663852886e38, "", -3.4028234663852886e38},
        {GDT_Float64, -9999, "--dst-nodata nan", dfNan},
        {GDT_Float32, -9999, "--type 8U --dst-nodata 255", 255},
        {GDT_CInt16, -1, "", -1},
        {GDT_UInt32, 4294967295.0, "", 4294967295.0},
    };
    for (const NodataCase& oCase : kCases) {
        for (const bool bDeclared : {true, false}) {
            const std::string sWhat =
                std::string(GDALGetDataTypeName(oCase.eType)) + " " + oCase.pszArgs;
            {
                const GDALDatasetUniquePtr po = Create("a.tif", kCols, kRows, 2, oCase.eType);
                Fill(*po, [&](int nBand, int nCol, int nRow) {
                    return IsHole(nBand, nCol, nRow) ? oCase.dfNodata : 50 + nCol % 2;
                });
                if (bDeclared) {
                    po->GetRasterBand(1)->SetNoDataValue(oCase.dfNodata);
                }
            }
            const std::string sNodata = CPLSPrintf(" --nodata %.17g", oCase.dfNodata);
            Succeed("resample a.tif b.tif --scale 0.5 1 -q " + std::string(oCase.pszArgs) +
                    (bDeclared ? "" : sNodata));
            int bHas = FALSE;
            const double dfDeclared = Open("b.tif")->GetRasterBand(2)->GetNoDataValue(&bHas);
            EXPECT_TRUE(bHas) << sWhat;
            const auto IsNodata = [&](double df) {
                return df == oCase.dfTarget || (std::isnan(df) && std::isnan(oCase.dfTarget));
            };
            EXPECT_TRUE(IsNodata(dfDeclared)) << sWhat << dfDeclared;
            const Pixels vdfPixels = Read("b.tif");
            for (int n = 0; n < 2 * kRows * kCols / 2; ++n) {
                const int nBand = 1 + n / (kRows * kCols / 2);
                const int nRow = n / (kCols / 2) % kRows;
                const int nCol = n % (kCols / 2) * 2;
                const bool bLeft = IsHole(nBand, nCol, nRow);
                const bool bRight = IsHole(nBand, nCol + 1, nRow);
                const double df = vdfPixels[static_cast<std::size_t>(n)];
                const bool bBelow = nRow + 1 == kRows || IsHole(nBand, nCol, nRow + 1) ||
                                    IsHole(nBand, nCol + 1, nRow + 1);
                // Between two pixels the right one is the nearest. Means are ties, to even.
                if (bRight) {
                    ASSERT_TRUE(IsNodata(df)) << sWhat << n << ' ' << df;
                } else if (bLeft || bBelow) {
                    ASSERT_EQ(df, 51) << sWhat << n;
                } else {
                    const bool bFloat = GDALDataTypeIsFloating(oCase.eType) != 0 &&
                                        std::string(oCase.pszArgs).find("8U") == std::string::npos;
                    ASSERT_EQ(df, bFloat ? 50.5 : 50.0) << sWhat << n;
                }
            }
        }
    }
}

TEST_F(ToolTest, NodataKeepsAllDigits) {
    const std::int64_t nNodata = -9007199254740993;
    {
        const GDALDatasetUniquePtr po = Create("a.tif", 4, 1, 1, GDT_Int64);
        std::vector<std::int64_t> vnPixels = {nNodata, 5, nNodata + 1, nNodata};
        EXPECT_EQ(po->GetRasterBand(1)->RasterIO(GF_Write, 0, 0, 4, 1, vnPixels.data(), 4, 1,
                                                 GDT_Int64, 0, 0, nullptr),
                  CE_None);
        po->GetRasterBand(1)->SetNoDataValueAsInt64(nNodata);
    }
    Succeed("resample a.tif b.tif --scale 1 --method NEAR -q");
    std::vector<std::int64_t> vnPixels(4);
    const GDALDatasetUniquePtr po = Open("b.tif");
    EXPECT_EQ(po->GetRasterBand(1)->RasterIO(GF_Read, 0, 0, 4, 1, vnPixels.data(), 4, 1, GDT_Int64,
                                             0, 0, nullptr),
              CE_None);
    EXPECT_EQ(po->GetRasterBand(1)->GetNoDataValueAsInt64(), nNodata);
    EXPECT_EQ(vnPixels, (std::vector<std::int64_t>{nNodata, 5, nNodata + 1, nNodata}));
}

TEST_F(ToolTest, MasksNeverMixWithData) {
    constexpr double kSentinel = 250;
    const auto Value = [](int nBand, int nCol, int nRow) {
        return IsHole(1, nCol, nRow) ? kSentinel : (nBand == 3 ? 0 : 50 + nCol % 2);
    };
    const auto Valid = [](int nCol, int nRow) { return IsHole(1, nCol, nRow) ? 0 : 200; };
    {
        const CPLConfigOptionSetter oInternal("GDAL_TIFF_INTERNAL_MASK", "YES", false);
        const GDALDatasetUniquePtr poMasked = Create("mask.tif", kCols, kRows, 3, GDT_Byte);
        Fill(*poMasked, Value);
        poMasked->CreateMaskBand(GMF_PER_DATASET);
        for (int n = 0; n < kCols * kRows; ++n) {
            unsigned char nValid = Valid(n % kCols, n / kCols) != 0 ? 255 : 0;
            EXPECT_EQ(
                poMasked->GetRasterBand(1)->GetMaskBand()->RasterIO(
                    GF_Write, n % kCols, n / kCols, 1, 1, &nValid, 1, 1, GDT_Byte, 0, 0, nullptr),
                CE_None);
        }
        Fill(*Create("alpha.tif", kCols, kRows, 4, GDT_Byte), [&](int nBand, int nCol, int nRow) {
            return nBand == 4 ? Valid(nCol, nRow) : Value(nBand, nCol, nRow);
        });
    }
    for (const std::string sSource : {"mask", "alpha"}) {
        Succeed("resample " + sSource + ".tif b.tif --scale 0.5 1 -q");
        EXPECT_EQ(List(), (std::set<std::string>{"alpha.tif", "b.tif", "mask.tif"}));
        const GDALDatasetUniquePtr po = Open("b.tif");
        EXPECT_EQ((po->GetRasterBand(1)->GetMaskFlags() & GMF_ALPHA) != 0, sSource == "alpha");
        const Pixels vdfMask = ReadMask("b.tif");
        const Pixels vdfPixels = Read("b.tif");
        for (int n = 0; n < kRows * kCols / 2; ++n) {
            const int nRow = n / (kCols / 2);
            const int nCol = n % (kCols / 2) * 2;
            const auto i = static_cast<std::size_t>(n);
            const double dfValid = sSource == "alpha" ? 200 : 255;
            ASSERT_EQ(vdfMask[i], IsHole(1, nCol + 1, nRow) ? 0 : dfValid) << sSource << n;
            const double df = vdfPixels[i];
            ASSERT_TRUE(vdfMask[i] == 0 ? df == 0 : df >= 50 && df <= 51) << sSource << n << df;
            // Zeros are values like others.
            ASSERT_EQ(vdfPixels[i + 2 * vdfMask.size()], 0) << sSource << n;
        }
    }
    // A nodata value goes into the colours alone.
    Succeed("resample alpha.tif b.tif --scale 1 --method NEAR --dst-nodata 7 -q");
    EXPECT_EQ(Read("b.tif")[3 * kCols * kRows + 3 * kCols + 15], 0);
    EXPECT_EQ(Read("b.tif")[3 * kCols + 15], 7);
    // What was masked stays so in a format whose driver only copies.
    Succeed("resample alpha.tif b.png --scale 1 --method NEAR -q");
    EXPECT_EQ(Read("b.png")[3 * kCols * kRows + 3 * kCols + 15], 0);
    EXPECT_EQ(Read("b.png")[3 * kCols + 15], 0);
}

TEST_F(ToolTest, FillChoosesWhatEdgesBecome) {
    Fill(*Create("a.tif", 6, 6, 1, GDT_Byte), [](int, int, int) { return 90; });
    Succeed("resample a.tif nn.tif --scale 2 -q");
    EXPECT_EQ(Read("nn.tif")[0], 90);
    Succeed("resample a.tif bgd.tif --scale 2 --fill bgd -q");
    EXPECT_EQ(Read("bgd.tif")[0], 0);
    EXPECT_EQ(Read("bgd.tif")[13], 90);
    Succeed("resample a.tif bgd.tif --scale 2 --fill BGD --dst-nodata 7 -q");
    EXPECT_EQ(Read("bgd.tif")[0], 7);
}

}  // namespace
