// The lane layer in portable form: four of the compiler's generic vectors of two doubles, which is
// what a plain processor has (SSE2, NEON). Included inside a level's namespace; see stages_inl.h
// for what a lane layer offers.

constexpr int kParts = 4;
typedef double Pair __attribute__((vector_size(16)));
typedef std::int64_t PairMask __attribute__((vector_size(16)));

struct F64 {
    Pair v[kParts];
};

// The lanes of a comparison: all bits of a lane, or none.
struct B64 {
    PairMask m[kParts];
};

#define VETRA_LANES_OPERATOR(Result, op, member) \
    inline Result operator op(F64 a, F64 b) {    \
        Result r;                                \
        for (int i = 0; i < kParts; ++i) {       \
            r.member[i] = a.v[i] op b.v[i];      \
        }                                        \
        return r;                                \
    }
VETRA_LANES_OPERATOR(F64, +, v)
VETRA_LANES_OPERATOR(F64, -, v)
VETRA_LANES_OPERATOR(F64, *, v)
VETRA_LANES_OPERATOR(F64, /, v)
VETRA_LANES_OPERATOR(B64, <=, m)
VETRA_LANES_OPERATOR(B64, <, m)
VETRA_LANES_OPERATOR(B64, >, m)
VETRA_LANES_OPERATOR(B64, ==, m)
#undef VETRA_LANES_OPERATOR

inline B64 operator&(B64 a, B64 b) {
    for (int i = 0; i < kParts; ++i) {
        a.m[i] &= b.m[i];
    }
    return a;
}
inline F64 Select(B64 m, F64 a, F64 b) {
    for (int i = 0; i < kParts; ++i) {
        a.v[i] = m.m[i] ? a.v[i] : b.v[i];
    }
    return a;
}

inline F64 Least(F64 a, F64 b) { return Select(a < b, a, b); }
inline F64 Greatest(F64 a, F64 b) { return Select(a > b, a, b); }
inline double LeastLane(F64 a) {
    double df = a.v[0][0];
    for (int i = 1; i < kLanes; ++i) {
        df = a.v[i / 2][i % 2] < df ? a.v[i / 2][i % 2] : df;
    }
    return df;
}
inline double GreatestLane(F64 a) {
    double df = a.v[0][0];
    for (int i = 1; i < kLanes; ++i) {
        df = a.v[i / 2][i % 2] > df ? a.v[i / 2][i % 2] : df;
    }
    return df;
}

inline F64 ZeroWhere(B64 m, F64 a) {
    for (int i = 0; i < kParts; ++i) {
        a.v[i] = reinterpret_cast<Pair>(reinterpret_cast<PairMask>(a.v[i]) & ~m.m[i]);
    }
    return a;
}

// Without a fused multiply-add nothing is gained by reciprocals.
inline F64 DivideBy(F64 x, const Divisor& oDivisor) {
    F64 r;
    for (int i = 0; i < kParts; ++i) {
        r.v[i] = x.v[i] / oDivisor.dfValue;
    }
    return r;
}
template <int N>
inline bool AnyTiny(const F64 (&)[N]) {
    return false;
}

inline F64 RunningSums(F64 a) {
    double dfSum = 0.0;
    for (int i = 0; i < kLanes; ++i) {
        dfSum += a.v[i / 2][i % 2];
        a.v[i / 2][i % 2] = dfSum;
    }
    return a;
}
inline F64 LastLane(F64 a) {
    const double df = a.v[kParts - 1][1];
    const Pair v{df, df};
    return {{v, v, v, v}};
}
inline F64 Set(double a, double b, double c, double d, double e, double f, double g, double h) {
    return {{Pair{a, b}, Pair{c, d}, Pair{e, f}, Pair{g, h}}};
}

inline F64 Set1(double df) {
    const Pair v{df, df};
    return {{v, v, v, v}};
}
inline F64 Load(const double* p) {
    F64 a;
    __builtin_memcpy(&a, p, sizeof a);
    return a;
}
inline void Store(double* p, F64 a) { __builtin_memcpy(p, &a, sizeof a); }

// The sign bits of a, or all its other bits.
inline Pair SignPart(Pair a, bool bSign) {
    const std::int64_t nSign = std::int64_t(std::uint64_t{1} << 63);
    const PairMask nMask = bSign ? PairMask{nSign, nSign} : PairMask{~nSign, ~nSign};
    return reinterpret_cast<Pair>(reinterpret_cast<PairMask>(a) & nMask);
}
inline Pair WithSignOf(Pair a, Pair sign) {
    return reinterpret_cast<Pair>(reinterpret_cast<PairMask>(a) |
                                  reinterpret_cast<PairMask>(SignPart(sign, true)));
}

// Adding 2^52 to a smaller number rounds it to a whole one, to nearest, ties to even; greater
// numbers, infinities and NaN are whole already. The sign is kept, that of zeros too.
inline F64 RoundEven(F64 a) {
    const Pair whole{0x1p52, 0x1p52};
    for (int i = 0; i < kParts; ++i) {
        const Pair magnitude = SignPart(a.v[i], false);
        const Pair rounded = WithSignOf((magnitude + whole) - whole, a.v[i]);
        a.v[i] = magnitude < whole ? rounded : a.v[i];
    }
    return a;
}
inline F64 Floor(F64 a) {
    const F64 rounded = RoundEven(a);
    return Select(rounded > a, rounded - Set1(1.0), rounded);
}

inline F64 Sqrt(F64 a) {
    for (int i = 0; i < kParts; ++i) {
        a.v[i] = Pair{__builtin_sqrt(a.v[i][0]), __builtin_sqrt(a.v[i][1])};
    }
    return a;
}

inline unsigned Bits(B64 b) {
    unsigned nBits = 0;
    for (int i = 0; i < kParts; ++i) {
        nBits |= static_cast<unsigned>((b.m[i][0] & 1) | (b.m[i][1] & 2)) << 2 * i;
    }
    return nBits;
}
inline B64 BytesEqual(const unsigned char* p, unsigned char nValue) {
    B64 b;
    for (int i = 0; i < kParts; ++i) {
        b.m[i] = PairMask{-std::int64_t{p[2 * i] == nValue}, -std::int64_t{p[2 * i + 1] == nValue}};
    }
    return b;
}

inline F64 LoadFloats(const float* p) {
    double adf[kLanes];
    for (int i = 0; i < kLanes; ++i) {
        adf[i] = static_cast<double>(p[i]);
    }
    return Load(adf);
}
inline void StoreIntegers(std::int64_t* p, F64 a) {
    for (int i = 0; i < kLanes; ++i) {
        p[i] = static_cast<std::int64_t>(a.v[i / 2][i % 2]);
    }
}

template <typename T>
inline F64 Gather(const T* p, const std::int64_t* panOffset) {
    F64 a;
    for (int i = 0; i < kParts; ++i) {
        a.v[i] = Pair{static_cast<double>(p[panOffset[2 * i]]),
                      static_cast<double>(p[panOffset[2 * i + 1]])};
    }
    return a;
}
template <typename T>
inline void GatherPair(const T* p, const std::int64_t* panOffset, F64& a, F64& b) {
    a = Gather(p, panOffset);
    b = Gather(p + 1, panOffset);
}

template <typename T>
inline void GatherQuad(const T* p, const std::int64_t* panOffset, F64 (&q)[4]) {
    for (int j = 0; j < 4; ++j) {
        q[j] = Gather(p + j, panOffset);
    }
}
inline F64 GatherNear(const double* p, const std::int64_t* panOffset, int nShift) {
    return Gather(p + nShift, panOffset);
}
template <typename T>
inline F64 LoadSamples(const T* p) {
    F64 a;
    for (int i = 0; i < kParts; ++i) {
        a.v[i] = Pair{static_cast<double>(p[2 * i]), static_cast<double>(p[2 * i + 1])};
    }
    return a;
}
template <int kStep, typename T>
inline F64 LoadEvery(const T* p) {
    F64 a;
    for (int i = 0; i < kParts; ++i) {
        a.v[i] = Pair{static_cast<double>(p[2 * i * kStep]),
                      static_cast<double>(p[(2 * i + 1) * kStep])};
    }
    return a;
}

template <typename T>
inline void ShufflePairs(const T* p, const unsigned char* pabyPlace, F64& a, F64& b) {
    for (int i = 0; i < kParts; ++i) {
        const unsigned char* q = pabyPlace + 2 * i;
        a.v[i] = Pair{static_cast<double>(p[q[0]]), static_cast<double>(p[q[1]])};
        b.v[i] = Pair{static_cast<double>(p[q[kLanes]]), static_cast<double>(p[q[kLanes + 1]])};
    }
}

template <typename T>
inline void CopySamples(T* t, const T* p, const std::int64_t* panOffset) {
    for (int i = 0; i < kLanes; ++i) {
        t[i] = p[panOffset[i]];
    }
}

template <typename T>
inline void StoreSamples(T* p, F64 a) {
    for (int i = 0; i < kLanes; ++i) {
        p[i] = static_cast<T>(a.v[i / 2][i % 2]);
    }
}

inline std::uint64_t EqualBits(const unsigned char* p, unsigned char nValue) {
    std::uint64_t nBits = 0;
    for (int i = 0; i < 64; ++i) {
        nBits |= std::uint64_t{p[i] == nValue} << i;
    }
    return nBits;
}
inline unsigned ByteBits(const unsigned char* p, const std::int64_t* panOffset,
                         unsigned char nValue) {
    unsigned nBits = 0;
    for (int i = 0; i < kLanes; ++i) {
        nBits |= static_cast<unsigned>(p[panOffset[i]] == nValue) << i;
    }
    return nBits;
}
inline unsigned FullPairBits(const unsigned char* p, const std::int64_t* panOffset) {
    return ~(ByteBits(p, panOffset, 0) | ByteBits(p + 1, panOffset, 0)) & 0xffu;
}
inline void StoreBits(unsigned char* p, std::uint64_t nBits0, std::uint64_t nBits1) {
    for (int i = 0; i < 64; ++i) {
        p[i] = static_cast<unsigned char>((nBits0 >> i & 1u) | (nBits1 >> i & 1u) << 1);
    }
}
inline void AddBits(unsigned char* p, std::uint64_t nBits, unsigned char nByte) {
    for (int i = 0; i < 64; ++i) {
        p[i] = static_cast<unsigned char>(p[i] | ((nBits >> i & 1u) != 0 ? nByte : 0));
    }
}
inline std::uint32_t GroupBits(const std::uint64_t* panRow, const BitGroup& oGroup,
                               const std::int64_t* panCol) {
    return PickGroupBits(panRow, oGroup, panCol);
}

// Eight pixels of a source: 0, 0 where they lie outside.
struct Cells {
    std::int32_t anCol[kLanes];
    std::int32_t anRow[kLanes];
    unsigned nInside;
};
inline Cells CellsInside(F64 col, F64 row, const CellLimits& o) {
    Cells oCells{{}, {}, 0};
    for (int i = 0; i < kLanes; ++i) {
        const double dfCol = col.v[i / 2][i % 2] + o.nColOff;
        const double dfRow = row.v[i / 2][i % 2] + o.nRowOff;
        if (dfCol >= 0.0 && dfCol < o.nCols && dfRow >= 0.0 && dfRow < o.nRows) {
            oCells.anCol[i] = static_cast<std::int32_t>(dfCol);
            oCells.anRow[i] = static_cast<std::int32_t>(dfRow);
            oCells.nInside |= 1u << i;
        }
    }
    return oCells;
}
inline unsigned Bits(const Cells& o) { return o.nInside; }
inline void StorePlaces(std::int64_t* p, const Cells& o, int nPitch, int nChan) {
    for (int i = 0; i < kLanes; ++i) {
        p[i] = std::int64_t{o.anRow[i]} * nPitch + std::int64_t{o.anCol[i]} * nChan;
    }
}
inline void Store(std::int32_t* panCol, std::int32_t* panRow, const Cells& o) {
    __builtin_memcpy(panCol, o.anCol, sizeof o.anCol);
    __builtin_memcpy(panRow, o.anRow, sizeof o.anRow);
}
inline unsigned BandBits(const unsigned char* pabyMap, std::int64_t nPitch,
                         const std::int32_t* panCol, const std::int32_t* panRow) {
    return PickBandBits(pabyMap, nPitch, panCol, panRow);
}
