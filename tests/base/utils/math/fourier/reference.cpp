#include "tests/base/utils/math/fourier/reference.h"

#include <cmath>
#include <numbers>
#include <random>
#include <utility>

namespace vetra::tests {

Work MakeWork(std::size_t n) {
    const std::size_t nRoot = static_cast<std::size_t>(std::sqrt(static_cast<double>(n)));
    return {std::vector<int>(2 + nRoot), std::vector<float>(n / 2)};
}

Samples RandomSamples(std::size_t n, unsigned nSeed) {
    std::mt19937 oRandom(nSeed);
    std::uniform_real_distribution<float> oUniform(-1.0f, 1.0f);
    Samples voData(n);
    for (FFTComplex& o : voData) {
        o = {oUniform(oRandom), oUniform(oRandom)};
    }
    return voData;
}

std::vector<float> PlainSinCosTable(std::size_t n) {
    std::vector<float> vfTable;
    for (std::size_t k = 0; k < n / 2; ++k) {
        const double dfAngle =
            static_cast<double>(k) * (6.283185307179586 / static_cast<double>(n));
        vfTable.push_back(static_cast<float>(std::cos(dfAngle)));
        vfTable.push_back(static_cast<float>(-std::sin(dfAngle)));
    }
    return vfTable;
}

void PlainTableTransform(std::size_t n, FFTComplex* poData, const std::vector<float>& vfTable,
                         bool bFlag) {
    Samples x(poData, poData + n);
    Samples y(n);
    for (std::size_t l = 1; l < n; l *= 2) {
        for (std::size_t j = 0; j < n / (2 * l); ++j) {
            const float c = vfTable[2 * j * l];
            const float s = bFlag ? vfTable[2 * j * l + 1] : -vfTable[2 * j * l + 1];
            for (std::size_t k = 0; k < l; ++k) {
                const FFTComplex u = x[j * l + k];
                const FFTComplex v = x[j * l + k + n / 2];
                const FFTComplex d{u.re - v.re, u.im - v.im};
                y[2 * j * l + k] = {u.re + v.re, u.im + v.im};
                y[2 * j * l + l + k] = {d.re * c - d.im * s, d.re * s + d.im * c};
            }
        }
        std::swap(x, y);
    }
    std::copy(x.begin(), x.end(), poData);
}

namespace {

void PlainBitReversal(std::size_t nFloats, float* a, int* t) {
    const auto fnSwap = [=](std::size_t i, std::size_t j) {
        std::swap(a[i], a[j]);
        std::swap(a[i + 1], a[j + 1]);
    };
    t[0] = 0;
    std::size_t l = nFloats;
    std::size_t m = 1;
    if (nFloats > 4) {
        do {
            l /= 2;
            for (std::size_t j = 0; j < m; ++j) {
                t[m + j] = t[j] + static_cast<int>(l);
            }
            m *= 2;
        } while (4 * m < l);
    }
    for (std::size_t k = 1; k < m; ++k) {
        for (std::size_t j = 0; j < k; ++j) {
            const std::size_t j1 = 2 * j + static_cast<std::size_t>(t[k]);
            const std::size_t k1 = 2 * k + static_cast<std::size_t>(t[j]);
            fnSwap(j1, k1);
            if (4 * m == l) {
                fnSwap(j1 + 2 * m, k1 + 2 * m);
            }
        }
    }
}

void PlainTable(std::size_t nw, int* ip, float* w) {
    ip[0] = static_cast<int>(nw);
    ip[1] = 1;
    if (nw < 3) {
        return;
    }
    const std::size_t h = nw / 2;
    const double d = std::atan(1.0) / static_cast<double>(h);
    w[0] = 1.0f;
    w[1] = 0.0f;
    w[h] = w[h + 1] = static_cast<float>(std::cos(static_cast<double>(h) * d));
    for (std::size_t j = 2; j + 2 <= h; j += 2) {
        w[j] = w[nw - j + 1] = static_cast<float>(std::cos(static_cast<double>(j) * d));
        w[j + 1] = w[nw - j] = static_cast<float>(std::sin(static_cast<double>(j) * d));
    }
    PlainBitReversal(nw, w, ip + 2);
}

// w z, or conj(w) z.
FFTComplex Times(FFTComplex w, FFTComplex z, bool bConjugate) {
    if (bConjugate) {
        return {w.re * z.re + w.im * z.im, w.re * z.im - w.im * z.re};
    }
    return {w.re * z.re - w.im * z.im, w.re * z.im + w.im * z.re};
}

}  // namespace

void PlainInPlaceTransform(std::size_t n, bool bFlag, FFTComplex* poData, Work& oWork) {
    const std::size_t nf = 2 * n;
    int* ip = oWork.vnIp.data();
    float* w = oWork.vfW.data();
    if (nf > 4 * static_cast<std::size_t>(ip[0])) {
        PlainTable(nf / 4, ip, w);
    }
    if (nf > 4) {
        PlainBitReversal(nf, &poData[0].re, ip + 2);
    }
    // In samples from here on: a span has s of them.
    std::size_t s = 1;
    for (; 4 * s <= n; s *= 4) {
        for (std::size_t g = 0; g < n / (4 * s); ++g) {
            for (std::size_t j = 4 * s * g; j < 4 * s * g + s; ++j) {
                FFTComplex* const p = poData + j;
                const FFTComplex t0{p[0].re + p[s].re, p[0].im + p[s].im};
                const FFTComplex t1{p[0].re - p[s].re, p[0].im - p[s].im};
                const FFTComplex t2{p[2 * s].re + p[3 * s].re, p[2 * s].im + p[3 * s].im};
                const FFTComplex t3{p[2 * s].re - p[3 * s].re, p[2 * s].im - p[3 * s].im};
                const FFTComplex plus{t1.re - t3.im, t1.im + t3.re};   // t1 + i t3
                const FFTComplex minus{t1.re + t3.im, t1.im - t3.re};  // t1 - i t3
                const FFTComplex z1 = bFlag ? minus : plus;
                const FFTComplex z3 = bFlag ? plus : minus;
                const FFTComplex z2{t0.re - t2.re, t0.im - t2.im};
                p[0] = {t0.re + t2.re, t0.im + t2.im};
                if (g == 0) {
                    p[s] = z1;
                    p[2 * s] = z2;
                    p[3 * s] = z3;
                } else if (g == 1 && !bFlag) {
                    const float c = w[2];
                    p[s] = {c * (z1.re - z1.im), c * (z1.re + z1.im)};
                    p[2 * s] = {t2.im - t0.im, z2.re};
                    p[3 * s] = {c * (-z3.im - z3.re), c * (z3.re - z3.im)};
                } else if (g == 1) {
                    const float c = w[2];
                    p[s] = {c * (z1.re + z1.im), c * (z1.im - z1.re)};
                    p[2 * s] = {z2.im, t2.re - t0.re};
                    p[3 * s] = {c * (z3.im - z3.re), c * (-z3.re - z3.im)};
                } else {
                    const FFTComplex w1{w[2 * g], w[2 * g + 1]};
                    const FFTComplex w2 =
                        g % 2 == 0 ? FFTComplex{w[g], w[g + 1]} : FFTComplex{-w[g], w[g - 1]};
                    const FFTComplex w3{w1.re - 2 * w2.im * w1.im, 2 * w2.im * w1.re - w1.im};
                    p[s] = Times(w1, z1, bFlag);
                    p[2 * s] = Times(w2, z2, bFlag);
                    p[3 * s] = Times(w3, z3, bFlag);
                }
            }
        }
    }
    if (s < n) {
        for (std::size_t j = 0; j < s; ++j) {
            const FFTComplex u0 = poData[j];
            const FFTComplex u1 = poData[j + s];
            poData[j] = {u0.re + u1.re, u0.im + u1.im};
            poData[j + s] = {u0.re - u1.re, u0.im - u1.im};
        }
    }
}

std::vector<std::complex<double>> ExactTransform(const Samples& voData, bool bFlag) {
    const std::size_t n = voData.size();
    std::vector<std::complex<double>> vRoots(n);
    for (std::size_t k = 0; k < n; ++k) {
        vRoots[k] = std::polar(1.0, (bFlag ? -2.0 : 2.0) * std::numbers::pi *
                                        static_cast<double>(k) / static_cast<double>(n));
    }
    // Decimation in time: transforms of length l of every (n / l)-th sample.
    std::vector<std::complex<double>> x;
    for (const FFTComplex& o : voData) {
        x.emplace_back(o.re, o.im);
    }
    std::vector<std::complex<double>> y(n);
    for (std::size_t l = 1; l < n; l *= 2) {
        const std::size_t nStep = n / (2 * l);
        for (std::size_t k = 0; k < l; ++k) {
            for (std::size_t i = 0; i < nStep; ++i) {
                const std::complex<double> u = x[k * 2 * nStep + i];
                const std::complex<double> v = x[k * 2 * nStep + i + nStep] * vRoots[k * nStep];
                y[k * nStep + i] = u + v;
                y[(k + l) * nStep + i] = u - v;
            }
        }
        std::swap(x, y);
    }
    return x;
}

double RelativeError(const Samples& voResult, const std::vector<std::complex<double>>& vExact) {
    double dfError = 0.0;
    double dfNorm = 0.0;
    for (std::size_t k = 0; k < vExact.size(); ++k) {
        dfError += std::norm(std::complex<double>(voResult[k].re, voResult[k].im) - vExact[k]);
        dfNorm += std::norm(vExact[k]);
    }
    return std::sqrt(dfError / dfNorm);
}

}  // namespace vetra::tests
