#include "gdalraster/pixeltypes.h"

#include <cpl_string.h>

#include <array>

namespace vetra::tool {

namespace {

using gobs::DataTypeAdapter;

constexpr std::array kTypes = {gobs::eDT_8U,   gobs::eDT_8S,  gobs::eDT_16U,  gobs::eDT_16S,
                               gobs::eDT_32U,  gobs::eDT_32S, gobs::eDT_32R,  gobs::eDT_64U,
                               gobs::eDT_64S,  gobs::eDT_64R, gobs::eDT_C16S, gobs::eDT_C32S,
                               gobs::eDT_C32R, gobs::eDT_C64R};

}  // namespace

gobs::NativeDataTypeCode GetPixelType(GDALRasterBand& oBand) {
    const GDALDataType eGdalType = oBand.GetRasterDataType();
    const char* pszMark = oBand.GetMetadataItem("PIXELTYPE", "IMAGE_STRUCTURE");
    if (eGdalType == GDT_Byte && pszMark != nullptr && EQUAL(pszMark, "SIGNEDBYTE")) {
        return gobs::eDT_8S;
    }
    for (const gobs::NativeDataTypeCode eType : kTypes) {
        if (ToGdalType(eType) == eGdalType && !IsMarkedSignedByte(eType)) {
            return eType;
        }
    }
    throw RunError("band " + std::to_string(oBand.GetBand()) + " has pixels of type " +
                   GDALGetDataTypeName(eGdalType) + ", which can't be resampled");
}

GDALDataType ToGdalType(gobs::NativeDataTypeCode eType) {
    switch (eType) {
        case gobs::eDT_8U:
            return GDT_Byte;
        case gobs::eDT_8S:
#if GDAL_VERSION_NUM >= GDAL_COMPUTE_VERSION(3, 7, 0)
            return GDT_Int8;
#else
            return GDT_Byte;
#endif
        case gobs::eDT_16U:
            return GDT_UInt16;
        case gobs::eDT_16S:
            return GDT_Int16;
        case gobs::eDT_32U:
            return GDT_UInt32;
        case gobs::eDT_32S:
            return GDT_Int32;
        case gobs::eDT_32R:
            return GDT_Float32;
        case gobs::eDT_64U:
            return GDT_UInt64;
        case gobs::eDT_64S:
            return GDT_Int64;
        case gobs::eDT_64R:
            return GDT_Float64;
        case gobs::eDT_C16S:
            return GDT_CInt16;
        case gobs::eDT_C32S:
            return GDT_CInt32;
        case gobs::eDT_C32R:
            return GDT_CFloat32;
        case gobs::eDT_C64R:
            return GDT_CFloat64;
        default:
            return GDT_Unknown;
    }
}

bool IsMarkedSignedByte(gobs::NativeDataTypeCode eType) {
    return eType == gobs::eDT_8S && ToGdalType(eType) == GDT_Byte;
}

std::optional<gobs::NativeDataTypeCode> FindPixelType(const std::string& sName) {
    for (const gobs::NativeDataTypeCode eType : kTypes) {
        if (EQUAL(sName.c_str(), DataTypeAdapter::TypeToString(eType).c_str())) {
            return eType;
        }
    }
    return std::nullopt;
}

std::string GetPixelTypeNames() {
    std::string sNames;
    for (const gobs::NativeDataTypeCode eType : kTypes) {
        sNames += (sNames.empty() ? "" : ", ") + DataTypeAdapter::TypeToString(eType);
    }
    return sNames;
}

}  // namespace vetra::tool
