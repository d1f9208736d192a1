#include "vetra/base/utils/resample/postfm/bufposblocktfm.h"

#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::utils {

BufPosBlockTfm::BufPosBlockTfm(const IBufPosTfm& oWhole, const PixelRect& oTarget, int nSrcCol,
                               int nSrcRow)
    : mpoWhole(&oWhole), moTarget(oTarget), mnSrcCol(nSrcCol), mnSrcRow(nSrcRow) {
    const int nCols = oWhole.GetNumCols();
    const int nRows = oWhole.GetNumRows();
    if (oTarget.nCols < 1 || oTarget.nRows < 1 || oTarget.nCol < 0 || oTarget.nRow < 0 ||
        oTarget.nCol > nCols - oTarget.nCols || oTarget.nRow > nRows - oTarget.nRows) {
        throw ParameterException("oTarget", ParameterException::eOutOfRange,
                                 FormatString("%d x %d pixels at (%d, %d)", oTarget.nCols,
                                              oTarget.nRows, oTarget.nCol, oTarget.nRow),
                                 FormatString("inside %d x %d pixels", nCols, nRows),
                                 "A block must hold a pixel and lie inside the transform's target",
                                 VETRA_HERE);
    }
}

BufPosBlockTfm::BufPosBlockTfm(const BufPosBlockTfm& oOther) = default;
BufPosBlockTfm& BufPosBlockTfm::operator=(const BufPosBlockTfm& oOther) = default;
BufPosBlockTfm::~BufPosBlockTfm() = default;

int BufPosBlockTfm::GetNumCols() const { return moTarget.nCols; }
int BufPosBlockTfm::GetNumRows() const { return moTarget.nRows; }
long long BufPosBlockTfm::GetNumPix() const { return moTarget.GetNumPix(); }

void BufPosBlockTfm::GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const {
    const long long nX = moTarget.nCol + nIdx % moTarget.nCols;
    const long long nY = moTarget.nRow + nIdx / moTarget.nCols;
    mpoWhole->GetSrcPos(nY * mpoWhole->GetNumCols() + nX, dfCol, dfRow);
    dfCol -= mnSrcCol;
    dfRow -= mnSrcRow;
}

BufPosBlockTfm* BufPosBlockTfm::Clone() const { return new BufPosBlockTfm(*this); }

}  // namespace vetra::utils
