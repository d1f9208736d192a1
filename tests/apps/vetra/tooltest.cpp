#include "tests/apps/vetra/tooltest.h"

#include <cpl_string.h>
#include <stdlib.h>
#include <sys/wait.h>

#include <filesystem>
#include <fstream>
#include <sstream>

namespace fs = std::filesystem;

namespace {

std::string ReadText(const fs::path& oPath) {
    std::ostringstream oText;
    oText << std::ifstream(oPath).rdbuf();
    return oText.str();
}

}  // namespace

ToolTest::ToolTest() { GDALAllRegister(); }

ToolTest::~ToolTest() = default;

ToolTest::Outcome ToolTest::Run(const std::string& sArgs, const std::string& sBefore) {
    const std::string sOutputs = moFolder.GetPath().string() + ".output";
    fs::create_directory(sOutputs);
    const std::string sCommand = "cd " + moFolder.GetPath().string() + "; " + sBefore +
                                 " " VETRA_TOOL " " + sArgs + " >" + sOutputs + "/out 2>" +
                                 sOutputs + "/err";
    const int nStatus = std::system(sCommand.c_str());
    const Outcome oOutcome{WIFEXITED(nStatus) ? WEXITSTATUS(nStatus) : 128 + WTERMSIG(nStatus),
                           ReadText(sOutputs + "/out"), ReadText(sOutputs + "/err")};
    fs::remove_all(sOutputs);
    return oOutcome;
}

void ToolTest::Succeed(const std::string& sArgs) {
    const Outcome oOutcome = Run(sArgs);
    ASSERT_EQ(oOutcome.nStatus, 0) << sArgs << ": " << oOutcome.sErr;
    EXPECT_EQ(oOutcome.sErr, "") << sArgs;
}

std::set<std::string> ToolTest::List() const {
    std::set<std::string> oNames;
    for (const fs::directory_entry& oEntry : fs::directory_iterator(moFolder.GetPath())) {
        oNames.insert(oEntry.path().filename());
    }
    return oNames;
}

GDALDatasetUniquePtr ToolTest::Create(const std::string& sName, int nCols, int nRows, int nBands,
                                      GDALDataType eType, const char* pszOption) {
    CPLStringList oOptions;
    if (pszOption != nullptr) {
        oOptions.AddString(pszOption);
    }
    GDALDriver* poDriver = GetGDALDriverManager()->GetDriverByName("GTiff");
    return GDALDatasetUniquePtr(
        poDriver->Create(Path(sName).c_str(), nCols, nRows, nBands, eType, oOptions.List()));
}

void ToolTest::Fill(GDALDataset& oDataset, const Filler& fnValue) {
    const int nCols = oDataset.GetRasterXSize();
    Pixels vdfRow(static_cast<std::size_t>(nCols));
    for (int nBand = 1; nBand <= oDataset.GetRasterCount(); ++nBand) {
        for (int nRow = 0; nRow < oDataset.GetRasterYSize(); ++nRow) {
            for (int nCol = 0; nCol < nCols; ++nCol) {
                vdfRow[static_cast<std::size_t>(nCol)] = fnValue(nBand, nCol, nRow);
            }
            ASSERT_EQ(
                oDataset.GetRasterBand(nBand)->RasterIO(GF_Write, 0, nRow, nCols, 1, vdfRow.data(),
                                                        nCols, 1, GDT_Float64, 0, 0, nullptr),
                CE_None);
        }
    }
}

GDALDatasetUniquePtr ToolTest::Open(const std::string& sName) const {
    GDALDatasetUniquePtr poDataset(GDALDataset::Open(Path(sName).c_str(), GDAL_OF_RASTER));
    if (!poDataset) {
        throw std::runtime_error("there is no image " + sName);
    }
    return poDataset;
}

ToolTest::Pixels ToolTest::Read(const std::string& sName) const {
    const GDALDatasetUniquePtr poDataset = Open(sName);
    const int nCols = poDataset->GetRasterXSize();
    const int nRows = poDataset->GetRasterYSize();
    const int nBands = poDataset->GetRasterCount();
    Pixels vdfPixels(static_cast<std::size_t>(nCols) * static_cast<std::size_t>(nRows) *
                     static_cast<std::size_t>(nBands));
    EXPECT_EQ(poDataset->RasterIO(GF_Read, 0, 0, nCols, nRows, vdfPixels.data(), nCols, nRows,
                                  GDT_Float64, nBands, nullptr, 0, 0, 0, nullptr),
              CE_None);
    return vdfPixels;
}

ToolTest::Pixels ToolTest::ReadMask(const std::string& sName) const {
    const GDALDatasetUniquePtr poDataset = Open(sName);
    const int nCols = poDataset->GetRasterXSize();
    const int nRows = poDataset->GetRasterYSize();
    EXPECT_TRUE(poDataset->GetRasterBand(1)->GetMaskFlags() & GMF_PER_DATASET) << sName;
    Pixels vdfMask(static_cast<std::size_t>(nCols) * static_cast<std::size_t>(nRows));
    EXPECT_EQ(
        poDataset->GetRasterBand(1)->GetMaskBand()->RasterIO(
            GF_Read, 0, 0, nCols, nRows, vdfMask.data(), nCols, nRows, GDT_Float64, 0, 0, nullptr),
        CE_None);
    return vdfMask;
}

std::string ToolTest::ReadBytes(const std::string& sName) const {
    const GDALDatasetUniquePtr poDataset = Open(sName);
    const int nCols = poDataset->GetRasterXSize();
    const int nRows = poDataset->GetRasterYSize();
    std::string sBytes;
    const auto Append = [&](GDALRasterBand* poBand) {
        const GDALDataType eType = poBand->GetRasterDataType();
        std::string sBand(static_cast<std::size_t>(GDALGetDataTypeSizeBytes(eType)) *
                              static_cast<std::size_t>(nCols) * static_cast<std::size_t>(nRows),
                          '\0');
        EXPECT_EQ(poBand->RasterIO(GF_Read, 0, 0, nCols, nRows, sBand.data(), nCols, nRows, eType,
                                   0, 0, nullptr),
                  CE_None);
        sBytes += sBand;
    };
    for (int nBand = 1; nBand <= poDataset->GetRasterCount(); ++nBand) {
        Append(poDataset->GetRasterBand(nBand));
    }
    Append(poDataset->GetRasterBand(1)->GetMaskBand());
    return sBytes;
}
