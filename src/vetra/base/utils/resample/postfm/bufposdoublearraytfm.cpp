#include "vetra/base/utils/resample/postfm/bufposdoublearraytfm.h"

#include "vetra/base/utils/resample/sizecheck.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::utils {

BufPosDoubleArrayTfm::BufPosDoubleArrayTfm(int nNumCols, int nNumRows, const double* padfColPos,
                                           const double* padfRowPos)
    : mnNumCols(nNumCols), mnNumRows(nNumRows), mpadfColPos(padfColPos), mpadfRowPos(padfRowPos) {
    CheckImageSize(nNumCols, nNumRows, VETRA_HERE);
    CheckPositions(padfColPos, "padfColPos", "Column", VETRA_HERE);
    CheckPositions(padfRowPos, "padfRowPos", "Row", VETRA_HERE);
}

BufPosDoubleArrayTfm::BufPosDoubleArrayTfm(const BufPosDoubleArrayTfm& oOther) = default;
BufPosDoubleArrayTfm& BufPosDoubleArrayTfm::operator=(const BufPosDoubleArrayTfm& oOther) = default;
BufPosDoubleArrayTfm::~BufPosDoubleArrayTfm() = default;

int BufPosDoubleArrayTfm::GetNumCols() const { return mnNumCols; }
int BufPosDoubleArrayTfm::GetNumRows() const { return mnNumRows; }
long long BufPosDoubleArrayTfm::GetNumPix() const {
    return static_cast<long long>(mnNumCols) * mnNumRows;
}

void BufPosDoubleArrayTfm::GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const {
    dfCol = mpadfColPos[nIdx];
    dfRow = mpadfRowPos[nIdx];
}

BufPosDoubleArrayTfm* BufPosDoubleArrayTfm::Clone() const {
    return new BufPosDoubleArrayTfm(*this);
}

void BufPosDoubleArrayTfm::GetTfmParameters(const double*& padfColPos,
                                            const double*& padfRowPos) const {
    padfColPos = mpadfColPos;
    padfRowPos = mpadfRowPos;
}

}  // namespace vetra::utils
