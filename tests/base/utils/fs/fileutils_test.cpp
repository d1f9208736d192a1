#include "vetra/base/utils/fs/fileutils.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <limits.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>
#include <vector>

#include "tests/support/ordinaryuser.h"
#include "tests/support/scratchfolder.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra {
namespace {

namespace fs = std::filesystem;
using Paths = std::vector<std::string>;
using tests::AsOrdinaryUser;
using tests::ScratchFolder;

bool IsRefusedToDelete(const std::string& sPath) {
    try {
        RemoveFile(sPath);
    } catch (const FileAccessException& oCaught) {
        return oCaught.GetFileName() == sPath && oCaught.GetType() == 8 &&
               oCaught.GetMessage() == "File cannot be deleted" &&
               oCaught.GetFile().find("vetra/") == 0 && oCaught.GetLine() > 0;
    }
    return false;
}

Paths Sorted(Paths vsPaths) {
    std::sort(vsPaths.begin(), vsPaths.end());
    return vsPaths;
}

TEST(FileUtils, Kinds) {
    const ScratchFolder oScratch;
    const std::string sFile = oScratch.Write("file", "");
    const std::string sFolder = oScratch.Path("folder");
    fs::create_directory(sFolder);
    fs::create_symlink("file", oScratch.Path("to_file"));
    fs::create_symlink("folder", oScratch.Path("to_folder"));
    fs::create_symlink("nowhere", oScratch.Path("to_nothing"));
    mkfifo(oScratch.Path("pipe").c_str(), 0600);

    for (const std::string& s :
         {sFile, oScratch.Path("to_file"), oScratch.Path("pipe"), std::string("/dev/null")}) {
        EXPECT_TRUE(IsFile(s) && !IsDirectory(s)) << s;
        EXPECT_TRUE(CanRead(s) && CanWrite(s)) << s;
    }
    for (const std::string& s : {sFolder, sFolder + '/', oScratch.Path("to_folder")}) {
        EXPECT_TRUE(!IsFile(s) && IsDirectory(s)) << s;
    }
    for (const std::string& s :
         {oScratch.Path("to_nothing"), oScratch.Path("nowhere"), sFile + '/', std::string(),
          std::string(100'000, 'x'), sFile + '\0', sFolder + '\0', oScratch.Path("fil?")}) {
        EXPECT_FALSE(IsFile(s) || IsDirectory(s)) << s;
    }
    for (const std::string& s : {sFolder, oScratch.Path("nowhere")}) {
        for (const auto pfnAsk : {CanRead, CanWrite}) {
            try {
                pfnAsk(s);
                ADD_FAILURE() << s;
            } catch (const FileNotFoundException& oCaught) {
                EXPECT_EQ(oCaught.GetFileName(), s);
                EXPECT_EQ(oCaught.GetMessage() + oCaught.GetFile() + oCaught.GetFunction(), "");
                EXPECT_EQ(oCaught.GetLine(), 0u);
            }
        }
    }
}

TEST(FileUtils, Permissions) {
    const ScratchFolder oScratch;
    const std::string sReadable = oScratch.Write("readable", "");
    const std::string sWritable = oScratch.Write("writable", "");
    chmod(sReadable.c_str(), 0444);
    chmod(sWritable.c_str(), 0222);
    fs::create_directory(oScratch.Path("closed"));
    oScratch.Write("closed/x", "");
    chmod(oScratch.Path("closed").c_str(), 0);
    const std::string sLink = oScratch.Path("to_nothing");
    fs::create_symlink("nowhere", sLink);
    chmod(oScratch.GetPath().c_str(), 0555);
    EXPECT_TRUE(AsOrdinaryUser([&] { return CanRead(sReadable) && !CanWrite(sReadable); }));
    EXPECT_TRUE(AsOrdinaryUser([&] { return !CanRead(sWritable) && CanWrite(sWritable); }));
    EXPECT_TRUE(
        AsOrdinaryUser([&] { return IsRefusedToDelete(sReadable) && IsRefusedToDelete(sLink); }));
    EXPECT_TRUE(AsOrdinaryUser([&] {
        const std::string sRoot = oScratch.GetPath();
        return Sorted(FindFiles(sRoot, "able", true)) == Paths{sReadable, sWritable} &&
               Sorted(FindFilesByWildcard(sRoot, "*", true)) == Paths{sReadable, sWritable};
    }));
    chmod(oScratch.GetPath().c_str(), 0755);
    chmod(oScratch.Path("closed").c_str(), 0755);
}

TEST(FileUtils, Names) {
    struct Case {
        const char *pszPath, *pszName, *pszExtension;
    };
    for (const Case& o : {Case{"a.tar.gz", "a.tar", "gz"},
                          {"a.", "a", ""},
                          {"abc", "abc", ""},
                          {"", "", ""},
                          {".profile", "", "profile"},
                          {"dir/a.txt", "dir/a", "txt"},
                          {"dir.d/file", "dir", "d/file"},
                          {"../file", ".", "/file"}}) {
        EXPECT_EQ(GetName(o.pszPath), o.pszName) << o.pszPath;
        EXPECT_EQ(GetExtension(o.pszPath), o.pszExtension) << o.pszPath;
    }
}

TEST(FileUtils, RemoveFile) {
    const ScratchFolder oScratch;
    const std::string sFile = oScratch.Write("file", "x");
    const std::string sFolder = oScratch.Path("folder");
    fs::create_directory(sFolder);
    fs::create_symlink("file", oScratch.Path("to_file"));
    fs::create_symlink("nowhere", oScratch.Path("to_nothing"));

    EXPECT_NO_THROW(RemoveFile(oScratch.Path("nowhere")));
    EXPECT_NO_THROW(RemoveFile(""));
    EXPECT_NO_THROW(RemoveFile(sFile + '\0' + "more"));
    EXPECT_TRUE(IsRefusedToDelete(sFolder) && IsDirectory(sFolder));
    RemoveFile(oScratch.Path("to_file"));
    RemoveFile(oScratch.Path("to_nothing"));
    EXPECT_FALSE(fs::is_symlink(oScratch.Path("to_file")));
    EXPECT_FALSE(fs::is_symlink(oScratch.Path("to_nothing")));
    EXPECT_TRUE(IsFile(sFile));
    RemoveFile(sFile);
    EXPECT_FALSE(IsFile(sFile));
}

// The two orders, call within call.
Paths PlainFind(const std::string& sFolder, const std::string& sSuffix) {
    Paths vsFound;
    for (const fs::directory_entry& oEntry : fs::directory_iterator(sFolder)) {
        const std::string sName = oEntry.path().filename();
        if (oEntry.is_directory()) {
            const Paths vsInner = PlainFind(sFolder + "/" + sName, sSuffix);
            vsFound.insert(vsFound.begin(), vsInner.begin(), vsInner.end());
        } else if (sName.size() >= sSuffix.size() &&
                   sName.compare(sName.size() - sSuffix.size(), sSuffix.size(), sSuffix) == 0) {
            vsFound.push_back(sFolder + "/" + sName);
        }
    }
    return vsFound;
}

Paths PlainWildcard(const std::string& sFolder, char cFirst) {
    Paths vsFound;
    for (const fs::directory_entry& oEntry : fs::directory_iterator(sFolder)) {
        const std::string sName = oEntry.path().filename();
        if (!oEntry.is_directory() && sName.front() == cFirst) {
            vsFound.push_back(sFolder + "/" + sName);
        }
    }
    for (const fs::directory_entry& oEntry : fs::directory_iterator(sFolder)) {
        if (oEntry.is_directory()) {
            const Paths vsInner = PlainWildcard(oEntry.path(), cFirst);
            vsFound.insert(vsFound.end(), vsInner.begin(), vsInner.end());
        }
    }
    return vsFound;
}

TEST(FileUtils, OrderOfFoundFiles) {
    const ScratchFolder oScratch;
    const std::string sRoot = oScratch.GetPath();
    std::mt19937 oRandom(5);
    Paths vsFolders{"."};
    for (int n = 0; n < 300; ++n) {
        const std::string sPath = vsFolders[oRandom() % vsFolders.size()] + "/" + "ab"[n % 2] +
                                  std::to_string(n) + (n % 3 == 0 ? ".tif" : ".txt");
        if (n % 5 == 0) {
            fs::create_directory(oScratch.Path(sPath));
            vsFolders.push_back(sPath);
        } else {
            oScratch.Write(sPath, "");
        }
    }
    const Paths vsFound = FindFiles(sRoot, ".tif", true);
    EXPECT_EQ(vsFound, PlainFind(sRoot, ".tif"));
    EXPECT_EQ(FindFilesByWildcard(sRoot, "b*", true), PlainWildcard(sRoot, 'b'));
    EXPECT_GT(vsFound.size(), 50u);
    EXPECT_TRUE(std::all_of(vsFound.begin(), vsFound.end(), IsFile));
}

TEST(FileUtils, FindFiles) {
    const ScratchFolder oScratch;
    const std::string sRoot = oScratch.GetPath();
    fs::create_directories(oScratch.Path("sub.tif/inner"));
    for (const char* pszName : {"a.tif", "a.tif.tif", "a.tif.bak", "a.TIF", ".tif", "tif",
                                "sub.tif/b.tif", "sub.tif/inner/\xff\n.tif"}) {
        oScratch.Write(pszName, "");
    }
    fs::create_symlink("a.tif", oScratch.Path("link.tif"));
    fs::create_symlink("nowhere", oScratch.Path("broken.tif"));
    fs::create_directory_symlink(".", oScratch.Path("loop.tif"));
    mkfifo(oScratch.Path("pipe.tif").c_str(), 0600);

    const Paths vsOwn = {sRoot + "/.tif", sRoot + "/a.tif", sRoot + "/a.tif.tif",
                         sRoot + "/link.tif", sRoot + "/pipe.tif"};
    Paths vsAll = vsOwn;
    vsAll.insert(vsAll.end(), {sRoot + "/sub.tif/b.tif", sRoot + "/sub.tif/inner/\xff\n.tif"});
    EXPECT_EQ(Sorted(FindFiles(sRoot, ".tif", false)), vsOwn);
    EXPECT_EQ(Sorted(FindFiles(sRoot, ".tif", true)), vsAll);
    EXPECT_EQ(FindFiles(oScratch.Path("loop.tif") + "/sub.tif", "b.tif", false),
              Paths{sRoot + "/loop.tif/sub.tif/b.tif"});
    for (const std::string& sFolder : {oScratch.Path("none"), oScratch.Path("a.tif"), sRoot + '\0',
                                       std::string(100'000, 'x'), oScratch.Path("pipe.tif")}) {
        EXPECT_EQ(FindFiles(sFolder, ".tif", true), Paths{}) << sFolder;
        EXPECT_EQ(FindFilesByWildcard(sFolder, "*", true), Paths{}) << sFolder;
    }
    EXPECT_EQ(FindFiles(sRoot, "", true), Paths{});
}

TEST(FileUtils, Wildcards) {
    const ScratchFolder oScratch;
    const std::string sRoot = oScratch.GetPath();
    const Paths vsNames = {
        "[ab]", "a", "a*b", "a.b.c", "ab", "aXb", "b.", ".ab", std::string(200, 'y')};
    for (const std::string& sName : vsNames) {
        oScratch.Write(sName, "");
    }
    fs::create_directory(oScratch.Path("sub"));
    oScratch.Write("sub/ab", "");

    std::string sSlow;
    for (int n = 0; n < 100; ++n) {
        sSlow += "*y";
    }
    struct Case {
        std::string sPattern;
        Paths vsExpected;
    };
    const Case aoCases[] = {{"*", Sorted(vsNames)},
                            {"*.*", Sorted(vsNames)},
                            {"?.*", {"a.b.c", "b."}},
                            {"*.", {"b."}},
                            {"a", {"a"}},
                            {"A", {}},
                            {"a*", {"a", "a*b", "a.b.c", "aXb", "ab"}},
                            {"a?b", {"a*b", "aXb"}},
                            {"a*b", {"a*b", "aXb", "ab"}},
                            {"**b", {".ab", "a*b", "aXb", "ab"}},
                            {"?", {"a"}},
                            {"?*?", {".ab", "[ab]", "a*b", "a.b.c", "aXb", "ab", "b.", vsNames[8]}},
                            {"*b*c", {"a.b.c"}},
                            {"[ab]", {"[ab]"}},
                            {"[!x]", {}},
                            {"\\a", {}},
                            {"", {}},
                            {"sub/ab", {}},
                            {sSlow, {vsNames[8]}},
                            {sSlow + 'z', {}},
                            {std::string(1'000'000, '*'), Sorted(vsNames)}};
    for (const Case& o : aoCases) {
        Paths vsExpected;
        for (const std::string& sName : o.vsExpected) {
            vsExpected.push_back(sRoot + '/' + sName);
        }
        const std::string sLabel = o.sPattern.substr(0, 30);
        EXPECT_EQ(Sorted(FindFilesByWildcard(sRoot, o.sPattern, false)), vsExpected) << sLabel;
        EXPECT_EQ(Sorted(FindFilesByWildcard(sRoot + '/', o.sPattern, false)), vsExpected)
            << sLabel;
    }

    const fs::path oBefore = fs::current_path();
    fs::current_path(sRoot);
    EXPECT_EQ(FindFilesByWildcard("", "?b", true), (Paths{"ab", "sub/ab"}));
    EXPECT_EQ(FindFilesByWildcard("sub", "?b", true), Paths{"sub/ab"});
    fs::current_path(oBefore);
}

TEST(FileUtils, DepthIsBoundByThePathAlone) {
    const ScratchFolder oScratch;
    const std::string sRoot = oScratch.GetPath();
    // More levels than a path has room for, and than there will be descriptors.
    const std::string sName(49, 'd');
    int nFolder = open(sRoot.c_str(), O_DIRECTORY);
    for (int nLevel = 0; nLevel < 100; ++nLevel) {
        mkdirat(nFolder, sName.c_str(), 0755);
        const int nInner = openat(nFolder, sName.c_str(), O_DIRECTORY);
        close(openat(nInner, "f", O_CREAT | O_WRONLY, 0644));
        close(nFolder);
        nFolder = nInner;
    }
    close(nFolder);

    rlimit oBefore{};
    getrlimit(RLIMIT_NOFILE, &oBefore);
    rlimit oFew = oBefore;
    oFew.rlim_cur = 32;
    setrlimit(RLIMIT_NOFILE, &oFew);
    const Paths vsBySuffix = FindFiles(sRoot, "f", true);
    const Paths vsByWildcard = FindFilesByWildcard(sRoot, "f", true);
    setrlimit(RLIMIT_NOFILE, &oBefore);

    // The longest path of a folder has PATH_MAX - 1 bytes, with a "/" for each level and at its
    // end.
    const std::size_t nLevels = (PATH_MAX - 1 - sRoot.size() - 1) / (1 + sName.size());
    EXPECT_EQ(vsBySuffix.size(), nLevels);
    EXPECT_EQ(Paths(vsBySuffix.rbegin(), vsBySuffix.rend()), vsByWildcard);

    // Too deep for the folder's own cleaning up.
    EXPECT_EQ(std::system(("rm -rf " + sRoot + "/" + sName).c_str()), 0);
}

}  // namespace
}  // namespace vetra
