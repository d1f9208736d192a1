#include "kernel/kernelplot.h"

#include <algorithm>
#include <cmath>
#include <numbers>
#include <vector>

#include "gdalraster/errors.h"
#include "kernel/axisfilter.h"
#include "kernel/panel.h"
#include "kernel/response.h"
#include "kernel/svgpicture.h"
#include "methods.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::tool {

namespace {

using Curve = std::vector<Point>;

constexpr std::size_t kMostWeights = 1000000;
constexpr double kLargestWeight = 1e100;
// Methods of that many sub-pixels look smooth, and are drawn so; with fewer their steps show.
constexpr int kSmoothSubPixels = 16;
constexpr double kLastFrequency = 2.0;
constexpr double kLowestDecibels = -80.0;
constexpr int kLongestTitle = 100;

constexpr int kWidth = 960;
constexpr double kTop = 62;
constexpr double kPanelHeight = 300;
constexpr double kTableTop = 434;
constexpr double kLineHeight = 22;

constexpr const char* kCss =
    "text { font: 12px 'DejaVu Sans', Verdana, sans-serif; fill: #333; }\n"
    ".title { font-size: 16px; font-weight: bold; }\n"
    ".axis, .tick { text-anchor: middle; }\n"
    ".tick { font-size: 11px; fill: #555; }\n"
    ".left, .figure { text-anchor: end; }\n"
    ".head { text-anchor: end; fill: #666; }\n"
    ".band { fill: #eef4ee; }\n"
    ".frame, polyline { fill: none; }\n"
    ".frame, .zero { stroke: #888; }\n"
    ".grid { stroke: #e2e2e2; }\n"
    ".ideal { stroke: #555; stroke-dasharray: 5 4; }\n"
    ".cols, .rows { stroke: #1763ab; stroke-width: 2; stroke-linejoin: round; }\n"
    ".rows { stroke: #d9660a; }\n"
    ".envelope { stroke: #d9660a; stroke-dasharray: 2 3; }\n";

// One axis of the image, or both where they are alike.
struct Series {
    const AxisFilter* poFilter;
    const char* pszName;
    const char* pszClass;
    ResponseFigures oFigures;
};

void CheckDrawable(const AxisFilter& oFilter) {
    const std::vector<double>& vdf = oFilter.vdfWeights;
    if (vdf.size() > kMostWeights) {
        throw RunError("the method has too many weights to be drawn");
    }
    if (!std::all_of(vdf.begin(), vdf.end(),
                     [](double df) { return std::abs(df) <= kLargestWeight; })) {
        throw RunError("the method has weights that are too large to be drawn, or no numbers");
    }
}

std::vector<Series> GetSeries(const MethodFilters& oFilters) {
    std::vector<Series> oSeries;
    if (oFilters.oCols == oFilters.oRows) {
        oSeries.push_back({&oFilters.oCols, "columns and rows", "cols", {}});
    } else {
        oSeries.push_back({&oFilters.oCols, "columns", "cols", {}});
        oSeries.push_back({&oFilters.oRows, "rows", "rows", {}});
    }
    for (Series& o : oSeries) {
        CheckDrawable(*o.poFilter);
        o.oFigures = GetFigures(*o.poFilter);
    }
    return oSeries;
}

// Weights by the distance of the position from the pixel, in ascending order.
Curve GetImpulseResponse(const AxisFilter& oFilter) {
    Curve oCurve;
    for (int nTap = oFilter.nTaps - 1; nTap >= 0; --nTap) {
        for (int nPhase = 0; nPhase <= oFilter.nSubPixels; ++nPhase) {
            const double dfWeight = oFilter.GetWeight(nPhase, nTap);
            const double dfSubPixels = std::max(oFilter.nSubPixels, 1);
            const auto Add = [&](double dfPhase) {
                oCurve.push_back(
                    {oFilter.GetFloor(nTap) + std::clamp(dfPhase / dfSubPixels, 0.0, 1.0),
                     dfWeight});
            };
            if (oFilter.nSubPixels >= kSmoothSubPixels) {
                Add(nPhase);
            } else {
                Add(nPhase - 0.5);
                Add(oFilter.nSubPixels == 0 ? 1.0 : nPhase + 0.5);
            }
        }
    }
    oCurve.insert(oCurve.begin(), {oCurve.front().dfX, 0.0});
    oCurve.push_back({oCurve.back().dfX, 0.0});
    return oCurve;
}

void DrawImpulseResponses(SvgPicture& oPicture, const std::vector<Series>& oSeries) {
    std::vector<Curve> oCurves;
    double dfReach = 0.0;
    double dfLow = 0.0;
    double dfHigh = 0.0;
    for (const Series& o : oSeries) {
        const Curve oCurve = GetImpulseResponse(*o.poFilter);
        oCurves.push_back(oCurve);
        const bool bCarrier = o.poFilter->dfCarrier != 0.0;
        for (const Point& oPoint : oCurve) {
            if (oPoint.dfY != 0.0) {
                dfReach = std::max(dfReach, std::abs(oPoint.dfX));
            }
            dfLow = std::min({dfLow, oPoint.dfY, bCarrier ? -oPoint.dfY : 0.0});
            dfHigh = std::max({dfHigh, oPoint.dfY, bCarrier ? -oPoint.dfY : 0.0});
        }
    }
    dfReach = std::ceil(dfReach + 0.25);
    const double dfHeight = dfHigh - dfLow > 1e-300 ? dfHigh - dfLow : 1.0;
    Panel oPanel(oPicture, {76, kTop}, 384, kPanelHeight,
                 MakeRange(-dfReach, dfReach, 8, "position minus pixel, in pixels"),
                 MakeRange(dfLow, dfLow + 1.02 * dfHeight, 7, "weight"));
    oPanel.DrawAxes();
    for (std::size_t n = oSeries.size(); n-- > 0;) {
        Curve& oCurve = oCurves[n];
        oCurve.insert(oCurve.begin(), {-dfReach, 0.0});
        oCurve.push_back({dfReach, 0.0});
        const double dfCarrier = oSeries[n].poFilter->dfCarrier;
        if (dfCarrier != 0.0) {
            Curve oMirrored = oCurve;
            for (Point& oPoint : oMirrored) {
                oPoint.dfY = -oPoint.dfY;
            }
            oPanel.DrawCurve(oCurve, "envelope");
            oPanel.DrawCurve(oMirrored, "envelope");
            for (Point& oPoint : oCurve) {
                oPoint.dfY *= std::cos(2.0 * std::numbers::pi * dfCarrier * oPoint.dfX);
            }
        }
        oPanel.DrawCurve(oCurve, oSeries[n].pszClass);
    }
}

double ToDecibels(double dfGain) { return 20.0 * std::log10(dfGain); }

void DrawFrequencyResponses(SvgPicture& oPicture, const std::vector<Series>& oSeries) {
    std::vector<Curve> oCurves;
    double dfFirst = 0.0;
    double dfHigh = 1.0;
    for (const Series& o : oSeries) {
        if (o.poFilter->dfCarrier != 0.0) {
            dfFirst = -kLastFrequency;
        }
    }
    for (const Series& o : oSeries) {
        const double dfCarrier = o.poFilter->dfCarrier;
        const FrequencyGrid oGrid =
            MakeGrid(*o.poFilter, dfFirst - dfCarrier, kLastFrequency - dfCarrier);
        const std::vector<double> vdfGains = GetGains(*o.poFilter, oGrid);
        Curve& oCurve = oCurves.emplace_back();
        for (int n = 0; n < oGrid.nCount; ++n) {
            oCurve.push_back({dfCarrier + oGrid.Get(n), vdfGains[static_cast<std::size_t>(n)]});
            dfHigh = std::max(dfHigh, oCurve.back().dfY);
        }
    }
    AxisRange oFrequencies = {dfFirst, kLastFrequency, 0.5, "frequency, in cycles per pixel", true};
    const double dfLeft = 552;
    const double dfPanelWidth = 384;
    const double dfUpper = 180;
    const double dfGap = 14;
    oFrequencies.bLabels = false;
    Panel oGains(oPicture, {dfLeft, kTop}, dfPanelWidth, dfUpper, oFrequencies,
                 MakeRange(0.0, 1.02 * dfHigh, 5, "gain"));
    oFrequencies.bLabels = true;
    Panel oDecibels(oPicture, {dfLeft, kTop + dfUpper + dfGap}, dfPanelWidth,
                    kPanelHeight - dfUpper - dfGap, oFrequencies,
                    {kLowestDecibels, 0.0, 20.0, "dB", true});
    const double dfNyquist = 0.5;
    const double dfPassFirst = std::max(-dfNyquist, dfFirst);
    for (Panel* poPanel : {&oGains, &oDecibels}) {
        poPanel->Shade(dfPassFirst, dfNyquist);
        poPanel->DrawAxes();
    }
    oGains.DrawCurve({{dfPassFirst, dfPassFirst < 0.0 ? 0.0 : 1.0},
                      {dfPassFirst, 1.0},
                      {dfNyquist, 1.0},
                      {dfNyquist, 0.0}},
                     "ideal");
    for (std::size_t n = oSeries.size(); n-- > 0;) {
        Curve& oCurve = oCurves[n];
        oGains.DrawCurve(oCurve, oSeries[n].pszClass);
        for (Point& oPoint : oCurve) {
            oPoint.dfY = std::max(kLowestDecibels, ToDecibels(oPoint.dfY));
        }
        oDecibels.DrawCurve(oCurve, oSeries[n].pszClass);
    }
    const auto Place = [&](double dfFrequency) {
        const double dfPart = (dfFrequency - dfFirst) / (kLastFrequency - dfFirst);
        return Point{dfLeft + dfPanelWidth * dfPart, kTop - 8};
    };
    oPicture.AddText(Place((dfPassFirst + dfNyquist) / 2), "pass band", "axis");
    oPicture.AddText(Place((dfNyquist + kLastFrequency) / 2), "images", "axis");
}

std::string Gain(double dfGain) {
    return dfGain > 0.0 ? FormatString("%.3f (%.1f dB)", dfGain, ToDecibels(dfGain)) : "0";
}

// Also says which curve is which.
void DrawTable(SvgPicture& oPicture, const std::vector<Series>& oSeries) {
    struct Column {
        double dfRight;
        const char* pszHead;
    };
    constexpr Column kColumns[] = {{214, "taps"},
                                   {290, "gain at 0"},
                                   {424, "at 0.25"},
                                   {558, "at 0.5 (Nyquist)"},
                                   {698, "largest image"},
                                   {796, "overshoot"},
                                   {936, "smallest weight"}};
    for (const Column& oColumn : kColumns) {
        oPicture.AddText({oColumn.dfRight, kTableTop}, oColumn.pszHead, "head");
    }
    double dfY = kTableTop;
    for (const Series& o : oSeries) {
        dfY += kLineHeight;
        oPicture.AddLines({{24, dfY - 4}, {48, dfY - 4}}, o.pszClass);
        oPicture.AddText({56, dfY}, o.pszName, "name");
        const ResponseFigures& oFigures = o.oFigures;
        const std::string sFigures[] = {
            std::to_string(o.poFilter->nTaps),
            FormatString("%.3f", oFigures.dfGainAtZero),
            Gain(oFigures.dfGainAtHalfNyquist),
            Gain(oFigures.dfGainAtNyquist),
            Gain(oFigures.dfLargestImage),
            FormatString("%.1f %%", 100.0 * oFigures.dfOvershoot),
            FormatString("%.3f", oFigures.dfSmallestWeight)};
        for (std::size_t n = 0; n < std::size(kColumns); ++n) {
            oPicture.AddText({kColumns[n].dfRight, dfY}, sFigures[n], "figure");
        }
    }
}

std::vector<std::string> GetNotes(const utils::IRasterResampler& oResampler,
                                  const std::vector<Series>& oSeries) {
    std::vector<std::string> oNotes = {
        "Largest image: gain from 0.75 on, where detail of up to 0.25 cycles per pixel reappears. "
        "Overshoot: beside a step, in parts of its height."};
    const ResampleMethod eMethod = oResampler.GetResampleType();
    if (GetPlainTwin(eMethod) != eMethod) {
        oNotes.push_back("The method does this to the square roots of samples.");
    }
    if (GetPlainTwin(eMethod) == eRM_AVERAGE) {
        oNotes.push_back(
            "The window starts at the nearest pixel: so the method has it. vetra resample moves it "
            "to lie around the position.");
    }
    for (const Series& o : oSeries) {
        const double dfCarrier = o.poFilter->dfCarrier;
        if (dfCarrier != 0.0) {
            int nCols = 0;
            int nRows = 0;
            int nColOff, nRowOff;
            utils::WindowAnchorPoint eColAnchor, eRowAnchor;
            oResampler.GetWindowExtents(nColOff, nRowOff, nCols, nRows, eColAnchor, eRowAnchor);
            oNotes.push_back(FormatString(
                "Rows: real part and envelope around the carrier of %g cycles per row, from which "
                "their gains count. All results carry a phase of %g degrees.",
                dfCarrier, std::remainder(-360.0 * dfCarrier * ((nRows - 1) / 2), 360.0)));
        }
        const double dfLow = o.oFigures.dfSmallestSum;
        const double dfHigh = o.oFigures.dfLargestSum;
        if (std::max(std::abs(dfLow - 1.0), std::abs(dfHigh - 1.0)) > 1e-6) {
            oNotes.push_back(FormatString(
                "%s: the weights of a phase sum to %.6g to %.6g, not to 1: the level changes.",
                o.pszName, dfLow, dfHigh));
        }
    }
    return oNotes;
}

}  // namespace

std::string DrawKernel(const utils::IRasterResampler& oResampler, const std::string& sMethod) {
    const MethodFilters oFilters = GetMethodFilters(oResampler);
    const std::vector<Series> oSeries = GetSeries(oFilters);
    const std::vector<std::string> oNotes = GetNotes(oResampler, oSeries);
    const double dfNotesTop =
        kTableTop + kLineHeight * static_cast<double>(oSeries.size() + 1) + 8;
    const int nHeight =
        static_cast<int>(dfNotesTop + kLineHeight * static_cast<double>(oNotes.size()));
    std::string sTitle = OneLine(sMethod);
    if (sTitle.size() > kLongestTitle) {
        sTitle = sTitle.substr(0, kLongestTitle) + "...";
    }
    SvgPicture oPicture(kWidth, nHeight, sTitle, kCss);
    oPicture.AddText({24, 30}, sTitle, "title");
    DrawImpulseResponses(oPicture, oSeries);
    DrawFrequencyResponses(oPicture, oSeries);
    DrawTable(oPicture, oSeries);
    double dfY = dfNotesTop;
    for (const std::string& sNote : oNotes) {
        oPicture.AddText({24, dfY}, sNote, "note");
        dfY += kLineHeight;
    }
    return oPicture.Finish();
}

}  // namespace vetra::tool
