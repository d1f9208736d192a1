#include <cpl_conv.h>
#include <cpl_string.h>

#include <cstring>

#include "tests/apps/vetra/tooltest.h"

namespace {

// 16 + 2 * column + 4 * row + band, which any method that is exact for planes keeps.
double Plane(int nBand, int nCol, int nRow) { return 16 + 2 * nCol + 4 * nRow + nBand; }

TEST_F(ToolTest, HalvingGivesTheMeanOfFourPixels) {
    Fill(*Create("a.tif", 60, 41, 3, GDT_UInt16), Plane);
    Succeed("resample a.tif half.tif --size 30 41 -q");
    const Pixels vdfHalf = Read("half.tif");
    ASSERT_EQ(vdfHalf.size(), 30u * 41 * 3);
    Succeed("resample a.tif both.tif --scale .5 0.25 --method bilin -q");
    const Pixels vdfBoth = Read("both.tif");
    ASSERT_EQ(vdfBoth.size(), 30u * 10 * 3);
    std::size_t n = 0;
    for (int nBand = 1; nBand <= 3; ++nBand) {
        for (int nRow = 0; nRow < 41; ++nRow) {
            for (int nCol = 0; nCol < 30; ++nCol, ++n) {
                // The columns' centres fall midway between two of the source. The last row has none
                // below it, so that the nearest pixel stands for the mean.
                ASSERT_EQ(vdfHalf[n], Plane(nBand, 2 * nCol, nRow) + (nRow == 40 ? 2 : 1)) << n;
            }
        }
    }
    // Rows fall on 4.1 * row + 1.55; bands follow each other.
    EXPECT_EQ(vdfBoth[0], 18 + 6);
    EXPECT_EQ(vdfBoth[300 + 30 * 9 + 29], 19 + 116 + 154);
}

TEST_F(ToolTest, EveryTypeKeepsItsSamples) {
    for (int n = 0; n < GDT_TypeCount; ++n) {
        const bool bSignedByte = n == 0;
        const auto eType = bSignedByte ? GDT_Byte : static_cast<GDALDataType>(n);
        if (GDALGetDataTypeSizeBytes(eType) == 0) {
            continue;
        }
        GDALDatasetUniquePtr poSource =
            Create("a.tif", 23, 9, 2, eType, bSignedByte ? "PIXELTYPE=SIGNEDBYTE" : nullptr);
        std::vector<unsigned char> vbyBytes(
            static_cast<std::size_t>(23 * 9 * 2 * GDALGetDataTypeSizeBytes(eType)));
        for (std::size_t i = 0; i < vbyBytes.size(); ++i) {
            // Never the exponent of a NaN, nor an integer that a double can't hold.
            const bool bHigh = (eType == GDT_Int64 || eType == GDT_UInt64) && i % 8 > 5;
            vbyBytes[i] = static_cast<unsigned char>(bHigh ? 0 : i * 151 % 251 & 0xbf);
        }
        ASSERT_EQ(poSource->RasterIO(GF_Write, 0, 0, 23, 9, vbyBytes.data(), 23, 9, eType, 2,
                                     nullptr, 0, 0, 0, nullptr),
                  CE_None);
        poSource.reset();
        Succeed("resample a.tif b.tif --scale 1 --method near -q");
        EXPECT_TRUE(ReadBytes("b.tif") == ReadBytes("a.tif")) << GDALGetDataTypeName(eType);
        const GDALDatasetUniquePtr poTarget = Open("b.tif");
        GDALRasterBand* poBand = poTarget->GetRasterBand(1);
        EXPECT_EQ(poBand->GetRasterDataType(), eType);
        const char* pszMark = poBand->GetMetadataItem("PIXELTYPE", "IMAGE_STRUCTURE");
        EXPECT_STREQ(pszMark, bSignedByte ? "SIGNEDBYTE" : nullptr);
    }
}

TEST_F(ToolTest, TypesConvertToAndFromFloat) {
    Fill(*Create("a.tif", 20, 20, 1, GDT_Byte), Plane);
    Succeed("resample a.tif f.tif --scale 0.7 --type 32r -q");
    EXPECT_EQ(Open("f.tif")->GetRasterBand(1)->GetRasterDataType(), GDT_Float32);
    EXPECT_NE(Read("f.tif")[1], std::floor(Read("f.tif")[1]));
    Succeed("resample f.tif s.tif --scale 1 --type 16S -q");
    EXPECT_EQ(Open("s.tif")->GetRasterBand(1)->GetRasterDataType(), GDT_Int16);
    EXPECT_EQ(Read("s.tif")[1], std::nearbyint(Read("f.tif")[1]));
}

TEST_F(ToolTest, PixelsDependOnNeitherMemoryNorThreads) {
    constexpr int kCols = 411;
    constexpr int kRows = 257;
    const auto Noise = [](int nBand, int nCol, int nRow) {
        const unsigned n = static_cast<unsigned>((nBand * 977 + nRow) * 1031 + nCol) * 2654435761u;
        return static_cast<double>(n >> 20 & 0xff);
    };
    {
        const CPLConfigOptionSetter oInternal("GDAL_TIFF_INTERNAL_MASK", "YES", false);
        const GDALDatasetUniquePtr poMasked = Create("mask.tif", kCols, kRows, 3, GDT_UInt16);
        poMasked->CreateMaskBand(GMF_PER_DATASET);
        Fill(*poMasked, Noise);
        std::vector<unsigned char> vbyMask(kCols * kRows);
        for (std::size_t n = 0; n < vbyMask.size(); ++n) {
            vbyMask[n] = n % 97 < 60 || n % 13 == 0 ? 255 : 0;
        }
        EXPECT_EQ(poMasked->GetRasterBand(1)->GetMaskBand()->RasterIO(GF_Write, 0, 0, kCols, kRows,
                                                                      vbyMask.data(), kCols, kRows,
                                                                      GDT_Byte, 0, 0, nullptr),
                  CE_None);
        const GDALDatasetUniquePtr poNodata = Create("nodata.tif", kCols, kRows, 3, GDT_Float32);
        Fill(*poNodata, Noise);
        poNodata->GetRasterBand(1)->SetNoDataValue(17);
        Fill(*Create("alpha.tif", kCols, kRows, 4, GDT_Byte), [&](int nBand, int nCol, int nRow) {
            return nBand == 4 ? std::max(0.0, Noise(4, nCol, nRow) - 100)
                              : Noise(nBand, nCol, nRow);
        });
        Fill(*Create("complex.tif", kCols, kRows, 2, GDT_CFloat32), Noise);
    }
    for (const std::string sSource : {"mask", "nodata", "alpha", "complex"}) {
        for (const std::string sSize :
             {"--scale 0.37 --co COMPRESS=LZW", "--scale 1.9 0.6", "--size 500 3 --method NEAR"}) {
            const std::string sRun = "resample " + sSource + ".tif b.tif -q " + sSize;
            Succeed(sRun + " --threads 1");
            const std::string sWhole = ReadBytes("b.tif");
            // So little memory leaves a few rows, or parts of a row, to a block.
            for (const std::string sLimit :
                 {" --memory 1", " --memory 2 --threads 3", " --memory 600 --threads 3"}) {
                Succeed(sRun + sLimit);
                EXPECT_TRUE(ReadBytes("b.tif") == sWhole) << sRun << sLimit;
            }
        }
    }
}

}  // namespace
