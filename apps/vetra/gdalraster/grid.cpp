#include "gdalraster/grid.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <string>

#include "gdalraster/errors.h"

namespace vetra::tool {

namespace {

int ToPixels(double dfPixels, const char* pszWhat) {
    if (!(dfPixels <= std::numeric_limits<int>::max())) {
        throw RunError(std::string("the target would have too many ") + pszWhat);
    }
    return std::max(1, static_cast<int>(dfPixels));
}

// The largest number of pixels whose centres all lie inside the source.
int FillSource(int nSrcPixels, double dfScale, const char* pszWhat) {
    int nPixels = ToPixels(std::ceil(nSrcPixels / dfScale), pszWhat);
    while (nPixels > 1 && (nPixels - 0.5) * dfScale >= nSrcPixels) {
        --nPixels;
    }
    if (0.5 * dfScale >= nSrcPixels) {
        throw RunError(std::string("a target pixel would be larger than twice the source's ") +
                       pszWhat);
    }
    return nPixels;
}

}  // namespace

Grid PlanGrid(GDALDataset& oSource, const GridRequest& oRequest) {
    const int nSrcCols = oSource.GetRasterXSize();
    const int nSrcRows = oSource.GetRasterYSize();
    std::array<double, 6> vdfTfm{};
    const bool bGeoTransform = oSource.GetGeoTransform(vdfTfm.data()) == CE_None;
    Grid oGrid;
    if (oRequest.eKind == GridRequest::eGK_RESOLUTION) {
        const double dfSrcX = std::hypot(vdfTfm[1], vdfTfm[4]);
        const double dfSrcY = std::hypot(vdfTfm[2], vdfTfm[5]);
        if (!bGeoTransform || !(dfSrcX > 0.0 && dfSrcY > 0.0)) {
            throw RunError(
                "the source has no georeferenced pixel size: use --size or --scale, not --res");
        }
        oGrid.dfColScale = oRequest.dfX / dfSrcX;
        oGrid.dfRowScale = oRequest.dfY / dfSrcY;
    } else if (oRequest.eKind == GridRequest::eGK_FACTOR) {
        oGrid.dfColScale = oRequest.dfX;
        oGrid.dfRowScale = oRequest.dfY;
    }
    if (oRequest.eKind == GridRequest::eGK_RESOLUTION ||
        oRequest.eKind == GridRequest::eGK_FACTOR) {
        oGrid.nCols = FillSource(nSrcCols, oGrid.dfColScale, "columns");
        oGrid.nRows = FillSource(nSrcRows, oGrid.dfRowScale, "rows");
    } else {
        const bool bSize = oRequest.eKind == GridRequest::eGK_SIZE;
        oGrid.nCols =
            ToPixels(std::round(bSize ? oRequest.dfX : nSrcCols * oRequest.dfX), "columns");
        oGrid.nRows = ToPixels(std::round(bSize ? oRequest.dfY : nSrcRows * oRequest.dfY), "rows");
        oGrid.dfColScale = static_cast<double>(nSrcCols) / oGrid.nCols;
        oGrid.dfRowScale = static_cast<double>(nSrcRows) / oGrid.nRows;
    }
    if (bGeoTransform) {
        vdfTfm[1] *= oGrid.dfColScale;
        vdfTfm[4] *= oGrid.dfColScale;
        vdfTfm[2] *= oGrid.dfRowScale;
        vdfTfm[5] *= oGrid.dfRowScale;
        if (oRequest.eKind == GridRequest::eGK_RESOLUTION && vdfTfm[2] == 0.0 && vdfTfm[4] == 0.0) {
            // The product can miss the request by a rounding.
            vdfTfm[1] = std::copysign(oRequest.dfX, vdfTfm[1]);
            vdfTfm[5] = std::copysign(oRequest.dfY, vdfTfm[5]);
        }
        oGrid.oGeoTransform = vdfTfm;
    }
    return oGrid;
}

}  // namespace vetra::tool
