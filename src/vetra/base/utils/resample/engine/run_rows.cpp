// The walk for axis-aligned transforms: columns come from tables that are made once per run, and
// rows are worked out once per target row.

#include <algorithm>
#include <cmath>
#include <vector>

#include "vetra/base/utils/resample/engine/run.h"

namespace vetra::utils::engine {

void Run::WalkRows(long long nBegin, long long nEnd, const ThreadMemory& oMemory,
                   ValueArrays& oValues) const {
    const int nCols = moTask.nTgtCols;
    const std::vector<Strip> voWhole = {{0, nCols}};
    RowCache* poRows = oMemory.poRows.get();
    for (const Strip& oStrip : poRows != nullptr ? moRowPlan.GetStrips() : voWhole) {
        if (poRows != nullptr) {
            poRows->SetStrip(oStrip);
        }
        for (long long nRow = nBegin / nCols; nRow * nCols < nEnd; ++nRow) {
            // The row's share, as far as it lies in the strip.
            const long long nFirst = std::max(nBegin, nRow * nCols + oStrip.nFirstCol);
            const long long nLast =
                std::min(nEnd, nRow * nCols + oStrip.nFirstCol + oStrip.nNumCols);
            if (nFirst >= nLast) {
                continue;
            }
            double dfCol = 0.0;
            double dfRow = 0.0;
            moTask.poTfm->GetSrcPos(nFirst, dfCol, dfRow);
            FillRow(dfRow, nFirst, static_cast<int>(nFirst % nCols),
                    static_cast<int>(nLast - nFirst), oMemory, oValues);
        }
    }
}

// Fills a stretch of one target row.
void Run::FillRow(double dfRow, long long nFirst, int nFirstCol, int nNumCols,
                  const ThreadMemory& oMemory, ValueArrays& oValues) const {
    const double dfNearRow = std::floor(dfRow + 0.5);
    const double dfAnchorRow = moLimits.bAnchorNearest ? dfNearRow : std::floor(dfRow);
    const double dfFracRow = dfRow - dfAnchorRow;
    const bool bFits =
        dfAnchorRow >= moLimits.dfFitRowFirst && dfAnchorRow <= moLimits.dfFitRowLast;
    const bool bNear = dfNearRow >= 0.0 && dfNearRow <= moLimits.dfNearRowLast;
    const auto nRowClass =
        static_cast<unsigned char>((bFits ? kClassFits : 0) | (bNear ? kClassNear : 0));

    Span oSpan;
    double adfFracRow[kSpanArray];
    if (moMethod.eValues != eVR_NONE) {
        std::fill_n(adfFracRow, std::min(nNumCols, kSpanPixels) + kLanes, dfFracRow);
        oSpan.padfFracRow = adfFracRow;
    }
    oSpan.eValues = moMethod.eValues;
    // Rows outside have no samples: no pixel of theirs has a mode that reads any.
    const long long nWindowRow =
        bFits ? static_cast<long long>(dfAnchorRow) + moMethod.oWindow.nRowOff : 0;
    const long long nNearestRow = bNear ? static_cast<long long>(dfNearRow) : 0;
    oSpan.pWindowSrc = SrcRow(nWindowRow);
    oSpan.pNearestSrc = SrcRow(nNearestRow);
    const unsigned char* pabyNearestMask = nullptr;
    bool bMapped = false;
    MaskRow oMask{};
    if (moTask.pabySrcMask != nullptr) {
        oSpan.pabyWindowMask = moTask.pabySrcMask + nWindowRow * moTask.nSrcCols;
        pabyNearestMask = moTask.pabySrcMask + nNearestRow * moTask.nSrcCols;
        Reach oRows;
        oRows.Add(nWindowRow);
        oRows.Add(nNearestRow);
        if (mpfnFillInvalid != nullptr && bNear && moColumns.bAllNear) {
            oSpan.pabyCopyMask = pabyNearestMask;
        } else if (oMemory.poMap != nullptr && oMemory.poMap->Provide(moColumns.oReach, oRows)) {
            bMapped = true;
            oMask = {oMemory.poMap->GetWhole(nWindowRow), oMemory.poMap->GetUsable(nNearestRow),
                     moColumns.voWholeGroups.data(),      moColumns.voUsableGroups.data(),
                     moColumns.vnWindowCol.data(),        moColumns.vnNearestCol.data()};
        }
    }
    // Rows know nothing of replaced samples.
    const bool bReplacing =
        moMethod.eRule == ModeRule::eReplacingWindow && moTask.pabySrcMask != nullptr;
    RowCache* poRows = bReplacing && !bMapped ? nullptr : oMemory.poRows.get();
    bool bFetched = false;
    alignas(64) unsigned char abyMode[kSpanArray];
    std::uint64_t anBroken[kSpanWords];
    for (int nDone = 0; nDone < nNumCols; nDone += kSpanPixels) {
        const std::size_t nCol = static_cast<std::size_t>(nFirstCol + nDone);
        oSpan.nFirst = nFirst + nDone;
        oSpan.nPix = std::min(kSpanPixels, nNumCols - nDone);
        oSpan.padfFracCol = moColumns.vdfFrac.data() + nCol;
        oSpan.panWindow = moColumns.vnWindow.data() + nCol;
        oSpan.panNearest = moColumns.vnNearest.data() + nCol;
        oSpan.poGroups = moColumns.voGroups.empty() || nCol % kLanes != 0
                             ? nullptr
                             : moColumns.voGroups.data() + nCol / kLanes;
        if (oSpan.pabyCopyMask != nullptr) {
            oSpan.nModes = kSetNearest;
        } else if (mbOpen) {
            oSpan.pabyMode = moColumns.avbyMode[nRowClass].data() + nCol;
            oSpan.nModes = SetOfModes(oSpan.pabyMode, oSpan.nPix);
        } else {
            oSpan.pabyMode = abyMode;
            if (bMapped) {
                const unsigned nModes = moStages.pfnRowClasses(
                    GetClassRules(), oMask, nRowClass, static_cast<int>(nCol), oSpan.nPix, abyMode,
                    bReplacing ? anBroken : nullptr);
                oSpan.nModes = ApplyRequests(oSpan.nFirst, oSpan.nPix, nModes, abyMode);
            } else {
                const unsigned char* pabyClass = moColumns.vbyClass.data() + nCol;
                for (int i = 0; i < kSpanPixels; ++i) {
                    abyMode[i] = pabyClass[i] & nRowClass;
                }
                oSpan.nModes = ChooseModes(oSpan.nFirst, oSpan.nPix, oSpan.pabyWindowMask,
                                           pabyNearestMask, moColumns.vnWindowCol.data() + nCol,
                                           moColumns.vnNearestCol.data() + nCol, abyMode);
            }
            if (bReplacing && bMapped) {
                oSpan.eValues = PlainRow(moMethod);
                oSpan.panBroken = anBroken;
            }
        }
        if (poRows != nullptr && (oSpan.nModes & kSetInterpolated) != 0) {
            if (!bFetched) {
                poRows->SetWindowRow(nWindowRow, dfFracRow);
                bFetched = true;
            }
            oSpan.poRows = poRows;
            oSpan.nFirstCol = nFirstCol + nDone;
        }
        Finish(oSpan, oMemory, oValues);
    }
}

}  // namespace vetra::utils::engine
