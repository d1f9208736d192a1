#include "vetra/base/utils/resample/engine/positions.h"

#include <algorithm>
#include <limits>
#include <typeinfo>

#include "vetra/base/utils/resample/postfm/bufposarraytfm.h"
#include "vetra/base/utils/resample/postfm/bufposbilineartfm.h"
#include "vetra/base/utils/resample/postfm/bufposdoublearraytfm.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"

namespace vetra::utils::engine {

namespace {

// The object as a T if it is exactly one: a class derived from T may give other positions.
template <typename T>
const T* ExactCast(const IBufPosTfm& oTfm) {
    return typeid(oTfm) == typeid(T) ? static_cast<const T*>(&oTfm) : nullptr;
}

PositionBounds Join(const PositionBounds& a, const PositionBounds& b) {
    return {std::min(a.dfFirstCol, b.dfFirstCol), std::max(a.dfLastCol, b.dfLastCol),
            std::min(a.dfFirstRow, b.dfFirstRow), std::max(a.dfLastRow, b.dfLastRow),
            a.bNumbers && b.bNumbers};
}

}  // namespace

Positions::Positions(const IBufPosTfm& oTfm)
    : mpoWhole(&oTfm), moPart{0, 0, oTfm.GetNumCols(), oTfm.GetNumRows()} {
    if (const auto* poBlock = ExactCast<BufPosBlockTfm>(oTfm)) {
        mpoWhole = &poBlock->GetWhole();
        moPart = poBlock->GetTarget();
        mnSrcCol = poBlock->GetSrcCol();
        mnSrcRow = poBlock->GetSrcRow();
    }
    mnWholeCols = mpoWhole->GetNumCols();
    if (const auto* poArray = ExactCast<BufPosArrayTfm>(*mpoWhole)) {
        meKind = Kind::eArray;
        poArray->GetTfmParameters(mpafCol, mnColOff, mpafRow, mnRowOff);
    } else if (const auto* poDoubles = ExactCast<BufPosDoubleArrayTfm>(*mpoWhole)) {
        meKind = Kind::eDoubleArray;
        poDoubles->GetTfmParameters(mpadfCol, mpadfRow);
    } else if (const auto* poBilinear = ExactCast<BufPosBilinearTfm>(*mpoWhole)) {
        meKind = Kind::eBilinear;
        double* c = moCorners.adfCol;
        double* r = moCorners.adfRow;
        poBilinear->GetTfmParameters(c[0], r[0], c[1], r[1], c[2], r[2], c[3], r[3]);
        moCorners.nCols = poBilinear->GetNumCols();
        moCorners.nRows = poBilinear->GetNumRows();
    } else if (ExactCast<BufPosScaleOffTfm>(*mpoWhole) != nullptr) {
        meKind = Kind::eScaleOff;
    } else if (mpoWhole == &oTfm) {
        // A caller's transform is asked by the flat index; what it says of its columns doesn't
        // matter.
        mnWholeCols = std::numeric_limits<int>::max();
        moPart.nCols = mnWholeCols;
    }
}

bool Positions::IsAxisAligned(int nTgtCols) const {
    return meKind == Kind::eScaleOff && moPart.nCols == nTgtCols;
}

PositionBounds Positions::Fill(const LevelStages& oStages, long long nFirst, int nPix,
                               double* padfCol, double* padfRow) const {
    PositionBounds oBounds{};
    int nDone = 0;
    while (nDone < nPix) {
        const long long nCol = (nFirst + nDone) % moPart.nCols;
        const long long nRow = (nFirst + nDone) / moPart.nCols;
        const int nStretch =
            static_cast<int>(std::min<long long>(nPix - nDone, moPart.nCols - nCol));
        const PositionBounds o = FillStretch(oStages, moPart.nCol + nCol, moPart.nRow + nRow,
                                             nStretch, padfCol + nDone, padfRow + nDone);
        oBounds = nDone == 0 ? o : Join(oBounds, o);
        nDone += nStretch;
    }
    if (mnSrcCol != 0 || mnSrcRow != 0) {
        for (int i = 0; i < nPix; ++i) {
            padfCol[i] -= mnSrcCol;
            padfRow[i] -= mnSrcRow;
        }
        oBounds.dfFirstCol -= mnSrcCol;
        oBounds.dfLastCol -= mnSrcCol;
        oBounds.dfFirstRow -= mnSrcRow;
        oBounds.dfLastRow -= mnSrcRow;
    }
    for (int i = nPix; i % kLanes != 0; ++i) {
        padfCol[i] = padfCol[nPix - 1];
        padfRow[i] = padfRow[nPix - 1];
    }
    return oBounds;
}

PositionBounds Positions::FillStretch(const LevelStages& oStages, long long nWholeCol,
                                      long long nWholeRow, int nPix, double* padfCol,
                                      double* padfRow) const {
    const long long nFirst = nWholeRow * mnWholeCols + nWholeCol;
    switch (meKind) {
        case Kind::eArray:
            return oStages.pfnArrayPositions(mpafCol + nFirst, mpafRow + nFirst, mnColOff, mnRowOff,
                                             nPix, padfCol, padfRow);
        case Kind::eDoubleArray:
            std::copy_n(mpadfCol + nFirst, nPix, padfCol);
            std::copy_n(mpadfRow + nFirst, nPix, padfRow);
            break;
        case Kind::eBilinear:
            oStages.pfnBilinearPositions(moCorners, nWholeCol, nWholeRow, nPix, padfCol, padfRow);
            break;
        case Kind::eScaleOff:
        case Kind::eOther:
            for (int i = 0; i < nPix; ++i) {
                mpoWhole->GetSrcPos(nFirst + i, padfCol[i], padfRow[i]);
            }
            break;
    }
    return oStages.pfnBounds(padfCol, padfRow, nPix);
}

}  // namespace vetra::utils::engine
