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

/// A range with at most \p nTicks distances of ticks, which are 1, 2 or 5 times a power of ten.
AxisRange MakeRange(double dfFirst, double dfLast, int nTicks, const std::string& sTitle);

/// A rectangle of a picture.
struct PanelArea {
    Point oCorner;
    double dfWidth;
    double dfHeight;
};

/// A diagram in a rectangle of a picture. Points are in the units of its axes; what lies outside
/// is drawn on the edge.
class Panel {
 public:
    /// \param oArea  of the frame; titles and numbers stand to the left of it and below
    Panel(SvgPicture& oPicture, const PanelArea& oArea, AxisRange oX, AxisRange oY);

    void Shade(double dfFirstX, double dfLastX);
    /// Draws frame, ticks and titles: after shades, before curves.
    void DrawAxes();
    void DrawCurve(const std::vector<Point>& oPoints, const char* pszClass);
    /// Writes above the frame.
    void DrawHead(double dfX, const std::string& sText);

 private:
    Point Place(Point oPoint) const;

    SvgPicture& moPicture;
    PanelArea moArea;
    AxisRange moX;
    AxisRange moY;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_KERNEL_PANEL_H
