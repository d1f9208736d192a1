#ifndef VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSARRAYTFM_H
#define VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSARRAYTFM_H

#include "vetra/base/utils/resample/postfm/ibufpostfm.h"

namespace vetra::utils {

/// A position per target pixel, stored as 32-bit floats, plus a whole-pixel offset for all.
///
/// A float holds a position to 1/1000 pixel up to some 16000 pixels only: for larger images store
/// positions relative to an origin and pass the origin as offset. The sum is taken in double.
class VETRA_EXPORT BufPosArrayTfm : public IBufPosTfm {
 public:
    /// \param nNumCols   target columns, at least 1
    /// \param nNumRows   target rows, at least 1
    /// \param pafColPos  `[rows x columns]` source columns; not null
    /// \param nColOff    added to every column
    /// \param pafRowPos  `[rows x columns]` source rows; not null
    /// \param nRowOff    added to every row
    /// \param bOwner     true hands both arrays over: they must come from `new float[]`. When the
    ///                   constructor throws they remain the caller's. Else the caller keeps them
    ///                   alive as long as this object and its copies.
    /// \throws ParameterException for a size below 1 or a null array.
    BufPosArrayTfm(int nNumCols, int nNumRows, float* pafColPos, int nColOff, float* pafRowPos,
                   int nRowOff, bool bOwner);
    /// Copies the arrays of an object that owns them, else refers to the same arrays.
    BufPosArrayTfm(const BufPosArrayTfm& oOther);
    /// As the copy constructor. When it throws (std::bad_alloc) the object is as it was.
    BufPosArrayTfm& operator=(const BufPosArrayTfm& oOther);
    ~BufPosArrayTfm() override;

    int GetNumCols() const override;
    int GetNumRows() const override;
    long long GetNumPix() const override;
    void GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const override;
    BufPosArrayTfm* Clone() const override;

    /// Hands out what the constructor was given; the arrays remain the object's.
    void GetTfmParameters(const float*& pafColPos, int& nColOff, const float*& pafRowPos,
                          int& nRowOff) const;

 private:
    BufPosArrayTfm();
    void Init();
    void CopyFrom(const BufPosArrayTfm& oOther);
    void FreeOwned();

    int mnNumCols;
    int mnNumRows;
    float* mpafColPos;
    int mnColOff;
    float* mpafRowPos;
    int mnRowOff;
    bool mbOwner;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSARRAYTFM_H
