#ifndef VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSSCALEOFFTFM_H
#define VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSSCALEOFFTFM_H

#include "vetra/base/utils/resample/postfm/ibufpostfm.h"

namespace vetra::utils {

/// An axis-aligned scale and offset.
///
/// Scale and offset act on pixel edges, where the centre of pixel n lies at n + 0.5: target column
/// x falls on source column `(x + start + 0.5) * scale + offset - 0.5`, rows likewise. With scale 2
/// and offset 0, column 0 falls midway between source columns 0 and 1. Scales may be negative or 0.
class VETRA_EXPORT BufPosScaleOffTfm : public IBufPosTfm {
 public:
    /// \param nNumCols    target columns, at least 1
    /// \param nNumRows    target rows, at least 1
    /// \param dfColScale  source columns per target column
    /// \param dfColOff    source column edge on which the target's left edge falls
    /// \param dfRowScale  source rows per target row
    /// \param dfRowOff    source row edge on which the target's upper edge falls
    /// \param nColStart   added to the target column before scaling; sums wrap in 32 bits
    /// \param nRowStart   added to the target row before scaling
    /// \throws ParameterException for a size below 1.
    BufPosScaleOffTfm(int nNumCols, int nNumRows, double dfColScale, double dfColOff,
                      double dfRowScale, double dfRowOff, int nColStart, int nRowStart);
    /// A copy.
    BufPosScaleOffTfm(const BufPosScaleOffTfm& oOther);
    /// A copy.
    BufPosScaleOffTfm& operator=(const BufPosScaleOffTfm& oOther);
    ~BufPosScaleOffTfm() override;

    int GetNumCols() const override;
    int GetNumRows() const override;
    long long GetNumPix() const override;
    void GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const override;
    BufPosScaleOffTfm* Clone() const override;

    /// Hands out what the constructor was given, but for the size.
    void GetTfmParameters(double& dfColScale, double& dfColOff, double& dfRowScale,
                          double& dfRowOff, int& nColStart, int& nRowStart) const;

 private:
    int mnNumCols;
    int mnNumRows;
    int mnColStart;
    int mnRowStart;
    double mdfColScale;
    double mdfColOff;
    double mdfRowScale;
    double mdfRowOff;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_POSTFM_BUFPOSSCALEOFFTFM_H
