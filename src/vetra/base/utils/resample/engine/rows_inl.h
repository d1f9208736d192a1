// The values stage of axis-aligned runs: source rows become doubles once, and separable methods
// filter each of them along the columns once, for all the target rows that need it. Included inside
// a level's namespace; see stages_inl.h.

// Samples of one channel, eight pixels at a time.
class ChannelReader {
 public:
    explicit ChannelReader(int nChan) : mnChan(nChan) {
        for (int i = 0; i < kLanes; ++i) {
            manOffset[i] = static_cast<std::int64_t>(i) * nChan;
        }
    }

    template <typename T>
    F64 Read(const T* p) const {
        if (mnChan == 1) {
            return LoadSamples(p);
        }
        if constexpr (sizeof(T) == 1) {
            if (mnChan == 3) {
                return LoadEvery<3>(p);
            }
            if (mnChan == 4) {
                return LoadEvery<4>(p);
            }
        }
        return Gather(p, manOffset);
    }

    // Their roots.
    template <typename T>
    F64 ReadRoots(const T* p) const {
        if constexpr (kHasRootTable<T>) {
            if (mnChan == 1) {
                return PickRoots([&](int i) { return p[i]; });
            }
            return PickRoots([&](int i) { return p[manOffset[i]]; });
        } else {
            return Root(Read(p));
        }
    }

 private:
    int mnChan;
    std::int64_t manOffset[kLanes];
};

// A stretch of one channel of a source row as doubles, as their roots, or as the squares of those.
enum class Widened { eSamples, eRoots, eSquaredRoots };
template <typename T, Widened eWidened>
VETRA_STAGE void Widen(const void* pSrc, int nChan, std::int64_t nCount, double* padf) {
    const T* p = static_cast<const T*>(pSrc);
    const auto fnWidened = [](const ChannelReader& oReader, const T* q) {
        if constexpr (eWidened == Widened::eSamples) {
            return oReader.Read(q);
        } else {
            const F64 root = oReader.ReadRoots(q);
            return eWidened == Widened::eSquaredRoots ? root * root : root;
        }
    };
    const ChannelReader oChannel(nChan);
    std::int64_t n = 0;
    for (; n + kLanes <= nCount; n += kLanes, p += static_cast<std::int64_t>(nChan) * kLanes) {
        Store(padf + n, fnWidened(oChannel, p));
    }
    if (n < nCount) {
        T aRest[kLanes] = {};
        for (int i = 0; n + i < nCount; ++i) {
            aRest[i] = p[static_cast<std::int64_t>(i) * nChan];
        }
        double adf[kLanes];
        Store(adf, fnWidened(ChannelReader(1), aRest));
        for (int i = 0; n + i < nCount; ++i) {
            padf[n + i] = adf[i];
        }
    }
}

// Calls fnGroup with the first pixel of each group and a reader of its windows.
template <typename Function>
inline void ForEachRowGroup(const RowWindows& oRows, const Function& fnGroup) {
    for (int i = 0; i < oRows.nPix; i += kLanes) {
        const PickGroup& oGroup = oRows.poGroups[i / kLanes];
        switch (oGroup.eKind) {
            case PickGroup::eInARow:
                fnGroup(i, RowReader<PickGroup::eInARow>{oRows, oGroup});
                break;
            case PickGroup::eNear:
                fnGroup(i, RowReader<PickGroup::eNear>{oRows, oGroup});
                break;
            default:
                fnGroup(i, RowReader<PickGroup::eAny>{oRows, oGroup});
                break;
        }
    }
}

// Taps of each group's columns, nCols x kLanes of them.
VETRA_STAGE void ColumnTaps(const void* pParameters, const double* padfFracCol, int nPix,
                            double* padfTaps) {
    const KernelTables& oTables = *static_cast<const KernelTables*>(pParameters);
    for (int i = 0; i < nPix; i += kLanes) {
        GatherAcrossTaps(oTables, Load(padfFracCol + i), padfTaps);
        padfTaps += oTables.nCols * kLanes;
    }
}

// One row, filtered along the columns.
template <typename Filter>
VETRA_STAGE void Across(const RowWindows& oRows, const double* padfRow, double* padfFiltered) {
    int nTaps = Filter::kTaps;
    if constexpr (Filter::kTabulated) {
        nTaps = static_cast<const KernelTables*>(oRows.pParameters)->nCols;
    }
    ForEachRowGroup(oRows, [&](int i, const auto& oWindow) {
        FilterInput oInput{Load(oRows.padfFracCol + i), nullptr, nTaps, oRows.bMayBeTiny};
        if constexpr (Filter::kTabulated) {
            oInput.padfTaps = oRows.padfColumnTaps + std::int64_t{i} * nTaps;
        }
        const Filter oAcross(oInput);
        Store(padfFiltered + i, oAcross.Value([&](int j) { return oWindow.Pick(padfRow, j); }));
    });
}

template <bool kSquared>
inline void StoreRowValue(double* p, F64 value) {
    Store(p, WithOneNaN(kSquared ? value * value : value));
}

// Values from filtered rows.
template <typename Filter, bool kSquared>
VETRA_STAGE void Down(const RowWindows& oRows, double* padfValue) {
    const F64 dy = Set1(oRows.dfFracRow);
    FilterInput oInput{dy, oRows.padfScratch, Filter::kTaps, oRows.bMayBeTiny};
    if constexpr (Filter::kTabulated) {
        const KernelTables& oTables = *static_cast<const KernelTables*>(oRows.pParameters);
        GatherDownTaps(oTables, dy, oRows.padfScratch);
        oInput.nTaps = oTables.nRows;
    }
    // A copy that no store can reach stays in registers.
    double adfTaps[Filter::kTabulated && Filter::kTaps != kAnySize ? Filter::kTaps * kLanes : 1];
    if constexpr (sizeof adfTaps > sizeof(double)) {
        __builtin_memcpy(adfTaps, oRows.padfScratch, sizeof adfTaps);
        oInput.padfTaps = adfTaps;
    }
    const Filter oDown(oInput);
    for (int i = 0; i < oRows.nPix; i += kLanes) {
        StoreRowValue<kSquared>(padfValue + i, oDown.Value([&](int k) {
            return Load(oRows.papdfRow[k] + oRows.nFirst + i);
        }));
    }
}

// Values of a method that isn't separable, from whole rows.
template <typename Method, bool kSquared>
VETRA_STAGE void RowValues(const RowWindows& oRows, double* padfValue) {
    const F64 dy = Set1(oRows.dfFracRow);
    ForEachRowGroup(oRows, [&](int i, const auto& oWindow) {
        StoreRowValue<kSquared>(padfValue + i,
                                Method::Value(oWindow, Load(oRows.padfFracCol + i), dy));
    });
}

template <typename Method>
struct RowStagesOf {
    static constexpr RowStages kStages{nullptr, &RowValues<Method, false>, &RowValues<Method, true>,
                                       false};
};
template <typename Filter>
struct RowStagesOf<Separable<Filter>> {
    static constexpr RowStages kStages{&Across<Filter>, &Down<Filter, false>, &Down<Filter, true>,
                                       Filter::kTabulated};
};
// Its replaced samples are another pixel's own: no row holds them.
template <>
struct RowStagesOf<CubicPs> {
    static constexpr RowStages kStages{};
};
