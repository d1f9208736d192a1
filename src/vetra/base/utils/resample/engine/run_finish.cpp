// What all spans end with: values, samples, and their way into the target.

#include <bit>
#include <cstring>

#include "vetra/base/utils/resample/engine/run.h"

namespace vetra::utils::engine {

namespace {

// Picks the broken windows out of a span.
void Pack(const Span& oSpan, PackedWindows& oBroken) {
    int n = 0;
    for (int nFirst = 0; nFirst < oSpan.nPix; nFirst += kWordPixels) {
        std::uint64_t nBits = oSpan.panBroken[nFirst / kWordPixels];
        if (oSpan.nPix - nFirst < kWordPixels) {
            nBits &= (std::uint64_t{1} << (oSpan.nPix - nFirst)) - 1;
        }
        for (; nBits != 0; nBits &= nBits - 1) {
            const int i = nFirst + std::countr_zero(nBits);
            // A branch would be foreseen badly.
            oBroken.anPixel[n] = i;
            n += oSpan.pabyMode[i] == ePO_INTERPOLATED ? 1 : 0;
        }
    }
    oBroken.nPix = n;
    // Whole groups are computed.
    for (; n % kLanes != 0; ++n) {
        oBroken.anPixel[n] = oBroken.anPixel[n - 1];
    }
    for (int k = 0; k < n; ++k) {
        const int i = oBroken.anPixel[k];
        oBroken.anOffset[k] = oSpan.panWindow[i];
        oBroken.adfFracCol[k] = oSpan.padfFracCol[i];
        oBroken.adfFracRow[k] = oSpan.padfFracRow[i];
    }
}
}  // namespace

// The last stages: values and store.
void Run::Finish(const Span& oSpan, const ThreadMemory& oMemory, ValueArrays& oValues) const {
    if (oSpan.pabyCopyMask != nullptr) {
        Copy(oSpan, 0, oSpan.nPix);
        mpfnFillInvalid(oSpan.pabyCopyMask, oSpan.panNearest, oSpan.nPix, moTask.pBackground,
                        TgtPixel(oSpan.nFirst));
        return;
    }
    if (moTask.oOptions.pabyOutcome != nullptr) {
        std::memcpy(moTask.oOptions.pabyOutcome + oSpan.nFirst, oSpan.pabyMode,
                    static_cast<std::size_t>(oSpan.nPix));
    }
    if (oSpan.nModes == kSetUntouched) {
        return;
    }
    if (oSpan.nModes == kSetBackground) {
        FillBackground(oSpan.nFirst, oSpan.nPix);
        return;
    }
    if (mpfnCopy != nullptr) {
        CopyRuns(oSpan);
        return;
    }
    if (mbMediansAreSamples && oSpan.poRows != nullptr && (oSpan.nModes & kSetNearest) == 0) {
        unsigned char* pabySample = oSpan.poRows->GetMedians(oSpan.nFirstCol, oSpan.nPix);
        Clamp(pabySample, oSpan.nPix);
        AddBackground(oSpan, pabySample);
        Deliver(oSpan, 0, pabySample);
        return;
    }
    const bool bWindows = (oSpan.nModes & kSetInterpolated) != 0;
    WindowSpan oWindows;
    oWindows.panOffset = oSpan.panWindow;
    oWindows.padfFracCol = oSpan.padfFracCol;
    oWindows.padfFracRow = oSpan.padfFracRow;
    oWindows.pabyMode = oSpan.ModesUnless(kSetInterpolated);
    oWindows.nPix = oSpan.nPix;
    oWindows.nPitch = mnPitch;
    oWindows.nChan = moTask.nChan;
    oWindows.pabyMask = oSpan.pabyWindowMask;
    oWindows.poGroups = oSpan.poGroups;
    oWindows.pParameters = moTask.pParameters;
    oWindows.padfScratch = oMemory.padfScratch.get();
    PackedWindows& oBroken = oValues.oBroken;
    if (oSpan.panBroken != nullptr) {
        Pack(oSpan, oBroken);
    }
    const bool bAll = (oSpan.nModes & kSetUntouched) == 0;
    const bool bInterleave = mbInterleaves && bAll;
    // Samples are made in whole groups.
    const bool bInPlace = moTask.nChan == 1 && bAll && oSpan.nPix % kLanes == 0;
    ValuesFunction pfnValues = mpfnPixels;
    if (bWindows && pfnValues == nullptr) {
        pfnValues = moStages.apfnValues[oSpan.eValues][moTask.nSrcType];
    }
    for (int nChannel = 0; nChannel < moTask.nChan; nChannel += mnChannels) {
        double* padfValue = oValues.adfValue;
        if (bWindows && oSpan.poRows != nullptr) {
            padfValue = oSpan.poRows->GetValues(nChannel, oSpan.nFirstCol, oSpan.nPix);
        } else if (bWindows) {
            pfnValues(oWindows, oSpan.pWindowSrc + std::ptrdiff_t{nChannel} * mnSrcBytes,
                      padfValue);
        }
        if (oSpan.panBroken != nullptr && oBroken.nPix != 0) {
            ReplaceBroken(oSpan, nChannel, oWindows, oBroken, padfValue);
        }
        for (int i = 0; i < mnChannels; ++i) {
            unsigned char* pabySample =
                bInPlace ? reinterpret_cast<unsigned char*>(TgtPixel(oSpan.nFirst))
                         : oValues.abySample;
            if (bInterleave) {
                pabySample += std::ptrdiff_t{nChannel + i} * kSpanArray * mnTgtBytes;
            }
            MakeSamples(oSpan, nChannel + i, padfValue + i * kSpanArray, pabySample);
            if (!bInterleave && !bInPlace) {
                Deliver(oSpan, nChannel + i, pabySample);
            }
        }
    }
    if (bInterleave) {
        moStages.apfnInterleave[moTask.nChan - 3][moTask.nTgtType](oValues.abySample, oSpan.nPix,
                                                                   TgtPixel(oSpan.nFirst));
    }
}

// Makes the values of broken windows.
void Run::ReplaceBroken(const Span& oSpan, int nChannel, WindowSpan oWindows,
                        PackedWindows& oBroken, double* padfValue) const {
    oWindows.panOffset = oBroken.anOffset;
    oWindows.padfFracCol = oBroken.adfFracCol;
    oWindows.padfFracRow = oBroken.adfFracRow;
    oWindows.pabyMode = nullptr;
    oWindows.poGroups = nullptr;
    oWindows.nPix = oBroken.nPix;
    moStages.apfnValues[moMethod.eValues][moTask.nSrcType](
        oWindows, oSpan.pWindowSrc + std::ptrdiff_t{nChannel} * mnSrcBytes, oBroken.adfValue);
    for (int i = 0; i < oBroken.nPix; ++i) {
        padfValue[oBroken.anPixel[i]] = oBroken.adfValue[i];
    }
}

// Adds the nearest samples to the values of a channel, makes target samples of them, and puts the
// background among those.
void Run::MakeSamples(const Span& oSpan, int nChannel, double* padfValue,
                      unsigned char* pabySample) const {
    if ((oSpan.nModes & kSetNearest) != 0) {
        const auto& apfnNearest =
            moMethod.bNonNegative ? moStages.apfnNonNegativeNearest : moStages.apfnNearest;
        apfnNearest[moTask.nSrcType](oSpan.pNearestSrc + std::ptrdiff_t{nChannel} * mnSrcBytes,
                                     oSpan.panNearest, oSpan.ModesUnless(kSetNearest), oSpan.nPix,
                                     padfValue);
    }
    moStages.apfnStore[moTask.nTgtType](padfValue, oSpan.nPix, moTask.pLimits, pabySample);
    AddBackground(oSpan, pabySample);
}

// Calls a function with a number as large as a target sample.
template <typename Function>
void Run::WithSampleBits(const Function& fnDo) const {
    switch (mnTgtBytes) {
        case 1:
            fnDo(std::uint8_t{});
            break;
        case 2:
            fnDo(std::uint16_t{});
            break;
        case 4:
            fnDo(std::uint32_t{});
            break;
        default:
            fnDo(std::uint64_t{});
            break;
    }
}

// Puts the background among the samples of one channel.
void Run::AddBackground(const Span& oSpan, void* pSamples) const {
    if ((oSpan.nModes & kSetBackground) == 0) {
        return;
    }
    WithSampleBits([&](auto nBits) {
        decltype(nBits) background;
        std::memcpy(&background, moTask.pBackground, sizeof background);
        // Copies that no store can reach.
        const unsigned char* __restrict pabyMode = oSpan.pabyMode;
        auto* __restrict pabySample = static_cast<unsigned char*>(pSamples);
        const auto nPix = static_cast<std::size_t>(oSpan.nPix);
        for (std::size_t i = 0; i < nPix; ++i) {
            decltype(nBits) sample;
            std::memcpy(&sample, pabySample + i * sizeof sample, sizeof sample);
            sample = pabyMode[i] == ePO_BACKGROUND ? background : sample;
            std::memcpy(pabySample + i * sizeof sample, &sample, sizeof sample);
        }
    });
}

// Writes one channel of a span, but where a pixel stays untouched.
void Run::Deliver(const Span& oSpan, int nChannel, const unsigned char* pabySample) const {
    WithSampleBits([&](auto nBits) {
        constexpr std::size_t kBytes = sizeof nBits;
        const auto nPix = static_cast<std::size_t>(oSpan.nPix);
        const std::size_t nStep = static_cast<std::size_t>(moTask.nChan) * kBytes;
        char* pTgt = TgtPixel(oSpan.nFirst) + static_cast<std::size_t>(nChannel) * kBytes;
        if ((oSpan.nModes & kSetUntouched) != 0) {
            for (std::size_t i = 0; i < nPix; ++i) {
                if (oSpan.pabyMode[i] != ePO_UNTOUCHED) {
                    std::memcpy(pTgt + i * nStep, pabySample + i * kBytes, kBytes);
                }
            }
        } else if (nStep == kBytes) {
            std::memcpy(pTgt, pabySample, nPix * kBytes);
        } else {
            for (std::size_t i = 0; i < nPix; ++i) {
                std::memcpy(pTgt + i * nStep, pabySample + i * kBytes, kBytes);
            }
        }
    });
}

// Nearest sampling without a change of type: whole pixels, clamped where they arrive.
void Run::CopyRuns(const Span& oSpan) const {
    const auto fnRunEnd = [&](int nBegin) {
        int nEnd = nBegin + 1;
        while (nEnd < oSpan.nPix && oSpan.pabyMode[nEnd] == oSpan.pabyMode[nBegin]) {
            ++nEnd;
        }
        return nEnd;
    };
    if ((oSpan.nModes & kSetUntouched) == 0) {
        // Pixels of other modes have places too.
        Copy(oSpan, 0, oSpan.nPix);
        if ((oSpan.nModes & kSetBackground) == 0) {
            return;
        }
        if (moTask.nChan == 1) {
            AddBackground(oSpan, TgtPixel(oSpan.nFirst));
            return;
        }
        for (int nBegin = 0; nBegin < oSpan.nPix;) {
            const void* p = std::memchr(oSpan.pabyMode + nBegin, ePO_BACKGROUND,
                                        static_cast<std::size_t>(oSpan.nPix - nBegin));
            if (p == nullptr) {
                break;
            }
            nBegin = static_cast<int>(static_cast<const unsigned char*>(p) - oSpan.pabyMode);
            const int nEnd = fnRunEnd(nBegin);
            FillBackground(oSpan.nFirst + nBegin, nEnd - nBegin);
            nBegin = nEnd;
        }
        return;
    }
    for (int nBegin = 0; nBegin < oSpan.nPix;) {
        const int nEnd = fnRunEnd(nBegin);
        if (oSpan.pabyMode[nBegin] == ePO_NEAREST) {
            Copy(oSpan, nBegin, nEnd);
        } else if (oSpan.pabyMode[nBegin] == ePO_BACKGROUND) {
            FillBackground(oSpan.nFirst + nBegin, nEnd - nBegin);
        }
        nBegin = nEnd;
    }
}

void Run::Copy(const Span& oSpan, int nBegin, int nEnd) const {
    char* pTgt = TgtPixel(oSpan.nFirst + nBegin);
    mpfnCopy(oSpan.pNearestSrc, oSpan.panNearest + nBegin, nEnd - nBegin, moTask.nChan, pTgt);
    Clamp(pTgt, static_cast<std::int64_t>(nEnd - nBegin) * moTask.nChan);
}

// Clamps samples of an integer type that took no way through a double.
void Run::Clamp(void* pSamples, std::int64_t nSamples) const {
    if (!moTask.bClampIsOpen) {
        moStages.apfnClamp[moTask.nTgtType](pSamples, nSamples, moTask.pLimits);
    }
}

void Run::FillBackground(long long nFirst, int nPix) const {
    char* pTgt = TgtPixel(nFirst);
    const long long nBytes = static_cast<long long>(nPix) * moTask.nChan * mnTgtBytes;
    for (long long i = 0; i < nBytes; i += mnTgtBytes) {
        std::memcpy(pTgt + i, moTask.pBackground, static_cast<std::size_t>(mnTgtBytes));
    }
}

}  // namespace vetra::utils::engine
