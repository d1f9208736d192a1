#include "vetra/base/utils/resample/engine/rowcache.h"

#include <algorithm>

namespace vetra::utils::engine {

namespace {

constexpr int kWidestStrip = 2048;
static_assert(kWidestStrip % kSpanPixels == 0);
// What a thread's rows should fit into: a part of the second-level cache.
constexpr double kCacheBytes = 384.0 * 1024;
// More than that is not kept at all.
constexpr double kMostBytes = 64.0 * 1024 * 1024;
// Source columns per target column beyond which rows hold too much that nobody reads.
constexpr int kMostReduction = 8;

// The row of the table that computes a method from rows of doubles.
int RowIndex(const Task& oTask) {
    const int nIndex = oTask.poMethod->eValues / 2;
    // Without a mask there is nothing to replace.
    return nIndex == eVR_CUBICPS / 2 && oTask.pabySrcMask == nullptr ? eVR_CUBIC / 2 : nIndex;
}

}  // namespace

RowPlan::RowPlan(const Task& oTask, const LevelStages& oStages, const ColumnTables& oColumns) {
    const Method& oMethod = *oTask.poMethod;
    if (oMethod.eValues == eVR_NONE || oMethod.eValues == eVR_CPLXSAR) {
        return;
    }
    mpoStages = &oStages;
    mpoRows = &oStages.aoRows[RowIndex(oTask)];
    mbSquared = oMethod.eValues % 2 == 1;
    mpadfFracCol = oColumns.vdfFrac.data();
    if (mpoRows->pfnValues == nullptr) {
        return;
    }
    for (int nCols = kWidestStrip; nCols >= kSpanPixels; nCols /= 2) {
        if (!MakeStrips(oTask, oColumns, nCols)) {
            break;
        }
        const double dfRow = mpoRows->pfnAcross != nullptr ? nCols : static_cast<double>(mnWidest);
        const double dfBytes = 8.0 * dfRow * oMethod.oWindow.nRows * oTask.nChan;
        if (dfBytes <= kCacheBytes || (nCols == kSpanPixels && dfBytes <= kMostBytes)) {
            return;
        }
    }
    mvoStrips.clear();
}

bool RowPlan::MakeStrips(const Task& oTask, const ColumnTables& oColumns, int nStripCols) {
    const int nWndCols = oTask.poMethod->oWindow.nCols;
    mnStripCols = nStripCols;
    mnWidest = 0;
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
                oStrip.nSrcFirst = nSrcLast < 0 ? n : std::min(n, oStrip.nSrcFirst);
                nSrcLast = std::max(nSrcLast, n + nWndCols - 1);
            }
        }
        if (nSrcLast >= 0) {
            oStrip.nSrcCount = nSrcLast - oStrip.nSrcFirst + 1;
        }
        if (oStrip.nSrcCount > std::int64_t{kMostReduction} * oStrip.nNumCols + nWndCols + kLanes) {
            return false;
        }
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
                oGroup.bNear = oGroup.bNear && oGroup.anOffset[k] < kNearReach;
            }
        }
        mnWidest = std::max(mnWidest, oStrip.nSrcCount);
        mvoStrips.push_back(oStrip);
    }
    return true;
}

RowCache::RowCache(const Task& oTask, const RowPlan& oPlan)
    : moTask(oTask),
      moPlan(oPlan),
      moMethod(*oTask.poMethod),
      mnRows(static_cast<std::size_t>(moMethod.oWindow.nRows)) {
    const std::size_t nSamples = static_cast<std::size_t>(oPlan.mnWidest) + kNearReach;
    const std::size_t nStripCols = static_cast<std::size_t>(oPlan.mnStripCols) + kLanes;
    const bool bFiltered = oPlan.mpoRows->pfnAcross != nullptr;
    mnRowDoubles = bFiltered ? nStripCols : nSamples;
    mpadfKept.reset(new double[static_cast<std::size_t>(oTask.nChan) * mnRows * mnRowDoubles]());
    if (bFiltered) {
        mpadfSamples.reset(new double[nSamples]());
    }
    if (oPlan.mpoRows->bTabulated) {
        mpadfTaps.reset(new double[nStripCols * static_cast<std::size_t>(moMethod.oWindow.nCols)]);
    }
    if (moMethod.eScratch != Scratch::eNone) {
        mpadfScratch.reset(new double[GetScratchSize(moMethod)]);
    }
    mvnSrcRow.assign(mnRows, -1);
    mvpadfRow.resize(mnRows * static_cast<std::size_t>(oTask.nChan));
    moWindows.padfColumnTaps = mpadfTaps.get();
    moWindows.pParameters = oTask.pParameters;
    moWindows.padfScratch = mpadfScratch.get();
}

void RowCache::SetStrip(const Strip& oStrip) {
    moStrip = oStrip;
    std::fill(mvnSrcRow.begin(), mvnSrcRow.end(), -1);
    if (moPlan.mpoRows->bTabulated && oStrip.nSrcCount > 0) {
        moPlan.mpoStages->pfnColumnTaps(moTask.pParameters, moPlan.mpadfFracCol + oStrip.nFirstCol,
                                        oStrip.nNumCols, mpadfTaps.get());
    }
}

void RowCache::SetWindowRow(std::int64_t nSrcRow, double dfFracRow) {
    moWindows.dfFracRow = dfFracRow;
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

void RowCache::Fetch(std::int64_t nSrcRow, std::size_t nSlot) {
    const int nChan = moTask.nChan;
    const int nBytes = kSampleBytes[moTask.nSrcType];
    const char* pSrc = static_cast<const char*>(moTask.pSrc) +
                       (nSrcRow * moTask.nSrcCols + moStrip.nSrcFirst) * nChan * nBytes;
    const auto& apfnWiden =
        moPlan.mbSquared ? moPlan.mpoStages->apfnWidenRoots : moPlan.mpoStages->apfnWiden;
    RowWindows oWindows = moWindows;
    oWindows.poGroups = moPlan.mvoGroups.data() + moStrip.nFirstCol / kLanes;
    oWindows.padfFracCol = moPlan.mpadfFracCol + moStrip.nFirstCol;
    oWindows.nPix = moStrip.nNumCols;
    for (int c = 0; c < nChan; ++c) {
        double* padfKept =
            mpadfKept.get() + (static_cast<std::size_t>(c) * mnRows + nSlot) * mnRowDoubles;
        double* padfSamples = mpadfSamples == nullptr ? padfKept : mpadfSamples.get();
        apfnWiden[moTask.nSrcType](pSrc + std::ptrdiff_t{c} * nBytes, nChan, moStrip.nSrcCount,
                                   padfSamples);
        if (mpadfSamples != nullptr) {
            moPlan.mpoRows->pfnAcross(oWindows, padfSamples, padfKept);
        }
    }
}

double* RowCache::GetValues(int nChannel, int nFirstCol, int nNumCols) {
    // Whole groups of the strip.
    const int nFirst = nFirstCol / kLanes * kLanes;
    const int nShift = nFirst - moStrip.nFirstCol;
    const double* const* papdfRow = mvpadfRow.data() + static_cast<std::size_t>(nChannel) * mnRows;
    moWindows.poGroups = moPlan.mvoGroups.data() + nFirst / kLanes;
    moWindows.padfFracCol = moPlan.mpadfFracCol + nFirst;
    moWindows.nPix = nFirstCol - nFirst + nNumCols;
    moWindows.papdfRow = papdfRow;
    moWindows.nFirst = moPlan.mpoRows->pfnAcross != nullptr ? nShift : 0;
    const RowValuesFunction pfnValues =
        moPlan.mbSquared ? moPlan.mpoRows->pfnSquaredValues : moPlan.mpoRows->pfnValues;
    pfnValues(moWindows, madfValue);
    return madfValue + (nFirstCol - nFirst);
}

}  // namespace vetra::utils::engine
