// How a method sees the windows of eight pixels, each in a lane. Included inside a level's
// namespace; see stages_inl.h.
//
// A window offers
//   Row(k, p)             the first samples of row k, as many as p has elements, an even number
//   Quad(k, j, p)         the samples of row k, columns j to j + 3
//   Sample(k, j)          the sample of row k, column j
//   PixelPair(k, p)       of all channels, three or four, the first two pixels of row k
//   Get<Parameters>()     what the method prepared for the run
//   Scratch()             the thread's working memory, as the method asked for
//   ColumnInput<Filter>(dx) RowInput<Filter>(dy)   what a filter is made from
//   HasMask() MaskRow(k, p)   source mask bytes, as Row

// Whether samples of this type can make a NaN.
template <typename T>
inline constexpr bool kIsFloating = T(0.5) != T(0);
// Whether they, or their products with weights, can be nearly 0 without being 0.
template <typename T>
inline constexpr bool kMayBeTiny = kIsFloating<T> && sizeof(T) == sizeof(double);

// The size of a method's windows where each run has its own.
constexpr int kAnySize = 0;

// Of one direction of eight windows, what a filter is made from.
struct FilterInput {
    F64 frac;
    // For a filter with tabulated weights: kLanes of them for each tap.
    const double* padfTaps;
    int nTaps;
    // The samples are doubles: products may overflow, or be so small that they lose digits or that
    // DivideBy can't divide them.
    bool bMayBeTiny;
};

// The tabulated phase nearest to a fraction. Pixels without a window may have any fraction, NaN
// included: they too get a phase that exists.
inline F64 Phase(F64 frac, int nSubPixels, int nLast) {
    const F64 phase = Floor(frac * Set1(nSubPixels) + Set1(0.5));
    const F64 atLeast = Select(phase > Set1(0.0), phase, Set1(0.0));
    const F64 last = Set1(nLast);
    return Select(atLeast < last, atLeast, last);
}

// The taps of eight phases from a table that holds them phase by phase.
inline void GatherTaps(const double* padfTable, int nTaps, F64 phase, double* padfTaps) {
    std::int64_t anFirst[kLanes];
    StoreIntegers(anFirst, phase);
    for (int i = 0; i < kLanes; ++i) {
        anFirst[i] *= nTaps;
    }
    int j = 0;
    for (; j + 4 <= nTaps; j += 4) {
        F64 tap[4];
        GatherQuad(padfTable + j, anFirst, tap);
        for (int k = 0; k < 4; ++k) {
            Store(padfTaps + (j + k) * kLanes, tap[k]);
        }
    }
    for (; j < nTaps; ++j) {
        Store(padfTaps + j * kLanes, Gather(padfTable + j, anFirst));
    }
}

inline void GatherAcrossTaps(const KernelTables& oTables, F64 fracCol, double* padfTaps) {
    const int nSubPixels = oTables.nSubPixels;
    GatherTaps(oTables.padfAcross, oTables.nCols, Phase(fracCol, nSubPixels, nSubPixels), padfTaps);
}
inline void GatherDownTaps(const KernelTables& oTables, F64 fracRow, double* padfTaps) {
    const int nSubPixels = oTables.nSubPixels;
    GatherTaps(oTables.padfDown, oTables.nRows, Phase(fracRow, nSubPixels, nSubPixels), padfTaps);
}

// Windows of source samples, for one channel.
template <typename T, bool kSingleChannel>
struct WindowReader {
    using SampleType = T;
    // Whether the pixels of a row are adjacent samples.
    static constexpr bool kAdjacent = kSingleChannel;

    const T* pFirst;
    const std::int64_t* panOffset;
    const WindowSpan& oSpan;

    template <int N>
    void Row(int nRow, F64 (&p)[N]) const {
        int j = 0;
        for (; j + 4 <= N; j += 4) {
            Quad(nRow, j, reinterpret_cast<F64(&)[4]>(p[j]));
        }
        for (; j < N; j += 2) {
            if constexpr (kSingleChannel) {
                GatherPair(At(nRow, j), panOffset, p[j], p[j + 1]);
            } else {
                const T* q = At(nRow, j);
                p[j] = Gather(q, panOffset);
                p[j + 1] = Gather(q + oSpan.nChan, panOffset);
            }
        }
    }

    void Quad(int nRow, int nCol, F64 (&p)[4]) const {
        if constexpr (kSingleChannel) {
            GatherQuad(At(nRow, nCol), panOffset, p);
        } else {
            for (int j = 0; j < 4; ++j) {
                p[j] = Sample(nRow, nCol + j);
            }
        }
    }

    // The samples of the first two pixels of a row, of three or four channels.
    template <int N>
    void PixelPair(int nRow, F64 (&p)[N]) const {
        static_assert(N == 6 || N == 8);
        // The second four begin where they end with the pixel.
        F64 first[4];
        F64 second[4];
        GatherQuad(At(nRow, 0), panOffset, first);
        GatherQuad(At(nRow, 0) + (N - 4), panOffset, second);
        for (int j = 0; j < N; ++j) {
            p[j] = j < 4 ? first[j] : second[j - (N - 4)];
        }
    }

    F64 Sample(int nRow, int nCol) const { return Gather(At(nRow, nCol), panOffset); }
    // The sample of one lane.
    T LaneSample(int nRow, int nCol, int i) const { return At(nRow, nCol)[panOffset[i]]; }

    // That sample and the one of the next channel.
    void ChannelPair(int nRow, int nCol, F64& first, F64& second) const {
        GatherPair(At(nRow, nCol), panOffset, first, second);
    }

    const T* At(int nRow, int nCol) const {
        return pFirst + nRow * oSpan.nPitch + static_cast<std::int64_t>(nCol) * oSpan.nChan;
    }

    template <typename Parameters>
    const Parameters& Get() const {
        return *static_cast<const Parameters*>(oSpan.pParameters);
    }
    double* Scratch() const { return oSpan.padfScratch; }

    template <typename Filter>
    FilterInput ColumnInput(F64 dx) const {
        if constexpr (Filter::kTabulated) {
            const KernelTables& oTables = Get<KernelTables>();
            GatherAcrossTaps(oTables, dx, Scratch());
            return {dx, Scratch(), oTables.nCols, kMayBeTiny<T>};
        } else {
            return {dx, nullptr, Filter::kTaps, kMayBeTiny<T>};
        }
    }
    template <typename Filter>
    FilterInput RowInput(F64 dy) const {
        if constexpr (Filter::kTabulated) {
            const KernelTables& oTables = Get<KernelTables>();
            // Behind those of the columns.
            double* padfTaps = Scratch() + oTables.nCols * kLanes;
            GatherDownTaps(oTables, dy, padfTaps);
            return {dy, padfTaps, oTables.nRows, kMayBeTiny<T>};
        } else {
            return {dy, nullptr, Filter::kTaps, kMayBeTiny<T>};
        }
    }

    bool HasMask() const { return oSpan.pabyMask != nullptr; }

    // Of windows of four columns.
    void MaskRow(int nRow, F64 (&p)[4]) const {
        std::int64_t anPixel[kLanes];
        for (int i = 0; i < kLanes; ++i) {
            anPixel[i] = kSingleChannel ? panOffset[i] : panOffset[i] / oSpan.nChan;
        }
        GatherQuad(oSpan.pabyMask + nRow * (oSpan.nPitch / oSpan.nChan), anPixel, p);
    }
};

// The same where sixteen adjacent samples hold all pairs.
template <typename T>
struct GroupReader {
    using SampleType = T;

    const T* pFirst;
    const PairGroup* poGroup;
    std::int64_t nPitch;

    void Row(int nRow, F64 (&p)[2]) const {
        ShufflePairs(RowOf(nRow), poGroup->abyPlace, p[0], p[1]);
    }
    T LaneSample(int nRow, int nCol, int i) const {
        return RowOf(nRow)[poGroup->abyPlace[nCol * kLanes + i]];
    }

 private:
    const T* RowOf(int nRow) const { return pFirst + nRow * nPitch + poGroup->nOffset; }
};

// The square root of a sample that is greater than 0; 0 for every other one, NaN included.
inline F64 Root(F64 sample) {
    const F64 zero = Set1(0.0);
    return Select(sample > zero, Sqrt(sample), zero);
}

template <typename T>
inline constexpr bool kHasRootTable = sizeof(T) == 1;

// The roots of eight 8-bit samples: fnSample(0) to fnSample(7).
template <typename Function>
inline F64 PickRoots(const Function& fnSample) {
    const auto fnRoot = [&](int i) { return kByteRoots<decltype(fnSample(0))>[fnSample(i)]; };
    return Set(fnRoot(0), fnRoot(1), fnRoot(2), fnRoot(3), fnRoot(4), fnRoot(5), fnRoot(6),
               fnRoot(7));
}

// Four adjacent 8-bit samples at eight offsets, each four read at once.
template <typename T>
class ByteQuads {
 public:
    ByteQuads(const T* p, const std::int64_t* panOffset) {
        for (int i = 0; i < kLanes; ++i) {
            __builtin_memcpy(&manQuad[i], p + panOffset[i], sizeof manQuad[i]);
        }
    }
    // Sample j of lane i.
    T Get(int i, int j) const {
        constexpr bool kLittle = __BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__;
        return static_cast<T>(manQuad[i] >> 8 * (kLittle ? j : 3 - j));
    }

 private:
    std::uint32_t manQuad[kLanes];
};

// The same windows with the roots of their samples.
template <typename Window>
struct RootReader {
    static constexpr bool kTable = kHasRootTable<typename Window::SampleType>;

    const Window& oWindow;

    template <int N>
    void Row(int nRow, F64 (&p)[N]) const {
        if constexpr (kTable) {
            if constexpr (N % 4 == 0) {
                for (int j = 0; j < N; j += 4) {
                    Quad(nRow, j, reinterpret_cast<F64(&)[4]>(p[j]));
                }
            } else {
                for (int j = 0; j < N; ++j) {
                    p[j] = Sample(nRow, j);
                }
            }
        } else {
            oWindow.Row(nRow, p);
            TakeRoots(p);
        }
    }
    void Quad(int nRow, int nCol, F64 (&p)[4]) const {
        if constexpr (kTable && Window::kAdjacent) {
            const ByteQuads oQuads(oWindow.At(nRow, nCol), oWindow.panOffset);
            for (int j = 0; j < 4; ++j) {
                p[j] = PickRoots([&](int i) { return oQuads.Get(i, j); });
            }
        } else if constexpr (kTable) {
            for (int j = 0; j < 4; ++j) {
                p[j] = Sample(nRow, nCol + j);
            }
        } else {
            oWindow.Quad(nRow, nCol, p);
            TakeRoots(p);
        }
    }
    F64 Sample(int nRow, int nCol) const {
        if constexpr (kTable) {
            return PickRoots([&](int i) { return oWindow.LaneSample(nRow, nCol, i); });
        } else {
            return Root(oWindow.Sample(nRow, nCol));
        }
    }
    template <typename Parameters>
    const Parameters& Get() const {
        return oWindow.template Get<Parameters>();
    }
    double* Scratch() const { return oWindow.Scratch(); }
    template <typename Filter>
    FilterInput ColumnInput(F64 dx) const {
        return oWindow.template ColumnInput<Filter>(dx);
    }
    template <typename Filter>
    FilterInput RowInput(F64 dy) const {
        return oWindow.template RowInput<Filter>(dy);
    }
    bool HasMask() const { return oWindow.HasMask(); }
    void MaskRow(int nRow, F64 (&p)[4]) const { oWindow.MaskRow(nRow, p); }

 private:
    template <int N>
    static void TakeRoots(F64 (&p)[N]) {
        for (int j = 0; j < N; ++j) {
            p[j] = Root(p[j]);
        }
    }
};

// Windows of rows that are doubles already (and roots, if need be), which lie as a PickGroup says.
template <PickGroup::Kind eKind>
struct RowReader {
    const RowWindows& oRows;
    const PickGroup& oGroup;

    F64 Pick(const double* padfRow, int nCol) const {
        const double* p = padfRow + oGroup.nFirst;
        if constexpr (eKind == PickGroup::eInARow) {
            return Load(p + nCol);
        } else if constexpr (eKind == PickGroup::eNear) {
            // Four columns come from the same loads.
            const int nShift = nCol % kNearColumns;
            return GatherNear(p + (nCol - nShift), oGroup.anOffset, nShift);
        } else {
            return Gather(p + nCol, oGroup.anOffset);
        }
    }

    template <int N>
    void Row(int nRow, F64 (&p)[N]) const {
        for (int j = 0; j < N; ++j) {
            p[j] = Pick(oRows.papdfRow[nRow], j);
        }
    }
    void Quad(int nRow, int nCol, F64 (&p)[4]) const {
        for (int j = 0; j < 4; ++j) {
            p[j] = Pick(oRows.papdfRow[nRow], nCol + j);
        }
    }
    F64 Sample(int nRow, int nCol) const { return Pick(oRows.papdfRow[nRow], nCol); }
    template <typename Parameters>
    const Parameters& Get() const {
        return *static_cast<const Parameters*>(oRows.pParameters);
    }
    double* Scratch() const { return oRows.padfScratch; }
};
