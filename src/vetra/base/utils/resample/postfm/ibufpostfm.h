#ifndef VETRA_BASE_UTILS_RESAMPLE_POSTFM_IBUFPOSTFM_H
#define VETRA_BASE_UTILS_RESAMPLE_POSTFM_IBUFPOSTFM_H

#include "vetra/export.h"

namespace vetra::utils {

/// Says where each target pixel falls in the source.
///
/// **Convention.** A position is a pair of doubles, column then row, in pixels of the source. A
/// whole number is the centre of a pixel: position p selects pixel floor(p + 0.5), so 2.5 selects
/// pixel 3 and -0.5 pixel 0. Positions outside the source, infinite and NaN ones are fine: such a
/// pixel gets the background.
///
/// Write your own by deriving from this class. Many threads call one object at the same time, so
/// the const operations keep no scratch state, take no lock, allocate nothing and don't throw.
class VETRA_EXPORT IBufPosTfm {
 public:
    /// For derived classes.
    IBufPosTfm() = default;
    /// For derived classes.
    IBufPosTfm(const IBufPosTfm&) = default;
    /// For derived classes.
    IBufPosTfm& operator=(const IBufPosTfm&) = default;
    virtual ~IBufPosTfm();

    /// Target columns.
    virtual int GetNumCols() const = 0;
    /// Target rows.
    virtual int GetNumRows() const = 0;
    /// Columns times rows.
    virtual long long GetNumPix() const = 0;
    /// The source position of one target pixel.
    ///
    /// \param nIdx   flat target index, y * columns + x, from 0 to `GetNumPix() - 1`; not checked
    /// \param dfCol  source column
    /// \param dfRow  source row
    virtual void GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const = 0;
    /// A new object of the same class, which the caller owns.
    virtual IBufPosTfm* Clone() const = 0;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_POSTFM_IBUFPOSTFM_H
