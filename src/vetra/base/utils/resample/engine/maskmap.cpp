#include "vetra/base/utils/resample/engine/maskmap.h"

#include <algorithm>

namespace vetra::utils::engine {

namespace {

constexpr std::int64_t kBlockWords = 8;
constexpr std::int64_t kLeastBlockRows = 64;
// Source pixels of a rectangle; a span of 256 pixels that are far apart has a larger one.
constexpr double kMostPixels = 1 << 22;

// Leaves the bits set behind which nNumBits - 1 others are set: the row and itself moved by one,
// then both by two, and so on.
void Erode(std::uint64_t* panRow, std::int64_t nWords, std::int64_t nNumBits) {
    for (std::int64_t nDone = 1; nDone < nNumBits;) {
        const std::int64_t nShift = std::min(nDone, nNumBits - nDone);
        const std::int64_t nWordShift = nShift / MaskMap::kWordBits;
        const int nBitShift = static_cast<int>(nShift % MaskMap::kWordBits);
        const auto fnWord = [&](std::int64_t i) { return i < nWords ? panRow[i] : 0; };
        for (std::int64_t i = 0; i < nWords; ++i) {
            std::uint64_t nMoved = fnWord(i + nWordShift) >> nBitShift;
            if (nBitShift != 0) {
                nMoved |= fnWord(i + nWordShift + 1) << (MaskMap::kWordBits - nBitShift);
            }
            panRow[i] &= nMoved;
        }
        nDone += nShift;
    }
}

}  // namespace

MaskMap::MaskMap(const Task& oTask, const LevelStages& oStages, bool bBands)
    : moTask(oTask),
      moStages(oStages),
      mbBands(bBands),
      mnRowWords((std::int64_t{oTask.nSrcCols} + kWordBits - 1) / kWordBits),
      // Whole bands.
      mnBlockRows(
          (std::max<std::int64_t>(kLeastBlockRows, oTask.poMethod->oWindow.nRows) + kBandRows - 1) /
          kBandRows * kBandRows),
      mnBlocksAcross((mnRowWords + kBlockWords - 1) / kBlockWords),
      mnScratchRows(mnBlockRows + oTask.poMethod->oWindow.nRows - 1),
      mnScratchWords(kBlockWords +
                     (std::int64_t{oTask.poMethod->oWindow.nCols} + kWordBits - 2) / kWordBits) {
    // Pages that nobody writes to take no memory. Groups of bits are read beyond the last one, and
    // so are bands, with the band below.
    const std::int64_t nBands = (oTask.nSrcRows + kBandRows - 1) / kBandRows + 1;
    const std::int64_t nRows = bBands ? nBands * kBandRows : oTask.nSrcRows;
    static_assert(BitGroup::kBytes == kBandReach);
    mpanBits.reset(static_cast<std::uint64_t*>(std::calloc(
        static_cast<std::size_t>(2 * mnRowWords * nRows) + kBandReach / sizeof(std::uint64_t),
        sizeof(std::uint64_t))));
    const std::int64_t nBlocksDown = (oTask.nSrcRows + mnBlockRows - 1) / mnBlockRows;
    mvbMade.resize(static_cast<std::size_t>(mnBlocksAcross * nBlocksDown));
    mvnScratch.resize(static_cast<std::size_t>(mnScratchRows * mnScratchWords));
    mvnUsable.resize(static_cast<std::size_t>(mnBlockRows * kBlockWords));
}

bool MaskMap::Provide(const Reach& oCols, const Reach& oRows) {
    const double dfPixels = static_cast<double>(oCols.nLast - oCols.nFirst + 1) *
                            static_cast<double>(oRows.nLast - oRows.nFirst + 1);
    if (mpanBits == nullptr || dfPixels > kMostPixels) {
        return false;
    }
    constexpr std::int64_t kBlockCols = kBlockWords * kWordBits;
    for (std::int64_t r = oRows.nFirst / mnBlockRows; r <= oRows.nLast / mnBlockRows; ++r) {
        for (std::int64_t c = oCols.nFirst / kBlockCols; c <= oCols.nLast / kBlockCols; ++c) {
            const auto itMade = mvbMade.begin() + (r * mnBlocksAcross + c);
            if (!*itMade) {
                MakeBlock(r, c);
                *itMade = true;
            }
        }
    }
    return true;
}

void MaskMap::MakeBlock(std::int64_t nBlockRow, std::int64_t nBlockCol) {
    const std::int64_t nFirstRow = nBlockRow * mnBlockRows;
    const std::int64_t nFirstCol = nBlockCol * kBlockWords * kWordBits;
    const std::int64_t nCount = std::min(mnScratchWords * kWordBits, moTask.nSrcCols - nFirstCol);
    // Beyond the source there are no bits: windows that don't fit aren't whole.
    std::fill(mvnScratch.begin(), mvnScratch.end(), 0);
    std::uint64_t* panRows = mvnScratch.data();
    const Window& oWindow = moTask.poMethod->oWindow;
    const bool bExactlyOne = moTask.poMethod->eRule == ModeRule::eWindow;
    const std::int64_t nBlockWords = std::min(kBlockWords, mnRowWords - nBlockCol * kBlockWords);
    const std::int64_t nNumRows = std::min(mnScratchRows, moTask.nSrcRows - nFirstRow);
    const std::int64_t nBlockRows = std::min(mnBlockRows, nNumRows);
    for (std::int64_t r = 0; r < nNumRows; ++r) {
        std::uint64_t* panRow = panRows + r * mnScratchWords;
        const unsigned char* pabyMask =
            moTask.pabySrcMask + (nFirstRow + r) * moTask.nSrcCols + nFirstCol;
        moStages.pfnMaskBits(pabyMask, nCount, 0, false, panRow);
        if (r < nBlockRows) {
            std::uint64_t* panUsable = mvnUsable.data() + r * kBlockWords;
            if (bExactlyOne) {
                moStages.pfnMaskBits(pabyMask, std::min(nCount, nBlockWords * kWordBits), 1, true,
                                     panUsable);
            } else {
                std::copy_n(panRow, nBlockWords, panUsable);
            }
        }
        Erode(panRow, mnScratchWords, oWindow.nCols);
    }
    for (std::int64_t nDone = 1; nDone < oWindow.nRows;) {
        const std::int64_t nShift = std::min(nDone, oWindow.nRows - nDone);
        const std::int64_t nWords = (mnScratchRows - nShift) * mnScratchWords;
        const std::uint64_t* panMoved = panRows + nShift * mnScratchWords;
        for (std::int64_t i = 0; i < nWords; ++i) {
            panRows[i] &= panMoved[i];
        }
        nDone += nShift;
    }
    const std::int64_t nFirstWord = nBlockCol * kBlockWords;
    Keep(panRows, mnScratchWords, false, nFirstRow, nBlockRows, nFirstWord, nBlockWords);
    Keep(mvnUsable.data(), kBlockWords, true, nFirstRow, nBlockRows, nFirstWord, nBlockWords);
}

// Puts a block's bits where they belong.
void MaskMap::Keep(const std::uint64_t* panRows, std::int64_t nRowWords, bool bUsable,
                   std::int64_t nFirstRow, std::int64_t nNumRows, std::int64_t nFirstWord,
                   std::int64_t nNumWords) {
    if (!mbBands) {
        for (std::int64_t r = 0; r < nNumRows; ++r) {
            std::copy_n(panRows + r * nRowWords, nNumWords,
                        mpanBits.get() + (2 * (nFirstRow + r) + (bUsable ? 1 : 0)) * mnRowWords +
                            nFirstWord);
        }
        return;
    }
    for (std::int64_t r = 0; r < nNumRows; r += kBandRows) {
        moStages.pfnMakeBand(panRows + r * nRowWords, nRowWords,
                             static_cast<int>(std::min<std::int64_t>(kBandRows, nNumRows - r)),
                             nNumWords,
                             BandStart((nFirstRow + r) / kBandRows) +
                                 ((bUsable ? mnRowWords : 0) + nFirstWord) * kWordBits);
    }
}

}  // namespace vetra::utils::engine
