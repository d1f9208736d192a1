#include "vetra/base/utils/resample/engine/rowcache.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>

namespace vetra::utils::engine {

namespace {

// What a thread keeps should fit into a part of the second-level cache.
constexpr double kCacheBytes = 512.0 * 1024;
// Source columns per target column beyond which rows hold too much that nobody reads.
constexpr int kMostReduction = 8;

// The row of the table that computes a method from rows of doubles. Where samples are replaced,
// which depends on the pixel, only the windows without any come from rows.
int RowIndex(const Method& oMethod) {
    return (oMethod.eRule == ModeRule::eReplacingWindow ? PlainRow(oMethod) : oMethod.eValues) / 2;
}

// Whether sums of columns are worth adding up from the left: not for a few columns.
bool SumsAddUp(const Method& oMethod) { return oMethod.oWindow.nCols > 8; }

}  // namespace

RowPlan::RowPlan(const Task& oTask, const LevelStages& oStages, const ColumnTables& oColumns) {
    const Method& oMethod = *oTask.poMethod;
    mpoStages = &oStages;
    if (oMethod.eValues != eVR_NONE && oMethod.eValues != eVR_CPLXSAR) {
        moFacts.poRows = &oStages.aoRows[RowIndex(oMethod)];
    }
    mbSquared = oMethod.eValues % 2 == 1;
    moFacts.pfnMedians = oStages.apfnMedians[oTask.nSrcType];
    mpadfFracCol = oColumns.vdfFrac.data();
    // Strips are made for nothing where no rows are kept however they lie.
    moPath = ChoosePath(oTask, moFacts);
    if (!KeepsRows(moPath.ePath)) {
        return;
    }
    // As few as the cache allows: source rows are read sooner the longer the stretches.
    const int nSpans = (oTask.nTgtCols + kSpanPixels - 1) / kSpanPixels;
    for (int nStrips = 1;;) {
        const int nStripSpans = (nSpans + nStrips - 1) / nStrips;
        MakeStrips(oTask, oColumns, nStripSpans * kSpanPixels);
        moPath = ChoosePath(oTask, moFacts);
        const double dfTooMany = GetKeptBytes(oTask, moFacts, moPath.ePath) / kCacheBytes;
        if (dfTooMany <= 1.0 || nStripSpans == 1) {
            break;
        }
        nStrips = static_cast<int>(std::clamp(nStrips * dfTooMany, nStrips + 1.0, 1.0 * nSpans));
    }
}

void RowPlan::MakeStrips(const Task& oTask, const ColumnTables& oColumns, int nStripCols) {
    const int nWndCols = oTask.poMethod->oWindow.nCols;
    moFacts.nStripCols = nStripCols;
    moFacts.nStripSrcCols = 0;
    moFacts.bReduces = false;
    moFacts.bUnitSteps = true;
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
                moFacts.bUnitSteps =
                    moFacts.bUnitSteps && n - oStrip.nSrcFirst == i - oStrip.nFitFirst;
                oStrip.nSrcFirst = std::min(n, oStrip.nSrcFirst);
                nSrcLast = std::max(nSrcLast, n + nWndCols - 1);
                ++oStrip.nFitCount;
            }
        }
        if (nSrcLast >= 0) {
            oStrip.nSrcCount = nSrcLast - oStrip.nSrcFirst + 1;
        }
        moFacts.bReduces =
            moFacts.bReduces ||
            oStrip.nSrcCount > std::int64_t{kMostReduction} * oStrip.nNumCols + nWndCols + kLanes;
        for (int i = nFirst; i < nFirst + oStrip.nNumCols; i += kLanes) {
            PickGroup& oGroup = mvoGroups[static_cast<std::size_t>(i / kLanes)];
            std::int64_t nLeast = -1;
            for (int k = i; k < i + kLanes; ++k) {
                if (fnFits(k) && (nLeast < 0 || fnSrcCol(k) < nLeast)) {
                    nLeast = fnSrcCol(k);
                }
            }
            oGroup.nFirst = nLeast < 0 ? 0 : nLeast - oStrip.nSrcFirst;
            bool bNear = true;
            bool bInARow = true;
            for (int k = 0; k < kLanes; ++k) {
                oGroup.anOffset[k] = fnFits(i + k) ? fnSrcCol(i + k) - nLeast : 0;
                bNear = bNear && oGroup.anOffset[k] + kNearColumns <= kNearReach;
                bInARow = bInARow && oGroup.anOffset[k] == k;
            }
            oGroup.eKind = bInARow ? PickGroup::eInARow
                           : bNear ? PickGroup::eNear
                                   : PickGroup::eAny;
        }
        moFacts.nStripSrcCols = std::max(moFacts.nStripSrcCols, oStrip.nSrcCount);
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
    // Each row begins on a whole group.
    const std::size_t nSamples =
        (static_cast<std::size_t>(oPlan.moFacts.nStripSrcCols) + kNearReach) / kLanes * kLanes +
        kLanes;
    const std::size_t nStripCols = static_cast<std::size_t>(oPlan.moFacts.nStripCols) + kLanes;
    mnRowDoubles = nSamples;
    switch (oPlan.moPath.ePath) {
        case Path::eMedians:
            mpabyCopy.reset(new char[mnRows * (nWndCols + kMedianReach) *
                                     static_cast<std::size_t>(kSampleBytes[oTask.nSrcType])]);
            mvpRow.resize(mnRows);
            mvpCopy.resize(mnRows);
            return;
        case Path::eSums:
            // Per channel the sums of the columns, and those added up.
            mnRowDoubles += kLanes;
            mpadfKept = MakeAlignedDoubles(nChan * 2 * mnRowDoubles);
            mvpadfRow.resize(nChan);
            for (std::size_t c = 0; c < nChan; ++c) {
                double* padfSum = mpadfKept.get() + 2 * c * mnRowDoubles;
                mvpadfRow[c] = SumsAddUp(moMethod) ? Totals(padfSum) : padfSum;
            }
            break;
        case Path::eFilteredRows:
            mnRowDoubles = nStripCols;
            mpadfSamples = MakeAlignedDoubles(nSamples);
            if (oPlan.moFacts.poRows->bTabulated) {
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
    moWindows.bMayBeTiny = oTask.nSrcType == gobs::eDT_64R;
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
    if (moPlan.moPath.ePath == Path::eSums) {
        MoveSums(nSrcRow);
    }
    mnWindowRow = nSrcRow;
    if (moPlan.moPath.ePath == Path::eSums || moPlan.moPath.ePath == Path::eMedians) {
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
            moPlan.moFacts.poRows->pfnAcross(oWindows, padfSamples, padfKept);
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
        // Rows come and rows leave, in pairs as far as they go.
        const auto fnChange = [&](std::int64_t nAdd, std::int64_t nAddEnd, std::int64_t nSubtract,
                                  std::int64_t nSubtractEnd) {
            while (nAdd < nAddEnd || nSubtract < nSubtractEnd) {
                oStages.apfnAddRow[moTask.nSrcType](
                    nAdd < nAddEnd ? SrcSamples(nAdd++, c) : nullptr,
                    nSubtract < nSubtractEnd ? SrcSamples(nSubtract++, c) : nullptr, moTask.nChan,
                    moStrip.nSrcCount, padfSum);
            }
        };
        if (!bNear) {
            std::fill_n(padfSum, moStrip.nSrcCount, 0.0);
            fnChange(nSrcRow, nSrcRow + nRows, 0, 0);
        } else if (nSrcRow >= mnWindowRow) {
            fnChange(mnWindowRow + nRows, nSrcRow + nRows, mnWindowRow, nSrcRow);
        } else {
            fnChange(nSrcRow, mnWindowRow, nSrcRow + nRows, mnWindowRow + nRows);
        }
        if (SumsAddUp(moMethod)) {
            oStages.pfnAddUp(padfSum, moStrip.nSrcCount, Totals(padfSum));
        }
    }
}

unsigned char* RowCache::GetMedians(int nFirstCol, int nNumCols) {
    const int nFirst = std::max(nFirstCol, moStrip.nFitFirst);
    const int nLast = std::min(nFirstCol + nNumCols, moStrip.nFitFirst + moStrip.nFitCount);
    if (nFirst < nLast) {
        const std::ptrdiff_t nBytes = kSampleBytes[moTask.nSrcType];
        for (std::size_t k = 0; k < mnRows; ++k) {
            mvpRow[k] = SrcSamples(mnWindowRow + static_cast<std::int64_t>(k), 0) +
                        (nFirst - moStrip.nFitFirst) * nBytes;
        }
        moPlan.moFacts.pfnMedians({mvpRow.data(), mpabyCopy.get(), mvpCopy.data()},
                                  *static_cast<const WindowSize*>(moTask.pParameters),
                                  nLast - nFirst, mabyMedian + (nFirst - nFirstCol) * nBytes);
    }
    return mabyMedian;
}

double* RowCache::GetValues(int nChannel, int nFirstCol, int nNumCols) {
    if (moPlan.moPath.ePath == Path::eMedians) {
        const LevelStages& oStages = *moPlan.mpoStages;
        const auto& apfnWiden =
            moPlan.mbSquared ? oStages.apfnWidenSquaredRoots : oStages.apfnWiden;
        apfnWiden[moTask.nSrcType](GetMedians(nFirstCol, nNumCols), 1, nNumCols, madfValue);
        return madfValue;
    }
    // Whole groups of the strip.
    const int nFirst = nFirstCol / kLanes * kLanes;
    const std::size_t nChannelRows = moPlan.moPath.ePath == Path::eSums ? 1 : mnRows;
    moWindows.papdfRow = mvpadfRow.data() + static_cast<std::size_t>(nChannel) * nChannelRows;
    moWindows.poGroups = moPlan.mvoGroups.data() + nFirst / kLanes;
    moWindows.padfFracCol = moPlan.mpadfFracCol + nFirst;
    moWindows.nPix = nFirstCol - nFirst + nNumCols;
    moWindows.nFirst = nFirst - moStrip.nFirstCol;
    const RowValuesFunction pfnValues =
        moPlan.moPath.ePath == Path::eSums ? (SumsAddUp(moMethod) ? moPlan.mpoStages->pfnTotalValues
                                                                  : moPlan.mpoStages->pfnSumValues)
        : moPlan.mbSquared                 ? moPlan.moFacts.poRows->pfnSquaredValues
                                           : moPlan.moFacts.poRows->pfnValues;
    pfnValues(moWindows, madfValue);
    return madfValue + (nFirstCol - nFirst);
}

}  // namespace vetra::utils::engine
