#ifndef VETRA_TESTS_APPS_TOOLTEST_H
#define VETRA_TESTS_APPS_TOOLTEST_H

#include <gdal_priv.h>
#include <gtest/gtest.h>

#include <functional>
#include <set>
#include <string>
#include <vector>

#include "tests/support/scratchfolder.h"

/// Runs the built tool in a folder of its own.
class ToolTest : public ::testing::Test {
 protected:
    struct Outcome {
        int nStatus;  ///< exit status, or 128 and the signal
        std::string sOut;
        std::string sErr;
    };
    using Pixels = std::vector<double>;
    /// Value of band, column, row.
    using Filler = std::function<double(int, int, int)>;

    ToolTest();
    ~ToolTest() override;

    /// \param sBefore  shell commands to run before the tool in the same shell
    Outcome Run(const std::string& sArgs, const std::string& sBefore = "");
    /// Runs and expects success without a word on the error output.
    void Succeed(const std::string& sArgs);
    std::string Path(const std::string& sName) const { return moFolder.Path(sName); }
    /// The names in the folder, hidden ones too.
    std::set<std::string> List() const;

    GDALDatasetUniquePtr Create(const std::string& sName, int nCols, int nRows, int nBands,
                                GDALDataType eType, const char* pszOption = nullptr);
    static void Fill(GDALDataset& oDataset, const Filler& fnValue);
    GDALDatasetUniquePtr Open(const std::string& sName) const;
    /// All values, band after band.
    Pixels Read(const std::string& sName) const;
    /// Values of the mask that holds for all bands.
    Pixels ReadMask(const std::string& sName) const;
    /// The samples of all bands as the file holds them, and its mask.
    std::string ReadBytes(const std::string& sName) const;

 private:
    vetra::tests::ScratchFolder moFolder;
};

#endif  // VETRA_TESTS_APPS_TOOLTEST_H
