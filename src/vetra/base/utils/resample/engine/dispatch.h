#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_DISPATCH_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_DISPATCH_H

#include "vetra/base/utils/resample/engine/task.h"
#include "vetra/base/utils/resample/resample.h"

namespace vetra::utils::engine {

/// The public `Resample` with options of the loop.
void Resample(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
              const ResampleInfo& oResParms, const RunOptions& oOptions);

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_DISPATCH_H
