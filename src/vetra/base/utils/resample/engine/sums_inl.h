// Window means of integer samples in axis-aligned runs. Included inside a level's namespace; see
// stages_inl.h.
//
// Sums of integers are exact in double whatever their order, so they may be kept running: of each
// source column over the rows of a window, and over the columns from the left.

// What a row or two change in the sums of columns.
template <typename T, bool kAdd, bool kSubtract>
inline void ChangeSums(const T* pAdd, const T* pSubtract, int nChan, std::int64_t nCount,
                       double* padfSum) {
    const ChannelReader oReader(nChan);
    std::int64_t n = 0;
    for (; n + kLanes <= nCount; n += kLanes) {
        F64 sum = Load(padfSum + n);
        sum = kAdd ? sum + oReader.Read(pAdd + n * nChan) : sum;
        sum = kSubtract ? sum - oReader.Read(pSubtract + n * nChan) : sum;
        Store(padfSum + n, sum);
    }
    for (; n < nCount; ++n) {
        padfSum[n] += kAdd ? static_cast<double>(pAdd[n * nChan]) : 0.0;
        padfSum[n] -= kSubtract ? static_cast<double>(pSubtract[n * nChan]) : 0.0;
    }
}

// Adds a stretch of one channel of a source row to the sums of its columns, takes one away, or
// both.
template <typename T>
VETRA_STAGE void AddRow(const void* pAdd, const void* pSubtract, int nChan, std::int64_t nCount,
                        double* padfSum) {
    const T* p = static_cast<const T*>(pAdd);
    const T* q = static_cast<const T*>(pSubtract);
    if (q == nullptr) {
        ChangeSums<T, true, false>(p, q, nChan, nCount, padfSum);
    } else if (p == nullptr) {
        ChangeSums<T, false, true>(p, q, nChan, nCount, padfSum);
    } else {
        ChangeSums<T, true, true>(p, q, nChan, nCount, padfSum);
    }
}

// Sums from the left: padfTotal[n] is that of the first n columns.
VETRA_STAGE void AddUp(const double* padfSum, std::int64_t nCount, double* padfTotal) {
    padfTotal[0] = 0.0;
    F64 total = Set1(0.0);
    std::int64_t n = 0;
    for (; n + kLanes <= nCount; n += kLanes) {
        const F64 sums = RunningSums(Load(padfSum + n));
        Store(padfTotal + n + 1, total + sums);
        total = total + LastLane(sums);
    }
    for (; n < nCount; ++n) {
        padfTotal[n + 1] = padfTotal[n] + padfSum[n];
    }
}

// Means, where the one row of oRows holds the sums of columns.
VETRA_STAGE void SumValues(const RowWindows& oRows, double* padfValue) {
    const WindowSize& oSize = *static_cast<const WindowSize*>(oRows.pParameters);
    const Divisor oCount = MakeDivisor(std::int64_t{oSize.nCols} * oSize.nRows);
    const int nCols = oSize.nCols;
    const double* padfSum = oRows.papdfRow[0];
    ForEachRowGroup(oRows, [&](int i, const auto& oWindow) {
        F64 sum = oWindow.Pick(padfSum, 0);
        for (int j = 1; j < nCols; ++j) {
            sum = sum + oWindow.Pick(padfSum, j);
        }
        Store(padfValue + i, DivideBy(sum, oCount));
    });
}

// The same where it holds the sums from the left.
VETRA_STAGE void TotalValues(const RowWindows& oRows, double* padfValue) {
    const WindowSize& oSize = *static_cast<const WindowSize*>(oRows.pParameters);
    const Divisor oCount = MakeDivisor(std::int64_t{oSize.nCols} * oSize.nRows);
    const double* padfTotal = oRows.papdfRow[0];
    ForEachRowGroup(oRows, [&](int i, const auto& oWindow) {
        const F64 sum = oWindow.Pick(padfTotal, oSize.nCols) - oWindow.Pick(padfTotal, 0);
        Store(padfValue + i, DivideBy(sum, oCount));
    });
}
