// Methods that filter the rows of a window first, and then the row values. Included inside a
// level's namespace; see engine/stages_inl.h.
//
// A filter is the mathematics of one direction. It is made from a `FilterInput`, for eight
// positions at once, and `Value(fnSample)` makes values of fnSample(0), fnSample(1), ..., the
// samples of its taps. Both directions use the same filter, wherever the samples come from: here
// from windows, in axis-aligned runs from whole rows (engine/rows_inl.h).

template <typename Filter>
struct Separable {
    static constexpr int kSize = Filter::kTaps;

    template <typename Window>
    static F64 Value(const Window& oWindow, F64 dx, F64 dy) {
        const Filter oAcross(oWindow.template ColumnInput<Filter>(dx));
        const Filter oDown(oWindow.template RowInput<Filter>(dy));
        return oDown.Value([&](int k) {
            if constexpr (kSize == kAnySize) {
                return oAcross.RowValue(oWindow, k);
            } else {
                F64 p[kSize];
                oWindow.Row(k, p);
                return oAcross.Value([&](int j) { return p[j]; });
            }
        });
    }
};
