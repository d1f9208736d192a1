#include "vetra/base/utils/resample/resample.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <iterator>
#include <typeinfo>
#include <vector>

#include "tests/support/refusal.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::utils {
namespace {

using tests::ExpectRefusal;
using tests::Refusal;
using namespace gobs;

const Refusal kChannels{"oTgt", 1, "NumChan = 1", "2",
                        "Target raster must have same number of channels as source raster"};
const Refusal kPair{"oTgt", 1, "Datatype", "",
                    "Source and target datatypes are incompatible for resampling"};
Refusal Complex(NativeDataTypeCode eTarget) {
    return {"oTgt", 1, DataTypeAdapter::TypeToString(eTarget), "",
            "Resample conversion between complex and real datatypes is not allowed"};
}

TEST(GetResampleConversionType, AllPairs) {
    constexpr NativeDataTypeCode aeTypes[] = {eDT_8U,   eDT_8S,   eDT_16U,  eDT_16S, eDT_32U,
                                              eDT_32S,  eDT_32R,  eDT_64U,  eDT_64S, eDT_64R,
                                              eDT_C16S, eDT_C32S, eDT_C32R, eDT_C64R};
    // A line per source, a column per target: = same type, F from float, T to float, . refused
    // pair, c complex against real.
    const char* const apszExpected[] = {
        "=.....T...cccc", ".=....T...cccc", "..=...T...cccc", "...=..T...cccc", "....=.T...cccc",
        ".....=T...cccc", "FFFFFF=FFFcccc", "......T=..cccc", "......T.=.cccc", "......T..=cccc",
        "cccccccccc=.T.", "cccccccccc.=T.", "ccccccccccFF=F", "cccccccccc..T=",
    };
    for (std::size_t nSrc = 0; nSrc < std::size(aeTypes); ++nSrc) {
        for (std::size_t nTgt = 0; nTgt < std::size(aeTypes); ++nTgt) {
            SCOPED_TRACE(DataTypeAdapter::TypeToString(aeTypes[nSrc]) + " to " +
                         DataTypeAdapter::TypeToString(aeTypes[nTgt]));
            const ResampleBuffer oSrc(aeTypes[nSrc], 2, 2, 3);
            const ResampleBuffer oTgt(aeTypes[nTgt], 5, 1, 3);
            auto eConv = static_cast<ResampleDatatypeConversion>(99);
            const auto fnCall = [&] { GetResampleConversionType(oSrc, oTgt, eConv); };
            const char cExpected = apszExpected[nSrc][nTgt];
            if (cExpected == '.' || cExpected == 'c') {
                ExpectRefusal(cExpected == 'c' ? Complex(aeTypes[nTgt]) : kPair, fnCall);
            } else {
                fnCall();
            }
            EXPECT_EQ(eConv, cExpected == 'F'   ? 0
                             : cExpected == 'T' ? 1
                             : cExpected == '=' ? 2
                                                : 99);
        }
    }
}

ResampleInfo Method(int nMethod, const CoefficientMap& oCoefficients = {}, int nWeights = 0) {
    ResampleInfo oInfo;
    oInfo.meMethod = static_cast<ResampleMethod>(nMethod);
    oInfo.moCoefficients = oCoefficients;
    oInfo.mvdfKernelWeights.resize(static_cast<std::size_t>(nWeights));
    return oInfo;
}

// Hands both forms of the call to the check. Expects target and outcomes to be as before.
void ExpectUntouched(NativeDataTypeCode eSrc, int nSrcChan, NativeDataTypeCode eTgt, int nTgtChan,
                     const ResampleInfo& oInfo,
                     const std::function<void(const std::function<void()>&)>& fnCheck) {
    const ResampleBuffer oSrc(eSrc, 8, 8, nSrcChan);
    ResampleBuffer oTgt(eTgt, 3, 3, nTgtChan);
    const int nBytes = 9 * nTgtChan * DataTypeAdapter::ByteSize(eTgt);
    std::fill_n(oTgt.GetBuf(), nBytes, static_cast<unsigned char>(0x5a));
    std::vector<unsigned char> abyOutcome(9, 0x5a);
    const BufPosScaleOffTfm oTfm(3, 3, 1.0, 0.0, 1.0, 0.0, 0, 0);
    fnCheck([&] { Resample(oSrc, oTgt, oTfm, oInfo); });
    fnCheck([&] { Resample(oSrc, oTgt, oTfm, oInfo, abyOutcome.data()); });
    EXPECT_EQ(std::count(oTgt.GetBuf(), oTgt.GetBuf() + nBytes, 0x5a), nBytes);
    EXPECT_EQ(std::count(abyOutcome.begin(), abyOutcome.end(), 0x5a), 9);
}

TEST(Resample, RefusesBeforeItWrites) {
    const auto fnMissing = [](const char* pszKey) {
        return Refusal{"sName", 1, pszKey, "",
                       FormatString("This resampler requires a coefficient '%s' which was not "
                                    "found in the coefficient map",
                                    pszKey)};
    };
    const Refusal oMethod{"oResParms", 1, "", "",
                          "The provided resample method was not recognized"};
    const Refusal oWeights{"oResParms.mvdfKernelWeights", 1, "", "",
                           "The number of kernel weights is wrong for this resampler."};
    const CoefficientMap oWindow = {{"NumCols", "3"}, {"numrows", "3"}};
    const CoefficientMap oKernel = {{"NumCols", "3"}, {"numrows", "3.9"}, {"NumSubPixels", "2"}};
    struct Case {
        NativeDataTypeCode eSrc;
        int nSrcChan;
        NativeDataTypeCode eTgt;
        int nTgtChan;
        ResampleInfo oInfo;
        Refusal oRefusal;
    };
    std::vector<Case> aoCases = {
        // The buffers come first, in the order channels, complex, pair; then the method.
        {eDT_8U, 2, eDT_C16S, 1, Method(eRM_CPLXSAR), kChannels},
        {eDT_8U, 2, eDT_C16S, 2, Method(eRM_CPLXSAR), Complex(eDT_C16S)},
        {eDT_C32R, 1, eDT_64R, 1, Method(eRM_NEAR), Complex(eDT_64R)},
        {eDT_8U, 1, eDT_8S, 1, Method(eRM_CPLXSAR), kPair},
        {eDT_C16S, 1, eDT_C64R, 1, Method(eRM_CUSTOM), kPair},
        {eDT_C64R, 2, eDT_C32R, 2, Method(eRM_CUSTOM), oMethod},
        {eDT_32R, 1, eDT_16U, 1, Method(26), oMethod},
        {eDT_8U, 1, eDT_8U, 1, Method(-1), oMethod},
        {eDT_8U,
         1,
         eDT_32R,
         1,
         Method(eRM_AVERAGE, {{"NUMCOLS", "abc"}}),
         {"sName", 1, "NUMCOLS", "",
          "The value of 'NUMCOLS' is not numeric in the coefficient map."}},
        {eDT_C16S, 1, eDT_C32R, 1, Method(eRM_CPLXSAR), fnMissing("NUMCOLS")},
        {eDT_8U, 1, eDT_8U, 1, Method(eRM_GAUSSIAN, oWindow, 389), oWeights},
        {eDT_8U, 1, eDT_8U, 1, Method(eRM_SQGAUSSIAN, oWindow, 389), oWeights},
        {eDT_8U, 1, eDT_8U, 1, Method(eRM_KERNEL, oKernel, 17), oWeights},
        {eDT_8U, 1, eDT_8U, 1, Method(eRM_SQKERNEL, oKernel, 17), oWeights},
        {eDT_8U, 1, eDT_8U, 1, Method(eRM_KERNEL, oWindow, 400), fnMissing("NUMSUBPIXELS")},
        {eDT_8U, 1, eDT_8U, 1, Method(eRM_SINC8, {}, 519), oWeights},
        {eDT_8U, 1, eDT_8U, 1, Method(eRM_SQSINC8), oWeights},
        {eDT_8U, 1, eDT_8U, 1, Method(eRM_SINC16, {}, 1039), oWeights},
        {eDT_8U, 1, eDT_8U, 1, Method(eRM_SQSINC16, {}, 520), oWeights},
    };
    // Parameters that no resampler class would let pass.
    const auto fnSize = [](const char* pszCols, const char* pszRows) -> CoefficientMap {
        return {{"NUMCOLS", pszCols}, {"NUMROWS", pszRows}, {"NUMSUBPIXELS", "0"}, {"FC", "0.6"}};
    };
    const auto fnPositive = [](const char* pszAxis, const char* pszGot, const char* pszWhat) {
        return Refusal{FormatString("nWndNum%s", pszAxis), 1, pszGot, "Positive number",
                       FormatString("Num %s for %s must be a positive number",
                                    pszAxis[0] == 'C' ? "cols" : "rows", pszWhat)};
    };
    const std::vector<std::pair<ResampleInfo, Refusal>> aoSizes = {
        {Method(eRM_AVERAGE, fnSize("0", "0")), fnPositive("Cols", "0", "averaging")},
        {Method(eRM_SQAVERAGE, fnSize("1", "-2")), fnPositive("Rows", "-2", "averaging")},
        {Method(eRM_MEDIAN, fnSize("-2147483648", "3")),
         fnPositive("Cols", "-2147483648", "median")},
        {Method(eRM_SQMEDIAN, fnSize("11", "12")),
         {"nWndNumRows", 1, "12", "Positive number",
          "Num rows for median must be a positive number, max 11"}},
        {Method(eRM_KERNEL, fnSize("-1", "3"), 2),
         {"nWndNumCols", 1, "-1", "Non-zero positive number",
          "Num cols for kernel resampler must be a non-zero positive number"}},
        {Method(eRM_SQKERNEL, fnSize("3", "0"), 3),
         {"nWndNumRows", 1, "0", "Non-zero positive number",
          "Num rows for kernel resampler must be a non-zero positive number"}},
        {Method(eRM_KERNEL, {{"NUMCOLS", "2"}, {"NUMROWS", "2"}, {"NUMSUBPIXELS", "-1"}}),
         {"nSubPixels", 1, "-1", "Positive number",
          "Num of subpixels for kernel resampler must be a positive number"}},
    };
    for (const auto& [oInfo, oRefusal] : aoSizes) {
        aoCases.push_back({eDT_8U, 1, eDT_8U, 1, oInfo, oRefusal});
    }
    aoCases.push_back({eDT_C16S,
                       1,
                       eDT_C16S,
                       1,
                       Method(eRM_CPLXSAR, fnSize("3", "4")),
                       {"nWndNumRows", 1, "4", "Positive odd number",
                        "Num rows for complex SAR resampler must be a positive odd number, max "
                        "31"}});
    aoCases.push_back({eDT_C16S,
                       1,
                       eDT_C16S,
                       1,
                       Method(eRM_CPLXSAR, fnSize("3", "3")),
                       {"dfFc", 1, "0.600000", "[-0.5, 0.5]",
                        "The given central frequency (0.600000) must fall in the range [-0.5, "
                        "0.5]"}});
    for (const int nMethod : {eRM_AVERAGE, eRM_MEDIAN, eRM_GAUSSIAN, eRM_KERNEL, eRM_SQAVERAGE,
                              eRM_SQMEDIAN, eRM_SQGAUSSIAN, eRM_SQKERNEL}) {
        aoCases.push_back({eDT_16S, 1, eDT_16S, 1, Method(nMethod), fnMissing("NUMCOLS")});
        aoCases.push_back(
            {eDT_16S, 1, eDT_16S, 1, Method(nMethod, {{"numcols", "3"}}), fnMissing("NUMROWS")});
    }
    for (std::size_t i = 0; i < aoCases.size(); ++i) {
        SCOPED_TRACE(i);
        const Case& o = aoCases[i];
        ExpectUntouched(o.eSrc, o.nSrcChan, o.eTgt, o.nTgtChan, o.oInfo,
                        [&](const auto& fnCall) { ExpectRefusal(o.oRefusal, fnCall); });
    }
}

TEST(Resample, ComplexMethodRefusesRealData) {
    ExpectUntouched(eDT_8U, 2, eDT_32R, 2, Method(eRM_CPLXSAR), [](const auto& fnCall) {
        try {
            fnCall();
            ADD_FAILURE() << "nothing was thrown";
        } catch (const DataException& oCaught) {
            EXPECT_TRUE(typeid(oCaught) == typeid(DataException));
            EXPECT_EQ(oCaught.GetMessage(), "eRM_CPLXSAR resampling type requires complex data");
        }
    });
    CheckDatatypeOkForResampler(ResampleBuffer(eDT_C16S, 1, 1, 1), Method(eRM_CPLXSAR));
    CheckDatatypeOkForResampler(ResampleBuffer(eDT_8U, 1, 1, 1), Method(eRM_CUSTOM));
}

TEST(Resample, RefusesNullOutcome) {
    const ResampleBuffer oSrc(eDT_8U, 1, 1, 1);
    ResampleBuffer oTgt(eDT_8U, 1, 1, 1);
    const BufPosScaleOffTfm oTfm(1, 1, 1.0, 0.0, 1.0, 0.0, 0, 0);
    EXPECT_THROW(Resample(oSrc, oTgt, oTfm, Method(eRM_NEAR), nullptr), ParameterException);
    EXPECT_EQ(oTgt.GetBuf()[0], 0);
}

}  // namespace
}  // namespace vetra::utils
