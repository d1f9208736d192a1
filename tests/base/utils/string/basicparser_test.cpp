#include "vetra/base/utils/string/basicparser.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <string>
#include <type_traits>

#include "tests/support/ordinaryuser.h"
#include "tests/support/scratchfolder.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra {
namespace {

using tests::ScratchFolder;

// The value, or how nothing was found.
std::string Find(BasicParser& oParser, const std::string& sKey) {
    std::string sValue = "kept";
    const bool bFound = oParser.Find(sKey, sValue);
    EXPECT_EQ(bFound, sValue != "kept" && !sValue.empty()) << sKey;
    return sValue;
}

std::string FindIn(const std::string& sText, const std::string& sKey) {
    const ScratchFolder oScratch;
    BasicParser oParser(oScratch.Write("file", sText));
    return Find(oParser, sKey);
}

// The message, after a look at all else that the failure carries.
std::string Failure(const std::string& sPath) {
    try {
        BasicParser oParser(sPath);
    } catch (const FileAccessException& oCaught) {
        EXPECT_EQ(oCaught.GetFileName(), sPath);
        EXPECT_EQ(oCaught.GetType(), 1);
        EXPECT_EQ(oCaught.GetFile().find("vetra/"), 0u);
        EXPECT_GT(oCaught.GetLine(), 0u);
        return oCaught.GetMessage();
    }
    return "none";
}

TEST(BasicParser, Find) {
    const std::string sSections = "Section B\nWidth 1\nSection C\r\nWidth 2\r\n";
    const struct {
        std::string sText, sKey, sValue;
    } aoCases[] = {
        {"Size = 12;\n", "Size", "12"},
        {"Size = 12;\n", "ize", "12"},
        {"Size = 12;\n", "size", "kept"},
        {"Size = 12;\n", "Size =", "kept"},
        {"Size = 12;\n", "12", ""},
        {"Size", "Size", ""},
        {"Size=1,2", "::Size::2:", ""},
        {"Size=1,2", "Size::1:", "2"},
        {sSections, "C:Width", "2"},
        {sSections, "Width", "1"},
        {sSections, "Width:Width", "2"},
        {sSections, "Width:B", "kept"},
        {sSections, "", "Section"},
        {sSections, ":", "Section"},
        {"A 1\t2 3", "A", "1\t2"},
        {"A 1\r2\rB", "A", "1\r2\rB"},
        {"A 1\r\r\nB", "A", "1\r"},
        {"\r\n", "", ""},
        {"aab 1", "ab", "1"},
        {"aaaab 1", "aab", "1"},
        {std::string("A 1\0 B 2", 8), "A", "1"},
        {std::string("A 1\0 B 2", 8), "B", "kept"},
        {std::string("\0A 1", 4), "", ""},
    };
    for (const auto& [sText, sKey, sValue] : aoCases) {
        EXPECT_EQ(FindIn(sText, sKey), sValue) << sText << " / " << sKey;
    }
}

// Line ends, zero bytes and keywords at and around what is read in one go.
TEST(BasicParser, LongFiles) {
    for (std::size_t nPadding = (1 << 16) - 8; nPadding < (1 << 16) + 2; ++nPadding) {
        const std::string sText = std::string(nPadding, 'x') + " Key\r\n1\r\n";
        EXPECT_EQ(FindIn(sText, "Key"), "1") << nPadding;
        EXPECT_EQ(FindIn(sText + std::string("2\0Z 3", 5), "1"), "2") << nPadding;
        EXPECT_EQ(FindIn(sText + std::string("2\0Z 3", 5), "Z"), "kept") << nPadding;
    }
    // A search from every place anew would take hours.
    const std::string sRun(2'000'000, 'a');
    EXPECT_EQ(FindIn(sRun + "b 7", sRun.substr(sRun.size() / 2) + 'b'), "7");
}

TEST(BasicParser, SearchesAreIndependent) {
    const ScratchFolder oScratch;
    BasicParser oParser(oScratch.Write("file", "A 1 B 2"));
    BasicParser oOther(oScratch.Write("other", "A 3"));
    EXPECT_EQ(Find(oParser, "B"), "2");
    EXPECT_EQ(Find(oParser, "A"), "1");
    EXPECT_EQ(Find(oParser, "Z"), "kept");
    oOther = oParser;
    EXPECT_EQ(Find(oOther, "B"), "2");
    oOther = *&oOther;
    EXPECT_EQ(Find(oOther, "A"), "1");
    EXPECT_FALSE(std::is_default_constructible_v<BasicParser>);
    EXPECT_FALSE(std::is_copy_constructible_v<BasicParser>);
}

// What is read ends at the first zero byte: the file is never held.
TEST(BasicParser, FourGigabytes) {
    const ScratchFolder oScratch;
    const std::string sPath = oScratch.Write("file", "A 1\n");
    std::filesystem::resize_file(sPath, (std::uintmax_t{1} << 32) + 4);
    BasicParser oParser(sPath);
    EXPECT_EQ(Find(oParser, "A"), "1");
}

TEST(BasicParser, Failures) {
    const ScratchFolder oScratch;
    EXPECT_EQ(Failure(oScratch.Write("empty", "")), "File has 0 size");
    const std::string sCannotOpen = "Error when trying to open this file";
    const std::string sPipe = oScratch.Path("pipe");
    ASSERT_EQ(mkfifo(sPipe.c_str(), 0600), 0);
    const std::string sFile = oScratch.Write("file", "A 1");
    for (const std::string& sPath :
         {std::string(), oScratch.Path("nothing"), oScratch.Path(""), sPipe,
          sFile + std::string(1, '\0'), std::string(100'000, 'x'), std::string("/dev/zero")}) {
        EXPECT_EQ(Failure(sPath), sCannotOpen) << sPath.substr(0, 100);
    }
    std::filesystem::permissions(oScratch.GetPath(), std::filesystem::perms(0755));
    std::filesystem::permissions(sFile, std::filesystem::perms::none);
    EXPECT_TRUE(tests::AsOrdinaryUser([&] { return Failure(sFile) == sCannotOpen; }));
}

}  // namespace
}  // namespace vetra
