#ifndef VETRA_BASIC_GOBS_RASTER_SAMPLETYPE_H
#define VETRA_BASIC_GOBS_RASTER_SAMPLETYPE_H

#include <cstdint>

#include "vetra/basic/gobs/raster/datatypeadapter.h"

namespace vetra::gobs {

/// Calls \p fnRun with a value of the sample type that a real code stands for.
/// \return false for any other code; \p fnRun is not called then
template <typename Function>
bool WithSampleType(NativeDataTypeCode eType, const Function& fnRun) {
    switch (eType) {
        case eDT_8U:
            fnRun(static_cast<unsigned char>(0));
            return true;
        case eDT_8S:
            fnRun(static_cast<signed char>(0));
            return true;
        case eDT_16U:
            fnRun(static_cast<unsigned short>(0));
            return true;
        case eDT_16S:
            fnRun(static_cast<short>(0));
            return true;
        case eDT_32U:
            fnRun(0u);
            return true;
        case eDT_32S:
            fnRun(0);
            return true;
        case eDT_32R:
            fnRun(0.0f);
            return true;
        case eDT_64U:
            fnRun(std::uint64_t{0});
            return true;
        case eDT_64S:
            fnRun(std::int64_t{0});
            return true;
        case eDT_64R:
            fnRun(0.0);
            return true;
        default:
            return false;
    }
}

}  // namespace vetra::gobs

#endif  // VETRA_BASIC_GOBS_RASTER_SAMPLETYPE_H
