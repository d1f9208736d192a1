#ifndef VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLECPLXSAR_H
#define VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLECPLXSAR_H

#include <memory>

#include "vetra/base/utils/resample/algorithm/cplxsarcoeffs.h"
#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/base/utils/resample/engine/methods.h"
#include "vetra/base/utils/resample/engine/sample.h"
#include "vetra/faultcore/exceptions.h"

/// Radar images: windowed sinc over pairs of real and imaginary channels, with a carrier of dfFc
/// cycles per pixel along the rows. The number of channels is even.
/// \throws ParameterException for a window whose sizes aren't odd numbers from 1 to 31, or dfFc
///         outside -0.5 to 0.5.
template <typename Tin, typename Tout>
void ResampleCplxSar(const vetra::utils::engine::SamplingArguments<Tin, Tout>& oArgs,
                     vetra::utils::NodataFillAction eFillAction, int nWndNumCols, int nWndNumRows,
                     double dfFc) {
    using namespace vetra::utils;
    CheckCplxSarSize(nWndNumCols, nWndNumRows, VETRA_HERE);
    constexpr int kNumPhases = 64;
    double* padfAcross = nullptr;
    double* padfDownReal = nullptr;
    double* padfDownImag = nullptr;
    GetCplxSarCoeffs(nWndNumCols, nWndNumRows, dfFc, kNumPhases, padfAcross, padfDownReal,
                     padfDownImag);
    const std::unique_ptr<double[]> oAcross(padfAcross);
    const std::unique_ptr<double[]> oDownReal(padfDownReal);
    const std::unique_ptr<double[]> oDownImag(padfDownImag);
    const engine::ComplexKernelTables oTables{padfAcross,  padfDownReal, padfDownImag,
                                              nWndNumCols, nWndNumRows,  kNumPhases};
    const engine::Method oMethod = engine::WithWindow(
        engine::kCplxSarMethod, engine::CentredWindow(nWndNumCols, nWndNumRows, true));
    engine::Sample(oArgs, oMethod, eFillAction, &oTables);
}

#endif  // VETRA_BASE_UTILS_RESAMPLE_ALGORITHM_RESAMPLECPLXSAR_H
