#include "vetra/base/utils/resample/engine/rowcache.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>

namespace vetra::utils::engine {

namespace {

constexpr int kWidestStrip = 2048;
static_assert(kWidestStrip % kSpanPixels == 0);
// What a thread keeps should fit into a part of the second-level cache.
constexpr double kCacheBytes = 512.0 * 1024;
// More than that is not kept at all.
constexpr double kMostBytes = 64.0 * 1024 * 1024;
// Source columns per target column beyond which rows hold too much that nobody reads.
constexpr int kMostReduction = 8;

// The row of the table that computes a method from rows of doubles. Where samples are replaced,
// which depends on the pixel, only the windows without any come from rows.
int RowIndex(const Method& oMethod) {
    return (oMethod.eRule == ModeRule::eReplacingWindow ? PlainRow(oMethod) : oMethod.eValues) / 2;
}

}  // namespace

RowPlan::RowPlan(const Task& oTask, const LevelStages& oStages, const ColumnTables& oColumns) {
    const Method& oMethod = *oTask.poMethod;
    if (oMethod.eValues == eVR_NONE || oMethod.eValues == eVR_CPLXSAR) {
        return;
    }
    mpoStages = &oStages;
    mpoRows = &oStages.aoRows[RowIndex(oMethod)];
    mbSquared = oMethod.eValues % 2 == 1;
    mpadfFracCol = oColumns.vdfFrac.data();
    for (int nCols = kWidestStrip; nCols >= kSpanPixels; nCols /= 2) {
        MakeStrips(oTask, oColumns, nCols);
        meKind = ChooseKind(oTask);
        if (meKind == RowKind::eNone || GetRowBytes(oTask) <= kCacheBytes) {
            return;
        }
    }
    if (GetRowBytes(oTask) > kMostBytes) {
        meKind = RowKind::eNone;
    }
}

RowKind RowPlan::ChooseKind(const Task& oTask) const {
    const Method& oMethod = *oTask.poMethod;
    // Four samples are read sooner from the source than from rows that are made first, unless they
    // are roots.
    if (mpoRows->pfnValues == nullptr || mbReduces || oMethod.eValues == eVR_BILINEAR) {
        return RowKind::eNone;
    }
    if (oMethod.eValues == eVR_AVERAGE && SumsAreExact(oTask)) {
        return RowKind::eSums;
    }
    if (oMethod.eValues / 2 == eVR_MEDIAN / 2 && mbUnitSteps && oTask.nChan == 1 &&
        mpoStages->apfnMedians[oTask.nSrcType] != nullptr &&
        static_cast<double>(oMethod.oWindow.nCols) * oMethod.oWindow.nRows <= kMostMedianSamples) {
        return RowKind::eMedians;
    }
    return mpoRows->pfnAcross != nullptr ? RowKind::eFiltered : RowKind::eDoubles;
}

// Whether no sum of a strip can be too large to be a whole number in double.
bool RowPlan::SumsAreExact(const Task& oTask) const {
    if (oTask.nSrcType >= gobs::eDT_32R) {
        return false;  // floating, or 64 bits
    }
    const double dfGreatest = std::ldexp(1.0, 8 * kSampleBytes[oTask.nSrcType]);
    return dfGreatest * oTask.poMethod->oWindow.nRows * static_cast<double>(mnWidest) <= 0x1p53;
}

// Of all that a thread keeps.
double RowPlan::GetRowBytes(const Task& oTask) const {
    const double dfDoubles = sizeof(double) * static_cast<double>(oTask.nChan);
    const double dfWidest = static_cast<double>(mnWidest);
    switch (meKind) {
        case RowKind::eDoubles:
            return dfDoubles * dfWidest * oTask.poMethod->oWindow.nRows;
        case RowKind::eFiltered:
            return dfDoubles * mnStripCols * oTask.poMethod->oWindow.nRows +
                   (mpoRows->bTabulated ? sizeof(double) * static_cast<double>(mnStripCols) *
                                              oTask.poMethod->oWindow.nCols
                                        : 0.0);
        case RowKind::eSums:
            return 2 * dfDoubles * dfWidest;
        case RowKind::eMedians:
        case RowKind::eNone:
            break;
    }
    return 0.0;
}

void RowPlan::MakeStrips(const Task& oTask, const ColumnTables& oColumns, int nStripCols) {
    const int nWndCols = oTask.poMethod->oWindow.nCols;
    mnStripCols = nStripCols;
    mnWidest = 0;
    mbReduces = false;
    mbUnitSteps = true;
    mvoStrips.clear();
    mvoGroups.assign(static_cast<std::size_t>(oTask.nTgtCols) / kLanes + 1, PickGroup{});
    for (int nFirst = 0; nFirst < oTask.nTgtCols; nFirst += nStripCols) {
        Strip oStrip;
        oStrip.nFirstCol = nFirst;
        oStrip.nNumCols = std::min(nStripCols, oTask.nTgtCols - nFirst);
        std::int64_t nSrcLast = -1;
        const auto fnFits = [&](int nCol) {
            return nCol < nFirst + oStrip.nNumCols &&
                   (oColumns.vbyClass[static_cast<std::size_t>(nCol)] & kClassFits) != 0;
        };
        const auto fnSrcCol = [&](int nCol) {
            return oColumns.vnWindowCol[static_cast<std::size_t>(nCol)];
        };
        for (int i = nFirst; i < nFirst + oStrip.nNumCols; ++i) {
            if (fnFits(i)) {
                const std::int64_t n = fnSrcCol(i);
                if (nSrcLast < 0) {
                    oStrip.nSrcFirst = n;
                    oStrip.nFitFirst = i;
                }
                mbUnitSteps = mbUnitSteps && n - oStrip.nSrcFirst == i - oStrip.nFitFirst;
                oStrip.nSrcFirst = std::min(n, oStrip.nSrcFirst);
                nSrcLast = std::max(nSrcLast, n + nWndCols - 1);
                ++oStrip.nFitCount;
            }
        }
        if (nSrcLast >= 0) {
            oStrip.nSrcCount = nSrcLast - oStrip.nSrcFirst + 1;
        }
        mbReduces = mbReduces || oStrip.nSrcCount > std::int64_t{kMostReduction} * oStrip.nNumCols +
                                                        nWndCols + kLanes;
        for (int i = nFirst; i < nFirst + oStrip.nNumCols; i += kLanes) {
            PickGroup& oGroup = mvoGroups[static_cast<std::size_t>(i / kLanes)];
            std::int64_t nLeast = -1;
            for (int k = i; k < i + kLanes; ++k) {
                if (fnFits(k) && (nLeast < 0 || fnSrcCol(k) < nLeast)) {
                    nLeast = fnSrcCol(k);
                }
            }
            oGroup.nFirst = nLeast < 0 ? 0 : nLeast - oStrip.nSrcFirst;
            oGroup.bNear = true;
            for (int k = 0; k < kLanes; ++k) {
                oGroup.anOffset[k] = fnFits(i + k) ? fnSrcCol(i + k) - nLeast : 0;
                oGroup.bNear = oGroup.bNear && oGroup.anOffset[k] + kNearColumns <= kNearReach;
            }
        }
        mnWidest = std::max(mnWidest, oStrip.nSrcCount);
        mvoStrips.push_back(oStrip);
    }
}

RowCache::RowCache(const Task& oTask, const RowPlan& oPlan)
    : moTask(oTask),
      moPlan(oPlan),
      moMethod(*oTask.poMethod),
      mnRows(static_cast<std::size_t>(moMethod.oWindow.nRows)) {
    const std::size_t nChan = static_cast<std::size_t>(oTask.nChan);
    const std::size_t nWndCols = static_cast<std::size_t>(moMethod.oWindow.nCols);
    const std::size_t nSamples = static_cast<std::size_t>(oPlan.mnWidest) + kNearReach;
    const std::size_t nStripCols = static_cast<std::size_t>(oPlan.mnStripCols) + kLanes;
    mnRowDoubles = nSamples;
    switch (oPlan.meKind) {
        case RowKind::eMedians:
            mpabyCopy.reset(new char[mnRows * (nWndCols + kMedianReach) *
                                     static_cast<std::size_t>(kSampleBytes[oTask.nSrcType])]);
            mvpRow.resize(mnRows);
            mvpCopy.resize(mnRows);
            return;
        case RowKind::eSums:
            // Per channel the sums of the columns, and those added up.
            mpadfKept = MakeAlignedDoubles(nChan * 2 * mnRowDoubles);
            mvpadfRow.resize(nChan);
            for (std::size_t c = 0; c < nChan; ++c) {
                mvpadfRow[c] = mpadfKept.get() + (2 * c + 1) * mnRowDoubles;
            }
            break;
        case RowKind::eFiltered:
            mnRowDoubles = nStripCols;
            mpadfSamples = MakeAlignedDoubles(nSamples);
            if (oPlan.mpoRows->bTabulated) {
                mpadfTaps = MakeAlignedDoubles(nStripCols * nWndCols);
            }
            [[fallthrough]];
        default:
            mpadfKept = MakeAlignedDoubles(nChan * mnRows * mnRowDoubles);
            mvnSrcRow.assign(mnRows, -1);
            mvpadfRow.resize(nChan * mnRows);
            if (moMethod.eScratch != Scratch::eNone) {
                mpadfScratch = MakeAlignedDoubles(GetScratchSize(moMethod));
            }
            break;
    }
    moWindows.padfColumnTaps = mpadfTaps.get();
    moWindows.pParameters = oTask.pParameters;
    moWindows.padfScratch = mpadfScratch.get();
}

void RowCache::SetStrip(const Strip& oStrip) {
    moStrip = oStrip;
    std::fill(mvnSrcRow.begin(), mvnSrcRow.end(), -1);
    mnWindowRow = -1;
    if (mpadfTaps != nullptr && oStrip.nSrcCount > 0) {
        moPlan.mpoStages->pfnColumnTaps(moTask.pParameters, moPlan.mpadfFracCol + oStrip.nFirstCol,
                                        oStrip.nNumCols, mpadfTaps.get());
    }
}

void RowCache::SetWindowRow(std::int64_t nSrcRow, double dfFracRow) {
    moWindows.dfFracRow = dfFracRow;
    if (moPlan.meKind == RowKind::eSums) {
        MoveSums(nSrcRow);
    }
    mnWindowRow = nSrcRow;
    if (moPlan.meKind == RowKind::eSums || moPlan.meKind == RowKind::eMedians) {
        return;
    }
    for (std::size_t k = 0; k < mnRows; ++k) {
        const std::int64_t nRow = nSrcRow + static_cast<std::int64_t>(k);
        const std::size_t nSlot = static_cast<std::size_t>(nRow) % mnRows;
        if (mvnSrcRow[nSlot] != nRow) {
            Fetch(nRow, nSlot);
            mvnSrcRow[nSlot] = nRow;
        }
        for (std::size_t c = 0; c < static_cast<std::size_t>(moTask.nChan); ++c) {
            mvpadfRow[c * mnRows + k] = mpadfKept.get() + (c * mnRows + nSlot) * mnRowDoubles;
        }
    }
}

const char* RowCache::SrcSamples(std::int64_t nSrcRow, int nChannel) const {
    return static_cast<const char*>(moTask.pSrc) +
           ((nSrcRow * moTask.nSrcCols + moStrip.nSrcFirst) * moTask.nChan + nChannel) *
               kSampleBytes[moTask.nSrcType];
}

void RowCache::Fetch(std::int64_t nSrcRow, std::size_t nSlot) {
    const auto& apfnWiden =
        moPlan.mbSquared ? moPlan.mpoStages->apfnWidenRoots : moPlan.mpoStages->apfnWiden;
    RowWindows oWindows = moWindows;
    oWindows.poGroups = moPlan.mvoGroups.data() + moStrip.nFirstCol / kLanes;
    oWindows.padfFracCol = moPlan.mpadfFracCol + moStrip.nFirstCol;
    oWindows.nPix = moStrip.nNumCols;
    for (int c = 0; c < moTask.nChan; ++c) {
        double* padfKept =
            mpadfKept.get() + (static_cast<std::size_t>(c) * mnRows + nSlot) * mnRowDoubles;
        double* padfSamples = mpadfSamples == nullptr ? padfKept : mpadfSamples.get();
        apfnWiden[moTask.nSrcType](SrcSamples(nSrcRow, c), moTask.nChan, moStrip.nSrcCount,
                                   padfSamples);
        if (mpadfSamples != nullptr) {
            moPlan.mpoRows->pfnAcross(oWindows, padfSamples, padfKept);
        }
    }
}

// Makes the sums of the columns those of the window rows from nSrcRow on.
void RowCache::MoveSums(std::int64_t nSrcRow) {
    if (nSrcRow == mnWindowRow) {
        return;
    }
    const std::int64_t nRows = static_cast<std::int64_t>(mnRows);
    const bool bNear = mnWindowRow >= 0 && 2 * std::abs(nSrcRow - mnWindowRow) < nRows;
    const LevelStages& oStages = *moPlan.mpoStages;
    for (int c = 0; c < moTask.nChan; ++c) {
        double* padfSum = mpadfKept.get() + 2 * static_cast<std::size_t>(c) * mnRowDoubles;
        const auto fnApply = [&](const AddRowFunction* apfnRow, std::int64_t nBegin,
                                 std::int64_t nEnd) {
            for (std::int64_t n = nBegin; n < nEnd; ++n) {
                apfnRow[moTask.nSrcType](SrcSamples(n, c), moTask.nChan, moStrip.nSrcCount,
                                         padfSum);
            }
        };
        if (bNear) {
            // Rows below come and rows above leave, or the other way round.
            fnApply(oStages.apfnAddRow, std::max(nSrcRow, mnWindowRow + nRows), nSrcRow + nRows);
            fnApply(oStages.apfnAddRow, nSrcRow, std::min(mnWindowRow, nSrcRow + nRows));
            fnApply(oStages.apfnSubtractRow, mnWindowRow, std::min(nSrcRow, mnWindowRow + nRows));
            fnApply(oStages.apfnSubtractRow, std::max(mnWindowRow, nSrcRow + nRows),
                    mnWindowRow + nRows);
        } else {
            std::fill_n(padfSum, moStrip.nSrcCount, 0.0);
            fnApply(oStages.apfnAddRow, nSrcRow, nSrcRow + nRows);
        }
        oStages.pfnAddUp(padfSum, moStrip.nSrcCount, padfSum + mnRowDoubles);
    }
}

// Medians for the target columns whose windows fit.
void RowCache::ComputeMedians(int nFirstCol, int nNumCols) {
    const int nFirst = std::max(nFirstCol, moStrip.nFitFirst);
    const int nLast = std::min(nFirstCol + nNumCols, moStrip.nFitFirst + moStrip.nFitCount);
    if (nFirst >= nLast) {
        return;
    }
    for (std::size_t k = 0; k < mnRows; ++k) {
        mvpRow[k] = SrcSamples(mnWindowRow + static_cast<std::int64_t>(k), 0) +
                    std::ptrdiff_t{nFirst - moStrip.nFitFirst} * kSampleBytes[moTask.nSrcType];
    }
    const auto& apfnMedians =
        moPlan.mbSquared ? moPlan.mpoStages->apfnSquaredMedians : moPlan.mpoStages->apfnMedians;
    apfnMedians[moTask.nSrcType]({mvpRow.data(), mpabyCopy.get(), mvpCopy.data()},
                                 *static_cast<const WindowSize*>(moTask.pParameters),
                                 nLast - nFirst, madfValue + (nFirst - nFirstCol));
}

double* RowCache::GetValues(int nChannel, int nFirstCol, int nNumCols) {
    if (moPlan.meKind == RowKind::eMedians) {
        ComputeMedians(nFirstCol, nNumCols);
        return madfValue;
    }
    // Whole groups of the strip.
    const int nFirst = nFirstCol / kLanes * kLanes;
    const std::size_t nChannelRows = moPlan.meKind == RowKind::eSums ? 1 : mnRows;
    moWindows.papdfRow = mvpadfRow.data() + static_cast<std::size_t>(nChannel) * nChannelRows;
    moWindows.poGroups = moPlan.mvoGroups.data() + nFirst / kLanes;
    moWindows.padfFracCol = moPlan.mpadfFracCol + nFirst;
    moWindows.nPix = nFirstCol - nFirst + nNumCols;
    moWindows.nFirst = nFirst - moStrip.nFirstCol;
    const RowValuesFunction pfnValues = moPlan.meKind == RowKind::eSums
                                            ? moPlan.mpoStages->pfnSumValues
                                        : moPlan.mbSquared ? moPlan.mpoRows->pfnSquaredValues
                                                           : moPlan.mpoRows->pfnValues;
    pfnValues(moWindows, madfValue);
    return madfValue + (nFirstCol - nFirst);
}

}  // namespace vetra::utils::engine
