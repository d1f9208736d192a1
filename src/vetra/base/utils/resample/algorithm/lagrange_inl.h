// Lagrange interpolation through equally spaced samples, along the columns and then along the rows.
// Included inside a level's namespace; see engine/stages_inl.h.
//
// At a fraction of exactly 0 the value is the sample there, without arithmetic.

// Degree 3, through nodes 0 to 3; t is measured from node 1.
struct LagrangeBasis4 {
    static constexpr int kSize = 4;

    explicit LagrangeBasis4(F64 t)
        : onNode(t == Set1(0.0)),
          d0(t + Set1(1.0)),
          d1(d0 - Set1(1.0)),
          d2(d0 - Set1(2.0)),
          d3(d0 - Set1(3.0)) {}

    F64 Value(const F64 (&p)[kSize]) const {
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
struct LagrangeBasis8 {
    static constexpr int kSize = 8;

    explicit LagrangeBasis8(F64 t) : onNode(t == Set1(0.0)) {
        const F64 u = t + Set1(3.0);
        for (int k = 0; k < kSize; ++k) {
            // The product of the distances to the other nodes, in ascending order.
            const int nFirst = k == 0 ? 1 : 0;
            product[k] = u - Set1(nFirst);
            for (int j = nFirst + 1; j < kSize; ++j) {
                if (j != k) {
                    product[k] = product[k] * (u - Set1(j));
                }
            }
        }
    }

    F64 Value(const F64 (&p)[kSize]) const {
        constexpr double kadfDivisor[kSize] = {5040, 720, 240, 144, 144, 240, 720, 5040};
        F64 term[kSize];
        for (int k = 0; k < kSize; ++k) {
            term[k] = p[k] * product[k] / Set1(kadfDivisor[k]);
        }
        const F64 value =
            term[1] - term[0] - term[2] + term[3] - term[4] + term[5] - term[6] + term[7];
        return Select(onNode, p[3], value);
    }

    B64 onNode;
    F64 product[kSize];
};

template <typename Basis>
struct Lagrange {
    static constexpr int kSize = Basis::kSize;

    template <typename Window>
    static F64 Value(const Window& oWindow, F64 dx, F64 dy) {
        const Basis across(dx);
        F64 rows[kSize];
        for (int k = 0; k < kSize; ++k) {
            F64 p[kSize];
            oWindow.Row(k, p);
            rows[k] = across.Value(p);
        }
        return Basis(dy).Value(rows);
    }
};
