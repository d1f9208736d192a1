// What the AVX2 and AVX-512 lane layers share: the bits of eight samples, picked up one by one. No
// load reaches beyond the samples that it is asked for, so none leaves the source. Included inside
// a level's namespace.

template <typename U, typename T>
inline U LoadBits(const T* p) {
    U n;
    __builtin_memcpy(&n, p, sizeof n);
    return n;
}

// Eight 8-bit values in the low half.
inline __m128i Gather8(const void* p, const std::int64_t* o) {
    const char* q = static_cast<const char*>(p);
    __m128i v = _mm_cvtsi32_si128(static_cast<unsigned char>(q[o[0]]));
    v = _mm_insert_epi8(v, q[o[1]], 1);
    v = _mm_insert_epi8(v, q[o[2]], 2);
    v = _mm_insert_epi8(v, q[o[3]], 3);
    v = _mm_insert_epi8(v, q[o[4]], 4);
    v = _mm_insert_epi8(v, q[o[5]], 5);
    v = _mm_insert_epi8(v, q[o[6]], 6);
    return _mm_insert_epi8(v, q[o[7]], 7);
}

// Eight 16-bit values, each at nScale * offset bytes.
template <int nScale>
inline __m128i Gather16(const void* p, const std::int64_t* o) {
    const char* q = static_cast<const char*>(p);
    const auto fnLoad = [&](int i) { return LoadBits<short>(q + nScale * o[i]); };
    __m128i v = _mm_cvtsi32_si128(static_cast<unsigned short>(fnLoad(0)));
    v = _mm_insert_epi16(v, fnLoad(1), 1);
    v = _mm_insert_epi16(v, fnLoad(2), 2);
    v = _mm_insert_epi16(v, fnLoad(3), 3);
    v = _mm_insert_epi16(v, fnLoad(4), 4);
    v = _mm_insert_epi16(v, fnLoad(5), 5);
    v = _mm_insert_epi16(v, fnLoad(6), 6);
    return _mm_insert_epi16(v, fnLoad(7), 7);
}

// Eight 32-bit values.
template <int nScale>
inline __m256i Gather32(const void* p, const std::int64_t* o) {
    const char* q = static_cast<const char*>(p);
    const auto fnHalf = [&](int i) {
        __m128i v = _mm_cvtsi32_si128(LoadBits<int>(q + nScale * o[i]));
        v = _mm_insert_epi32(v, LoadBits<int>(q + nScale * o[i + 1]), 1);
        v = _mm_insert_epi32(v, LoadBits<int>(q + nScale * o[i + 2]), 2);
        return _mm_insert_epi32(v, LoadBits<int>(q + nScale * o[i + 3]), 3);
    };
    return _mm256_set_m128i(fnHalf(4), fnHalf(0));
}

// Four 64-bit values as a register of 32-byte size, from lane i on.
template <int nScale>
inline __m256i Gather64(const void* p, const std::int64_t* o, int i) {
    const char* q = static_cast<const char*>(p);
    const auto fnPair = [&](int k) {
        return _mm_unpacklo_epi64(
            _mm_loadl_epi64(reinterpret_cast<const __m128i*>(q + nScale * o[k])),
            _mm_loadl_epi64(reinterpret_cast<const __m128i*>(q + nScale * o[k + 1])));
    };
    return _mm256_set_m128i(fnPair(i + 2), fnPair(i));
}

template <typename T>
inline constexpr bool kIsSigned = T(-1) < T(0);

// Eight 8-bit or 16-bit values as 32-bit integers.
template <typename T>
inline __m256i Widen(__m128i v) {
    if constexpr (sizeof(T) == 1) {
        return kIsSigned<T> ? _mm256_cvtepi8_epi32(v) : _mm256_cvtepu8_epi32(v);
    } else {
        return kIsSigned<T> ? _mm256_cvtepi16_epi32(v) : _mm256_cvtepu16_epi32(v);
    }
}

// The first and the second sample of eight pairs of adjacent 8-bit samples, as 32-bit integers.
template <typename T>
inline void SplitPairs8(__m128i vPairs, __m256i& v0, __m256i& v1) {
    if constexpr (kIsSigned<T>) {
        v0 = _mm256_cvtepi16_epi32(_mm_srai_epi16(_mm_slli_epi16(vPairs, 8), 8));
        v1 = _mm256_cvtepi16_epi32(_mm_srai_epi16(vPairs, 8));
    } else {
        v0 = _mm256_cvtepu16_epi32(_mm_and_si128(vPairs, _mm_set1_epi16(0xff)));
        v1 = _mm256_cvtepu16_epi32(_mm_srli_epi16(vPairs, 8));
    }
}

// The same for pairs of 16-bit samples.
template <typename T>
inline void SplitPairs16(__m256i vPairs, __m256i& v0, __m256i& v1) {
    if constexpr (kIsSigned<T>) {
        v0 = _mm256_srai_epi32(_mm256_slli_epi32(vPairs, 16), 16);
        v1 = _mm256_srai_epi32(vPairs, 16);
    } else {
        v0 = _mm256_and_si256(vPairs, _mm256_set1_epi32(0xffff));
        v1 = _mm256_srli_epi32(vPairs, 16);
    }
}

// The first and the second 32 bits of eight times 64, of which v0 holds the lanes 0 to 3.
inline void SplitWords(__m256i v0, __m256i v1, __m256i& vFirst, __m256i& vSecond) {
    const __m256 vLow = _mm256_castsi256_ps(_mm256_permute2x128_si256(v0, v1, 0x20));   // 0 1 | 4 5
    const __m256 vHigh = _mm256_castsi256_ps(_mm256_permute2x128_si256(v0, v1, 0x31));  // 2 3 | 6 7
    vFirst = _mm256_castps_si256(_mm256_shuffle_ps(vLow, vHigh, 0x88));
    vSecond = _mm256_castps_si256(_mm256_shuffle_ps(vLow, vHigh, 0xdd));
}

// The types whose samples the functions below read; the 64-bit integers and 32U go the plain way.
enum class Kind { eSmall8, eSmall16, eInt32, eFloat, eDouble, eOther };
template <typename T>
inline constexpr Kind kKind = Kind::eOther;
template <>
inline constexpr Kind kKind<unsigned char> = Kind::eSmall8;
template <>
inline constexpr Kind kKind<signed char> = Kind::eSmall8;
template <>
inline constexpr Kind kKind<unsigned short> = Kind::eSmall16;
template <>
inline constexpr Kind kKind<short> = Kind::eSmall16;
template <>
inline constexpr Kind kKind<int> = Kind::eInt32;
template <>
inline constexpr Kind kKind<float> = Kind::eFloat;
template <>
inline constexpr Kind kKind<double> = Kind::eDouble;

template <typename T>
inline F64 Gather(const T* p, const std::int64_t* o) {
    if constexpr (kKind<T> == Kind::eSmall8) {
        return FromInt32(Widen<T>(Gather8(p, o)));
    } else if constexpr (kKind<T> == Kind::eSmall16) {
        return FromInt32(Widen<T>(Gather16<2>(p, o)));
    } else if constexpr (kKind<T> == Kind::eInt32) {
        return FromInt32(Gather32<4>(p, o));
    } else if constexpr (kKind<T> == Kind::eFloat) {
        return FromFloat(_mm256_castsi256_ps(Gather32<4>(p, o)));
    } else if constexpr (kKind<T> == Kind::eDouble) {
        return FromHalves(_mm256_castsi256_pd(Gather64<8>(p, o, 0)),
                          _mm256_castsi256_pd(Gather64<8>(p, o, 4)));
    } else {
        double adf[kLanes];
        for (int i = 0; i < kLanes; ++i) {
            adf[i] = static_cast<double>(p[o[i]]);
        }
        return Load(adf);
    }
}

// Two adjacent samples at each offset.
template <typename T>
inline void GatherPair(const T* p, const std::int64_t* o, F64& a, F64& b) {
    if constexpr (kKind<T> == Kind::eSmall8) {
        __m256i v0;
        __m256i v1;
        SplitPairs8<T>(Gather16<1>(p, o), v0, v1);
        a = FromInt32(v0);
        b = FromInt32(v1);
    } else if constexpr (kKind<T> == Kind::eSmall16) {
        __m256i v0;
        __m256i v1;
        SplitPairs16<T>(Gather32<2>(p, o), v0, v1);
        a = FromInt32(v0);
        b = FromInt32(v1);
    } else if constexpr (kKind<T> == Kind::eInt32 || kKind<T> == Kind::eFloat) {
        __m256i vFirst;
        __m256i vSecond;
        SplitWords(Gather64<4>(p, o, 0), Gather64<4>(p, o, 4), vFirst, vSecond);
        if constexpr (kKind<T> == Kind::eInt32) {
            a = FromInt32(vFirst);
            b = FromInt32(vSecond);
        } else {
            a = FromFloat(_mm256_castsi256_ps(vFirst));
            b = FromFloat(_mm256_castsi256_ps(vSecond));
        }
    } else {
        a = Gather(p, o);
        b = Gather(p + 1, o);
    }
}

// Eight times 128 bits, those of the lanes i and i + 4 in each register.
template <int nScale>
inline void Gather128(const void* p, const std::int64_t* o, __m256 (&r)[4]) {
    const char* q = static_cast<const char*>(p);
    const auto fnLoad = [&](int i) {
        return _mm_loadu_ps(reinterpret_cast<const float*>(q + nScale * o[i]));
    };
    for (int i = 0; i < 4; ++i) {
        r[i] = _mm256_set_m128(fnLoad(i + 4), fnLoad(i));
    }
}

// The 32-bit values of such registers, position by position.
inline void Transpose(__m256 (&r)[4]) {
    const __m256d t0 = _mm256_castps_pd(_mm256_unpacklo_ps(r[0], r[1]));
    const __m256d t1 = _mm256_castps_pd(_mm256_unpackhi_ps(r[0], r[1]));
    const __m256d t2 = _mm256_castps_pd(_mm256_unpacklo_ps(r[2], r[3]));
    const __m256d t3 = _mm256_castps_pd(_mm256_unpackhi_ps(r[2], r[3]));
    r[0] = _mm256_castpd_ps(_mm256_unpacklo_pd(t0, t2));
    r[1] = _mm256_castpd_ps(_mm256_unpackhi_pd(t0, t2));
    r[2] = _mm256_castpd_ps(_mm256_unpacklo_pd(t1, t3));
    r[3] = _mm256_castpd_ps(_mm256_unpackhi_pd(t1, t3));
}

// Four doubles each of the lanes i to i + 3, position by position.
inline void GatherFour64(const double* p, const std::int64_t* o, __m256d (&r)[4]) {
    const __m256d a = _mm256_loadu_pd(p + o[0]);
    const __m256d b = _mm256_loadu_pd(p + o[1]);
    const __m256d c = _mm256_loadu_pd(p + o[2]);
    const __m256d d = _mm256_loadu_pd(p + o[3]);
    const __m256d t0 = _mm256_unpacklo_pd(a, b);
    const __m256d t1 = _mm256_unpackhi_pd(a, b);
    const __m256d t2 = _mm256_unpacklo_pd(c, d);
    const __m256d t3 = _mm256_unpackhi_pd(c, d);
    r[0] = _mm256_permute2f128_pd(t0, t2, 0x20);
    r[1] = _mm256_permute2f128_pd(t1, t3, 0x20);
    r[2] = _mm256_permute2f128_pd(t0, t2, 0x31);
    r[3] = _mm256_permute2f128_pd(t1, t3, 0x31);
}

// Four adjacent samples at each offset.
template <typename T>
inline void GatherQuad(const T* p, const std::int64_t* o, F64 (&q)[4]) {
    if constexpr (kKind<T> == Kind::eSmall8) {
        const __m256i v = Gather32<1>(p, o);
        if constexpr (kIsSigned<T>) {
            q[0] = FromInt32(_mm256_srai_epi32(_mm256_slli_epi32(v, 24), 24));
            q[1] = FromInt32(_mm256_srai_epi32(_mm256_slli_epi32(v, 16), 24));
            q[2] = FromInt32(_mm256_srai_epi32(_mm256_slli_epi32(v, 8), 24));
            q[3] = FromInt32(_mm256_srai_epi32(v, 24));
        } else {
            const __m256i vLow = _mm256_set1_epi32(0xff);
            q[0] = FromInt32(_mm256_and_si256(v, vLow));
            q[1] = FromInt32(_mm256_and_si256(_mm256_srli_epi32(v, 8), vLow));
            q[2] = FromInt32(_mm256_and_si256(_mm256_srli_epi32(v, 16), vLow));
            q[3] = FromInt32(_mm256_srli_epi32(v, 24));
        }
    } else if constexpr (kKind<T> == Kind::eSmall16) {
        __m256i vFirst;
        __m256i vSecond;
        SplitWords(Gather64<2>(p, o, 0), Gather64<2>(p, o, 4), vFirst, vSecond);
        __m256i v[4];
        SplitPairs16<T>(vFirst, v[0], v[1]);
        SplitPairs16<T>(vSecond, v[2], v[3]);
        for (int j = 0; j < 4; ++j) {
            q[j] = FromInt32(v[j]);
        }
    } else if constexpr (kKind<T> == Kind::eInt32 || kKind<T> == Kind::eFloat) {
        __m256 r[4];
        Gather128<4>(p, o, r);
        Transpose(r);
        for (int j = 0; j < 4; ++j) {
            if constexpr (kKind<T> == Kind::eInt32) {
                q[j] = FromInt32(_mm256_castps_si256(r[j]));
            } else {
                q[j] = FromFloat(r[j]);
            }
        }
    } else if constexpr (kKind<T> == Kind::eDouble) {
        __m256d lo[4];
        __m256d hi[4];
        GatherFour64(p, o, lo);
        GatherFour64(p, o + 4, hi);
        for (int j = 0; j < 4; ++j) {
            q[j] = FromHalves(lo[j], hi[j]);
        }
    } else {
        for (int j = 0; j < 4; ++j) {
            q[j] = Gather(p + j, o);
        }
    }
}

template <typename T>
inline F64 LoadSamples(const T* p) {
    const auto* v = reinterpret_cast<const __m128i*>(p);
    if constexpr (kKind<T> == Kind::eSmall8) {
        return FromInt32(Widen<T>(_mm_loadl_epi64(v)));
    } else if constexpr (kKind<T> == Kind::eSmall16) {
        return FromInt32(Widen<T>(_mm_loadu_si128(v)));
    } else if constexpr (kKind<T> == Kind::eInt32) {
        return FromInt32(_mm256_loadu_si256(reinterpret_cast<const __m256i*>(p)));
    } else if constexpr (kKind<T> == Kind::eFloat) {
        return LoadFloats(p);
    } else if constexpr (kKind<T> == Kind::eDouble) {
        return Load(p);
    } else {
        double adf[kLanes];
        for (int i = 0; i < kLanes; ++i) {
            adf[i] = static_cast<double>(p[i]);
        }
        return Load(adf);
    }
}

// The second of two loads ends with the last sample.
template <int kStep, typename T>
inline F64 LoadEvery(const T* p) {
    constexpr int kLoad = 16;
    constexpr int kSecond = (kLanes - 1) * kStep + 1 - kLoad;
    static_assert(sizeof(T) == 1 && kSecond > 0 && kSecond <= kLoad);
    // An index with the highest bit gives 0.
    alignas(kLoad) signed char aFirst[kLoad];
    alignas(kLoad) signed char aSecond[kLoad];
    for (int i = 0; i < kLoad; ++i) {
        const int nPlace = i * kStep;
        aFirst[i] = static_cast<signed char>(i < kLanes && nPlace < kLoad ? nPlace : -1);
        aSecond[i] =
            static_cast<signed char>(i < kLanes && nPlace >= kLoad ? nPlace - kSecond : -1);
    }
    const auto fnPick = [&](const T* q, const signed char* pIndex) {
        return _mm_shuffle_epi8(_mm_loadu_si128(reinterpret_cast<const __m128i*>(q)),
                                _mm_load_si128(reinterpret_cast<const __m128i*>(pIndex)));
    };
    return FromInt32(Widen<T>(_mm_or_si128(fnPick(p, aFirst), fnPick(p + kSecond, aSecond))));
}

template <typename T>
inline void ShufflePairs(const T* p, const unsigned char* pabyPlace, F64& a, F64& b) {
    const __m128i v =
        _mm_shuffle_epi8(_mm_loadu_si128(reinterpret_cast<const __m128i*>(p)),
                         _mm_loadu_si128(reinterpret_cast<const __m128i*>(pabyPlace)));
    a = FromInt32(Widen<T>(v));
    b = FromInt32(Widen<T>(_mm_srli_si128(v, 8)));
}

// Copies the eight samples at the offsets.
template <typename T>
inline void CopySamples(T* t, const T* p, const std::int64_t* o) {
    if constexpr (sizeof(T) == 1) {
        _mm_storel_epi64(reinterpret_cast<__m128i*>(t), Gather8(p, o));
    } else if constexpr (sizeof(T) == 2) {
        _mm_storeu_si128(reinterpret_cast<__m128i*>(t), Gather16<2>(p, o));
    } else {
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(t), Gather32<4>(p, o));
    }
}

template <typename T>
inline void StoreSamples(T* p, F64 a) {
    if constexpr (kKind<T> == Kind::eFloat) {
        _mm256_storeu_ps(p, ToFloat(a));
    } else if constexpr (kKind<T> == Kind::eDouble) {
        Store(p, a);
    } else if constexpr (kKind<T> == Kind::eInt32) {
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(p), ToInt32(a));
    } else if constexpr (kKind<T> == Kind::eSmall16) {
        _mm_storeu_si128(reinterpret_cast<__m128i*>(p), Narrow16<kIsSigned<T>>(ToInt32(a)));
    } else if constexpr (kKind<T> == Kind::eSmall8) {
        _mm_storel_epi64(reinterpret_cast<__m128i*>(p), Narrow8<kIsSigned<T>>(ToInt32(a)));
    } else {
        double adf[kLanes];
        Store(adf, a);
        for (int i = 0; i < kLanes; ++i) {
            p[i] = static_cast<T>(adf[i]);
        }
    }
}

inline unsigned ByteBits(const unsigned char* p, const std::int64_t* o, unsigned char nValue) {
    const __m128i vSame = _mm_cmpeq_epi8(Gather8(p, o), _mm_set1_epi8(static_cast<char>(nValue)));
    return static_cast<unsigned>(_mm_movemask_epi8(vSame)) & 0xffu;
}
inline unsigned FullPairBits(const unsigned char* p, const std::int64_t* o) {
    const __m128i vZero = _mm_setzero_si128();
    const __m128i vFull = _mm_cmpeq_epi16(_mm_cmpeq_epi8(Gather16<1>(p, o), vZero), vZero);
    return static_cast<unsigned>(_mm_movemask_epi8(_mm_packs_epi16(vFull, vFull))) & 0xffu;
}

// With the reciprocal in two parts, high + low, x * high + x * low rounded once lies nearer to the
// true quotient than 2^-50 of its last place, while no quotient by an integer up to 2^45 comes
// nearer than 2^-46 to the middle of two doubles: so the rounding is that of a division
// (Brisebarre, Muller, Raina: Accelerating correctly rounded floating-point division when the
// divisor is known in advance, IEEE Transactions on Computers 53, 2004). Both parts are positive,
// so signed zeros and infinities come out right as well.
inline F64 DivideBy(F64 x, const Divisor& oDivisor) {
    return FusedMultiplyAdd(x, Set1(oDivisor.dfHigh), x * Set1(oDivisor.dfLow));
}

// Thirty-two bytes: nByte where a bit is set, else 0.
inline __m256i SpreadBits(std::uint32_t nBits, unsigned char nByte) {
    // Each byte gets the eight bits among which its own is, and keeps that one.
    const __m256i vEight = _mm256_shuffle_epi8(
        _mm256_set1_epi32(static_cast<int>(nBits)),
        _mm256_setr_epi64x(0, 0x0101010101010101, 0x0202020202020202, 0x0303030303030303));
    const __m256i vOwn = _mm256_set1_epi64x(static_cast<long long>(0x8040201008040201u));
    return _mm256_and_si256(_mm256_cmpeq_epi8(_mm256_and_si256(vEight, vOwn), vOwn),
                            _mm256_set1_epi8(static_cast<char>(nByte)));
}
inline void AddBits(unsigned char* p, std::uint64_t nBits, unsigned char nByte) {
    for (int i = 0; i < 64; i += 32) {
        auto* q = reinterpret_cast<__m256i*>(p + i);
        _mm256_storeu_si256(
            q, _mm256_or_si256(_mm256_loadu_si256(q),
                               SpreadBits(static_cast<std::uint32_t>(nBits >> i), nByte)));
    }
}
inline void StoreBits(unsigned char* p, std::uint64_t nBits0, std::uint64_t nBits1) {
    for (int i = 0; i < 64; i += 32) {
        _mm256_storeu_si256(
            reinterpret_cast<__m256i*>(p + i),
            _mm256_or_si256(SpreadBits(static_cast<std::uint32_t>(nBits0 >> i), 1),
                            SpreadBits(static_cast<std::uint32_t>(nBits1 >> i), 2)));
    }
}

inline std::uint32_t GroupBits(const std::uint64_t* panRow, const BitGroup& oGroup,
                               const std::int64_t* panCol) {
    if (oGroup.nFirst < 0) {
        return PickGroupBits(panRow, oGroup, panCol);
    }
    const auto fnTable = [](const unsigned char* p) {
        return _mm256_loadu_si256(reinterpret_cast<const __m256i*>(p));
    };
    const __m128i vRow = _mm_loadu_si128(
        reinterpret_cast<const __m128i*>(reinterpret_cast<const char*>(panRow) + oGroup.nFirst));
    const __m256i vByte =
        _mm256_shuffle_epi8(_mm256_broadcastsi128_si256(vRow), fnTable(oGroup.abyPlace));
    const __m256i vNot =
        _mm256_cmpeq_epi8(_mm256_and_si256(vByte, fnTable(oGroup.abyBit)), _mm256_setzero_si256());
    return ~static_cast<std::uint32_t>(_mm256_movemask_epi8(vNot));
}

inline void Store(std::int32_t* panCol, std::int32_t* panRow, const Cells& o) {
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(panCol), o.vCol);
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(panRow), o.vRow);
}

// Mostly the eight pixels lie in two bands and sixteen columns, from the first or the last of them
// on: then two loads have all bits.
inline unsigned BandBits(const unsigned char* pabyMap, std::int64_t nPitch,
                         const std::int32_t* panCol, const std::int32_t* panRow) {
    const auto fnLoad = [](const std::int32_t* p) {
        return _mm256_loadu_si256(reinterpret_cast<const __m256i*>(p));
    };
    const auto fnLesserEnd = [](const std::int32_t* p) {
        return p[0] < p[kLanes - 1] ? p[0] : p[kLanes - 1];
    };
    static_assert(kBandRows == 1 << 3);
    const std::int32_t nFirstCol = fnLesserEnd(panCol);
    const std::int32_t nBand = fnLesserEnd(panRow) >> 3;
    const __m256i vCols = _mm256_sub_epi32(fnLoad(panCol), _mm256_set1_epi32(nFirstCol));
    const __m256i vRows = _mm256_sub_epi32(fnLoad(panRow), _mm256_set1_epi32(nBand << 3));
    static_assert(kBandReach == 16 && 2 * kBandRows == 16);
    if (_mm256_testz_si256(_mm256_or_si256(vCols, vRows), _mm256_set1_epi32(~15)) == 0) {
        return PickBandBits(pabyMap, nPitch, panCol, panRow);
    }
    const unsigned char* p = pabyMap + nBand * nPitch + nFirstCol;
    // The upper band in the lower half and the lower one in the upper half.
    const auto fnBand = [](const unsigned char* q) {
        return _mm_loadu_si128(reinterpret_cast<const __m128i*>(q));
    };
    const __m256i vBands = _mm256_set_m128i(fnBand(p + nPitch), fnBand(p));
    // Bits of the rows of either band.
    constexpr auto nBits = static_cast<long long>(0x8040201008040201u);
    const __m256i vBits = _mm256_set_epi64x(nBits, 0, 0, nBits);
    const __m256i vFound = _mm256_and_si256(
        _mm256_shuffle_epi8(vBands, _mm256_broadcastsi128_si256(Narrow8<false>(vCols))),
        _mm256_shuffle_epi8(vBits, _mm256_broadcastsi128_si256(Narrow8<false>(vRows))));
    const auto nNot = static_cast<unsigned>(
        _mm256_movemask_epi8(_mm256_cmpeq_epi8(vFound, _mm256_setzero_si256())));
    return ~(nNot & nNot >> 16) & 0xffu;
}
