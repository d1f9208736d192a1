#ifndef VETRA_APPS_KERNEL_SVGPICTURE_H
#define VETRA_APPS_KERNEL_SVGPICTURE_H

#include <string>
#include <vector>

namespace vetra::tool {

/// A place in a drawing, x to the right, y down.
struct Point {
    double dfX = 0.0;
    double dfY = 0.0;
};

/// Grows the text of an SVG picture on white. Shapes get their looks by the names of classes.
class SvgPicture {
 public:
    /// \param sTitle  for programs that show or read out titles
    /// \param pszCss  the rules of the classes
    SvgPicture(int nWidth, int nHeight, const std::string& sTitle, const char* pszCss);

    void AddRectangle(Point oCorner, double dfWidth, double dfHeight, const char* pszClass);
    /// Lines from point to point.
    void AddLines(const std::vector<Point>& oPoints, const char* pszClass);
    /// \param sText  UTF-8; what is not, and control characters, appear as ?
    void AddText(Point oPlace, const std::string& sText, const char* pszClass);
    /// As AddText, turned to read upwards.
    void AddTextUpwards(Point oPlace, const std::string& sText, const char* pszClass);

    /// The whole document.
    std::string Finish() const;

 private:
    std::string msText;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_KERNEL_SVGPICTURE_H
