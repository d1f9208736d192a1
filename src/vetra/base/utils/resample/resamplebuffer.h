#ifndef VETRA_BASE_UTILS_RESAMPLE_RESAMPLEBUFFER_H
#define VETRA_BASE_UTILS_RESAMPLE_RESAMPLEBUFFER_H

#include "vetra/basic/gobs/raster/datatypeadapter.h"
#include "vetra/export.h"

namespace vetra::utils {

/// An image of one sample type, with an optional validity mask.
///
/// **Samples.** `[rows x columns x channels]`: rows from the top, columns from the left, the
/// channels of a pixel side by side, no padding anywhere. The sample of channel c at column x,
/// row y is element `(y * columns + x) * channels + c`.
///
/// **Mask.** `[rows x columns]` bytes, one for all channels of a pixel, or null. As a source, 0
/// marks a pixel without data and 1 a valid pixel; no mask means that every pixel is valid. As a
/// target, a byte is the request for this pixel: 0 write the background, 1 sample, 2 take the
/// nearest sample only, 3 leave the pixel as it is; no mask requests 1 everywhere. Use no other
/// values. A run reads masks and never writes them.
///
/// The buffer owns its arrays, or is a view on those of its maker; a copy is of the same kind.
class VETRA_EXPORT ResampleBuffer {
 public:
    /// Allocates and owns an image of zero samples and a mask of ones.
    ///
    /// \param eType     one of the fourteen types that have a size
    /// \param nNumCols  columns, at least 1
    /// \param nNumRows  rows, at least 1
    /// \param nNumChan  channels, at least 1; a complex sample counts once
    /// \throws ParameterException for any other argument, std::bad_alloc when there is no memory.
    ResampleBuffer(gobs::NativeDataTypeCode eType, int nNumCols, int nNumRows, int nNumChan);

    /// Takes the caller's arrays as they are.
    ///
    /// \param eType     as above
    /// \param nNumCols  columns, at least 1
    /// \param nNumRows  rows, at least 1
    /// \param nNumChan  channels, at least 1
    /// \param pabyBuf   columns x rows x channels samples; not null, aligned for the sample type
    /// \param pabyMask  columns x rows mask bytes, or null
    /// \param bOwner    true hands both arrays over: they must come from `new unsigned char[]`.
    ///                  When the constructor throws they remain the caller's.
    /// \throws ParameterException as above, and for a null \p pabyBuf.
    ResampleBuffer(gobs::NativeDataTypeCode eType, int nNumCols, int nNumRows, int nNumChan,
                   unsigned char* pabyBuf, unsigned char* pabyMask, bool bOwner);

    /// Copies the arrays of a buffer that owns them; of a view it makes a second view.
    ResampleBuffer(const ResampleBuffer& oOther);
    /// As the copy constructor. When it throws (std::bad_alloc) the buffer is as it was.
    ResampleBuffer& operator=(const ResampleBuffer& oOther);
    virtual ~ResampleBuffer();

    /// The samples, to be read and written; cast to the sample type.
    unsigned char* GetBuf() { return mpabyBuf; }
    /// The samples; cast to the sample type.
    const unsigned char* GetBuf() const { return mpabyBuf; }
    /// Null when the buffer has no mask.
    unsigned char* GetMask() { return mpabyMask; }
    /// Null when the buffer has no mask.
    const unsigned char* GetMask() const { return mpabyMask; }
    /// The sample type.
    gobs::NativeDataTypeCode GetDatatype() const { return meType; }
    /// Columns.
    int GetNumCols() const { return mnNumCols; }
    /// Rows.
    int GetNumRows() const { return mnNumRows; }
    /// Channels; a complex sample counts once.
    int GetNumChan() const { return mnNumChan; }
    /// Whether the arrays are the buffer's own.
    bool GetOwnerFlag() const { return mbOwner; }

 private:
    ResampleBuffer();

    void Init();
    static bool IsRecognizedTypeCode(gobs::NativeDataTypeCode eType);
    void SetBufferInfo(gobs::NativeDataTypeCode eType, int nNumCols, int nNumRows, int nNumChan);
    void CopyFrom(const ResampleBuffer& oOther);
    void FreeOwned();
    long long GetNumBytes() const;
    long long GetNumPix() const;

    gobs::NativeDataTypeCode meType;
    int mnNumCols;
    int mnNumRows;
    int mnNumChan;
    unsigned char* mpabyBuf;
    unsigned char* mpabyMask;
    bool mbOwner;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_RESAMPLEBUFFER_H
