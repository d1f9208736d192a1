#ifndef VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSDOUBLEARRAYTFM_H
#define VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSDOUBLEARRAYTFM_H

#include "vetra/base/utils/resample/postfm/ibufpostfm.h"

namespace vetra::utils {

/// A position per target pixel, stored as doubles: exact in images of any size, where the floats of
/// `BufPosArrayTfm` are not.
///
/// Refers to the caller's arrays, which must outlive this object and its copies.
class VETRA_EXPORT BufPosDoubleArrayTfm : public IBufPosTfm {
 public:
    /// \param nNumCols    target columns, at least 1
    /// \param nNumRows    target rows, at least 1
    /// \param padfColPos  `[rows x columns]` source columns; not null
    /// \param padfRowPos  `[rows x columns]` source rows; not null
    /// \throws ParameterException for a size below 1 or a null array.
    BufPosDoubleArrayTfm(int nNumCols, int nNumRows, const double* padfColPos,
                         const double* padfRowPos);
    /// A copy, which refers to the same arrays.
    BufPosDoubleArrayTfm(const BufPosDoubleArrayTfm& oOther);
    /// A copy, which refers to the same arrays.
    BufPosDoubleArrayTfm& operator=(const BufPosDoubleArrayTfm& oOther);
    ~BufPosDoubleArrayTfm() override;

    int GetNumCols() const override;
    int GetNumRows() const override;
    long long GetNumPix() const override;
    void GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const override;
    BufPosDoubleArrayTfm* Clone() const override;

    /// Hands out what the constructor was given.
    void GetTfmParameters(const double*& padfColPos, const double*& padfRowPos) const;

 private:
    int mnNumCols;
    int mnNumRows;
    const double* mpadfColPos;
    const double* mpadfRowPos;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSDOUBLEARRAYTFM_H
