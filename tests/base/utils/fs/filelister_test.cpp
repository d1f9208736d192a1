#include "vetra/base/utils/fs/filelister.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "tests/support/scratchfolder.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra {
namespace {

namespace fs = std::filesystem;
using Pairs = std::vector<std::pair<std::string, std::string>>;
using tests::ScratchFolder;

Pairs Search(const std::string& sFolder) { return FileLister(sFolder, ".hdr", ".img").GetFiles(); }

// The search spelled out: each file is held against the whole list.
class PlainSearch {
 public:
    static Pairs Run(const std::string& sFolder, const std::string& sFirst,
                     const std::string& sSecond) {
        PlainSearch oSearch{{}, sFirst, sSecond};
        oSearch.Walk(sFolder);
        std::erase_if(oSearch.voPairs,
                      [](const auto& o) { return o.first.empty() || o.second.empty(); });
        return oSearch.voPairs;
    }

    void Walk(const std::string& sFolder) {
        for (const fs::directory_entry& oEntry : fs::directory_iterator(sFolder)) {
            const std::string sName = oEntry.path().filename();
            if (oEntry.is_directory()) {
                Walk(sFolder + "/" + sName);
            } else if (sName.find(sFirst) != std::string::npos) {
                Add(sFolder + "/" + sName, true);
            } else if (sName.find(sSecond) != std::string::npos) {
                Add(sFolder + "/" + sName, false);
            }
        }
    }

    void Add(const std::string& sPath, bool bFirst) {
        const auto fnCommon = [](const std::string& s, const std::string& sExtension) {
            return s.substr(0, s.size() - sExtension.size());
        };
        for (auto& [sA, sB] : voPairs) {
            if (bFirst && sA.empty() && fnCommon(sB, sSecond) == fnCommon(sPath, sFirst)) {
                sA = sPath;
                return;
            }
            if (!bFirst && sB.empty() && fnCommon(sA, sFirst) == fnCommon(sPath, sSecond)) {
                sB = sPath;
                return;
            }
        }
        voPairs.emplace_back(bFirst ? sPath : "", bFirst ? "" : sPath);
    }

    Pairs voPairs;
    std::string sFirst;
    std::string sSecond;
};

TEST(FileLister, PairsAndOrderAreThoseOfThePlainSearch) {
    const ScratchFolder oScratch;
    std::mt19937 oRandom(3);
    // Few stems and extensions of different lengths: many names share what is left of them.
    const std::string asStems[] = {"a", "ab", "a.x", "a.xy"};
    const std::string asExtensions[] = {".x", ".xy", ".xyz", ".x.y", ".y", "", ".xx", ".yy"};
    std::vector<std::string> vsFolders{"."};
    for (int n = 0; n < 400; ++n) {
        const std::string sPath = vsFolders[oRandom() % vsFolders.size()] + "/" +
                                  asStems[oRandom() % 4] + asExtensions[oRandom() % 8] +
                                  asExtensions[oRandom() % 8] +
                                  (n % 4 == 0 ? std::to_string(n % 7) : "");
        if (n % 20 == 0 && fs::create_directory(oScratch.Path(sPath + 'd'))) {
            vsFolders.push_back(sPath + 'd');
        } else {
            oScratch.Write(sPath, "");
        }
    }
    std::size_t nPairs = 0;
    for (const std::string& sFirst : asExtensions) {
        for (const std::string& sSecond : asExtensions) {
            const Pairs voPairs = FileLister(oScratch.GetPath(), sFirst, sSecond).GetFiles();
            EXPECT_EQ(voPairs, PlainSearch::Run(oScratch.GetPath(), sFirst, sSecond))
                << sFirst << ' ' << sSecond;
            nPairs += voPairs.size();
        }
    }
    EXPECT_GT(nPairs, 100u);
}

TEST(FileLister, PathsAndLinks) {
    const ScratchFolder oScratch;
    const std::string sRoot = oScratch.GetPath();
    fs::create_directories(oScratch.Path("sub.hdr/inner"));
    for (const char* pszName : {"a.hdr", "a.img", "b.HDR", "b.img", "c.hdr", "sub.hdr/c.img",
                                "sub.hdr/inner/\xff\n.hdr", "sub.hdr/inner/\xff\n.img"}) {
        oScratch.Write(pszName, "");
    }
    fs::create_directory_symlink(".", oScratch.Path("loop"));
    fs::create_directory_symlink("../..", oScratch.Path("sub.hdr/inner/loop"));
    fs::create_directory_symlink("inner", oScratch.Path("sub.hdr/c.hdr"));
    fs::create_symlink("a.hdr", oScratch.Path("link.hdr"));
    mkfifo(oScratch.Path("link.img").c_str(), 0600);
    fs::create_symlink("nowhere", oScratch.Path("broken.hdr"));
    fs::create_symlink("self.img", oScratch.Path("self.img"));
    oScratch.Write("broken.img", "");

    for (const std::string& sFolder : {sRoot, sRoot + "/", oScratch.Path("loop")}) {
        Pairs voPairs = Search(sFolder);
        std::sort(voPairs.begin(), voPairs.end());
        const std::string sInner = sFolder + "/sub.hdr/inner/\xff\n";
        EXPECT_EQ(voPairs, (Pairs{{sFolder + "/a.hdr", sFolder + "/a.img"},
                                  {sFolder + "/link.hdr", sFolder + "/link.img"},
                                  {sInner + ".hdr", sInner + ".img"}}));
        for (const auto& [sFirst, sSecond] : voPairs) {
            EXPECT_TRUE(std::ifstream(sFirst).is_open()) << sFirst;
            EXPECT_TRUE(fs::exists(sSecond)) << sSecond;
        }
    }
}

TEST(FileLister, CopiesAndDisplay) {
    const ScratchFolder oScratch;
    const std::string sFirst = oScratch.Write("a.hdr", "");
    const std::string sSecond = oScratch.Write("a.img", "");
    const FileLister oOne(oScratch.GetPath(), ".hdr", ".img");
    fs::remove(sSecond);
    FileLister oCopy(oScratch.GetPath(), ".hdr", ".img");
    testing::internal::CaptureStdout();
    oCopy.Display();
    oCopy = oOne;
    oCopy.Display();
    EXPECT_EQ(testing::internal::GetCapturedStdout(), sFirst + ' ' + sSecond + " \n");
}

void ExpectUnlistable(const std::string& sRoot, const std::string& sFolder) {
    try {
        Search(sRoot);
        ADD_FAILURE() << sRoot;
    } catch (const FileAccessException& oCaught) {
        EXPECT_EQ(oCaught.GetFileName(), sFolder);
        EXPECT_EQ(oCaught.GetType(), 1);
        EXPECT_EQ(oCaught.GetMessage(), "Error when trying to open this dir");
    }
}

TEST(FileLister, FoldersThatCannotBeListed) {
    const ScratchFolder oScratch;
    for (const std::string& sRoot :
         {oScratch.Path("none"), oScratch.Write("file", ""), oScratch.GetPath().string() + '\0'}) {
        ExpectUnlistable(sRoot, sRoot);
    }
    // Below the root: a path that is too long for the system, which binds the superuser too. A
    // folder is made where no other path leads.
    std::string sFolder = oScratch.GetPath();
    fs::current_path(sFolder);
    const std::string sName(250, 'd');
    while (sFolder.size() < 4096) {
        fs::create_directory(sName);
        fs::current_path(sName);
        sFolder += '/' + sName;
    }
    fs::current_path("/");
    ExpectUnlistable(oScratch.GetPath(), sFolder);
}

TEST(FileLister, ManyPairsInTimeLinearInTheirNumber) {
    // In memory where that can be had: on a disk it takes a minute to make the files.
    const ScratchFolder oScratch(fs::is_directory("/dev/shm") ? "/dev/shm"
                                                              : fs::temp_directory_path());
    for (int n = 0; n < 100'000; ++n) {
        const std::string sName = oScratch.Path("scene" + std::to_string(n));
        std::ofstream(sName + ".hdr");
        std::ofstream(sName + ".img");
    }
    const std::clock_t nBegin = std::clock();
    const Pairs voPairs = Search(oScratch.GetPath());
    const double dfSeconds = static_cast<double>(std::clock() - nBegin) / CLOCKS_PER_SEC;
    EXPECT_EQ(voPairs.size(), 100'000u);
    EXPECT_TRUE(std::all_of(voPairs.begin(), voPairs.end(), [](const auto& o) {
        return fs::path(o.first).replace_extension(".img") == o.second;
    }));
    // Far above what a slow machine needs, far below what anything quadratic does.
    EXPECT_LT(dfSeconds, 10.0);
}

}  // namespace
}  // namespace vetra
