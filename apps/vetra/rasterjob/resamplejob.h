#ifndef VETRA_APPS_RASTERJOB_RESAMPLEJOB_H
#define VETRA_APPS_RASTERJOB_RESAMPLEJOB_H

#include <optional>
#include <string>
#include <vector>

#include "gdalraster/grid.h"
#include "gdalraster/nodatavalue.h"
#include "vetra/base/utils/resample/resampleinfo.h"
#include "vetra/basic/gobs/raster/datatypeadapter.h"

namespace vetra::tool {

/// What a user asks for.
struct ResampleOptions {
    std::string sSource;
    std::string sTarget;
    GridRequest oGrid;
    std::string sMethod = "BILIN";                  ///< a resampler string
    std::optional<gobs::NativeDataTypeCode> oType;  ///< that of the source if absent
    std::optional<NodataValue> oNodata;             ///< replaces that of the source's bands
    std::optional<NodataValue> oTargetNodata;       ///< that of the source if absent
    std::optional<utils::NodataFillAction> eFill;   ///< that of the method string if absent
    int nThreads = 0;                               ///< 0 for all processors
    long long nMemoryMb = 512;                      ///< limit for the whole process
    std::string sFormat;                            ///< by the target's extension if empty
    std::vector<std::string> oCreationOptions;
    bool bQuiet = false;
};

/// Resamples an image file block by block. The pixels of the target depend on neither threads nor
/// memory. When it throws, the target's folder is as it was.
///
/// \throws RunError, UsageError, Interrupted and the engine's exceptions.
void RunResample(const ResampleOptions& oOptions);

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_RESAMPLEJOB_H
