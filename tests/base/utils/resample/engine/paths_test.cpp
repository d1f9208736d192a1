// The ways through the sampling loop, one by one and beside each other, on images that are large
// enough for all that they keep: strips, blocks of mask bits, whole groups of channels.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "randomimages.h"
#include "vetra/base/utils/resample/engine/dispatch.h"
#include "vetra/base/utils/resample/postfm/bufposarraytfm.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"

using namespace vetra::utils;
using namespace vetra::gobs;

namespace {

constexpr int kSrcCols = 1300;
constexpr int kSrcRows = 210;
constexpr int kTgtCols = 900;
constexpr int kTgtRows = 40;
constexpr std::size_t kTgtPixels = std::size_t{kTgtCols} * std::size_t{kTgtRows};

BufPosScaleOffTfm AxisAligned(double dfScale, double dfFirst) {
    return {kTgtCols, kTgtRows, dfScale, dfFirst, 1.25, 3.0, 0, 0};
}

// A turned grid, of which some corners lie outside.
std::unique_ptr<BufPosArrayTfm> Turned() {
    auto pafCol = std::make_unique<float[]>(kTgtPixels);
    auto pafRow = std::make_unique<float[]>(kTgtPixels);
    for (std::size_t i = 0; i < kTgtPixels; ++i) {
        const auto x = static_cast<float>(i % kTgtCols);
        const auto y = static_cast<float>(i / kTgtCols);
        pafCol[i] = -20.0f + 1.4f * x - 0.3f * y;
        pafRow[i] = -10.0f + 0.25f * x + 1.2f * y;
    }
    return std::make_unique<BufPosArrayTfm>(kTgtCols, kTgtRows, pafCol.release(), 0,
                                            pafRow.release(), 0, true);
}

std::vector<unsigned char> RunOn(const Image& oSrc, NativeDataTypeCode eTgt, const IBufPosTfm& oTfm,
                                 const ResampleInfo& oInfo, const engine::RunOptions& oOptions) {
    const int nChan = oSrc.oBuffer.GetNumChan();
    ResampleBuffer oTgt(eTgt, kTgtCols, kTgtRows, nChan);
    engine::Resample(oSrc.oBuffer, oTgt, oTfm, oInfo, oOptions);
    const auto* pabyTgt = static_cast<const unsigned char*>(oTgt.GetBuf());
    return {pabyTgt, pabyTgt + static_cast<std::size_t>(kTgtCols * kTgtRows * nChan *
                                                        DataTypeAdapter::ByteSize(eTgt))};
}

ResampleInfo InfoOf(ResampleMethod eMethod, int nWindow) {
    ResampleInfo oInfo = MakeResampler(eMethod)->GetResampleInfo();
    if (eMethod == eRM_AVERAGE || eMethod == eRM_MEDIAN || eMethod == eRM_SQAVERAGE ||
        eMethod == eRM_SQMEDIAN) {
        nWindow = eMethod == eRM_SQMEDIAN ? std::min(nWindow, 11) : nWindow;
        oInfo.moCoefficients["NUMCOLS"] = std::to_string(nWindow);
        oInfo.moCoefficients["NUMROWS"] = std::to_string(nWindow);
    }
    return oInfo;
}

TEST(Paths, EachIsTakenByItsRunsAndGivesThePlainResult) {
    const struct {
        const char* pszPath;
        ResampleMethod eMethod;
        NativeDataTypeCode eType;
        double dfScale;
    } aoCases[] = {
        {"columns", eRM_NEAR, eDT_8U, 0.75},
        {"columns", eRM_BILIN, eDT_8U, 1.4},
        {"columns", eRM_CPLXSAR, eDT_C32R, 1.4},
        {"rows", eRM_SQBILIN, eDT_16U, 1.4},
        {"rows", eRM_AVERAGE, eDT_32R, 1.4},
        {"rows", eRM_MEDIAN, eDT_8U, 1.4},
        {"filtered rows", eRM_CUBIC, eDT_8U, 1.4},
        {"filtered rows", eRM_CUBICPS, eDT_16S, 0.7},
        {"filtered rows", eRM_LAGRANGE8, eDT_64R, 1.4},
        {"filtered rows", eRM_SQSINC16, eDT_32R, 1.0},
        {"sums", eRM_AVERAGE, eDT_16S, 1.4},
        {"sums", eRM_AVERAGE, eDT_8U, 1.0},
        {"medians", eRM_MEDIAN, eDT_8U, 1.0},
        {"medians", eRM_SQMEDIAN, eDT_16U, 1.0},
    };
    Random oRandom(3);
    for (const auto& oCase : aoCases) {
        Image oSrc(oCase.eType, kSrcCols, kSrcRows, 1, false);
        FillSamples(oRandom, oCase.eType, oSrc.oSamples.Get(), oSrc.nSamples);
        const BufPosScaleOffTfm oTfm = AxisAligned(oCase.dfScale, -5.25);
        const ResampleInfo oInfo = InfoOf(oCase.eMethod, 5);
        engine::PathChoice oTaken;
        engine::RunOptions oOptions;
        oOptions.poTaken = &oTaken;
        oOptions.ePath = engine::Path::ePlain;
        const auto vbyPlain = RunOn(oSrc, oCase.eType, oTfm, oInfo, oOptions);
        EXPECT_STREQ("plain", engine::GetPathName(oTaken.ePath));
        for (const engine::Path ePath : {engine::Path::eBest, engine::Path::eColumns}) {
            oOptions.ePath = ePath;
            const auto vbyTaken = RunOn(oSrc, oCase.eType, oTfm, oInfo, oOptions);
            EXPECT_STREQ(ePath == engine::Path::eBest ? oCase.pszPath : "columns",
                         engine::GetPathName(oTaken.ePath))
                << oCase.eMethod << ": " << oTaken.pszWhy;
            EXPECT_TRUE(vbyPlain == vbyTaken) << oCase.eMethod << " by " << oTaken.pszWhy;
        }
    }
    // Turned windows have no rows in common.
    Image oSrc(eDT_8U, kSrcCols, kSrcRows, 1, false);
    FillSamples(oRandom, eDT_8U, oSrc.oSamples.Get(), oSrc.nSamples);
    engine::PathChoice oTaken;
    engine::RunOptions oOptions;
    oOptions.poTaken = &oTaken;
    RunOn(oSrc, eDT_8U, *Turned(), InfoOf(eRM_CUBIC, 4), oOptions);
    EXPECT_STREQ("plain", engine::GetPathName(oTaken.ePath));
}

class PathsOfMethod : public testing::TestWithParam<ResampleMethod> {};

// Masks with few and with many holes, requests, one to five channels; windows as large as a block
// of mask bits.
TEST_P(PathsOfMethod, MasksAndChannelsGiveThePlainResult) {
    const bool bComplex = GetParam() == eRM_CPLXSAR;
    const auto poTurned = Turned();
    for (unsigned nSeed = 0; nSeed < 14; ++nSeed) {
        Random oRandom(nSeed);
        const NativeDataTypeCode eType =
            bComplex ? eDT_C16S : oRandom.Pick({eDT_8U, eDT_8S, eDT_16U, eDT_32R, eDT_64R});
        const int nChan = oRandom.Pick({1, 1, 2, 3, 4, 5});
        Image oSrc(eType, kSrcCols, kSrcRows, nChan, oRandom.Chance(0.8));
        FillSamples(oRandom, eType, oSrc.oSamples.Get(), oSrc.nSamples);
        const double dfHoles = oRandom.Pick({0.0, 0.0005, 0.01, 0.5});
        for (std::size_t i = 0; i < oSrc.oMask.Size(); ++i) {
            oSrc.oMask.Get()[i] =
                oRandom.Chance(dfHoles) ? oRandom.Pick<unsigned char>({0, 0, 7}) : std::uint8_t{1};
        }
        ResampleInfo oInfo = InfoOf(GetParam(), oRandom.Pick({2, 3, 9, 67}));
        oInfo.meNodataFillAction = oRandom.Pick({eNFA_NN, eNFA_BGD});
        const BufPosScaleOffTfm oAligned =
            AxisAligned(oRandom.Pick({1.0, 1.4, 0.6, -1.3, 5.5}), oRandom.Pick({-5.25, 1200.0}));
        const IBufPosTfm& oTfm =
            oRandom.Chance(0.5) ? static_cast<const IBufPosTfm&>(oAligned) : *poTurned;
        engine::RunOptions oOptions;
        std::vector<unsigned char> vbyOutcome(kTgtPixels);
        oOptions.pabyOutcome = vbyOutcome.data();
        oOptions.ePath = engine::Path::ePlain;
        const auto vbyPlain = RunOn(oSrc, eType, oTfm, oInfo, oOptions);
        const auto vbyPlainOutcome = vbyOutcome;
        for (const engine::Level eLevel : engine::GetSupportedLevels()) {
            oOptions.eLevel = eLevel;
            oOptions.ePath = engine::Path::eBest;
            const auto vbyBest = RunOn(oSrc, eType, oTfm, oInfo, oOptions);
            ASSERT_TRUE(vbyPlainOutcome == vbyOutcome)
                << engine::GetStages(eLevel).pszName << " seed " << nSeed;
            ASSERT_TRUE(vbyPlain == vbyBest)
                << engine::GetStages(eLevel).pszName << " seed " << nSeed;
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Methods, PathsOfMethod, testing::ValuesIn(AllMethods()), MethodName);

}  // namespace
