#include "vetra/base/utils/resample/postfm/bufposbilineartfm.h"

#include "vetra/base/utils/resample/sizecheck.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::utils {

BufPosBilinearTfm::BufPosBilinearTfm(int nNumCols, int nNumRows, double dfCol0, double dfRow0,
                                     double dfCol1, double dfRow1, double dfCol2, double dfRow2,
                                     double dfCol3, double dfRow3) {
    CheckImageSize(nNumCols, nNumRows, VETRA_HERE);
    mnNumCols = nNumCols;
    mnNumRows = nNumRows;
    mdfCol0 = dfCol0;
    mdfRow0 = dfRow0;
    mdfCol1 = dfCol1;
    mdfRow1 = dfRow1;
    mdfCol2 = dfCol2;
    mdfRow2 = dfRow2;
    mdfCol3 = dfCol3;
    mdfRow3 = dfRow3;
}

BufPosBilinearTfm::BufPosBilinearTfm(const BufPosBilinearTfm& oOther) = default;
BufPosBilinearTfm& BufPosBilinearTfm::operator=(const BufPosBilinearTfm& oOther) = default;
BufPosBilinearTfm::~BufPosBilinearTfm() = default;

int BufPosBilinearTfm::GetNumCols() const { return mnNumCols; }
int BufPosBilinearTfm::GetNumRows() const { return mnNumRows; }
long long BufPosBilinearTfm::GetNumPix() const {
    return static_cast<long long>(mnNumCols) * mnNumRows;
}

void BufPosBilinearTfm::GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const {
    const long long nX = nIdx % mnNumCols;
    const long long nY = nIdx / mnNumCols;
    const double u = mnNumCols > 1 ? static_cast<double>(nX) / (mnNumCols - 1) : 0.0;
    const double v = mnNumRows > 1 ? static_cast<double>(nY) / (mnNumRows - 1) : 0.0;
    dfCol =
        ((1.0 - u) * mdfCol2 + u * mdfCol3) * v + ((1.0 - u) * mdfCol0 + u * mdfCol1) * (1.0 - v);
    dfRow =
        ((1.0 - u) * mdfRow2 + u * mdfRow3) * v + ((1.0 - u) * mdfRow0 + u * mdfRow1) * (1.0 - v);
}

BufPosBilinearTfm* BufPosBilinearTfm::Clone() const { return new BufPosBilinearTfm(*this); }

void BufPosBilinearTfm::GetTfmParameters(double& dfCol0, double& dfRow0, double& dfCol1,
                                         double& dfRow1, double& dfCol2, double& dfRow2,
                                         double& dfCol3, double& dfRow3) const {
    dfCol0 = mdfCol0;
    dfRow0 = mdfRow0;
    dfCol1 = mdfCol1;
    dfRow1 = mdfRow1;
    dfCol2 = mdfCol2;
    dfRow2 = mdfRow2;
    dfCol3 = mdfCol3;
    dfRow3 = mdfRow3;
}

}  // namespace vetra::utils
