// Code and output in the pages are those of the programs in examples/, which are built and run.

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <map>
#include <optional>
#include <regex>
#include <string>
#include <vector>

#include "tests/support/scratchfolder.h"

namespace vetra::tests {
namespace {

namespace fs = std::filesystem;
using Lines = std::vector<std::string>;

const fs::path kSource = VETRA_SOURCE_DIR;

std::string WithoutEnd(std::string sLine) {
    sLine.erase(sLine.find_last_not_of(" \r\n") + 1);
    return sLine;
}

Lines ReadLines(const fs::path& oFile) {
    std::ifstream oStream(oFile);
    Lines oLines;
    for (std::string sLine; std::getline(oStream, sLine);) {
        oLines.push_back(WithoutEnd(sLine));
    }
    EXPECT_FALSE(oLines.empty()) << oFile;
    return oLines;
}

// A fenced block, and the comment in the line above it.
struct Block {
    std::string sPlace;
    std::string sMark;
    std::string sLanguage;
    Lines oLines;
};

std::vector<Block> ReadBlocks() {
    std::vector<fs::path> oPages = {kSource / "README.md"};
    for (const auto& oEntry : fs::directory_iterator(kSource / "docs")) {
        // The recipe for a new method stands inside the engine.
        if (oEntry.path().extension() == ".md" && oEntry.path().filename() != "architecture.md") {
            oPages.push_back(oEntry.path());
        }
    }
    std::vector<Block> oBlocks;
    for (const fs::path& oPage : oPages) {
        const Lines oLines = ReadLines(oPage);
        for (std::size_t n = 0; n < oLines.size(); ++n) {
            if (oLines[n].rfind("```", 0) != 0) {
                continue;
            }
            Block oBlock{oPage.filename().string() + ":" + std::to_string(n + 1),
                         n > 0 ? oLines[n - 1] : "",
                         oLines[n].substr(3),
                         {}};
            while (++n < oLines.size() && oLines[n] != "```") {
                oBlock.oLines.push_back(oLines[n]);
            }
            oBlocks.push_back(oBlock);
        }
    }
    return oBlocks;
}

// The lines between two lines "// [part]", without the indentation that they share.
std::optional<Lines> ReadPart(const std::string& sProgram, const std::string& sPart) {
    const std::regex oMark(" *// \\[" + sPart + "\\]");
    const auto IsMark = [&oMark](const std::string& s) { return std::regex_match(s, oMark); };
    const Lines oLines = ReadLines(kSource / "examples" / (sProgram + ".cpp"));
    const auto itFirst = std::find_if(oLines.begin(), oLines.end(), IsMark);
    if (itFirst == oLines.end()) {
        return std::nullopt;
    }
    const auto itLast = std::find_if(itFirst + 1, oLines.end(), IsMark);
    if (itLast == oLines.end()) {
        return std::nullopt;
    }
    Lines oPart(itFirst + 1, itLast);
    std::size_t nIndent = std::string::npos;
    for (const std::string& sLine : oPart) {
        nIndent = std::min(nIndent, sLine.find_first_not_of(' '));
    }
    for (std::string& sLine : oPart) {
        sLine.erase(0, nIndent);
    }
    return oPart;
}

Lines RunProgram(const std::string& sProgram) {
    const ScratchFolder oFolder;
    const std::string sCommand = "cd '" + oFolder.GetPath().string() +
                                 "' && '" VETRA_EXAMPLES_DIR "/example_" + sProgram + "'";
    std::FILE* poPipe = popen(sCommand.c_str(), "r");
    Lines oLines;
    if (poPipe != nullptr) {
        std::array<char, 4096> szLine;
        while (std::fgets(szLine.data(), static_cast<int>(szLine.size()), poPipe) != nullptr) {
            oLines.push_back(WithoutEnd(szLine.data()));
        }
        EXPECT_EQ(pclose(poPipe), 0) << sCommand;
    }
    return oLines;
}

TEST(Guide, CodeIsThatOfThePrograms) {
    const std::regex oMark("<!-- ([a-z_]+)\\.cpp: ([a-z]+) -->");
    int nBlocks = 0;
    for (const Block& oBlock : ReadBlocks()) {
        if (oBlock.sLanguage != "cpp") {
            continue;
        }
        ++nBlocks;
        std::smatch oParts;
        if (!std::regex_match(oBlock.sMark, oParts, oMark)) {
            ADD_FAILURE() << oBlock.sPlace << " doesn't say which program the code is from";
            continue;
        }
        const std::optional<Lines> oPart = ReadPart(oParts[1], oParts[2]);
        ASSERT_TRUE(oPart) << oBlock.sPlace << ": no such part of the program";
        EXPECT_EQ(oBlock.oLines, *oPart) << oBlock.sPlace;
    }
    EXPECT_GE(nBlocks, 15);
}

TEST(Guide, OutputIsThatOfThePrograms) {
    const std::regex oMark("<!-- output of ([a-z_]+) -->");
    std::map<std::string, Lines> oOutputs;
    for (const Block& oBlock : ReadBlocks()) {
        std::smatch oParts;
        if (!std::regex_match(oBlock.sMark, oParts, oMark)) {
            continue;
        }
        const auto [itOutput, bNew] = oOutputs.try_emplace(oParts[1]);
        if (bNew) {
            itOutput->second = RunProgram(oParts[1]);
        }
        const Lines& oOutput = itOutput->second;
        EXPECT_NE(
            std::search(oOutput.begin(), oOutput.end(), oBlock.oLines.begin(), oBlock.oLines.end()),
            oOutput.end())
            << oBlock.sPlace << ": the program prints something else, "
            << testing::PrintToString(oOutput);
    }
    EXPECT_GE(oOutputs.size(), 7u);
}

}  // namespace
}  // namespace vetra::tests
