#include "vetra/base/utils/resample/resamplerfactory.h"

#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <limits>
#include <memory>
#include <random>
#include <string>
#include <typeinfo>
#include <vector>

#include "tests/support/refusal.h"
#include "tests/support/scratchfolder.h"
#include "vetra/vetra.h"

namespace vetra::utils {
namespace {

using tests::ExpectRefusal;

constexpr double kLowest = std::numeric_limits<double>::lowest();
constexpr double kHighest = std::numeric_limits<double>::max();

using Resampler = std::unique_ptr<IRasterResampler>;

template <typename... Args>
Resampler Make(const Args&... args) {
    return Resampler(ResamplerFactory().GetResampler(args...));
}
Resampler Squared(const IRasterResampler& oSrc) {
    return Resampler(ResamplerFactory().GetSquaredResampler(&oSrc));
}
Resampler Complex(const IRasterResampler& oSrc, double dfFc) {
    return Resampler(ResamplerFactory().GetComplexSarResampler(&oSrc, dfFc));
}
ResampleInfo Read(const std::string& sResParms) {
    return ResamplerFactory().GetResampleInfo(sResParms);
}
ResampleMethod Method(int nMethod) { return static_cast<ResampleMethod>(nMethod); }

// A caller's resampler with any parameters.
class OwnResampler : public IRasterResampler {
 public:
    explicit OwnResampler(int nMethod, const CoefficientMap& oCoefficients = {}) {
        ResampleInfo oInfo;
        oInfo.meMethod = Method(nMethod);
        oInfo.moCoefficients = oCoefficients;
        SetResampleInfo(oInfo);
    }
    OwnResampler* Clone() const override { return new OwnResampler(*this); }
};

void ExpectDataException(const std::string& sMessage, const std::function<void()>& fnCall) {
    try {
        fnCall();
        ADD_FAILURE() << "nothing was thrown instead of \"" << sMessage << '"';
    } catch (const DataException& oCaught) {
        EXPECT_TRUE(typeid(oCaught) == typeid(DataException));
        EXPECT_EQ(oCaught.GetMessage(), sMessage);
        EXPECT_NE(oCaught.GetLine(), 0u);
    }
}

void ExpectMissingCoefficient(const std::string& sKey, const std::function<void()>& fnCall) {
    ExpectRefusal({"sName", 1, sKey, "",
                   "This resampler requires a coefficient '" + sKey +
                       "' which was not found in the coefficient map"},
                  fnCall);
}

TEST(ResamplerFactory, Names) {
    EXPECT_EQ(ResamplerFactory::MethodToName(eRM_CUSTOM), "CUSTOM");
    EXPECT_EQ(ResamplerFactory::MethodToName(eRM_LAGRANGE8), "LAGRANGE8");
    for (int nMethod = 0; nMethod < 25; ++nMethod) {
        const std::string sName = ResamplerFactory::MethodToName(Method(nMethod));
        EXPECT_EQ(ResamplerFactory::NameToMethod(ToLower("\t" + sName + " ")), nMethod) << sName;
        EXPECT_EQ(sName.substr(0, 2) == "SQ", nMethod > 12) << sName;
    }
    for (const int nMethod : {-1, 26, 1000}) {
        ExpectRefusal(
            {"eMethod", 1, "", "",
             "Given resampler method was not recognized (potentially uninitialized variable)"},
            [&] { ResamplerFactory::MethodToName(Method(nMethod)); });
    }
    for (const char* pszName : {"CUSTOM", "BIL", "8PT", "", "NEAR EST"}) {
        ExpectRefusal({"sName", 1, pszName, "",
                       FormatString("Resampler name '%s' was not recognized", pszName)},
                      [&] { ResamplerFactory::NameToMethod(ToLower(std::string(pszName) + " ")); });
    }
}

TEST(ResamplerFactory, Strings) {
    struct {
        const char* pszString;
        int nMethod;
        CoefficientMap oCoefficients = {};
        double dfMin = kLowest;
        double dfMax = kHighest;
        int nFill = 0;
    } const aoCases[] = {
        {"", 1},
        {"cubic, min=0, max=255, fill=bgd", 1, {}, 0.0, 255.0, 1},
        {" Near ,\t MIN = -1e3 ,max=+.5,Fill = nn ", 3, {}, -1000.0, 0.5},
        {"NEAR,,MIN=1,", 3, {}, 1.0},
        {", ,NEAR, ,MIN=1", 3, {}, 1.0},
        {"NEAR,MIN=9,MAX=2", 3, {}, 9.0, 2.0},
        {"NEAR,\"a,b\"=c,BETA=x,NUMCOLS=y,FILE=z,=1,MIN=2", 3, {}, 2.0},
        {"AVERAGE,NUMCOLS=3,NUMROWS=3,numCols= 5.5 ", 6, {{"NUMCOLS", "5.5"}, {"NUMROWS", "3"}}},
        {"sqmedian,numrows=3,numcols=-1", 20, {{"NUMCOLS", "-1"}, {"NUMROWS", "3"}}},
        {"CPLXSAR,NUMCOLS=7,NUMROWS=9", 8, {{"NUMCOLS", "7"}, {"NUMROWS", "9"}}},
        {"CPLXSAR,NUMCOLS=7,NUMROWS=9,FC=1d-1",
         8,
         {{"FC", "1d-1"}, {"NUMCOLS", "7"}, {"NUMROWS", "9"}}},
        {"GAUSSIAN", 11},
        {"SQGAUSSIAN,DSFACTORCOL=2,DSFACTORROW=3",
         23,
         {{"DSFACTORCOL", "2"}, {"DSFACTORROW", "3"}}},
        {"sinc8", 4},
        {"SINC16,SHAPINGWINDOW= hann ", 5, {{"SHAPINGWINDOW", "HANN"}}},
        {"SINC8,BETA=2", 4, {{"BETA", "2"}}},
        {"SINC8,SIGMA=abc,BETA=2", 4, {{"BETA", "2"}, {"SIGMA", "abc"}}},
        {"SQSINC8,BETA=2,SHAPINGWINDOW=Kaiser", 17, {{"BETA", "2"}, {"SHAPINGWINDOW", "KAISER"}}},
        {"SQSINC16,SHAPINGWINDOW=gaussian,SIGMA=a=b",
         18,
         {{"SHAPINGWINDOW", "GAUSSIAN"}, {"SIGMA", "a=b"}}},
        {" 8pt ,SHAPINGWINDOW=HANN", 4, {{"SHAPINGWINDOW", "PARABOLA"}}},
        {"16PT", 5, {{"SHAPINGWINDOW", "PARABOLA"}}},
        {"SQ8PT,MAX=1e999", 17, {{"SHAPINGWINDOW", "PARABOLA"}}, kLowest, HUGE_VAL},
        {"sq16pt,ShapingWindow=none", 18, {{"SHAPINGWINDOW", "PARABOLA"}}},
    };
    for (const auto& oCase : aoCases) {
        ResampleInfo oExpected;
        oExpected.meMethod = Method(oCase.nMethod);
        oExpected.moCoefficients = oCase.oCoefficients;
        oExpected.mdfClampMin = oCase.dfMin;
        oExpected.mdfClampMax = oCase.dfMax;
        oExpected.meNodataFillAction = static_cast<NodataFillAction>(oCase.nFill);
        EXPECT_TRUE(Read(oCase.pszString) == oExpected) << oCase.pszString;
    }
}

TEST(ResamplerFactory, StringRefusals) {
    struct {
        const char* pszString;
        const char* pszMessage;
    } const aoWhole[] = {
        {"NEAR, MIN ", "Missing = separator for algorithm parameter 'MIN'"},
        {"bogus,MAX=1,x y", "Missing = separator for algorithm parameter 'x y'"},
        {"average,NUMCOLS=a,NUMROWS=b",
         "Invalid NUMCOLS value 'a' for resampling method 'AVERAGE'"},
        {"MEDIAN,NUMCOLS=1,NUMROWS=1x,FC=c",
         "Invalid NUMROWS value '1x' for resampling method 'MEDIAN'"},
        {"CPLXSAR,NUMCOLS=1,NUMROWS=1,FC=,MIN=d",
         "Invalid FC value '' for resampling method 'CPLXSAR'"},
        {"GAUSSIAN,DSFACTORROW=f,DSFACTORCOL=e",
         "Invalid DSFACTORCOL value 'e' for resampling method 'GAUSSIAN'"},
        {"sqgaussian,DSFACTORROW=F,MAX=h",
         "Invalid DSFACTORROW value 'F' for resampling method 'SQGAUSSIAN'"},
        {"8pt,MAX=1,MIN=0x1", "Invalid MIN value '0x1' for resampling method 'SINC8'"},
        {"NEAR,FILL=none,MAX=nan", "Invalid MAX value 'nan' for resampling method 'NEAR'"},
        {"NEAR,FILL=Near", "Invalid FILL value 'Near' for resampling method 'NEAR'"},
    };
    for (const auto& oCase : aoWhole) {
        ExpectRefusal({"sResParms", 1, oCase.pszString, "", oCase.pszMessage},
                      [&] { Read(oCase.pszString); });
    }
    ExpectRefusal({"sName", 1, "9PT", "", "Resampler name '9PT' was not recognized"},
                  [] { Read("9pt"); });

    struct {
        const char* pszString;
        const char* pszGot;
        const char* pszMessage;
    } const aoValues[] = {
        {"SINC8,SHAPINGWINDOW=foo", "FOO", "Shaping window type 'FOO' was not recognized"},
        {"SINC8,SHAPINGWINDOW=", "", "Shaping window type '' was not recognized"},
        {"SINC8,SHAPINGWINDOW=hann,BETA=2", "HANN", "BETA is not valid for 'HANN' shaping window"},
        {"SQ16PT,BETA=2", "PARABOLA", "BETA is not valid for 'PARABOLA' shaping window"},
        {"SINC16,SHAPINGWINDOW=KAISER,SIGMA=1", "KAISER",
         "SIGMA is not valid for 'KAISER' shaping window"},
        {"SINC8,SHAPINGWINDOW=none,SIGMA=1,BETA=2", "NONE",
         "BETA is not valid for 'NONE' shaping window"},
    };
    for (const auto& oCase : aoValues) {
        ExpectRefusal({"sVal", 1, oCase.pszGot, "", oCase.pszMessage},
                      [&] { Read(oCase.pszString); });
    }

    for (const std::string sString : {",,", " , ", " ", "\t,\n"}) {
        ExpectDataException("Error parsing resampling parameters from string '" + sString + "'",
                            [&] { Read(sString); });
    }
    for (const auto& [pszString, pszKey] : {std::pair("AVERAGE,NUMCOLS=3", "NUMROWS"),
                                            {"CPLXSAR,FC=x", "NUMCOLS"},
                                            {"KERNEL,FILES=x", "FILE"},
                                            {"SQKERNEL", "FILE"}}) {
        ExpectDataException(FormatString("Required key '%s' not found in token list of resampler "
                                         "string",
                                         pszKey),
                            [s = std::string(pszString)] { Read(s); });
    }
    EXPECT_THROW(Read("KERNEL,FILE=/no/such/file"), FileNotFoundException);
}

TEST(ResamplerFactory, KernelFiles) {
    const tests::ScratchFolder oFolder;
    const std::string sFile = oFolder.Write("kernel.csv", "2,1\n0.5,0.5\n0.25,0.75\n");
    const std::vector<double> vdfWeights = {0.5, 0.5, 0.25, 0.75, 0.5, 0.5, 0.25, 0.75};
    const CoefficientMap oExpected = {{"NUMCOLS", "2"}, {"NUMROWS", "2"}, {"NUMSUBPIXELS", "1"}};
    for (const std::string sName : {"KERNEL", "SQKERNEL"}) {
        const std::string sString = sName + ",FILE= " + sFile + " ,MIN=0";
        const ResampleInfo oInfo = Read(sString);
        EXPECT_EQ(oInfo.moCoefficients, oExpected);
        EXPECT_EQ(oInfo.mvdfKernelWeights, vdfWeights);
        EXPECT_TRUE(Make(sString)->GetResampleInfo() == oInfo);
    }
    EXPECT_TRUE(KernelResampler(sFile).GetResampleInfo() ==
                KernelResampler(2, 2, 1, vdfWeights).GetResampleInfo());
    EXPECT_TRUE(SqKernelResampler(sFile).GetResampleInfo() ==
                SqKernelResampler(2, 2, 1, vdfWeights).GetResampleInfo());
    EXPECT_THROW(SqKernelResampler(oFolder.Path("other")), FileNotFoundException);
    // The file's count fits; the size is the constructor's business.
    const std::string sEmpty = oFolder.Write("empty.csv", "0,3\n");
    ExpectRefusal({"nWndNumCols", 1, "0", "Non-zero positive number",
                   "Num cols for kernel resampler must be a non-zero positive number"},
                  [&] { Make("KERNEL,FILE=" + sEmpty); });
}

// A method's resampler, and what a resampler made from its parameters is.
TEST(ResamplerFactory, EveryMethodThereAndBack) {
    ResampleInfo oInfo;
    oInfo.moCoefficients = {{"NUMCOLS", "3"},       {"NUMROWS", "5"},
                            {"NUMSUBPIXELS", "1"},  {"FC", "0.25"},
                            {"DSFACTORCOL", "2.5"}, {"SHAPINGWINDOW", "gaussian"}};
    oInfo.mvdfKernelWeights.assign(16, 0.5);
    oInfo.mdfClampMin = -2.0;
    oInfo.mdfClampMax = 7.0;
    oInfo.mdfOutBgd = 5.0;
    oInfo.mbClampBgd = false;
    oInfo.meNodataFillAction = eNFA_BGD;
    for (int nMethod = 0; nMethod < 25; ++nMethod) {
        SCOPED_TRACE(nMethod);
        oInfo.meMethod =
            ResamplerFactory::NameToMethod(ResamplerFactory::MethodToName(Method(nMethod)));
        const Resampler poFirst = Make(oInfo);
        const ResampleInfo oFirst = poFirst->GetResampleInfo();
        EXPECT_EQ(oFirst.meMethod, nMethod);
        EXPECT_EQ(oFirst.mdfClampMin, -2.0);
        EXPECT_EQ(oFirst.mdfClampMax, 7.0);
        EXPECT_EQ(oFirst.mdfOutBgd, 5.0);
        EXPECT_EQ(oFirst.meNodataFillAction, eNFA_BGD);
        EXPECT_TRUE(oFirst.mbClampBgd);
        if (nMethod == eRM_GAUSSIAN || nMethod == eRM_SQGAUSSIAN) {
            ExpectMissingCoefficient("DSFACTORCOL", [&] { Make(oFirst); });
            ExpectMissingCoefficient("DSFACTORCOL", [&] { Squared(*poFirst); });
            continue;
        }
        EXPECT_TRUE(Make(oFirst)->GetResampleInfo() == oFirst);
        // The squared twin differs in its method, and is its own twin.
        if (nMethod == eRM_CPLXSAR) {
            ExpectRefusal({"poSrc", 1, "", "", "Cannot get squared version of CPLXSAR resampler"},
                          [&] { Squared(*poFirst); });
            continue;
        }
        ResampleInfo oTwin = oFirst;
        oTwin.meMethod = ResamplerFactory::NameToMethod(
            (nMethod < 13 ? "SQ" : "") + ResamplerFactory::MethodToName(Method(nMethod)));
        const Resampler poTwin = Squared(*poFirst);
        EXPECT_TRUE(poTwin->GetResampleInfo() == oTwin);
    }
}

TEST(ResamplerFactory, Resamplers) {
    // Methods alone, and with coefficients.
    EXPECT_EQ(Make(eRM_NEAR)->GetResampleType(), eRM_NEAR);
    EXPECT_EQ(Make(eRM_SINC8)->GetCoefficients(),
              (CoefficientMap{{"SHAPINGWINDOW", "KAISER"}, {"BETA", "9.420000"}}));
    EXPECT_EQ(
        Make(eRM_SQMEDIAN, CoefficientMap{{"numcols", "3.9"}, {"NUMROWS", "5"}})->GetCoefficients(),
        (CoefficientMap{{"NUMCOLS", "3"}, {"NUMROWS", "5"}}));
    EXPECT_EQ(Make("CPLXSAR,NUMCOLS=3,NUMROWS=5")->GetCoefficients().at("FC"),
              "  0.0000000000000000e+00");
    // One factor serves both axes.
    EXPECT_TRUE(Make("GAUSSIAN,DSFACTORCOL=2")->GetResampleInfo() ==
                GaussianResampler(2.0f, 2.0f).GetResampleInfo());
    EXPECT_TRUE(Make("SQGAUSSIAN,DSFACTORCOL=4,DSFACTORROW=1")->GetResampleInfo() ==
                SqGaussianResampler(4.0f, 1.0f).GetResampleInfo());
    ExpectMissingCoefficient("NUMCOLS", [] { Make(eRM_AVERAGE); });
    ExpectMissingCoefficient("NUMROWS", [] {
        Make(eRM_CPLXSAR, CoefficientMap{{"NUMCOLS", "3"}});
    });
    ExpectMissingCoefficient("NUMCOLS", [] { Make(eRM_KERNEL); });
    ExpectMissingCoefficient("NUMSUBPIXELS", [] {
        Make(eRM_SQKERNEL, CoefficientMap{{"NUMCOLS", "3"}, {"NUMROWS", "3"}});
    });
    ExpectMissingCoefficient("DSFACTORCOL", [] { Make("GAUSSIAN,DSFACTORROW=2"); });
    for (const int nMethod : {25, 26, -1}) {
        ExpectRefusal(
            {"eType", 1, "", "", "GetResampler(): The provided resample method was not recognized"},
            [&] { Make(Method(nMethod)); });
    }
    // What passes as a string and fails as a resampler.
    ExpectRefusal(
        {"dfClampMin & dfClampMax", 1, "dfClampMin = 9.000000 dfClampMax = 2.000000",
         "dfClampMin <= dfClampMax", "Min clamp range cannot be greater than max clamp range"},
        [] { Make("NEAR,MIN=9,MAX=2"); });
    ExpectRefusal(
        {"sName", 1, "BETA", "", "The value of 'BETA' is not numeric in the coefficient map."},
        [] { Make("SINC8,BETA=abc"); });
    ExpectRefusal({"BETA", 1, "", "",
                   "BETA value '26.000000' for Kaiser shaping window is too large (must be < 25)"},
                  [] { Make("SINC16,SHAPINGWINDOW=KAISER,BETA=26"); });
    ExpectRefusal({"nWndNumCols", 1, "-1", "Positive number",
                   "Num cols for averaging must be a positive number"},
                  [] { Make("AVERAGE,NUMCOLS=-1,NUMROWS=3"); });
    ExpectRefusal({"fDsFactorRow", 1, "0.500000", ">= 1.0",
                   "Row downsampling factor for gaussian must be a positive number"},
                  [] { Make("GAUSSIAN,DSFACTORCOL=1,DSFACTORROW=0.5"); });
    ExpectRefusal({"dfFc", 1, "0.600000", "[-0.5, 0.5]",
                   "The given central frequency (0.600000) must fall in the range [-0.5, 0.5]"},
                  [] { Make("CPLXSAR,NUMCOLS=3,NUMROWS=5,FC=.6"); });
}

TEST(ResamplerFactory, Squared) {
    const ResamplerFactory oFactory;
    ExpectRefusal({"poSrc", 1, "NULL", "non-NULL", "The poSrc parameter may not be NULL"},
                  [&] { oFactory.GetSquaredResampler(nullptr); });
    ExpectRefusal({"poSrc", 1, "", "", "Cannot get squared version of CUSTOM resampler"},
                  [] { Squared(OwnResampler(25)); });
    for (const int nMethod : {-1, 26}) {
        ExpectRefusal({"poSrc", 1, "", "", "Unrecognized method code for provided resampler"},
                      [&] { Squared(OwnResampler(nMethod)); });
    }
}

TEST(ResamplerFactory, ComplexSar) {
    const CoefficientMap oSource = {{"NUMCOLS", "9"}, {"NUMROWS", "8"}};
    for (int nMethod = -1; nMethod < 27; ++nMethod) {
        SCOPED_TRACE(nMethod);
        OwnResampler oSrc(nMethod, oSource);
        oSrc.SetClampRange(1.0, 2.0);
        oSrc.SetOutBgd(3.0);
        oSrc.SetNodataFillAction(eNFA_BGD);
        const bool bUnrecognized = nMethod < 0 || nMethod > 25 || nMethod == eRM_GAUSSIAN ||
                                   nMethod == eRM_KERNEL || nMethod == eRM_SQGAUSSIAN ||
                                   nMethod == eRM_SQKERNEL;
        if (bUnrecognized || nMethod == eRM_CUSTOM) {
            ExpectRefusal({"poSrc", 1, "", "",
                           bUnrecognized ? "Unrecognized method code for provided resampler" : ""},
                          [&] { Complex(oSrc, 0.1); });
            continue;
        }
        if (nMethod == eRM_CPLXSAR) {
            continue;
        }
        const bool bSixteen = nMethod == eRM_SINC16 || nMethod == eRM_SQSINC16;
        const bool bSized = nMethod == eRM_AVERAGE || nMethod == eRM_MEDIAN ||
                            nMethod == eRM_SQAVERAGE || nMethod == eRM_SQMEDIAN;
        CplxSarResampler oExpected(bSixteen || bSized ? 15 : 7, bSixteen ? 15 : 7, -0.125);
        oExpected.SetClampRange(1.0, 2.0);
        oExpected.SetOutBgd(3.0);
        oExpected.SetNodataFillAction(eNFA_BGD);
        const Resampler poComplex = Complex(oSrc, -0.125);
        EXPECT_TRUE(poComplex->GetResampleInfo() == oExpected.GetResampleInfo());
    }
    // A complex one keeps window and frequency, whatever is asked for.
    const CplxSarResampler oSar(3, 31, 0.375);
    EXPECT_TRUE(Complex(oSar, 99.0)->GetResampleInfo() == oSar.GetResampleInfo());
    // Fourteen decimal places of the frequency arrive.
    double dfFc = 0.0;
    Complex(CubicResampler(), 1.0 / 3.0)->GetResampleInfo().GetCoefficientDouble("FC", dfFc, true);
    EXPECT_EQ(dfFc, 0.33333333333333);

    const ResamplerFactory oFactory;
    ExpectRefusal({"poSrc", 1, "NULL", "non-NULL", "The poSrc parameter may not be NULL"},
                  [&] { oFactory.GetComplexSarResampler(nullptr, 0.0); });
    for (const double dfBad : {-0.75, 1e6, HUGE_VAL, std::nan("")}) {
        const std::string sFc = FormatString("%f", dfBad);
        ExpectRefusal(
            {"dfFc", 1, sFc, "[-0.5, 0.5]",
             "The given central frequency (" + sFc + ") must fall in the range [-0.5, 0.5]"},
            [&] { Complex(NearestResampler(), dfBad); });
    }
    ExpectMissingCoefficient("NUMCOLS", [] { Complex(OwnResampler(eRM_MEDIAN), 0.0); });
}

TEST(ResamplerFactory, Junk) {
    std::mt19937 oRandom(20260714);
    const auto fnBelow = [&](std::size_t n) { return oRandom() % n; };
    std::vector<std::string> vsPieces = {",",
                                         ",",
                                         "=",
                                         "=",
                                         " ",
                                         "\"",
                                         "\t",
                                         std::string(1, '\0'),
                                         "\xff",
                                         "%s%n",
                                         "8PT",
                                         "sq16pt",
                                         "NUMCOLS",
                                         "numrows",
                                         "FC",
                                         "DSFACTORCOL",
                                         "dsfactorrow",
                                         "FILE",
                                         "SHAPINGWINDOW",
                                         "BETA",
                                         "SIGMA",
                                         "min",
                                         "MAX",
                                         "FILL",
                                         "NN",
                                         "bgd",
                                         "KAISER",
                                         "hann",
                                         "GAUSSIAN",
                                         "0",
                                         "1",
                                         "3",
                                         "12",
                                         "-7",
                                         "0.3",
                                         ".",
                                         "1e999",
                                         "-1e999",
                                         "1e-400",
                                         "2d1",
                                         "nan",
                                         "inf",
                                         "0x10"};
    for (int nMethod = 0; nMethod < 26; ++nMethod) {
        vsPieces.push_back(ResamplerFactory::MethodToName(Method(nMethod)));
    }
    const char* apszKeys[] = {"NUMCOLS",     "NUMROWS", "FC",   "DSFACTORCOL",
                              "DSFACTORROW", "FILE",    "BETA", "SIGMA",
                              "MIN",         "MAX",     "FILL", "SHAPINGWINDOW"};
    int nMade = 0;
    for (int i = 0; i < 20000; ++i) {
        std::string sString;
        if (i % 2 == 0) {
            for (std::size_t n = fnBelow(12); n > 0; --n) {
                sString += vsPieces[fnBelow(vsPieces.size())];
            }
        } else {
            // Strings of the right form, with any value.
            sString = ResamplerFactory::MethodToName(Method(static_cast<int>(fnBelow(26))));
            for (std::size_t n = fnBelow(6); n > 0; --n) {
                sString += std::string(",") + apszKeys[fnBelow(std::size(apszKeys))] + "=" +
                           vsPieces[fnBelow(vsPieces.size())];
            }
        }
        try {
            const Resampler poResampler = Make(sString);
            ++nMade;
            EXPECT_LE(poResampler->GetResampleType(), 24);
        } catch (const Exception&) {
            // As any other refusal; nothing else may come out.
        } catch (...) {
            ADD_FAILURE() << '"' << sString << '"';
        }
    }
    EXPECT_GT(nMade, 1000);
}

}  // namespace
}  // namespace vetra::utils
