#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"

#include "vetra/base/utils/resample/sizecheck.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::utils {

namespace {

double SourceCoordinate(long long nTarget, int nStart, double dfScale, double dfOff) {
    // The sum is a 32-bit one; unsigned, so that it wraps where an extreme start makes it overflow.
    const int nSum =
        static_cast<int>(static_cast<unsigned int>(nTarget) + static_cast<unsigned int>(nStart));
    return (nSum + 0.5) * dfScale + dfOff - 0.5;
}

}  // namespace

BufPosScaleOffTfm::BufPosScaleOffTfm(int nNumCols, int nNumRows, double dfColScale, double dfColOff,
                                     double dfRowScale, double dfRowOff, int nColStart,
                                     int nRowStart) {
    CheckImageSize(nNumCols, nNumRows, VETRA_HERE);
    mnNumCols = nNumCols;
    mnNumRows = nNumRows;
    mnColStart = nColStart;
    mnRowStart = nRowStart;
    mdfColScale = dfColScale;
    mdfColOff = dfColOff;
    mdfRowScale = dfRowScale;
    mdfRowOff = dfRowOff;
}

BufPosScaleOffTfm::BufPosScaleOffTfm(const BufPosScaleOffTfm& oOther) = default;
BufPosScaleOffTfm& BufPosScaleOffTfm::operator=(const BufPosScaleOffTfm& oOther) = default;
BufPosScaleOffTfm::~BufPosScaleOffTfm() = default;

int BufPosScaleOffTfm::GetNumCols() const { return mnNumCols; }
int BufPosScaleOffTfm::GetNumRows() const { return mnNumRows; }
long long BufPosScaleOffTfm::GetNumPix() const {
    return static_cast<long long>(mnNumCols) * mnNumRows;
}

void BufPosScaleOffTfm::GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const {
    dfCol = SourceCoordinate(nIdx % mnNumCols, mnColStart, mdfColScale, mdfColOff);
    dfRow = SourceCoordinate(nIdx / mnNumCols, mnRowStart, mdfRowScale, mdfRowOff);
}

BufPosScaleOffTfm* BufPosScaleOffTfm::Clone() const { return new BufPosScaleOffTfm(*this); }

void BufPosScaleOffTfm::GetTfmParameters(double& dfColScale, double& dfColOff, double& dfRowScale,
                                         double& dfRowOff, int& nColStart, int& nRowStart) const {
    dfColScale = mdfColScale;
    dfColOff = mdfColOff;
    dfRowScale = mdfRowScale;
    dfRowOff = mdfRowOff;
    nColStart = mnColStart;
    nRowStart = mnRowStart;
}

}  // namespace vetra::utils
