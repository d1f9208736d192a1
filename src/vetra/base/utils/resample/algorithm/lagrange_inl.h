// Lagrange interpolation through equally spaced samples, along the columns and then along the rows.
// Filters of separable methods; see separable_inl.h. Included inside a level's namespace.
//
// At a fraction of exactly 0 the value is the sample there, without arithmetic.

// Degree 3, through nodes 0 to 3; t is measured from node 1.
struct Lagrange4Filter {
    static constexpr int kTaps = 4;
    static constexpr bool kTabulated = false;

    explicit Lagrange4Filter(const FilterInput& oInput)
        : onNode(oInput.frac == Set1(0.0)),
          d0(oInput.frac + Set1(1.0)),
          d1(d0 - Set1(1.0)),
          d2(d0 - Set1(2.0)),
          d3(d0 - Set1(3.0)) {}

    template <typename Samples>
    F64 Value(const Samples& fnSample) const {
        const F64 p[kTaps] = {fnSample(0), fnSample(1), fnSample(2), fnSample(3)};
        const F64 half = Set1(0.5);
        const F64 six = Set1(6.0);
        const F64 value = p[1] * d0 * d2 * d3 * half - d1 * p[0] * d2 * d3 / six -
                          p[2] * d0 * d1 * d3 * half + p[3] * d0 * d1 * d2 / six;
        return Select(onNode, p[1], value);
    }

    B64 onNode;
    F64 d0, d1, d2, d3;
};

// Degree 7, through nodes 0 to 7; t is measured from node 3.
struct Lagrange8Filter {
    static constexpr int kTaps = 8;
    static constexpr bool kTabulated = false;

    explicit Lagrange8Filter(const FilterInput& oInput) : onNode(oInput.frac == Set1(0.0)) {
        const F64 u = oInput.frac + Set1(3.0);
        for (int k = 0; k < kTaps; ++k) {
            // The product of the distances to the other nodes, in ascending order.
            const int nFirst = k == 0 ? 1 : 0;
            product[k] = u - Set1(nFirst);
            for (int j = nFirst + 1; j < kTaps; ++j) {
                if (j != k) {
                    product[k] = product[k] * (u - Set1(j));
                }
            }
        }
    }

    template <typename Samples>
    F64 Value(const Samples& fnSample) const {
        constexpr double kadfDivisor[kTaps] = {5040, 720, 240, 144, 144, 240, 720, 5040};
        F64 term[kTaps];
        F64 node;
        for (int k = 0; k < kTaps; ++k) {
            const F64 p = fnSample(k);
            term[k] = p * product[k] / Set1(kadfDivisor[k]);
            node = k == 3 ? p : node;
        }
        const F64 value =
            term[1] - term[0] - term[2] + term[3] - term[4] + term[5] - term[6] + term[7];
        return Select(onNode, node, value);
    }

    B64 onNode;
    F64 product[kTaps];
};
