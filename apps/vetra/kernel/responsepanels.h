#ifndef VETRA_APPS_KERNEL_RESPONSEPANELS_H
#define VETRA_APPS_KERNEL_RESPONSEPANELS_H

#include <vector>

#include "kernel/axisfilter.h"
#include "kernel/panel.h"
#include "kernel/svgpicture.h"

namespace vetra::tool {

/// A filter and the class of its curves.
struct DrawnFilter {
    const AxisFilter* poFilter;
    const char* pszClass;
};

/// Draws weights by the distance of the position from the pixel. With a carrier, the real part and
/// the envelope.
void DrawImpulseResponses(SvgPicture& oPicture, const PanelArea& oArea,
                          const std::vector<DrawnFilter>& oFilters);

/// Draws gains by frequency, in plain numbers above decibels. \throws Interrupted
void DrawFrequencyResponses(SvgPicture& oPicture, const PanelArea& oArea,
                            const std::vector<DrawnFilter>& oFilters);

/// 20 times the decimal logarithm of a gain.
double ToDecibels(double dfGain);

}  // namespace vetra::tool

#endif  // VETRA_APPS_KERNEL_RESPONSEPANELS_H
