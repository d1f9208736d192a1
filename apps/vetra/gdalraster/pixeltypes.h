#ifndef VETRA_APPS_GDALRASTER_PIXELTYPES_H
#define VETRA_APPS_GDALRASTER_PIXELTYPES_H

#include <gdal_priv.h>

#include <cstdint>
#include <optional>
#include <string>
#include <utility>

#include "gdalraster/errors.h"
#include "vetra/basic/gobs/raster/datatypeadapter.h"

namespace vetra::tool {

/// The type of a band's samples.
/// \throws RunError when the engine has no such type.
gobs::NativeDataTypeCode GetPixelType(GDALRasterBand& oBand);

/// The type that files hold for \p eType. Signed bytes are `GDT_Byte` with the structure item
/// PIXELTYPE=SIGNEDBYTE where GDAL has no type of their own.
GDALDataType ToGdalType(gobs::NativeDataTypeCode eType);

/// Whether signed bytes are marked by the structure item, not by a type of their own.
bool IsMarkedSignedByte(gobs::NativeDataTypeCode eType);

/// The type of a short name ("8U" to "C64R", in any case) that has a size.
std::optional<gobs::NativeDataTypeCode> FindPixelType(const std::string& sName);

/// All short names that `FindPixelType` knows, with a separator between them.
std::string GetPixelTypeNames();

/// Calls \p oFunction with a zero of the type of a sample's parts.
template <class Function>
void WithPartType(gobs::NativeDataTypeCode eType, Function&& oFunction) {
    switch (gobs::DataTypeAdapter::ComplexToScalar(eType)) {
        case gobs::eDT_8U:
            return oFunction(std::uint8_t{});
        case gobs::eDT_8S:
            return oFunction(std::int8_t{});
        case gobs::eDT_16U:
            return oFunction(std::uint16_t{});
        case gobs::eDT_16S:
            return oFunction(std::int16_t{});
        case gobs::eDT_32U:
            return oFunction(std::uint32_t{});
        case gobs::eDT_32S:
            return oFunction(std::int32_t{});
        case gobs::eDT_32R:
            return oFunction(float{});
        case gobs::eDT_64U:
            return oFunction(std::uint64_t{});
        case gobs::eDT_64S:
            return oFunction(std::int64_t{});
        case gobs::eDT_64R:
            return oFunction(double{});
        default:
            throw RunError("pixel type without samples");
    }
}

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_PIXELTYPES_H
