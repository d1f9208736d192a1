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
#include <utility>
#include <vector>

#include "randomimages.h"
#include "reference.h"
#include "vetra/base/utils/resample/engine/dispatch.h"
#include "vetra/base/utils/resample/postfm/bufposarraytfm.h"
#include "vetra/base/utils/resample/postfm/bufposbilineartfm.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"

using namespace vetra::utils;
using namespace vetra::gobs;

namespace {

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

// Window sizes, and weights that need not be those of any filter.
void SetParameters(Random& oRandom, ResampleInfo& oInfo) {
    int nCols = oRandom.Pick({1, 2, 3, 4, 5, 6, 9, 13});
    int nRows = oRandom.Pick({1, 2, 3, 4, 5, 8, 11, 40});
    int nSubPixels = 64;
    std::size_t nTaps = 0;
    switch (oInfo.meMethod) {
        case eRM_SINC8:
        case eRM_SQSINC8:
            nTaps = 8;
            break;
        case eRM_SINC16:
        case eRM_SQSINC16:
            nTaps = 16;
            break;
        case eRM_KERNEL:
        case eRM_SQKERNEL:
            nSubPixels = oRandom.Pick({0, 1, 3, 64, 100});
            oInfo.moCoefficients["NUMSUBPIXELS"] = std::to_string(nSubPixels);
            [[fallthrough]];
        case eRM_GAUSSIAN:
        case eRM_SQGAUSSIAN:
            nTaps = static_cast<std::size_t>(nCols + nRows);
            break;
        case eRM_AVERAGE:
        case eRM_MEDIAN:
        case eRM_SQAVERAGE:
            if (oRandom.Chance(0.05)) nCols = std::numeric_limits<int>::max();
            break;
        case eRM_SQMEDIAN:
            nCols = std::min(nCols, 11);
            nRows = std::min(nRows, 11);
            break;
        case eRM_CPLXSAR:
            nCols = oRandom.Pick({1, 3, 5, 7, 15, 31});
            nRows = oRandom.Pick({1, 3, 5, 7, 9, 31});
            oInfo.moCoefficients["FC"] = oRandom.Pick({"-0.5", "-0.13", "0", "0.25", "0.5"});
            break;
        default:
            return;
    }
    oInfo.moCoefficients["NUMCOLS"] = std::to_string(nCols);
    oInfo.moCoefficients["NUMROWS"] = std::to_string(nRows);
    const std::size_t nWeights = nTaps * (static_cast<std::size_t>(nSubPixels) + 1);
    oInfo.mvdfKernelWeights.resize(nWeights);
    for (double& df : oInfo.mvdfKernelWeights) {
        df = oRandom.Chance(0.1) ? oRandom.Pick({0.0, -0.0, 1.0}) : oRandom.Real(-0.5, 1.0);
    }
}

ResampleInfo MakeInfo(Random& oRandom, ResampleMethod eMethod) {
    ResampleInfo oInfo;
    oInfo.meMethod = eMethod;
    SetParameters(oRandom, oInfo);
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
        for (const engine::Path ePath : {engine::Path::eBest, engine::Path::ePlain}) {
            const int nThreads = oRandom.Pick({1, 2, 3, 7});
            // Some shortcuts are for runs that nobody asks what became of their pixels.
            const bool bOutcome = oRandom.Pick({false, true});
            SCOPED_TRACE(testing::Message()
                         << engine::GetStages(eLevel).pszName << " path "
                         << engine::GetPathName(ePath) << " threads " << nThreads << " transform "
                         << TransformName(*poTfm) << " source " << nSrcCols << "x" << nSrcRows
                         << " target " << nTgtCols << "x" << nTgtRows << " channels " << nChan);
            omp_set_num_threads(nThreads);
            std::copy(vbyStart.begin(), vbyStart.end(), oTgt.oSamples.Get());
            GuardedBytes oOutcome(vbyWantOutcome.size());
            engine::RunOptions oOptions;
            oOptions.eLevel = eLevel;
            oOptions.ePath = ePath;
            oOptions.pabyOutcome = bOutcome ? oOutcome.Get() : nullptr;
            engine::Resample(oSrc.oBuffer, oTgt.oBuffer, *poTfm, oInfo, oOptions);
            ASSERT_EQ(0, std::memcmp(oTgt.oSamples.Get(), oWant.oSamples.Get(), vbyStart.size()));
            if (bOutcome) {
                ASSERT_EQ(0, std::memcmp(oOutcome.Get(), vbyWantOutcome.data(), oOutcome.Size()));
                ASSERT_TRUE(oOutcome.GuardsHold());
            }
        }
    }
    EXPECT_TRUE(oTgt.oSamples.GuardsHold());
    EXPECT_TRUE(oSrc.oSamples.GuardsHold());
    EXPECT_TRUE(std::equal(vbySrcMask.begin(), vbySrcMask.end(), oSrc.oMask.Get()));
    EXPECT_TRUE(std::equal(vbyTgtMask.begin(), vbyTgtMask.end(), oTgt.oMask.Get()));
}

class Exactness : public testing::TestWithParam<ResampleMethod> {
 protected:
    void TearDown() override { omp_set_num_threads(omp_get_num_procs()); }
};

TEST_P(Exactness, RandomRunsEqualPlainEvaluation) {
    const auto voPairs = AllTypePairs();
    ASSERT_EQ(28u + 10u, voPairs.size());
    for (const TypePair& oPair : voPairs) {
        if (GetParam() == eRM_CPLXSAR && !DataTypeAdapter::IsComplex(oPair.eSrc)) continue;
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
    const ResampleInfo oInfo = MakeResampler(GetParam())->GetResampleInfo();
    const std::vector<NativeDataTypeCode> veTypes =
        GetParam() == eRM_CPLXSAR ? std::vector{eDT_C16S, eDT_C32R}
                                  : std::vector{eDT_8U, eDT_8S, eDT_16S, eDT_32R};
    for (const NativeDataTypeCode eType : veTypes) {
        for (const int nSrcCols : {15, 16, 17, 90}) {
            Image oSrc(eType, nSrcCols, 21, 1, false);
            FillSamples(oRandom, eType, oSrc.oSamples.Get(), oSrc.nSamples);
            for (double dfScale = -3.0; dfScale <= 3.0; dfScale += 0.0625) {
                const double dfOff = (nSrcCols - 61 * dfScale) / 2;
                const BufPosScaleOffTfm oTfm(61, 3, dfScale, dfOff, 1.0, 9.25, 0, 0);
                ResampleBuffer oWant(eType, 61, 3, 1);
                ResampleBuffer oWantView = RealView(oWant);
                std::vector<unsigned char> vbyOutcome;
                ReferenceResample(RealView(oSrc.oBuffer), oWantView, oTfm, oInfo, vbyOutcome);
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

// All positions of a turned image lie inside the source, but for one of a span, which lies at an
// edge, outside or nowhere.
TEST_P(Exactness, OddPositionsAmongInnerOnesEqualPlainEvaluation) {
    constexpr int kSrcCols = 90;
    constexpr int kSrcRows = 70;
    constexpr int kTgtCols = 300;
    constexpr int kTgtRows = 3;
    Random oRandom(17);
    const ResampleInfo oInfo = MakeResampler(GetParam())->GetResampleInfo();
    std::vector<float> vfOdd = {40.0f, NAN, INFINITY, -INFINITY, 3e38f, -3e38f, 2147483648.0f};
    for (const int nSize : {kSrcCols, kSrcRows}) {
        for (const float fEdge : {0.0f, static_cast<float>(nSize)}) {
            for (float fShift = -9.0f; fShift <= 9.0f; fShift += 0.5f) {
                vfOdd.push_back(fEdge + fShift);
                vfOdd.push_back(std::nextafter(fEdge + fShift, -1000.0f));
            }
        }
    }
    for (const NativeDataTypeCode eType : {eDT_C16S, eDT_8U, eDT_32R}) {
        if ((GetParam() == eRM_CPLXSAR) != DataTypeAdapter::IsComplex(eType)) continue;
        Image oSrc(eType, kSrcCols, kSrcRows, 1, false);
        FillSamples(oRandom, RealView(oSrc.oBuffer).GetDatatype(), oSrc.oSamples.Get(),
                    oSrc.oSamples.Size() / static_cast<std::size_t>(DataTypeAdapter::ByteSize(
                                               RealView(oSrc.oBuffer).GetDatatype())));
        std::vector<float> vfCol(kTgtCols * kTgtRows);
        std::vector<float> vfRow(vfCol.size());
        for (std::size_t i = 0; i < vfCol.size(); ++i) {
            const auto x = static_cast<float>(i % kTgtCols);
            const auto y = static_cast<float>(i / kTgtCols);
            vfCol[i] = 20.0f + 0.15f * x + 3.1f * y;
            vfRow[i] = 50.0f - 0.1f * x + 0.9f * y;
        }
        for (const float fOdd : vfOdd) {
            const auto nAt = static_cast<std::size_t>(oRandom.Int(0, kTgtCols * kTgtRows - 1));
            float& fPosition = oRandom.Chance(0.5) ? vfCol[nAt] : vfRow[nAt];
            const float fInner = std::exchange(fPosition, fOdd);
            const BufPosArrayTfm oTfm(kTgtCols, kTgtRows, vfCol.data(), 0, vfRow.data(), 0, false);
            Image oWant(eType, kTgtCols, kTgtRows, 1, false);
            ResampleBuffer oWantView = RealView(oWant.oBuffer);
            std::vector<unsigned char> vbyWantOutcome;
            ReferenceResample(RealView(oSrc.oBuffer), oWantView, oTfm, oInfo, vbyWantOutcome);
            for (const engine::Level eLevel : engine::GetSupportedLevels()) {
                Image oTgt(eType, kTgtCols, kTgtRows, 1, false);
                std::vector<unsigned char> vbyOutcome(vbyWantOutcome.size());
                engine::RunOptions oOptions;
                oOptions.eLevel = eLevel;
                oOptions.pabyOutcome = vbyOutcome.data();
                engine::Resample(oSrc.oBuffer, oTgt.oBuffer, oTfm, oInfo, oOptions);
                SCOPED_TRACE(testing::Message()
                             << engine::GetStages(eLevel).pszName << " position " << fOdd
                             << " at pixel " << nAt << " type " << eType);
                ASSERT_EQ(vbyWantOutcome, vbyOutcome);
                ASSERT_EQ(0, std::memcmp(oWant.oSamples.Get(), oTgt.oSamples.Get(),
                                         oWant.oSamples.Size()));
            }
            fPosition = fInner;
        }
    }
}

// Windows at unit scale, where those of neighbours overlap: every size up to the larger ones, and
// positions that begin outside.
class UnitScale : public Exactness {};

TEST_P(UnitScale, EqualsPlainEvaluation) {
    const ResampleMethod eMethod = GetParam();
    Random oRandom(5);
    for (const NativeDataTypeCode eType : {eDT_8U, eDT_8S, eDT_16U, eDT_16S, eDT_32S, eDT_32R}) {
        for (const int nSize : {1, 2, 3, 4, 5, 6, 7, 9, 11, 16, 17}) {
            ResampleInfo oInfo;
            oInfo.meMethod = eMethod;
            oInfo.mbClampBgd = false;
            const int nCols = oRandom.Pick({nSize, 1, 3, 5});
            const int nRows = nSize;
            if (eMethod == eRM_SQMEDIAN && nSize > 11) continue;
            oInfo.moCoefficients["NUMCOLS"] = std::to_string(nCols);
            oInfo.moCoefficients["NUMROWS"] = std::to_string(nRows);
            const int nTgtCols = oRandom.Pick({31, 64, 100, 300});
            Image oSrc(eType, 290, 60, 1, false);
            FillSamples(oRandom, eType, oSrc.oSamples.Get(), oSrc.nSamples);
            const double dfRowScale = oRandom.Pick({1.0, 1.0, -1.0, 2.0, 0.5});
            const BufPosScaleOffTfm oTfm(nTgtCols, 50, 1.0, oRandom.Pick({0.0, -3.0, 2.25}),
                                         dfRowScale, dfRowScale < 0 ? 55.0 : -2.0, 0, 0);
            ResampleBuffer oWant(eType, nTgtCols, 50, 1);
            std::vector<unsigned char> vbyOutcome;
            ReferenceResample(oSrc.oBuffer, oWant, oTfm, oInfo, vbyOutcome);
            for (const engine::Level eLevel : engine::GetSupportedLevels()) {
                ResampleBuffer oTgt(eType, nTgtCols, 50, 1);
                engine::RunOptions oOptions;
                oOptions.eLevel = eLevel;
                engine::Resample(oSrc.oBuffer, oTgt, oTfm, oInfo, oOptions);
                ASSERT_EQ(0, std::memcmp(oWant.GetBuf(), oTgt.GetBuf(),
                                         vbyOutcome.size() * static_cast<std::size_t>(
                                                                 DataTypeAdapter::ByteSize(eType))))
                    << engine::GetStages(eLevel).pszName << " window " << nCols << " x " << nRows
                    << " type " << eType << " of " << nTgtCols << " columns";
            }
        }
    }
}

// Whatever stands under a mask byte of 0, no target pixel shows it.
TEST_P(Exactness, MaskedSamplesNeverShow) {
    const bool bComplex = GetParam() == eRM_CPLXSAR;
    const auto poResampler = MakeResampler(GetParam());
    for (const NativeDataTypeCode eReal : {eDT_32R, eDT_64R, eDT_16S, eDT_8U}) {
        const NativeDataTypeCode eType = !bComplex                             ? eReal
                                         : eReal == eDT_16S || eReal == eDT_8U ? eDT_C16S
                                                                               : eDT_C32R;
        for (unsigned nSeed = 0; nSeed < 20; ++nSeed) {
            Random oRandom(nSeed);
            const int nChan = oRandom.Pick({1, 3});
            Image oSrc(eType, 60, 50, nChan, true);
            Image oJunk(eType, 60, 50, nChan, true);
            FillSamples(oRandom, eType, oSrc.oSamples.Get(), oSrc.nSamples);
            FillSamples(oRandom, eType, oJunk.oSamples.Get(), oJunk.nSamples);
            const std::size_t nPixelBytes = oSrc.oSamples.Size() / oSrc.oMask.Size();
            for (std::size_t i = 0; i < oSrc.oMask.Size(); ++i) {
                const bool bMasked = oRandom.Chance(0.01);
                oSrc.oMask.Get()[i] = oJunk.oMask.Get()[i] = bMasked ? 0 : 1;
                if (bMasked && !bComplex && eReal == eDT_32R) {
                    const float f = oRandom.Pick({NAN, INFINITY, -32768.0f, -3.4e38f});
                    std::memcpy(oJunk.oSamples.Get() + i * nPixelBytes, &f, sizeof f);
                } else if (!bMasked) {
                    std::memcpy(oJunk.oSamples.Get() + i * nPixelBytes,
                                oSrc.oSamples.Get() + i * nPixelBytes, nPixelBytes);
                }
            }
            poResampler->SetNodataFillAction(oRandom.Pick({eNFA_NN, eNFA_BGD}));
            const auto poTfm = MakeTransform(oRandom, 128, 20, 60, 50);
            ResampleBuffer oTgt(eType, 128, 20, nChan);
            ResampleBuffer oTgtOfJunk(eType, 128, 20, nChan);
            poResampler->Resample(oSrc.oBuffer, oTgt, *poTfm);
            poResampler->Resample(oJunk.oBuffer, oTgtOfJunk, *poTfm);
            ASSERT_EQ(0, std::memcmp(oTgt.GetBuf(), oTgtOfJunk.GetBuf(), 128 * 20 * nPixelBytes));
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Methods, Exactness, testing::ValuesIn(AllMethods()), MethodName);

INSTANTIATE_TEST_SUITE_P(Statistics, UnitScale,
                         testing::Values(eRM_AVERAGE, eRM_MEDIAN, eRM_SQAVERAGE, eRM_SQMEDIAN),
                         MethodName);

// A forced level is the one that runs, and the best one is the default.
// Samples near both ends of their type's range, at positions on nodes, next to them and between:
// products that lose digits or overflow, and quotients of products that do neither.
TEST(Lagrange, SamplesAtTheEndsOfTheRangeEqualPlainEvaluation) {
    constexpr int kSize = 40;
    Random oRandom(11);
    for (const NativeDataTypeCode eType : {eDT_32R, eDT_64R}) {
        Image oSrc(eType, kSize, kSize, 1, false);
        for (std::size_t i = 0; i < oSrc.nSamples; ++i) {
            const bool bFloat = eType == eDT_32R;
            const int nLeast = bFloat ? -149 : -1074;
            const int nExponent =
                oRandom.Pick({nLeast, oRandom.Int(nLeast, nLeast + 200), bFloat ? 127 : 1015});
            const double df = std::ldexp(oRandom.Pick({0.0, 1.0, oRandom.Real(-2, 2)}), nExponent);
            const float f = static_cast<float>(df);
            bFloat ? std::memcpy(oSrc.oSamples.Get() + i * sizeof f, &f, sizeof f)
                   : std::memcpy(oSrc.oSamples.Get() + i * sizeof df, &df, sizeof df);
        }
        for (const ResampleMethod eMethod :
             {eRM_LAGRANGE4, eRM_LAGRANGE8, eRM_SQLAGRANGE4, eRM_SQLAGRANGE8}) {
            ResampleInfo oInfo = MakeResampler(eMethod)->GetResampleInfo();
            oInfo.mbClampBgd = false;
            for (const double dfFirst : {0.0, 0x1p-52, 0x1p-50, 0.5, 1 - 0x1p-53, 0.3}) {
                const BufPosScaleOffTfm oTfm(kSize, kSize, 1.0, dfFirst, 1.0, dfFirst, 0, 0);
                Image oExpected(eDT_64R, kSize, kSize, 1, false);
                std::vector<unsigned char> vbyOutcome;
                ReferenceResample(oSrc.oBuffer, oExpected.oBuffer, oTfm, oInfo, vbyOutcome);
                for (const engine::Level eLevel : engine::GetSupportedLevels()) {
                    for (const engine::Path ePath : {engine::Path::eBest, engine::Path::ePlain}) {
                        Image oTgt(eDT_64R, kSize, kSize, 1, false);
                        engine::RunOptions oOptions;
                        oOptions.eLevel = eLevel;
                        oOptions.ePath = ePath;
                        engine::Resample(oSrc.oBuffer, oTgt.oBuffer, oTfm, oInfo, oOptions);
                        EXPECT_EQ(0, std::memcmp(oExpected.oSamples.Get(), oTgt.oSamples.Get(),
                                                 oTgt.oSamples.Size()))
                            << eMethod << " at " << dfFirst << ", level "
                            << static_cast<int>(eLevel);
                    }
                }
            }
        }
    }
}

// Without a target mask, and where nobody asks what became of the pixels, the source mask alone
// decides about nearest samples.
TEST(Nearest, CopiesUnderASourceMaskEqualPlainEvaluation) {
    constexpr int kCols = 301;
    constexpr int kRows = 5;
    Random oRandom(23);
    const BufPosScaleOffTfm oInside(kCols, kRows, 0.37, 2.25, 3.5, 1.0, 0, 0);
    const BufPosScaleOffTfm oAcross(kCols, kRows, 0.5, -2.0, 6.0, -1.0, 0, 0);
    std::vector<float> vfCols(std::size_t{kCols} * kRows);
    std::vector<float> vfRows(vfCols.size());
    for (std::size_t i = 0; i < vfCols.size(); ++i) {
        vfCols[i] = 3.3f + 0.38f * static_cast<float>(i % kCols);
        vfRows[i] = 0.1f * vfCols[i] + 2.0f * static_cast<float>(i / kCols);
    }
    const BufPosArrayTfm oTurned(kCols, kRows, vfCols.data(), 0, vfRows.data(), 0, false);
    const std::vector<const IBufPosTfm*> vpoTfms = {&oInside, &oAcross, &oTurned};
    for (const NativeDataTypeCode eType : {eDT_8U, eDT_8S, eDT_16U, eDT_32S}) {
        for (const NodataFillAction eFillAction : {eNFA_NN, eNFA_BGD}) {
            for (const IBufPosTfm* poTfm : vpoTfms) {
                Image oSrc(eType, 120, 28, 1, true);
                FillSamples(oRandom, eType, oSrc.oSamples.Get(), oSrc.nSamples);
                for (std::size_t i = 0; i < oSrc.nSamples; ++i) {
                    oSrc.oMask.Get()[i] =
                        static_cast<unsigned char>(oRandom.Pick({0, 1, 1, 1, 1, 1, 1, 255}));
                }
                ResampleInfo oInfo = MakeResampler(eRM_NEAR)->GetResampleInfo();
                oInfo.meNodataFillAction = eFillAction;
                oInfo.mdfOutBgd = 7.0;
                Image oWant(eType, kCols, kRows, 1, false);
                Image oTgt(eType, kCols, kRows, 1, false);
                const std::size_t nBytes = oWant.oSamples.Size();
                std::memset(oWant.oSamples.Get(), 3, nBytes);
                std::vector<unsigned char> vbyOutcome;
                ReferenceResample(oSrc.oBuffer, oWant.oBuffer, *poTfm, oInfo, vbyOutcome);
                for (const engine::Level eLevel : engine::GetSupportedLevels()) {
                    std::memset(oTgt.oSamples.Get(), 3, nBytes);
                    engine::RunOptions oOptions;
                    oOptions.eLevel = eLevel;
                    engine::Resample(oSrc.oBuffer, oTgt.oBuffer, *poTfm, oInfo, oOptions);
                    ASSERT_EQ(0, std::memcmp(oWant.oSamples.Get(), oTgt.oSamples.Get(), nBytes))
                        << engine::GetStages(eLevel).pszName << " type " << eType << " action "
                        << eFillAction << " transform " << TransformName(*poTfm);
                    ASSERT_TRUE(oTgt.oSamples.GuardsHold());
                }
            }
        }
    }
}

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
