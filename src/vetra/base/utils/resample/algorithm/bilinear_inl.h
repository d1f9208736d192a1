// Bilinear interpolation. Included inside a level's namespace; see engine/stages_inl.h.

struct Bilinear {
    static constexpr int kSize = 2;

    // The value between the four samples around a position. The products are added in this order,
    // which is part of the result.
    template <typename Window>
    static F64 Value(const Window& oWindow, F64 dx, F64 dy) {
        const F64 one = Set1(1.0);
        const F64 w00 = (one - dx) * (one - dy);
        const F64 w10 = (one - dy) * dx;
        const F64 w01 = (one - dx) * dy;
        const F64 w11 = dy * dx;
        F64 upper[2];
        F64 lower[2];
        oWindow.Row(0, upper);
        oWindow.Row(1, lower);
        return upper[1] * w10 + upper[0] * w00 + lower[0] * w01 + lower[1] * w11;
    }
};
