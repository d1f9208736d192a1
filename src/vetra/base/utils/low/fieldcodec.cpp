#include "vetra/base/utils/low/fieldcodec.h"

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "vetra/base/utils/string/stringutils.h"

static_assert(sizeof(short) == 2 && sizeof(int) == 4 && sizeof(float) == 4 && sizeof(double) == 8);

namespace {

template <std::size_t nSize>
void CopyNumber(unsigned char* pabyOut, const unsigned char* pabyIn, bool bSwap) {
    if (bSwap) {
        std::reverse_copy(pabyIn, pabyIn + nSize, pabyOut);
    } else {
        std::memcpy(pabyOut, pabyIn, nSize);
    }
}

template <typename T>
T DecodeNumber(const unsigned char* pabyBuffer, unsigned int nOffset, bool bSwap) {
    unsigned char abyValue[sizeof(T)];
    CopyNumber<sizeof(T)>(abyValue, pabyBuffer + nOffset, bSwap);
    T value;
    std::memcpy(&value, abyValue, sizeof(T));
    return value;
}

template <typename T>
void EncodeNumber(T value, unsigned char* pabyBuffer, unsigned int nOffset, bool bSwap) {
    unsigned char abyValue[sizeof(T)];
    std::memcpy(abyValue, &value, sizeof(T));
    CopyNumber<sizeof(T)>(pabyBuffer + nOffset, abyValue, bSwap);
}

template <std::size_t nSize>
void CopyNumbers(unsigned char* pabyOut, const unsigned char* pabyIn, std::size_t nCount,
                 bool bSwap) {
    if (!bSwap) {
        std::copy_n(pabyIn, nCount * nSize, pabyOut);
        return;
    }
    for (std::size_t i = 0; i < nCount * nSize; i += nSize) {
        CopyNumber<nSize>(pabyOut + i, pabyIn + i, true);
    }
}

template <typename T>
void DecodeNumbers(T* paValues, unsigned int nCount, const unsigned char* pabyBuffer,
                   unsigned int nOffset, bool bSwap) {
    CopyNumbers<sizeof(T)>(reinterpret_cast<unsigned char*>(paValues), pabyBuffer + nOffset, nCount,
                           bSwap);
}

template <typename T>
void EncodeNumbers(const T* paValues, unsigned int nCount, unsigned char* pabyBuffer,
                   unsigned int nOffset, bool bSwap) {
    CopyNumbers<sizeof(T)>(pabyBuffer + nOffset, reinterpret_cast<const unsigned char*>(paValues),
                           nCount, bSwap);
}

std::int32_t SignedSize(std::size_t nSize) {
    return std::max(static_cast<std::int32_t>(static_cast<std::uint32_t>(nSize)), 0);
}

void CopyPadded(unsigned char* pabyOut, std::size_t nOutSize, const unsigned char* pabyIn,
                std::size_t nInSize, unsigned char byPad) {
    const std::int32_t nOut = SignedSize(nOutSize);
    const std::int32_t nCopied = std::min(nOut, SignedSize(nInSize));
    std::fill_n(std::copy_n(pabyIn, nCopied, pabyOut), nOut - nCopied, byPad);
}

}  // namespace

EndianCode GetEndian() { return std::endian::native == std::endian::little ? eEC_LITTLE : eEC_BIG; }

bool NeedsByteSwap(EndianCode code) { return code != GetEndian(); }

void swapbyte(void* dst, const void* src, int size) {
    const unsigned char* pabySrc = static_cast<const unsigned char*>(src);
    std::reverse_copy(pabySrc, pabySrc + std::max(size, 0), static_cast<unsigned char*>(dst));
}

void swapbytes(unsigned char* data, unsigned long size) { std::reverse(data, data + size); }

short DecodeInt16(const unsigned char* buffer, unsigned int offset, bool swap) {
    return DecodeNumber<short>(buffer, offset, swap);
}

unsigned short DecodeUint16(const unsigned char* buffer, unsigned int offset, bool swap) {
    return DecodeNumber<unsigned short>(buffer, offset, swap);
}

int DecodeInt32(const unsigned char* buffer, unsigned int offset, bool swap) {
    return DecodeNumber<int>(buffer, offset, swap);
}

unsigned int DecodeUint32(const unsigned char* buffer, unsigned int offset, bool swap) {
    return DecodeNumber<unsigned int>(buffer, offset, swap);
}

float DecodeFloat(const unsigned char* buffer, unsigned int offset, bool swap) {
    return DecodeNumber<float>(buffer, offset, swap);
}

double DecodeDouble(const unsigned char* buffer, unsigned int offset, bool swap) {
    return DecodeNumber<double>(buffer, offset, swap);
}

void EncodeInt16(short value, unsigned char* buffer, unsigned int offset, bool swap) {
    EncodeNumber(value, buffer, offset, swap);
}

void EncodeUint16(unsigned short value, unsigned char* buffer, unsigned int offset, bool swap) {
    EncodeNumber(value, buffer, offset, swap);
}

void EncodeInt32(int value, unsigned char* buffer, unsigned int offset, bool swap) {
    EncodeNumber(value, buffer, offset, swap);
}

void EncodeUint32(unsigned int value, unsigned char* buffer, unsigned int offset, bool swap) {
    EncodeNumber(value, buffer, offset, swap);
}

void EncodeFloat(float value, unsigned char* buffer, unsigned int offset, bool swap) {
    EncodeNumber(value, buffer, offset, swap);
}

void EncodeDouble(double value, unsigned char* buffer, unsigned int offset, bool swap) {
    EncodeNumber(value, buffer, offset, swap);
}

void DecodeInt32Array(int* values, unsigned int count, const unsigned char* buffer,
                      unsigned int offset, bool swap) {
    DecodeNumbers(values, count, buffer, offset, swap);
}

void DecodeUint32Array(unsigned int* values, unsigned int count, const unsigned char* buffer,
                       unsigned int offset, bool swap) {
    DecodeNumbers(values, count, buffer, offset, swap);
}

void DecodeDoubleArray(double* values, unsigned int count, const unsigned char* buffer,
                       unsigned int offset, bool swap) {
    DecodeNumbers(values, count, buffer, offset, swap);
}

void EncodeInt32Array(const int* values, unsigned int count, unsigned char* buffer,
                      unsigned int offset, bool swap) {
    EncodeNumbers(values, count, buffer, offset, swap);
}

void EncodeUint32Array(const unsigned int* values, unsigned int count, unsigned char* buffer,
                       unsigned int offset, bool swap) {
    EncodeNumbers(values, count, buffer, offset, swap);
}

void EncodeDoubleArray(const double* values, unsigned int count, unsigned char* buffer,
                       unsigned int offset, bool swap) {
    EncodeNumbers(values, count, buffer, offset, swap);
}

void DecodeByteArray(unsigned char* dst, unsigned int dstSize, const unsigned char* buffer,
                     unsigned int offset, unsigned int fieldSize) {
    CopyPadded(dst, dstSize, buffer + offset, fieldSize, ' ');
}

void EncodeByteArray(const unsigned char* src, unsigned int srcSize, unsigned char* buffer,
                     unsigned int offset, unsigned int fieldSize) {
    CopyPadded(buffer + offset, fieldSize, src, srcSize, ' ');
}

std::string DecodeString(const unsigned char* buffer, unsigned int offset, unsigned int length) {
    const unsigned char* pabyField = buffer + offset;
    return TrimWhitespace(
        std::string(pabyField, std::find(pabyField, pabyField + SignedSize(length), 0)));
}

void EncodeString(const std::string& text, unsigned char* buffer, unsigned int offset,
                  unsigned int fieldSize) {
    CopyPadded(buffer + offset, fieldSize, reinterpret_cast<const unsigned char*>(text.data()),
               text.size(), 0);
}
