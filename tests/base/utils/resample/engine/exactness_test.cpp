// The engine against plain evaluation, bit by bit, on random runs: every pair of sample types,
// transforms, masks, requests, clamps, channels, thread counts, processor levels, with the
// shortcuts and without them.

#include <gtest/gtest.h>
#include <omp.h>

#include <cmath>
#include <cstdint>
#include <cstring>
#include <limits>
#include <memory>
#include <random>
#include <typeinfo>
#include <vector>

#include "reference.h"
#include "vetra/base/utils/resample/algorithm/bilinearresampler.h"
#include "vetra/base/utils/resample/algorithm/cubicpsresampler.h"
#include "vetra/base/utils/resample/algorithm/cubicresampler.h"
#include "vetra/base/utils/resample/algorithm/lagrange4resampler.h"
#include "vetra/base/utils/resample/algorithm/lagrange8resampler.h"
#include "vetra/base/utils/resample/algorithm/nearestresampler.h"
#include "vetra/base/utils/resample/blockplanner.h"
#include "vetra/base/utils/resample/engine/dispatch.h"
#include "vetra/base/utils/resample/postfm/bufposarraytfm.h"
#include "vetra/base/utils/resample/postfm/bufposbilineartfm.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"

using namespace vetra::utils;
using namespace vetra::gobs;

namespace {

// Bytes around every array that show stray writes. AddressSanitizer sees reads too, but only where
// nothing is allocated.
#if defined(__has_feature)
#if __has_feature(address_sanitizer)
#define VETRA_TEST_ASAN
#endif
#endif
#if defined(VETRA_TEST_ASAN) || defined(__SANITIZE_ADDRESS__)
constexpr int kGuard = 0;
#else
constexpr int kGuard = 64;
#endif
constexpr unsigned char kGuardByte = 0xa5;

class Random {
 public:
    explicit Random(unsigned nSeed) : moEngine(nSeed) {}

    int Int(int nLow, int nHigh) {
        return std::uniform_int_distribution<int>(nLow, nHigh)(moEngine);
    }
    double Real(double dfLow, double dfHigh) {
        return std::uniform_real_distribution<double>(dfLow, dfHigh)(moEngine);
    }
    bool Chance(double df) { return Real(0, 1) < df; }
    std::uint64_t Bits() { return moEngine(); }
    template <typename T>
    T Pick(std::initializer_list<T> loItems) {
        return loItems.begin()[Int(0, static_cast<int>(loItems.size()) - 1)];
    }

 private:
    std::mt19937_64 moEngine;
};

class GuardedBytes {
 public:
    explicit GuardedBytes(std::size_t nBytes)
        : mnBytes(nBytes), mpabyAll(new unsigned char[nBytes + 2 * kGuard]) {
        std::memset(mpabyAll.get(), kGuardByte, nBytes + 2 * kGuard);
    }
    unsigned char* Get() { return mpabyAll.get() + kGuard; }
    std::size_t Size() const { return mnBytes; }
    bool GuardsHold() const {
        for (int i = 0; i < kGuard; ++i) {
            if (mpabyAll[static_cast<std::size_t>(i)] != kGuardByte ||
                mpabyAll[kGuard + mnBytes + static_cast<std::size_t>(i)] != kGuardByte) {
                return false;
            }
        }
        return true;
    }

 private:
    std::size_t mnBytes;
    std::unique_ptr<unsigned char[]> mpabyAll;
};

bool IsFloating(NativeDataTypeCode eType) { return eType == eDT_32R || eType == eDT_64R; }

// Samples that lie close together, spread over the whole range, or are special.
void FillSamples(Random& oRandom, NativeDataTypeCode eType, unsigned char* pabyBuf,
                 std::size_t nCount) {
    const int nBytes = DataTypeAdapter::ByteSize(eType);
    const int nKind = oRandom.Int(0, 2);
    for (std::size_t i = 0; i < nCount; ++i) {
        std::uint64_t nBits = oRandom.Bits();
        if (IsFloating(eType)) {
            double df = oRandom.Real(-300, 300);
            if (nKind == 1) df = std::ldexp(df, oRandom.Int(-80, 80));
            if (nKind == 2 && oRandom.Chance(0.1)) {
                df = oRandom.Pick<double>(
                    {NAN, INFINITY, -INFINITY, -0.0, 0.25, -9999.0, 3e38, -3e38});
            }
            const float f = static_cast<float>(df);
            std::memcpy(&nBits, eType == eDT_32R ? static_cast<const void*>(&f) : &df,
                        static_cast<std::size_t>(nBytes));
        } else if (nKind == 1) {
            nBits %= 5;
        } else if (nKind == 2 && oRandom.Chance(0.3)) {
            nBits = oRandom.Pick<std::uint64_t>({0, ~0ull, 1ull << 63, ~0ull >> 1, 0x7f, 0x80,
                                                 0x7fff, 0x8000, 0x7fffffff, 0x80000000});
        }
        std::memcpy(pabyBuf + i * static_cast<std::size_t>(nBytes), &nBits,
                    static_cast<std::size_t>(nBytes));
    }
}

// A transform as a caller might write it, with some impossible positions.
class OddTfm : public IBufPosTfm {
 public:
    OddTfm(int nCols, int nRows, double dfScale)
        : mnCols(nCols), mnRows(nRows), mdfScale(dfScale) {}
    int GetNumCols() const override { return mnCols; }
    int GetNumRows() const override { return mnRows; }
    long long GetNumPix() const override { return static_cast<long long>(mnCols) * mnRows; }
    void GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const override {
        dfCol = std::fmod(static_cast<double>(nIdx) * 0.7369, 40.0) * mdfScale - 2.0;
        dfRow = std::fmod(static_cast<double>(nIdx) * 1.1731, 30.0) * mdfScale - 2.0;
        switch (nIdx % 23) {
            case 3:
                dfCol = NAN;
                break;
            case 7:
                dfRow = INFINITY;
                break;
            case 11:
                dfCol = -1e300;
                break;
            case 13:
                dfRow = 3e9;
                break;
            case 17:
                dfCol = -2147483648.5;
                break;
            case 19:
                dfCol = std::floor(dfCol) + 0.49999999999999994;
                break;
            default:
                break;
        }
    }
    OddTfm* Clone() const override { return new OddTfm(*this); }

 private:
    int mnCols;
    int mnRows;
    double mdfScale;
};

std::unique_ptr<IBufPosTfm> MakeTransform(Random& oRandom, int nCols, int nRows, int nSrcCols,
                                          int nSrcRows) {
    const double dfWide = nSrcCols + 3.0;
    const double dfHigh = nSrcRows + 3.0;
    switch (oRandom.Int(0, 3)) {
        case 0: {
            const std::size_t nPix =
                static_cast<std::size_t>(nCols) * static_cast<std::size_t>(nRows);
            auto pafCol = std::make_unique<float[]>(nPix);
            auto pafRow = std::make_unique<float[]>(nPix);
            const int nOff = oRandom.Int(-2, 2);
            for (std::size_t i = 0; i < nPix; ++i) {
                pafCol[i] = static_cast<float>(oRandom.Real(-2, dfWide) - nOff);
                pafRow[i] = static_cast<float>(oRandom.Real(-2, dfHigh));
                if (oRandom.Chance(0.2)) pafCol[i] = std::round(2 * pafCol[i]) / 2;
                if (oRandom.Chance(0.02))
                    pafRow[i] = oRandom.Pick<float>({NAN, INFINITY, -3e38f, 3e9f});
            }
            return std::make_unique<BufPosArrayTfm>(nCols, nRows, pafCol.release(), nOff,
                                                    pafRow.release(), 0, true);
        }
        case 1:
            return std::make_unique<BufPosBilinearTfm>(
                nCols, nRows, oRandom.Real(-2, dfWide), oRandom.Real(-2, dfHigh),
                oRandom.Real(-2, dfWide), oRandom.Real(-2, dfHigh), oRandom.Real(-2, dfWide),
                oRandom.Real(-2, dfHigh), oRandom.Real(-2, dfWide), oRandom.Real(-2, dfHigh));
        case 2: {
            const double dfSign = oRandom.Pick({1.0, -1.0});
            return std::make_unique<BufPosScaleOffTfm>(
                nCols, nRows,
                oRandom.Pick({1.0, 2.0, 0.5, dfSign * nSrcCols / nCols, oRandom.Real(-2, 3), 0.0}),
                oRandom.Pick({0.0, 0.5, dfSign < 0 ? nSrcCols : 0.0, oRandom.Real(-3, dfWide)}),
                oRandom.Pick({1.0, 2.0, 0.5, 1.0 * nSrcRows / nRows, oRandom.Real(-2, 3)}),
                oRandom.Pick({0.0, 0.5, oRandom.Real(-3, dfHigh), 1e300, 1.0 * NAN}),
                oRandom.Pick({0, 0, 3, -2}), oRandom.Pick({0, 0, 1, -1}));
        }
        default:
            // The engine has no use for its columns.
            return std::make_unique<OddTfm>(oRandom.Pick({0, nCols}), nRows,
                                            oRandom.Pick({0.2, 1.0}));
    }
}

const char* TransformName(const IBufPosTfm& oTfm) { return typeid(oTfm).name(); }

ResampleInfo MakeInfo(Random& oRandom, ResampleMethod eMethod) {
    ResampleInfo oInfo;
    oInfo.meMethod = eMethod;
    oInfo.mbClampBgd = oRandom.Chance(0.6);
    oInfo.meNodataFillAction = oRandom.Pick({eNFA_NN, eNFA_BGD});
    if (oRandom.Chance(0.6)) {
        oInfo.mdfClampMin = oRandom.Pick({-200.0, 0.0, 1.5, 2.0, 100.0, -9.3e18, -1e300});
        oInfo.mdfClampMax =
            oInfo.mdfClampMin + oRandom.Pick({0.0, 1.0, 2.0, 100.7, 9.3e18, 1.9e19, 1e300});
    }
    if (oRandom.Chance(0.7)) {
        oInfo.mdfOutBgd = oRandom.Pick({0.0, 0.25, 2.9, -3.7, 255.0, -9999.0, 300.0, 1.0, 3.0,
                                        1e300, oInfo.mdfClampMin, oInfo.mdfClampMax, 1.0 * NAN});
    }
    return oInfo;
}

struct TypePair {
    NativeDataTypeCode eSrc;
    NativeDataTypeCode eTgt;
};

std::vector<TypePair> AllTypePairs() {
    std::vector<TypePair> voPairs;
    for (int nSrc = eDT_8U; nSrc <= eDT_C64R; ++nSrc) {
        for (int nTgt = eDT_8U; nTgt <= eDT_C64R; ++nTgt) {
            const auto fnIs = [&](int nType, int nReal, int nComplex) {
                return nType == nReal || nType == nComplex;
            };
            if (nSrc == eDT_C16U || nTgt == eDT_C16U || (nSrc > eDT_64R) != (nTgt > eDT_64R)) {
                continue;
            }
            if (nSrc == nTgt || fnIs(nSrc, eDT_32R, eDT_C32R) || fnIs(nTgt, eDT_32R, eDT_C32R)) {
                voPairs.push_back(
                    {static_cast<NativeDataTypeCode>(nSrc), static_cast<NativeDataTypeCode>(nTgt)});
            }
        }
    }
    return voPairs;
}

// One image with guards around samples and mask.
struct Image {
    Image(NativeDataTypeCode eType, int nCols, int nRows, int nChan, bool bMask)
        : nSamples(static_cast<std::size_t>(nCols) * static_cast<std::size_t>(nRows) *
                   static_cast<std::size_t>(nChan)),
          oSamples(nSamples * static_cast<std::size_t>(DataTypeAdapter::ByteSize(eType))),
          oMask(static_cast<std::size_t>(nCols) * static_cast<std::size_t>(nRows)),
          oBuffer(eType, nCols, nRows, nChan, oSamples.Get(), bMask ? oMask.Get() : nullptr,
                  false) {}

    std::size_t nSamples;
    GuardedBytes oSamples;
    GuardedBytes oMask;
    ResampleBuffer oBuffer;
};

// The same memory as real samples.
ResampleBuffer RealView(ResampleBuffer& oBuffer) {
    const bool bComplex = DataTypeAdapter::IsComplex(oBuffer.GetDatatype());
    return ResampleBuffer(DataTypeAdapter::ComplexToScalar(oBuffer.GetDatatype()),
                          oBuffer.GetNumCols(), oBuffer.GetNumRows(),
                          (bComplex ? 2 : 1) * oBuffer.GetNumChan(), oBuffer.GetBuf(),
                          oBuffer.GetMask(), false);
}

void CompareRandomRun(Random& oRandom, const TypePair& oPair, ResampleMethod eMethod) {
    const int nChan = oRandom.Pick({1, 1, 2, 3, 4, 5});
    const int nSrcCols = oRandom.Pick({1, 2, 3, 17, 40});
    const int nSrcRows = oRandom.Pick({1, 2, 5, 11, 30});
    const int nTgtCols = oRandom.Pick({1, 7, 8, 9, 31, 128, 131, 300});
    const int nTgtRows = oRandom.Pick({1, 2, 13});
    // Dense and sparse masks; every value that a mask may hold, and some that it may not.
    Image oSrc(oPair.eSrc, nSrcCols, nSrcRows, nChan, oRandom.Chance(0.5));
    Image oTgt(oPair.eTgt, nTgtCols, nTgtRows, nChan, oRandom.Chance(0.5));
    Image oWant(oPair.eTgt, nTgtCols, nTgtRows, nChan, false);
    const ResampleBuffer oSrcView = RealView(oSrc.oBuffer);
    FillSamples(oRandom, oSrcView.GetDatatype(), oSrc.oSamples.Get(),
                oSrc.nSamples * static_cast<std::size_t>(oSrcView.GetNumChan() / nChan));
    const double dfMasked = oRandom.Pick({0.02, 0.5});
    for (std::size_t i = 0; i < oSrc.oMask.Size(); ++i) {
        oSrc.oMask.Get()[i] = oRandom.Chance(dfMasked) ? oRandom.Pick<unsigned char>({0, 0, 2}) : 1;
    }
    const bool bAllSame = oRandom.Chance(0.2);
    const unsigned char nSame = oRandom.Pick<unsigned char>({0, 1, 2, 3});
    for (std::size_t i = 0; i < oTgt.oMask.Size(); ++i) {
        oTgt.oMask.Get()[i] = bAllSame                   ? nSame
                              : oRandom.Chance(dfMasked) ? oRandom.Pick<unsigned char>({0, 2, 3, 4})
                                                         : static_cast<unsigned char>(1);
    }
    // A transform may have other columns than the target, as long as it has the pixels.
    const bool bOtherShape = oRandom.Chance(0.15);
    const int nTfmCols = bOtherShape ? nTgtCols * nTgtRows : nTgtCols;
    const int nTfmRows = bOtherShape ? 1 : nTgtRows;
    const auto poTfm = MakeTransform(oRandom, nTfmCols, nTfmRows, nSrcCols, nSrcRows);
    const ResampleInfo oInfo = MakeInfo(oRandom, eMethod);

    std::vector<unsigned char> vbyStart(oTgt.oSamples.Size());
    for (auto& by : vbyStart) by = static_cast<unsigned char>(oRandom.Bits());
    std::copy(vbyStart.begin(), vbyStart.end(), oWant.oSamples.Get());
    ResampleBuffer oWantBuffer(oPair.eTgt, nTgtCols, nTgtRows, nChan, oWant.oSamples.Get(),
                               oTgt.oBuffer.GetMask(), false);
    ResampleBuffer oWantView = RealView(oWantBuffer);
    std::vector<unsigned char> vbyWantOutcome;
    ReferenceResample(oSrcView, oWantView, *poTfm, oInfo, vbyWantOutcome);
    const std::vector<unsigned char> vbySrcMask(oSrc.oMask.Get(),
                                                oSrc.oMask.Get() + oSrc.oMask.Size());
    const std::vector<unsigned char> vbyTgtMask(oTgt.oMask.Get(),
                                                oTgt.oMask.Get() + oTgt.oMask.Size());

    for (const engine::Level eLevel : engine::GetSupportedLevels()) {
        for (const bool bShortcuts : {true, false}) {
            const int nThreads = oRandom.Pick({1, 2, 3, 7});
            SCOPED_TRACE(testing::Message()
                         << engine::GetStages(eLevel).pszName << " shortcuts " << bShortcuts
                         << " threads " << nThreads << " transform " << TransformName(*poTfm)
                         << " source " << nSrcCols << "x" << nSrcRows << " target " << nTgtCols
                         << "x" << nTgtRows << " channels " << nChan);
            omp_set_num_threads(nThreads);
            std::copy(vbyStart.begin(), vbyStart.end(), oTgt.oSamples.Get());
            GuardedBytes oOutcome(vbyWantOutcome.size());
            engine::RunOptions oOptions;
            oOptions.eLevel = eLevel;
            oOptions.bShortcuts = bShortcuts;
            oOptions.pabyOutcome = oOutcome.Get();
            engine::Resample(oSrc.oBuffer, oTgt.oBuffer, *poTfm, oInfo, oOptions);
            ASSERT_EQ(0, std::memcmp(oTgt.oSamples.Get(), oWant.oSamples.Get(), vbyStart.size()));
            ASSERT_EQ(0, std::memcmp(oOutcome.Get(), vbyWantOutcome.data(), oOutcome.Size()));
            ASSERT_TRUE(oOutcome.GuardsHold());
        }
    }
    EXPECT_TRUE(oTgt.oSamples.GuardsHold());
    EXPECT_TRUE(oSrc.oSamples.GuardsHold());
    EXPECT_TRUE(std::equal(vbySrcMask.begin(), vbySrcMask.end(), oSrc.oMask.Get()));
    EXPECT_TRUE(std::equal(vbyTgtMask.begin(), vbyTgtMask.end(), oTgt.oMask.Get()));
}

std::unique_ptr<IRasterResampler> MakeResampler(ResampleMethod eMethod) {
    switch (eMethod) {
        case eRM_NEAR:
            return std::make_unique<NearestResampler>();
        case eRM_BILIN:
            return std::make_unique<BilinearResampler>();
        case eRM_CUBIC:
            return std::make_unique<CubicResampler>();
        case eRM_CUBICPS:
            return std::make_unique<CubicPsResampler>();
        case eRM_LAGRANGE4:
            return std::make_unique<Lagrange4Resampler>();
        case eRM_LAGRANGE8:
            return std::make_unique<Lagrange8Resampler>();
        case eRM_SQNEAR:
            return std::make_unique<SqNearestResampler>();
        case eRM_SQBILIN:
            return std::make_unique<SqBilinearResampler>();
        case eRM_SQCUBIC:
            return std::make_unique<SqCubicResampler>();
        case eRM_SQCUBICPS:
            return std::make_unique<SqCubicPsResampler>();
        case eRM_SQLAGRANGE4:
            return std::make_unique<SqLagrange4Resampler>();
        default:
            return std::make_unique<SqLagrange8Resampler>();
    }
}

class Exactness : public testing::TestWithParam<ResampleMethod> {
 protected:
    void TearDown() override { omp_set_num_threads(omp_get_num_procs()); }
};

TEST_P(Exactness, RandomRunsEqualPlainEvaluation) {
    const auto voPairs = AllTypePairs();
    ASSERT_EQ(28u + 10u, voPairs.size());
    for (const TypePair& oPair : voPairs) {
        for (unsigned nSeed = 0; nSeed < 40; ++nSeed) {
            SCOPED_TRACE(testing::Message()
                         << DataTypeAdapter::TypeToString(oPair.eSrc) << " to "
                         << DataTypeAdapter::TypeToString(oPair.eTgt) << " seed " << nSeed);
            Random oRandom(nSeed * 1009 + static_cast<unsigned>(oPair.eSrc * 16 + oPair.eTgt));
            CompareRandomRun(oRandom, oPair, GetParam());
            if (HasFatalFailure()) return;
        }
    }
}

// Every distance between neighbouring columns, with columns outside on both sides.
TEST_P(Exactness, ScalesEqualPlainEvaluation) {
    Random oRandom(11);
    ResampleInfo oInfo;
    oInfo.meMethod = GetParam();
    for (const NativeDataTypeCode eType : {eDT_8U, eDT_8S, eDT_16S, eDT_32R}) {
        for (const int nSrcCols : {15, 16, 17, 90}) {
            Image oSrc(eType, nSrcCols, 9, 1, false);
            FillSamples(oRandom, eType, oSrc.oSamples.Get(), oSrc.nSamples);
            for (double dfScale = -3.0; dfScale <= 3.0; dfScale += 0.0625) {
                const double dfOff = (nSrcCols - 61 * dfScale) / 2;
                const BufPosScaleOffTfm oTfm(61, 3, dfScale, dfOff, 1.0, 3.25, 0, 0);
                ResampleBuffer oWant(eType, 61, 3, 1);
                std::vector<unsigned char> vbyOutcome;
                ReferenceResample(oSrc.oBuffer, oWant, oTfm, oInfo, vbyOutcome);
                for (const engine::Level eLevel : engine::GetSupportedLevels()) {
                    ResampleBuffer oTgt(eType, 61, 3, 1);
                    engine::RunOptions oOptions;
                    oOptions.eLevel = eLevel;
                    engine::Resample(oSrc.oBuffer, oTgt, oTfm, oInfo, oOptions);
                    ASSERT_EQ(0, std::memcmp(oWant.GetBuf(), oTgt.GetBuf(),
                                             static_cast<std::size_t>(
                                                 61 * 3 * DataTypeAdapter::ByteSize(eType))))
                        << engine::GetStages(eLevel).pszName << " scale " << dfScale << " of "
                        << nSrcCols << " columns, type " << eType;
                }
            }
        }
    }
}

// Images larger than a span in every direction, cut into blocks.
TEST_P(Exactness, BlocksGiveTheBytesOfOneRun) {
    Random oRandom(7);
    const int nCols = 700;
    const int nRows = 500;
    Image oSrc(eDT_16U, 611, 437, 2, true);
    FillSamples(oRandom, eDT_16U, oSrc.oSamples.Get(), oSrc.nSamples);
    for (std::size_t i = 0; i < oSrc.oMask.Size(); ++i) {
        oSrc.oMask.Get()[i] = oRandom.Chance(0.01) ? 0 : 1;
    }
    const auto poResampler = MakeResampler(GetParam());
    poResampler->SetOutBgd(17);

    const std::size_t nPix = nCols * nRows;
    std::vector<float> vfCol(nPix);
    std::vector<float> vfRow(nPix);
    for (std::size_t i = 0; i < nPix; ++i) {
        const double x = static_cast<double>(i % nCols);
        const double y = static_cast<double>(i / nCols);
        vfCol[i] = static_cast<float>(-90 + 0.94 * x + 0.3 * y);
        vfRow[i] = static_cast<float>(150 - 0.3 * x + 0.94 * y);
        if (i % 1013 == 0) vfRow[i] = NAN;
    }
    std::vector<std::unique_ptr<IBufPosTfm>> vpoTfms;
    vpoTfms.push_back(
        std::make_unique<BufPosArrayTfm>(nCols, nRows, vfCol.data(), 0, vfRow.data(), 0, false));
    vpoTfms.push_back(std::make_unique<BufPosScaleOffTfm>(nCols, nRows, 611.0 / 700, 0.0,
                                                          437.0 / 500, 0.0, 0, 0));
    vpoTfms.push_back(
        std::make_unique<BufPosScaleOffTfm>(nCols, nRows, -1.3, 633.3, 1.1, -40.7, 3, -2));
    vpoTfms.push_back(std::make_unique<BufPosBilinearTfm>(nCols, nRows, -20.1, 30.3, 500.7, -41.9,
                                                          77.0, 400.0, 650.0, 480.0));
    vpoTfms.push_back(std::make_unique<OddTfm>(nCols, nRows, 1.0));

    for (const auto& poTfm : vpoTfms) {
        SCOPED_TRACE(TransformName(*poTfm));
        ResampleBuffer oWhole(eDT_16U, nCols, nRows, 2);
        poResampler->Resample(oSrc.oBuffer, oWhole, *poTfm);
        for (const int nSize : {64, 100, 1000}) {
            const BlockPlanner oPlanner(*poTfm, 611, 437, *poResampler, nSize, nSize);
            std::vector<std::uint16_t> vnGot(nPix * 2);
            for (long long nBlock = 0; nBlock < oPlanner.GetNumBlocks(); ++nBlock) {
                const ResampleBlock oBlock = oPlanner.GetBlock(nBlock);
                const PixelRect& oFrom = oBlock.oSource;
                const PixelRect& oTo = oBlock.oTarget;
                ResampleBuffer oPart(eDT_16U, oFrom.nCols, oFrom.nRows, 2);
                for (int y = 0; y < oFrom.nRows; ++y) {
                    const int nFirst = (oFrom.nRow + y) * 611 + oFrom.nCol;
                    std::memcpy(oPart.GetBuf() + y * oFrom.nCols * 4,
                                oSrc.oSamples.Get() + nFirst * 4,
                                static_cast<std::size_t>(oFrom.nCols) * 4);
                    std::memcpy(oPart.GetMask() + y * oFrom.nCols, oSrc.oMask.Get() + nFirst,
                                static_cast<std::size_t>(oFrom.nCols));
                }
                ResampleBuffer oTile(eDT_16U, oTo.nCols, oTo.nRows, 2);
                poResampler->Resample(oPart, oTile, oPlanner.GetLocalTfm(oBlock));
                for (int y = 0; y < oTo.nRows; ++y) {
                    std::memcpy(
                        &vnGot[static_cast<std::size_t>((oTo.nRow + y) * nCols + oTo.nCol) * 2],
                        oTile.GetBuf() + y * oTo.nCols * 4,
                        static_cast<std::size_t>(oTo.nCols) * 4);
                }
            }
            EXPECT_EQ(0, std::memcmp(vnGot.data(), oWhole.GetBuf(), nPix * 4)) << nSize;
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Methods, Exactness,
                         testing::Values(eRM_NEAR, eRM_BILIN, eRM_CUBIC, eRM_CUBICPS, eRM_LAGRANGE4,
                                         eRM_LAGRANGE8, eRM_SQNEAR, eRM_SQBILIN, eRM_SQCUBIC,
                                         eRM_SQCUBICPS, eRM_SQLAGRANGE4, eRM_SQLAGRANGE8));

// A forced level is the one that runs, and the best one is the default.
TEST(Levels, AreDistinctAndOrdered) {
    const auto veLevels = engine::GetSupportedLevels();
    ASSERT_FALSE(veLevels.empty());
    EXPECT_EQ(engine::Level::ePortable, veLevels.front());
    EXPECT_EQ(veLevels.back(), engine::GetBestLevel());
    const char* apszNames[] = {"portable", "v2", "v3", "v4"};
    for (const engine::Level eLevel : veLevels) {
        EXPECT_STREQ(apszNames[static_cast<int>(eLevel)], engine::GetStages(eLevel).pszName);
    }
}

}  // namespace
