// Cubic convolution with free parameter -1. Included inside a level's namespace; see
// engine/stages_inl.h.

// The value at fraction t from p1 towards p2.
inline F64 CubicKernel(const F64 (&p)[4], F64 t) {
    const F64 a = p[0] + p[0] - p[1] - p[1] + p[2] - p[3];
    const F64 b = p[1] - p[0] - p[2] + p[3];
    const F64 c = p[2] - p[0];
    return ((a + b * t) * t + c) * t + p[1];
}

struct Cubic {
    static constexpr int kSize = 4;

    template <typename Window>
    static F64 Value(const Window& oWindow, F64 dx, F64 dy) {
        F64 rows[kSize];
        for (int k = 0; k < kSize; ++k) {
            F64 p[kSize];
            oWindow.Row(k, p);
            rows[k] = CubicKernel(p, dx);
        }
        return CubicKernel(rows, dy);
    }
};

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
        F64 rows[kSize];
        for (int k = 0; k < kSize; ++k) {
            F64 mask[kSize];
            oWindow.MaskRow(k, mask);
            for (int j = 0; j < kSize; ++j) {
                p[k][j] = Select(mask[j] == Set1(0.0), nearest, p[k][j]);
            }
            rows[k] = CubicKernel(p[k], dx);
        }
        return CubicKernel(rows, dy);
    }
};
