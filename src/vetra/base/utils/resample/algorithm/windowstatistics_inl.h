// Mean and median of a window of any size. Included inside a level's namespace; see
// engine/stages_inl.h. Samples are visited row by row, each from left to right.

struct Average {
    static constexpr int kSize = kAnySize;

    template <typename Window>
    static F64 Value(const Window& oWindow, F64, F64) {
        const WindowSize& oSize = oWindow.template Get<WindowSize>();
        F64 sum = Set1(0.0);
        for (int k = 0; k < oSize.nRows; ++k) {
            for (int j = 0; j < oSize.nCols; ++j) {
                sum = sum + oWindow.Sample(k, j);
            }
        }
        return sum / Set1(static_cast<double>(std::int64_t{oSize.nCols} * oSize.nRows));
    }
};

// The element of rank nRank, counted from 0: Hoare's FIND (Communications of the ACM 4, 1961,
// algorithm 65), which reorders the array. With NaN among the elements, which compare as neither
// less nor greater, it ends all the same, and which element comes out is part of the result.
inline double SelectRank(double* padf, std::int64_t nCount, std::int64_t nRank) {
    std::int64_t nLeft = 0;
    std::int64_t nRight = nCount - 1;
    while (nLeft < nRight) {
        const double dfPivot = padf[nRank];
        std::int64_t i = nLeft;
        std::int64_t j = nRight;
        do {
            while (dfPivot > padf[i]) {
                ++i;
            }
            while (padf[j] > dfPivot) {
                --j;
            }
            if (i <= j) {
                const double df = padf[i];
                padf[i++] = padf[j];
                padf[j--] = df;
            }
        } while (i <= j);
        if (j < nRank) {
            nLeft = i;
        }
        if (nRank < i) {
            nRight = j;
        }
    }
    return padf[nRank];
}

struct Median {
    static constexpr int kSize = kAnySize;

    // Of an even number of samples the lower one of the two in the middle.
    template <typename Window>
    static F64 Value(const Window& oWindow, F64, F64) {
        const WindowSize& oSize = oWindow.template Get<WindowSize>();
        const std::int64_t nCount = std::int64_t{oSize.nCols} * oSize.nRows;
        // One array for each of the eight pixels.
        double* padfScratch = oWindow.Scratch();
        double* padfNext = padfScratch;
        for (int k = 0; k < oSize.nRows; ++k) {
            for (int j = 0; j < oSize.nCols; ++j, ++padfNext) {
                double adf[kLanes];
                Store(adf, oWindow.Sample(k, j));
                for (int i = 0; i < kLanes; ++i) {
                    padfNext[i * nCount] = adf[i];
                }
            }
        }
        double adfMedian[kLanes];
        for (int i = 0; i < kLanes; ++i) {
            adfMedian[i] = SelectRank(padfScratch + i * nCount, nCount, (nCount - 1) / 2);
        }
        return Load(adfMedian);
    }
};
