#ifndef VETRA_BASIC_GOBS_RASTER_DATATYPEADAPTER_H
#define VETRA_BASIC_GOBS_RASTER_DATATYPEADAPTER_H

#include <string>

#include "vetra/export.h"

namespace vetra::gobs {

/// Type of a pixel's samples. A complex sample holds its real part first, then its imaginary part.
enum NativeDataTypeCode : int {
    eDT_8U = 0,        ///< 8-bit integer without sign
    eDT_8S = 1,        ///< 8-bit integer with sign
    eDT_16U = 2,       ///< 16-bit integer without sign
    eDT_16S = 3,       ///< 16-bit integer with sign
    eDT_32U = 4,       ///< 32-bit integer without sign
    eDT_32S = 5,       ///< 32-bit integer with sign
    eDT_32R = 6,       ///< 32-bit IEEE float
    eDT_64U = 7,       ///< 64-bit integer without sign
    eDT_64S = 8,       ///< 64-bit integer with sign
    eDT_64R = 9,       ///< 64-bit IEEE float
    eDT_C16U = 10,     ///< has a name, but no size: nothing works on it
    eDT_C16S = 11,     ///< complex, of 16-bit integers with sign
    eDT_C32S = 12,     ///< complex, of 32-bit integers with sign
    eDT_C32R = 13,     ///< complex, of 32-bit floats
    eDT_C64R = 14,     ///< complex, of 64-bit floats
    eDT_UNKNOWN = 15,  ///< no type
};

/// Questions about a type code that is known only at run time.
class VETRA_EXPORT DataTypeAdapter {
 public:
    /// Bytes of one sample of one channel, both parts of a complex sample together.
    /// \throws ParameterException for a code without a size: `eDT_C16U`, `eDT_UNKNOWN`, and any
    ///         value outside the enumeration.
    static int ByteSize(NativeDataTypeCode eDataType);

    /// True for `eDT_C16S` to `eDT_C64R`; false for every other value, `eDT_C16U` among them.
    /// \throws ParameterException for `eDT_UNKNOWN`.
    static bool IsComplex(NativeDataTypeCode eDataType);

    /// The type of a complex sample's parts; a code that is not complex comes back unchanged.
    static NativeDataTypeCode ComplexToScalar(NativeDataTypeCode eDataType);

    /// The short name of a type, "8U" to "C64R".
    /// \throws ParameterException for `eDT_UNKNOWN` and any value outside the enumeration.
    static std::string TypeToString(NativeDataTypeCode eDataType);
};

}  // namespace vetra::gobs

#endif  // VETRA_BASIC_GOBS_RASTER_DATATYPEADAPTER_H
