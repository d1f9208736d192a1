// Lagrange interpolation through equally spaced samples, along the columns and then along the rows.
// Filters of separable methods; see separable_inl.h. Included inside a level's namespace.
//
// At a fraction of exactly 0 the value is the sample there, without arithmetic.
//
// Distances to nodes are differences of doubles from 0 to 7, and at most one of them is below 1/2:
// a product of them is 0 or at least 2^-53. With samples that are 0 or at least 2^-149 in size, as
// integers, floats and their roots are, no term and no sum of terms lies between 0 and 2^-400. Only
// samples of type double may make smaller ones.

// The quotients of some numbers by integers.
template <int N>
inline void DivideAll(bool bMayBeTiny, F64 (&x)[N], const Divisor (&aoDivisor)[N]) {
    if (!bMayBeTiny || !AnyTiny(x)) {
        for (int k = 0; k < N; ++k) {
            x[k] = DivideBy(x[k], aoDivisor[k]);
        }
    } else {
        for (int k = 0; k < N; ++k) {
            x[k] = x[k] / Set1(aoDivisor[k].dfValue);
        }
    }
}

// Degree 3, through nodes 0 to 3; t is measured from node 1.
struct Lagrange4Filter {
    static constexpr int kTaps = 4;
    static constexpr bool kTabulated = false;

    explicit Lagrange4Filter(const FilterInput& oInput)
        : onNode(oInput.frac == Set1(0.0)),
          d0(oInput.frac + Set1(1.0)),
          d1(d0 - Set1(1.0)),
          d2(d0 - Set1(2.0)),
          d3(d0 - Set1(3.0)),
          halfD3(d3 * Set1(0.5)),
          bMayBeTiny(oInput.bMayBeTiny) {}

    template <typename Samples>
    F64 Value(const Samples& fnSample) const {
        const F64 p[kTaps] = {fnSample(0), fnSample(1), fnSample(2), fnSample(3)};
        // Half of a product is the product with half of a factor, unless that is subnormal or the
        // product overflows.
        const auto fnHalved = [&](F64 product) {
            return bMayBeTiny ? product * d3 * Set1(0.5) : product * halfD3;
        };
        constexpr Divisor kSix = MakeDivisor(6);
        constexpr Divisor kaoDivisor[2] = {kSix, kSix};
        F64 outer[2] = {d1 * p[0] * d2 * d3, p[3] * d0 * d1 * d2};
        DivideAll(bMayBeTiny, outer, kaoDivisor);
        const F64 value = fnHalved(p[1] * d0 * d2) - outer[0] - fnHalved(p[2] * d0 * d1) + outer[1];
        return Select(onNode, p[1], value);
    }

    B64 onNode;
    F64 d0, d1, d2, d3;
    F64 halfD3;
    bool bMayBeTiny;
};

// Degree 7, through nodes 0 to 7; t is measured from node 3.
struct Lagrange8Filter {
    static constexpr int kTaps = 8;
    static constexpr bool kTabulated = false;

    explicit Lagrange8Filter(const FilterInput& oInput)
        : onNode(oInput.frac == Set1(0.0)), bMayBeTiny(oInput.bMayBeTiny) {
        const F64 u = oInput.frac + Set1(3.0);
        F64 distance[kTaps];
        for (int k = 0; k < kTaps; ++k) {
            distance[k] = u - Set1(k);
        }
        // Each is the product of the distances to the other nodes, in ascending order.
        product[0] = Times<2>(distance[1], distance);
        product[1] = Times<2>(distance[0], distance);
        F64 below = distance[0] * distance[1];
        product[2] = Times<3>(below, distance);
        below = below * distance[2];
        product[3] = Times<4>(below, distance);
        below = below * distance[3];
        product[4] = Times<5>(below, distance);
        below = below * distance[4];
        product[5] = Times<6>(below, distance);
        below = below * distance[5];
        product[6] = Times<7>(below, distance);
        product[7] = below * distance[6];
    }

    template <typename Samples>
    F64 Value(const Samples& fnSample) const {
        constexpr Divisor kaoDivisor[kTaps] = {
            MakeDivisor(5040), MakeDivisor(720), MakeDivisor(240), MakeDivisor(144),
            MakeDivisor(144),  MakeDivisor(240), MakeDivisor(720), MakeDivisor(5040)};
        F64 term[kTaps];
        F64 node;
        for (int k = 0; k < kTaps; ++k) {
            const F64 p = fnSample(k);
            term[k] = p * product[k];
            node = k == 3 ? p : node;
        }
        DivideAll(bMayBeTiny, term, kaoDivisor);
        const F64 value =
            term[1] - term[0] - term[2] + term[3] - term[4] + term[5] - term[6] + term[7];
        return Select(onNode, node, value);
    }

    // x times the distances to node kFirst and those behind it. Compilers don't unroll the loop,
    // and what goes through memory is slow.
    template <int kFirst>
    static F64 Times(F64 x, const F64 (&distance)[kTaps]) {
        if constexpr (kFirst < kTaps) {
            return Times<kFirst + 1>(x * distance[kFirst], distance);
        } else {
            return x;
        }
    }

    B64 onNode;
    F64 product[kTaps];
    bool bMayBeTiny;
};
