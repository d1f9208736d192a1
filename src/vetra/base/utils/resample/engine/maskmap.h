#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_MASKMAP_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_MASKMAP_H

#include <cstdint>
#include <cstdlib>
#include <memory>
#include <vector>

#include "vetra/base/utils/resample/engine/columntables.h"
#include "vetra/base/utils/resample/engine/task.h"

namespace vetra::utils::engine {

/// What windows and nearest pixels find in the source mask: two bits for each source pixel. One is
/// set where the window that begins there is whole, the other where the pixel may be used as a
/// nearest one. They lie in rows for runs that take them row by row, else in bands. Bits are made
/// in blocks, of which a thread makes those that it needs, at a cost that grows with the logarithm
/// of the window's size.
class MaskMap {
 public:
    /// Reserves room for two bits per source pixel. Where there is none the map stays empty and
    /// provides nothing. Throws std::bad_alloc where there is no room for a block.
    MaskMap(const Task& oTask, const LevelStages& oStages, bool bBands);

    /// Makes the bits of these columns and rows of the source. False, and nothing done, where the
    /// rectangle is so large that it is better to look at the mask for each pixel.
    bool Provide(const Reach& oCols, const Reach& oRows);

    /// Bits of a row; of a map without bands.
    const std::uint64_t* GetWhole(std::int64_t nRow) const {
        return mpanBits.get() + 2 * nRow * mnRowWords;
    }
    const std::uint64_t* GetUsable(std::int64_t nRow) const { return GetWhole(nRow) + mnRowWords; }
    /// Of a map with bands.
    MaskBands GetBands() const {
        return {BandStart(0), BandStart(0) + mnRowWords * kWordBits, 2 * mnRowWords * kWordBits};
    }

    static constexpr int kWordBits = 64;

 private:
    struct Free {
        void operator()(std::uint64_t* pan) const { std::free(pan); }
    };

    unsigned char* BandStart(std::int64_t nBand) const {
        return reinterpret_cast<unsigned char*>(mpanBits.get()) +
               2 * nBand * mnRowWords * kWordBits;
    }
    void MakeBlock(std::int64_t nBlockRow, std::int64_t nBlockCol);
    void Keep(const std::uint64_t* panRows, std::int64_t nRowWords, bool bUsable,
              std::int64_t nFirstRow, std::int64_t nNumRows, std::int64_t nFirstWord,
              std::int64_t nNumWords);

    const Task& moTask;
    const LevelStages& moStages;
    bool mbBands;
    std::int64_t mnRowWords;
    std::int64_t mnBlockRows;  // of pixels
    std::int64_t mnBlocksAcross;
    // [rows][2][mnRowWords], or bands: [bands][2][bytes of mnRowWords words' bits]
    std::unique_ptr<std::uint64_t[], Free> mpanBits;
    std::vector<bool> mvbMade;
    // Rows of a block and of the windows that begin in it.
    std::int64_t mnScratchRows;
    std::int64_t mnScratchWords;
    std::vector<std::uint64_t> mvnScratch;
    std::vector<std::uint64_t> mvnUsable;
};

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_MASKMAP_H
