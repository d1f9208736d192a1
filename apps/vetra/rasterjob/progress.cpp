#include "rasterjob/progress.h"

#include <unistd.h>

#include <cmath>
#include <cstdio>
#include <string>

#include "vetra/textcore/formatstring.h"

namespace vetra::tool {

namespace {

constexpr int kBarWidth = 50;
// Before, an estimate would only jump.
constexpr double kFirstEstimateSeconds = 1.0;

std::string DescribeTimeLeft(double dfSeconds, double dfDone) {
    if (dfSeconds < kFirstEstimateSeconds || dfDone >= 1.0) {
        return "";
    }
    const long long nLeft = std::llround(dfSeconds * (1.0 - dfDone) / dfDone);
    return FormatString(", %lld:%02lld:%02lld left", nLeft / 3600, nLeft / 60 % 60, nLeft % 60);
}

}  // namespace

Progress::Progress(bool bQuiet)
    : mbShown(!bQuiet && isatty(STDERR_FILENO) != 0), moStart(std::chrono::steady_clock::now()) {}

Progress::~Progress() {
    if (mnPercent >= 0) {
        std::fputs(mnPercent == 100 ? "\n" : "\r\033[K", stderr);
    }
}

void Progress::StartPart(double dfEnd) {
    mdfPartStart = mdfPartEnd;
    mdfPartEnd = dfEnd;
}

void Progress::Show(double dfDone) {
    const double dfAll = mdfPartStart + (mdfPartEnd - mdfPartStart) * dfDone;
    const int nPercent = static_cast<int>(dfAll * 100.0);
    if (!mbShown || nPercent <= mnPercent) {
        return;
    }
    mnPercent = nPercent;
    const int nFilled = nPercent * kBarWidth / 100;
    const std::string sBar = std::string(static_cast<std::size_t>(nFilled), '#') +
                             std::string(static_cast<std::size_t>(kBarWidth - nFilled), '.');
    const std::chrono::duration<double> oTime = std::chrono::steady_clock::now() - moStart;
    std::fprintf(stderr, "\r[%s] %3d %%%s\033[K", sBar.c_str(), nPercent,
                 DescribeTimeLeft(oTime.count(), dfAll).c_str());
    std::fflush(stderr);
}

}  // namespace vetra::tool
