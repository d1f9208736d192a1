#include "vetra/base/utils/resample/resampleinfo.h"

#include <algorithm>

#include "vetra/base/utils/string/stringutils.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

bool CaseInsensitiveCompare::operator()(const std::string& a, const std::string& b) const {
    return ToLower(a.c_str()) < ToLower(b.c_str());
}

namespace vetra::utils {

void CheckClampRange(double dfClampMin, double dfClampMax) {
    if (dfClampMin > dfClampMax) {
        throw ParameterException(
            "dfClampMin & dfClampMax", ParameterException::eInvalid,
            FormatString("dfClampMin = %lf dfClampMax = %lf", dfClampMin, dfClampMax),
            "dfClampMin <= dfClampMax", "Min clamp range cannot be greater than max clamp range",
            VETRA_HERE);
    }
}

ResampleInfo::ResampleInfo() = default;

ResampleInfo::ResampleInfo(ResampleMethod eMethod, const CoefficientMap& oCoefficients,
                           double dfClampMin, double dfClampMax, double dfOutBgd,
                           NodataFillAction eFillAction)
    : meMethod(eMethod),
      moCoefficients(oCoefficients),
      mdfClampMin(dfClampMin),
      mdfClampMax(dfClampMax),
      mdfOutBgd(dfOutBgd),
      meNodataFillAction(eFillAction) {
    CheckClampRange(dfClampMin, dfClampMax);
}

ResampleInfo::ResampleInfo(const ResampleInfo& oOther) = default;
ResampleInfo& ResampleInfo::operator=(const ResampleInfo& oOther) = default;
ResampleInfo::~ResampleInfo() = default;

bool ResampleInfo::operator==(const ResampleInfo& oOther) const {
    if (this == &oOther) {
        return true;
    }
    // The map's == compares keys and values as strings, not by the map's ordering.
    return meMethod == oOther.meMethod && moCoefficients == oOther.moCoefficients &&
           mdfClampMin == oOther.mdfClampMin && mdfClampMax == oOther.mdfClampMax &&
           mdfOutBgd == oOther.mdfOutBgd && mbClampBgd == oOther.mbClampBgd &&
           meNodataFillAction == oOther.meNodataFillAction &&
           mvdfKernelWeights == oOther.mvdfKernelWeights;
}

int ResampleInfo::GetCoefficient(const std::string& sName, std::string& sValue,
                                 bool bRequired) const {
    const auto itFound = moCoefficients.find(sName);
    if (itFound != moCoefficients.end()) {
        sValue = itFound->second;
        return 0;
    }
    if (bRequired) {
        throw ParameterException("sName", ParameterException::eInvalid, sName, "",
                                 FormatString("This resampler requires a coefficient '%s' which "
                                              "was not found in the coefficient map",
                                              sName.c_str()),
                                 VETRA_HERE);
    }
    return -1;
}

int ResampleInfo::GetCoefficientDouble(const std::string& sName, double& dfValue,
                                       bool bRequired) const {
    std::string sValue;
    if (GetCoefficient(sName, sValue, bRequired) != 0) {
        return -1;
    }
    if (!IsNumeric(sValue)) {
        throw ParameterException(
            "sName", ParameterException::eInvalid, sName, "",
            FormatString("The value of '%s' is not numeric in the coefficient map.", sName.c_str()),
            VETRA_HERE);
    }
    dfValue = TextToDouble(sValue);
    return 0;
}

int ResampleInfo::GetCoefficientFloat(const std::string& sName, float& fValue,
                                      bool bRequired) const {
    double dfValue = 0.0;
    const int nStatus = GetCoefficientDouble(sName, dfValue, bRequired);
    fValue = static_cast<float>(dfValue);
    return nStatus;
}

int ResampleInfo::GetCoefficientInt(const std::string& sName, int& nValue, bool bRequired) const {
    double dfValue = 0.0;
    const int nStatus = GetCoefficientDouble(sName, dfValue, bRequired);
    nValue = static_cast<int>(std::clamp<double>(dfValue, std::numeric_limits<int>::min(),
                                                 std::numeric_limits<int>::max()));
    return nStatus;
}

}  // namespace vetra::utils
