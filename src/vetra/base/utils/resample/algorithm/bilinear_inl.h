// Bilinear interpolation. Included inside a level's namespace; see engine/stages_inl.h.

struct Bilinear {
    // The value between the four samples around a position. The products are added in this order,
    // which is part of the result.
    template <typename Window>
    static F64 Value(const Window& oWindow, F64 dx, F64 dy) {
        const F64 one = Set1(1.0);
        const F64 w00 = (one - dx) * (one - dy);
        const F64 w10 = (one - dy) * dx;
        const F64 w01 = (one - dx) * dy;
        const F64 w11 = dy * dx;
        F64 p00, p10, p01, p11;
        oWindow.Pair(0, p00, p10);
        oWindow.Pair(1, p01, p11);
        return p10 * w10 + p00 * w00 + p01 * w01 + p11 * w11;
    }
};
