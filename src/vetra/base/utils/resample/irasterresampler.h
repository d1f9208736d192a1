#ifndef VETRA_BASE_UTILS_RESAMPLE_IRASTERRESAMPLER_H
#define VETRA_BASE_UTILS_RESAMPLE_IRASTERRESAMPLER_H

#include "vetra/base/utils/resample/postfm/ibufpostfm.h"
#include "vetra/base/utils/resample/resamplebuffer.h"
#include "vetra/base/utils/resample/resampleinfo.h"
#include "vetra/export.h"

namespace vetra::utils {

/// The pixel from which a window's offsets count.
enum WindowAnchorPoint : int {
    eWAP_FLOOR = 0,    ///< the pixel at floor(position)
    eWAP_NEAREST = 1,  ///< the nearest pixel, at floor(position + 0.5)
};

/// A sampling method with all its parameters, and the window of source pixels that it touches.
///
/// A new resampler has the widest clamp range, the lowest finite double as background, keeps
/// computed values off the background, and fills with the nearest sample. With the background at
/// the lowest value an unsigned image's zeros come out as ones: call `SetClampBgdFlag(false)` when
/// the target's lowest value is an ordinary one.
///
/// `Resample` may run from several threads on one object, each with a target of its own; the
/// setters need the caller's exclusion.
///
/// Derive from this class to give your own parameters to one of the methods: call
/// `SetResampleInfo` and `SetWindowExtents` in the constructor.
class VETRA_EXPORT IRasterResampler {
 public:
    /// Cubic sampling by `ResampleInfo`'s defaults, with the window of a single pixel.
    IRasterResampler();
    virtual ~IRasterResampler();

    /// A new object of the same class with the same parameters, which the caller owns.
    virtual IRasterResampler* Clone() const = 0;

    /// Fills a target image: the free `Resample` with this object's parameters, and its failures.
    virtual void Resample(const ResampleBuffer& oSrc, ResampleBuffer& oTgt,
                          const IBufPosTfm& oTfm) const;

    /// The method.
    virtual ResampleMethod GetResampleType() const;
    /// The method's own parameters, as text.
    virtual CoefficientMap GetCoefficients() const;

    /// The window, relative to its anchor pixel.
    /// \param nColOff     column of the first pixel
    /// \param nRowOff     row of the first pixel
    /// \param nWndCols    columns
    /// \param nWndRows    rows
    /// \param eColAnchor  what the column offset counts from
    /// \param eRowAnchor  what the row offset counts from
    virtual void GetWindowExtents(int& nColOff, int& nRowOff, int& nWndCols, int& nWndRows,
                                  WindowAnchorPoint& eColAnchor,
                                  WindowAnchorPoint& eRowAnchor) const;

    /// The source block that a position needs: columns floor(x) + \p nLeft to floor(x) + \p nRight
    /// and rows floor(y) + \p nTop to floor(y) + \p nBottom hold every pixel that the method can
    /// read for position (x, y). \p nLeft and \p nTop are 0 or negative.
    virtual void GetSrcBufferMargins(int& nLeft, int& nTop, int& nRight, int& nBottom) const;

    /// Limits of computed values.
    virtual void GetClampRange(double& dfClampMin, double& dfClampMax) const;
    /// Whether computed values are kept off the background value.
    virtual bool GetClampBgdFlag() const;
    /// The background value.
    virtual double GetOutBgd() const;
    /// What replaces an interpolation whose window lacks valid pixels.
    virtual NodataFillAction GetNodataFillAction() const;
    /// All parameters, as the free `Resample` takes them.
    virtual ResampleInfo GetResampleInfo() const;

    /// \throws ParameterException when \p dfClampMin is greater than \p dfClampMax; the range stays
    ///         as it was then.
    virtual void SetClampRange(double dfClampMin, double dfClampMax);
    /// Whether computed values are to be kept off the background value: those that would equal it
    /// are moved by one step, see `PixelClamp`.
    virtual void SetClampBgdFlag(bool bClampBgd);
    /// The value of pixels that nothing is computed for. It is saturated to the target's type and,
    /// for an integer type, cut toward zero when it is written; clamp limits don't apply to it.
    virtual void SetOutBgd(double dfOutBgd);
    /// What is to replace an interpolation whose window lacks valid pixels.
    virtual void SetNodataFillAction(NodataFillAction eFillAction);

 protected:
    /// Sets window, anchors and margins to those of a single pixel.
    virtual void Init();
    /// Takes over all parameters and the window of another object.
    virtual void CopyFrom(const IRasterResampler& oOther);

    /// As `CopyFrom`.
    IRasterResampler(const IRasterResampler& oOther);

    /// Replaces all parameters: method, coefficients, weights, clamp range, background and fill.
    void SetResampleInfo(const ResampleInfo& oInfo);
    /// Stores the window and derives the right and bottom margins: the last offset of the window,
    /// plus 1 where the anchor is the nearest pixel, which can lie one beyond the floor.
    void SetWindowExtents(int nColOff, int nRowOff, int nWndCols, int nWndRows,
                          WindowAnchorPoint eColAnchor, WindowAnchorPoint eRowAnchor);

 private:
    IRasterResampler& operator=(const IRasterResampler&) = delete;

    ResampleInfo moResampleInfo;
    int mnRightMargin;
    int mnBottomMargin;
    int mnColOff;
    int mnRowOff;
    int mnWndCols;
    int mnWndRows;
    WindowAnchorPoint meColAnchor;
    WindowAnchorPoint meRowAnchor;
};

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_RESAMPLE_IRASTERRESAMPLER_H
