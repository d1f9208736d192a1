#include "kernel/kernelplot.h"

#include <algorithm>
#include <cmath>
#include <vector>

#include "gdalraster/errors.h"
#include "kernel/axisfilter.h"
#include "kernel/response.h"
#include "kernel/responsepanels.h"
#include "kernel/svgpicture.h"
#include "methods.h"
#include "vetra/textcore/formatstring.h"

namespace vetra::tool {

namespace {

constexpr std::size_t kMostWeights = 1000000;
constexpr double kLargestWeight = 1e100;
constexpr int kLongestTitle = 100;

constexpr int kWidth = 960;
constexpr PanelArea kLeftArea = {{76, 62}, 384, 300};
constexpr PanelArea kRightArea = {{552, 62}, 384, 300};
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
    int nWindow;
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

std::vector<Series> GetSeries(const MethodFilters& oFilters,
                              const utils::IRasterResampler& oResampler) {
    int nColOff, nRowOff, nCols, nRows;
    utils::WindowAnchorPoint eColAnchor, eRowAnchor;
    oResampler.GetWindowExtents(nColOff, nRowOff, nCols, nRows, eColAnchor, eRowAnchor);
    std::vector<Series> oSeries;
    if (oFilters.oCols == oFilters.oRows) {
        oSeries.push_back({&oFilters.oCols, nCols, "columns and rows", "cols", {}});
    } else {
        oSeries.push_back({&oFilters.oCols, nCols, "columns", "cols", {}});
        oSeries.push_back({&oFilters.oRows, nRows, "rows", "rows", {}});
    }
    for (Series& o : oSeries) {
        CheckDrawable(*o.poFilter);
        o.oFigures = GetFigures(*o.poFilter);
    }
    return oSeries;
}

std::string Gain(double dfGain) {
    // Below are the zeros of a response, up to rounding.
    const double dfLeast = 1e-6;
    if (dfGain < dfLeast) {
        return FormatString("0 (below %.0f dB)", ToDecibels(dfLeast));
    }
    // The sum turns -0 into 0.
    const double dfTenths = std::round(10.0 * ToDecibels(dfGain)) + 0.0;
    return FormatString("%.3f (%.1f dB)", dfGain, dfTenths / 10.0);
}

// Also says which curve is which.
void DrawTable(SvgPicture& oPicture, const std::vector<Series>& oSeries) {
    struct Column {
        double dfRight;
        const char* pszHead;
    };
    constexpr Column kColumns[] = {{214, "taps"},           {290, "gain at 0"},
                                   {424, "at 0.25"},        {558, "at 0.5 (Nyquist)"},
                                   {698, "largest image"},  {796, "overshoot"},
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
        const std::string sFigures[] = {std::to_string(o.nWindow),
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
        "Dashed: the ideal low pass. Largest image: gain from 0.75 on, where detail of up to 0.25 "
        "cycles per pixel reappears.",
        "Overshoot: beside a step, in parts of its height."};
    const ResampleMethod eMethod = oResampler.GetResampleType();
    if (GetPlainTwin(eMethod) != eMethod) {
        oNotes.push_back("The method does this to the square roots of samples.");
    }
    if (GetPlainTwin(eMethod) == eRM_AVERAGE) {
        oNotes.push_back(
            "As the method works by itself: its window starts at the nearest pixel. vetra resample "
            "moves it to lie around the position.");
    }
    for (const Series& o : oSeries) {
        const double dfCarrier = o.poFilter->dfCarrier;
        if (dfCarrier != 0.0) {
            const double dfPhase =
                std::remainder(-360.0 * dfCarrier * ((o.nWindow - 1) / 2), 360.0);
            oNotes.push_back(FormatString(
                "Rows: real part and envelope around the carrier of %g cycles per row, from which "
                "their gains count. All results carry a phase of %g degrees.",
                dfCarrier, dfPhase + 0.0));
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
    const std::vector<Series> oSeries = GetSeries(oFilters, oResampler);
    const std::vector<std::string> oNotes = GetNotes(oResampler, oSeries);
    const double dfNotesTop = kTableTop + kLineHeight * static_cast<double>(oSeries.size() + 1) + 8;
    const int nHeight =
        static_cast<int>(dfNotesTop + kLineHeight * static_cast<double>(oNotes.size()));
    std::string sTitle = OneLine(sMethod);
    if (sTitle.size() > kLongestTitle) {
        sTitle = sTitle.substr(0, kLongestTitle) + "...";
    }
    SvgPicture oPicture(kWidth, nHeight, sTitle, kCss);
    oPicture.AddText({24, 30}, sTitle, "title");
    std::vector<DrawnFilter> oDrawn;
    for (const Series& o : oSeries) {
        oDrawn.push_back({o.poFilter, o.pszClass});
    }
    DrawImpulseResponses(oPicture, kLeftArea, oDrawn);
    DrawFrequencyResponses(oPicture, kRightArea, oDrawn);
    DrawTable(oPicture, oSeries);
    double dfY = dfNotesTop;
    for (const std::string& sNote : oNotes) {
        oPicture.AddText({24, dfY}, sNote, "note");
        dfY += kLineHeight;
    }
    return oPicture.Finish();
}

}  // namespace vetra::tool
