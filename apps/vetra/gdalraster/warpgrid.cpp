#include "gdalraster/warpgrid.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "gdalraster/errors.h"

namespace vetra::tool {

namespace {

int CountPixels(double dfLength, double dfPixel, const char* pszWhat) {
    const double dfPixels = std::floor(dfLength / dfPixel + 0.5);
    if (!(dfPixels <= std::numeric_limits<int>::max())) {
        throw RunError(std::string("the target would have too many ") + pszWhat);
    }
    return std::max(1, static_cast<int>(dfPixels));
}

}  // namespace

Grid PlanWarpGrid(GeoTransformer& oTransformer, const WarpRequest& oRequest) {
    Grid oGrid;
    oGrid.poCrs = oTransformer.GetCrs();
    std::array<double, 4> vdfExtent{};
    std::array<double, 2> vdfPixel{};
    if (!oRequest.oExtent || (!oRequest.oResolution && !oRequest.oSize)) {
        const SuggestedGrid oSuggested = oTransformer.SuggestGrid();
        const std::array<double, 6>& vdfTfm = oSuggested.vdfGeoTransform;
        if (!oRequest.oExtent && !oRequest.oResolution && !oRequest.oSize) {
            oGrid.nCols = oSuggested.nCols;
            oGrid.nRows = oSuggested.nRows;
            oGrid.oGeoTransform = vdfTfm;
            return oGrid;
        }
        vdfPixel = {vdfTfm[1], -vdfTfm[5]};
        vdfExtent = {vdfTfm[0], vdfTfm[3] + vdfTfm[5] * oSuggested.nRows,
                     vdfTfm[0] + vdfTfm[1] * oSuggested.nCols, vdfTfm[3]};
    }
    vdfExtent = oRequest.oExtent.value_or(vdfExtent);
    const double dfWidth = vdfExtent[2] - vdfExtent[0];
    const double dfHeight = vdfExtent[3] - vdfExtent[1];
    if (oRequest.oSize) {
        oGrid.nCols = (*oRequest.oSize)[0];
        oGrid.nRows = (*oRequest.oSize)[1];
        vdfPixel = {dfWidth / oGrid.nCols, dfHeight / oGrid.nRows};
    } else {
        vdfPixel = oRequest.oResolution.value_or(vdfPixel);
        oGrid.nCols = CountPixels(dfWidth, vdfPixel[0], "columns");
        oGrid.nRows = CountPixels(dfHeight, vdfPixel[1], "rows");
    }
    oGrid.oGeoTransform = {vdfExtent[0], vdfPixel[0], 0.0, vdfExtent[3], 0.0, -vdfPixel[1]};
    return oGrid;
}

Grid ReadGrid(const std::string& sPath, std::string& sCrs) {
    GdalMessages::ForgetFailures();
    const GDALDatasetUniquePtr poImage(
        GDALDataset::Open(sPath.c_str(), GDAL_OF_RASTER | GDAL_OF_VERBOSE_ERROR));
    if (!poImage) {
        GdalMessages::Throw("can't open the image " + sPath);
    }
    Grid oGrid;
    oGrid.nCols = poImage->GetRasterXSize();
    oGrid.nRows = poImage->GetRasterYSize();
    std::array<double, 6> vdfTfm{};
    if (poImage->GetGeoTransform(vdfTfm.data()) != CE_None) {
        throw RunError("--like: the image " + sPath + " has no geotransform");
    }
    oGrid.oGeoTransform = vdfTfm;
    if (poImage->GetSpatialRef() != nullptr) {
        sCrs = ToWkt(*poImage->GetSpatialRef());
    }
    return oGrid;
}

}  // namespace vetra::tool
