#include "vetra/base/utils/resample/postfm/bufposarraytfm.h"

#include <algorithm>
#include <memory>

#include "vetra/base/utils/resample/sizecheck.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::utils {

namespace {

using Floats = std::unique_ptr<float[]>;

Floats CopyFloats(const float* pafSrc, long long nCount) {
    Floats pafCopy(new float[static_cast<std::size_t>(nCount)]);
    std::copy_n(pafSrc, nCount, pafCopy.get());
    return pafCopy;
}

}  // namespace

BufPosArrayTfm::BufPosArrayTfm() { Init(); }

BufPosArrayTfm::BufPosArrayTfm(int nNumCols, int nNumRows, float* pafColPos, int nColOff,
                               float* pafRowPos, int nRowOff, bool bOwner) {
    Init();
    CheckImageSize(nNumCols, nNumRows, VETRA_HERE);
    CheckPositions(pafColPos, "pafColPos", "Column", VETRA_HERE);
    CheckPositions(pafRowPos, "pafRowPos", "Row", VETRA_HERE);
    mnNumCols = nNumCols;
    mnNumRows = nNumRows;
    mpafColPos = pafColPos;
    mnColOff = nColOff;
    mpafRowPos = pafRowPos;
    mnRowOff = nRowOff;
    mbOwner = bOwner;
}

BufPosArrayTfm::BufPosArrayTfm(const BufPosArrayTfm& oOther) : BufPosArrayTfm() {
    CopyFrom(oOther);
}

BufPosArrayTfm& BufPosArrayTfm::operator=(const BufPosArrayTfm& oOther) {
    CopyFrom(oOther);
    return *this;
}

BufPosArrayTfm::~BufPosArrayTfm() { FreeOwned(); }

void BufPosArrayTfm::Init() {
    mnNumCols = 0;
    mnNumRows = 0;
    mpafColPos = nullptr;
    mnColOff = 0;
    mpafRowPos = nullptr;
    mnRowOff = 0;
    mbOwner = true;
}

void BufPosArrayTfm::CopyFrom(const BufPosArrayTfm& oOther) {
    if (this == &oOther) {
        return;
    }
    // Everything that can fail comes before the first change of this object.
    Floats pafColPos;
    Floats pafRowPos;
    if (oOther.mbOwner) {
        pafColPos = CopyFloats(oOther.mpafColPos, oOther.GetNumPix());
        pafRowPos = CopyFloats(oOther.mpafRowPos, oOther.GetNumPix());
    }
    FreeOwned();
    mnNumCols = oOther.mnNumCols;
    mnNumRows = oOther.mnNumRows;
    mpafColPos = oOther.mbOwner ? pafColPos.release() : oOther.mpafColPos;
    mpafRowPos = oOther.mbOwner ? pafRowPos.release() : oOther.mpafRowPos;
    mbOwner = oOther.mbOwner;
    mnColOff = oOther.mnColOff;
    mnRowOff = oOther.mnRowOff;
}

void BufPosArrayTfm::FreeOwned() {
    if (mbOwner) {
        delete[] mpafColPos;
        delete[] mpafRowPos;
    }
    mpafColPos = nullptr;
    mpafRowPos = nullptr;
}

int BufPosArrayTfm::GetNumCols() const { return mnNumCols; }
int BufPosArrayTfm::GetNumRows() const { return mnNumRows; }
long long BufPosArrayTfm::GetNumPix() const {
    return static_cast<long long>(mnNumCols) * mnNumRows;
}

void BufPosArrayTfm::GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const {
    dfCol = static_cast<double>(mpafColPos[nIdx]) + static_cast<double>(mnColOff);
    dfRow = static_cast<double>(mpafRowPos[nIdx]) + static_cast<double>(mnRowOff);
}

BufPosArrayTfm* BufPosArrayTfm::Clone() const { return new BufPosArrayTfm(*this); }

void BufPosArrayTfm::GetTfmParameters(const float*& pafColPos, int& nColOff,
                                      const float*& pafRowPos, int& nRowOff) const {
    pafColPos = mpafColPos;
    nColOff = mnColOff;
    pafRowPos = mpafRowPos;
    nRowOff = mnRowOff;
}

}  // namespace vetra::utils
