// Cubic convolution with free parameter -1. Included inside a level's namespace; see
// engine/stages_inl.h.

// The value between the second and the third of four samples.
struct CubicFilter {
    static constexpr int kTaps = 4;
    static constexpr bool kTabulated = false;

    explicit CubicFilter(const FilterInput& oInput) : t(oInput.frac) {}

    template <typename Samples>
    F64 Value(const Samples& fnSample) const {
        const F64 p0 = fnSample(0);
        const F64 p1 = fnSample(1);
        const F64 p2 = fnSample(2);
        const F64 p3 = fnSample(3);
        const F64 a = p0 + p0 - p1 - p1 + p2 - p3;
        const F64 b = p1 - p0 - p2 + p3;
        const F64 c = p2 - p0;
        return ((a + b * t) * t + c) * t + p1;
    }

    F64 t;
};

using Cubic = Separable<CubicFilter>;

// The same with the nearest sample in the place of each masked one.
struct CubicPs {
    static constexpr int kSize = 4;

    template <typename Window>
    static F64 Value(const Window& oWindow, F64 dx, F64 dy) {
        if (!oWindow.HasMask()) {
            return Cubic::Value(oWindow, dx, dy);
        }
        F64 p[kSize][kSize];
        for (int k = 0; k < kSize; ++k) {
            oWindow.Row(k, p[k]);
        }
        // The nearest pixel is one of the middle four: a window's position is at least 1, where
        // floor(position + 0.5) turns exactly at a fraction of 0.5.
        const F64 half = Set1(0.5);
        const B64 right = half <= dx;
        const F64 nearest =
            Select(half <= dy, Select(right, p[2][2], p[2][1]), Select(right, p[1][2], p[1][1]));
        const CubicFilter oAcross(oWindow.template ColumnInput<CubicFilter>(dx));
        const CubicFilter oDown(oWindow.template RowInput<CubicFilter>(dy));
        return oDown.Value([&](int k) {
            F64 mask[kSize];
            oWindow.MaskRow(k, mask);
            return oAcross.Value(
                [&](int j) { return Select(mask[j] == Set1(0.0), nearest, p[k][j]); });
        });
    }
};
