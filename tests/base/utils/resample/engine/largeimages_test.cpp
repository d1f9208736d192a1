// Sizes at which 16 and 32 bits run out.

#include <sys/mman.h>

#include <cstring>
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

class LargeImages : public testing::TestWithParam<ResampleMethod> {
 protected:
    // Compares all levels to plain evaluation.
    void Compare(ResampleBuffer& oSrc, const IBufPosTfm& oTfm) const {
        const ResampleInfo oInfo = MakeResampler(GetParam())->GetResampleInfo();
        const auto fnTarget = [&] {
            return ResampleBuffer(oSrc.GetDatatype(), oTfm.GetNumCols(), oTfm.GetNumRows(),
                                  oSrc.GetNumChan());
        };
        ResampleBuffer oWant = fnTarget();
        ResampleBuffer oWantView = RealView(oWant);
        std::vector<unsigned char> vbyOutcome;
        ReferenceResample(RealView(oSrc), oWantView, oTfm, oInfo, vbyOutcome);
        const std::size_t nBytes =
            vbyOutcome.size() *
            static_cast<std::size_t>(oSrc.GetNumChan() *
                                     DataTypeAdapter::ByteSize(oSrc.GetDatatype()));
        for (const engine::Level eLevel : engine::GetSupportedLevels()) {
            ResampleBuffer oTgt = fnTarget();
            engine::RunOptions oOptions;
            oOptions.eLevel = eLevel;
            engine::Resample(oSrc, oTgt, oTfm, oInfo, oOptions);
            ASSERT_EQ(0, std::memcmp(oWant.GetBuf(), oTgt.GetBuf(), nBytes))
                << engine::GetStages(eLevel).pszName;
        }
    }

    NativeDataTypeCode Type() const { return GetParam() == eRM_CPLXSAR ? eDT_C16S : eDT_8U; }
};

TEST_P(LargeImages, TargetsWiderThan65536Columns) {
    constexpr int kCols = 70001;
    Random oRandom(3);
    Image oSrc(Type(), 300, 40, 1, false);
    FillSamples(oRandom, Type(), oSrc.oSamples.Get(), oSrc.nSamples);
    Compare(oSrc.oBuffer, BufPosScaleOffTfm(kCols, 2, 300.0 / kCols, 0.0, 1.0, 20.3, 0, 0));

    std::vector<float> vfCol;
    std::vector<float> vfRow;
    for (int i = 0; i < kCols; ++i) {
        vfCol.push_back(static_cast<float>(oRandom.Real(0, 300)));
        vfRow.push_back(static_cast<float>(oRandom.Real(0, 40)));
    }
    Compare(oSrc.oBuffer, BufPosArrayTfm(kCols, 1, vfCol.data(), 0, vfRow.data(), 0, false));
}

TEST_P(LargeImages, SourcesOfMoreThan2To31Samples) {
    // Pages that nobody writes take no memory: only the last rows are filled.
    constexpr int kCols = 46400;
    constexpr int kRows = 46400;
    constexpr int kFilled = 60;
    const std::size_t nPitch = kCols * static_cast<std::size_t>(DataTypeAdapter::ByteSize(Type()));
    const std::size_t nBytes = nPitch * kRows;
    void* pPages = mmap(nullptr, nBytes, PROT_READ | PROT_WRITE,
                        MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
    if (pPages == MAP_FAILED) {
        GTEST_SKIP() << "no address space for " << nBytes << " bytes";
    }
    unsigned char* pabySrc = static_cast<unsigned char*>(pPages);
    Random oRandom(4);
    FillSamples(oRandom, Type(), pabySrc + (kRows - kFilled) * nPitch,
                static_cast<std::size_t>(kFilled) * kCols);
    {
        ResampleBuffer oSrc(Type(), kCols, kRows, 1, pabySrc, nullptr, false);
        Compare(oSrc, BufPosScaleOffTfm(40, 30, 1.37, kCols - 47.2, 1.21, kRows - 38.4, 0, 0));
        const double dfCol = kCols - 46.0;
        const double dfRow = kRows - 40.0;
        Compare(oSrc, BufPosBilinearTfm(40, 30, dfCol, dfRow + 9, dfCol + 30, dfRow, dfCol + 11,
                                        dfRow + 40, dfCol + 45, dfRow + 33));
    }
    munmap(pPages, nBytes);
}

INSTANTIATE_TEST_SUITE_P(Methods, LargeImages, testing::ValuesIn(AllMethods()), MethodName);

}  // namespace
