// The passes of the Fourier transforms, compiled once per processor level. A level's source defines
// VETRA_LEVEL, its namespace, and VETRA_LANES, the floats of its vectors, and includes this file.
// Everything stands in the level's namespace and nothing of the standard library is called, so that
// no code built for one processor can be linked into another's path.
//
// Samples are interleaved pairs of floats. Each sample goes through the operations of the plain
// radix-2 (radix-4) passes one by one; what differs is only that two or three passes of the table
// family run on samples that stay in registers, that neighbouring samples share a vector, and that
// the passes of the in-place family finish a block that fits the cache before the next one. Negated
// twiddles stand for subtractions, which is the same in IEEE arithmetic. So all levels give the
// same bits.

#include <cfloat>
#include <cstddef>
#include <cstdint>
#include <type_traits>
#include <utility>

#include "vetra/base/utils/math/fourier/passes.h"

static_assert(FLT_EVAL_METHOD == 0, "float arithmetic must be done in float");

namespace vetra::utils::math::fourier::VETRA_LEVEL {

namespace {

using std::ptrdiff_t;

template <int kFloats>
struct Lanes {
    typedef float Floats __attribute__((vector_size(kFloats * 4)));
    typedef std::int32_t Bits __attribute__((vector_size(kFloats * 4)));
};
template <int kFloats>
using Vector = typename Lanes<kFloats>::Floats;

template <int kFloats>
inline Vector<kFloats> Load(const float* paf) {
    Vector<kFloats> v;
    __builtin_memcpy(&v, paf, sizeof v);
    return v;
}
template <typename V>
inline void Store(float* paf, V v) {
    __builtin_memcpy(paf, &v, sizeof v);
}
// f - 0 is f also for negative zeros.
template <int kFloats>
inline Vector<kFloats> Splat(float f) {
    return f - Vector<kFloats>{};
}

// Shuffles: where lane i of the result stands in two vectors behind each other.
template <typename Place, typename V, int... i>
inline V ShuffleLanes(V a, V b, std::integer_sequence<int, i...>) {
    return __builtin_shufflevector(a, b, Place::Of(i)...);
}
template <typename Place, typename V>
inline V Shuffle(V a, V b) {
    return ShuffleLanes<Place>(a, b, std::make_integer_sequence<int, sizeof(V) / sizeof(float)>());
}
struct SwappedParts {
    static constexpr int Of(int i) { return i ^ 1; }
};
struct RealParts {
    static constexpr int Of(int i) { return i & ~1; }
};
struct ImaginaryParts {
    static constexpr int Of(int i) { return i | 1; }
};
struct EverySecondSample {
    static constexpr int Of(int i) { return 2 * (i & ~1) + (i & 1); }
};
// One step of a transposition: trades places between rows that are kStep apart.
template <int kFloats, int kStep>
struct LowerRow {
    static constexpr int Of(int i) { return (i & kStep) != 0 ? kFloats + i - kStep : i; }
};
template <int kFloats, int kStep>
struct UpperRow {
    static constexpr int Of(int i) { return (i & kStep) != 0 ? kFloats + i : i + kStep; }
};
// Of two samples e0, e1 in the lower half: e0, e0, e1, e1, the second of each with swapped parts.
struct TwiceSwapped {
    static constexpr int Of(int i) { return 2 * (i / 4) + ((i & 2) != 0 ? ~i & 1 : i & 1); }
};

template <typename V>
inline V SwapParts(V v) {
    return Shuffle<SwappedParts>(v, v);
}

// Transposes kFloats / 2 rows of as many samples.
template <int kFloats, int kStep = 2>
inline void Transpose(Vector<kFloats>* pv) {
    if constexpr (kStep < kFloats) {
        constexpr int kRows = kStep / 2;
        for (int i = 0; i < kFloats / 2; ++i) {
            if ((i & kRows) == 0) {
                const Vector<kFloats> lower = pv[i];
                const Vector<kFloats> upper = pv[i + kRows];
                pv[i] = Shuffle<LowerRow<kFloats, kStep>>(lower, upper);
                pv[i + kRows] = Shuffle<UpperRow<kFloats, kStep>>(lower, upper);
            }
        }
        Transpose<kFloats, 2 * kStep>(pv);
    }
}

// Sign bits on the real or on the imaginary parts.
template <int kFloats>
struct Signs {
    typename Lanes<kFloats>::Bits n;

    explicit Signs(bool bReal) {
        for (int i = 0; i < kFloats; ++i) {
            n[i] = ((i & 1) == 0) == bReal ? INT32_MIN : 0;
        }
    }
    Vector<kFloats> Flip(Vector<kFloats> v) const {
        return reinterpret_cast<Vector<kFloats>>(
            reinterpret_cast<typename Lanes<kFloats>::Bits>(v) ^ n);
    }
    // i v with signs on the real parts, -i v with signs on the imaginary parts.
    Vector<kFloats> Turn(Vector<kFloats> v) const { return Flip(SwapParts(v)); }
};

// Factors c + i s as (c, c) and (-s, s).
template <int kFloats>
struct Twiddle {
    Vector<kFloats> c;
    Vector<kFloats> s;

    // With signs on the imaginary parts the factors are conjugated.
    Twiddle(Vector<kFloats> v, const Signs<kFloats>& oSigns)
        : c(Shuffle<RealParts>(v, v)), s(oSigns.Flip(Shuffle<ImaginaryParts>(v, v))) {}
    Twiddle(float fReal, float fImaginary, const Signs<kFloats>& oSigns)
        : c(Splat<kFloats>(fReal)), s(oSigns.Flip(Splat<kFloats>(fImaginary))) {}
};

template <int kFloats>
inline Vector<kFloats> Times(Vector<kFloats> v, const Twiddle<kFloats>& oTwiddle) {
    return v * oTwiddle.c + SwapParts(v) * oTwiddle.s;
}

// ---- The table family: self-sorting radix-2 passes, up to three in one sweep over memory. ----

template <int kFloats>
inline void Butterfly(Vector<kFloats>& u, Vector<kFloats>& v, const Twiddle<kFloats>& oTwiddle) {
    const Vector<kFloats> difference = u - v;
    u = u + v;
    v = Times(difference, oTwiddle);
}

// Each pass doubles the stride, so that the results end up in bit-reversed order: that of z[r] in
// the next array's blocks is Reversed<kPasses>(r).
template <int kPasses>
constexpr int Reversed(int r) {
    int nReversed = 0;
    for (int i = 0; i < kPasses; ++i) {
        nReversed |= ((r >> i) & 1) << (kPasses - 1 - i);
    }
    return nReversed;
}

// fnTwiddle(nMultiple, q) is table entry nMultiple * e + q n / (2^kPasses / nMultiple), e being the
// entry of the sweep's first pass.
template <int kPasses, typename V, typename GetTwiddle>
inline void RunPasses(V* z, GetTwiddle fnTwiddle) {
    if constexpr (kPasses == 3) {
        Butterfly(z[0], z[4], fnTwiddle(1, 0));
        Butterfly(z[1], z[5], fnTwiddle(1, 1));
        Butterfly(z[2], z[6], fnTwiddle(1, 2));
        Butterfly(z[3], z[7], fnTwiddle(1, 3));
        const auto oEven = fnTwiddle(2, 0);
        Butterfly(z[0], z[2], oEven);
        Butterfly(z[4], z[6], oEven);
        const auto oOdd = fnTwiddle(2, 1);
        Butterfly(z[1], z[3], oOdd);
        Butterfly(z[5], z[7], oOdd);
        const auto oLast = fnTwiddle(4, 0);
        Butterfly(z[0], z[1], oLast);
        Butterfly(z[2], z[3], oLast);
        Butterfly(z[4], z[5], oLast);
        Butterfly(z[6], z[7], oLast);
    } else if constexpr (kPasses == 2) {
        Butterfly(z[0], z[2], fnTwiddle(1, 0));
        Butterfly(z[1], z[3], fnTwiddle(1, 1));
        const auto oLast = fnTwiddle(2, 0);
        Butterfly(z[0], z[1], oLast);
        Butterfly(z[2], z[3], oLast);
    } else {
        Butterfly(z[0], z[1], fnTwiddle(1, 0));
    }
}

// Three passes from stride 1: neighbouring j share a vector.
template <int kFloats>
void FirstSweep(ptrdiff_t n, const float* pafX, float* pafY, const float* pafTable, bool bFlag) {
    constexpr int kSamples = kFloats / 2;
    const Signs<kFloats> oSigns(bFlag);
    const ptrdiff_t nPart = n / 8;
    for (ptrdiff_t j = 0; j < nPart; j += kSamples) {
        Vector<kFloats> z[8];
        for (int q = 0; q < 8; ++q) {
            z[q] = Load<kFloats>(pafX + 2 * (j + q * nPart));
        }
        RunPasses<3>(z, [&](int nMultiple, int q) {
            const float* paf = pafTable + 2 * nMultiple * (j + q * nPart);
            Vector<kFloats> v = Load<kFloats>(paf);
            if (nMultiple >= 2) {
                v = Shuffle<EverySecondSample>(v, Load<kFloats>(paf + kFloats));
            }
            if (nMultiple == 4) {
                v = Shuffle<EverySecondSample>(
                    v, Shuffle<EverySecondSample>(Load<kFloats>(paf + 2 * kFloats),
                                                  Load<kFloats>(paf + 3 * kFloats)));
            }
            return Twiddle<kFloats>(v, oSigns);
        });
        for (int nBlock = 0; nBlock < 8; nBlock += kSamples) {
            Vector<kFloats> avRows[kSamples];
            for (int r = 0; r < kSamples; ++r) {
                avRows[r] = z[Reversed<3>(nBlock + r)];
            }
            Transpose<kFloats>(avRows);
            for (int r = 0; r < kSamples; ++r) {
                Store(pafY + 2 * (8 * (j + r) + nBlock), avRows[r]);
            }
        }
    }
}

// The passes of strides l, 2 l ... 2^(kPasses - 1) l: neighbouring k share a vector. In a sweep
// that ends with stride n / 2, the two arrays may be the same one.
template <int kPasses, int kFloats>
void Sweep(ptrdiff_t n, ptrdiff_t l, const float* pafX, float* pafY, const float* pafTable,
           bool bFlag) {
    constexpr int kRadix = 1 << kPasses;
    const Signs<kFloats> oSigns(bFlag);
    const ptrdiff_t nPart = n / kRadix;
    for (ptrdiff_t jl = 0; jl < nPart; jl += l) {
        const auto fnTwiddle = [&](int nMultiple, int q) {
            const float* paf = pafTable + 2 * nMultiple * (jl + q * nPart);
            return Twiddle<kFloats>(paf[0], paf[1], oSigns);
        };
        const float* pafFrom = pafX + 2 * jl;
        float* pafTo = pafY + 2 * kRadix * jl;
        for (ptrdiff_t k = 0; k < l; k += kFloats / 2) {
            Vector<kFloats> z[kRadix];
            for (int q = 0; q < kRadix; ++q) {
                z[q] = Load<kFloats>(pafFrom + 2 * (k + q * nPart));
            }
            RunPasses<kPasses>(z, fnTwiddle);
            for (int r = 0; r < kRadix; ++r) {
                Store(pafTo + 2 * (k + r * l), z[Reversed<kPasses>(r)]);
            }
        }
    }
}

void TableTransform(ptrdiff_t n, float* pafData, float* pafWork, const float* pafTable,
                    bool bFlag) {
    constexpr int kFloats = VETRA_LANES;
    ptrdiff_t l = 8;
    float* pafFrom = pafWork;
    if (n >= 4 * kFloats) {
        FirstSweep<kFloats>(n, pafData, pafWork, pafTable, bFlag);
    } else if (n >= 16) {
        FirstSweep<4>(n, pafData, pafWork, pafTable, bFlag);
    } else {
        l = 1;
        pafFrom = pafData;
    }
    while (l < n) {
        const ptrdiff_t nLeft = n / l;
        // The last sweep leads into the data, be it from there.
        const auto fnTarget = [&](int nRadix) {
            return nLeft == nRadix || pafFrom == pafWork ? pafData : pafWork;
        };
        float* pafTo = nullptr;
        if (l < 8) {
            pafTo = fnTarget(2);
            Sweep<1, 2>(n, l, pafFrom, pafTo, pafTable, bFlag);
            l *= 2;
        } else if (nLeft == 2) {
            pafTo = fnTarget(2);
            Sweep<1, kFloats>(n, l, pafFrom, pafTo, pafTable, bFlag);
            l *= 2;
        } else if (nLeft == 4 || nLeft == 16) {
            pafTo = fnTarget(4);
            Sweep<2, kFloats>(n, l, pafFrom, pafTo, pafTable, bFlag);
            l *= 4;
        } else {
            pafTo = fnTarget(8);
            Sweep<3, kFloats>(n, l, pafFrom, pafTo, pafTable, bFlag);
            l *= 8;
        }
        pafFrom = pafTo;
    }
}

// ---- The in-place family: radix-4 passes on bit-reversed data. ----

// What a radix-4 butterfly's sums and differences are multiplied with.
struct NoFactors {};
template <int kFloats>
struct EighthTurn {
    Vector<kFloats> c;
};
template <int kFloats>
struct Factors {
    Twiddle<kFloats> w1;
    Twiddle<kFloats> w2;
    Twiddle<kFloats> w3;
};

template <int kFloats>
using Quad = Vector<kFloats>[4];

template <int kFloats, typename Factor>
inline void RadixFour(Quad<kFloats>& u, const Factor& oFactor, const Signs<kFloats>& oSigns) {
    using V = Vector<kFloats>;
    const V t0 = u[0] + u[1];
    const V t1 = u[0] - u[1];
    const V t2 = u[2] + u[3];
    const V t3 = u[2] - u[3];
    const V turned = oSigns.Turn(t3);
    const V z1 = t1 + turned;
    const V z3 = t1 - turned;
    u[0] = t0 + t2;
    if constexpr (std::is_same_v<Factor, NoFactors>) {
        u[1] = z1;
        u[2] = t0 - t2;
        u[3] = z3;
    } else if constexpr (std::is_same_v<Factor, EighthTurn<kFloats>>) {
        u[1] = oFactor.c * (z1 + oSigns.Turn(z1));
        u[2] = oSigns.Turn(t0) - oSigns.Turn(t2);
        // The turned z3 is put together anew, so that no zero is negated.
        u[3] = oFactor.c * ((oSigns.Turn(t1) + t3) - z3);
    } else {
        u[1] = Times(z1, oFactor.w1);
        u[2] = Times(t0 - t2, oFactor.w2);
        u[3] = Times(z3, oFactor.w3);
    }
}

// One group of span l: neighbouring offsets share a vector.
template <int kFloats, typename Factor>
inline void Group(float* paf, ptrdiff_t l, const Factor& oFactor, const Signs<kFloats>& oSigns) {
    for (ptrdiff_t j = 0; j < l; j += kFloats) {
        Quad<kFloats> u;
        for (int q = 0; q < 4; ++q) {
            u[q] = Load<kFloats>(paf + j + q * l);
        }
        RadixFour<kFloats>(u, oFactor, oSigns);
        for (int q = 0; q < 4; ++q) {
            Store(paf + j + q * l, u[q]);
        }
    }
}

// The radix-4 pass of span l over the groups nFirst to nEnd - 1; paf is where group 0 starts.
template <int kFloats>
void Groups(float* paf, ptrdiff_t nFirst, ptrdiff_t nEnd, ptrdiff_t l, const float* pafTable,
            bool bFlag) {
    const Signs<kFloats> oSigns(!bFlag);
    for (ptrdiff_t g = nFirst; g < nEnd; ++g) {
        float* pafGroup = paf + g * 4 * l;
        if (g == 0) {
            Group<kFloats>(pafGroup, l, NoFactors(), oSigns);
        } else if (g == 1) {
            Group<kFloats>(pafGroup, l, EighthTurn<kFloats>{Splat<kFloats>(pafTable[2])}, oSigns);
        } else {
            const float w1r = pafTable[2 * g];
            const float w1i = pafTable[2 * g + 1];
            const bool bOdd = (g & 1) != 0;
            const float w2r = bOdd ? -pafTable[g] : pafTable[g];
            const float w2i = bOdd ? pafTable[g - 1] : pafTable[g + 1];
            const float w3r = w1r - 2 * w2i * w1i;
            const float w3i = 2 * w2i * w1r - w1i;
            Group<kFloats>(
                pafGroup, l,
                Factors<kFloats>{{w1r, w1i, oSigns}, {w2r, w2i, oSigns}, {w3r, w3i, oSigns}},
                oSigns);
        }
    }
}

// The pass of span 2, in which a group is only four samples: four groups from 4 up at a time.
void SmallGroups(float* paf, ptrdiff_t nFirst, ptrdiff_t nEnd, const float* pafTable, bool bFlag) {
    constexpr int kFloats = 8;
    using V = Vector<kFloats>;
    const Signs<kFloats> oSigns(!bFlag);
    const Signs<kFloats> oReal(true);
    const Signs<kFloats> oImaginary(false);
    const typename Lanes<kFloats>::Bits anOddReal{0, 0, INT32_MIN, 0, 0, 0, INT32_MIN, 0};
    Signs<kFloats> oOddReal(true);
    oOddReal.n = anOddReal;
    for (ptrdiff_t g = nFirst; g < nEnd; g += 4) {
        const V w1 = Load<kFloats>(pafTable + 2 * g);
        V w2{};
        __builtin_memcpy(&w2, pafTable + g, 4 * sizeof(float));
        w2 = oOddReal.Flip(Shuffle<TwiceSwapped>(w2, w2));
        const V product = 2 * Shuffle<ImaginaryParts>(w2, w2) * SwapParts(w1);
        const V w3 = oImaginary.Flip(w1) + oReal.Flip(product);
        Quad<kFloats> u;
        for (int q = 0; q < 4; ++q) {
            u[q] = Load<kFloats>(paf + 8 * (g + q));
        }
        Transpose<kFloats>(u);
        RadixFour<kFloats>(u, Factors<kFloats>{{w1, oSigns}, {w2, oSigns}, {w3, oSigns}}, oSigns);
        Transpose<kFloats>(u);
        for (int q = 0; q < 4; ++q) {
            Store(paf + 8 * (g + q), u[q]);
        }
    }
}

// The pass of span l over the nFloats floats from nStart on.
void RadixFourPass(float* paf, ptrdiff_t nStart, ptrdiff_t nFloats, ptrdiff_t l,
                   const float* pafTable, bool bFlag) {
    const ptrdiff_t nFirst = nStart / (4 * l);
    const ptrdiff_t nEnd = (nStart + nFloats) / (4 * l);
    if (l > 8) {
        Groups<VETRA_LANES>(paf, nFirst, nEnd, l, pafTable, bFlag);
    } else if (l == 8) {
        Groups < VETRA_LANES<8 ? VETRA_LANES : 8>(paf, nFirst, nEnd, l, pafTable, bFlag);
    } else if (VETRA_LANES < 8 || nEnd < 8) {
        Groups<2>(paf, nFirst, nEnd, l, pafTable, bFlag);
    } else {
        const ptrdiff_t nSmall = nFirst == 0 ? 4 : nFirst;
        Groups<2>(paf, nFirst, nSmall, l, pafTable, bFlag);
        SmallGroups(paf, nSmall, nEnd, pafTable, bFlag);
    }
}

// All radix-4 passes within the nFloats floats from nStart on. A pass needs only what earlier
// passes did in the same group, so that a block that fits the first-level cache is finished at
// once.
void RadixFourPasses(float* paf, ptrdiff_t nStart, ptrdiff_t nFloats, const float* pafTable,
                     bool bFlag) {
    constexpr ptrdiff_t kBlock = 8192;
    if (nFloats > kBlock) {
        for (ptrdiff_t nPart = 0; nPart < 4; ++nPart) {
            RadixFourPasses(paf, nStart + nPart * (nFloats / 4), nFloats / 4, pafTable, bFlag);
        }
        RadixFourPass(paf, nStart, nFloats, nFloats / 4, pafTable, bFlag);
        return;
    }
    for (ptrdiff_t l = 2; 4 * l <= nFloats; l *= 4) {
        RadixFourPass(paf, nStart, nFloats, l, pafTable, bFlag);
    }
}

template <int kFloats>
void RadixTwoPass(float* paf, ptrdiff_t l) {
    for (ptrdiff_t j = 0; j < l; j += kFloats) {
        const Vector<kFloats> u0 = Load<kFloats>(paf + j);
        const Vector<kFloats> u1 = Load<kFloats>(paf + j + l);
        Store(paf + j, u0 + u1);
        Store(paf + j + l, u0 - u1);
    }
}

void Butterflies(ptrdiff_t nFloats, float* pafData, const float* pafTable, bool bFlag) {
    ptrdiff_t l = 2;
    while (4 * l <= nFloats) {
        l *= 4;
    }
    for (ptrdiff_t nStart = 0; nStart < nFloats; nStart += l) {
        RadixFourPasses(pafData, nStart, l, pafTable, bFlag);
    }
    if (l < nFloats) {
        if (l >= VETRA_LANES) {
            RadixTwoPass<VETRA_LANES>(pafData, l);
        } else {
            RadixTwoPass<2>(pafData, l);
        }
    }
}

}  // namespace

#define VETRA_TEXT(x) #x
#define VETRA_NAME(x) VETRA_TEXT(x)

extern const Passes kPasses;
const Passes kPasses = {VETRA_NAME(VETRA_LEVEL), &TableTransform, &Butterflies};

}  // namespace vetra::utils::math::fourier::VETRA_LEVEL
