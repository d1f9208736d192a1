#ifndef VETRA_APPS_METHODS_H
#define VETRA_APPS_METHODS_H

#include <memory>
#include <string>

#include "vetra/base/utils/resample/irasterresampler.h"

namespace vetra::tool {

/// A resampler from a resampler string, for instance "AVERAGE,NUMCOLS=3,NUMROWS=3".
/// \throws UsageError for a string that the library refuses, and for an empty one.
std::unique_ptr<utils::IRasterResampler> MakeResampler(const std::string& sMethod);

/// Whether a method gives samples of the source as they are.
bool IsNearest(const utils::IRasterResampler& oResampler);

/// The method whose mathematics a squared one runs on square roots; any other method itself.
ResampleMethod GetPlainTwin(ResampleMethod eMethod);

/// Resamples one pixel between these types, to see whether the engine can do it.
/// \throws what `utils::Resample` throws.
void RunOnePixel(const utils::ResampleInfo& oInfo, gobs::NativeDataTypeCode eSrcType,
                 gobs::NativeDataTypeCode eTgtType);

/// A method's window and margins for a user to read.
struct WindowText {
    std::string sWindow;   ///< columns x rows
    std::string sMargins;  ///< left, top, right, bottom
};
WindowText DescribeWindow(const utils::IRasterResampler& oResampler);

/// All methods with their keys, for a user to read.
std::string DescribeMethods();

/// The method that a resampler string makes: its coefficients, window and margins.
/// \throws UsageError as `MakeResampler`.
std::string DescribeMethod(const std::string& sMethod);

}  // namespace vetra::tool

#endif  // VETRA_APPS_METHODS_H
