#ifndef VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSBILINEARTFM_H
#define VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSBILINEARTFM_H

#include "vetra/base/utils/resample/postfm/ibufpostfm.h"

namespace vetra::utils {

/// A bilinear mapping of the target rectangle onto a source quadrilateral.
///
/// With u = x / (columns - 1) and v = y / (rows - 1) the column is
/// `((1 - u) * C2 + u * C3) * v + ((1 - u) * C0 + u * C1) * (1 - v)`, the row likewise: exactly the
/// given positions at the four corner pixels. A target of one column has u = 0 and one of one row
/// v = 0, so it takes the quadrilateral's left or upper side.
class VETRA_EXPORT BufPosBilinearTfm : public IBufPosTfm {
 public:
    /// \param nNumCols        target columns, at least 1
    /// \param nNumRows        target rows, at least 1
    /// \param dfCol0,dfRow0   source position of the first pixel of the first target row
    /// \param dfCol1,dfRow1   of the last pixel of the first row
    /// \param dfCol2,dfRow2   of the first pixel of the last row
    /// \param dfCol3,dfRow3   of the last pixel of the last row
    /// \throws ParameterException for a size below 1.
    BufPosBilinearTfm(int nNumCols, int nNumRows, double dfCol0, double dfRow0, double dfCol1,
                      double dfRow1, double dfCol2, double dfRow2, double dfCol3, double dfRow3);
    /// A copy.
    BufPosBilinearTfm(const BufPosBilinearTfm& oOther);
    /// A copy.
    BufPosBilinearTfm& operator=(const BufPosBilinearTfm& oOther);
    ~BufPosBilinearTfm() override;

    int GetNumCols() const override;
    int GetNumRows() const override;
    long long GetNumPix() const override;
    void GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const override;
    BufPosBilinearTfm* Clone() const override;

    /// Hands out the corner positions in the constructor's order.
    void GetTfmParameters(double& dfCol0, double& dfRow0, double& dfCol1, double& dfRow1,
                          double& dfCol2, double& dfRow2, double& dfCol3, double& dfRow3) const;

 private:
    int mnNumCols;
    int mnNumRows;
    double mdfCol0;
    double mdfRow0;
    double mdfCol1;
    double mdfRow1;
    double mdfCol2;
    double mdfRow2;
    double mdfCol3;
    double mdfRow3;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSBILINEARTFM_H
