#ifndef VETRA_BASE_UTILS_LOW_FIELDCODEC_H
#define VETRA_BASE_UTILS_LOW_FIELDCODEC_H

#include <string>

#include "vetra/export.h"

/// \file
/// Fields of binary records: a field is at an offset, in bytes, into a buffer. Fields need no
/// alignment, and numbers are read and written bit by bit, NaNs too. Nothing is checked: a field
/// must lie inside its buffer, and source and target may not overlap. Offsets and counts are
/// 32-bit, but an array may end beyond 4 GiB. Sizes of bytes and texts are taken as signed 32-bit
/// numbers: one of 2^31 and more is negative, and counts as 0.

/// A byte order.
enum EndianCode : int {
    eEC_LITTLE = 0,  ///< the least significant byte first
    eEC_BIG = 1,     ///< the most significant byte first
};

/// The byte order of this machine.
VETRA_EXPORT EndianCode GetEndian();

/// Whether numbers of a byte order must be swapped on this machine.
VETRA_EXPORT bool NeedsByteSwap(EndianCode code);

/// Copies \p size bytes in reverse order, none when \p size is 0 or less.
VETRA_EXPORT void swapbyte(void* dst, const void* src, int size);

/// Reverses \p size bytes in place.
VETRA_EXPORT void swapbytes(unsigned char* data, unsigned long size);

/// The number at an offset; \p swap reverses its bytes. The same holds for all of these.
/// @{
VETRA_EXPORT short DecodeInt16(const unsigned char* buffer, unsigned int offset, bool swap);
VETRA_EXPORT unsigned short DecodeUint16(const unsigned char* buffer, unsigned int offset,
                                         bool swap);
VETRA_EXPORT int DecodeInt32(const unsigned char* buffer, unsigned int offset, bool swap);
VETRA_EXPORT unsigned int DecodeUint32(const unsigned char* buffer, unsigned int offset, bool swap);
VETRA_EXPORT float DecodeFloat(const unsigned char* buffer, unsigned int offset, bool swap);
VETRA_EXPORT double DecodeDouble(const unsigned char* buffer, unsigned int offset, bool swap);
/// @}

/// Writes a number at an offset; \p swap reverses its bytes. The same holds for all of these.
/// @{
VETRA_EXPORT void EncodeInt16(short value, unsigned char* buffer, unsigned int offset, bool swap);
VETRA_EXPORT void EncodeUint16(unsigned short value, unsigned char* buffer, unsigned int offset,
                               bool swap);
VETRA_EXPORT void EncodeInt32(int value, unsigned char* buffer, unsigned int offset, bool swap);
VETRA_EXPORT void EncodeUint32(unsigned int value, unsigned char* buffer, unsigned int offset,
                               bool swap);
VETRA_EXPORT void EncodeFloat(float value, unsigned char* buffer, unsigned int offset, bool swap);
VETRA_EXPORT void EncodeDouble(double value, unsigned char* buffer, unsigned int offset, bool swap);
/// @}

/// Reads \p count numbers that follow each other from an offset on; \p swap reverses the bytes of
/// each. The same holds for all of these.
/// @{
VETRA_EXPORT void DecodeInt32Array(int* values, unsigned int count, const unsigned char* buffer,
                                   unsigned int offset, bool swap);
VETRA_EXPORT void DecodeUint32Array(unsigned int* values, unsigned int count,
                                    const unsigned char* buffer, unsigned int offset, bool swap);
VETRA_EXPORT void DecodeDoubleArray(double* values, unsigned int count, const unsigned char* buffer,
                                    unsigned int offset, bool swap);
/// @}

/// Writes \p count numbers, one behind the other, from an offset on; \p swap reverses the bytes of
/// each. The same holds for all of these.
/// @{
VETRA_EXPORT void EncodeInt32Array(const int* values, unsigned int count, unsigned char* buffer,
                                   unsigned int offset, bool swap);
VETRA_EXPORT void EncodeUint32Array(const unsigned int* values, unsigned int count,
                                    unsigned char* buffer, unsigned int offset, bool swap);
VETRA_EXPORT void EncodeDoubleArray(const double* values, unsigned int count, unsigned char* buffer,
                                    unsigned int offset, bool swap);
/// @}

/// Copies a field of \p fieldSize bytes to \p dst: as much as fits, with blanks behind it up to
/// \p dstSize.
VETRA_EXPORT void DecodeByteArray(unsigned char* dst, unsigned int dstSize,
                                  const unsigned char* buffer, unsigned int offset,
                                  unsigned int fieldSize);

/// Copies \p srcSize bytes to a field: as much as fits, with blanks behind it up to
/// \p fieldSize.
VETRA_EXPORT void EncodeByteArray(const unsigned char* src, unsigned int srcSize,
                                  unsigned char* buffer, unsigned int offset,
                                  unsigned int fieldSize);

/// The text in a field of \p length bytes, cut at the first zero byte and then trimmed
/// (`TrimWhitespace`).
VETRA_EXPORT std::string DecodeString(const unsigned char* buffer, unsigned int offset,
                                      unsigned int length);

/// Copies a text to a field: as much as fits, with zero bytes behind it up to \p fieldSize. A text
/// that fills the field has no terminator.
VETRA_EXPORT void EncodeString(const std::string& text, unsigned char* buffer, unsigned int offset,
                               unsigned int fieldSize);

#endif  // VETRA_BASE_UTILS_LOW_FIELDCODEC_H
