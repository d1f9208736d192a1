#ifndef VETRA_APPS_RASTERJOB_RUNPLAN_H
#define VETRA_APPS_RASTERJOB_RUNPLAN_H

#include <memory>

#include "gdalraster/sourceraster.h"
#include "gdalraster/targetraster.h"
#include "rasterjob/rasteroptions.h"
#include "vetra/base/utils/resample/irasterresampler.h"

namespace vetra::tool {

/// What the blocks of a run have in common.
struct RunPlan {
    TargetPlan oTarget;
    std::unique_ptr<utils::IRasterResampler> poResampler;
    /// Pixels without a whole window are filled in a second run, from where they are and not from
    /// where their window starts.
    bool bFillApart = false;
    bool bJoined = false;       ///< all bands are channels of one run
    bool bExactNodata = false;  ///< the nodata value is stored after the run, not by it
};

/// \throws RunError when the source and what a user wants don't go together, UsageError for a
///         method that doesn't exist.
RunPlan MakePlan(const RasterOptions& oOptions, SourceRaster& oSource, const Grid& oGrid);

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_RUNPLAN_H
