#include "vetra/base/utils/resample/engine/path.h"

#include <cmath>

namespace vetra::utils::engine {

namespace {

// More than that is not kept.
constexpr double kMostBytes = 64.0 * 1024 * 1024;

// Whether no sum of a strip can be too large to be a whole number in double.
bool SumsAreExact(const Task& oTask, const PathFacts& oFacts) {
    if (oTask.nSrcType >= gobs::eDT_32R) {
        return false;  // floating, or 64 bits
    }
    const double dfGreatest = std::ldexp(1.0, 8 * kSampleBytes[oTask.nSrcType]);
    return dfGreatest * oTask.poMethod->oWindow.nRows * static_cast<double>(oFacts.nStripSrcCols) <=
           0x1p53;
}

PathChoice ChooseByMethod(const Task& oTask, const PathFacts& oFacts) {
    const Method& oMethod = *oTask.poMethod;
    if (oMethod.eValues == eVR_NONE) {
        return {Path::eColumns, "nearest samples need no rows"};
    }
    if (oFacts.poRows == nullptr || oFacts.poRows->pfnValues == nullptr) {
        return {Path::eColumns, "the method doesn't work on rows"};
    }
    if (oMethod.eValues == eVR_BILINEAR) {
        return {Path::eColumns, "four samples are read sooner from the source than from rows"};
    }
    if (oFacts.bReduces) {
        return {Path::eColumns, "rows would hold mostly samples that nobody reads"};
    }
    if (oMethod.eValues == eVR_AVERAGE && SumsAreExact(oTask, oFacts)) {
        return {Path::eSums, "sums of integers are exact in any order"};
    }
    if (oMethod.eValues / 2 == eVR_MEDIAN / 2 && oFacts.bUnitSteps && oTask.nChan == 1 &&
        oFacts.pfnMedians != nullptr &&
        static_cast<double>(oMethod.oWindow.nCols) * oMethod.oWindow.nRows <= kMostMedianSamples) {
        return {Path::eMedians, "windows of small integers are neighbours"};
    }
    if (oFacts.poRows->pfnAcross != nullptr) {
        return {Path::eFilteredRows, "a separable method filters each source row once"};
    }
    return {Path::eRows, "each sample becomes a double once"};
}

}  // namespace

double GetKeptBytes(const Task& oTask, const PathFacts& oFacts, Path ePath) {
    const Window& oWindow = oTask.poMethod->oWindow;
    const double dfDoubles = sizeof(double) * static_cast<double>(oTask.nChan);
    const double dfSrcCols = static_cast<double>(oFacts.nStripSrcCols);
    switch (ePath) {
        case Path::eRows:
            return dfDoubles * dfSrcCols * oWindow.nRows;
        case Path::eFilteredRows:
            return dfDoubles * oFacts.nStripCols * oWindow.nRows +
                   (oFacts.poRows->bTabulated
                        ? static_cast<double>(sizeof(double)) * oFacts.nStripCols * oWindow.nCols
                        : 0.0);
        case Path::eSums:
            return 2 * dfDoubles * dfSrcCols;
        default:
            return 0.0;
    }
}

PathChoice ChoosePath(const Task& oTask, const PathFacts& oFacts) {
    PathChoice oChoice = ChooseByMethod(oTask, oFacts);
    if (oTask.oOptions.ePath == Path::eColumns) {
        oChoice = {Path::eColumns, "asked for"};
    }
    // Narrower strips keep less.
    if (oFacts.nStripCols <= kSpanPixels &&
        GetKeptBytes(oTask, oFacts, oChoice.ePath) > kMostBytes) {
        oChoice = {Path::eColumns, "rows would be too large to be kept"};
    }
    return oChoice;
}

const char* GetPathName(Path ePath) {
    switch (ePath) {
        case Path::eBest:
            return "best";
        case Path::ePlain:
            return "plain";
        case Path::eColumns:
            return "columns";
        case Path::eRows:
            return "rows";
        case Path::eFilteredRows:
            return "filtered rows";
        case Path::eSums:
            return "sums";
        case Path::eMedians:
            return "medians";
    }
    return "";
}

}  // namespace vetra::utils::engine
