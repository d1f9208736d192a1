#include <cpl_string.h>
#include <gdalwarper.h>
#include <ogr_spatialref.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <memory>

#include "methods.h"
#include "tests/apps/vetra/tooltest.h"
#include "tests/base/utils/resample/engine/reference.h"
#include "vetra/base/utils/resample/postfm/bufposdoublearraytfm.h"
#include "vetra/base/utils/resample/resample.h"

namespace {

using GeoTransform = std::array<double, 6>;

// Smooth, and different in all directions.
double Waves(int nBand, int nCol, int nRow) {
    return 100 * nBand + 40 * std::sin(0.21 * nCol + 0.05 * nRow) + 30 * std::cos(0.17 * nRow) +
           0.03 * nCol;
}

double Noise(int nBand, int nCol, int nRow) {
    const unsigned n = static_cast<unsigned>((nBand * 977 + nRow) * 1031 + nCol) * 2654435761u;
    return static_cast<double>(n >> 20 & 0xff);
}

OGRSpatialReference Crs(int nCode) {
    OGRSpatialReference oCrs;
    oCrs.importFromEPSG(nCode);
    oCrs.SetAxisMappingStrategy(OAMS_TRADITIONAL_GIS_ORDER);
    return oCrs;
}

class WarpTest : public ToolTest {
 protected:
    GDALDatasetUniquePtr Georeferenced(const std::string& sName, int nCols, int nRows, int nBands,
                                       GDALDataType eType, GeoTransform vdfTfm, int nCode) {
        GDALDatasetUniquePtr poImage = Create(sName, nCols, nRows, nBands, eType);
        poImage->SetGeoTransform(vdfTfm.data());
        const OGRSpatialReference oCrs = Crs(nCode);
        poImage->SetSpatialRef(&oCrs);
        return poImage;
    }
    GeoTransform Georeference(const std::string& sName) const {
        GeoTransform vdfTfm{};
        EXPECT_EQ(Open(sName)->GetGeoTransform(vdfTfm.data()), CE_None);
        return vdfTfm;
    }
    // Source positions, pixel centres at whole numbers, of the pixels of a target between two
    // systems, one after the other.
    std::vector<std::pair<double, double>> ExactPositions(const std::string& sTarget,
                                                          const std::string& sSource, int nFrom,
                                                          int nTo) const {
        const OGRSpatialReference oFrom = Crs(nFrom);
        const OGRSpatialReference oTo = Crs(nTo);
        const std::unique_ptr<OGRCoordinateTransformation> po(
            OGRCreateCoordinateTransformation(&oTo, &oFrom));
        const GDALDatasetUniquePtr poTarget = Open(sTarget);
        const GeoTransform t = Georeference(sTarget);
        GeoTransform vdfSource = Georeference(sSource);
        GeoTransform s{};
        EXPECT_TRUE(GDALInvGeoTransform(vdfSource.data(), s.data()));
        std::vector<std::pair<double, double>> oPositions;
        for (int nRow = 0; nRow < poTarget->GetRasterYSize(); ++nRow) {
            for (int nCol = 0; nCol < poTarget->GetRasterXSize(); ++nCol) {
                double x = t[0] + (nCol + 0.5) * t[1] + (nRow + 0.5) * t[2];
                double y = t[3] + (nCol + 0.5) * t[4] + (nRow + 0.5) * t[5];
                EXPECT_TRUE(po->Transform(1, &x, &y));
                oPositions.emplace_back(s[0] + x * s[1] + y * s[2] - 0.5,
                                        s[3] + x * s[4] + y * s[5] - 0.5);
            }
        }
        return oPositions;
    }
};

TEST_F(WarpTest, ValuesAreThoseOfExactPositions) {
    constexpr int kCols = 300;
    constexpr int kRows = 260;
    // Turned and far from its central meridian, so that nothing is symmetric.
    Fill(*Georeferenced("a.tif", kCols, kRows, 1, GDT_Float64,
                        {700000, 900, 310, 5400000, 280, -950}, 32632),
         Waves);
    Pixels vdfSource = Read("a.tif");
    struct Case {
        const char* pszMethod;
        const char* pszOptions;
        double dfShift;  // to the nearest pixel of a mean's window
        double dfTolerance;
        int nMostOthers;  // pixels at edges, where the bound decides between inside and outside
    };
    // The values change by less than 15 a pixel.
    const Case kCases[] = {
        {"BILIN", " --error 0", 0, 1e-6, 0},
        {"CUBIC", " --error 0", 0, 1e-6, 0},
        {"SINC8,SHAPINGWINDOW=LANCZOS", " --error 0", 0, 1e-6, 0},
        {"AVERAGE,NUMCOLS=2,NUMROWS=2", " --error 0", -0.5, 1e-6, 0},
        {"BILIN", "", 0, 0.15, 40},
        {"CUBIC", " --error 0.001", 0, 0.015, 4},
    };
    for (const Case& oCase : kCases) {
        const std::string sArgs = std::string(oCase.pszMethod) + oCase.pszOptions;
        Succeed("warp a.tif b.tif --crs EPSG:3035 --fill bgd --nodata -1 -q --method " + sArgs);
        const int nTgtCols = Open("b.tif")->GetRasterXSize();
        const int nTgtRows = Open("b.tif")->GetRasterYSize();
        Pixels vdfCol;
        Pixels vdfRow;
        for (const auto& [dfCol, dfRow] : ExactPositions("b.tif", "a.tif", 32632, 3035)) {
            vdfCol.push_back(dfCol + oCase.dfShift);
            vdfRow.push_back(dfRow + oCase.dfShift);
        }
        Pixels vdfExpected(vdfCol.size());
        const auto View = [](Pixels& vdf, int nCols, int nRows) {
            return vetra::utils::ResampleBuffer(vetra::gobs::eDT_64R, nCols, nRows, 1,
                                                reinterpret_cast<unsigned char*>(vdf.data()),
                                                nullptr, false);
        };
        vetra::utils::ResampleBuffer oExpected = View(vdfExpected, nTgtCols, nTgtRows);
        const auto poResampler = vetra::tool::MakeResampler(oCase.pszMethod);
        poResampler->SetNodataFillAction(vetra::utils::eNFA_BGD);
        poResampler->SetOutBgd(-1);
        std::vector<unsigned char> vbyOutcome;
        ReferenceResample(
            View(vdfSource, kCols, kRows), oExpected,
            vetra::utils::BufPosDoubleArrayTfm(nTgtCols, nTgtRows, vdfCol.data(), vdfRow.data()),
            poResampler->GetResampleInfo(), vbyOutcome);
        const Pixels vdfTarget = Read("b.tif");
        ASSERT_EQ(vdfTarget.size(), vdfExpected.size());
        int nOthers = 0;
        double dfWorst = 0.0;
        for (std::size_t n = 0; n < vdfTarget.size(); ++n) {
            if ((vdfTarget[n] == -1) != (vdfExpected[n] == -1)) {
                ++nOthers;
            } else {
                dfWorst = std::max(dfWorst, std::fabs(vdfTarget[n] - vdfExpected[n]));
            }
        }
        EXPECT_LE(nOthers, oCase.nMostOthers) << sArgs;
        EXPECT_LE(dfWorst, oCase.dfTolerance) << sArgs;
        EXPECT_GT(std::count(vbyOutcome.begin(), vbyOutcome.end(), vetra::utils::ePO_INTERPOLATED),
                  kCols * kRows / 2);
    }
}

TEST_F(WarpTest, GridsFollowTheOptions) {
    Fill(*Georeferenced("a.tif", 90, 50, 1, GDT_Byte, {500000, 100, 0, 5000000, 0, -100}, 32633),
         Noise);
    Fill(*Georeferenced("ref.tif", 33, 22, 1, GDT_Byte, {14.9, 0.01, 0.001, 45.2, 0, -0.01}, 4326),
         Noise);
    struct Case {
        const char* pszOptions;
        GeoTransform vdfTfm;
        int nCols;
        int nRows;
        int nCode;
    };
    const Case kCases[] = {
        {"", {500000, 100, 0, 5000000, 0, -100}, 90, 50, 32633},
        {"--crs EPSG:32633 --res 250", {500000, 250, 0, 5000000, 0, -250}, 36, 20, 32633},
        {"--res 300 170", {500000, 300, 0, 5000000, 0, -170}, 30, 29, 32633},
        {"--size 45 10", {500000, 200, 0, 5000000, 0, -500}, 45, 10, 32633},
        {"--extent 500050 4996000 508050 5001000",
         {500050, 100, 0, 5001000, 0, -100},
         80,
         50,
         32633},
        {"--extent 14.9 45.1 15.1 45.3 --res 0.01 --crs EPSG:4326",
         {14.9, 0.01, 0, 45.3, 0, -0.01},
         20,
         20,
         4326},
        {"--extent -15 -45.1 -14.5 -45 --size 5 4 --crs EPSG:4326",
         {-15, 0.1, 0, -45, 0, -0.025},
         5,
         4,
         4326},
        {"--like ref.tif", {14.9, 0.01, 0.001, 45.2, 0, -0.01}, 33, 22, 4326},
    };
    for (const Case& oCase : kCases) {
        Succeed(std::string("warp a.tif b.tif -q ") + oCase.pszOptions);
        const GDALDatasetUniquePtr po = Open("b.tif");
        EXPECT_EQ(po->GetRasterXSize(), oCase.nCols) << oCase.pszOptions;
        EXPECT_EQ(po->GetRasterYSize(), oCase.nRows) << oCase.pszOptions;
        const GeoTransform vdfTfm = Georeference("b.tif");
        for (std::size_t n = 0; n < 6; ++n) {
            EXPECT_NEAR(vdfTfm[n], oCase.vdfTfm[n], 1e-12 * std::fabs(oCase.vdfTfm[n]))
                << oCase.pszOptions << n;
        }
        const OGRSpatialReference oCrs = Crs(oCase.nCode);
        ASSERT_NE(po->GetSpatialRef(), nullptr);
        EXPECT_TRUE(po->GetSpatialRef()->IsSame(&oCrs)) << oCase.pszOptions;
    }
    // The grid of the source itself: nothing moves.
    Succeed("warp a.tif b.tif -q --method SINC8");
    EXPECT_EQ(Read("b.tif")[777], Read("a.tif")[777]);
}

TEST_F(WarpTest, WhatLiesBesideTheSourceIsMarked) {
    const std::string sTo = " --extent 499000 4999000 501000 5001000 --res 100 -q";
    const GeoTransform vdfTfm = {500000, 100, 0, 5000000, 0, -100};
    const auto Make = [&](GDALDataType eType) {
        Fill(*Georeferenced("a.tif", 90, 50, 2, eType, vdfTfm, 32633),
             [](int, int nCol, int) { return nCol % 2; });
    };
    // The source's first pixel is column 10 of row 10.
    constexpr std::size_t kFirst = 10 * 20 + 10;
    Make(GDT_Byte);
    Succeed("warp a.tif b.tif" + sTo);
    EXPECT_EQ(Open("b.tif")->GetRasterBand(1)->GetNoDataValue(), 0);
    EXPECT_EQ(Read("b.tif")[0], 0);
    EXPECT_EQ(Read("b.tif")[kFirst], 1) << "a value must not become that of nodata";
    Succeed("warp a.tif b.tif --method NEAR" + sTo);
    EXPECT_EQ(Read("b.tif")[kFirst], 0);
    EXPECT_EQ(ReadMask("b.tif")[0], 0);
    EXPECT_EQ(ReadMask("b.tif")[kFirst], 255);
    Make(GDT_Float32);
    Succeed("warp a.tif b.tif" + sTo);
    EXPECT_TRUE(std::isnan(Open("b.tif")->GetRasterBand(2)->GetNoDataValue()));
    EXPECT_TRUE(std::isnan(Read("b.tif")[0]));
    EXPECT_NEAR(Read("b.tif")[kFirst], 0, 1e-9);
    Succeed("warp a.tif b.tif --dst-nodata 7" + sTo);
    EXPECT_EQ(Read("b.tif")[0], 7);
    // Half of the square map of a globe's side lies in space.
    Fill(*Georeferenced("world.tif", 360, 180, 1, GDT_Byte, {-180, 1, 0, 90, 0, -1}, 4326),
         [](int, int, int) { return 9; });
    Succeed(
        "warp world.tif b.tif --crs '+proj=ortho +lat_0=40 +lon_0=10' --size 400 400 "
        "--extent -7e6 -7e6 7e6 7e6 -q");
    int nEarth = 0;
    const Pixels vdf = Read("b.tif");
    for (int n = 0; n < 400 * 400; ++n) {
        const double dfRadius = std::hypot(n % 400 - 199.5, n / 400 - 199.5) * 35000;
        const double df = vdf[static_cast<std::size_t>(n)];
        nEarth += df == 9 ? 1 : 0;
        if (dfRadius < 6.2e6 || dfRadius > 6.4e6) {
            ASSERT_EQ(df, dfRadius < 6.3e6 ? 9 : 0) << n % 400 << ' ' << n / 400;
        }
    }
    EXPECT_GT(nEarth, 0);
}

TEST_F(WarpTest, ControlPointsAndShiftedWindows) {
    {
        const GDALDatasetUniquePtr po = Create("a.tif", 80, 60, 1, GDT_Float32);
        Fill(*po, [](int, int nCol, int nRow) { return nCol + 100 * nRow; });
        GDAL_GCP aoPoints[4];
        GDALInitGCPs(4, aoPoints);
        for (int n = 0; n < 4; ++n) {
            aoPoints[n].dfGCPPixel = n % 2 * 80;
            aoPoints[n].dfGCPLine = n / 2 * 60;
            aoPoints[n].dfGCPX = 10 + aoPoints[n].dfGCPPixel / 100;
            aoPoints[n].dfGCPY = 50 - aoPoints[n].dfGCPLine / 100;
        }
        const OGRSpatialReference oCrs = Crs(4326);
        po->SetGCPs(4, aoPoints, &oCrs);
        GDALDeinitGCPs(4, aoPoints);
    }
    for (const std::string sOption : {"", " --to METHOD=GCP_TPS"}) {
        Succeed("warp a.tif b.tif --extent 10.1 49.5 10.7 49.9 --res 0.01 -q" + sOption);
        EXPECT_EQ(Open("b.tif")->GetGCPCount(), 0);
        EXPECT_NEAR(Read("b.tif")[0], 10 + 1000, 1e-2) << sOption;
        EXPECT_NEAR(Read("b.tif")[39 * 60 + 59], 69 + 4900, 1e-2) << sOption;
    }
    // Means lie around their pixel, wherever the window starts.
    Succeed(
        "warp a.tif b.tif --extent 10.1 49.5 10.7 49.9 --res 0.02 -q "
        "--method AVERAGE,NUMCOLS=2,NUMROWS=2");
    EXPECT_NEAR(Read("b.tif")[0], 10.5 + 1050, 1e-2);
}

TEST_F(WarpTest, PixelsDependOnNeitherMemoryNorThreads) {
    Fill(
        *Georeferenced("utm.tif", 611, 437, 3, GDT_Byte, {600000, 900, 0, 5400000, 0, -900}, 32632),
        Noise);
    Fill(*Georeferenced("world.tif", 720, 360, 1, GDT_Int16, {-180, 0.5, 0, 90, 0, -0.5}, 4326),
         Noise);
    // The source's edges meet in the target of the second one, which many blocks cross; the third
    // takes exact positions.
    for (const std::string sArgs :
         {"utm.tif b.tif --crs EPSG:4326 --method CUBIC",
          "world.tif b.tif --crs EPSG:3832 --res 60000 --extent -2e7 -2e7 2e7 2e7 --method "
          "AVERAGE,NUMCOLS=2,NUMROWS=3",
          "world.tif b.tif --crs EPSG:3995 --size 300 200 --error 0 --method NEAR"}) {
        Succeed("warp -q --threads 1 " + sArgs);
        const std::string sWhole = ReadBytes("b.tif");
        for (const std::string sLimit :
             {" --memory 1", " --memory 2 --threads 3", " --memory 900 --threads 2"}) {
            Succeed("warp -q " + sArgs + sLimit);
            EXPECT_TRUE(ReadBytes("b.tif") == sWhole) << sArgs << sLimit;
        }
    }
}

TEST_F(WarpTest, OverviewsAreMadeByTheMethod) {
    const GeoTransform vdfTfm = {500000, 10, 0, 5000000, 0, -10};
    Fill(*Georeferenced("a.tif", 1001, 700, 3, GDT_UInt16, vdfTfm, 32633), Noise);
    Succeed(
        "resample a.tif b.tif --scale 1 --method NEAR --overviews MEDIAN,NUMCOLS=3,NUMROWS=3 -q");
    EXPECT_TRUE(Read("b.tif") == Read("a.tif"));
    Succeed("resample a.tif half.tif --size 501 350 --method MEDIAN,NUMCOLS=3,NUMROWS=3 -q");
    const Pixels vdfHalf = Read("half.tif");
    const GDALDatasetUniquePtr po = Open("b.tif");
    ASSERT_EQ(po->GetRasterBand(1)->GetOverviewCount(), 2);
    for (int nBand = 1; nBand <= 3; ++nBand) {
        Pixels vdfLevel(501 * 350);
        ASSERT_EQ(
            po->GetRasterBand(nBand)->GetOverview(0)->RasterIO(
                GF_Read, 0, 0, 501, 350, vdfLevel.data(), 501, 350, GDT_Float64, 0, 0, nullptr),
            CE_None);
        EXPECT_TRUE(
            std::equal(vdfLevel.begin(), vdfLevel.end(), vdfHalf.begin() + (nBand - 1) * 501 * 350))
            << nBand;
    }
    EXPECT_EQ(po->GetRasterBand(1)->GetOverview(1)->GetXSize(), 251);
}

TEST_F(WarpTest, CloudOptimizedFilesHoldTheSamePixels) {
    const GeoTransform vdfTfm = {650000, 10, 0, 5000000, 0, -10};
    Fill(*Georeferenced("a.tif", 1500, 1100, 1, GDT_Byte, vdfTfm, 32633), Noise);
    for (const std::string sMethod : {"BILIN", "NEAR"}) {
        const std::string sRun = " --crs EPSG:4326 -q --method " + sMethod;
        Succeed("warp a.tif b.tif" + sRun);
        Succeed("warp a.tif cog.tif --cog" + sRun);
        EXPECT_TRUE(ReadBytes("cog.tif") == ReadBytes("b.tif")) << sMethod;
        EXPECT_EQ(Georeference("cog.tif"), Georeference("b.tif"));
        const GDALDatasetUniquePtr po = Open("cog.tif");
        EXPECT_STREQ(po->GetMetadataItem("LAYOUT", "IMAGE_STRUCTURE"), "COG");
        EXPECT_GE(po->GetRasterBand(1)->GetOverviewCount(), 2);
        // The overviews have the mask too.
        GDALRasterBand* poLevel = po->GetRasterBand(1)->GetOverview(1);
        ASSERT_NE(poLevel, nullptr);
        unsigned char byCorner = 1;
        ASSERT_EQ(poLevel->GetMaskBand()->RasterIO(GF_Read, 0, 0, 1, 1, &byCorner, 1, 1, GDT_Byte,
                                                   0, 0, nullptr),
                  CE_None);
        EXPECT_EQ(byCorner, 0) << sMethod;
    }
}

}  // namespace
