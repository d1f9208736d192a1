#include <immintrin.h>

#include <cstdint>

#include "bare.h"
#include "vetra/base/utils/resample/engine/stages.h"

namespace vetra::utils::engine {

namespace {

#include "vetra/base/utils/resample/engine/scalars_inl.h"
// clang-format off
#include "vetra/base/utils/resample/engine/lanes_avx512_inl.h"
#include "vetra/base/utils/resample/algorithm/bilinear_inl.h"
// clang-format on

// Eight pixels.
struct Group {
    Group(const BarePositions& o, int i)
        : col(LoadFloats(o.pafCol + i)), row(LoadFloats(o.pafRow + i)) {}

    F64 col;
    F64 row;
};

inline void StorePlaces(const BareImages& oImages, F64 col, F64 row, std::int64_t* panPlace) {
    StoreIntegers(panPlace, row * Set1(oImages.nPitch) + col);
}

// The samples of eight pixels lie in one or two cache lines.
inline void AskAhead(const unsigned char* paby, const BarePositions& oPositions,
                     const std::int64_t* panPlace) {
    // Not as a pointer, which might lie outside the image.
    __builtin_prefetch(reinterpret_cast<const void*>(
        reinterpret_cast<std::uintptr_t>(paby) +
        static_cast<std::uintptr_t>(panPlace[0] + oPositions.nAhead)));
}

template <bool kMask>
inline void CopyNearest(const unsigned char* pabySrc, const unsigned char* pabyMask,
                        const std::int64_t* panPlace, unsigned char* pabyTgt) {
    __m128i vSamples = Gather8(pabySrc, panPlace);
    if constexpr (kMask) {
        const __m128i vInvalid = _mm_cmpeq_epi8(Gather8(pabyMask, panPlace), _mm_setzero_si128());
        vSamples = _mm_andnot_si128(vInvalid, vSamples);
    }
    _mm_storel_epi64(reinterpret_cast<__m128i*>(pabyTgt), vSamples);
}

template <bool kMask>
void NearestLoop(const BareImages& oImages, const BarePositions& oPositions) {
    const F64 half = Set1(0.5);
    for (int i = 0; i < oImages.nCols * oImages.nRows; i += kLanes) {
        const Group o(oPositions, i);
        std::int64_t anPlace[kLanes];
        StorePlaces(oImages, Floor(o.col + half), Floor(o.row + half), anPlace);
        AskAhead(oImages.pabySrc, oPositions, anPlace);
        if constexpr (kMask) {
            AskAhead(oImages.pabyMask, oPositions, anPlace);
        }
        CopyNearest<kMask>(oImages.pabySrc, oImages.pabyMask, anPlace, oImages.pabyTgt + i);
    }
}

template <bool kMask>
void ScaledNearestLoop(const BareImages& oImages, const BareCells& oCells) {
    unsigned char* pabyTgt = oImages.pabyTgt;
    for (int nRow = 0; nRow < oImages.nRows; ++nRow) {
        const std::int64_t nFirst = oCells.panRow[nRow] * oImages.nPitch;
        const unsigned char* pabyMask = kMask ? oImages.pabyMask + nFirst : nullptr;
        for (int i = 0; i < oImages.nCols; i += kLanes, pabyTgt += kLanes) {
            CopyNearest<kMask>(oImages.pabySrc + nFirst, pabyMask, oCells.panCol + i, pabyTgt);
        }
    }
}

struct BareWindow {
    const BareImages& oImages;
    const std::int64_t* panPlace;

    void Row(int nRow, F64 (&p)[2]) const {
        GatherPair(oImages.pabySrc + static_cast<std::int64_t>(nRow) * oImages.nPitch, panPlace,
                   p[0], p[1]);
    }
};

template <bool kMask>
void BilinearLoop(const BareImages& oImages, const BarePositions& oPositions) {
    const F64 half = Set1(0.5);
    for (int i = 0; i < oImages.nCols * oImages.nRows; i += kLanes) {
        const Group o(oPositions, i);
        const F64 col = Floor(o.col);
        const F64 row = Floor(o.row);
        std::int64_t anPlace[kLanes];
        StorePlaces(oImages, col, row, anPlace);
        AskAhead(oImages.pabySrc, oPositions, anPlace);
        F64 value = Bilinear::Value(BareWindow{oImages, anPlace}, o.col - col, o.row - row);
        value = Floor(value + half);
        if constexpr (kMask) {
            AskAhead(oImages.pabyMask, oPositions, anPlace);
            const unsigned nWhole = FullPairBits(oImages.pabyMask, anPlace) &
                                    FullPairBits(oImages.pabyMask + oImages.nPitch, anPlace);
            if (nWhole != 0xff) {
                StorePlaces(oImages, Floor(o.col + half), Floor(o.row + half), anPlace);
                const B64 whole{static_cast<__mmask8>(nWhole)};
                const B64 invalid{static_cast<__mmask8>(ByteBits(oImages.pabyMask, anPlace, 0))};
                value = Select(whole, value, ZeroWhere(invalid, Gather(oImages.pabySrc, anPlace)));
            }
        }
        StoreSamples(oImages.pabyTgt + i, value);
    }
}

}  // namespace

}  // namespace vetra::utils::engine

void BareNearest(const BareImages& oImages, const BarePositions& oPositions) {
    using namespace vetra::utils::engine;
    oImages.pabyMask == nullptr ? NearestLoop<false>(oImages, oPositions)
                                : NearestLoop<true>(oImages, oPositions);
}

void BareBilinear(const BareImages& oImages, const BarePositions& oPositions) {
    using namespace vetra::utils::engine;
    oImages.pabyMask == nullptr ? BilinearLoop<false>(oImages, oPositions)
                                : BilinearLoop<true>(oImages, oPositions);
}

void BareScaledNearest(const BareImages& oImages, const BareCells& oCells) {
    using namespace vetra::utils::engine;
    oImages.pabyMask == nullptr ? ScaledNearestLoop<false>(oImages, oCells)
                                : ScaledNearestLoop<true>(oImages, oCells);
}
