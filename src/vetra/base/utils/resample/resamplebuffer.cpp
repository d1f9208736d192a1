#include "vetra/base/utils/resample/resamplebuffer.h"

#include <algorithm>
#include <limits>
#include <memory>
#include <new>

#include "vetra/base/utils/resample/sizecheck.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::utils {

using gobs::DataTypeAdapter;
using gobs::NativeDataTypeCode;

namespace {

using Bytes = std::unique_ptr<unsigned char[]>;

Bytes CopyBytes(const unsigned char* pabySrc, long long nBytes) {
    // Not make_unique: every byte is written right after.
    Bytes pabyCopy(new unsigned char[static_cast<std::size_t>(nBytes)]);
    std::copy_n(pabySrc, nBytes, pabyCopy.get());
    return pabyCopy;
}

}  // namespace

ResampleBuffer::ResampleBuffer() { Init(); }

ResampleBuffer::ResampleBuffer(NativeDataTypeCode eType, int nNumCols, int nNumRows, int nNumChan)
    : ResampleBuffer() {
    SetBufferInfo(eType, nNumCols, nNumRows, nNumChan);
    Bytes pabyBuf(new unsigned char[static_cast<std::size_t>(GetNumBytes())]());
    Bytes pabyMask(new unsigned char[static_cast<std::size_t>(GetNumPix())]);
    std::fill_n(pabyMask.get(), GetNumPix(), static_cast<unsigned char>(1));
    mpabyBuf = pabyBuf.release();
    mpabyMask = pabyMask.release();
    mbOwner = true;
}

ResampleBuffer::ResampleBuffer(NativeDataTypeCode eType, int nNumCols, int nNumRows, int nNumChan,
                               unsigned char* pabyBuf, unsigned char* pabyMask, bool bOwner)
    : ResampleBuffer() {
    SetBufferInfo(eType, nNumCols, nNumRows, nNumChan);
    if (pabyBuf == nullptr) {
        throw ParameterException("pabyBuf", ParameterException::eInvalid, "NULL", "non-NULL",
                                 "Raster buffer must be a valid pointer (NULL not allowed)",
                                 VETRA_HERE);
    }
    mpabyBuf = pabyBuf;
    mpabyMask = pabyMask;
    mbOwner = bOwner;
}

ResampleBuffer::ResampleBuffer(const ResampleBuffer& oOther) : ResampleBuffer() {
    CopyFrom(oOther);
}

ResampleBuffer& ResampleBuffer::operator=(const ResampleBuffer& oOther) {
    CopyFrom(oOther);
    return *this;
}

ResampleBuffer::~ResampleBuffer() { FreeOwned(); }

void ResampleBuffer::Init() {
    meType = gobs::eDT_UNKNOWN;
    mnNumCols = 0;
    mnNumRows = 0;
    mnNumChan = 0;
    mpabyBuf = nullptr;
    mpabyMask = nullptr;
    mbOwner = false;
}

bool ResampleBuffer::IsRecognizedTypeCode(NativeDataTypeCode eType) {
    return (eType >= gobs::eDT_8U && eType <= gobs::eDT_64R) ||
           (eType >= gobs::eDT_C16S && eType <= gobs::eDT_C64R);
}

void ResampleBuffer::SetBufferInfo(NativeDataTypeCode eType, int nNumCols, int nNumRows,
                                   int nNumChan) {
    if (!IsRecognizedTypeCode(eType)) {
        throw ParameterException("eType", ParameterException::eInvalid, "",
                                 "valid NativeDataTypeCode",
                                 "eType is not recognized (potentially uninitialized)", VETRA_HERE);
    }
    CheckImageSize(nNumCols, nNumRows, VETRA_HERE);
    CheckCount(nNumChan, "nNumChan", "channels", VETRA_HERE);
    meType = eType;
    mnNumCols = nNumCols;
    mnNumRows = nNumRows;
    mnNumChan = nNumChan;
}

void ResampleBuffer::CopyFrom(const ResampleBuffer& oOther) {
    if (this == &oOther) {
        return;
    }
    // Everything that can fail comes before the first change of this object.
    Bytes pabyBuf;
    Bytes pabyMask;
    if (oOther.mbOwner) {
        pabyBuf = CopyBytes(oOther.mpabyBuf, oOther.GetNumBytes());
        if (oOther.mpabyMask != nullptr) {
            pabyMask = CopyBytes(oOther.mpabyMask, oOther.GetNumPix());
        }
    }
    FreeOwned();
    SetBufferInfo(oOther.meType, oOther.mnNumCols, oOther.mnNumRows, oOther.mnNumChan);
    mpabyBuf = oOther.mbOwner ? pabyBuf.release() : oOther.mpabyBuf;
    mpabyMask = oOther.mbOwner ? pabyMask.release() : oOther.mpabyMask;
    mbOwner = oOther.mbOwner;
}

void ResampleBuffer::FreeOwned() {
    if (mbOwner) {
        delete[] mpabyBuf;
        delete[] mpabyMask;
    }
    mpabyBuf = nullptr;
    mpabyMask = nullptr;
}

long long ResampleBuffer::GetNumPix() const {
    return static_cast<long long>(mnNumCols) * mnNumRows;
}

long long ResampleBuffer::GetNumBytes() const {
    // Three factors below 2^31 and a size of up to 16 can pass 2^63.
    const long long nPixelBytes =
        static_cast<long long>(mnNumChan) * DataTypeAdapter::ByteSize(meType);
    if (nPixelBytes > std::numeric_limits<long long>::max() / GetNumPix()) {
        throw std::bad_array_new_length();
    }
    return GetNumPix() * nPixelBytes;
}

}  // namespace vetra::utils
