// Window medians of 8-bit and 16-bit integers in axis-aligned runs at unit scale, where the windows
// of neighbouring pixels are neighbours. Included inside a level's namespace; see stages_inl.h.
//
// The median of integers is the same however it is found: here for as many pixels at once as have
// room in a register. Samples are compared as signed elements: unsigned ones are moved down by half
// their range.

#if defined(__AVX512BW__)
constexpr int kRegisterBytes = 64;
#elif defined(__AVX2__)
constexpr int kRegisterBytes = 32;
#else
constexpr int kRegisterBytes = 16;
#endif

// Elements of some bytes, and numbers that count them.
template <int nBytes>
struct Lanes;
template <>
struct Lanes<1> {
    typedef signed char Element;
    typedef unsigned char Count;
};
template <>
struct Lanes<2> {
    typedef short Element;
    typedef unsigned short Count;
};
template <int nBytes>
constexpr int kElements = kRegisterBytes / nBytes;
template <int nBytes>
struct Vectors {
    typedef typename Lanes<nBytes>::Element Elements __attribute__((vector_size(kRegisterBytes)));
    typedef typename Lanes<nBytes>::Count Counts __attribute__((vector_size(kRegisterBytes)));
};

template <typename T>
inline constexpr int kMoved = T(-1) < T(0) ? 0 : 1 << (8 * sizeof(T) - 1);

template <int nBytes, typename T>
inline typename Vectors<nBytes>::Elements LoadLanes(const T* p) {
    typedef typename Lanes<sizeof(T)>::Element Narrow;
    typedef Narrow Packed __attribute__((vector_size(kElements<nBytes> * sizeof(T))));
    Packed v;
    __builtin_memcpy(&v, p, sizeof v);
    v ^= static_cast<Narrow>(kMoved<T>);
    return __builtin_convertvector(v, typename Vectors<nBytes>::Elements);
}

template <typename Vector>
inline void SortPair(Vector& a, Vector& b) {
    const Vector least = a < b ? a : b;
    b = a < b ? b : a;
    a = least;
}

// The sample of rank (nCount - 1) / 2, for few samples. Of a little more than half of them neither
// the least nor the greatest can be it: both leave, another sample joins, until all have been seen.
constexpr int kMostFew = 30;
template <typename Vector, typename Samples>
inline Vector SelectOfFew(int nCount, const Samples& fnSample) {
    Vector aHeld[kMostFew / 2 + 2];
    int nHeld = nCount < 3 ? nCount : nCount / 2 + 2;
    for (int i = 0; i < nHeld; ++i) {
        aHeld[i] = fnSample(i);
    }
    for (int nNext = nHeld; nHeld > 2;) {
        // The least to the front, the greatest to the back.
        for (int i = 0, j = nHeld - 1; i < j; ++i, --j) {
            SortPair(aHeld[i], aHeld[j]);
        }
        for (int i = 1; i < (nHeld + 1) / 2; ++i) {
            SortPair(aHeld[0], aHeld[i]);
        }
        for (int i = nHeld / 2; i < nHeld - 1; ++i) {
            SortPair(aHeld[i], aHeld[nHeld - 1]);
        }
        --nHeld;
        if (nNext < nCount) {
            aHeld[0] = fnSample(nNext++);
        } else {
            --nHeld;
            for (int i = 0; i < nHeld; ++i) {
                aHeld[i] = aHeld[i + 1];
            }
        }
    }
    if (nHeld == 2) {
        SortPair(aHeld[0], aHeld[1]);
    }
    return aHeld[0];
}

// The same for more samples, of kBits bits, as many as an element can count: bit by bit, the
// greatest number that has no more samples below it than the rank says.
template <int nBytes, int kBits, typename Samples>
inline typename Vectors<nBytes>::Elements SelectOfMany(int nCount, const Samples& fnSample) {
    typedef typename Lanes<nBytes>::Count Count;
    typedef typename Vectors<nBytes>::Elements Elements;
    typedef typename Vectors<nBytes>::Counts Counts;
    const Count nRank = static_cast<Count>((nCount - 1) / 2);
    const Count nMoved = static_cast<Count>(1u << (kBits - 1));
    Counts found{};
    for (int nBit = kBits - 1; nBit >= 0; --nBit) {
        const Counts more = found | static_cast<Count>(1u << nBit);
        const Elements tried = reinterpret_cast<Elements>(more - nMoved);
        Counts below{};
        for (int i = 0; i < nCount; ++i) {
            // A comparison that holds is -1.
            below -= reinterpret_cast<Counts>(fnSample(i) < tried);
        }
        found = below <= nRank ? more : found;
    }
    return reinterpret_cast<Elements>(found - nMoved);
}

// Medians of kElements<nBytes> pixels; rows begin at the first pixel's windows.
template <typename T, int nBytes, bool kSquared>
inline void MedianBlock(const void* const* papRow, std::int64_t nFirst, const WindowSize& oSize,
                        double* padfValue) {
    typedef typename Vectors<nBytes>::Elements Elements;
    const int nCount = oSize.nCols * oSize.nRows;
    int nRow = 0;
    int nCol = 0;
    // Samples are asked for in order, again and again.
    const auto fnSample = [&](int i) {
        if (i == 0) {
            nRow = 0;
            nCol = 0;
        }
        const Elements v = LoadLanes<nBytes>(static_cast<const T*>(papRow[nRow]) + nFirst + nCol);
        if (++nCol == oSize.nCols) {
            nCol = 0;
            ++nRow;
        }
        return v;
    };
    // By the number of operations, of which a bit needs three for each sample.
    constexpr int kFew = sizeof(T) == 1 ? 12 : kMostFew;
    const Elements median =
        nCount <= kFew ? SelectOfFew<Elements>(nCount, fnSample)
                       : SelectOfMany<nBytes, 8 * static_cast<int>(sizeof(T))>(nCount, fnSample);
    typename Lanes<nBytes>::Element aMedian[kElements<nBytes>];
    __builtin_memcpy(aMedian, &median, sizeof aMedian);
    for (int i = 0; i < kElements<nBytes>; ++i) {
        padfValue[i] = static_cast<double>(static_cast<int>(aMedian[i]) + kMoved<T>);
    }
    if constexpr (kSquared) {
        // The root of the median is the median of the roots.
        for (int i = 0; i < kElements<nBytes>; i += kLanes) {
            const F64 root = Root(Load(padfValue + i));
            Store(padfValue + i, root * root);
        }
    }
}

template <typename T, int nBytes, bool kSquared>
inline void MediansWith(const MedianRows& oRows, const WindowSize& oSize, int nPix,
                        double* padfValue) {
    constexpr int kCount = kElements<nBytes>;
    static_assert(kCount <= kMedianReach);
    if (nPix < kCount) {
        // A copy, of which a whole block may be read.
        const std::size_t nRowBytes = static_cast<std::size_t>(oSize.nCols + nPix - 1) * sizeof(T);
        T* pCopy = static_cast<T*>(oRows.pCopy);
        for (int k = 0; k < oSize.nRows; ++k) {
            __builtin_memcpy(pCopy, oRows.papRow[k], nRowBytes);
            oRows.papCopy[k] = pCopy;
            pCopy += oSize.nCols + kMedianReach;
        }
        double adfValue[kCount];
        MedianBlock<T, nBytes, kSquared>(oRows.papCopy, 0, oSize, adfValue);
        __builtin_memcpy(padfValue, adfValue, static_cast<std::size_t>(nPix) * sizeof(double));
        return;
    }
    for (int i = 0; i < nPix; i += kCount) {
        // The last block overlaps the one before rather than the end of the rows.
        const int nFirst = i + kCount <= nPix ? i : nPix - kCount;
        MedianBlock<T, nBytes, kSquared>(oRows.papRow, nFirst, oSize, padfValue + nFirst);
    }
}

template <typename T, bool kSquared>
VETRA_STAGE void Medians(const MedianRows& oRows, const WindowSize& oSize, int nPix,
                         double* padfValue) {
    constexpr int kMostOfBytes = 255;
    if constexpr (sizeof(T) == 1) {
        if (oSize.nCols * oSize.nRows <= kMostOfBytes) {
            MediansWith<T, 1, kSquared>(oRows, oSize, nPix, padfValue);
            return;
        }
    }
    MediansWith<T, 2, kSquared>(oRows, oSize, nPix, padfValue);
}
