#include "vetra/base/utils/resample/resampleinfo.h"

#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <limits>

#include "tests/support/refusal.h"

namespace vetra::utils {
namespace {

using tests::ExpectRefusal;
using tests::Refusal;

constexpr double kLowest = std::numeric_limits<double>::lowest();
constexpr double kHighest = std::numeric_limits<double>::max();

TEST(ResampleInfo, Construction) {
    const ResampleInfo oDefault;
    const ResampleInfo oExpected(eRM_CUBIC, {}, kLowest, kHighest, kLowest, eNFA_NN);
    EXPECT_TRUE(oDefault == oExpected);
    EXPECT_TRUE(oDefault.mbClampBgd);
    const ResampleInfo oInfo(eRM_NEAR, {{"A", "1"}}, 5.0, 5.0, -2.0, eNFA_BGD);
    EXPECT_EQ(oInfo.meMethod, 3);
    EXPECT_EQ(oInfo.moCoefficients.at("a"), "1");
    EXPECT_EQ(oInfo.mdfClampMin, 5.0);
    EXPECT_EQ(oInfo.mdfOutBgd, -2.0);
    EXPECT_EQ(oInfo.meNodataFillAction, 1);
    EXPECT_TRUE(oInfo.mbClampBgd && oInfo.mvdfKernelWeights.empty());
    ExpectRefusal(
        {"dfClampMin & dfClampMax", 1, "dfClampMin = 5.000000 dfClampMax = 4.000000",
         "dfClampMin <= dfClampMax", "Min clamp range cannot be greater than max clamp range"},
        [] { ResampleInfo(eRM_NEAR, {}, 5.0, 4.0, 0.0, eNFA_NN); });
    // Not greater, so not refused.
    EXPECT_TRUE(std::isnan(ResampleInfo(eRM_NEAR, {}, NAN, 4.0, 0.0, eNFA_NN).mdfClampMin));
}

TEST(ResampleInfo, KeysIgnoreCase) {
    const CaseInsensitiveCompare oLess;
    // '_' lies between the upper- and the lower-case letters; bytes count as unsigned.
    const std::pair<const char*, const char*> aoOrdered[] = {
        {"NUMCOLS", "numrows"}, {"NUM", "numcols"}, {"", "a"}, {"_", "Z"}, {"z", "\xe9"}};
    for (const auto& [pszLess, pszGreater] : aoOrdered) {
        EXPECT_TRUE(oLess(pszLess, pszGreater)) << pszLess;
        EXPECT_FALSE(oLess(pszGreater, pszLess)) << pszLess;
    }
    EXPECT_FALSE(oLess("NUMCOLS", "numCols") || oLess("numCols", "NUMCOLS"));
    EXPECT_FALSE(oLess(std::string("ab\0c", 4), std::string("AB\0d", 4)));  // up to the zero byte
}

TEST(ResampleInfo, Equality) {
    ResampleInfo oBase(eRM_KERNEL, {{"A", "1"}, {"B", "x"}}, 1.0, 2.0, 3.0, eNFA_NN);
    oBase.mvdfKernelWeights = {0.5, 0.25};
    ResampleInfo oCopy;
    oCopy = ResampleInfo(oBase);
    EXPECT_TRUE(oBase == oCopy);
    EXPECT_FALSE(oBase != oCopy);
    const std::function<void(ResampleInfo&)> afnChanges[] = {
        [](ResampleInfo& o) { o.meMethod = eRM_GAUSSIAN; },
        [](ResampleInfo& o) { o.moCoefficients.emplace("C", "1"); },
        [](ResampleInfo& o) {
            o.moCoefficients = {{"A", "1"}, {"B", "X"}};
        },
        [](ResampleInfo& o) {
            o.moCoefficients = {{"A", "1"}, {"b", "x"}};
        },
        [](ResampleInfo& o) {
            o.moCoefficients = {{"A", "1"}, {"C", "x"}};
        },
        [](ResampleInfo& o) { o.mdfClampMin = 0.5; },
        [](ResampleInfo& o) { o.mdfClampMax = 2.5; },
        [](ResampleInfo& o) { o.mdfOutBgd = 0.0; },
        [](ResampleInfo& o) { o.mbClampBgd = false; },
        [](ResampleInfo& o) { o.meNodataFillAction = eNFA_BGD; },
        [](ResampleInfo& o) { o.mvdfKernelWeights.push_back(0.0); },
        [](ResampleInfo& o) { o.mvdfKernelWeights[1] = 0.3; },
    };
    for (std::size_t i = 0; i < std::size(afnChanges); ++i) {
        ResampleInfo oChanged = oBase;
        afnChanges[i](oChanged);
        EXPECT_FALSE(oChanged == oBase) << i;
        EXPECT_TRUE(oChanged != oBase) << i;
    }
    for (double* pdfField :
         {&oCopy.mdfClampMin, &oCopy.mdfClampMax, &oCopy.mdfOutBgd, &oCopy.mvdfKernelWeights[0]}) {
        oCopy = oBase;
        *pdfField = NAN;
        EXPECT_FALSE(oCopy == ResampleInfo(oCopy));
        const ResampleInfo& oItself = oCopy;
        EXPECT_TRUE(oCopy == oItself);
    }
}

TEST(ResampleInfo, Coefficients) {
    ResampleInfo oInfo;
    oInfo.moCoefficients = {{"numcols", "3.9"}, {"NEG", " -2.7 "}, {"Big", "1e300"},
                            {"Word", "abc"},    {"Fc", "2.5e-1"},  {"Low", "-1e10"}};
    std::string sValue;
    double dfValue = 7.0;
    float fValue = 7.0f;
    int nValue = 7;
    EXPECT_EQ(oInfo.GetCoefficient("NumCols", sValue, true), 0);
    EXPECT_EQ(sValue, "3.9");
    EXPECT_EQ(oInfo.GetCoefficientDouble("FC", dfValue, true), 0);
    EXPECT_EQ(dfValue, 0.25);
    EXPECT_EQ(oInfo.GetCoefficientFloat("NUMCOLS", fValue, false), 0);
    EXPECT_EQ(fValue, 3.9f);
    const std::pair<const char*, int> aoInts[] = {
        {"NUMCOLS", 3}, {"neg", -2}, {"BIG", 2147483647}, {"LOW", -2147483647 - 1}};
    for (const auto& [pszKey, nExpected] : aoInts) {
        EXPECT_EQ(oInfo.GetCoefficientInt(pszKey, nValue, true), 0);
        EXPECT_EQ(nValue, nExpected) << pszKey;
    }
    // A missing key leaves text and double alone, and stores 0 as float and integer.
    EXPECT_EQ(oInfo.GetCoefficient("NONE", sValue, false), -1);
    EXPECT_EQ(oInfo.GetCoefficientDouble("NONE", dfValue, false), -1);
    EXPECT_EQ(oInfo.GetCoefficientFloat("NONE", fValue, false), -1);
    EXPECT_EQ(oInfo.GetCoefficientInt("NONE", nValue, false), -1);
    EXPECT_TRUE(sValue == "3.9" && dfValue == 0.25 && fValue == 0.0f && nValue == 0);

    const auto fnExpectRefusal = [&](const char* pszKey, bool bRequired, const char* pszMessage) {
        const Refusal oRefusal{"sName", 1, pszKey, "", pszMessage};
        ExpectRefusal(oRefusal, [&] { oInfo.GetCoefficientDouble(pszKey, dfValue, bRequired); });
        ExpectRefusal(oRefusal, [&] { oInfo.GetCoefficientFloat(pszKey, fValue, bRequired); });
        ExpectRefusal(oRefusal, [&] { oInfo.GetCoefficientInt(pszKey, nValue, bRequired); });
    };
    fnExpectRefusal("None", true,
                    "This resampler requires a coefficient 'None' which was not found in the "
                    "coefficient map");
    fnExpectRefusal("WORD", false, "The value of 'WORD' is not numeric in the coefficient map.");
    EXPECT_THROW(oInfo.GetCoefficient("None", sValue, true), ParameterException);
}

}  // namespace
}  // namespace vetra::utils
