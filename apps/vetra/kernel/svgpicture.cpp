#include "kernel/svgpicture.h"

#include <cpl_string.h>

#include <algorithm>

#include "vetra/textcore/formatstring.h"

namespace vetra::tool {

namespace {

// A tenth of a unit is finer than what screens show.
std::string Number(double df) {
    std::string s = FormatString("%.1f", df);
    if (s.ends_with(".0")) {
        s.resize(s.size() - 2);
    }
    return s == "-0" ? "0" : s;
}

std::string Escape(std::string s) {
    const bool bUtf8 = CPLIsUTF8(s.c_str(), -1) != FALSE;
    std::replace_if(
        s.begin(), s.end(),
        [&](char c) {
            const auto by = static_cast<unsigned char>(c);
            return by < ' ' || by == 0x7f || (by > 0x7f && !bUtf8);
        },
        '?');
    char* pszEscaped = CPLEscapeString(s.c_str(), -1, CPLES_XML);
    const std::string sEscaped = pszEscaped;
    CPLFree(pszEscaped);
    return sEscaped;
}

}  // namespace

SvgPicture::SvgPicture(int nWidth, int nHeight, const std::string& sTitle, const char* pszCss)
    : msText(FormatString("<svg xmlns=\"http://www.w3.org/2000/svg\" width=\"%d\" height=\"%d\" "
                          "viewBox=\"0 0 %d %d\">\n",
                          nWidth, nHeight, nWidth, nHeight)) {
    msText += "<title>" + Escape(sTitle) + "</title>\n<style>\n" + pszCss + "</style>\n" +
              "<rect width=\"100%\" height=\"100%\" fill=\"#fff\"/>\n";
}

void SvgPicture::AddRectangle(Point oCorner, double dfWidth, double dfHeight,
                              const char* pszClass) {
    msText += "<rect class=\"" + std::string(pszClass) + "\" x=\"" + Number(oCorner.dfX) +
              "\" y=\"" + Number(oCorner.dfY) + "\" width=\"" + Number(dfWidth) + "\" height=\"" +
              Number(dfHeight) + "\"/>\n";
}

void SvgPicture::AddLines(const std::vector<Point>& oPoints, const char* pszClass) {
    msText += "<polyline class=\"" + std::string(pszClass) + "\" points=\"";
    for (const Point& oPoint : oPoints) {
        msText += Number(oPoint.dfX);
        msText += ',';
        msText += Number(oPoint.dfY);
        msText += ' ';
    }
    msText.back() = '"';
    msText += "/>\n";
}

void SvgPicture::AddText(Point oPlace, const std::string& sText, const char* pszClass) {
    msText += "<text class=\"" + std::string(pszClass) + "\" x=\"" + Number(oPlace.dfX) +
              "\" y=\"" + Number(oPlace.dfY) + "\">" + Escape(sText) + "</text>\n";
}

void SvgPicture::AddTextUpwards(Point oPlace, const std::string& sText, const char* pszClass) {
    msText += "<text class=\"" + std::string(pszClass) + "\" transform=\"translate(" +
              Number(oPlace.dfX) + " " + Number(oPlace.dfY) + ") rotate(-90)\">" + Escape(sText) +
              "</text>\n";
}

std::string SvgPicture::Finish() const { return msText + "</svg>\n"; }

}  // namespace vetra::tool
