// Window means of integer samples in axis-aligned runs. Included inside a level's namespace; see
// stages_inl.h.
//
// Sums of integers are exact in double whatever their order, so they may be kept running: of each
// source column over the rows of a window, and over the columns from the left.

// Adds a stretch of one channel of a source row to the sums of its columns, or takes it away.
template <typename T, bool kAdd>
VETRA_STAGE void AddRow(const void* pSrc, int nChan, std::int64_t nCount, double* padfSum) {
    const T* p = static_cast<const T*>(pSrc);
    std::int64_t anOffset[kLanes];
    for (int i = 0; i < kLanes; ++i) {
        anOffset[i] = static_cast<std::int64_t>(i) * nChan;
    }
    std::int64_t n = 0;
    for (; n + kLanes <= nCount; n += kLanes, p += static_cast<std::int64_t>(nChan) * kLanes) {
        const F64 sample = nChan == 1 ? LoadSamples(p) : Gather(p, anOffset);
        const F64 sum = Load(padfSum + n);
        Store(padfSum + n, kAdd ? sum + sample : sum - sample);
    }
    for (; n < nCount; ++n, p += nChan) {
        const double df = static_cast<double>(*p);
        padfSum[n] += kAdd ? df : -df;
    }
}

// Sums from the left: padfTotal[n] is that of the first n columns.
VETRA_STAGE void AddUp(const double* padfSum, std::int64_t nCount, double* padfTotal) {
    double dfTotal = 0.0;
    std::int64_t n = 0;
    padfTotal[0] = 0.0;
    // Four at a time, of which only one addition waits for the four before.
    for (; n + 4 <= nCount; n += 4) {
        const double df2 = padfSum[n] + padfSum[n + 1];
        const double df3 = df2 + padfSum[n + 2];
        const double df4 = df2 + (padfSum[n + 2] + padfSum[n + 3]);
        padfTotal[n + 1] = dfTotal + padfSum[n];
        padfTotal[n + 2] = dfTotal + df2;
        padfTotal[n + 3] = dfTotal + df3;
        dfTotal = dfTotal + df4;
        padfTotal[n + 4] = dfTotal;
    }
    for (; n < nCount; ++n) {
        dfTotal += padfSum[n];
        padfTotal[n + 1] = dfTotal;
    }
}

// Means, where the one row of oRows holds the sums from the left.
VETRA_STAGE void SumValues(const RowWindows& oRows, double* padfValue) {
    const WindowSize& oSize = *static_cast<const WindowSize*>(oRows.pParameters);
    const Divisor oCount = MakeDivisor(std::int64_t{oSize.nCols} * oSize.nRows);
    const double* padfTotal = oRows.papdfRow[0];
    ForEachRowGroup(oRows, [&](int i, const auto& oWindow) {
        const F64 sum = oWindow.Pick(padfTotal, oSize.nCols) - oWindow.Pick(padfTotal, 0);
        Store(padfValue + i, DivideBy(sum, oCount));
    });
}
