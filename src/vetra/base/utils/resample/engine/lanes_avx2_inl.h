// The lane layer for AVX2: two registers of four doubles. Included inside a level's namespace; see
// stages_inl.h for what a lane layer offers.

struct F64 {
    __m256d lo;
    __m256d hi;
};
struct B64 {
    __m256d lo;
    __m256d hi;
};

inline F64 operator+(F64 a, F64 b) {
    return {_mm256_add_pd(a.lo, b.lo), _mm256_add_pd(a.hi, b.hi)};
}
inline F64 operator-(F64 a, F64 b) {
    return {_mm256_sub_pd(a.lo, b.lo), _mm256_sub_pd(a.hi, b.hi)};
}
inline F64 operator*(F64 a, F64 b) {
    return {_mm256_mul_pd(a.lo, b.lo), _mm256_mul_pd(a.hi, b.hi)};
}
inline F64 operator/(F64 a, F64 b) {
    return {_mm256_div_pd(a.lo, b.lo), _mm256_div_pd(a.hi, b.hi)};
}
inline B64 operator<=(F64 a, F64 b) {
    return {_mm256_cmp_pd(a.lo, b.lo, _CMP_LE_OQ), _mm256_cmp_pd(a.hi, b.hi, _CMP_LE_OQ)};
}
inline B64 operator<(F64 a, F64 b) {
    return {_mm256_cmp_pd(a.lo, b.lo, _CMP_LT_OQ), _mm256_cmp_pd(a.hi, b.hi, _CMP_LT_OQ)};
}
inline B64 operator>(F64 a, F64 b) { return b < a; }
inline B64 operator==(F64 a, F64 b) {
    return {_mm256_cmp_pd(a.lo, b.lo, _CMP_EQ_OQ), _mm256_cmp_pd(a.hi, b.hi, _CMP_EQ_OQ)};
}
inline B64 operator&(B64 a, B64 b) {
    return {_mm256_and_pd(a.lo, b.lo), _mm256_and_pd(a.hi, b.hi)};
}
inline F64 Select(B64 m, F64 a, F64 b) {
    return {_mm256_blendv_pd(b.lo, a.lo, m.lo), _mm256_blendv_pd(b.hi, a.hi, m.hi)};
}

inline F64 Least(F64 a, F64 b) { return {_mm256_min_pd(a.lo, b.lo), _mm256_min_pd(a.hi, b.hi)}; }
inline F64 Greatest(F64 a, F64 b) { return {_mm256_max_pd(a.lo, b.lo), _mm256_max_pd(a.hi, b.hi)}; }
inline double LeastLane(F64 a) {
    const __m256d v = _mm256_min_pd(a.lo, a.hi);
    const __m128d w = _mm_min_pd(_mm256_castpd256_pd128(v), _mm256_extractf128_pd(v, 1));
    return _mm_cvtsd_f64(_mm_min_sd(w, _mm_unpackhi_pd(w, w)));
}
inline double GreatestLane(F64 a) {
    const __m256d v = _mm256_max_pd(a.lo, a.hi);
    const __m128d w = _mm_max_pd(_mm256_castpd256_pd128(v), _mm256_extractf128_pd(v, 1));
    return _mm_cvtsd_f64(_mm_max_sd(w, _mm_unpackhi_pd(w, w)));
}

inline F64 ZeroWhere(B64 m, F64 a) {
    return {_mm256_andnot_pd(m.lo, a.lo), _mm256_andnot_pd(m.hi, a.hi)};
}

inline F64 Set1(double df) { return {_mm256_set1_pd(df), _mm256_set1_pd(df)}; }
inline F64 Set(double a, double b, double c, double d, double e, double f, double g, double h) {
    return {_mm256_setr_pd(a, b, c, d), _mm256_setr_pd(e, f, g, h)};
}
inline F64 Load(const double* p) { return {_mm256_loadu_pd(p), _mm256_loadu_pd(p + 4)}; }
inline void Store(double* p, F64 a) {
    _mm256_storeu_pd(p, a.lo);
    _mm256_storeu_pd(p + 4, a.hi);
}

inline F64 Floor(F64 a) { return {_mm256_floor_pd(a.lo), _mm256_floor_pd(a.hi)}; }
inline F64 RoundEven(F64 a) {
    constexpr int nMode = _MM_FROUND_TO_NEAREST_INT | _MM_FROUND_NO_EXC;
    return {_mm256_round_pd(a.lo, nMode), _mm256_round_pd(a.hi, nMode)};
}
inline F64 Sqrt(F64 a) { return {_mm256_sqrt_pd(a.lo), _mm256_sqrt_pd(a.hi)}; }

inline F64 FusedMultiplyAdd(F64 a, F64 b, F64 c) {
    return {_mm256_fmadd_pd(a.lo, b.lo, c.lo), _mm256_fmadd_pd(a.hi, b.hi, c.hi)};
}
template <int N>
inline bool AnyTiny(const F64 (&x)[N]) {
    // Every exponent from 2^-511 on has one of the two upper bits, here moved into bit 63.
    const auto fnLarge = [](__m256d v) {
        const __m256i n = _mm256_castpd_si256(v);
        return _mm256_or_si256(_mm256_slli_epi64(n, 1), _mm256_slli_epi64(n, 2));
    };
    __m256i vLarge = _mm256_set1_epi64x(-1);
    for (int k = 0; k < N; ++k) {
        vLarge = _mm256_and_si256(vLarge, fnLarge(x[k].lo));
        vLarge = _mm256_and_si256(vLarge, fnLarge(x[k].hi));
    }
    return _mm256_movemask_pd(_mm256_castsi256_pd(vLarge)) != 0xf && AnySmallNumber(x);
}

// Sums from the left within four.
inline __m256d RunningSums4(__m256d v) {
    // Within pairs, and then the first pair's to both of the second.
    v = v + _mm256_shuffle_pd(_mm256_setzero_pd(), v, 0);
    const __m256d vFirst = _mm256_permute4x64_pd(v, 0x50);
    return v + _mm256_blend_pd(_mm256_setzero_pd(), vFirst, 0xc);
}
inline F64 RunningSums(F64 a) {
    const __m256d lo = RunningSums4(a.lo);
    return {lo, RunningSums4(a.hi) + _mm256_permute4x64_pd(lo, 0xff)};
}
inline F64 LastLane(F64 a) {
    const __m256d v = _mm256_permute4x64_pd(a.hi, 0xff);
    return {v, v};
}

inline unsigned Bits(B64 b) {
    return static_cast<unsigned>(_mm256_movemask_pd(b.lo) | _mm256_movemask_pd(b.hi) << 4);
}
inline B64 BytesEqual(const unsigned char* p, unsigned char nValue) {
    const __m128i v = _mm_cmpeq_epi8(_mm_loadl_epi64(reinterpret_cast<const __m128i*>(p)),
                                     _mm_set1_epi8(static_cast<char>(nValue)));
    return {_mm256_castsi256_pd(_mm256_cvtepi8_epi64(v)),
            _mm256_castsi256_pd(_mm256_cvtepi8_epi64(_mm_srli_si128(v, 4)))};
}

inline std::uint64_t EqualBits(const unsigned char* p, unsigned char nValue) {
    const auto fnHalf = [&](const unsigned char* q) {
        const __m256i v = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(q));
        return static_cast<unsigned>(_mm256_movemask_epi8(
            _mm256_cmpeq_epi8(v, _mm256_set1_epi8(static_cast<char>(nValue)))));
    };
    return std::uint64_t{fnHalf(p + 32)} << 32 | fnHalf(p);
}

inline F64 FromInt32(__m256i v) {
    return {_mm256_cvtepi32_pd(_mm256_castsi256_si128(v)),
            _mm256_cvtepi32_pd(_mm256_extracti128_si256(v, 1))};
}
inline F64 FromFloat(__m256 v) {
    return {_mm256_cvtps_pd(_mm256_castps256_ps128(v)),
            _mm256_cvtps_pd(_mm256_extractf128_ps(v, 1))};
}
inline F64 FromHalves(__m256d lo, __m256d hi) { return {lo, hi}; }
inline __m256i ToInt32(F64 a) {
    return _mm256_set_m128i(_mm256_cvttpd_epi32(a.hi), _mm256_cvttpd_epi32(a.lo));
}
inline __m256 ToFloat(F64 a) {
    return _mm256_set_m128(_mm256_cvtpd_ps(a.hi), _mm256_cvtpd_ps(a.lo));
}

// Eight 32-bit integers that fit as 16-bit ones, or as 8-bit ones in the low half.
template <bool kSigned>
inline __m128i Narrow16(__m256i v) {
    const __m128i vLow = _mm256_castsi256_si128(v);
    const __m128i vHigh = _mm256_extracti128_si256(v, 1);
    return kSigned ? _mm_packs_epi32(vLow, vHigh) : _mm_packus_epi32(vLow, vHigh);
}
template <bool kSigned>
inline __m128i Narrow8(__m256i v) {
    const __m128i v16 = Narrow16<true>(v);
    return kSigned ? _mm_packs_epi16(v16, v16) : _mm_packus_epi16(v16, v16);
}

inline F64 LoadFloats(const float* p) { return FromFloat(_mm256_loadu_ps(p)); }

// Adding 2^52 leaves a whole number from 0 to 2^52 - 1 in the low bits of the mantissa.
inline void StoreIntegers(std::int64_t* p, F64 a) {
    const __m256d vMagic = _mm256_set1_pd(0x1p52);
    const auto fnStore = [&](std::int64_t* q, __m256d v) {
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(q),
                            _mm256_castpd_si256(_mm256_xor_pd(_mm256_add_pd(v, vMagic), vMagic)));
    };
    fnStore(p, a.lo);
    fnStore(p + 4, a.hi);
}

// Eight pixels of a source: 0, 0 where they lie outside.
struct Cells {
    __m256i vCol;
    __m256i vRow;
    __m256i vInside;
};
// What isn't a 32-bit number becomes the least one, which is outside.
inline Cells CellsInside(F64 col, F64 row, const CellLimits& o) {
    const __m256i vCol = _mm256_add_epi32(ToInt32(col), _mm256_set1_epi32(o.nColOff));
    const __m256i vRow = _mm256_add_epi32(ToInt32(row), _mm256_set1_epi32(o.nRowOff));
    const auto fnInside = [](__m256i v, int nCount) {
        // Of none, the sign can't be trusted.
        const __m256i vLast = _mm256_set1_epi32(nCount - 1);
        return nCount > 0 ? _mm256_cmpeq_epi32(_mm256_min_epu32(v, vLast), v)
                          : _mm256_setzero_si256();
    };
    const __m256i vInside = _mm256_and_si256(fnInside(vCol, o.nCols), fnInside(vRow, o.nRows));
    return {_mm256_and_si256(vCol, vInside), _mm256_and_si256(vRow, vInside), vInside};
}
inline unsigned Bits(const Cells& o) {
    return static_cast<unsigned>(_mm256_movemask_ps(_mm256_castsi256_ps(o.vInside)));
}

inline void StorePlaces(std::int64_t* p, const Cells& o, int nPitch, int nChan) {
    const __m256i vCol = _mm256_mullo_epi32(o.vCol, _mm256_set1_epi32(nChan));
    const auto fnStore = [&](std::int64_t* q, __m128i vRow4, __m128i vCol4) {
        const __m256i vPlace = _mm256_add_epi64(
            _mm256_mul_epi32(_mm256_cvtepi32_epi64(vRow4), _mm256_set1_epi64x(nPitch)),
            _mm256_cvtepi32_epi64(vCol4));
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(q), vPlace);
    };
    fnStore(p, _mm256_castsi256_si128(o.vRow), _mm256_castsi256_si128(vCol));
    fnStore(p + 4, _mm256_extracti128_si256(o.vRow, 1), _mm256_extracti128_si256(vCol, 1));
}

#include "vetra/base/utils/resample/engine/lanes_avx_common_inl.h"

inline F64 GatherNear(const double* p, const std::int64_t* o, int nShift) {
    return Gather(p + nShift, o);
}
