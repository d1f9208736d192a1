#include <gtest/gtest.h>
#include <omp.h>

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstring>
#include <limits>
#include <numbers>

#include "tests/base/utils/math/fourier/reference.h"
#include "tests/support/refusal.h"
#include "vetra/base/utils/math/fourier/cdft.h"
#include "vetra/base/utils/math/fourier/complexdft.h"
#include "vetra/base/utils/math/fourier/passes.h"
#include "vetra/base/utils/math/sincos.h"

namespace vetra::tests {
namespace {

using std::size_t;
namespace fourier = utils::math::fourier;

constexpr int kMostPasses = 20;

float* Floats(Samples& vo) { return &vo[0].re; }

bool SameBits(const void* pA, const void* pB, size_t nBytes) {
    return nBytes == 0 || std::memcmp(pA, pB, nBytes) == 0;
}
template <typename T>
bool SameBits(const std::vector<T>& vA, const std::vector<T>& vB) {
    return vA.size() == vB.size() && SameBits(vA.data(), vB.data(), vA.size() * sizeof(T));
}

int Log2(size_t n) { return std::countr_zero(n); }

Samples TableTransform(Samples voData, bool bFlag) {
    const int n = static_cast<int>(voData.size());
    std::vector<float> vfTable(voData.size());
    Samples voWork(voData.size());
    InitSinCosTable(n, vfTable.data());
    CDFT1d(n, Log2(voData.size()), Floats(voData), Floats(voWork), vfTable.data(), bFlag);
    return voData;
}

Samples InPlaceTransform(Samples voData, bool bFlag) {
    Work oWork = MakeWork(voData.size());
    ComplexDFT1d(static_cast<int>(voData.size()), bFlag, voData.data(), oWork.vnIp.data(),
                 oWork.vfW.data());
    return voData;
}

Samples TableTransform2d(Samples voData, size_t n, bool bFlag) {
    std::vector<float> vfTable(n);
    InitSinCosTable(static_cast<int>(n), vfTable.data());
    CDFT2d(static_cast<int>(n), voData.data(), vfTable.data(), bFlag);
    return voData;
}

Samples InPlaceTransform2d(Samples voData, size_t nRows, size_t nCols, bool bFlag) {
    Work oWork = MakeWork(std::max(nRows, nCols));
    Samples voColumn(nRows);
    ComplexDFT2d(static_cast<int>(nRows), static_cast<int>(nCols), bFlag, voData.data(),
                 voColumn.data(), oWork.vnIp.data(), oWork.vfW.data());
    return voData;
}

// Random data, and such with many zeros of both signs, for which -0 and +0 differ.
std::vector<Samples> Inputs(size_t n) {
    Samples voSparse(n, FFTComplex{0.0f, -0.0f});
    voSparse[n / 2] = {1.0f, -0.0f};
    voSparse[n - 1] = {-0.0f, 2.0f};
    return {RandomSamples(n, static_cast<unsigned>(n)), voSparse};
}

// Unaligned memory with guards around it.
struct Guarded {
    static constexpr size_t kGuard = 3;
    std::vector<float> vf;

    explicit Guarded(const Samples& vo) : vf(2 * vo.size() + 2 * kGuard, -7.0f) {
        std::memcpy(vf.data() + kGuard, vo.data(), vo.size() * sizeof(FFTComplex));
    }
    float* Get() { return vf.data() + kGuard; }
    bool IsIntact() const {
        return std::all_of(vf.begin(), vf.begin() + kGuard, [](float f) { return f == -7.0f; }) &&
               std::all_of(vf.end() - kGuard, vf.end(), [](float f) { return f == -7.0f; });
    }
};

TEST(Fourier, EveryLevelHasTheBitsOfThePlainPasses) {
    for (int m = 0; m <= 17; ++m) {
        const size_t n = size_t{1} << m;
        const std::vector<float> vfTable = PlainSinCosTable(n);
        Work oWork = MakeWork(n);
        for (const Samples& voInput : Inputs(n)) {
            for (const bool bFlag : {true, false}) {
                Samples voTable = voInput;
                PlainTableTransform(n, voTable.data(), vfTable, bFlag);
                Samples voInPlace = voInput;
                PlainInPlaceTransform(n, bFlag, voInPlace.data(), oWork);
                // The butterflies alone start from the permuted data.
                Samples voPermuted(n);
                for (size_t i = 0; i < n; ++i) {
                    size_t nReversed = 0;
                    for (int nBit = 0; nBit < m; ++nBit) {
                        nReversed |= ((i >> nBit) & 1) << (m - 1 - nBit);
                    }
                    voPermuted[nReversed] = voInput[i];
                }
                for (const utils::low::Level eLevel : utils::low::GetSupportedLevels()) {
                    const fourier::Passes& oPasses = fourier::GetPasses(eLevel);
                    SCOPED_TRACE(testing::Message()
                                 << oPasses.pszName << ", n = " << n << ", flag " << bFlag);
                    if (n >= 2) {
                        Guarded oData(voInput);
                        Guarded oScratch(voInput);
                        oPasses.pfnTableTransform(static_cast<std::ptrdiff_t>(n), oData.Get(),
                                                  oScratch.Get(), vfTable.data(), bFlag);
                        ASSERT_TRUE(SameBits(oData.Get(), voTable.data(), n * sizeof(FFTComplex)));
                        ASSERT_TRUE(oData.IsIntact() && oScratch.IsIntact());
                    }
                    Guarded oData(voPermuted);
                    oPasses.pfnButterflies(static_cast<std::ptrdiff_t>(2 * n), oData.Get(),
                                           oWork.vfW.data(), bFlag);
                    ASSERT_TRUE(SameBits(oData.Get(), voInPlace.data(), n * sizeof(FFTComplex)));
                    ASSERT_TRUE(oData.IsIntact());
                }
            }
        }
    }
    EXPECT_STREQ("portable", fourier::GetPasses(utils::low::Level::ePortable).pszName);
    const std::string sBest = fourier::GetPasses(utils::low::GetBestLevel()).pszName;
    EXPECT_EQ(sBest == "portable", utils::low::GetBestLevel() < utils::low::Level::eV3);
}

TEST(Fourier, ErrorsAreBounded) {
    for (int m = 1; m <= kMostPasses; ++m) {
        const Samples voInput = RandomSamples(size_t{1} << m, 17);
        for (const bool bFlag : {true, false}) {
            const auto vExact = ExactTransform(voInput, bFlag);
            const Samples voTable = TableTransform(voInput, bFlag);
            const Samples voInPlace = InPlaceTransform(voInput, bFlag);
            EXPECT_LT(RelativeError(voTable, vExact), 5e-8 * std::sqrt(m)) << m;
            EXPECT_LT(RelativeError(voInPlace, vExact), 1e-7 * std::sqrt(m)) << m;
            // The roots drift least for the last sizes; here they are measured most sharply.
            const Samples voBack = TableTransform(voTable, !bFlag);
            const Samples voBackInPlace = InPlaceTransform(voInPlace, !bFlag);
            std::vector<std::complex<double>> vScaled;
            for (const FFTComplex& o : voInput) {
                vScaled.push_back(std::ldexp(1.0, m) * std::complex<double>(o.re, o.im));
            }
            EXPECT_LT(RelativeError(voBack, vScaled), 1e-7 * std::sqrt(m)) << m;
            EXPECT_LT(RelativeError(voBackInPlace, vScaled), 2e-7 * std::sqrt(m)) << m;
        }
    }
}

TEST(Fourier, KnownTransforms) {
    for (const size_t n : std::vector<size_t>{2, 4, 8, 16, 64, 4096}) {
        for (const auto fnTransform : {&TableTransform, &InPlaceTransform}) {
            for (const bool bFlag : {true, false}) {
                const Samples voConstant = fnTransform(Samples(n, {1.0f, 0.0f}), bFlag);
                for (size_t k = 0; k < n; ++k) {
                    EXPECT_EQ(voConstant[k].re, k == 0 ? static_cast<float>(n) : 0.0f);
                    EXPECT_EQ(voConstant[k].im, 0.0f);
                }
                Samples voImpulse(n, {0.0f, 0.0f});
                voImpulse[1].re = 1.0f;
                voImpulse = fnTransform(voImpulse, bFlag);
                for (size_t k = 0; k < n; ++k) {
                    const std::complex<double> root =
                        std::polar(1.0, (bFlag ? -2.0 : 2.0) * std::numbers::pi *
                                            static_cast<double>(k) / static_cast<double>(n));
                    EXPECT_NEAR(voImpulse[k].re, root.real(), 3e-7) << k << " of " << n;
                    EXPECT_NEAR(voImpulse[k].im, root.imag(), 3e-7) << k << " of " << n;
                }
            }
        }
    }
}

TEST(Fourier, WorkArraysOfTheInPlaceFamily) {
    // Growing, shrinking and repeated lengths against the plain form, in one pair of arrays.
    Work oOurs = MakeWork(1 << 12);
    Work oPlain = MakeWork(1 << 12);
    oOurs.vnIp.back() = oPlain.vnIp.back() = -9;
    for (const size_t n :
         std::vector<size_t>{1, 2, 4, 8, 2, 16, 256, 16, 1, 128, 2048, 32, 4096, 512}) {
        for (const bool bFlag : {true, false}) {
            Samples voOurs = RandomSamples(n, 5);
            Samples voPlain = voOurs;
            ComplexDFT1d(static_cast<int>(n), bFlag, voOurs.data(), oOurs.vnIp.data(),
                         oOurs.vfW.data());
            PlainInPlaceTransform(n, bFlag, voPlain.data(), oPlain);
            EXPECT_TRUE(SameBits(voOurs, voPlain)) << n;
            EXPECT_EQ(oOurs.vnIp, oPlain.vnIp) << n;
            EXPECT_TRUE(SameBits(oOurs.vfW, oPlain.vfW)) << n;
        }
    }
    EXPECT_EQ(oOurs.vnIp[0], 2048);

    // Short transforms touch no table.
    for (const int n : {1, 2, 4}) {
        int anIp[4] = {0, -1, -1, -1};
        Samples voData = RandomSamples(static_cast<size_t>(n), 3);
        const Samples voBefore = voData;
        ComplexDFT1d(n, true, voData.data(), anIp, nullptr);
        EXPECT_EQ(anIp[0], n / 2);
        EXPECT_EQ(anIp[1], 1);
        EXPECT_EQ(SameBits(voData, voBefore), n == 1);
    }
    Work oEight = MakeWork(8);
    Samples voData(8);
    ComplexDFT1d(8, false, voData.data(), oEight.vnIp.data(), oEight.vfW.data());
    const float fHalfRoot = static_cast<float>(std::numbers::sqrt2 / 2);
    EXPECT_EQ(oEight.vfW, (std::vector<float>{1.0f, 0.0f, fHalfRoot, fHalfRoot}));
}

// Rows and columns by the plain transform of each family.
template <typename Transform>
Samples PlainTransform2d(Samples voData, size_t nRows, size_t nCols, Transform fnTransform) {
    for (size_t i = 0; i < nRows; ++i) {
        fnTransform(nCols, &voData[i * nCols]);
    }
    for (size_t j = 0; j < nCols; ++j) {
        Samples voColumn;
        for (size_t i = 0; i < nRows; ++i) {
            voColumn.push_back(voData[i * nCols + j]);
        }
        fnTransform(nRows, voColumn.data());
        for (size_t i = 0; i < nRows; ++i) {
            voData[i * nCols + j] = voColumn[i];
        }
    }
    return voData;
}

TEST(Fourier, TwoDimensions) {
    const int nMaxThreads = omp_get_max_threads();
    for (const size_t n : std::vector<size_t>{2, 4, 8, 16, 64, 512}) {
        const Samples voInput = RandomSamples(n * n, 11);
        const std::vector<float> vfTable = PlainSinCosTable(n);
        for (const bool bFlag : {true, false}) {
            const Samples voPlain =
                PlainTransform2d(voInput, n, n, [&](size_t nLength, FFTComplex* po) {
                    PlainTableTransform(nLength, po, vfTable, bFlag);
                });
            for (const int nThreads : {1, 2, 3, 8}) {
                omp_set_num_threads(nThreads);
                EXPECT_TRUE(SameBits(TableTransform2d(voInput, n, bFlag), voPlain)) << n;
                EXPECT_EQ(omp_get_max_threads(), nThreads);
            }
            omp_set_num_threads(nMaxThreads);
        }
    }
    for (const auto& [nRows, nCols] : std::vector<std::pair<size_t, size_t>>{
             {1, 1}, {1, 8}, {8, 1}, {2, 4}, {64, 8}, {8, 128}, {256, 256}}) {
        const Samples voInput = RandomSamples(nRows * nCols, 13);
        for (const bool bFlag : {true, false}) {
            Work oPlain = MakeWork(std::max(nRows, nCols));
            const Samples voPlain =
                PlainTransform2d(voInput, nRows, nCols, [&](size_t nLength, FFTComplex* po) {
                    PlainInPlaceTransform(nLength, bFlag, po, oPlain);
                });
            Work oWork = MakeWork(std::max(nRows, nCols));
            Samples voData = voInput;
            Samples voColumn(nRows);
            ComplexDFT2d(static_cast<int>(nRows), static_cast<int>(nCols), bFlag, voData.data(),
                         voColumn.data(), oWork.vnIp.data(), oWork.vfW.data());
            EXPECT_TRUE(SameBits(voData, voPlain)) << nRows << " x " << nCols;
            EXPECT_EQ(oWork.vnIp, oPlain.vnIp);
            EXPECT_TRUE(SameBits(oWork.vfW, oPlain.vfW));
            for (size_t i = 0; i < nRows; ++i) {
                EXPECT_EQ(voColumn[i].re, voData[(i + 1) * nCols - 1].re);
            }
        }
    }
}

TEST(Fourier, ErrorsAreBoundedInTwoDimensions) {
    constexpr size_t n = 1024;
    const Samples voInput = RandomSamples(n * n, 19);
    const auto fnCopy = [](const Samples& vo, size_t nFirst, size_t nStep) {
        Samples voLine;
        for (size_t i = 0; i < n; ++i) {
            voLine.push_back(vo[nFirst + i * nStep]);
        }
        return voLine;
    };
    for (const bool bFlag : {true, false}) {
        // The exact transform of the rows, scaled and rounded, would not be exact: both parts of it
        // go through the exact transform of the columns.
        std::vector<std::complex<double>> vRows(n * n);
        for (size_t i = 0; i < n; ++i) {
            const auto vRow = ExactTransform(fnCopy(voInput, i * n, 1), bFlag);
            std::copy(vRow.begin(), vRow.end(), vRows.begin() + static_cast<std::ptrdiff_t>(i * n));
        }
        std::vector<std::complex<double>> vExact(n * n);
        for (size_t j = 0; j < n; ++j) {
            Samples voHigh(n);
            Samples voLow(n);
            for (size_t i = 0; i < n; ++i) {
                const std::complex<double> z = vRows[i * n + j];
                voHigh[i] = {static_cast<float>(z.real()), static_cast<float>(z.imag())};
                voLow[i] = {static_cast<float>(z.real() - static_cast<double>(voHigh[i].re)),
                            static_cast<float>(z.imag() - static_cast<double>(voHigh[i].im))};
            }
            const auto vHigh = ExactTransform(voHigh, bFlag);
            const auto vLow = ExactTransform(voLow, bFlag);
            for (size_t i = 0; i < n; ++i) {
                vExact[i * n + j] = vHigh[i] + vLow[i];
            }
        }
        const double dfPasses = std::sqrt(kMostPasses);
        EXPECT_LT(RelativeError(TableTransform2d(voInput, n, bFlag), vExact), 5e-8 * dfPasses);
        EXPECT_LT(RelativeError(InPlaceTransform2d(voInput, n, n, bFlag), vExact), 1e-7 * dfPasses);
    }
}

TEST(Fourier, Table) {
    const int nMaxThreads = omp_get_max_threads();
    for (const int n : {2, 3, 7, 8, 1024, 1 << 16}) {
        for (const int nThreads : {1, 3}) {
            omp_set_num_threads(nThreads);
            std::vector<float> vfTable(static_cast<size_t>(n / 2 * 2) + 1, -5.0f);
            InitSinCosTable(n, vfTable.data());
            EXPECT_EQ(vfTable.back(), -5.0f);
            vfTable.pop_back();
            EXPECT_TRUE(SameBits(vfTable, PlainSinCosTable(static_cast<size_t>(n)))) << n;
        }
    }
    omp_set_num_threads(nMaxThreads);
    double dfSin = 0.0;
    double dfCos = 0.0;
    sincos(2.5, dfSin, dfCos);
    EXPECT_EQ(dfSin, std::sin(2.5));
    EXPECT_EQ(dfCos, std::cos(2.5));
}

TEST(Fourier, Refusals) {
    Samples voData = RandomSamples(16, 1);
    const Samples voBefore = voData;
    Samples voWork(16);
    std::vector<float> vfTable = PlainSinCosTable(16);
    Work oWork = MakeWork(16);
    float* a = Floats(voData);
    float* b = Floats(voWork);
    int* ip = oWork.vnIp.data();
    float* w = oWork.vfW.data();
    const float* t = vfTable.data();
    FFTComplex* po = voData.data();
    FFTComplex* poColumn = voWork.data();
    const auto fnPointer = [](const std::string& s) {
        return Refusal{s, ParameterException::eInvalid, "NULL", "non-NULL",
                       s + " must be a valid pointer"};
    };
    const auto fnPower = [](const std::string& s, const std::string& sGot) {
        return Refusal{s, ParameterException::eInvalid, sGot, "a power of two",
                       s + " must be a power of two"};
    };
    const auto fnRange = [](const std::string& s, const std::string& sGot,
                            const std::string& sLeast) {
        return Refusal{s, ParameterException::eOutOfRange, sGot, ">= " + sLeast,
                       s + " must be at least " + sLeast};
    };
    constexpr int kLowest = std::numeric_limits<int>::min();
    ExpectRefusal(fnRange("n", "1", "2"), [&] { InitSinCosTable(1, vfTable.data()); });
    ExpectRefusal(fnPointer("table"), [&] { InitSinCosTable(16, nullptr); });
    ExpectRefusal(fnRange("n", "1", "2"), [&] { CDFT1d(1, 0, a, b, t, true); });
    ExpectRefusal(fnPower("n", "12"), [&] { CDFT1d(12, 3, a, b, t, true); });
    for (const int m : {3, 5, -1, 36, kLowest}) {
        ExpectRefusal({"m", ParameterException::eInvalid, std::to_string(m),
                       "the binary logarithm of n", "m must be the binary logarithm of n"},
                      [&] { CDFT1d(16, m, a, b, t, true); });
    }
    ExpectRefusal(fnPointer("a"), [&] { CDFT1d(16, 4, nullptr, b, t, true); });
    ExpectRefusal(fnPointer("b"), [&] { CDFT1d(16, 4, a, nullptr, t, true); });
    ExpectRefusal(fnPointer("table"), [&] { CDFT1d(16, 4, a, b, nullptr, true); });
    ExpectRefusal(fnRange("n", "0", "2"), [&] { CDFT2d(0, po, t, true); });
    ExpectRefusal(fnPower("n", "3"), [&] { CDFT2d(3, po, t, true); });
    ExpectRefusal(fnPointer("data"), [&] { CDFT2d(4, nullptr, t, true); });
    ExpectRefusal(fnPointer("table"), [&] { CDFT2d(4, po, nullptr, true); });
    ExpectRefusal(fnRange("n", std::to_string(kLowest), "1"),
                  [&] { ComplexDFT1d(kLowest, true, po, ip, w); });
    ExpectRefusal(fnPower("n", "15"), [&] { ComplexDFT1d(15, true, po, ip, w); });
    ExpectRefusal(fnPointer("data"), [&] { ComplexDFT1d(16, true, nullptr, ip, w); });
    ExpectRefusal(fnPointer("ip"), [&] { ComplexDFT1d(16, true, po, nullptr, w); });
    ExpectRefusal(fnPointer("w"), [&] { ComplexDFT1d(8, true, po, ip, nullptr); });
    ExpectRefusal(fnRange("nRows", "0", "1"),
                  [&] { ComplexDFT2d(0, 4, true, po, poColumn, ip, w); });
    ExpectRefusal(fnPower("nCols", "6"), [&] { ComplexDFT2d(2, 6, true, po, poColumn, ip, w); });
    ExpectRefusal(fnPointer("column"), [&] { ComplexDFT2d(4, 4, true, po, nullptr, ip, w); });
    ExpectRefusal(fnPointer("w"), [&] { ComplexDFT2d(8, 2, true, po, poColumn, ip, nullptr); });
    EXPECT_TRUE(SameBits(voData, voBefore));
    EXPECT_EQ(oWork.vnIp, MakeWork(16).vnIp);
}

}  // namespace
}  // namespace vetra::tests
