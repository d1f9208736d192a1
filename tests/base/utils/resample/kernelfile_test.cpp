#include "vetra/base/utils/resample/algorithm/kernelfile.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <climits>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <iomanip>
#include <iterator>
#include <random>
#include <sstream>
#include <stdexcept>
#include <string>
#include <typeinfo>
#include <utility>
#include <vector>

#include "tests/support/scratchfolder.h"
#include "vetra/base/utils/string/stringutils.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra {
namespace {

using tests::ScratchFolder;
using Weights = std::vector<double>;

const char* const kBadHeader =
    "Invalid input line format read from input file.|"
    "   Expected format: KernelSize,NumSubPixels OR NumCols,NumRows,NumSubPixels|located";
const char* const kBadLine =
    "Invalid input line format read from input file.|"
    "Expected format: numericValue_1,...,numericValue_KernelSize|located";
const char* const kBadCount =
    "data: Resampler kernel file does not have correct number of weights.|located";
const char* const kNegative = "length: vector<T> too long";

struct Loaded {
    int nCols = -7, nRows = -7, nSubPixels = -7;
    Weights vdfWeights{-7.0};
    std::string sFailure;  // class and texts

    bool operator==(const Loaded&) const = default;
};

void PrintTo(const Loaded& o, std::ostream* poOut) {
    *poOut << o.nCols << ' ' << o.nRows << ' ' << o.nSubPixels << ' ' << o.sFailure.substr(0, 300);
    for (std::size_t n = 0; n < std::min<std::size_t>(o.vdfWeights.size(), 20); ++n) {
        *poOut << ' ' << o.vdfWeights[n];
    }
}

std::string Location(const Exception& o) {
    const bool bFull = o.GetFile().find("vetra/") == 0 && o.GetLine() > 0 &&
                       o.GetFunction().find("KernelFile(std::") != std::string::npos;
    const bool bNone = o.GetFile().empty() && o.GetFunction().empty() && o.GetLine() == 0;
    return bFull ? "|located" : bNone ? "" : "|half located";
}

template <typename Call>
std::string FailureOf(Call fnCall) {
    try {
        fnCall();
        return "";
    } catch (const FileNotFoundException& o) {
        return "not found: " + o.GetFileName() + "|" + o.GetMessage() + Location(o);
    } catch (const DataTypeException& o) {
        return "type: " + o.GetGot() + "|" + o.GetExpected() + "|" + o.GetMessage() + Location(o);
    } catch (const FormatException& o) {
        return "format: " + o.GetGot() + "|" + o.GetMessage() + "|" + o.GetExpected() + Location(o);
    } catch (const DataException& o) {
        EXPECT_TRUE(typeid(o) == typeid(DataException));
        return "data: " + o.GetMessage() + Location(o);
    } catch (const std::length_error& o) {
        return std::string("length: ") + o.what();
    }
}

Loaded Load(const std::string& sFile) {
    Loaded o;
    o.sFailure =
        FailureOf([&] { LoadKernelFile(sFile, o.nCols, o.nRows, o.nSubPixels, o.vdfWeights); });
    return o;
}

Loaded LoadText(const std::string& sText) {
    const ScratchFolder oScratch;
    return Load(oScratch.Write("kernel", sText));
}

Weights Repeat(const Weights& vdf) {
    Weights vdfTwice = vdf;
    vdfTwice.insert(vdfTwice.end(), vdf.begin(), vdf.end());
    return vdfTwice;
}

TEST(KernelFile, SavedFilesAreRead) {
    const ScratchFolder oScratch;
    const std::string sFile = oScratch.Path("kernel");
    std::mt19937_64 oRandom(11);
    struct Size {
        int nCols, nRows, nSubPixels;
    };
    for (const Size& o : {Size{1, 1, 0}, {3, 0, 2}, {2, 5, 0}, {12, 7, 64}, {1, 40, 9}}) {
        const auto nPhases = static_cast<std::size_t>(o.nSubPixels + 1);
        const auto nCols = static_cast<std::size_t>(o.nCols);
        const auto nRows = static_cast<std::size_t>(o.nRows);
        Weights vdfWeights((nCols + nRows) * nPhases + 3);  // more are allowed
        for (double& df : vdfWeights) {
            df = std::ldexp(static_cast<double>(oRandom()) - 0x1p63,
                            static_cast<int>(oRandom() % 1000) - 560);
        }
        for (const bool bSingle : {false, true}) {
            const std::string sLabel = testing::PrintToString(o.nCols) + (bSingle ? " single" : "");
            SaveKernelFile(sFile, o.nCols, o.nRows, o.nSubPixels, vdfWeights, bSingle);
            const Loaded oLoaded = Load(sFile);
            EXPECT_EQ(oLoaded.sFailure, "") << sLabel;
            EXPECT_EQ(oLoaded.nCols, o.nCols) << sLabel;
            EXPECT_EQ(oLoaded.nRows, bSingle ? o.nCols : o.nRows) << sLabel;
            EXPECT_EQ(oLoaded.nSubPixels, o.nSubPixels) << sLabel;
            Weights vdfExpected = vdfWeights;
            vdfExpected.resize((nCols + (bSingle ? 0 : nRows)) * nPhases);
            vdfExpected = bSingle ? Repeat(vdfExpected) : vdfExpected;
            ASSERT_EQ(oLoaded.vdfWeights.size(), vdfExpected.size()) << sLabel;
            for (std::size_t n = 0; n < vdfExpected.size(); ++n) {
                EXPECT_NEAR(oLoaded.vdfWeights[n], vdfExpected[n], 5e-15 * std::abs(vdfExpected[n]))
                    << sLabel;
            }
        }
    }
}

TEST(KernelFile, FormAsWritten) {
    const ScratchFolder oScratch;
    const std::string sFile = oScratch.Write("kernel", std::string(1000, 'x'));
    Weights vdfWeights = {0.25, -1.0 / 3.0, 1e-300, -0.0, 1.0, 2.0, 0x1p70};
    SaveKernelFile(sFile, 2, 1, 1, vdfWeights, false);
    EXPECT_EQ(oScratch.Read("kernel"),
              "2,1,1\n"
              "2.50000000000000e-01,-3.33333333333333e-01\n"
              "1.00000000000000e-300,-0.00000000000000e+00\n"
              "1.00000000000000e+00\n"
              "2.00000000000000e+00\n");
    SaveKernelFile(sFile, 2, INT_MIN, 0, vdfWeights, true);
    EXPECT_EQ(oScratch.Read("kernel"), "2,0\n2.50000000000000e-01,-3.33333333333333e-01\n");

    // A stream gets the same text, whatever its own format.
    std::ostringstream oText;
    oText << std::hex << std::fixed << std::setw(40);
    SaveKernelFile(oText, 2, 1, 1, std::as_const(vdfWeights), true);
    EXPECT_EQ(oText.str(),
              "2,1\n2.50000000000000e-01,-3.33333333333333e-01\n"
              "1.00000000000000e-300,-0.00000000000000e+00\n");
    EXPECT_EQ(FailureOf([&] { SaveKernelFile(oText, 8, 0, 0, vdfWeights, true); }),
              "data: Kernel buffer has incorrect number of weights.|located");

    // Refused before the file is touched.
    const std::string sBefore = oScratch.Read("kernel");
    struct Size {
        int nCols, nRows, nSubPixels;
        bool bSingle;
    };
    for (const Size& o : {Size{2, 1, 2, false},
                          {8, 0, 0, true},
                          {4, 4, 0, false},
                          {0, 1, 0, false},
                          {-5, 6, 0, false},
                          {5, -1, 0, false},
                          {1, 1, -1, false},
                          {-1, -1, -2, false},
                          {INT_MAX, INT_MAX, INT_MAX, false},
                          {65536, 0, 65535, true},
                          {1, 0, INT_MIN, true}}) {
        EXPECT_EQ(FailureOf([&] {
                      SaveKernelFile(sFile, o.nCols, o.nRows, o.nSubPixels, vdfWeights, o.bSingle);
                  }),
                  "data: Kernel buffer has incorrect number of weights.|located")
            << o.nCols << ' ' << o.nRows << ' ' << o.nSubPixels;
    }
    // Not reported.
    for (const std::string& s :
         {oScratch.Path("none/kernel"), oScratch.GetPath().string(), std::string(), sFile + '\0'}) {
        EXPECT_NO_THROW(SaveKernelFile(s, 1, 1, 0, vdfWeights, false));
    }
    EXPECT_EQ(oScratch.Read("kernel"), sBefore);
}

TEST(KernelFile, FormsThatAreRead) {
    const Loaded oShort = {2, 2, 1, {1, 2, 3, 4, 1, 2, 3, 4}, ""};
    for (const char* psz : {"2,1\n1,2\n3,4\n", "2,1\r\n1,2\r\n\r\n3,4\r\n", "2,1\n1,2,3,4",
                            ",2,,1,\n,1,,2,\n,\n3\n4,\n", "2,1\n\n#x\n \t\n1,2,3,\n#1\n4\n# end",
                            "2,1\n \t1 , 2 \n3,4 , \n , \n", " 2x,+1.9\n1.,+2\n0.03E2,400e-2\n",
                            "2,1\n10D-1,.2d+1,3.D0,4\n"}) {
        EXPECT_EQ(LoadText(psz), oShort) << psz;
    }
    EXPECT_EQ(LoadText("2,1,0\n1\n2\n3\n"), (Loaded{2, 1, 0, {1, 2, 3}, ""}));
    EXPECT_EQ(LoadText("x,5\n"), (Loaded{0, 0, 5, {}, ""}));
    // What the sizes mean is not looked at here.
    EXPECT_EQ(LoadText("-2,-2\n1,2\n"), (Loaded{-2, -2, -2, {1, 2, 1, 2}, ""}));
    EXPECT_EQ(LoadText("-1,3,0\n.,1e999\n"), (Loaded{-1, 3, 0, {0, HUGE_VAL}, ""}));
}

TEST(KernelFile, Failures) {
    const ScratchFolder oScratch;
    const std::string sNone = oScratch.Path("none");
    for (const std::string& s : {sNone, oScratch.GetPath().string(), sNone + '\0'}) {
        EXPECT_EQ(Load(s), (Loaded{-7, -7, -7, {}, "not found: " + s + "|File not found|located"}));
    }
    mkfifo(oScratch.Path("pipe").c_str(), 0600);
    for (const std::string& s : {oScratch.Path("pipe"), std::string("/dev/zero")}) {
        EXPECT_EQ(Load(s), (Loaded{-7, -7, -7, {}, "type: ||Invalid stream"})) << s;
    }

    for (const std::string& s : {std::string(), std::string("# comment"), std::string("4"),
                                 std::string("1,2,3,4"), std::string(",,"), std::string("8,"),
                                 std::string("\"8,64\""), std::string(60'000, ',')}) {
        for (const char* pszEnd : {"\n1,2\n", "\r\n1,2\n", ""}) {
            EXPECT_EQ(LoadText(s + pszEnd),
                      (Loaded{0, 0, 0, {}, "format: " + s + '|' + kBadHeader}))
                << s;
        }
    }
    for (const char* psz : {"1,x", "1,2 # no", "1, ,2", "1,\"2\"", "1,\"2,3\"", "1,2;3", "1,0x10",
                            "1,nan", "1,-inf", "1,1 2"}) {
        EXPECT_EQ(LoadText("2,1,2\n7\n \t" + std::string(psz) + " \r\n8\n"),
                  (Loaded{2, 1, 2, {7, 1}, "format: " + std::string(psz) + '|' + kBadLine}));
    }
    EXPECT_EQ(LoadText("2,0\n #1\n").sFailure, std::string("format: #1|") + kBadLine);
    EXPECT_EQ(LoadText(std::string("2,0\n1\0\n", 7)).sFailure,
              std::string("format: 1\0|", 11) + kBadLine);

    EXPECT_EQ(LoadText("3,0\n1,2\n"), (Loaded{3, 0, 0, {1, 2}, kBadCount}));
    EXPECT_EQ(LoadText("3,0\n1,2\n3,4,5\n"), (Loaded{3, 0, 0, {1, 2, 3}, kBadCount}));
    // A line that is no number comes before the count, wherever it stands.
    EXPECT_EQ(LoadText("1,0\n1,2\n3,x\n"),
              (Loaded{1, 0, 0, {1}, std::string("format: 3,x|") + kBadLine}));
}

TEST(KernelFile, HeadersThatPromiseTooMuch) {
    EXPECT_EQ(LoadText("-1,0\nx\n"), (Loaded{-1, 0, 0, {}, kNegative}));
    EXPECT_EQ(LoadText("1,2,-2\n"), (Loaded{1, 2, -2, {}, kNegative}));
    EXPECT_EQ(LoadText("-2147483648,-2147483648,2147483647\n"),
              (Loaded{INT_MIN, INT_MIN, INT_MAX, {}, kNegative}));
    // More than any vector holds.
    EXPECT_EQ(LoadText("2147483647,2147483647,2147483647\n1\n"),
              (Loaded{INT_MAX, INT_MAX, INT_MAX, {}, kNegative}));
    // Much, but not too much for a vector; as a 32-bit product these would be 0,
    // 1 and 65536.
    EXPECT_EQ(LoadText("65536,65535\n"), (Loaded{65536, 0, 65535, {}, kBadCount}));
    EXPECT_EQ(LoadText("641,0,6700416\n1\n"), (Loaded{641, 0, 6700416, {1}, kBadCount}));
    EXPECT_EQ(LoadText("65536,65536\n1\n"), (Loaded{65536, 0, 65536, {1}, kBadCount}));
    EXPECT_EQ(LoadText("99999999999,0\n1\n"), (Loaded{INT_MAX, 0, 0, {1}, kBadCount}));
    EXPECT_EQ(LoadText("-99999999999,0\n1\n"), (Loaded{INT_MIN, 0, 0, {}, kNegative}));
}

TEST(KernelFile, LongLinesAndRubbish) {
    constexpr std::size_t kNumbers = 500'000;
    std::string sLine;
    for (std::size_t n = 0; n < kNumbers; ++n) {
        sLine += std::to_string(n % 7) + ',';
    }
    const std::string sComment = '#' + std::string(3'000'000, ',') + '\n';
    const Loaded oLoaded = LoadText("500000,0\n" + sComment + sLine);
    EXPECT_EQ(oLoaded.sFailure, "");
    ASSERT_EQ(oLoaded.vdfWeights.size(), 2 * kNumbers);
    EXPECT_EQ(oLoaded.vdfWeights[kNumbers - 1], static_cast<double>((kNumbers - 1) % 7));
    EXPECT_EQ(LoadText("3,0\n" + sLine), (Loaded{3, 0, 0, {0, 1, 2}, kBadCount}));
    EXPECT_EQ(LoadText("1,0\n" + sLine + 'x').sFailure,
              "format: " + sLine.substr(0, 65536) + "...|" + kBadLine);

    // A tebibyte of zero bytes, without a line end.
    const ScratchFolder oScratch;
    const std::string sZeros(65536, '\0');
    for (const std::string& sStart :
         {std::string(), std::string("1,0\n"), std::string("1,0\n1,")}) {
        const std::string sFile = oScratch.Write("zeros", sStart);
        std::filesystem::resize_file(sFile, std::uintmax_t{1} << 40);
        const std::string sShown = sStart.size() < 5 ? sZeros : "1," + sZeros.substr(2);
        EXPECT_EQ(Load(sFile).sFailure,
                  "format: " + sShown + "...|" + (sStart.empty() ? kBadHeader : kBadLine));
    }

    std::mt19937 oRandom(12);
    std::string sRubbish(1'000'000, ' ');
    for (int nCase = 0; nCase < 20; ++nCase) {
        for (char& c : sRubbish) {
            c = static_cast<char>(oRandom());
        }
        EXPECT_EQ(LoadText("5,7\n" + sRubbish).sFailure.substr(0, 7), "format:");
        EXPECT_NE(LoadText(sRubbish).sFailure, "");
    }
}

// The rules, line by line.
Loaded PlainLoad(const std::string& sText) {
    Loaded o;
    std::istringstream oStream(sText);
    std::string sLine;
    std::getline(oStream, sLine);
    const std::vector<std::string> vsHeader = TokenizeString(sLine, ",", true, true);
    o.nCols = std::atoi(vsHeader[0].c_str());
    o.nRows = vsHeader.size() == 2 ? 0 : std::atoi(vsHeader[1].c_str());
    o.nSubPixels = std::atoi(vsHeader.back().c_str());
    o.vdfWeights.clear();
    const auto nTotal = static_cast<std::size_t>((o.nCols + o.nRows) * (o.nSubPixels + 1));
    std::size_t nCount = 0;
    while (!oStream.eof()) {
        std::getline(oStream, sLine);
        if (sLine.empty() || sLine[0] == '#') {
            continue;
        }
        sLine = TrimWhitespace(sLine);
        for (std::string sField : TokenizeString(sLine, ",", true, true)) {
            if (!IsNumeric(sField)) {
                o.sFailure = "format: " + sLine + '|' + kBadLine;
                return o;
            }
            if (nCount++ < nTotal) {
                std::replace(sField.begin(), sField.end(), 'D', 'E');
                o.vdfWeights.push_back(std::atof(sField.c_str()));
            }
        }
    }
    if (nCount != nTotal) {
        o.sFailure = kBadCount;
    } else if (vsHeader.size() == 2) {
        o.nRows = o.nCols;
        o.vdfWeights = Repeat(o.vdfWeights);
    }
    return o;
}

TEST(KernelFile, AnyTextAsLineByLine) {
    const char* const apszPieces[] = {"1",  "-2.5", "3e1", "1D2", ".",  "x",  ",",  ",",
                                      ",",  ",",    ",",   ",",   " ",  "\t", "\n", "\n",
                                      "\n", "\r\n", "\r",  "#",   "\"", "4",  "5",  "6"};
    const char* const apszHeaders[] = {"1,1",   "1,0",   "2,0", "1,1,0",
                                       "1,0,1", "1,2,0", "2,1", "0,9"};
    const ScratchFolder oScratch;
    std::mt19937 oRandom(13);
    int nRead = 0;
    for (int nCase = 0; nCase < 4'000; ++nCase) {
        std::string sText = apszHeaders[oRandom() % std::size(apszHeaders)];
        sText += '\n';
        for (std::size_t nPieces = oRandom() % 12; nPieces > 0; --nPieces) {
            sText += apszPieces[oRandom() % std::size(apszPieces)];
        }
        const Loaded oLoaded = Load(oScratch.Write(std::to_string(nCase), sText));
        ASSERT_EQ(oLoaded, PlainLoad(sText)) << testing::PrintToString(sText);
        nRead += oLoaded.sFailure.empty() && !oLoaded.vdfWeights.empty();
    }
    EXPECT_GT(nRead, 200);
}

}  // namespace
}  // namespace vetra
