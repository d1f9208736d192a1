#ifndef VETRA_APPS_KERNEL_PANEL_H
#define VETRA_APPS_KERNEL_PANEL_H

#include <string>
#include <vector>

#include "kernel/svgpicture.h"

namespace vetra::tool {

/// What an axis of a panel shows.
struct AxisRange {
    double dfFirst = 0.0;
    double dfLast = 1.0;
    double dfTick = 1.0;  ///< ticks stand at its multiples
    std::string sTitle;
    bool bLabels = true;
};

/// The range from \p dfFirst to \p dfLast, widened to whole ticks of 1, 2 or 5 times a power of
/// ten. \param nTicks  about how many
AxisRange MakeRange(double dfFirst, double dfLast, int nTicks, const std::string& sTitle);

/// A diagram in a rectangle of a picture. Points are in the units of its axes; what lies outside
/// is drawn on the edge.
class Panel {
 public:
    Panel(SvgPicture& oPicture, Point oCorner, double dfWidth, double dfHeight, AxisRange oX,
          AxisRange oY);

    void Shade(double dfFirstX, double dfLastX);
    /// Draws frame, ticks and titles: after shades, before curves.
    void DrawAxes();
    void DrawCurve(const std::vector<Point>& oPoints, const char* pszClass);
    void DrawText(Point oPlace, const std::string& sText, const char* pszClass);

 private:
    Point Place(Point oPoint) const;

    SvgPicture& moPicture;
    Point moCorner;
    double mdfWidth;
    double mdfHeight;
    AxisRange moX;
    AxisRange moY;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_KERNEL_PANEL_H
