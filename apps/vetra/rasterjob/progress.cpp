#include "rasterjob/progress.h"

#include <cpl_progress.h>
#include <unistd.h>

#include <cstdio>
#include <string>

namespace vetra::tool {

namespace {

constexpr int kBarWidth = 50;

}  // namespace

Progress::Progress(bool bQuiet) : mbQuiet(bQuiet), mbTerminal(isatty(STDERR_FILENO) != 0) {}

Progress::~Progress() {
    if (mnPercent < 0) {
        return;
    }
    if (mbTerminal) {
        std::fputs(mnPercent == 100 ? "\n" : "\r\033[K", stderr);
    } else if (mnPercent < 100) {
        std::fputs("\n", stdout);
        std::fflush(stdout);
    }
}

void Progress::Show(double dfDone) {
    const int nPercent = static_cast<int>(dfDone * 100.0);
    if (mbQuiet || nPercent <= mnPercent) {
        return;
    }
    mnPercent = nPercent;
    if (!mbTerminal) {
        GDALTermProgress(dfDone, nullptr, nullptr);
        return;
    }
    const int nFilled = nPercent * kBarWidth / 100;
    const std::string sBar = std::string(static_cast<std::size_t>(nFilled), '#') +
                             std::string(static_cast<std::size_t>(kBarWidth - nFilled), '.');
    std::fprintf(stderr, "\r[%s] %3d %%", sBar.c_str(), nPercent);
    std::fflush(stderr);
}

}  // namespace vetra::tool
