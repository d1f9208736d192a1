#include "kernel/panel.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "vetra/textcore/formatstring.h"

namespace vetra::tool {

namespace {

// Of the points between two, those that a line from one to the other misses by more than can be
// seen, and of what they leave again those.
void KeepBends(const std::vector<Point>& oPoints, std::size_t nFirst, std::size_t nLast,
               std::vector<Point>& oKept) {
    const Point& a = oPoints[nFirst];
    const Point oStep = {oPoints[nLast].dfX - a.dfX, oPoints[nLast].dfY - a.dfY};
    const double dfLength = std::hypot(oStep.dfX, oStep.dfY);
    std::size_t nFarthest = nFirst;
    double dfFarthest = 0.05;
    for (std::size_t n = nFirst + 1; n < nLast; ++n) {
        const Point o = {oPoints[n].dfX - a.dfX, oPoints[n].dfY - a.dfY};
        const double dfMissed = dfLength > 0.0
                                    ? std::abs(oStep.dfX * o.dfY - oStep.dfY * o.dfX) / dfLength
                                    : std::hypot(o.dfX, o.dfY);
        if (dfMissed > dfFarthest) {
            dfFarthest = dfMissed;
            nFarthest = n;
        }
    }
    if (nFarthest != nFirst) {
        KeepBends(oPoints, nFirst, nFarthest, oKept);
        oKept.push_back(oPoints[nFarthest]);
        KeepBends(oPoints, nFarthest, nLast, oKept);
    }
}

// A curve with as few points as it takes to look the same. Where many points have one place across,
// the first, the lowest, the highest and the last of them will do.
std::vector<Point> Thin(const std::vector<Point>& oPoints) {
    const auto SamePlace = [](const Point& a, const Point& b) {
        return std::lround(2.0 * a.dfX) == std::lround(2.0 * b.dfX);
    };
    const auto Lower = [](const Point& a, const Point& b) { return a.dfY < b.dfY; };
    std::vector<Point> oFew;
    for (auto oFirst = oPoints.begin(); oFirst != oPoints.end();) {
        const auto oEnd = std::find_if_not(oFirst, oPoints.end(),
                                           [&](const Point& o) { return SamePlace(o, *oFirst); });
        const auto [oLow, oHigh] = std::minmax_element(oFirst, oEnd, Lower);
        std::vector oOrder = {oFirst, std::min(oLow, oHigh), std::max(oLow, oHigh), oEnd - 1};
        oOrder.erase(std::unique(oOrder.begin(), oOrder.end()), oOrder.end());
        for (const auto& o : oOrder) {
            oFew.push_back(*o);
        }
        oFirst = oEnd;
    }
    std::vector<Point> oKept = {oFew.front()};
    KeepBends(oFew, 0, oFew.size() - 1, oKept);
    oKept.push_back(oFew.back());
    return oKept;
}

// Ticks that lie in a range, as multiples of their distance.
std::pair<long, long> GetTicks(const AxisRange& oRange) {
    const double dfSlack = 1e-9;
    return {std::lround(std::ceil(oRange.dfFirst / oRange.dfTick - dfSlack)),
            std::lround(std::floor(oRange.dfLast / oRange.dfTick + dfSlack))};
}

}  // namespace

AxisRange MakeRange(double dfFirst, double dfLast, int nTicks, const std::string& sTitle) {
    const double dfRough = (dfLast - dfFirst) / nTicks;
    const double dfPower = std::pow(10.0, std::floor(std::log10(dfRough)));
    double dfTick = 10.0 * dfPower;
    for (const double dfDigit : {5.0, 2.0, 1.0}) {
        if (dfDigit * dfPower >= 0.99 * dfRough) {
            dfTick = dfDigit * dfPower;
        }
    }
    return {dfFirst, dfLast, dfTick, sTitle, true};
}

Panel::Panel(SvgPicture& oPicture, const PanelArea& oArea, AxisRange oX, AxisRange oY)
    : moPicture(oPicture), moArea(oArea), moX(std::move(oX)), moY(std::move(oY)) {}

Point Panel::Place(Point oPoint) const {
    const auto Part = [](double df, const AxisRange& oRange) {
        return std::clamp((df - oRange.dfFirst) / (oRange.dfLast - oRange.dfFirst), 0.0, 1.0);
    };
    return {moArea.oCorner.dfX + moArea.dfWidth * Part(oPoint.dfX, moX),
            moArea.oCorner.dfY + moArea.dfHeight * (1.0 - Part(oPoint.dfY, moY))};
}

void Panel::Shade(double dfFirstX, double dfLastX) {
    const Point oFirst = Place({dfFirstX, moY.dfLast});
    const Point oLast = Place({dfLastX, moY.dfFirst});
    moPicture.AddRectangle(oFirst, oLast.dfX - oFirst.dfX, oLast.dfY - oFirst.dfY, "band");
}

void Panel::DrawAxes() {
    const auto [nFirstX, nLastX] = GetTicks(moX);
    for (long n = nFirstX; n <= nLastX; ++n) {
        const double dfX = static_cast<double>(n) * moX.dfTick;
        DrawCurve({{dfX, moY.dfFirst}, {dfX, moY.dfLast}}, n == 0 ? "zero" : "grid");
        if (moX.bLabels) {
            const Point oPlace = Place({dfX, moY.dfFirst});
            moPicture.AddText({oPlace.dfX, oPlace.dfY + 16}, FormatString("%g", dfX), "tick");
        }
    }
    const auto [nFirstY, nLastY] = GetTicks(moY);
    for (long n = nFirstY; n <= nLastY; ++n) {
        const double dfY = static_cast<double>(n) * moY.dfTick;
        DrawCurve({{moX.dfFirst, dfY}, {moX.dfLast, dfY}}, n == 0 ? "zero" : "grid");
        const Point oPlace = Place({moX.dfFirst, dfY});
        moPicture.AddText({oPlace.dfX - 6, oPlace.dfY + 4}, FormatString("%g", dfY), "tick left");
    }
    moPicture.AddRectangle(moArea.oCorner, moArea.dfWidth, moArea.dfHeight, "frame");
    if (moX.bLabels) {
        moPicture.AddText(
            {moArea.oCorner.dfX + moArea.dfWidth / 2, moArea.oCorner.dfY + moArea.dfHeight + 34},
            moX.sTitle, "axis");
    }
    moPicture.AddTextUpwards({moArea.oCorner.dfX - 44, moArea.oCorner.dfY + moArea.dfHeight / 2},
                             moY.sTitle, "axis");
}

void Panel::DrawCurve(const std::vector<Point>& oPoints, const char* pszClass) {
    std::vector<Point> oPlaces;
    for (const Point& oPoint : oPoints) {
        oPlaces.push_back(Place(oPoint));
    }
    moPicture.AddLines(Thin(oPlaces), pszClass);
}

void Panel::DrawHead(double dfX, const std::string& sText) {
    const Point oPlace = Place({dfX, moY.dfLast});
    moPicture.AddText({oPlace.dfX, oPlace.dfY - 8}, sText, "axis");
}

}  // namespace vetra::tool
