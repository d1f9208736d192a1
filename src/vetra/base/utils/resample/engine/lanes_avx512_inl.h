// The lane layer for AVX-512: one register of eight doubles. Included inside a level's namespace;
// see stages_inl.h for what a lane layer offers.

struct F64 {
    __m512d v;
};
struct B64 {
    __mmask8 m;
};

inline F64 operator+(F64 a, F64 b) { return {_mm512_add_pd(a.v, b.v)}; }
inline F64 operator-(F64 a, F64 b) { return {_mm512_sub_pd(a.v, b.v)}; }
inline F64 operator*(F64 a, F64 b) { return {_mm512_mul_pd(a.v, b.v)}; }
inline F64 operator/(F64 a, F64 b) { return {_mm512_div_pd(a.v, b.v)}; }
inline B64 operator<=(F64 a, F64 b) { return {_mm512_cmp_pd_mask(a.v, b.v, _CMP_LE_OQ)}; }
inline B64 operator<(F64 a, F64 b) { return {_mm512_cmp_pd_mask(a.v, b.v, _CMP_LT_OQ)}; }
inline B64 operator>(F64 a, F64 b) { return b < a; }
inline B64 operator==(F64 a, F64 b) { return {_mm512_cmp_pd_mask(a.v, b.v, _CMP_EQ_OQ)}; }
inline B64 operator&(B64 a, B64 b) { return {static_cast<__mmask8>(a.m & b.m)}; }
inline F64 Select(B64 m, F64 a, F64 b) { return {_mm512_mask_blend_pd(m.m, b.v, a.v)}; }

inline F64 Least(F64 a, F64 b) { return {_mm512_min_pd(a.v, b.v)}; }
inline F64 Greatest(F64 a, F64 b) { return {_mm512_max_pd(a.v, b.v)}; }
inline double LeastLane(F64 a) { return _mm512_reduce_min_pd(a.v); }
inline double GreatestLane(F64 a) { return _mm512_reduce_max_pd(a.v); }

inline F64 ZeroWhere(B64 m, F64 a) {
    return {_mm512_maskz_mov_pd(static_cast<__mmask8>(~m.m), a.v)};
}

inline F64 Set1(double df) { return {_mm512_set1_pd(df)}; }
inline F64 Set(double a, double b, double c, double d, double e, double f, double g, double h) {
    return {_mm512_setr_pd(a, b, c, d, e, f, g, h)};
}
inline F64 Load(const double* p) { return {_mm512_loadu_pd(p)}; }
inline void Store(double* p, F64 a) { _mm512_storeu_pd(p, a.v); }

inline F64 Floor(F64 a) {
    return {_mm512_roundscale_pd(a.v, _MM_FROUND_TO_NEG_INF | _MM_FROUND_NO_EXC)};
}
inline F64 RoundEven(F64 a) {
    return {_mm512_roundscale_pd(a.v, _MM_FROUND_TO_NEAREST_INT | _MM_FROUND_NO_EXC)};
}

inline F64 Sqrt(F64 a) { return {_mm512_sqrt_pd(a.v)}; }

inline F64 FusedMultiplyAdd(F64 a, F64 b, F64 c) { return {_mm512_fmadd_pd(a.v, b.v, c.v)}; }
template <int N>
inline bool AnyTiny(const F64 (&x)[N]) {
    // Every exponent from 2^-511 on has one of the two upper bits, here moved into bit 62.
    __m512i vLarge = _mm512_castpd_si512(x[0].v);
    vLarge = _mm512_or_si512(vLarge, _mm512_slli_epi64(vLarge, 1));
    for (int k = 1; k < N; ++k) {
        const __m512i v = _mm512_castpd_si512(x[k].v);
        vLarge = _mm512_ternarylogic_epi64(vLarge, v, _mm512_slli_epi64(v, 1), 0xe0);
    }
    if (_mm512_testn_epi64_mask(vLarge, _mm512_set1_epi64(std::int64_t{1} << 62)) == 0) {
        return false;
    }
    return AnySmallNumber(x);
}

inline F64 RunningSums(F64 a) {
    const __m512i vZero = _mm512_setzero_si512();
    __m512d v = a.v;
    v = v + _mm512_castsi512_pd(_mm512_alignr_epi64(_mm512_castpd_si512(v), vZero, 7));
    v = v + _mm512_castsi512_pd(_mm512_alignr_epi64(_mm512_castpd_si512(v), vZero, 6));
    v = v + _mm512_castsi512_pd(_mm512_alignr_epi64(_mm512_castpd_si512(v), vZero, 4));
    return {v};
}
inline F64 LastLane(F64 a) { return {_mm512_permutexvar_pd(_mm512_set1_epi64(kLanes - 1), a.v)}; }

inline unsigned Bits(B64 b) { return b.m; }
inline B64 BytesEqual(const unsigned char* p, unsigned char nValue) {
    const __mmask16 m = _mm_cmpeq_epi8_mask(_mm_loadl_epi64(reinterpret_cast<const __m128i*>(p)),
                                            _mm_set1_epi8(static_cast<char>(nValue)));
    return {static_cast<__mmask8>(m)};
}

inline std::uint64_t EqualBits(const unsigned char* p, unsigned char nValue) {
    return _mm512_cmpeq_epi8_mask(_mm512_loadu_si512(p),
                                  _mm512_set1_epi8(static_cast<char>(nValue)));
}

inline F64 FromInt32(__m256i v) { return {_mm512_cvtepi32_pd(v)}; }
inline F64 FromFloat(__m256 v) { return {_mm512_cvtps_pd(v)}; }
inline F64 FromHalves(__m256d lo, __m256d hi) {
    return {_mm512_insertf64x4(_mm512_castpd256_pd512(lo), hi, 1)};
}
inline __m256i ToInt32(F64 a) { return _mm512_cvttpd_epi32(a.v); }
inline __m256 ToFloat(F64 a) { return _mm512_cvtpd_ps(a.v); }

// Eight 32-bit integers that fit as 16-bit ones, or as 8-bit ones in the low half.
template <bool kSigned>
inline __m128i Narrow16(__m256i v) {
    return _mm256_cvtepi32_epi16(v);
}
template <bool kSigned>
inline __m128i Narrow8(__m256i v) {
    return _mm256_cvtepi32_epi8(v);
}

inline F64 LoadFloats(const float* p) { return FromFloat(_mm256_loadu_ps(p)); }
inline void StoreIntegers(std::int64_t* p, F64 a) {
    _mm512_storeu_si512(p, _mm512_cvttpd_epi64(a.v));
}

// Eight pixels of a source: 0, 0 where they lie outside.
struct Cells {
    __m256i vCol;
    __m256i vRow;
    __mmask8 m;
};
// What isn't a 32-bit number becomes the least one, which is outside.
inline Cells CellsInside(F64 col, F64 row, const CellLimits& o) {
    const __m256i vCol = _mm256_add_epi32(ToInt32(col), _mm256_set1_epi32(o.nColOff));
    const __m256i vRow = _mm256_add_epi32(ToInt32(row), _mm256_set1_epi32(o.nRowOff));
    const __mmask8 m =
        _mm256_mask_cmplt_epu32_mask(_mm256_cmplt_epu32_mask(vCol, _mm256_set1_epi32(o.nCols)),
                                     vRow, _mm256_set1_epi32(o.nRows));
    return {_mm256_maskz_mov_epi32(m, vCol), _mm256_maskz_mov_epi32(m, vRow), m};
}
inline unsigned Bits(const Cells& o) { return o.m; }

inline void StorePlaces(std::int64_t* p, const Cells& o, int nPitch, int nChan) {
    const __m512i vRow = _mm512_mul_epi32(_mm512_cvtepi32_epi64(o.vRow), _mm512_set1_epi64(nPitch));
    const __m256i vCol = _mm256_mullo_epi32(o.vCol, _mm256_set1_epi32(nChan));
    _mm512_storeu_si512(p, _mm512_add_epi64(vRow, _mm512_cvtepi32_epi64(vCol)));
}

inline F64 GatherNear(const double* p, const std::int64_t* o, int nShift) {
    const __m512i vPlace = _mm512_add_epi64(_mm512_loadu_si512(o), _mm512_set1_epi64(nShift));
    return {_mm512_permutex2var_pd(_mm512_loadu_pd(p), vPlace, _mm512_loadu_pd(p + kLanes))};
}

#include "vetra/base/utils/resample/engine/lanes_avx_common_inl.h"
