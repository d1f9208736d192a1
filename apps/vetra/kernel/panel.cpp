#include "kernel/panel.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "vetra/textcore/formatstring.h"

namespace vetra::tool {

namespace {

// Where a curve has many points to one place across, the first, the lowest, the highest and the
// last of them look the same as all.
std::vector<Point> Thin(const std::vector<Point>& oPoints) {
    const auto SamePlace = [](const Point& a, const Point& b) {
        return std::lround(2.0 * a.dfX) == std::lround(2.0 * b.dfX);
    };
    const auto Lower = [](const Point& a, const Point& b) { return a.dfY < b.dfY; };
    std::vector<Point> oKept;
    for (auto oFirst = oPoints.begin(); oFirst != oPoints.end();) {
        const auto oEnd = std::find_if_not(oFirst, oPoints.end(),
                                           [&](const Point& o) { return SamePlace(o, *oFirst); });
        const auto [oLow, oHigh] = std::minmax_element(oFirst, oEnd, Lower);
        std::vector oOrder = {oFirst, std::min(oLow, oHigh), std::max(oLow, oHigh), oEnd - 1};
        oOrder.erase(std::unique(oOrder.begin(), oOrder.end()), oOrder.end());
        for (const auto& o : oOrder) {
            oKept.push_back(*o);
        }
        oFirst = oEnd;
    }
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
    return {dfTick * std::floor(dfFirst / dfTick), dfTick * std::ceil(dfLast / dfTick), dfTick,
            sTitle, true};
}

Panel::Panel(SvgPicture& oPicture, Point oCorner, double dfWidth, double dfHeight, AxisRange oX,
             AxisRange oY)
    : moPicture(oPicture),
      moCorner(oCorner),
      mdfWidth(dfWidth),
      mdfHeight(dfHeight),
      moX(std::move(oX)),
      moY(std::move(oY)) {}

Point Panel::Place(Point oPoint) const {
    const auto Part = [](double df, const AxisRange& oRange) {
        return std::clamp((df - oRange.dfFirst) / (oRange.dfLast - oRange.dfFirst), 0.0, 1.0);
    };
    return {moCorner.dfX + mdfWidth * Part(oPoint.dfX, moX),
            moCorner.dfY + mdfHeight * (1.0 - Part(oPoint.dfY, moY))};
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
    moPicture.AddRectangle(moCorner, mdfWidth, mdfHeight, "frame");
    if (moX.bLabels) {
        moPicture.AddText({moCorner.dfX + mdfWidth / 2, moCorner.dfY + mdfHeight + 34}, moX.sTitle,
                          "axis");
    }
    moPicture.AddTextUpwards({moCorner.dfX - 44, moCorner.dfY + mdfHeight / 2}, moY.sTitle, "axis");
}

void Panel::DrawCurve(const std::vector<Point>& oPoints, const char* pszClass) {
    std::vector<Point> oPlaces;
    for (const Point& oPoint : oPoints) {
        oPlaces.push_back(Place(oPoint));
    }
    moPicture.AddLines(Thin(oPlaces), pszClass);
}

void Panel::DrawText(Point oPlace, const std::string& sText, const char* pszClass) {
    moPicture.AddText(Place(oPlace), sText, pszClass);
}

}  // namespace vetra::tool
