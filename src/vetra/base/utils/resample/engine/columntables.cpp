#include "vetra/base/utils/resample/engine/columntables.h"

#include <algorithm>
#include <cmath>

namespace vetra::utils::engine {

namespace {

// The samples of eight neighbouring columns lie close together unless the scale is large: one load
// and a shuffle replace eight loads.
std::vector<PairGroup> MakePairGroups(const Task& oTask, const ColumnTables& oColumns) {
    const Method& oMethod = *oTask.poMethod;
    if (oMethod.eValues == eVR_NONE || oMethod.oWindow.nCols != 2 || oTask.nChan != 1 ||
        kSampleBytes[oTask.nSrcType] != 1 || oTask.nSrcCols < PairGroup::kBytes) {
        return {};
    }
    std::vector<PairGroup> voGroups(static_cast<std::size_t>(oTask.nTgtCols) / kLanes + 1);
    const std::int64_t* panOffset = oColumns.vnWindow.data();
    for (PairGroup& oGroup : voGroups) {
        const auto [itFirst, itLast] = std::minmax_element(panOffset, panOffset + kLanes);
        // The load ends with the row at the latest, so it stays in the source.
        oGroup.nOffset = std::min<std::int64_t>(*itFirst, oTask.nSrcCols - PairGroup::kBytes);
        if (*itLast + 1 - oGroup.nOffset >= PairGroup::kBytes) {
            oGroup.nOffset = -1;
        } else {
            for (int i = 0; i < kLanes; ++i) {
                const auto nPlace = static_cast<unsigned char>(panOffset[i] - oGroup.nOffset);
                oGroup.abyPlace[i] = nPlace;
                oGroup.abyPlace[kLanes + i] = static_cast<unsigned char>(nPlace + 1);
            }
        }
        panOffset += kLanes;
    }
    return voGroups;
}

// Of the windows or nearest pixels that have a class.
std::vector<BitGroup> MakeBitGroups(const ColumnTables& oColumns,
                                    const std::vector<std::int64_t>& vnPlace, unsigned char nClass,
                                    int nCols) {
    constexpr int kBitsInByte = 8;
    std::vector<BitGroup> voGroups(static_cast<std::size_t>(nCols + BitGroup::kColumns - 1) /
                                   BitGroup::kColumns);
    const std::int64_t* panPlace = vnPlace.data();
    const unsigned char* pabyClass = oColumns.vbyClass.data();
    int nLeft = nCols;
    for (BitGroup& oGroup : voGroups) {
        const int nGroupCols = std::min(nLeft, BitGroup::kColumns);
        Reach oBytes;
        for (int i = 0; i < nGroupCols; ++i) {
            if ((pabyClass[i] & nClass) != 0) {
                oGroup.nInside |= std::uint32_t{1} << i;
                oBytes.Add(panPlace[i] / kBitsInByte);
            }
        }
        const bool bClose = oBytes.nLast - oBytes.nFirst < BitGroup::kBytes;
        oGroup.nFirst = bClose ? oBytes.nFirst : -1;
        for (int i = 0; i < nGroupCols; ++i) {
            if ((oGroup.nInside >> i & 1u) != 0) {
                oGroup.abyBit[i] = static_cast<unsigned char>(1 << panPlace[i] % kBitsInByte);
                oGroup.abyPlace[i] = static_cast<unsigned char>(
                    bClose ? panPlace[i] / kBitsInByte - oBytes.nFirst : 0);
            }
        }
        panPlace += nGroupCols;
        pabyClass += nGroupCols;
        nLeft -= nGroupCols;
    }
    return voGroups;
}

}  // namespace

ColumnTables MakeColumnTables(const Task& oTask, const LevelStages& oStages,
                              const Positions& oPositions, const ClassLimits& oLimits,
                              const ModeTable* poModes) {
    const int nCols = oTask.nTgtCols;
    const std::size_t nSize = static_cast<std::size_t>(nCols) + kSpanArray;
    ColumnTables oColumns;
    oColumns.vdfFrac.resize(nSize);
    oColumns.vnWindowCol.resize(nSize);
    oColumns.vnNearestCol.resize(nSize);
    oColumns.vbyClass.resize(nSize);
    // Of the first source row, to which no window is tied: what remains is the column's part.
    ClassLimits oFirstRow = oLimits;
    oFirstRow.dfFitRowFirst = 0.0;
    oFirstRow.dfFitRowLast = 0.0;
    oFirstRow.dfRowOff = 0.0;
    double adfCol[kSpanArray];
    double adfRow[kSpanArray];
    for (int nX = 0; nX < nCols; nX += kSpanPixels) {
        const int nPix = std::min(kSpanPixels, nCols - nX);
        oPositions.Fill(oStages, nX, nPix, adfCol, adfRow);
        std::fill_n(adfRow, kSpanArray, 0.0);
        oStages.pfnClasses(oFirstRow, 0, adfCol, adfRow, nPix, oColumns.vbyClass.data() + nX,
                           oColumns.vnWindowCol.data() + nX, oColumns.vnNearestCol.data() + nX);
        double* padfFrac = oColumns.vdfFrac.data() + nX;
        for (int i = 0; i < nPix; ++i) {
            padfFrac[i] =
                adfCol[i] - std::floor(oLimits.bAnchorNearest ? adfCol[i] + 0.5 : adfCol[i]);
        }
    }
    for (std::size_t i = 0; i < static_cast<std::size_t>(nCols); ++i) {
        const unsigned char nClass = oColumns.vbyClass[i];
        if ((nClass & kClassFits) != 0) {
            oColumns.oReach.Add(oColumns.vnWindowCol[i]);
        }
        if ((nClass & kClassNear) != 0) {
            oColumns.oReach.Add(oColumns.vnNearestCol[i]);
        } else {
            oColumns.bAllNear = false;
        }
    }
    const auto fnOffsets = [&](const std::vector<std::int64_t>& vnCol) {
        std::vector<std::int64_t> vnOffset(nSize);
        std::transform(vnCol.begin(), vnCol.begin() + nCols, vnOffset.begin(),
                       [&](std::int64_t n) { return n * oTask.nChan; });
        return vnOffset;
    };
    oColumns.vnWindow = fnOffsets(oColumns.vnWindowCol);
    oColumns.vnNearest = fnOffsets(oColumns.vnNearestCol);
    if (poModes != nullptr) {
        for (unsigned char nRowClass = 0; nRowClass < 4; ++nRowClass) {
            unsigned char abyMode[4];
            for (unsigned char nClass = 0; nClass < 4; ++nClass) {
                abyMode[nClass] = poModes->Get(ePO_INTERPOLATED, nClass & nRowClass);
            }
            std::vector<unsigned char>& vbyMode = oColumns.avbyMode[nRowClass];
            vbyMode.resize(nSize);
            std::transform(oColumns.vbyClass.begin(), oColumns.vbyClass.begin() + nCols,
                           vbyMode.begin(), [&](unsigned char nClass) { return abyMode[nClass]; });
        }
    }
    oColumns.voGroups = MakePairGroups(oTask, oColumns);
    if (oTask.pabySrcMask != nullptr) {
        oColumns.voWholeGroups = MakeBitGroups(oColumns, oColumns.vnWindowCol, kClassFits, nCols);
        oColumns.voUsableGroups = MakeBitGroups(oColumns, oColumns.vnNearestCol, kClassNear, nCols);
    }
    return oColumns;
}

}  // namespace vetra::utils::engine
