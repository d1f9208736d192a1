// Tabulated weights: windowed sinc, Gaussian and user kernels, and the radar filter. Included
// inside a level's namespace; see engine/stages_inl.h.
//
// Sums start at 0 and run from the first tap to the last, in double.

// The weighted sum of kNumTaps samples, or of as many as the tables say.
template <int kNumTaps>
struct KernelFilter {
    static constexpr int kTaps = kNumTaps;
    static constexpr bool kTabulated = true;

    explicit KernelFilter(const FilterInput& oInput)
        : padfTaps(oInput.padfTaps), nTaps(kTaps == kAnySize ? oInput.nTaps : kTaps) {}

    template <typename Samples>
    F64 Value(const Samples& fnSample) const {
        F64 sum = Set1(0.0);
        for (int j = 0; j < nTaps; ++j) {
            sum = sum + fnSample(j) * Load(padfTaps + j * kLanes);
        }
        return sum;
    }

    // Of a whole row of a window.
    template <typename Window>
    F64 RowValue(const Window& oWindow, int nRow) const {
        F64 sum = Set1(0.0);
        int j = 0;
        for (; j + 4 <= nTaps; j += 4) {
            F64 p[4];
            oWindow.Quad(nRow, j, p);
            for (int i = 0; i < 4; ++i) {
                sum = sum + p[i] * Load(padfTaps + (j + i) * kLanes);
            }
        }
        for (; j < nTaps; ++j) {
            sum = sum + oWindow.Sample(nRow, j) * Load(padfTaps + j * kLanes);
        }
        return sum;
    }

    const double* padfTaps;
    int nTaps;
};

// Complex samples: real weights across, complex ones down.
struct CplxSar {
    template <typename Window>
    static void Value(const Window& oWindow, F64 dx, F64 dy, F64& re, F64& im) {
        const ComplexKernelTables& oTables = oWindow.template Get<ComplexKernelTables>();
        const int nPhases = oTables.nPhases;
        const F64 half = Set1(0.5);
        const F64 down = Phase(dy + half, nPhases, nPhases - 1);
        double* padfAcross = oWindow.Scratch();
        double* padfReal = padfAcross + oTables.nCols * kLanes;
        double* padfImag = padfReal + oTables.nRows * kLanes;
        GatherTaps(oTables.padfAcross, oTables.nCols, Phase(dx + half, nPhases, nPhases - 1),
                   padfAcross);
        GatherTaps(oTables.padfDownReal, oTables.nRows, down, padfReal);
        GatherTaps(oTables.padfDownImag, oTables.nRows, down, padfImag);
        re = Set1(0.0);
        im = Set1(0.0);
        for (int k = 0; k < oTables.nRows; ++k) {
            F64 rowRe = Set1(0.0);
            F64 rowIm = Set1(0.0);
            for (int j = 0; j < oTables.nCols; ++j) {
                F64 sampleRe;
                F64 sampleIm;
                oWindow.ChannelPair(k, j, sampleRe, sampleIm);
                const F64 weight = Load(padfAcross + j * kLanes);
                rowRe = rowRe + sampleRe * weight;
                rowIm = rowIm + sampleIm * weight;
            }
            const F64 c = Load(padfReal + k * kLanes);
            const F64 d = Load(padfImag + k * kLanes);
            re = re + (c * rowRe - d * rowIm);
            im = im + (d * rowRe + c * rowIm);
        }
    }
};
