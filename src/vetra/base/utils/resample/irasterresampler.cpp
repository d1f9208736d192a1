#include "vetra/base/utils/resample/irasterresampler.h"

#include "vetra/base/utils/resample/resample.h"

namespace vetra::utils {

IRasterResampler::IRasterResampler() { IRasterResampler::Init(); }

IRasterResampler::IRasterResampler(const IRasterResampler& oOther) {
    IRasterResampler::Init();
    IRasterResampler::CopyFrom(oOther);
}

IRasterResampler::~IRasterResampler() = default;

void IRasterResampler::Init() {
    mnRightMargin = 1;
    mnBottomMargin = 1;
    mnColOff = 0;
    mnRowOff = 0;
    mnWndCols = 1;
    mnWndRows = 1;
    meColAnchor = eWAP_NEAREST;
    meRowAnchor = eWAP_NEAREST;
}

void IRasterResampler::CopyFrom(const IRasterResampler& oOther) {
    if (this == &oOther) {
        return;
    }
    moResampleInfo = oOther.moResampleInfo;
    mnRightMargin = oOther.mnRightMargin;
    mnBottomMargin = oOther.mnBottomMargin;
    mnColOff = oOther.mnColOff;
    mnRowOff = oOther.mnRowOff;
    mnWndCols = oOther.mnWndCols;
    mnWndRows = oOther.mnWndRows;
    meColAnchor = oOther.meColAnchor;
    meRowAnchor = oOther.meRowAnchor;
}

void IRasterResampler::Resample(const ResampleBuffer& oSrc, ResampleBuffer& oTgt,
                                const IBufPosTfm& oTfm) const {
    utils::Resample(oSrc, oTgt, oTfm, moResampleInfo);
}

ResampleMethod IRasterResampler::GetResampleType() const { return moResampleInfo.meMethod; }
CoefficientMap IRasterResampler::GetCoefficients() const { return moResampleInfo.moCoefficients; }

void IRasterResampler::GetWindowExtents(int& nColOff, int& nRowOff, int& nWndCols, int& nWndRows,
                                        WindowAnchorPoint& eColAnchor,
                                        WindowAnchorPoint& eRowAnchor) const {
    nColOff = mnColOff;
    nRowOff = mnRowOff;
    nWndCols = mnWndCols;
    nWndRows = mnWndRows;
    eColAnchor = meColAnchor;
    eRowAnchor = meRowAnchor;
}

void IRasterResampler::GetSrcBufferMargins(int& nLeft, int& nTop, int& nRight, int& nBottom) const {
    nLeft = mnColOff;
    nTop = mnRowOff;
    nRight = mnRightMargin;
    nBottom = mnBottomMargin;
}

void IRasterResampler::GetClampRange(double& dfClampMin, double& dfClampMax) const {
    dfClampMin = moResampleInfo.mdfClampMin;
    dfClampMax = moResampleInfo.mdfClampMax;
}

bool IRasterResampler::GetClampBgdFlag() const { return moResampleInfo.mbClampBgd; }
double IRasterResampler::GetOutBgd() const { return moResampleInfo.mdfOutBgd; }
NodataFillAction IRasterResampler::GetNodataFillAction() const {
    return moResampleInfo.meNodataFillAction;
}
ResampleInfo IRasterResampler::GetResampleInfo() const { return moResampleInfo; }

void IRasterResampler::SetClampRange(double dfClampMin, double dfClampMax) {
    CheckClampRange(dfClampMin, dfClampMax);
    moResampleInfo.mdfClampMin = dfClampMin;
    moResampleInfo.mdfClampMax = dfClampMax;
}

void IRasterResampler::SetClampBgdFlag(bool bClampBgd) { moResampleInfo.mbClampBgd = bClampBgd; }
void IRasterResampler::SetOutBgd(double dfOutBgd) { moResampleInfo.mdfOutBgd = dfOutBgd; }
void IRasterResampler::SetNodataFillAction(NodataFillAction eFillAction) {
    moResampleInfo.meNodataFillAction = eFillAction;
}

void IRasterResampler::SetResampleInfo(const ResampleInfo& oInfo) { moResampleInfo = oInfo; }

void IRasterResampler::SetWindowExtents(int nColOff, int nRowOff, int nWndCols, int nWndRows,
                                        WindowAnchorPoint eColAnchor,
                                        WindowAnchorPoint eRowAnchor) {
    mnColOff = nColOff;
    mnRowOff = nRowOff;
    mnWndCols = nWndCols;
    mnWndRows = nWndRows;
    meColAnchor = eColAnchor;
    meRowAnchor = eRowAnchor;
    mnRightMargin = nColOff + nWndCols - (eColAnchor == eWAP_FLOOR ? 1 : 0);
    mnBottomMargin = nRowOff + nWndRows - (eRowAnchor == eWAP_FLOOR ? 1 : 0);
}

}  // namespace vetra::utils
