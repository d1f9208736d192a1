// Separable windows with tabulated weights, along the columns and then along the rows: windowed
// sinc, Gaussian and user kernels, and the radar filter. Included inside a level's namespace; see
// engine/stages_inl.h.
//
// Sums start at 0 and run from the first tap to the last, in double.

// The tabulated phase nearest to a fraction. Pixels without a window may have any fraction, NaN
// included: they too get a phase that exists.
inline F64 Phase(F64 frac, int nSubPixels, int nLast) {
    const F64 phase = Floor(frac * Set1(nSubPixels) + Set1(0.5));
    const F64 atLeast = Select(phase > Set1(0.0), phase, Set1(0.0));
    const F64 last = Set1(nLast);
    return Select(atLeast < last, atLeast, last);
}

// The weights of eight pixels, each of its own phase.
template <int kTaps>
class Weights {
 public:
    Weights(const double* padfTable, int nTaps, F64 phase) : mpadfTable(padfTable) {
        StoreIntegers(manFirst, phase);
        for (int i = 0; i < kLanes; ++i) {
            manFirst[i] *= nTaps;
        }
        if constexpr (kTaps != kAnySize) {
            for (int j = 0; j < kTaps; ++j) {
                maTap[j] = Gather(padfTable + j, manFirst);
            }
        }
    }

    F64 Tap(int j) const {
        if constexpr (kTaps != kAnySize) {
            return maTap[j];
        } else {
            return Gather(mpadfTable + j, manFirst);
        }
    }

 private:
    const double* mpadfTable;
    std::int64_t manFirst[kLanes];
    F64 maTap[kTaps == kAnySize ? 1 : kTaps];
};

// The weighted sum of a window's row.
template <int kTaps, typename Window>
inline F64 RowSum(const Window& oWindow, int nRow, const Weights<kTaps>& oAcross, int nCols) {
    F64 sum = Set1(0.0);
    if constexpr (kTaps != kAnySize) {
        F64 p[kTaps];
        oWindow.Row(nRow, p);
        for (int j = 0; j < kTaps; ++j) {
            sum = sum + p[j] * oAcross.Tap(j);
        }
    } else {
        for (int j = 0; j < nCols; ++j) {
            sum = sum + oWindow.Sample(nRow, j) * oAcross.Tap(j);
        }
    }
    return sum;
}

// Windows of kTaps x kTaps pixels, or of the size that the tables have.
template <int kTaps>
struct Kernel {
    static constexpr int kSize = kTaps;

    template <typename Window>
    static F64 Value(const Window& oWindow, F64 dx, F64 dy) {
        const KernelTables& oTables = oWindow.template Get<KernelTables>();
        const int nCols = kTaps != kAnySize ? kTaps : oTables.nCols;
        const int nRows = kTaps != kAnySize ? kTaps : oTables.nRows;
        const int nPhases = oTables.nSubPixels;
        const Weights<kTaps> oAcross(oTables.padfAcross, nCols, Phase(dx, nPhases, nPhases));
        const Weights<kTaps> oDown(oTables.padfDown, nRows, Phase(dy, nPhases, nPhases));
        F64 sum = Set1(0.0);
        for (int k = 0; k < nRows; ++k) {
            sum = sum + RowSum(oWindow, k, oAcross, nCols) * oDown.Tap(k);
        }
        return sum;
    }
};

// Complex samples: real weights across, complex ones down.
struct CplxSar {
    template <typename Window>
    static void Value(const Window& oWindow, F64 dx, F64 dy, F64& re, F64& im) {
        const ComplexKernelTables& oTables = oWindow.template Get<ComplexKernelTables>();
        const int nPhases = oTables.nPhases;
        const F64 half = Set1(0.5);
        const F64 across = Phase(dx + half, nPhases, nPhases - 1);
        const F64 down = Phase(dy + half, nPhases, nPhases - 1);
        const Weights<kAnySize> oAcross(oTables.padfAcross, oTables.nCols, across);
        const Weights<kAnySize> oDownReal(oTables.padfDownReal, oTables.nRows, down);
        const Weights<kAnySize> oDownImag(oTables.padfDownImag, oTables.nRows, down);
        re = Set1(0.0);
        im = Set1(0.0);
        for (int k = 0; k < oTables.nRows; ++k) {
            F64 rowRe = Set1(0.0);
            F64 rowIm = Set1(0.0);
            for (int j = 0; j < oTables.nCols; ++j) {
                F64 sampleRe;
                F64 sampleIm;
                oWindow.ChannelPair(k, j, sampleRe, sampleIm);
                const F64 weight = oAcross.Tap(j);
                rowRe = rowRe + sampleRe * weight;
                rowIm = rowIm + sampleIm * weight;
            }
            const F64 c = oDownReal.Tap(k);
            const F64 d = oDownImag.Tap(k);
            re = re + (c * rowRe - d * rowIm);
            im = im + (d * rowRe + c * rowIm);
        }
    }
};
