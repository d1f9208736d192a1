#include "vetra/base/utils/resample/resamplerstring.h"

#include <cstddef>
#include <cstdint>
#include <utility>

#include "vetra/base/utils/resample/algorithm/kernelfile.h"
#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/base/utils/resample/resamplerfactory.h"
#include "vetra/base/utils/resample/shapingwindow.h"
#include "vetra/base/utils/string/stringutils.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::utils {
namespace {

// Method names that bring their shaping window along.
constexpr std::pair<const char*, const char*> kAliases[] = {
    {"8PT", "SINC8"}, {"16PT", "SINC16"}, {"SQ8PT", "SQSINC8"}, {"SQ16PT", "SQSINC16"}};

// A resampler string, cut into its parts.
struct Tokens {
    std::string sString;     // as it was given
    std::string sMethod;     // in upper case, aliases resolved
    CoefficientMap oValues;  // by key
};

[[noreturn]] void RefuseString(const std::string& sString, const std::string& sMessage) {
    throw ParameterException("sResParms", ParameterException::eInvalid, sString, "", sMessage,
                             VETRA_HERE);
}

// Cuts a string into the method's token and the values of the keys.
void GetTokenMap(const std::string& sResParms, std::string& sMethod, CoefficientMap& oTokens) {
    bool bMethod = true;
    for (const std::string& sRaw : TokenizeString(sResParms, ",", true, true)) {
        const std::string sToken = TrimWhitespace(sRaw);
        if (sToken.empty()) {
            continue;
        }
        if (std::exchange(bMethod, false)) {
            sMethod = sToken;
            continue;
        }
        const std::size_t nSeparator = sToken.find('=');
        if (nSeparator == std::string::npos) {
            RefuseString(sResParms, FormatString("Missing = separator for algorithm parameter '%s'",
                                                 sToken.c_str()));
        }
        oTokens[ToUpper(TrimWhitespace(sToken.substr(0, nSeparator)))] =
            TrimWhitespace(sToken.substr(nSeparator + 1));
    }
    if (bMethod) {
        throw DataException(
            FormatString("Error parsing resampling parameters from string '%s'", sResParms.c_str()),
            VETRA_HERE);
    }
}

Tokens Cut(const std::string& sResParms) {
    Tokens oTokens;
    oTokens.sString = sResParms;
    GetTokenMap(sResParms, oTokens.sMethod, oTokens.oValues);
    oTokens.sMethod = TrimWhitespace(ToUpper(oTokens.sMethod));
    for (const auto& [pszAlias, pszMethod] : kAliases) {
        if (oTokens.sMethod == pszAlias) {
            oTokens.sMethod = pszMethod;
            oTokens.oValues["SHAPINGWINDOW"] = "PARABOLA";
            break;
        }
    }
    return oTokens;
}

// Looks up a key. Returns 0, or -1 and an empty value for a missing one that isn't required.
int GetEntry(const CoefficientMap& oTokens, const std::string& sKey, std::string& sValue,
             bool bRequired) {
    const auto itFound = oTokens.find(sKey);
    if (itFound != oTokens.end()) {
        sValue = itFound->second;
        return 0;
    }
    if (bRequired) {
        throw DataException(
            FormatString("Required key '%s' not found in token list of resampler string",
                         sKey.c_str()),
            VETRA_HERE);
    }
    sValue.clear();
    return -1;
}

// One key's value on its way into the parameters.
struct Entry {
    const Tokens& oTokens;
    const char* pszKey;
    const std::string& sValue;

    [[noreturn]] void Refuse() const {
        RefuseString(oTokens.sString,
                     FormatString("Invalid %s value '%s' for resampling method '%s'", pszKey,
                                  sValue.c_str(), oTokens.sMethod.c_str()));
    }
    void CheckNumeric() const {
        if (!IsNumeric(sValue)) {
            Refuse();
        }
    }
};

void ReadNumber(const Entry& oEntry, ResampleInfo& oInfo) {
    oEntry.CheckNumeric();
    oInfo.moCoefficients[oEntry.pszKey] = oEntry.sValue;
}

void ReadKernelFile(const Entry& oEntry, ResampleInfo& oInfo) {
    int nCols = 0;
    int nRows = 0;
    int nSubPixels = 0;
    LoadKernelFile(oEntry.sValue, nCols, nRows, nSubPixels, oInfo.mvdfKernelWeights);
    oInfo.moCoefficients = KernelCoefficients(nCols, nRows, nSubPixels);
}

void ReadShapingWindow(const Entry& oEntry, ResampleInfo& oInfo) {
    const CoefficientMap oWindow = {{oEntry.pszKey, ToUpper(oEntry.sValue)}};
    GetShapingWindow(MethodInfo(oInfo.meMethod, oWindow));  // refuses an unknown name
    oInfo.moCoefficients.insert(oWindow.begin(), oWindow.end());
}

// The parameter of one of the windows. It may stand beside that window or beside none.
void ReadWindowParameter(const Entry& oEntry, ResampleInfo& oInfo, const char* pszWindow) {
    std::string sWindow = pszWindow;
    oInfo.GetCoefficient("SHAPINGWINDOW", sWindow, false);
    if (sWindow != pszWindow) {
        throw ParameterException(
            "sVal", ParameterException::eInvalid, sWindow, "",
            FormatString("%s is not valid for '%s' shaping window", oEntry.pszKey, sWindow.c_str()),
            VETRA_HERE);
    }
    oInfo.moCoefficients[oEntry.pszKey] = oEntry.sValue;
}

void ReadBeta(const Entry& oEntry, ResampleInfo& oInfo) {
    ReadWindowParameter(oEntry, oInfo, "KAISER");
}

void ReadSigma(const Entry& oEntry, ResampleInfo& oInfo) {
    ReadWindowParameter(oEntry, oInfo, "GAUSSIAN");
}

void ReadClampMin(const Entry& oEntry, ResampleInfo& oInfo) {
    oEntry.CheckNumeric();
    oInfo.mdfClampMin = TextToDouble(oEntry.sValue);
}

void ReadClampMax(const Entry& oEntry, ResampleInfo& oInfo) {
    oEntry.CheckNumeric();
    oInfo.mdfClampMax = TextToDouble(oEntry.sValue);
}

void ReadFill(const Entry& oEntry, ResampleInfo& oInfo) {
    const std::string sFill = ToUpper(oEntry.sValue);
    if (sFill == "NN") {
        oInfo.meNodataFillAction = eNFA_NN;
    } else if (sFill == "BGD") {
        oInfo.meNodataFillAction = eNFA_BGD;
    } else {
        oEntry.Refuse();
    }
}

// A set of methods, one bit each.
using Methods = std::uint32_t;
template <typename... Method>
constexpr Methods SetOf(Method... eMethod) {
    return ((Methods{1} << eMethod) | ...);
}
constexpr Methods kSincMethods = SetOf(eRM_SINC8, eRM_SINC16, eRM_SQSINC8, eRM_SQSINC16);
constexpr Methods kSizedMethods =
    SetOf(eRM_AVERAGE, eRM_MEDIAN, eRM_SQAVERAGE, eRM_SQMEDIAN, eRM_CPLXSAR);
constexpr Methods kGaussianMethods = SetOf(eRM_GAUSSIAN, eRM_SQGAUSSIAN);
constexpr Methods kKernelMethods = SetOf(eRM_KERNEL, eRM_SQKERNEL);
constexpr Methods kAllMethods = ~Methods{0};

// The keys of resampler strings, in the order in which they are read.
constexpr struct {
    const char* pszKey;
    Methods nMethods;  // those that read the key
    bool bRequired;
    void (*pfnRead)(const Entry& oEntry, ResampleInfo& oInfo);
} kKeys[] = {
    {"NUMCOLS", kSizedMethods, true, ReadNumber},
    {"NUMROWS", kSizedMethods, true, ReadNumber},
    {"FC", SetOf(eRM_CPLXSAR), false, ReadNumber},
    {"DSFACTORCOL", kGaussianMethods, false, ReadNumber},
    {"DSFACTORROW", kGaussianMethods, false, ReadNumber},
    {"FILE", kKernelMethods, true, ReadKernelFile},
    {"SHAPINGWINDOW", kSincMethods, false, ReadShapingWindow},
    {"BETA", kSincMethods, false, ReadBeta},
    {"SIGMA", kSincMethods, false, ReadSigma},
    {"MIN", kAllMethods, false, ReadClampMin},
    {"MAX", kAllMethods, false, ReadClampMax},
    {"FILL", kAllMethods, false, ReadFill},
};

}  // namespace

ResampleInfo ReadResamplerString(const std::string& sResParms) {
    const Tokens oTokens = Cut(sResParms);
    ResampleInfo oInfo = MethodInfo(ResamplerFactory::NameToMethod(oTokens.sMethod));
    for (const auto& oKey : kKeys) {
        std::string sValue;
        if ((oKey.nMethods & SetOf(oInfo.meMethod)) != 0 &&
            GetEntry(oTokens.oValues, oKey.pszKey, sValue, oKey.bRequired) == 0) {
            oKey.pfnRead({oTokens, oKey.pszKey, sValue}, oInfo);
        }
    }
    return oInfo;
}

}  // namespace vetra::utils
