#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_SAMPLE_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_SAMPLE_H

#include <cstdint>
#include <limits>
#include <type_traits>

#include "vetra/base/utils/resample/engine/task.h"
#include "vetra/base/utils/resample/pixelclamp.h"

namespace vetra::utils::engine {

/// The type code of a real sample type.
template <typename T>
inline constexpr gobs::NativeDataTypeCode kTypeCode = gobs::eDT_UNKNOWN;
template <>
inline constexpr auto kTypeCode<unsigned char> = gobs::eDT_8U;
template <>
inline constexpr auto kTypeCode<signed char> = gobs::eDT_8S;
template <>
inline constexpr auto kTypeCode<unsigned short> = gobs::eDT_16U;
template <>
inline constexpr auto kTypeCode<short> = gobs::eDT_16S;
template <>
inline constexpr auto kTypeCode<unsigned int> = gobs::eDT_32U;
template <>
inline constexpr auto kTypeCode<int> = gobs::eDT_32S;
template <>
inline constexpr auto kTypeCode<float> = gobs::eDT_32R;
template <>
inline constexpr auto kTypeCode<std::uint64_t> = gobs::eDT_64U;
template <>
inline constexpr auto kTypeCode<std::int64_t> = gobs::eDT_64S;
template <>
inline constexpr auto kTypeCode<double> = gobs::eDT_64R;

/// What all sampling templates take, in this order.
template <typename Tin, typename Tout>
struct SamplingArguments {
    const Tin* pSrc;
    int nSrcCols;
    int nSrcRows;
    const unsigned char* pabySrcMask;
    int nNumChan;
    Tout* pTgt;
    int nTgtCols;
    int nTgtRows;
    const unsigned char* pabyTgtMask;
    const IBufPosTfm& oTfm;
    double dfClampMin;
    double dfClampMax;
    double dfOutBgd;
    bool bClampBgd;
    const RunOptions& oOptions;
};

template <typename T>
StoreLimits<T> MakeStoreLimits(const PixelClamp<T>& oClamp) {
    StoreLimits<T> oLimits;
    oLimits.low = oClamp.GetLow();
    oLimits.high = oClamp.GetHigh();
    oLimits.background = oClamp.GetBackground();
    oLimits.bAvoid = oClamp.AvoidsBackground();
    oLimits.tolerance = oClamp.GetTolerance();
    oLimits.replacement = oLimits.background;
    if (oLimits.bAvoid) {
        // The clamp itself says what becomes of the background.
        oClamp.Clamp(static_cast<double>(oLimits.background), &oLimits.replacement);
    }
    return oLimits;
}

/// Runs a method over a pair of sample types.
template <typename Tin, typename Tout>
void Sample(const SamplingArguments<Tin, Tout>& oArgs, const Method& oMethod,
            NodataFillAction eFillAction, const void* pParameters = nullptr) {
    const PixelClamp<Tout> oClamp =
        oArgs.bClampBgd ? PixelClamp<Tout>(oArgs.dfClampMin, oArgs.dfClampMax, oArgs.dfOutBgd)
                        : PixelClamp<Tout>(oArgs.dfClampMin, oArgs.dfClampMax);
    const StoreLimits<Tout> oLimits = MakeStoreLimits(oClamp);
    // Not the clamp's: limits have no say in what is written as background.
    const Tout background = SaturateCast<Tout>(oArgs.dfOutBgd);

    Task oTask;
    oTask.pSrc = oArgs.pSrc;
    oTask.nSrcCols = oArgs.nSrcCols;
    oTask.nSrcRows = oArgs.nSrcRows;
    oTask.pabySrcMask = oArgs.pabySrcMask;
    oTask.nSrcType = kTypeCode<Tin>;
    oTask.pTgt = oArgs.pTgt;
    oTask.nTgtCols = oArgs.nTgtCols;
    oTask.nTgtRows = oArgs.nTgtRows;
    oTask.pabyTgtMask = oArgs.pabyTgtMask;
    oTask.nTgtType = kTypeCode<Tout>;
    oTask.nChan = oArgs.nNumChan;
    oTask.poTfm = &oArgs.oTfm;
    oTask.eFillAction = eFillAction;
    oTask.poMethod = &oMethod;
    oTask.pParameters = pParameters;
    oTask.pLimits = &oLimits;
    oTask.pBackground = &background;
    oTask.bClampIsOpen = !oLimits.bAvoid && oLimits.low == std::numeric_limits<Tout>::lowest() &&
                         oLimits.high == std::numeric_limits<Tout>::max();
    oTask.oOptions = oArgs.oOptions;
    Execute(oTask);
}

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_SAMPLE_H
