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

template <int nBytes, typename T>
inline void StoreLanes(T* p, typename Vectors<nBytes>::Elements v) {
    typedef typename Lanes<sizeof(T)>::Element Narrow;
    typedef Narrow Packed __attribute__((vector_size(kElements<nBytes> * sizeof(T))));
    const Packed packed = __builtin_convertvector(v, Packed) ^ static_cast<Narrow>(kMoved<T>);
    __builtin_memcpy(p, &packed, sizeof packed);
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

// The same for a number of samples that the compiler knows, all in registers.
template <int i, int j, typename Vector>
inline void SortMirrored(Vector* pHeld) {
    if constexpr (i < j) {
        SortPair(pHeld[i], pHeld[j]);
        SortMirrored<i + 1, j - 1>(pHeld);
    }
}
template <int i, int kEnd, typename Vector>
inline void LeastToFront(Vector* pHeld) {
    if constexpr (i < kEnd) {
        SortPair(pHeld[0], pHeld[i]);
        LeastToFront<i + 1, kEnd>(pHeld);
    }
}
template <int i, int kLast, typename Vector>
inline void GreatestToBack(Vector* pHeld) {
    if constexpr (i < kLast) {
        SortPair(pHeld[i], pHeld[kLast]);
        GreatestToBack<i + 1, kLast>(pHeld);
    }
}
template <int kHeld, int kNext, int kCount, typename Vector, typename Samples>
inline Vector SelectHeld(Vector* pHeld, const Samples& fnSample) {
    if constexpr (kHeld == 1) {
        return pHeld[0];
    } else {
        SortMirrored<0, kHeld - 1>(pHeld);
        LeastToFront<1, (kHeld + 1) / 2>(pHeld);
        GreatestToBack<kHeld / 2, kHeld - 1>(pHeld);
        if constexpr (kNext < kCount) {
            pHeld[0] = fnSample(kNext);
            return SelectHeld<kHeld - 1, kNext + 1, kCount>(pHeld, fnSample);
        } else {
            return SelectHeld<kHeld - 2, kNext, kCount>(pHeld + 1, fnSample);
        }
    }
}
template <int kSize, typename T, int nBytes>
inline typename Vectors<nBytes>::Elements SelectOfSquare(const void* const* papRow,
                                                         std::int64_t nFirst) {
    constexpr int kCount = kSize * kSize;
    static_assert(kCount % 2 == 1);
    constexpr int kHeld = kCount / 2 + 2;
    const auto fnSample = [&](int i) {
        return LoadLanes<nBytes>(static_cast<const T*>(papRow[i / kSize]) + nFirst + i % kSize);
    };
    typename Vectors<nBytes>::Elements aHeld[kHeld];
    for (int i = 0; i < kHeld; ++i) {
        aHeld[i] = fnSample(i);
    }
    return SelectHeld<kHeld, kHeld, kCount>(aHeld, fnSample);
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
template <typename T, int nBytes>
inline void MedianBlock(const void* const* papRow, std::int64_t nFirst, const WindowSize& oSize,
                        T* pMedian) {
    if (oSize.nCols == 3 && oSize.nRows == 3) {
        StoreLanes<nBytes>(pMedian, SelectOfSquare<3, T, nBytes>(papRow, nFirst));
        return;
    }
    if (oSize.nCols == 5 && oSize.nRows == 5) {
        StoreLanes<nBytes>(pMedian, SelectOfSquare<5, T, nBytes>(papRow, nFirst));
        return;
    }
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
    StoreLanes<nBytes>(
        pMedian, nCount <= kFew
                     ? SelectOfFew<Elements>(nCount, fnSample)
                     : SelectOfMany<nBytes, 8 * static_cast<int>(sizeof(T))>(nCount, fnSample));
}

template <typename T, int nBytes>
inline void MediansWith(const MedianRows& oRows, const WindowSize& oSize, int nPix, T* pMedian) {
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
        T aMedian[kCount];
        MedianBlock<T, nBytes>(oRows.papCopy, 0, oSize, aMedian);
        __builtin_memcpy(pMedian, aMedian, static_cast<std::size_t>(nPix) * sizeof(T));
        return;
    }
    for (int i = 0; i < nPix; i += kCount) {
        // The last block overlaps the one before rather than the end of the rows.
        const int nFirst = i + kCount <= nPix ? i : nPix - kCount;
        MedianBlock<T, nBytes>(oRows.papRow, nFirst, oSize, pMedian + nFirst);
    }
}

template <typename T>
VETRA_STAGE void Medians(const MedianRows& oRows, const WindowSize& oSize, int nPix,
                         void* pMedians) {
    T* pMedian = static_cast<T*>(pMedians);
    constexpr int kMostOfBytes = 255;
    if constexpr (sizeof(T) == 1) {
        if (oSize.nCols * oSize.nRows <= kMostOfBytes) {
            MediansWith<T, 1>(oRows, oSize, nPix, pMedian);
            return;
        }
    }
    MediansWith<T, 2>(oRows, oSize, nPix, pMedian);
}
