#include <fcntl.h>
#include <ogr_spatialref.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>
#include <random>
#include <thread>

#include "tests/apps/vetra/tooltest.h"

namespace {

namespace fs = std::filesystem;

TEST_F(ToolTest, FailuresGiveOneLineAndLeaveNothing) {
    Fill(*Create("a.tif", 200, 200, 3, GDT_Byte), [](int, int nCol, int) { return nCol; });
    Fill(*Create("old.tif", 3, 3, 1, GDT_Byte), [](int, int, int) { return 4; });
    Fill(*Create("cut.tif", 200, 200, 1, GDT_UInt16), [](int, int nCol, int) { return nCol; });
    fs::resize_file(Path("cut.tif"), 50000);
    Fill(*Create("cuthead.tif", 9, 9, 1, GDT_Byte), [](int, int, int) { return 1; });
    fs::resize_file(Path("cuthead.tif"), 6);
    {
        double adfTfm[6] = {10, 0.1, 0, 50, 0, -0.1};
        const GDALDatasetUniquePtr po = Create("geo.tif", 20, 20, 1, GDT_Byte);
        po->SetGeoTransform(adfTfm);
        OGRSpatialReference oCrs;
        oCrs.importFromEPSG(4326);
        po->SetSpatialRef(&oCrs);
    }
    fs::create_symlink("a.tif", Path("link.tif"));
    fs::create_directory(Path("folder"));
    {
        const GDALDatasetUniquePtr po = Create("palette.tif", 9, 9, 1, GDT_Byte);
        GDALColorTable oColours;
        const GDALColorEntry oRed = {200, 10, 20, 255};
        oColours.SetColorEntry(3, &oRed);
        po->GetRasterBand(1)->SetColorTable(&oColours);
    }
    const std::set<std::string> oBefore = List();
    const std::string sOld = ReadBytes("old.tif");
    struct Case {
        int nStatus;
        const char* pszArgs;
        const char* pszMessage;
        const char* pszBefore = "";
    };
    // The shell counts file sizes in units of 512 or 1024 bytes.
    const Case kCases[] = {
        {2, "", "subcommand"},
        {2, "resample a.tif", "DST"},
        {2, "resample a.tif old.tif", "--size,--scale,--res"},
        {2, "resample a.tif old.tif --size 4 4 --scale 1", "2 were given"},
        {2, "resample a.tif old.tif --size 4", "--size"},
        {2, "resample a.tif old.tif --size 0 4", "--size"},
        {2, "resample a.tif old.tif --scale -1", "--scale"},
        {2, "resample a.tif old.tif --scale nan", "--scale"},
        {2, "resample a.tif old.tif --scale 1x", "--scale"},
        {2, "resample a.tif old.tif --scale 1 --method BEST", "BEST"},
        {2, "resample a.tif old.tif --scale 1 --method ''", "no method"},
        {2, "resample a.tif old.tif --scale 1 --method AVERAGE", "NUMCOLS"},
        {2, "resample a.tif old.tif --scale 1 --method NEAR,FILL", "Missing ="},
        {2, "resample a.tif old.tif --scale 1 --method KERNEL,FILE=none.txt", "none.txt"},
        {2, "resample a.tif old.tif --scale 1 --downsample 2", "2 were given"},
        {2, "resample a.tif old.tif --downsample 0", "--downsample"},
        {2, "methods BEST", "BEST"},
        {1, "resample a.tif old.tif --downsample 3 --method CPLXSAR", "complex"},
        {2, "resample a.tif old.tif --scale 1 --type 12U", "12U"},
        {2, "resample a.tif old.tif --scale 1 --nodata none", "none"},
        {2, "resample a.tif old.tif --scale 1 --fill black", "black"},
        {2, "resample a.tif old.tif --scale 1 --threads -1", "--threads"},
        {2, "resample a.tif old.tif --scale 1 --memory 0", "--memory"},
        {2, "resample a.tif old.tif --scale 1 --of NOPE", "NOPE"},
        {2, "resample a.tif old.tif --scale 1 --co TILED", "TILED"},
        {2, "resample a.tif old.tif --scale 1 --fast", "--fast"},
        {1, "resample none.tif old.tif --scale 1", "none.tif"},
        {1, "resample cuthead.tif old.tif --scale 1", "cuthead.tif"},
        {1, "resample cut.tif old.tif --scale 1 -q", "can't read the pixels"},
        {1, "resample cut.tif old.png --scale 1 --memory 1", "can't read the pixels"},
        {1, "resample a.tif a.tif --scale 1", "a.tif"},
        {1, "resample a.tif link.tif --scale 1", "link.tif"},
        {1, "resample a.tif folder --scale 1", "not a file"},
        {1, "resample a.tif folder/none/b.tif --scale 1", "folder/none"},
        {1, "resample a.tif /proc/b.tif --scale 1", "/proc"},
        {1, "resample a.tif /dev/null --scale 1", "not a file"},
        {1, "resample a.tif old.tif --res 2", "--res"},
        {1, "resample a.tif old.tif --scale 1e9", "too many"},
        {1, "resample a.tif old.tif --scale 1 --type 16U", "16U"},
        {1, "resample a.tif old.tif --scale 1 --type C32R", "C32R"},
        {1, "resample a.tif old.png --scale 1 --type 32R", "PNG"},
        {1, "resample a.tif old.tif --scale 1 --nodata 256", "256"},
        {1, "resample palette.tif old.tif --scale 2", "palette"},
        {1, "resample a.tif old.tif --scale 4 -q", "can't write", "ulimit -f 100;"},
        {1, "resample a.tif old.tif --scale 4 -q --co COMPRESS=LZW", "can't", "ulimit -f 8;"},
        {1, "resample a.tif old.png --scale 4 -q", "can't write", "ulimit -f 100;"},
        {1, "resample a.tif new.tif --scale 1 -q", "can't", "ulimit -f 110;"},
        {2, "resample a.tif old.tif --scale 1 --overviews BEST", "BEST"},
        {2, "resample a.tif old.png --scale 1 --overviews NEAR", "GeoTIFF"},
        {2, "resample a.tif old.tif --scale 1 --cog --of PNG", "--cog"},
        {1, "resample a.tif old.tif --scale 4 -q --cog", "can't", "ulimit -f 900;"},
        {2, "warp a.tif old.tif --crs EPSG:1", "EPSG:1"},
        {2, "warp a.tif old.tif --like geo.tif --res 1", "--like"},
        {2, "warp a.tif old.tif --size 4 4 --res 1", "--size"},
        {2, "warp a.tif old.tif --extent 1 2 1 3", "--extent"},
        {2, "warp a.tif old.tif --extent 1 2 nan 3", "--extent"},
        {2, "warp a.tif old.tif --error -1", "--error"},
        {2, "warp a.tif old.tif --to METHOD", "--to"},
        {1, "warp a.tif old.tif", "georeferenced"},
        {1, "warp a.tif old.tif --crs EPSG:4326", "coordinate reference system"},
        {1, "warp geo.tif old.tif --like a.tif", "geotransform"},
        {1, "warp geo.tif old.tif --like none.tif", "none.tif"},
        {1, "warp geo.tif old.tif --res 1e-12", "too many"},
        {1, "warp geo.tif geo.tif", "geo.tif"},
    };
    for (const Case& oCase : kCases) {
        const Outcome oOutcome = Run(oCase.pszArgs, oCase.pszBefore);
        EXPECT_EQ(oOutcome.nStatus, oCase.nStatus) << oCase.pszArgs << oOutcome.sErr;
        const std::string& sErr = oOutcome.sErr;
        EXPECT_TRUE(sErr.starts_with("vetra: error: ") && sErr.find('\n') == sErr.size() - 1)
            << oCase.pszArgs << ": " << sErr;
        EXPECT_NE(sErr.find(oCase.pszMessage), std::string::npos) << oCase.pszArgs << ": " << sErr;
        EXPECT_EQ(List(), oBefore) << oCase.pszArgs;
        EXPECT_TRUE(ReadBytes("old.tif") == sOld) << oCase.pszArgs;
    }
    EXPECT_TRUE(fs::is_empty(Path("folder")));
}

TEST_F(ToolTest, ASignalLeavesNothing) {
    // Sparse: large at once, and long enough at work.
    Create("a.tif", 30000, 30000, 1, GDT_Byte, "SPARSE_OK=TRUE").reset();
    Fill(*Create("old.tif", 3, 3, 1, GDT_Byte), [](int, int, int) { return 4; });
    const std::set<std::string> oBefore = List();
    const std::string sOld = ReadBytes("old.tif");
    for (const int nSignal : {SIGTERM, SIGINT}) {
        const pid_t nChild = fork();
        ASSERT_GE(nChild, 0);
        if (nChild == 0) {
            dup2(open("/dev/null", O_WRONLY), STDERR_FILENO);
            execl(VETRA_TOOL, "vetra", "resample", Path("a.tif").c_str(), Path("old.tif").c_str(),
                  "--scale", "1", "-q", static_cast<char*>(nullptr));
            _exit(127);
        }
        const auto oEnd = std::chrono::steady_clock::now() + std::chrono::seconds(20);
        while (List() == oBefore && std::chrono::steady_clock::now() < oEnd) {
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
        }
        EXPECT_NE(List(), oBefore) << "the run makes no file";
        kill(nChild, nSignal);
        int nStatus = 0;
        ASSERT_EQ(waitpid(nChild, &nStatus, 0), nChild);
        EXPECT_TRUE(WIFSIGNALED(nStatus) && WTERMSIG(nStatus) == nSignal) << nStatus;
        EXPECT_EQ(List(), oBefore);
        EXPECT_TRUE(ReadBytes("old.tif") == sOld);
    }
}

TEST_F(ToolTest, AKilledRunLeavesNoWholeImage) {
    Create("a.tif", 6000, 6000, 1, GDT_Byte, "SPARSE_OK=TRUE").reset();
    const char* const apszExtra[] = {"--cog", "--overviews=AVERAGE", "--quiet"};
    constexpr int kKills = 6;
    std::random_device oRandom;
    int nKilled = 0;
    // Most kills come before the end of a run on this machine.
    unsigned anRunTime[3];
    for (int n = 0; n < 3; ++n) {
        const auto oStart = std::chrono::steady_clock::now();
        EXPECT_EQ(Run(std::string("resample a.tif b.tif --scale=1 -q ") + apszExtra[n]).sErr, "");
        const std::chrono::duration<double, std::milli> oTime =
            std::chrono::steady_clock::now() - oStart;
        anRunTime[n] = static_cast<unsigned>(oTime.count());
        fs::remove(Path("b.tif"));
    }
    for (int n = 0; n < kKills; ++n) {
        const pid_t nChild = fork();
        ASSERT_GE(nChild, 0);
        if (nChild == 0) {
            execl(VETRA_TOOL, "vetra", "resample", Path("a.tif").c_str(), Path("b.tif").c_str(),
                  "--scale=1", "-q", apszExtra[n % 3], static_cast<char*>(nullptr));
            _exit(127);
        }
        const unsigned nDelay = oRandom() % (anRunTime[n % 3] * 3 / 4 + 1);
        std::this_thread::sleep_for(std::chrono::milliseconds(nDelay));
        kill(nChild, SIGKILL);
        int nStatus = 0;
        ASSERT_EQ(waitpid(nChild, &nStatus, 0), nChild);
        if (WIFSIGNALED(nStatus)) {
            ++nKilled;
            EXPECT_FALSE(fs::exists(Path("b.tif"))) << nDelay << " ms";
        } else {
            // It was faster than its killer.
            EXPECT_EQ(nStatus, 0);
            EXPECT_EQ(Open("b.tif")->GetRasterXSize(), 6000);
        }
        fs::remove(Path("b.tif"));
    }
    EXPECT_GT(nKilled, kKills / 2);
}

TEST_F(ToolTest, TellsWhatItIsAndDoes) {
    Fill(*Create("a.tif", 300, 300, 1, GDT_Byte), [](int, int nCol, int) { return nCol; });
    const Outcome oRun = Run("resample a.tif b.tif --scale 2 --memory 1");
    EXPECT_EQ(oRun.sOut, "");
    EXPECT_EQ(oRun.sErr, "");
    EXPECT_EQ(Run("resample a.tif b.tif --scale 2 --quiet").sOut, "");
    EXPECT_EQ(Run("--version").sOut.rfind("vetra ", 0), 0u);
    EXPECT_NE(Run("resample --help").sOut.find("--dst-nodata"), std::string::npos);
}

}  // namespace
