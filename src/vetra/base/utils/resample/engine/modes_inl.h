// The modes stage and the places stage. Included inside a level's namespace; see stages_inl.h.

// Eight bytes: bit 0 of each from nBits0, bit 1 from nBits1.
inline void StoreBits(unsigned char* p, unsigned nBits0, unsigned nBits1) {
#if defined(__BMI2__)
    constexpr std::uint64_t nLowest = 0x0101010101010101u;
    const std::uint64_t nBytes = _pdep_u64(nBits0, nLowest) | _pdep_u64(nBits1, nLowest << 1);
    __builtin_memcpy(p, &nBytes, sizeof nBytes);
#else
    for (int i = 0; i < kLanes; ++i) {
        p[i] = static_cast<unsigned char>((nBits0 >> i & 1u) | (nBits1 >> i & 1u) << 1);
    }
#endif
}

inline bool AnyByteEquals(const unsigned char* p, unsigned char nValue) {
    // A byte of 0 alone borrows from its own highest bit.
    constexpr std::uint64_t nLowest = 0x0101010101010101u;
    std::uint64_t n;
    __builtin_memcpy(&n, p, sizeof n);
    n ^= nValue * nLowest;
    return ((n - nLowest) & ~n & nLowest << 7) != 0;
}

// floor(x) <= last is x < last + 1 for whole numbers, which saves the floor.
struct Limits {
    explicit Limits(const ClassLimits& o)
        : fitColFirst(Set1(o.dfFitColFirst)),
          fitColEnd(Set1(o.dfFitColLast + 1.0)),
          fitRowFirst(Set1(o.dfFitRowFirst)),
          fitRowEnd(Set1(o.dfFitRowLast + 1.0)),
          nearColEnd(Set1(o.dfNearColLast + 1.0)),
          nearRowEnd(Set1(o.dfNearRowLast + 1.0)),
          anchorShift(Set1(o.bAnchorNearest ? 0.5 : 0.0)) {}

    // Which windows lie inside the source.
    B64 Fit(F64 col, F64 row) const {
        const F64 anchorCol = col + anchorShift;
        const F64 anchorRow = row + anchorShift;
        return (fitColFirst <= anchorCol) & (anchorCol < fitColEnd) & (fitRowFirst <= anchorRow) &
               (anchorRow < fitRowEnd);
    }
    // Which nearest pixels do.
    B64 Near(F64 col, F64 row) const {
        const F64 zero = Set1(0.0);
        const F64 half = Set1(0.5);
        const F64 nearCol = col + half;
        const F64 nearRow = row + half;
        return (zero <= nearCol) & (nearCol < nearColEnd) & (zero <= nearRow) &
               (nearRow < nearRowEnd);
    }

    F64 fitColFirst, fitColEnd, fitRowFirst, fitRowEnd, nearColEnd, nearRowEnd, anchorShift;
};

inline F64 Nearest(F64 pos) { return Floor(pos + Set1(0.5)); }

// A whole number where lanes say so, else 0.
inline void StorePlaces(std::int64_t* p, B64 lanes, F64 place) {
    StoreIntegers(p, Select(lanes, place, Set1(0.0)));
}

// The pixel from which a window's offsets count.
inline F64 Anchor(const ClassLimits& oLimits, F64 pos) {
    return oLimits.bAnchorNearest ? Nearest(pos) : Floor(pos);
}

VETRA_STAGE void Classes(const ClassLimits& oClassLimits, std::int64_t nPitch,
                         const double* padfCol, const double* padfRow, int nPix,
                         unsigned char* pabyClass, std::int64_t* panWindow,
                         std::int64_t* panNearest) {
    const Limits oLimits(oClassLimits);
    const double dfPitch = static_cast<double>(nPitch);
    const F64 pitch = Set1(dfPitch);
    const F64 first = Set1(oClassLimits.dfRowOff * dfPitch + oClassLimits.dfColOff);
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        const B64 fit = oLimits.Fit(col, row);
        const B64 near = oLimits.Near(col, row);
        StoreBits(pabyClass + i, Bits(fit), Bits(near));
        StorePlaces(panWindow + i, fit,
                    Anchor(oClassLimits, row) * pitch + Anchor(oClassLimits, col) + first);
        StorePlaces(panNearest + i, near, Nearest(row) * pitch + Nearest(col));
    }
}

inline F64 Least(F64 a, F64 b) { return Select(a < b, a, b); }
inline double LeastOf(F64 a) {
    double adf[kLanes];
    Store(adf, a);
    for (int i = 1; i < kLanes; ++i) {
        adf[0] = adf[i] < adf[0] ? adf[i] : adf[0];
    }
    return adf[0];
}

VETRA_STAGE PositionBounds Bounds(const double* padfCol, const double* padfRow, int nPix) {
    F64 firstCol = Set1(__builtin_inf());
    F64 firstRow = firstCol;
    // With their signs changed.
    F64 lastCol = firstCol;
    F64 lastRow = firstCol;
    const F64 zero = Set1(0.0);
    for (int i = 0; i + kLanes <= nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        firstCol = Least(col, firstCol);
        firstRow = Least(row, firstRow);
        lastCol = Least(zero - col, lastCol);
        lastRow = Least(zero - row, lastRow);
    }
    PositionBounds o{LeastOf(firstCol), -LeastOf(lastCol), LeastOf(firstRow), -LeastOf(lastRow)};
    for (int i = nPix / kLanes * kLanes; i < nPix; ++i) {
        o.dfFirstCol = padfCol[i] < o.dfFirstCol ? padfCol[i] : o.dfFirstCol;
        o.dfLastCol = padfCol[i] > o.dfLastCol ? padfCol[i] : o.dfLastCol;
        o.dfFirstRow = padfRow[i] < o.dfFirstRow ? padfRow[i] : o.dfFirstRow;
        o.dfLastRow = padfRow[i] > o.dfLastRow ? padfRow[i] : o.dfLastRow;
    }
    return o;
}

// Which of the windows of eight pixels hold no mask byte of 0.
inline unsigned WholeBits(const MaskWindow& oWindow, const std::int64_t* panWindow) {
    if (oWindow.panWhole != nullptr) {
        return MapBits(oWindow.panWhole, panWindow);
    }
    unsigned nWhole = 0xff;
    const unsigned char* pabyRow = oWindow.pabyWindow;
    for (int nRow = 0; nRow < oWindow.nWndRows; ++nRow, pabyRow += oWindow.nSrcCols) {
        int nCol = 0;
        for (; nCol + 1 < oWindow.nWndCols; nCol += 2) {
            nWhole &= FullPairBits(pabyRow + nCol, panWindow);
        }
        if (nCol < oWindow.nWndCols) {
            nWhole &= ~ByteBits(pabyRow + nCol, panWindow, 0);
        }
    }
    return nWhole;
}

// Which of the nearest pixels of eight pixels may be used.
inline unsigned UsableBits(const MaskWindow& oWindow, const std::int64_t* panNearest) {
    if (oWindow.panUsable != nullptr) {
        return MapBits(oWindow.panUsable, panNearest);
    }
    return oWindow.bExactlyOne ? ByteBits(oWindow.pabyNearest, panNearest, 1)
                               : ~ByteBits(oWindow.pabyNearest, panNearest, 0);
}

// Bits of eight pixels in a row of bits.
inline unsigned FindBits(const std::uint64_t* panRow, const BitGroup& oGroup,
                         const std::int64_t* panPlace) {
    return oGroup.nFirst >= 0 ? GroupBits(panRow, oGroup) : MapBits(panRow, panPlace);
}

// Writes classes of pixels, or the modes that belong to them, and keeps the set of what it wrote.
// Pixels come in groups of eight and are written 64 at a time.
class ClassWriter {
 public:
    // Without modes, classes are written.
    ClassWriter(const unsigned char* pabyModeOfClass, int nPix, unsigned char* paby)
        : mnPix(nPix), mpaby(paby) {
        if (pabyModeOfClass != nullptr) {
            __builtin_memcpy(mabyWritten, pabyModeOfClass, sizeof mabyWritten);
        }
        for (int k = 0; k < 4; ++k) {
            manBit0[k] = (mabyWritten[k] & 1) != 0 ? ~std::uint64_t{0} : 0;
            manBit1[k] = (mabyWritten[k] & 2) != 0 ? ~std::uint64_t{0} : 0;
        }
    }

    // Whether the nearest pixel decides about those whose windows are whole.
    bool NearestDecides() const {
        return mabyWritten[kClassFits] != mabyWritten[kClassFits | kClassNear];
    }

    // Adds the pixels i to i + 7.
    void Add(int i, unsigned nFits, unsigned nNear) {
        const int nShift = i % kWord;
        mnFits |= std::uint64_t{nFits & 0xffu} << nShift;
        mnNear |= std::uint64_t{nNear & 0xffu} << nShift;
        if (nShift == kWord - kLanes || i + kLanes >= mnPix) {
            Write(i - nShift);
        }
    }

    // Of all pixels, when they have been added.
    unsigned GetSet() const {
        unsigned nSet = 0;
        for (int k = 0; k < 4; ++k) {
            nSet |= manFound[k] != 0 ? 1u << mabyWritten[k] : 0u;
        }
        return nSet;
    }

 private:
    static constexpr int kWord = 64;

    void Write(int i) {
        // Mostly all pixels are of one class, and those behind the last one may be what they like.
        const std::uint64_t nExist =
            mnPix - i < kWord ? (std::uint64_t{1} << (mnPix - i)) - 1 : ~std::uint64_t{0};
        const std::uint64_t nFits = mnFits & nExist;
        const std::uint64_t nNear = mnNear & nExist;
        mnFits = 0;
        mnNear = 0;
        if ((nFits == 0 || nFits == nExist) && (nNear == 0 || nNear == nExist)) {
            const int nClass = (nFits != 0 ? kClassFits : 0) | (nNear != 0 ? kClassNear : 0);
            __builtin_memset(mpaby + i, mabyWritten[nClass], kWord);
            manFound[nClass] = 1;
            return;
        }
        const std::uint64_t nBoth = nFits & nNear;
        const std::uint64_t anClass[4] = {~(nFits | nNear), nFits ^ nBoth, nNear ^ nBoth, nBoth};
        std::uint64_t nBits0 = 0;
        std::uint64_t nBits1 = 0;
        for (int k = 0; k < 4; ++k) {
            nBits0 |= anClass[k] & manBit0[k];
            nBits1 |= anClass[k] & manBit1[k];
            manFound[k] |= anClass[k] & nExist;
        }
        StoreBits(mpaby + i, nBits0, nBits1);
    }

    int mnPix;
    unsigned char* mpaby;
    unsigned char mabyWritten[4] = {0, 1, 2, 3};
    // All bits set for the classes for which bit 0, or bit 1, is written.
    std::uint64_t manBit0[4];
    std::uint64_t manBit1[4];
    std::uint64_t manFound[4] = {};
    std::uint64_t mnFits = 0;
    std::uint64_t mnNear = 0;
};

VETRA_STAGE unsigned MaskClasses(const MaskWindow& oWindow, const std::int64_t* panWindow,
                                 const std::int64_t* panNearest, int nPix,
                                 unsigned char* pabyClassThenMode) {
    ClassWriter oWriter(oWindow.pabyModeOfClass, nPix, pabyClassThenMode);
    for (int i = 0; i < nPix; i += kLanes) {
        const unsigned char* pabyGroup = pabyClassThenMode + i;
        const unsigned nBoth = Bits(BytesEqual(pabyGroup, kClassFits | kClassNear));
        unsigned nFits = nBoth | Bits(BytesEqual(pabyGroup, kClassFits));
        unsigned nNear = nBoth | Bits(BytesEqual(pabyGroup, kClassNear));
        // Where nothing fits the source may be smaller than a window.
        if (oWindow.nWndRows != 0 && nFits != 0) {
            nFits &= WholeBits(oWindow, panWindow + i);
        }
        if (nFits != 0xff || oWriter.NearestDecides()) {
            nNear &= UsableBits(oWindow, panNearest + i);
        }
        oWriter.Add(i, nFits, nNear);
    }
    return oWriter.GetSet();
}

VETRA_STAGE unsigned RowClasses(const MaskWindow& oWindow, unsigned char nRowClass,
                                const std::int64_t* panWindow, const std::int64_t* panNearest,
                                int nPix, unsigned char* pabyClassThenMode) {
    ClassWriter oWriter(oWindow.pabyModeOfClass, nPix, pabyClassThenMode);
    const unsigned nRowFits = (nRowClass & kClassFits) != 0 ? 0xff : 0;
    const unsigned nRowNear = (nRowClass & kClassNear) != 0 ? 0xff : 0;
    const unsigned nUncounted = oWindow.nWndRows != 0 ? 0 : 0xff;
    for (int i = 0; i < nPix; i += kLanes) {
        const BitGroup& oWhole = oWindow.poWholeGroups[i / kLanes];
        const BitGroup& oUsable = oWindow.poUsableGroups[i / kLanes];
        oWriter.Add(
            i,
            oWhole.nInside & nRowFits &
                (nUncounted | FindBits(oWindow.panWhole, oWhole, panWindow + i)),
            oUsable.nInside & nRowNear & FindBits(oWindow.panUsable, oUsable, panNearest + i));
    }
    return oWriter.GetSet();
}

VETRA_STAGE unsigned MappedPlaces(const ClassLimits& oClassLimits, const MaskWindow& oWindow,
                                  std::int64_t nBitPitch, double dfPitch, double dfChan,
                                  const double* padfCol, const double* padfRow, int nPix,
                                  const SpanPlaces& oPlaces) {
    const Limits oLimits(oClassLimits);
    ClassWriter oWriter(oWindow.pabyModeOfClass, nPix, oPlaces.pabyClassThenMode);
    const double dfBitPitch = static_cast<double>(nBitPitch);
    const F64 bitPitch = Set1(dfBitPitch);
    const F64 pitch = Set1(dfPitch);
    const F64 chan = Set1(dfChan);
    const F64 firstBit = Set1(oClassLimits.dfRowOff * dfBitPitch + oClassLimits.dfColOff);
    const F64 first = Set1(oClassLimits.dfRowOff * dfPitch + oClassLimits.dfColOff * dfChan);
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        unsigned nFits = 0;
        if (oPlaces.panWindow != nullptr) {
            const B64 fit = oLimits.Fit(col, row);
            const F64 anchorCol = Anchor(oClassLimits, col);
            const F64 anchorRow = Anchor(oClassLimits, row);
            StorePlaces(oPlaces.panWindow + i, fit, anchorRow * pitch + anchorCol * chan + first);
            Store(oPlaces.padfFracCol + i, col - anchorCol);
            Store(oPlaces.padfFracRow + i, row - anchorRow);
            const unsigned nWhole =
                MapBits(oWindow.panWhole,
                        Select(fit, anchorRow * bitPitch + anchorCol + firstBit, Set1(0.0)));
            nFits = Bits(fit);
            if (oPlaces.pabyBroken != nullptr) {
                StoreBits(oPlaces.pabyBroken + i, nFits & ~nWhole, 0u);
            }
            if (oWindow.nWndRows != 0) {
                nFits &= nWhole;
            }
        }
        unsigned nNear = 0;
        if (nFits != 0xff || oWriter.NearestDecides()) {
            const B64 near = oLimits.Near(col, row);
            const F64 nearCol = Nearest(col);
            const F64 nearRow = Nearest(row);
            StorePlaces(oPlaces.panNearest + i, near, nearRow * pitch + nearCol * chan);
            nNear = Bits(near) & MapBits(oWindow.panUsable,
                                         Select(near, nearRow * bitPitch + nearCol, Set1(0.0)));
        }
        oWriter.Add(i, nFits, nNear);
    }
    return oWriter.GetSet();
}

VETRA_STAGE void MaskBits(const unsigned char* pabyMask, std::int64_t nCount, unsigned char nValue,
                          bool bEqual, std::uint64_t* panBits) {
    const std::uint64_t nFlip = bEqual ? 0 : ~std::uint64_t{0};
    std::int64_t n = 0;
    for (; n + 64 <= nCount; n += 64) {
        *panBits++ = EqualBits(pabyMask + n, nValue) ^ nFlip;
    }
    if (n < nCount) {
        unsigned char aby[64] = {};
        __builtin_memcpy(aby, pabyMask + n, static_cast<std::size_t>(nCount - n));
        *panBits = (EqualBits(aby, nValue) ^ nFlip) & ((std::uint64_t{1} << (nCount - n)) - 1);
    }
}

VETRA_STAGE void BrokenWindows(const MaskWindow& oWindow, const std::int64_t* panWindow,
                               const unsigned char* pabyMode, int nPix, unsigned char* pabyBroken) {
    for (int i = 0; i < nPix; i += kLanes) {
        unsigned nBroken = Bits(BytesEqual(pabyMode + i, 1));
        if (nBroken != 0) {
            nBroken &=
                ~(oWindow.poWholeGroups != nullptr
                      ? FindBits(oWindow.panWhole, oWindow.poWholeGroups[i / kLanes], panWindow + i)
                      : MapBits(oWindow.panWhole, panWindow + i));
        }
        StoreBits(pabyBroken + i, nBroken, 0u);
    }
}

VETRA_STAGE unsigned OpenModes(const ClassLimits& oClassLimits, bool bWindow,
                               unsigned char nFallback, const double* padfCol,
                               const double* padfRow, int nPix, unsigned char* pabyMode) {
    const Limits oLimits(oClassLimits);
    const unsigned char abyModeOfClass[4] = {0, 1, nFallback, 1};
    ClassWriter oWriter(abyModeOfClass, nPix, pabyMode);
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        const unsigned nFit = bWindow ? Bits(oLimits.Fit(col, row)) : 0u;
        oWriter.Add(i, nFit, nFit == 0xffu ? 0u : Bits(oLimits.Near(col, row)));
    }
    return oWriter.GetSet();
}

VETRA_STAGE void Windows(const ClassLimits& oLimits, double dfPitch, double dfChan,
                         const double* padfCol, const double* padfRow,
                         const unsigned char* pabyMode, int nPix, std::int64_t* panOffset,
                         double* padfFracCol, double* padfFracRow) {
    // Offsets are whole numbers below 2^53, so exact in double.
    const F64 pitch = Set1(dfPitch);
    const F64 chan = Set1(dfChan);
    const F64 first = Set1(oLimits.dfRowOff * dfPitch + oLimits.dfColOff * dfChan);
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        const F64 anchorCol = Anchor(oLimits, col);
        const F64 anchorRow = Anchor(oLimits, row);
        const F64 offset = anchorRow * pitch + anchorCol * chan + first;
        if (pabyMode == nullptr) {
            StoreIntegers(panOffset + i, offset);
        } else {
            StorePlaces(panOffset + i, BytesEqual(pabyMode + i, 1), offset);
        }
        Store(padfFracCol + i, col - anchorCol);
        Store(padfFracRow + i, row - anchorRow);
    }
}

VETRA_STAGE void NearestPlaces(double dfPitch, double dfChan, const double* padfCol,
                               const double* padfRow, const unsigned char* pabyMode, int nPix,
                               std::int64_t* panOffset) {
    const F64 pitch = Set1(dfPitch);
    const F64 chan = Set1(dfChan);
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 offset = Nearest(Load(padfRow + i)) * pitch + Nearest(Load(padfCol + i)) * chan;
        if (pabyMode == nullptr) {
            StoreIntegers(panOffset + i, offset);
        } else {
            StorePlaces(panOffset + i, BytesEqual(pabyMode + i, 2), offset);
        }
    }
}
