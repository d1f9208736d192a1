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
    return Bits(BytesEqual(p, nValue)) != 0;
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

// Writes what becomes of groups of eight pixels, and keeps the set of it. Pixels are bits; those of
// each class have a byte of a word.
struct ClassWriter {
    ClassWriter(const MaskWindow& oWindow, int nNumPix) : nPix(nNumPix) {
        if (oWindow.pabyModeOfClass != nullptr) {
            __builtin_memcpy(abyWritten, oWindow.pabyModeOfClass, sizeof abyWritten);
        }
        for (int k = 0; k < 4; ++k) {
            const std::uint32_t nByte = 0xffu << (8 * k);
            nBit0 |= (abyWritten[k] & 1) != 0 ? nByte : 0u;
            nBit1 |= (abyWritten[k] & 2) != 0 ? nByte : 0u;
        }
        bNearestDecides = abyWritten[kClassFits] != abyWritten[kClassFits | kClassNear];
    }

    void Write(int i, std::uint32_t nFits, std::uint32_t nNear, unsigned char* p) {
        nFits &= 0xffu;
        nNear &= 0xffu;
        const std::uint32_t nBoth = nFits & nNear;
        const std::uint32_t nClasses =
            ((nFits | nNear) ^ 0xffu) | (nFits ^ nBoth) << 8 | (nNear ^ nBoth) << 16 | nBoth << 24;
        const auto fnFold = [](std::uint32_t n) {
            n |= n >> 16;
            return (n | n >> 8) & 0xffu;
        };
        StoreBits(p + i, fnFold(nClasses & nBit0), fnFold(nClasses & nBit1));
        const std::uint32_t nExist = nPix - i < kLanes ? (1u << (nPix - i)) - 1u : 0xffu;
        nFound |= nClasses & nExist * 0x01010101u;
    }

    unsigned GetSet() const {
        unsigned nSet = 0;
        for (int k = 0; k < 4; ++k) {
            nSet |= (nFound >> (8 * k) & 0xffu) != 0 ? 1u << abyWritten[k] : 0u;
        }
        return nSet;
    }

    int nPix;
    unsigned char abyWritten[4] = {0, 1, 2, 3};
    std::uint32_t nBit0 = 0;  // the classes for which bit 0 is written
    std::uint32_t nBit1 = 0;
    std::uint32_t nFound = 0;
    bool bNearestDecides;  // about pixels whose windows are whole
};

VETRA_STAGE unsigned MaskClasses(const MaskWindow& oWindow, const std::int64_t* panWindow,
                                 const std::int64_t* panNearest, int nPix,
                                 unsigned char* pabyClassThenMode) {
    ClassWriter oWriter(oWindow, nPix);
    for (int i = 0; i < nPix; i += kLanes) {
        const unsigned char* pabyGroup = pabyClassThenMode + i;
        const unsigned nBoth = Bits(BytesEqual(pabyGroup, kClassFits | kClassNear));
        unsigned nFits = nBoth | Bits(BytesEqual(pabyGroup, kClassFits));
        unsigned nNear = nBoth | Bits(BytesEqual(pabyGroup, kClassNear));
        // Where nothing fits the source may be smaller than a window.
        if (oWindow.nWndRows != 0 && nFits != 0) {
            nFits &= WholeBits(oWindow, panWindow + i);
        }
        if (nFits != 0xff || oWriter.bNearestDecides) {
            nNear &= UsableBits(oWindow, panNearest + i);
        }
        oWriter.Write(i, nFits, nNear, pabyClassThenMode);
    }
    return oWriter.GetSet();
}

VETRA_STAGE unsigned MappedPlaces(const ClassLimits& oClassLimits, const MaskWindow& oWindow,
                                  std::int64_t nBitPitch, double dfPitch, double dfChan,
                                  const double* padfCol, const double* padfRow, int nPix,
                                  const SpanPlaces& oPlaces) {
    const Limits oLimits(oClassLimits);
    ClassWriter oWriter(oWindow, nPix);
    const double dfBitPitch = static_cast<double>(nBitPitch);
    const F64 bitPitch = Set1(dfBitPitch);
    const F64 pitch = Set1(dfPitch);
    const F64 chan = Set1(dfChan);
    const F64 firstBit = Set1(oClassLimits.dfRowOff * dfBitPitch + oClassLimits.dfColOff);
    const F64 first = Set1(oClassLimits.dfRowOff * dfPitch + oClassLimits.dfColOff * dfChan);
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        const B64 fit = oLimits.Fit(col, row);
        unsigned nFits = Bits(fit);
        if (nFits != 0) {
            const F64 anchorCol = Anchor(oClassLimits, col);
            const F64 anchorRow = Anchor(oClassLimits, row);
            StorePlaces(oPlaces.panWindow + i, fit, anchorRow * pitch + anchorCol * chan + first);
            Store(oPlaces.padfFracCol + i, col - anchorCol);
            Store(oPlaces.padfFracRow + i, row - anchorRow);
            const unsigned nWhole =
                MapBits(oWindow.panWhole,
                        Select(fit, anchorRow * bitPitch + anchorCol + firstBit, Set1(0.0)));
            if (oPlaces.pabyBroken != nullptr) {
                StoreBits(oPlaces.pabyBroken + i, nFits & ~nWhole, 0);
            }
            if (oWindow.nWndRows != 0) {
                nFits &= nWhole;
            }
        } else {
            StoreIntegers(oPlaces.panWindow + i, Set1(0.0));
            if (oPlaces.pabyBroken != nullptr) {
                StoreBits(oPlaces.pabyBroken + i, 0, 0);
            }
        }
        unsigned nNear = 0;
        if (nFits != 0xff || oWriter.bNearestDecides) {
            const B64 near = oLimits.Near(col, row);
            const F64 nearCol = Nearest(col);
            const F64 nearRow = Nearest(row);
            StorePlaces(oPlaces.panNearest + i, near, nearRow * pitch + nearCol * chan);
            nNear = Bits(near) & MapBits(oWindow.panUsable,
                                         Select(near, nearRow * bitPitch + nearCol, Set1(0.0)));
        }
        oWriter.Write(i, nFits, nNear, oPlaces.pabyClassThenMode);
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

VETRA_STAGE void BrokenWindows(const std::uint64_t* panWhole, const std::int64_t* panWindow,
                               const unsigned char* pabyMode, int nPix, unsigned char* pabyBroken) {
    for (int i = 0; i < nPix; i += kLanes) {
        const unsigned nMode = Bits(BytesEqual(pabyMode + i, 1));
        StoreBits(pabyBroken + i, nMode != 0 ? nMode & ~MapBits(panWhole, panWindow + i) : 0u, 0);
    }
}

VETRA_STAGE unsigned OpenModes(const ClassLimits& oClassLimits, bool bWindow,
                               unsigned char nFallback, const double* padfCol,
                               const double* padfRow, int nPix, unsigned char* pabyMode) {
    const Limits oLimits(oClassLimits);
    unsigned nFitAny = 0;
    unsigned nNearAny = 0;
    unsigned nNoneAny = 0;
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        const unsigned nFit = bWindow ? Bits(oLimits.Fit(col, row)) : 0u;
        unsigned nNear = 0;
        if (nFit != 0xffu && nFallback != 0) {
            nNear = Bits(oLimits.Near(col, row)) & ~nFit;
        }
        StoreBits(pabyMode + i, nFit, nNear);
        nFitAny |= nFit;
        nNearAny |= nNear;
        nNoneAny |= ~(nFit | nNear) & 0xffu;
    }
    return (nNoneAny != 0 ? 1u : 0u) | (nFitAny != 0 ? 2u : 0u) | (nNearAny != 0 ? 4u : 0u);
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
