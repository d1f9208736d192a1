#include "vetra/base/utils/math/interpolation.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <limits>

#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace {

// A position that far from a node is on it.
bool IsZero(double dfDistance) {
    return std::abs(dfDistance) < std::numeric_limits<double>::epsilon();
}

// Numerator and denominator of the basis polynomial of node i, which is 1 there and 0 at the other
// nodes.
struct Basis {
    template <typename Nodes>
    Basis(std::size_t i, std::size_t nNumPoints, const Nodes& fnNode, double x) {
        for (std::size_t j = 0; j < nNumPoints; ++j) {
            if (j != i) {
                num *= x - fnNode(j);
                den *= fnNode(i) - fnNode(j);
            }
        }
    }

    double num = 1.0;
    double den = 1.0;
};

}  // namespace

void interpolate_linear(const double& a, const double& b, const double& t, double& out) {
    out = (1.0 - t) * a + t * b;
}

void interpolate_Lagrange(const double& x0, const double& x1, const double& x2, const double& x3,
                          const double& y0, const double& y1, const double& y2, const double& y3,
                          const double& x, double& out) {
    const double d0 = x - x0;
    const double d1 = x - x1;
    const double d2 = x - x2;
    const double d3 = x - x3;
    if (IsZero(d0)) {
        out = y0;
    } else if (IsZero(d1)) {
        out = y1;
    } else if (IsZero(d2)) {
        out = y2;
    } else if (IsZero(d3)) {
        out = y3;
    } else {
        out = y0 * (d1 / (x0 - x1) * (d2 / (x0 - x2)) * (d3 / (x0 - x3))) +
              y1 * (d0 / (x1 - x0) * (d2 / (x1 - x2)) * (d3 / (x1 - x3))) +
              y2 * (d0 / (x2 - x0) * (d1 / (x2 - x1)) * (d3 / (x2 - x3))) +
              y3 * (d0 / (x3 - x0) * (d1 / (x3 - x1)) * (d2 / (x3 - x2)));
    }
}

void interpolate_Lagrange(const std::vector<double>& vdfX, const std::vector<double>& vdfY,
                          const double& x, double& out) {
    if (vdfY.size() < vdfX.size()) {
        throw vetra::ParameterException(
            "vdfY", vetra::ParameterException::eWrongLength, FormatString("%zu", vdfY.size()),
            FormatString(">= %zu", vdfX.size()), "There are fewer samples than nodes", VETRA_HERE);
    }
    const auto fnNode = [&](std::size_t j) { return vdfX[j]; };
    double dfSum = 0.0;
    for (std::size_t i = 0; i < vdfX.size(); ++i) {
        const Basis oBasis(i, vdfX.size(), fnNode, x);
        dfSum += oBasis.num * vdfY[i] / oBasis.den;
    }
    out = dfSum;
}

void interpolate_Lagrange(int nNumPoints, const double* padfSamples, int nDimension, double x,
                          double* padfOut) {
    const auto nPoints = static_cast<std::size_t>(std::max(nNumPoints, 0));
    const auto nSize = static_cast<std::size_t>(std::max(nDimension, 0));
    const auto fnNode = [](std::size_t j) { return static_cast<double>(j); };
    std::fill_n(padfOut, nSize, 0.0);
    for (std::size_t i = 0; i < nPoints; ++i) {
        const Basis oBasis(i, nPoints, fnNode, x);
        const double w = oBasis.num / oBasis.den;
        for (std::size_t k = 0; k < nSize; ++k) {
            padfOut[k] += w * padfSamples[i * nSize + k];
        }
    }
}

void interpolate_Lagrange_rate(const double& x0, const double& x1, const double& x2,
                               const double& x3, const double& y0, const double& y1,
                               const double& y2, const double& y3, const double& x, double& out) {
    const double a = x - x0;
    const double b = x - x1;
    const double c = x - x2;
    const double d = x - x3;
    if (IsZero(a)) {
        out = (y1 - y0) / (x1 - x0);
    } else if (IsZero(b)) {
        out = (y2 - y0) / (x2 - x0);
    } else if (IsZero(c)) {
        out = (y3 - y1) / (x3 - x1);
    } else if (IsZero(d)) {
        out = (y3 - y2) / (x3 - x2);
    } else {
        out = y0 * (d * b + d * c + c * b) / ((x0 - x2) * (x0 - x1) * (x0 - x3)) +
              y1 * (d * a + d * c + c * a) / ((x1 - x2) * (x1 - x0) * (x1 - x3)) +
              y2 * (d * a + d * b + b * a) / ((x2 - x1) * (x2 - x0) * (x2 - x3)) +
              y3 * (c * a + c * b + b * a) / ((x3 - x1) * (x3 - x0) * (x3 - x2));
    }
}

void interpolate_Lagrange_rate(const double& y0, const double& y1, const double& y2,
                               const double& y3, const double& t, const double& h, double& out) {
    constexpr double kThird = 0.3333333333333333;
    constexpr double kSixth = 0.16666666666666666;
    const double k = 1.0 / h;
    const double w0 = (t - kThird - t * t * 0.5) * k;
    const double w1 = (-0.5 - 2.0 * t + 3.0 * t * t * 0.5) * k;
    const double w2 = (t + 1.0 - 3.0 * t * t * 0.5) * k;
    const double w3 = (t * t * 0.5 - kSixth) * k;
    out = w0 * y0 + w1 * y1 + w2 * y2 + w3 * y3;
}
