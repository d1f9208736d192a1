#include "vetra/faultcore/exceptions.h"

#include <gtest/gtest.h>

#include <type_traits>
#include <utility>
#include <vector>

namespace vetra {
namespace {

static_assert(std::is_convertible_v<FileException*, IOException*>);

// Throws an E at a fixed location. Expects it to arrive at its branch, with a text that holds the
// given parts in this order and the location last.
template <typename E, typename... Args>
void Check(const char* pszBranch, std::vector<std::string> asParts, Args... args) {
    static_assert(std::is_nothrow_copy_constructible_v<E> && std::is_nothrow_copy_assignable_v<E>);
    std::string sBranch;
    std::string sWhat;
    try {
        try {
            throw E(args..., "a.cpp", "void F()", 7);
        } catch (const std::exception& oCaught) {
            sWhat = oCaught.what();
            throw;
        }
    } catch (const DataException&) {
        sBranch = "data";
    } catch (const FileException& oCaught) {
        sBranch = "file " + oCaught.GetFileName();
    } catch (const IOException&) {
        sBranch = "io";
    } catch (const Exception&) {
        sBranch = "root";
    }
    EXPECT_EQ(sBranch, pszBranch) << sWhat;
    asParts.insert(asParts.end(), {"void F()", "a.cpp", "7"});
    std::size_t nPos = 0;
    for (const std::string& sPart : asParts) {
        nPos = sWhat.find(sPart, nPos);
        ASSERT_NE(nPos, std::string::npos) << sPart << " in " << sWhat;
        nPos += sPart.size();
    }
    EXPECT_EQ(nPos, sWhat.size()) << sWhat;
}

constexpr auto kRange = ParameterException::eOutOfRange;
constexpr auto kDelete = FileAccessException::eCannotDelete;

TEST(Exceptions, BranchAndText) {
    Check<Exception>("root", {"Msg"}, "Msg");
    Check<DataException>("data", {"Msg"}, "Msg");
    Check<ParameterException>("data", {"Msg", "nArg", "Got", "Want"}, "nArg", kRange, "Got", "Want",
                              "Msg");
    Check<DataTypeException>("data", {"Msg", "One", "Two"}, "One", "Two", "Msg");
    Check<FormatException>("data", {"Msg", "Got", "Want"}, "Got", "Msg", "Want");
    Check<DeviceException>("io", {"Msg"}, "Msg");
    Check<FileAccessException>("file x.tif", {"Msg", "x.tif"}, "x.tif", kDelete, "Msg");
    Check<FileNotFoundException>("file x.tif", {"Msg", "x.tif"}, "x.tif", "Msg");
}

TEST(Exceptions, EmptyPartsLeaveNoTrace) {
    EXPECT_STREQ(ParameterException("", kRange, "", "", "", "", "", 0).what(), "");
    EXPECT_STREQ(ParameterException("", kRange, "", "", "Msg", "", "", 0).what(), "Msg");
    EXPECT_STREQ(DataTypeException("", "", "Msg", "", "", 0).what(), "Msg");
    const std::string sWhat = ParameterException("nArg", kRange, "", "Want", "", "", "", 0).what();
    EXPECT_EQ(sWhat.find("got"), std::string::npos) << sWhat;
    EXPECT_NE(sWhat.front(), ';');
}

TEST(Exceptions, CopyKeepsAllPartsBeyondItsSource) {
    ParameterException oCopy("", kRange, "", "", "", "", "", 0);
    oCopy = ParameterException("nArg", ParameterException::eWrongLength, "Got", "Want", "Msg",
                               "a.cpp", "F", 7);
    EXPECT_EQ(oCopy.GetArgument(), "nArg");
    EXPECT_EQ(oCopy.GetType(), 8);
    EXPECT_EQ(oCopy.GetGot(), "Got");
    EXPECT_EQ(oCopy.GetExpected(), "Want");
    EXPECT_EQ(oCopy.GetMessage(), "Msg");
    EXPECT_EQ(oCopy.GetFile(), "a.cpp");
    EXPECT_EQ(oCopy.GetFunction(), "F");
    EXPECT_EQ(oCopy.GetLine(), 7u);
    EXPECT_EQ(FileAccessException("x", kDelete, "", "", "", 0).GetType(), 8);
}

}  // namespace
TEST(Exceptions, KeepTheirTextsWhenMovedFrom) {
    Exception oFrom("message", "file.cpp", "void f()", 7);
    const Exception oTo = std::move(oFrom);
    EXPECT_STREQ(oTo.what(), oFrom.what());
    EXPECT_EQ("message", oFrom.GetMessage());
}

}  // namespace vetra
