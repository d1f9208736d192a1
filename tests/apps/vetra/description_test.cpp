#include <cpl_conv.h>
#include <cpl_string.h>

#include <array>
#include <fstream>

#include "tests/apps/vetra/tooltest.h"

namespace {

std::string Item(GDALMajorObject& oObject, const char* pszName, const char* pszDomain = "") {
    const char* pszValue = oObject.GetMetadataItem(pszName, pszDomain);
    return pszValue != nullptr ? pszValue : "(none)";
}

TEST_F(ToolTest, DescriptionIsKept) {
    OGRSpatialReference oSystem;
    oSystem.importFromEPSG(32633);
    {
        const GDALDatasetUniquePtr po = Create("a.tif", 90, 45, 2, GDT_Int16);
        po->SetMetadataItem("AREA_OR_POINT", "Point");
        po->SetMetadataItem("PLACE", "somewhere");
        po->SetMetadataItem("STATISTICS_MEAN", "3");
        po->SetMetadataItem("TIFFTAG_XRESOLUTION", "300");
        po->SetMetadataItem("SENSOR", "eye", "MINE");
        const CPLStringList oRpc(CSLTokenizeString(
            "LINE_OFF=10 SAMP_OFF=20 LINE_SCALE=30 SAMP_SCALE=40 LAT_OFF=1 LONG_OFF=2 HEIGHT_OFF=3 "
            "LAT_SCALE=1 LONG_SCALE=1 HEIGHT_SCALE=1"));
        CPLStringList oFull(oRpc);
        for (const char* pszName :
             {"LINE_NUM_COEFF", "LINE_DEN_COEFF", "SAMP_NUM_COEFF", "SAMP_DEN_COEFF"}) {
            oFull.SetNameValue(pszName, "1 2 3 4 5 6 7 8 9 10 11 12 13 14 15 16 17 18 19 20");
        }
        po->SetMetadata(oFull.List(), "RPC");
        po->SetSpatialRef(&oSystem);
        std::array<double, 6> vdfTfm = {500000, 10, 0, 5200000, 0, -20};
        po->SetGeoTransform(vdfTfm.data());
        GDALRasterBand* poBand = po->GetRasterBand(2);
        poBand->SetDescription("second");
        poBand->SetColorInterpretation(GCI_AlphaBand);
        po->GetRasterBand(1)->SetUnitType("metre");
        poBand->SetOffset(5);
        poBand->SetScale(0.25);
        poBand->SetMetadataItem("WAVELENGTH", "0.6");
        poBand->SetMetadataItem("STATISTICS_MINIMUM", "0");
        const CPLStringList oNames(CSLTokenizeString("water land"));
        po->GetRasterBand(1)->SetCategoryNames(CPLStringList(oNames).List());
        Fill(*po, [](int, int, int) { return 1; });
    }
    Succeed("resample a.tif b.tif --scale 0.5 0.2 -q");
    const GDALDatasetUniquePtr po = Open("b.tif");
    EXPECT_EQ(Item(*po, "AREA_OR_POINT"), "Point");
    EXPECT_EQ(Item(*po, "PLACE"), "somewhere");
    EXPECT_EQ(Item(*po, "STATISTICS_MEAN"), "(none)");
    EXPECT_EQ(Item(*po, "TIFFTAG_XRESOLUTION"), "(none)");
    EXPECT_EQ(Item(*po, "SENSOR", "MINE"), "eye");
    // The centre of line 10 is 10.5 lines below the upper edge, which are 2.1 of the target.
    EXPECT_EQ(CPLAtof(Item(*po, "LINE_OFF", "RPC").c_str()), 1.6);
    EXPECT_EQ(CPLAtof(Item(*po, "SAMP_OFF", "RPC").c_str()), 9.75);
    EXPECT_EQ(CPLAtof(Item(*po, "LINE_SCALE", "RPC").c_str()), 6);
    EXPECT_EQ(CPLAtof(Item(*po, "LAT_OFF", "RPC").c_str()), 1);
    ASSERT_NE(po->GetSpatialRef(), nullptr);
    EXPECT_TRUE(po->GetSpatialRef()->IsSame(&oSystem));
    std::array<double, 6> vdfTfm{};
    EXPECT_EQ(po->GetGeoTransform(vdfTfm.data()), CE_None);
    EXPECT_EQ(vdfTfm, (std::array<double, 6>{500000, 20, 0, 5200000, 0, -100}));
    GDALRasterBand* poFirst = po->GetRasterBand(1);
    GDALRasterBand* poSecond = po->GetRasterBand(2);
    EXPECT_STREQ(poSecond->GetDescription(), "second");
    EXPECT_EQ(poSecond->GetColorInterpretation(), GCI_AlphaBand);
    EXPECT_STREQ(poFirst->GetUnitType(), "metre");
    EXPECT_EQ(poSecond->GetOffset(), 5);
    EXPECT_EQ(poSecond->GetScale(), 0.25);
    EXPECT_EQ(Item(*poSecond, "WAVELENGTH"), "0.6");
    EXPECT_EQ(Item(*poSecond, "STATISTICS_MINIMUM"), "(none)");
    EXPECT_EQ(CPLStringList(poFirst->GetCategoryNames(), FALSE).FindString("land"), 1);
}

TEST_F(ToolTest, ResolutionIsKeptAndNoPixelLeavesTheSource) {
    for (const double dfRes : {0.3, 0.7, 1.0, 3.0, 6.9, 24.0, 43.0, 85.0}) {
        {
            const GDALDatasetUniquePtr po = Create("a.tif", 43, 43, 1, GDT_Byte);
            std::array<double, 6> vdfTfm = {7, 1, 0, 9, 0, -1};
            po->SetGeoTransform(vdfTfm.data());
            Fill(*po, [](int, int, int) { return 200; });
        }
        Succeed("resample a.tif b.tif -q --res " + std::string(CPLSPrintf("%.17g", dfRes)));
        const GDALDatasetUniquePtr po = Open("b.tif");
        std::array<double, 6> vdfTfm{};
        po->GetGeoTransform(vdfTfm.data());
        EXPECT_EQ(vdfTfm, (std::array<double, 6>{7, dfRes, 0, 9, 0, -dfRes}));
        EXPECT_LE(std::fabs(po->GetRasterXSize() * dfRes - 43), dfRes / 2 + 1e-9);
        // The background would be 0.
        const Pixels vdfPixels = Read("b.tif");
        EXPECT_EQ(vdfPixels, Pixels(vdfPixels.size(), 200)) << dfRes;
    }
}

TEST_F(ToolTest, ControlPointsMoveWithThePixels) {
    {
        const GDALDatasetUniquePtr po = Create("a.tif", 50, 80, 1, GDT_Byte);
        std::vector<GDAL_GCP> oPoints(4);
        GDALInitGCPs(4, oPoints.data());
        for (int n = 0; n < 4; ++n) {
            oPoints[static_cast<std::size_t>(n)].dfGCPPixel = 10 * n + 1;
            oPoints[static_cast<std::size_t>(n)].dfGCPLine = 20 * (n % 2);
            oPoints[static_cast<std::size_t>(n)].dfGCPX = n;
        }
        const OGRSpatialReference* poSystem = nullptr;
        po->SetGCPs(4, oPoints.data(), poSystem);
        GDALDeinitGCPs(4, oPoints.data());
    }
    Succeed("resample a.tif b.tif --scale 2 0.5 -q");
    const GDALDatasetUniquePtr po = Open("b.tif");
    ASSERT_EQ(po->GetGCPCount(), 4);
    EXPECT_EQ(po->GetGCPs()[3].dfGCPPixel, 62);
    EXPECT_EQ(po->GetGCPs()[3].dfGCPLine, 10);
    EXPECT_EQ(po->GetGCPs()[3].dfGCPX, 3);
}

TEST_F(ToolTest, ColoursAreKept) {
    GDALColorTable oColours;
    const GDALColorEntry oRed = {200, 10, 20, 255};
    oColours.SetColorEntry(3, &oRed);
    {
        const GDALDatasetUniquePtr po = Create("p.tif", 9, 9, 1, GDT_Byte);
        po->GetRasterBand(1)->SetColorTable(&oColours);
        Fill(*po, [](int, int, int) { return 3; });
        Fill(*Create("rgb.tif", 9, 9, 3, GDT_Byte, "PHOTOMETRIC=RGB"),
             [](int, int, int) { return 1; });
        Fill(*Create("grey.tif", 9, 9, 4, GDT_Byte, "PHOTOMETRIC=MINISBLACK"),
             [](int, int, int) { return 1; });
    }
    Succeed("resample p.tif q.tif --scale 3 --method NEAR -q");
    GDALDatasetUniquePtr po = Open("q.tif");
    ASSERT_NE(po->GetRasterBand(1)->GetColorTable(), nullptr);
    EXPECT_EQ(po->GetRasterBand(1)->GetColorTable()->GetColorEntry(3)->c1, 200);
    for (const std::string sName : {"rgb.tif", "grey.tif"}) {
        Succeed("resample " + sName + " b.tif --scale 3 -q");
        po = Open("b.tif");
        for (int nBand = 1; nBand <= po->GetRasterCount(); ++nBand) {
            EXPECT_EQ(po->GetRasterBand(nBand)->GetColorInterpretation(),
                      Open(sName)->GetRasterBand(nBand)->GetColorInterpretation())
                << sName << nBand;
        }
    }
}

TEST_F(ToolTest, SideFilesBelongToTheirImage) {
    Fill(*Create("a.tif", 40, 40, 1, GDT_Byte), [](int, int nCol, int) { return nCol; });
    // An image that was there before, with a side file that would spoil the new one.
    Fill(*Create("b.tif", 5, 5, 1, GDT_Byte), [](int, int, int) { return 9; });
    std::ofstream(Path("b.tif.aux.xml"))
        << "<PAMDataset><PAMRasterBand band=\"1\"><NoDataValue>7</NoDataValue></PAMRasterBand>"
           "</PAMDataset>";
    Succeed("resample a.tif b.tif --scale 2 -q");
    EXPECT_EQ(List(), (std::set<std::string>{"a.tif", "b.tif"}));
    EXPECT_EQ(Open("b.tif")->GetRasterXSize(), 80);
    // A format of two files, and one whose driver only copies.
    Succeed("resample a.tif c.img --of ENVI --scale 0.5 -q");
    Succeed("resample a.tif d.png --scale 0.5 -q");
    EXPECT_EQ(List(), (std::set<std::string>{"a.tif", "b.tif", "c.hdr", "c.img", "d.png"}));
    EXPECT_EQ(Read("c.img"), Read("d.png"));
    EXPECT_STREQ(Open("d.png")->GetDriver()->GetDescription(), "PNG");
}

}  // namespace
