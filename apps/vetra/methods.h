#ifndef VETRA_APPS_METHODS_H
#define VETRA_APPS_METHODS_H

#include <memory>
#include <string>

#include "vetra/base/utils/resample/irasterresampler.h"

namespace vetra::tool {

/// A resampler by the name of its method, in any case.
/// \throws UsageError for a name that is none, or whose method needs parameters.
std::unique_ptr<utils::IRasterResampler> MakeResampler(const std::string& sMethod);

/// Whether a method gives samples of the source as they are.
bool IsNearest(const utils::IRasterResampler& oResampler);

/// Resamples one pixel between these types, to see whether the engine can do it.
/// \throws what `utils::Resample` throws.
void RunOnePixel(const utils::ResampleInfo& oInfo, gobs::NativeDataTypeCode eSrcType,
                 gobs::NativeDataTypeCode eTgtType);

/// A table of all methods for a user to read.
std::string DescribeMethods();

}  // namespace vetra::tool

#endif  // VETRA_APPS_METHODS_H
