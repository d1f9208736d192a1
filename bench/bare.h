#ifndef VETRA_BENCH_BARE_H
#define VETRA_BENCH_BARE_H

#include <cstdint>

/// Sampling with nothing but what one geometry and one type need: no bounds, no requests, no target
/// mask, no clamp. An invalid sample, or a window that holds one, gives way to the nearest pixel,
/// and to 0 where that is invalid too. For processors with AVX-512.

/// What a bare loop reads and writes: 8-bit images of one channel.
struct BareImages {
    const unsigned char* pabySrc;
    const unsigned char* pabyMask;  ///< of the source; may be null
    unsigned char* pabyTgt;
    int nCols;   ///< of the target; a multiple of eight
    int nRows;   ///< of the target
    int nPitch;  ///< samples of a source row
};

/// A position for each target pixel, all of whose windows lie inside the source.
struct BarePositions {
    const float* pafCol;
    const float* pafRow;
    /// From a pixel's sample to the one that is worth asking for with it.
    std::int64_t nAhead;
};
void BareNearest(const BareImages& oImages, const BarePositions& oPositions);
void BareBilinear(const BareImages& oImages, const BarePositions& oPositions);

/// The nearest source column of each target column, and row of each row.
struct BareCells {
    const std::int64_t* panCol;
    const std::int64_t* panRow;
};
void BareScaledNearest(const BareImages& oImages, const BareCells& oCells);

#endif  // VETRA_BENCH_BARE_H
