#ifndef VETRA_TESTS_BASE_UTILS_RESAMPLE_ENGINE_REFERENCE_H
#define VETRA_TESTS_BASE_UTILS_RESAMPLE_ENGINE_REFERENCE_H

#include <vector>

#include "vetra/base/utils/resample/postfm/ibufpostfm.h"
#include "vetra/base/utils/resample/resamplebuffer.h"
#include "vetra/base/utils/resample/resampleinfo.h"

/// Plain evaluation of a resampling run, one pixel and channel after the other, sharing no code
/// with the library: what the engine's bytes are compared to. Real sample types; complex images are
/// the business of the caller. \p pvbyOutcome takes what became of each pixel.
void ReferenceResample(const vetra::utils::ResampleBuffer& oSrc, vetra::utils::ResampleBuffer& oTgt,
                       const vetra::utils::IBufPosTfm& oTfm,
                       const vetra::utils::ResampleInfo& oInfo,
                       std::vector<unsigned char>& vbyOutcome);

#endif  // VETRA_TESTS_BASE_UTILS_RESAMPLE_ENGINE_REFERENCE_H
