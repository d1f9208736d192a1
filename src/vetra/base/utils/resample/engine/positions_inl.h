// The positions stage. Included inside a level's namespace; see stages_inl.h.

class BoundsFinder {
 public:
    void Add(F64 col, F64 row) {
        // Of a position that is no number the bound so far remains.
        mFirstCol = Least(col, mFirstCol);
        mFirstRow = Least(row, mFirstRow);
        mLastCol = Greatest(col, mLastCol);
        mLastRow = Greatest(row, mLastRow);
        mSum = mSum + (col + row);
    }
    PositionBounds Get() const {
        return {LeastLane(mFirstCol), GreatestLane(mLastCol), LeastLane(mFirstRow),
                GreatestLane(mLastRow), Bits(mSum - mSum == Set1(0.0)) == 0xff};
    }

 private:
    F64 mFirstCol = Set1(__builtin_inf());
    F64 mFirstRow = mFirstCol;
    F64 mLastCol = Set1(-__builtin_inf());
    F64 mLastRow = mLastCol;
    F64 mSum = Set1(0.0);
};

VETRA_STAGE PositionBounds ArrayPositions(const float* pafCol, const float* pafRow, double dfColOff,
                                          double dfRowOff, int nPix, double* padfCol,
                                          double* padfRow) {
    const F64 vColOff = Set1(dfColOff);
    const F64 vRowOff = Set1(dfRowOff);
    // Beyond the end of a page the processor's own prefetchers don't look.
    constexpr int kAhead = 1024;
    BoundsFinder oBounds;
    int i = 0;
    for (; i + kLanes <= nPix; i += kLanes) {
        if (i % (2 * kLanes) == 0) {
            __builtin_prefetch(pafCol + i + kAhead);
            __builtin_prefetch(pafRow + i + kAhead);
        }
        const F64 col = LoadFloats(pafCol + i) + vColOff;
        const F64 row = LoadFloats(pafRow + i) + vRowOff;
        oBounds.Add(col, row);
        Store(padfCol + i, col);
        Store(padfRow + i, row);
    }
    for (; i < nPix; ++i) {
        padfCol[i] = static_cast<double>(pafCol[i]) + dfColOff;
        padfRow[i] = static_cast<double>(pafRow[i]) + dfRowOff;
        oBounds.Add(Set1(padfCol[i]), Set1(padfRow[i]));
    }
    return oBounds.Get();
}

VETRA_STAGE PositionBounds Bounds(const double* padfCol, const double* padfRow, int nPix) {
    BoundsFinder oBounds;
    int i = 0;
    for (; i + kLanes <= nPix; i += kLanes) {
        oBounds.Add(Load(padfCol + i), Load(padfRow + i));
    }
    for (; i < nPix; ++i) {
        oBounds.Add(Set1(padfCol[i]), Set1(padfRow[i]));
    }
    return oBounds.Get();
}

VETRA_STAGE void BilinearPositions(const BilinearCorners& oCorners, std::int64_t nX,
                                   std::int64_t nY, int nPix, double* padfCol, double* padfRow) {
    static const double kadfSteps[kLanes] = {0, 1, 2, 3, 4, 5, 6, 7};
    const F64 one = Set1(1.0);
    const bool bWide = oCorners.nCols > 1;
    const F64 vSpan = Set1(bWide ? oCorners.nCols - 1 : 1.0);
    const double dfV = oCorners.nRows > 1 ? static_cast<double>(nY) / (oCorners.nRows - 1) : 0.0;
    const F64 v = Set1(dfV);
    const auto fnPosition = [&](const double* padfCorner, F64 u) {
        return ((one - u) * Set1(padfCorner[2]) + u * Set1(padfCorner[3])) * v +
               ((one - u) * Set1(padfCorner[0]) + u * Set1(padfCorner[1])) * (one - v);
    };
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 x = Set1(static_cast<double>(nX + i)) + Load(kadfSteps);
        const F64 u = bWide ? x / vSpan : Set1(0.0);
        Store(padfCol + i, fnPosition(oCorners.adfCol, u));
        Store(padfRow + i, fnPosition(oCorners.adfRow, u));
    }
}
