#ifndef VETRA_APPS_GDALRASTER_NODATAVALUE_H
#define VETRA_APPS_GDALRASTER_NODATAVALUE_H

#include <gdal_priv.h>

#include <cstdint>
#include <optional>
#include <string>
#include <variant>

#include "vetra/basic/gobs/raster/datatypeadapter.h"

namespace vetra::tool {

/// The sample value that marks a pixel without data, exact for every type.
class NodataValue {
 public:
    /// The number that a text reads as: a decimal integer is kept exactly, "nan" and "inf" count.
    /// Empty for any other text.
    static std::optional<NodataValue> FromText(const std::string& sText);
    static std::optional<NodataValue> FromBand(GDALRasterBand& oBand);

    /// Whether a sample of this type can have the value. A number with a fraction between two
    /// values of a floating type counts as the nearest of them.
    bool Fits(gobs::NativeDataTypeCode eType) const;
    double AsDouble() const;
    std::string ToText() const;
    bool IsSame(const NodataValue& oOther) const;

    /// Declares it as the value of a band. \returns false when the driver refuses.
    bool Declare(GDALRasterBand& oBand) const;

    /// Sets the mask byte of every pixel that has the value to 0 and leaves the others. A complex
    /// pixel has it when its real part does and its imaginary part does too or is 0.
    void Mask(gobs::NativeDataTypeCode eType, const unsigned char* pabySamples, long long nNumPix,
              unsigned char* pabyMask) const;

    /// Whether the engine can't write the value as its background: it would round it, or it is NaN.
    /// No computed value equals such a value.
    bool NeedsExactStore(gobs::NativeDataTypeCode eType) const;
    /// Stores the value in every pixel whose outcome is background.
    void StoreBackground(gobs::NativeDataTypeCode eType, const unsigned char* pabyOutcome,
                         long long nNumPix, int nNumChan, unsigned char* pabySamples) const;

 private:
    using Number = std::variant<double, std::int64_t, std::uint64_t>;
    explicit NodataValue(Number oNumber) : moNumber(oNumber) {}
    template <class T>
    std::optional<T> As() const;

    Number moNumber;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_NODATAVALUE_H
