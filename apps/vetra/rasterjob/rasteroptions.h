#ifndef VETRA_APPS_RASTERJOB_RASTEROPTIONS_H
#define VETRA_APPS_RASTERJOB_RASTEROPTIONS_H

#include <optional>
#include <string>
#include <vector>

#include "gdalraster/nodatavalue.h"
#include "vetra/base/utils/resample/resampleinfo.h"
#include "vetra/basic/gobs/raster/datatypeadapter.h"

namespace vetra::tool {

/// What a user asks for, whatever the target's grid.
struct RasterOptions {
    std::string sSource;
    std::string sTarget;
    std::string sMethod = "BILIN";                  ///< a resampler string
    std::optional<gobs::NativeDataTypeCode> oType;  ///< that of the source if absent
    std::optional<NodataValue> oNodata;             ///< replaces that of the source's bands
    std::optional<NodataValue> oTargetNodata;       ///< that of the source if absent
    std::optional<utils::NodataFillAction> eFill;   ///< that of the method string if absent
    int nThreads = 0;                               ///< of the resampling; 0 for all processors
    long long nMemoryMb = 512;                      ///< limit for the whole process
    std::string sFormat;                            ///< by the target's extension if empty
    std::vector<std::string> oCreationOptions;
    std::string sOverviews;  ///< a resampler string for halving; no overviews if empty
    bool bQuiet = false;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_RASTEROPTIONS_H
