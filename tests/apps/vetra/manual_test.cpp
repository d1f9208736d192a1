// The manual page and the completion know what the tool's help shows.

#include <fstream>
#include <regex>
#include <sstream>

#include "tests/apps/vetra/tooltest.h"
#include "vetra/base/utils/resample/resamplerfactory.h"

namespace {

using Names = std::set<std::string>;

constexpr const char* kPage = VETRA_SHARE "/man/man1/vetra.1";

Names Split(const std::string& sText) {
    std::istringstream oText(sText);
    return {std::istream_iterator<std::string>(oText), {}};
}

// What a pattern's first group finds, once for each line that begins with the pattern. The second
// group is another name.
Names FindInLines(const std::string& sText, const std::string& sPattern) {
    const std::regex oPattern("^" + sPattern);
    Names oNames;
    std::istringstream oText(sText);
    for (std::string sLine; std::getline(oText, sLine);) {
        std::smatch oMatch;
        if (std::regex_search(sLine, oMatch, oPattern)) {
            for (std::size_t n = 1; n < oMatch.size(); ++n) {
                if (oMatch[n].matched) {
                    oNames.insert(oMatch[n]);
                }
            }
        }
    }
    return oNames;
}

// The options that the page lists under headings with a command's name.
Names FindInPage(const std::string& sCommand) {
    std::ifstream oPage(kPage);
    Names oOptions;
    bool bInside = false;
    for (std::string sLine; std::getline(oPage, sLine);) {
        if (sLine.rfind(".S", 0) == 0) {
            bInside = sLine.rfind(".Ss", 0) == 0 && Split(sLine).count(sCommand) != 0;
        } else if (bInside && sLine.rfind(".It Fl", 0) == 0) {
            const std::regex oFlag("Fl (-?[a-z-]+)");
            for (std::sregex_iterator it(sLine.begin(), sLine.end(), oFlag), itEnd; it != itEnd;
                 ++it) {
                oOptions.insert(std::string("-").append(it->str(1)));
            }
        }
    }
    return oOptions;
}

TEST_F(ToolTest, ManualAndCompletionKnowAllThatHelpShows) {
    std::ofstream(Path("complete.sh")) << "source " VETRA_SHARE
                                          "/completion/vetra.bash\n"
                                          "COMP_WORDS=(\"$@\"); COMP_CWORD=$(($# - 1)); _vetra\n"
                                          "printf '%s\\n' \"${COMPREPLY[@]}\"\n";
    const auto Complete = [this](const std::string& sLine) {
        return Split(Run(sLine, "bash complete.sh").sOut);
    };

    const std::string sHelp = Run("--help").sOut;
    const Names oCommands =
        FindInLines(sHelp.substr(sHelp.find("Subcommands:")), " {2}([a-z]+) .*");
    EXPECT_GE(oCommands.size(), 3u);
    EXPECT_EQ(Complete("''"), oCommands);
    for (const std::string& sCommand : oCommands) {
        Names oOptions =
            FindInLines(Run(sCommand + " --help").sOut, " {2,4}(?:(-[a-z]),)?(--[a-z-]+)(?: |$)");
        EXPECT_EQ(Complete(sCommand + " -"), oOptions) << sCommand;
        EXPECT_EQ(oOptions.erase("-h") + oOptions.erase("--help"), 2u) << sCommand;
        EXPECT_EQ(FindInPage(sCommand), oOptions) << sCommand;
    }

    Names oMethods;
    for (int n = eRM_BILIN; n < eRM_CUSTOM; ++n) {
        oMethods.insert(
            vetra::utils::ResamplerFactory::MethodToName(static_cast<ResampleMethod>(n)));
    }
    EXPECT_EQ(Complete("resample --method ''"), oMethods);
    EXPECT_EQ(Complete("kernel ''"), oMethods);
    EXPECT_EQ(Complete("resample --method = SQC"), (Names{"SQCUBIC", "SQCUBICPS"}));
    EXPECT_EQ(Complete("resample --type C"), (Names{"C16S", "C32S", "C32R", "C64R"}));
}

TEST_F(ToolTest, ManualIsWellFormed) {
    for (const std::string sCheck : {"mandoc -Tlint -W warning", "man --warnings -Tutf8 -l"}) {
        const std::string sProgram = sCheck.substr(0, sCheck.find(' '));
        const std::string sBefore = std::string("command -v ") + sProgram +
                                    " >/dev/null || exit 0; " + sCheck + " " + kPage +
                                    " 2>warnings >page; exit; ";
        EXPECT_EQ(Run("", sBefore).nStatus, 0) << sCheck;
        std::ifstream oWarnings(Path("warnings"));
        EXPECT_EQ(std::string(std::istreambuf_iterator<char>(oWarnings), {}), "") << sCheck;
    }
}

}  // namespace
