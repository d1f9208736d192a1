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

// The groups of a span for which fnCondition holds, of their first pixels. Takes no branch for
// each, which would be foreseen badly.
class GroupList {
 public:
    template <typename Condition>
    GroupList(int nPix, const Condition& fnCondition) {
        int nCount = 0;
        for (int i = 0; i < nPix; i += kLanes) {
            manFirst[nCount] = i;
            nCount += fnCondition(i) ? 1 : 0;
        }
        mnCount = nCount;
    }
    // The groups' first pixels.
    const int* begin() const { return manFirst; }
    const int* end() const { return manFirst + mnCount; }

 private:
    int manFirst[kSpanPixels / kLanes];
    int mnCount;
};

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

// Which of the windows of eight pixels hold no mask byte of 0.
inline unsigned WholeBits(const MaskBytes& oMask, const std::int64_t* panWindow) {
    unsigned nWhole = 0xff;
    const unsigned char* pabyRow = oMask.pabyWindow;
    for (int nRow = 0; nRow < oMask.nWndRows; ++nRow, pabyRow += oMask.nSrcCols) {
        int nCol = 0;
        for (; nCol + 1 < oMask.nWndCols; nCol += 2) {
            nWhole &= FullPairBits(pabyRow + nCol, panWindow);
        }
        if (nCol < oMask.nWndCols) {
            nWhole &= ~ByteBits(pabyRow + nCol, panWindow, 0);
        }
    }
    return nWhole;
}

// Which of the nearest pixels of eight pixels may be used.
inline unsigned UsableBits(const ClassRules& oRules, const MaskBytes& oMask,
                           const std::int64_t* panNearest) {
    return oRules.bExactlyOne ? ByteBits(oMask.pabyNearest, panNearest, 1)
                              : ~ByteBits(oMask.pabyNearest, panNearest, 0);
}

// A bit for each pixel of a span.
struct SpanBits {
    // The bits of pixels i to i + 7.
    void Set(int i, unsigned nBits) { Byte(i) = static_cast<unsigned char>(nBits); }
    unsigned Get(int i) { return Byte(i); }

    std::uint64_t an[kSpanWords] = {};

 private:
    unsigned char& Byte(int i) {
        constexpr int kSwap = __BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__ ? 0 : 7;
        return reinterpret_cast<unsigned char*>(an)[i / kLanes ^ kSwap];
    }
};

// Writes classes of pixels, or the modes that belong to them, and keeps the set of what it wrote.
class ClassWriter {
 public:
    ClassWriter(const ClassRules& oRules, int nPix, unsigned char* paby)
        : mnPix(nPix), mpaby(paby) {
        if (oRules.pabyModeOfClass != nullptr) {
            __builtin_memcpy(mabyWritten, oRules.pabyModeOfClass, sizeof mabyWritten);
        }
        for (int k = 0; k < 4; ++k) {
            manBit0[k] = (mabyWritten[k] & 1) != 0 ? ~std::uint64_t{0} : 0;
            manBit1[k] = (mabyWritten[k] & 2) != 0 ? ~std::uint64_t{0} : 0;
        }
    }

    // Whether the nearest pixel decides about those whose windows fit.
    bool NearestDecides() const {
        return mabyWritten[kClassFits] != mabyWritten[kClassFits | kClassNear];
    }

    // Writes all pixels. Returns the set.
    unsigned Write(const SpanBits& oFits, const SpanBits& oNear) {
        for (int i = 0; i < mnPix; i += kWordPixels) {
            WriteWord(i, oFits.an[i / kWordPixels], oNear.an[i / kWordPixels]);
        }
        unsigned nSet = 0;
        for (int k = 0; k < 4; ++k) {
            nSet |= manFound[k] != 0 ? 1u << mabyWritten[k] : 0u;
        }
        return nSet;
    }

 private:
    void WriteWord(int i, std::uint64_t nFits, std::uint64_t nNear) {
        // Mostly all pixels are of one class, and those behind the last one may be what they like.
        const std::uint64_t nExist =
            mnPix - i < kWordPixels ? (std::uint64_t{1} << (mnPix - i)) - 1 : ~std::uint64_t{0};
        nFits &= nExist;
        nNear &= nExist;
        if ((nFits == 0 || nFits == nExist) && (nNear == 0 || nNear == nExist)) {
            const int nClass = (nFits != 0 ? kClassFits : 0) | (nNear != 0 ? kClassNear : 0);
            __builtin_memset(mpaby + i, mabyWritten[nClass], kWordPixels);
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
};

VETRA_STAGE unsigned MaskClasses(const ClassRules& oRules, const MaskBytes& oMask,
                                 const std::int64_t* panWindow, const std::int64_t* panNearest,
                                 int nPix, unsigned char* pabyClassThenMode) {
    ClassWriter oWriter(oRules, nPix, pabyClassThenMode);
    SpanBits oFits;
    SpanBits oNear;
    for (int i = 0; i < nPix; i += kLanes) {
        const unsigned char* pabyGroup = pabyClassThenMode + i;
        const unsigned nBoth = Bits(BytesEqual(pabyGroup, kClassFits | kClassNear));
        unsigned nFits = nBoth | Bits(BytesEqual(pabyGroup, kClassFits));
        unsigned nNear = nBoth | Bits(BytesEqual(pabyGroup, kClassNear));
        // Where nothing fits the source may be smaller than a window.
        if (oRules.bNeedsWhole && nFits != 0) {
            nFits &= WholeBits(oMask, panWindow + i);
        }
        if (nFits != 0xff || oWriter.NearestDecides()) {
            nNear &= UsableBits(oRules, oMask, panNearest + i);
        }
        oFits.Set(i, nFits);
        oNear.Set(i, nNear);
    }
    return oWriter.Write(oFits, oNear);
}

inline void StoreBroken(const SpanBits& oInside, const SpanBits& oWhole, std::uint64_t* panBroken) {
    for (int k = 0; k < kSpanWords; ++k) {
        panBroken[k] = oInside.an[k] & ~oWhole.an[k];
    }
}

// The bits of target columns from nCol on, which fnGroup gives for each group.
template <typename Function>
inline SpanBits RowBits(int nCol, int nPix, const Function& fnGroup) {
    constexpr int kColumns = BitGroup::kColumns;
    SpanBits oBits;
    const int nShift = nCol % kColumns;
    int i = -nShift;
    for (int g = nCol / kColumns; i < nPix; ++g, i += kColumns) {
        const std::uint64_t nGroup = fnGroup(g);
        if (i < 0) {
            oBits.an[0] = nGroup >> nShift;
            continue;
        }
        oBits.an[i / kWordPixels] |= nGroup << (i % kWordPixels);
        // A group may begin in one word and end in the next.
        const int nNext = (i + kColumns - 1) / kWordPixels;
        if (nNext != i / kWordPixels && nNext < kSpanWords) {
            oBits.an[nNext] = nGroup >> (kWordPixels - i % kWordPixels);
        }
    }
    return oBits;
}

VETRA_STAGE unsigned RowClasses(const ClassRules& oRules, const MaskRow& oMask,
                                unsigned char nRowClass, int nCol, int nPix,
                                unsigned char* pabyClassThenMode, std::uint64_t* panBroken) {
    SpanBits oInside;
    SpanBits oWhole;
    SpanBits oNear;
    if ((nRowClass & kClassFits) != 0) {
        if (!oRules.bNeedsWhole) {
            oInside = RowBits(nCol, nPix, [&](int g) { return oMask.poWholeGroups[g].nInside; });
        }
        if (oRules.bNeedsWhole || panBroken != nullptr) {
            oWhole = RowBits(nCol, nPix, [&](int g) {
                return GroupBits(oMask.panWhole, oMask.poWholeGroups[g],
                                 oMask.panWindowCol + g * BitGroup::kColumns);
            });
        }
    }
    if ((nRowClass & kClassNear) != 0) {
        oNear = RowBits(nCol, nPix, [&](int g) {
            return GroupBits(oMask.panUsable, oMask.poUsableGroups[g],
                             oMask.panNearestCol + g * BitGroup::kColumns);
        });
    }
    if (panBroken != nullptr) {
        StoreBroken(oInside, oWhole, panBroken);
    }
    return ClassWriter(oRules, nPix, pabyClassThenMode)
        .Write(oRules.bNeedsWhole ? oWhole : oInside, oNear);
}

inline CellLimits WindowLimits(const ClassLimits& o) {
    const auto fnCount = [](double dfFirst, double dfLast) {
        return dfFirst <= dfLast ? static_cast<int>(dfLast - dfFirst) + 1 : 0;
    };
    return {static_cast<int>(o.dfColOff), static_cast<int>(o.dfRowOff),
            fnCount(o.dfFitColFirst, o.dfFitColLast), fnCount(o.dfFitRowFirst, o.dfFitRowLast)};
}
inline CellLimits NearestLimits(const ClassLimits& o) {
    return {0, 0, static_cast<int>(o.dfNearColLast) + 1, static_cast<int>(o.dfNearRowLast) + 1};
}

// The cells of windows, or of nearest pixels, of a span, and which of them are inside.
struct SpanCells {
    alignas(64) std::int32_t anCol[kSpanPixels];
    alignas(64) std::int32_t anRow[kSpanPixels];
    SpanBits oInside;
};

template <bool kAnchorNearest>
VETRA_STAGE void WindowCells(const ClassLimits& oClassLimits, int nPitch, int nChan,
                             const double* padfCol, const double* padfRow, int nPix,
                             SpanPlaces oPlaces, SpanCells& oSpanCells) {
    const CellLimits oLimits = WindowLimits(oClassLimits);
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        const F64 anchorCol = kAnchorNearest ? Nearest(col) : Floor(col);
        const F64 anchorRow = kAnchorNearest ? Nearest(row) : Floor(row);
        Store(oPlaces.padfFracCol + i, col - anchorCol);
        Store(oPlaces.padfFracRow + i, row - anchorRow);
        const Cells oCells = CellsInside(anchorCol, anchorRow, oLimits);
        StorePlaces(oPlaces.panWindow + i, oCells, nPitch, nChan);
        Store(oSpanCells.anCol + i, oSpanCells.anRow + i, oCells);
        oSpanCells.oInside.Set(i, Bits(oCells));
    }
}

VETRA_STAGE unsigned MappedPlaces(const ClassLimits& oClassLimits, const ClassRules& oRules,
                                  const MaskBands& oMask, int nPitch, int nChan,
                                  const double* padfCol, const double* padfRow, int nPix,
                                  const SpanPlaces& oPlaces) {
    SpanBits oWhole;
    SpanBits oNear;
    SpanCells oCells;
    // Bits are looked up in loops of their own: what leads to them takes many steps, and the
    // shorter a loop, the more of its rounds overlap.
    const std::int64_t nBandPitch = oMask.nPitch;
    if (oPlaces.panWindow != nullptr) {
        const auto pfnCells =
            oClassLimits.bAnchorNearest ? &WindowCells<true> : &WindowCells<false>;
        pfnCells(oClassLimits, nPitch, nChan, padfCol, padfRow, nPix, oPlaces, oCells);
        const unsigned char* pabyWhole = oMask.pabyWhole;
        for (int i = 0; i < nPix; i += kLanes) {
            const unsigned nWhole =
                BandBits(pabyWhole, nBandPitch, oCells.anCol + i, oCells.anRow + i);
            oWhole.Set(i, oCells.oInside.Get(i) & nWhole);
            oNear.Set(i, oCells.oInside.Get(i) & nWhole);
        }
        if (oPlaces.panBroken != nullptr) {
            StoreBroken(oCells.oInside, oWhole, oPlaces.panBroken);
        }
    }
    // Where all requests are 1, a whole window decides: alone, or with its nearest pixel, which is
    // as valid as the rest.
    const bool bAll = oRules.pabyModeOfClass == nullptr;
    const GroupList oOthers(nPix, [&](int i) { return bAll || oWhole.Get(i) != 0xff; });
    const CellLimits oLimits = NearestLimits(oClassLimits);
    for (const int i : oOthers) {
        const Cells o =
            CellsInside(Nearest(Load(padfCol + i)), Nearest(Load(padfRow + i)), oLimits);
        StorePlaces(oPlaces.panNearest + i, o, nPitch, nChan);
        Store(oCells.anCol + i, oCells.anRow + i, o);
        oNear.Set(i, Bits(o));
    }
    const unsigned char* pabyUsable = oMask.pabyUsable;
    for (const int i : oOthers) {
        oNear.Set(
            i, oNear.Get(i) & BandBits(pabyUsable, nBandPitch, oCells.anCol + i, oCells.anRow + i));
    }
    return ClassWriter(oRules, nPix, oPlaces.pabyClassThenMode)
        .Write(oRules.bNeedsWhole ? oWhole : oCells.oInside, oNear);
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

VETRA_STAGE void MakeBand(const std::uint64_t* panBits, std::int64_t nRowWords, int nRows,
                          std::int64_t nWords, unsigned char* pabyBand) {
    __builtin_memset(pabyBand, 0, static_cast<std::size_t>(nWords) * 64);
    for (int r = 0; r < nRows; ++r) {
        for (std::int64_t n = 0; n < nWords; ++n) {
            AddBits(pabyBand + n * 64, panBits[r * nRowWords + n],
                    static_cast<unsigned char>(1 << r));
        }
    }
}

VETRA_STAGE unsigned OpenModes(const ClassLimits& oClassLimits, bool bWindow,
                               unsigned char nFallback, const double* padfCol,
                               const double* padfRow, int nPix, unsigned char* pabyMode) {
    const Limits oLimits(oClassLimits);
    const unsigned char abyModeOfClass[4] = {0, 1, nFallback, 1};
    SpanBits oFits;
    SpanBits oNear;
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 col = Load(padfCol + i);
        const F64 row = Load(padfRow + i);
        const unsigned nFit = bWindow ? Bits(oLimits.Fit(col, row)) : 0u;
        oFits.Set(i, nFit);
        oNear.Set(i, nFit == 0xffu ? 0u : Bits(oLimits.Near(col, row)));
    }
    return ClassWriter({abyModeOfClass, false, false}, nPix, pabyMode).Write(oFits, oNear);
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
