#include "vetra/base/utils/low/copypixel.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <type_traits>

#include "vetra/basic/gobs/raster/sampletype.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::utils::low {

namespace {

using gobs::DataTypeAdapter;
using gobs::NativeDataTypeCode;

// Counts are of 64 bits below the interface: a complex pixel has twice its samples.
using Count = std::uint64_t;

[[noreturn]] void Refuse(const char* pszArgument, const std::string& sMessage) {
    throw ParameterException(pszArgument, ParameterException::eInvalid, "", "", sMessage,
                             VETRA_HERE);
}

// Calls fnRun with a value of the type that a copy type stands for; false for any other code.
template <typename Function>
bool WithCopyType(NativeDataTypeCode eType, const Function& fnRun) {
    bool bKnown = true;
    return gobs::WithSampleType(eType,
                                [&]<typename T>(T value) {
                                    if constexpr (std::is_integral_v<T> && sizeof(T) == 8) {
                                        bKnown = false;
                                    } else {
                                        fnRun(value);
                                    }
                                }) &&
           bKnown;
}

void CopyBytes(unsigned char* pabyOut, const unsigned char* pabyIn, Count nBytes) {
    if (nBytes > 0) {  // the pointers of an empty buffer may be null
        std::memcpy(pabyOut, pabyIn, nBytes);
    }
}

// A sample at any address, of whatever type the memory was made for.
template <typename T>
struct Unaligned {
    typedef T Type __attribute__((aligned(1), may_alias));
};

// Not inlined: within a larger function GCC 12 sends parts of the loop's vectors through memory.
template <typename Tin, typename Tout>
[[gnu::noinline]] void Convert(unsigned char* pabyOut, const unsigned char* pabyIn, Count nCount) {
    if constexpr (std::is_same_v<Tin, Tout> ||
                  (std::is_integral_v<Tin> && std::is_integral_v<Tout> &&
                   sizeof(Tin) == sizeof(Tout))) {
        CopyBytes(pabyOut, pabyIn, nCount * sizeof(Tin));
    } else {
        const auto* pIn = reinterpret_cast<const typename Unaligned<Tin>::Type*>(pabyIn);
        auto* pOut = reinterpret_cast<typename Unaligned<Tout>::Type*>(pabyOut);
        for (Count i = 0; i < nCount; ++i) {
            pOut[i] = static_cast<Tout>(pIn[i]);
        }
    }
}

// Writes the run of bytes at the start of a buffer again and again behind itself, nTimes in all.
void Repeat(unsigned char* pabyRuns, Count nBytes, Count nTimes) {
    // Copies whole blocks of runs, of which the first grows until it fills a part of the cache.
    constexpr Count kBlockBytes = 16 * 1024;
    const Count nEnd = nBytes * nTimes;
    Count nBlock = nBytes;
    for (Count nDone = nBytes; nDone < nEnd;) {
        const Count nCopied = std::min(nBlock, nEnd - nDone);
        CopyBytes(pabyRuns + nDone, pabyRuns, nCopied);
        nDone += nCopied;
        if (nBlock < kBlockBytes) {
            nBlock = nDone;
        }
    }
}

template <typename Tin>
void ConvertPixel(unsigned char* pabyOut, const unsigned char* pabyIn, NativeDataTypeCode eTypeOut,
                  Count nCount) {
    if (!WithCopyType(eTypeOut,
                      [&]<typename Tout>(Tout) { Convert<Tin, Tout>(pabyOut, pabyIn, nCount); })) {
        Refuse("eTypeIn", "Unrecognized datatype in TTCopyPixel()");
    }
}

template <typename Tin>
void ConvertValue(unsigned char* pabyOut, const unsigned char* pabyIn, NativeDataTypeCode eTypeOut,
                  Count nIndex) {
    if (!WithCopyType(eTypeOut, [&]<typename Tout>(Tout) {
            Convert<Tin, Tout>(pabyOut + nIndex * sizeof(Tout), pabyIn, 1);
        })) {
        Refuse("eTypeIn", "Unrecognized datatype in TCopyPixelValue()");
    }
}

template <typename Tin>
void ConvertToRaster(unsigned char* pabyOut, const unsigned char* pabyIn,
                     NativeDataTypeCode eTypeOut, Count nCount, Count nNumPix) {
    if (!WithCopyType(eTypeOut, [&]<typename Tout>(Tout) {
            if (nCount > 0 && nNumPix > 0) {
                Convert<Tin, Tout>(pabyOut, pabyIn, nCount);
                Repeat(pabyOut, nCount * sizeof(Tout), nNumPix);
            }
        })) {
        Refuse("eTypeIn", "Unrecognized datatype in TTCopyPixelToRaster()");
    }
}

// Calls fnRun(value of the source's component type, component type of the target, number of parts
// in a sample). The function's name is for the messages.
template <typename Function>
void WithComponents(const std::string& sFunction, NativeDataTypeCode eTypeOut,
                    NativeDataTypeCode eTypeIn, const Function& fnRun) {
    const bool bComplex = DataTypeAdapter::IsComplex(eTypeIn);
    if (bComplex != DataTypeAdapter::IsComplex(eTypeOut)) {
        Refuse("eTypeIn && eTypeOut",
               "Cannot " + sFunction + "() between complex and non-complex datatypes");
    }
    if (!WithCopyType(DataTypeAdapter::ComplexToScalar(eTypeIn), [&](auto value) {
            fnRun(value, DataTypeAdapter::ComplexToScalar(eTypeOut), Count{bComplex ? 2u : 1u});
        })) {
        Refuse("eTypeIn", sFunction + "(): input datatype is unrecognized");
    }
}

}  // namespace

void CopyPixel(unsigned char* pabyOut, const unsigned char* pabyIn, NativeDataTypeCode eType,
               unsigned int nCount) {
    CopyBytes(pabyOut, pabyIn,
              Count{nCount} * static_cast<Count>(DataTypeAdapter::ByteSize(eType)));
}

void CopyPixel(unsigned char* pabyOut, const unsigned char* pabyIn, NativeDataTypeCode eTypeOut,
               NativeDataTypeCode eTypeIn, unsigned int nCount) {
    WithComponents("CopyPixel", eTypeOut, eTypeIn,
                   [&]<typename T>(T, NativeDataTypeCode eOut, Count nParts) {
                       ConvertPixel<T>(pabyOut, pabyIn, eOut, nParts * nCount);
                   });
}

void CopyPixelValue(unsigned char* pabyOut, const unsigned char* pabyIn,
                    NativeDataTypeCode eTypeOut, NativeDataTypeCode eTypeIn, unsigned int nIndex) {
    WithComponents("CopyPixelValue", eTypeOut, eTypeIn,
                   [&]<typename T>(T, NativeDataTypeCode eOut, Count nParts) {
                       for (Count i = 0; i < nParts; ++i) {
                           ConvertValue<T>(pabyOut, pabyIn + i * sizeof(T), eOut,
                                           nParts * nIndex + i);
                       }
                   });
}

void CopyPixelToRaster(unsigned char* pabyOut, const unsigned char* pabyIn,
                       NativeDataTypeCode eTypeOut, NativeDataTypeCode eTypeIn, unsigned int nCount,
                       unsigned long long nNumPix) {
    WithComponents("CopyPixelToRaster", eTypeOut, eTypeIn,
                   [&]<typename T>(T, NativeDataTypeCode eOut, Count nParts) {
                       ConvertToRaster<T>(pabyOut, pabyIn, eOut, nParts * nCount, nNumPix);
                   });
}

template <typename T>
void TCopyPixel(unsigned char* pabyOut, const T* pIn, NativeDataTypeCode eTypeOut,
                unsigned int nCount) {
    ConvertPixel<T>(pabyOut, reinterpret_cast<const unsigned char*>(pIn), eTypeOut, nCount);
}

template <typename T>
void TCopyPixelValue(unsigned char* pabyOut, T value, NativeDataTypeCode eTypeOut,
                     unsigned int nIndex) {
    ConvertValue<T>(pabyOut, reinterpret_cast<const unsigned char*>(&value), eTypeOut, nIndex);
}

template <typename T>
void TCopyPixelToRaster(unsigned char* pabyOut, const T* pIn, NativeDataTypeCode eTypeOut,
                        unsigned int nCount, unsigned long long nNumPix) {
    ConvertToRaster<T>(pabyOut, reinterpret_cast<const unsigned char*>(pIn), eTypeOut, nCount,
                       nNumPix);
}

#define VETRA_INSTANTIATE(T)                                                                     \
    template void TCopyPixel(unsigned char*, const T*, NativeDataTypeCode, unsigned int);        \
    template void TCopyPixelValue(unsigned char*, T, NativeDataTypeCode, unsigned int);          \
    template void TCopyPixelToRaster(unsigned char*, const T*, NativeDataTypeCode, unsigned int, \
                                     unsigned long long);
VETRA_INSTANTIATE(unsigned char)
VETRA_INSTANTIATE(signed char)
VETRA_INSTANTIATE(unsigned short)
VETRA_INSTANTIATE(short)
VETRA_INSTANTIATE(unsigned int)
VETRA_INSTANTIATE(int)
VETRA_INSTANTIATE(float)
VETRA_INSTANTIATE(double)
#undef VETRA_INSTANTIATE

}  // namespace vetra::utils::low
