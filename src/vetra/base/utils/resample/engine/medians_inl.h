// Window medians of 8-bit and 16-bit integers in axis-aligned runs at unit scale, where the windows
// of neighbouring pixels are neighbours. Included inside a level's namespace; see stages_inl.h.
//
// The median of integers is the same however it is found: here for as many pixels at once as have
// room in 64 bytes.

template <typename Element>
struct Lanes {
    typedef Element Vector __attribute__((vector_size(64)));
    static constexpr int kCount = 64 / static_cast<int>(sizeof(Element));
    static constexpr int kMost = static_cast<Element>(-1);  // that an element can count
};

template <int kBytes>
struct UnsignedOf {
    typedef unsigned char Type;
};
template <>
struct UnsignedOf<2> {
    typedef unsigned short Type;
};

// Signed samples are moved up by half their range, so that they compare like unsigned elements.
template <typename T>
inline constexpr int kMoved = T(-1) < T(0) ? 1 << (8 * sizeof(T) - 1) : 0;

template <typename Element, typename T>
inline typename Lanes<Element>::Vector LoadLanes(const T* p) {
    typedef typename UnsignedOf<sizeof(T)>::Type Unsigned;
    typedef Unsigned Packed __attribute__((vector_size(Lanes<Element>::kCount * sizeof(T))));
    Packed v;
    __builtin_memcpy(&v, p, sizeof v);
    v ^= static_cast<Unsigned>(kMoved<T>);
    return __builtin_convertvector(v, typename Lanes<Element>::Vector);
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
template <typename Element, int kBits, typename Samples>
inline typename Lanes<Element>::Vector SelectOfMany(int nCount, const Samples& fnSample) {
    typedef typename Lanes<Element>::Vector Vector;
    const Element nRank = static_cast<Element>((nCount - 1) / 2);
    Vector found{};
    for (int nBit = kBits - 1; nBit >= 0; --nBit) {
        const Vector tried = found | static_cast<Element>(1u << nBit);
        Vector below{};
        for (int i = 0; i < nCount; ++i) {
            const Vector more = below + static_cast<Element>(1);
            below = fnSample(i) < tried ? more : below;
        }
        found = below <= nRank ? tried : found;
    }
    return found;
}

// Medians of Lanes<Element>::kCount pixels; rows begin at the first pixel's windows.
template <typename T, typename Element, bool kSquared>
inline void MedianBlock(const void* const* papRow, std::int64_t nFirst, const WindowSize& oSize,
                        double* padfValue) {
    typedef typename Lanes<Element>::Vector Vector;
    const int nCount = oSize.nCols * oSize.nRows;
    int nRow = 0;
    int nCol = 0;
    // Samples are asked for in order, again and again.
    const auto fnSample = [&](int i) {
        if (i == 0) {
            nRow = 0;
            nCol = 0;
        }
        const Vector v = LoadLanes<Element>(static_cast<const T*>(papRow[nRow]) + nFirst + nCol);
        if (++nCol == oSize.nCols) {
            nCol = 0;
            ++nRow;
        }
        return v;
    };
    // By the number of operations, of which a bit needs three for each sample.
    constexpr int kFew = sizeof(T) == 1 ? 12 : kMostFew;
    const Vector median =
        nCount <= kFew ? SelectOfFew<Vector>(nCount, fnSample)
                       : SelectOfMany<Element, 8 * static_cast<int>(sizeof(T))>(nCount, fnSample);
    Element aMedian[Lanes<Element>::kCount];
    __builtin_memcpy(aMedian, &median, sizeof aMedian);
    for (int i = 0; i < Lanes<Element>::kCount; ++i) {
        padfValue[i] = static_cast<double>(static_cast<int>(aMedian[i]) - kMoved<T>);
    }
    if constexpr (kSquared) {
        // The root of the median is the median of the roots.
        for (int i = 0; i < Lanes<Element>::kCount; i += kLanes) {
            const F64 root = Root(Load(padfValue + i));
            Store(padfValue + i, root * root);
        }
    }
}

template <typename T, typename Element, bool kSquared>
void MediansWith(const MedianRows& oRows, const WindowSize& oSize, int nPix, double* padfValue) {
    constexpr int kCount = Lanes<Element>::kCount;
    static_assert(kCount <= kMedianReach);
    if (nPix < kCount) {
        // A copy, of which a whole block may be read.
        const std::size_t nBytes = static_cast<std::size_t>(oSize.nCols + nPix - 1) * sizeof(T);
        T* pCopy = static_cast<T*>(oRows.pCopy);
        for (int k = 0; k < oSize.nRows; ++k) {
            __builtin_memcpy(pCopy, oRows.papRow[k], nBytes);
            oRows.papCopy[k] = pCopy;
            pCopy += oSize.nCols + kMedianReach;
        }
        double adfValue[kCount];
        MedianBlock<T, Element, kSquared>(oRows.papCopy, 0, oSize, adfValue);
        __builtin_memcpy(padfValue, adfValue, static_cast<std::size_t>(nPix) * sizeof(double));
        return;
    }
    for (int i = 0; i < nPix; i += kCount) {
        // The last block overlaps the one before rather than the end of the rows.
        const int nFirst = i + kCount <= nPix ? i : nPix - kCount;
        MedianBlock<T, Element, kSquared>(oRows.papRow, nFirst, oSize, padfValue + nFirst);
    }
}

template <typename T, bool kSquared>
VETRA_STAGE void Medians(const MedianRows& oRows, const WindowSize& oSize, int nPix,
                         double* padfValue) {
    if constexpr (sizeof(T) == 1) {
        if (oSize.nCols * oSize.nRows <= Lanes<unsigned char>::kMost) {
            MediansWith<T, unsigned char, kSquared>(oRows, oSize, nPix, padfValue);
            return;
        }
    }
    MediansWith<T, unsigned short, kSquared>(oRows, oSize, nPix, padfValue);
}
