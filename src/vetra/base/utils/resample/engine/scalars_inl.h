// What lane layers have in common that isn't done in lanes. Included inside a level's namespace;
// see stages_inl.h.

// An integer divisor and its reciprocal in two parts, by which some lane layers divide.
struct Divisor {
    double dfValue;
    double dfHigh;  // 1 / dfValue, rounded down to a double
    double dfLow;   // what is missing
};

// Of a whole number from 1 to 2^45.
constexpr Divisor MakeDivisor(std::int64_t nValue) {
    // Long division, bit by bit, until the quotient has all the bits of a double.
    std::int64_t nQuotient = 0;
    std::int64_t nRest = 1;
    double dfUnit = 1.0;
    while (nQuotient < std::int64_t{1} << 52) {
        const bool bOne = nRest >= nValue;
        nRest = 2 * (bOne ? nRest - nValue : nRest);
        nQuotient = 2 * nQuotient + (bOne ? 1 : 0);
        dfUnit *= 0.5;
    }
    // One digit stood before the point.
    dfUnit *= 2.0;
    const double dfValue = static_cast<double>(nValue);
    const double dfHigh = static_cast<double>(nQuotient) * dfUnit;
    // Never 0, by which an infinite number can't be multiplied.
    const double dfLow =
        nRest == 0 ? dfHigh * 0x1p-100 : static_cast<double>(nRest) * 0.5 / dfValue * dfUnit;
    return {dfValue, dfHigh, dfLow};
}

// The square roots of 8-bit samples, rounded to nearest, 0 for negative ones: picked up sooner than
// a processor takes roots.
template <typename T>
class ByteRoots {
 public:
    constexpr ByteRoots() {
        for (int n = 1; n < 256 && T(n) > T(0); ++n) {
            madf[n] = RootOf(n);
        }
    }
    double operator[](T n) const { return madf[static_cast<unsigned char>(n)]; }

 private:
    // Digit by digit, until the root has all the bits of a double.
    static constexpr double RootOf(int n) {
        std::int64_t nRoot = 0;
        std::int64_t nRest = 0;
        double dfUnit = 1.0;
        for (int nShift = 6; nRoot < std::int64_t{1} << 52; nShift -= 2) {
            nRest = 4 * nRest + (nShift >= 0 ? n >> nShift & 3 : 0);
            const std::int64_t nNext = 4 * nRoot + 1;
            nRoot = 2 * nRoot + (nRest >= nNext ? 1 : 0);
            nRest -= nRest >= nNext ? nNext : 0;
            dfUnit *= nShift < 0 ? 0.5 : 1.0;
        }
        return static_cast<double>(nRest > nRoot ? nRoot + 1 : nRoot) * dfUnit;
    }

    double madf[256] = {};
};
template <typename T>
constexpr ByteRoots<T> kByteRoots;

// Whether a number in x is below 2^-511 in size, but not 0.
template <typename Number, int N>
inline bool AnySmallNumber(const Number (&x)[N]) {
    constexpr int kCount = N * kLanes;
    double adf[kCount];
    __builtin_memcpy(adf, x, sizeof adf);
    int nSmall = 0;
    for (int i = 0; i < kCount; ++i) {
        nSmall += __builtin_fabs(adf[i]) < 0x1p-511 && adf[i] != 0.0 ? 1 : 0;
    }
    return nSmall != 0;
}

// Bits of a group's columns in a row of bits.
inline std::uint32_t PickGroupBits(const std::uint64_t* panRow, const BitGroup& oGroup,
                                   const std::int64_t* panCol) {
    std::uint32_t nBits = 0;
    for (int i = 0; i < BitGroup::kColumns; ++i) {
        const std::int64_t n = panCol[i];
        const std::uint64_t nBit = oGroup.abyBit[i] != 0 ? panRow[n >> 6] >> (n & 63) & 1u : 0u;
        nBits |= static_cast<std::uint32_t>(nBit) << i;
    }
    return nBits;
}

// Bits of eight pixels in bands.
inline unsigned PickBandBits(const unsigned char* pabyMap, std::int64_t nPitch,
                             const std::int32_t* panCol, const std::int32_t* panRow) {
    unsigned nBits = 0;
    for (int i = 0; i < kLanes; ++i) {
        const unsigned nByte = pabyMap[panRow[i] / kBandRows * nPitch + panCol[i]];
        nBits |= (nByte >> panRow[i] % kBandRows & 1u) << i;
    }
    return nBits;
}
