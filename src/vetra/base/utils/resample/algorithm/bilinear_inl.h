// Bilinear interpolation. Included inside a level's namespace; see engine/stages_inl.h.

struct Bilinear {
    static constexpr int kSize = 2;

    template <typename Window>
    static F64 Value(const Window& oWindow, F64 dx, F64 dy) {
        const Weights w(dx, dy);
        F64 upper[2];
        F64 lower[2];
        oWindow.Row(0, upper);
        oWindow.Row(1, lower);
        return w.Blend(upper[0], upper[1], lower[0], lower[1]);
    }

    // Of all channels at once, kNumChan of them.
    template <int kNumChan, typename Window>
    static void Values(const Window& oWindow, F64 dx, F64 dy, F64 (&value)[kNumChan]) {
        const Weights w(dx, dy);
        F64 upper[2 * kNumChan];
        F64 lower[2 * kNumChan];
        oWindow.PixelPair(0, upper);
        oWindow.PixelPair(1, lower);
        for (int c = 0; c < kNumChan; ++c) {
            value[c] = w.Blend(upper[c], upper[kNumChan + c], lower[c], lower[kNumChan + c]);
        }
    }

 private:
    struct Weights {
        Weights(F64 dx, F64 dy)
            : w00((Set1(1.0) - dx) * (Set1(1.0) - dy)),
              w10((Set1(1.0) - dy) * dx),
              w01((Set1(1.0) - dx) * dy),
              w11(dy * dx) {}

        // The value between the four samples around a position. The products are added in this
        // order, which is part of the result.
        F64 Blend(F64 p00, F64 p10, F64 p01, F64 p11) const {
            return p10 * w10 + p00 * w00 + p01 * w01 + p11 * w11;
        }

        F64 w00, w10, w01, w11;
    };
};
