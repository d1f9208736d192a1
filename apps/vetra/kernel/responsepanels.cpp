#include "kernel/responsepanels.h"

#include <algorithm>
#include <cmath>
#include <numbers>

#include "kernel/response.h"

namespace vetra::tool {

namespace {

struct Curve {
    std::vector<Point> oPoints;
    const char* pszClass;
};

// Methods of that many sub-pixels look smooth, and are drawn so; with fewer their steps show.
constexpr int kSmoothSubPixels = 16;
constexpr double kNyquist = 0.5;
constexpr double kLastFrequency = 2.0;
constexpr double kLowestDecibels = -80.0;

std::vector<Point> GetImpulseResponse(const AxisFilter& oFilter) {
    std::vector<Point> oPoints;
    const double dfSubPixels = std::max(oFilter.nSubPixels, 1);
    for (int nTap = oFilter.nTaps - 1; nTap >= 0; --nTap) {
        for (int nPhase = 0; nPhase <= oFilter.nSubPixels; ++nPhase) {
            const auto Add = [&](double dfFraction) {
                oPoints.push_back({oFilter.GetFloor(nTap) + std::clamp(dfFraction, 0.0, 1.0),
                                   oFilter.GetWeight(nPhase, nTap)});
            };
            if (oFilter.nSubPixels >= kSmoothSubPixels) {
                Add(nPhase / dfSubPixels);
            } else {
                Add((nPhase - 0.5) / dfSubPixels);
                Add(oFilter.nSubPixels == 0 ? 1.0 : (nPhase + 0.5) / dfSubPixels);
            }
        }
    }
    return oPoints;
}

// How far a curve is from 0 along x, in whole pixels and at least a quarter more.
double GetReach(const std::vector<Curve>& oCurves) {
    double dfReach = 0.0;
    for (const Curve& oCurve : oCurves) {
        for (const Point& oPoint : oCurve.oPoints) {
            if (oPoint.dfY != 0.0) {
                dfReach = std::max(dfReach, std::abs(oPoint.dfX));
            }
        }
    }
    return std::ceil(dfReach + 0.25);
}

AxisRange GetWeightRange(const std::vector<Curve>& oCurves) {
    double dfLow = 0.0;
    double dfHigh = 0.0;
    for (const Curve& oCurve : oCurves) {
        for (const Point& oPoint : oCurve.oPoints) {
            dfLow = std::min(dfLow, oPoint.dfY);
            dfHigh = std::max(dfHigh, oPoint.dfY);
        }
    }
    // A kernel of nothing but zeros has a height too.
    const double dfHeight = dfHigh - dfLow > 1e-300 ? dfHigh - dfLow : 1.0;
    return MakeRange(dfLow - 0.06 * dfHeight, dfHigh + 0.06 * dfHeight, 8, "weight");
}

// The parts of a curve that are above a floor, down to it.
std::vector<std::vector<Point>> CutAtFloor(const std::vector<Point>& oPoints, double dfFloor) {
    std::vector<std::vector<Point>> oParts;
    bool bAbove = false;
    for (std::size_t n = 0; n < oPoints.size(); ++n) {
        const bool bWasAbove = bAbove;
        bAbove = oPoints[n].dfY > dfFloor;
        if (bAbove && !bWasAbove) {
            oParts.emplace_back();
            if (n > 0) {
                oParts.back().push_back({oPoints[n - 1].dfX, dfFloor});
            }
        }
        if (bAbove || bWasAbove) {
            oParts.back().push_back({oPoints[n].dfX, std::max(oPoints[n].dfY, dfFloor)});
        }
    }
    return oParts;
}

}  // namespace

void DrawImpulseResponses(SvgPicture& oPicture, const PanelArea& oArea,
                          const std::vector<DrawnFilter>& oFilters) {
    std::vector<Curve> oCurves;
    for (const DrawnFilter& o : oFilters) {
        Curve oCurve = {GetImpulseResponse(*o.poFilter), o.pszClass};
        const double dfCarrier = o.poFilter->dfCarrier;
        if (dfCarrier != 0.0) {
            oCurves.push_back({oCurve.oPoints, "envelope"});
            for (Point& oPoint : oCurve.oPoints) {
                oPoint.dfY *= std::cos(2.0 * std::numbers::pi * dfCarrier * oPoint.dfX);
            }
        }
        oCurves.push_back(oCurve);
    }
    const double dfReach = GetReach(oCurves);
    Panel oPanel(oPicture, oArea,
                 MakeRange(-dfReach, dfReach, 10, "position minus pixel, in pixels"),
                 GetWeightRange(oCurves));
    oPanel.DrawAxes();
    std::reverse(oCurves.begin(), oCurves.end());
    for (Curve& oCurve : oCurves) {
        std::vector<Point>& oPoints = oCurve.oPoints;
        oPoints.insert(oPoints.begin(), {{-dfReach, 0.0}, {oPoints.front().dfX, 0.0}});
        oPoints.insert(oPoints.end(), {{oPoints.back().dfX, 0.0}, {dfReach, 0.0}});
        oPanel.DrawCurve(oPoints, oCurve.pszClass);
    }
}

void DrawFrequencyResponses(SvgPicture& oPicture, const PanelArea& oArea,
                            const std::vector<DrawnFilter>& oFilters) {
    // Both sides of 0 where they differ.
    const bool bCarrier = std::any_of(oFilters.begin(), oFilters.end(), [](const DrawnFilter& o) {
        return o.poFilter->dfCarrier != 0.0;
    });
    const double dfFirst = bCarrier ? -kLastFrequency : 0.0;
    const double dfPassFirst = bCarrier ? -kNyquist : 0.0;
    std::vector<Curve> oCurves;
    double dfHigh = 1.0;
    for (const DrawnFilter& o : oFilters) {
        const double dfCarrier = o.poFilter->dfCarrier;
        const FrequencyGrid oGrid =
            MakeGrid(*o.poFilter, dfFirst - dfCarrier, kLastFrequency - dfCarrier);
        const std::vector<double> vdfGains = GetGains(*o.poFilter, oGrid);
        Curve& oCurve = oCurves.emplace_back(Curve{{}, o.pszClass});
        for (int n = 0; n < oGrid.nCount; ++n) {
            const double dfGain = vdfGains[static_cast<std::size_t>(n)];
            oCurve.oPoints.push_back({dfCarrier + oGrid.Get(n), dfGain});
            dfHigh = std::max(dfHigh, dfGain);
        }
    }
    std::reverse(oCurves.begin(), oCurves.end());

    const AxisRange oPlain = {dfFirst, kLastFrequency, 0.5, "", false};
    AxisRange oLabelled = oPlain;
    oLabelled.sTitle = "frequency, in cycles per pixel";
    oLabelled.bLabels = true;
    const double dfUpper = 0.62 * oArea.dfHeight;
    const double dfLower = 0.34 * oArea.dfHeight;
    Panel oGains(oPicture, {oArea.oCorner, oArea.dfWidth, dfUpper}, oPlain,
                 MakeRange(0.0, 1.12 * dfHigh, 6, "gain"));
    const Point oBelow = {oArea.oCorner.dfX, oArea.oCorner.dfY + oArea.dfHeight - dfLower};
    Panel oDecibels(oPicture, {oBelow, oArea.dfWidth, dfLower}, oLabelled,
                    {kLowestDecibels, 8.0, 20.0, "dB", true});
    for (Panel* poPanel : {&oGains, &oDecibels}) {
        poPanel->Shade(dfPassFirst, kNyquist);
        poPanel->DrawAxes();
    }
    oGains.DrawCurve({{-kNyquist, 0.0}, {-kNyquist, 1.0}, {kNyquist, 1.0}, {kNyquist, 0.0}},
                     "ideal");
    oGains.DrawHead((dfPassFirst + kNyquist) / 2.0, "pass band");
    oGains.DrawHead((kNyquist + kLastFrequency) / 2.0, "images");
    for (Curve& oCurve : oCurves) {
        oGains.DrawCurve(oCurve.oPoints, oCurve.pszClass);
        for (Point& oPoint : oCurve.oPoints) {
            oPoint.dfY = ToDecibels(oPoint.dfY);
        }
        for (const std::vector<Point>& oPart : CutAtFloor(oCurve.oPoints, kLowestDecibels)) {
            oDecibels.DrawCurve(oPart, oCurve.pszClass);
        }
    }
}

double ToDecibels(double dfGain) { return 20.0 * std::log10(dfGain); }

}  // namespace vetra::tool
