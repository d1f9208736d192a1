#ifndef VETRA_BASE_UTILS_RESAMPLE_RESAMPLERSTRING_H
#define VETRA_BASE_UTILS_RESAMPLE_RESAMPLERSTRING_H

#include <string>

#include "vetra/base/utils/resample/resampleinfo.h"

// Private: the resampler strings of `ResamplerFactory`.
namespace vetra::utils {

/// Reads a resampler string that is not empty. Throws as `ResamplerFactory::GetResampleInfo`.
ResampleInfo ReadResamplerString(const std::string& sResParms);

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_RESAMPLERSTRING_H
