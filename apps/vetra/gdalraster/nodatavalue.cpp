#include "gdalraster/nodatavalue.h"

#include <cpl_conv.h>
#include <cpl_string.h>

#include <charconv>
#include <cmath>
#include <limits>
#include <type_traits>
#include <utility>

#include "gdalraster/pixeltypes.h"
#include "vetra/base/utils/resample/resample.h"

namespace vetra::tool {

namespace {

template <class T>
bool IsSameValue(T a, T b) {
    if constexpr (std::is_floating_point_v<T>) {
        return a == b || (std::isnan(a) && std::isnan(b));
    } else {
        return a == b;
    }
}

template <class T>
std::optional<T> ReadInteger(const std::string& sText) {
    T nValue{};
    const char* pszEnd = sText.data() + sText.size();
    const auto [pszStop, eError] = std::from_chars(sText.data(), pszEnd, nValue);
    return eError == std::errc{} && pszStop == pszEnd ? std::optional<T>(nValue) : std::nullopt;
}

// The floating or integer value of a type that equals a double; empty when there is none.
template <class T>
std::optional<T> Convert(double dfValue) {
    if constexpr (std::is_floating_point_v<T>) {
        // Values are often written with fewer digits than would reach the type's exact limit.
        const double dfMax = static_cast<double>(std::numeric_limits<T>::max());
        if (std::isfinite(dfValue) && std::fabs(dfValue) > dfMax) {
            return std::fabs(dfValue) <= dfMax * (1.0 + 1e-6)
                       ? std::optional<T>(static_cast<T>(std::copysign(dfMax, dfValue)))
                       : std::nullopt;
        }
        return static_cast<T>(dfValue);
    } else {
        const double dfLow = static_cast<double>(std::numeric_limits<T>::min());
        const double dfEnd = std::ldexp(1.0, std::numeric_limits<T>::digits);
        if (!(dfValue >= dfLow && dfValue < dfEnd) || dfValue != std::floor(dfValue)) {
            return std::nullopt;
        }
        return static_cast<T>(dfValue);
    }
}

}  // namespace

std::optional<NodataValue> NodataValue::FromText(const std::string& sText) {
    const std::string sNumber = !sText.empty() && sText[0] == '+' ? sText.substr(1) : sText;
    if (const auto nValue = ReadInteger<std::int64_t>(sNumber)) {
        return NodataValue(*nValue);
    }
    if (const auto nValue = ReadInteger<std::uint64_t>(sNumber)) {
        return NodataValue(*nValue);
    }
    char* pszStop = nullptr;
    const double dfValue = CPLStrtod(sText.c_str(), &pszStop);
    if (sText.empty() || pszStop != sText.c_str() + sText.size()) {
        return std::nullopt;
    }
    return NodataValue(dfValue);
}

std::optional<NodataValue> NodataValue::FromBand(GDALRasterBand& oBand) {
    int bHas = FALSE;
    Number oNumber;
    switch (oBand.GetRasterDataType()) {
        case GDT_Int64:
            oNumber = static_cast<std::int64_t>(oBand.GetNoDataValueAsInt64(&bHas));
            break;
        case GDT_UInt64:
            oNumber = static_cast<std::uint64_t>(oBand.GetNoDataValueAsUInt64(&bHas));
            break;
        default:
            oNumber = oBand.GetNoDataValue(&bHas);
            break;
    }
    return bHas ? std::optional<NodataValue>(NodataValue(oNumber)) : std::nullopt;
}

template <class T>
std::optional<T> NodataValue::As() const {
    return std::visit(
        [](auto oValue) -> std::optional<T> {
            if constexpr (std::is_floating_point_v<decltype(oValue)>) {
                return Convert<T>(oValue);
            } else if constexpr (std::is_floating_point_v<T>) {
                return Convert<T>(static_cast<double>(oValue));
            } else {
                return std::in_range<T>(oValue) ? std::optional<T>(static_cast<T>(oValue))
                                                : std::nullopt;
            }
        },
        moNumber);
}

bool NodataValue::Fits(gobs::NativeDataTypeCode eType) const {
    bool bFits = false;
    WithPartType(eType, [&](auto oZero) { bFits = As<decltype(oZero)>().has_value(); });
    return bFits;
}

double NodataValue::AsDouble() const {
    return std::visit([](auto oValue) { return static_cast<double>(oValue); }, moNumber);
}

std::string NodataValue::ToText() const {
    return std::visit(
        [](auto oValue) -> std::string {
            if constexpr (std::is_floating_point_v<decltype(oValue)>) {
                return CPLSPrintf("%.17g", oValue);
            } else {
                return std::to_string(oValue);
            }
        },
        moNumber);
}

bool NodataValue::IsSame(const NodataValue& oOther) const {
    if (std::holds_alternative<double>(moNumber) ||
        std::holds_alternative<double>(oOther.moNumber)) {
        return IsSameValue(AsDouble(), oOther.AsDouble());
    }
    return As<std::int64_t>() == oOther.As<std::int64_t>() &&
           As<std::uint64_t>() == oOther.As<std::uint64_t>();
}

bool NodataValue::Declare(GDALRasterBand& oBand) const {
    switch (oBand.GetRasterDataType()) {
        case GDT_Int64:
            return oBand.SetNoDataValueAsInt64(As<std::int64_t>().value()) == CE_None;
        case GDT_UInt64:
            return oBand.SetNoDataValueAsUInt64(As<std::uint64_t>().value()) == CE_None;
        case GDT_Float32:
        case GDT_CFloat32:
            return oBand.SetNoDataValue(static_cast<double>(As<float>().value())) == CE_None;
        default:
            return oBand.SetNoDataValue(AsDouble()) == CE_None;
    }
}

void NodataValue::Mask(gobs::NativeDataTypeCode eType, const unsigned char* pabySamples,
                       long long nNumPix, unsigned char* pabyMask) const {
    const bool bComplex = gobs::DataTypeAdapter::IsComplex(eType);
    WithPartType(eType, [&](auto oZero) {
        using T = decltype(oZero);
        const std::optional<T> oValue = As<T>();
        if (!oValue) {
            return;
        }
        const T* poSample = reinterpret_cast<const T*>(pabySamples);
        for (long long n = 0; n < nNumPix; ++n) {
            const T* poParts = poSample + (bComplex ? 2 * n : n);
            if (IsSameValue(poParts[0], *oValue) &&
                (!bComplex || IsSameValue(poParts[1], *oValue) || poParts[1] == T{})) {
                pabyMask[n] = 0;
            }
        }
    });
}

bool NodataValue::NeedsExactStore(gobs::NativeDataTypeCode eType) const {
    bool bNeeds = std::isnan(AsDouble());
    WithPartType(eType, [&](auto oZero) {
        using T = decltype(oZero);
        bNeeds = bNeeds || As<T>() != Convert<T>(AsDouble());
    });
    return bNeeds;
}

void NodataValue::StoreBackground(gobs::NativeDataTypeCode eType, const unsigned char* pabyOutcome,
                                  long long nNumPix, int nNumChan,
                                  unsigned char* pabySamples) const {
    const int nParts = gobs::DataTypeAdapter::IsComplex(eType) ? 2 * nNumChan : nNumChan;
    WithPartType(eType, [&](auto oZero) {
        using T = decltype(oZero);
        const T oValue = As<T>().value();
        T* poSamples = reinterpret_cast<T*>(pabySamples);
        for (long long n = 0; n < nNumPix; ++n) {
            if (pabyOutcome[n] == utils::ePO_BACKGROUND) {
                std::fill_n(poSamples + n * nParts, nParts, oValue);
            }
        }
    });
}

}  // namespace vetra::tool
