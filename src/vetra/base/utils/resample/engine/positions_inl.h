// The positions stage. Included inside a level's namespace; see stages_inl.h.

VETRA_STAGE void ArrayPositions(const float* pafCol, const float* pafRow, double dfColOff,
                                double dfRowOff, int nPix, double* padfCol, double* padfRow) {
    const F64 vColOff = Set1(dfColOff);
    const F64 vRowOff = Set1(dfRowOff);
    // Beyond the end of a page the processor's own prefetchers don't look.
    constexpr int kAhead = 1024;
    int i = 0;
    for (; i + kLanes <= nPix; i += kLanes) {
        if (i % (2 * kLanes) == 0) {
            __builtin_prefetch(pafCol + i + kAhead);
            __builtin_prefetch(pafRow + i + kAhead);
        }
        Store(padfCol + i, LoadFloats(pafCol + i) + vColOff);
        Store(padfRow + i, LoadFloats(pafRow + i) + vRowOff);
    }
    for (; i < nPix; ++i) {
        padfCol[i] = static_cast<double>(pafCol[i]) + dfColOff;
        padfRow[i] = static_cast<double>(pafRow[i]) + dfRowOff;
    }
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
