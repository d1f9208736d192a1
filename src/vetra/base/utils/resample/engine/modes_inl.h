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

VETRA_STAGE void Classes(const ClassLimits& oClassLimits, int nSrcCols, const double* padfCol,
                         const double* padfRow, int nPix, unsigned char* pabyClass,
                         std::int64_t* panWindow, std::int64_t* panNearest) {
    const Limits oLimits(oClassLimits);
    const F64 pitch = Set1(nSrcCols);
    const F64 first = Set1(oClassLimits.dfRowOff * nSrcCols + oClassLimits.dfColOff);
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

VETRA_STAGE void MaskClasses(const MaskWindow& oWindow, const std::int64_t* panWindow,
                             const std::int64_t* panNearest, int nPix, unsigned char* pabyClass) {
    for (int i = 0; i < nPix; i += kLanes) {
        unsigned char* pabyGroup = pabyClass + i;
        // Where nothing fits the source may be smaller than a window.
        unsigned nFull = 0;
        if (AnyByteEquals(pabyGroup, kClassFits) ||
            AnyByteEquals(pabyGroup, kClassFits | kClassNear)) {
            nFull = 0xff;
            const unsigned char* pabyRow = oWindow.pabyWindow;
            for (int nRow = 0; nRow < oWindow.nWndRows; ++nRow, pabyRow += oWindow.nSrcCols) {
                int nCol = 0;
                for (; nCol + 1 < oWindow.nWndCols; nCol += 2) {
                    nFull &= FullPairBits(pabyRow + nCol, panWindow + i);
                }
                if (nCol < oWindow.nWndCols) {
                    nFull &= ~ByteBits(pabyRow + nCol, panWindow + i, 0);
                }
            }
        }
        const unsigned nUsable = oWindow.bExactlyOne
                                     ? ByteBits(oWindow.pabyNearest, panNearest + i, 1)
                                     : ~ByteBits(oWindow.pabyNearest, panNearest + i, 0);
        unsigned char abyKeep[kLanes];
        StoreBits(abyKeep, nFull & 0xffu, nUsable & 0xffu);
        for (int k = 0; k < kLanes; ++k) {
            pabyGroup[k] &= abyKeep[k];
        }
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
