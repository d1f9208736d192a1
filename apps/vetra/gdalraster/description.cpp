#include "gdalraster/description.h"

#include <cpl_conv.h>
#include <cpl_string.h>

#include <array>
#include <string>
#include <vector>

#include "gdalraster/errors.h"

namespace vetra::tool {

namespace {

// Domains that describe the file, or positions in it, instead of the image.
constexpr std::array kFileDomains = {
    "IMAGE_STRUCTURE", "SUBDATASETS", "DERIVED_SUBDATASETS", "GEOLOCATION", "xml:VRT",
    "xml:ESRI",        "vrt_sources", "new_vrt_sources",     "OVERVIEWS",   "RPC"};

// Items of the default domain, by the beginning of their names, that a new pixel grid or new values
// make wrong.
constexpr std::array kGridItems = {
    "STATISTICS_",          "NODATA_VALUES",          "TIFFTAG_XRESOLUTION",
    "TIFFTAG_YRESOLUTION",  "TIFFTAG_RESOLUTIONUNIT", "EXIF_PixelXDimension",
    "EXIF_PixelYDimension", "EXIF_XResolution",       "EXIF_YResolution",
    "EXIF_ResolutionUnit"};

bool IsFileDomain(const char* pszDomain) {
    for (const char* pszFileDomain : kFileDomains) {
        if (EQUAL(pszDomain, pszFileDomain)) {
            return true;
        }
    }
    return false;
}

void CopyMetadata(GDALMajorObject& oSource, GDALMajorObject& oTarget) {
    const CPLStringList oDomains(oSource.GetMetadataDomainList());
    for (int n = 0; n < oDomains.size(); ++n) {
        const char* pszDomain = oDomains[n];
        if (IsFileDomain(pszDomain)) {
            continue;
        }
        CPLStringList oItems(CSLDuplicate(oSource.GetMetadata(pszDomain)));
        if (EQUAL(pszDomain, "")) {
            for (int nItem = oItems.size() - 1; nItem >= 0; --nItem) {
                for (const char* pszStale : kGridItems) {
                    if (STARTS_WITH_CI(oItems[nItem], pszStale)) {
                        oItems =
                            CPLStringList(CSLRemoveStrings(oItems.StealList(), nItem, 1, nullptr));
                        break;
                    }
                }
            }
        }
        if (!oItems.empty()) {
            oTarget.SetMetadata(oItems.List(), pszDomain);
        }
    }
}

// Offsets of rational polynomials count from the centre of the first pixel.
void CopyRationalPolynomials(GDALDataset& oSource, const Grid& oGrid, GDALDataset& oTarget) {
    CPLStringList oItems(CSLDuplicate(oSource.GetMetadata("RPC")));
    if (oItems.empty() || oGrid.poCrs) {
        return;
    }
    const auto Change = [&](const char* pszName, auto fnChange) {
        if (const char* pszValue = oItems.FetchNameValue(pszName)) {
            oItems.SetNameValue(pszName, CPLSPrintf("%.15g", fnChange(CPLAtof(pszValue))));
        }
    };
    Change("SAMP_OFF", [&](double df) { return oGrid.ToTargetCol(df + 0.5) - 0.5; });
    Change("LINE_OFF", [&](double df) { return oGrid.ToTargetRow(df + 0.5) - 0.5; });
    Change("SAMP_SCALE", [&](double df) { return oGrid.ToTargetCol(df); });
    Change("LINE_SCALE", [&](double df) { return oGrid.ToTargetRow(df); });
    oTarget.SetMetadata(oItems.List(), "RPC");
}

void CopyGeoreference(GDALDataset& oSource, const Grid& oGrid, GDALDataset& oTarget) {
    const OGRSpatialReference* poCrs = oGrid.poCrs ? oGrid.poCrs.get() : oSource.GetSpatialRef();
    if (poCrs != nullptr && !poCrs->IsEmpty()) {
        oTarget.SetSpatialRef(poCrs);
    }
    if (oGrid.oGeoTransform) {
        std::array<double, 6> vdfTfm = *oGrid.oGeoTransform;
        oTarget.SetGeoTransform(vdfTfm.data());
    }
    // A warped image has used its points.
    const int nNumPoints = oGrid.poCrs ? 0 : oSource.GetGCPCount();
    if (nNumPoints > 0) {
        GDAL_GCP* poPoints = GDALDuplicateGCPs(nNumPoints, oSource.GetGCPs());
        for (int n = 0; n < nNumPoints; ++n) {
            poPoints[n].dfGCPPixel = oGrid.ToTargetCol(poPoints[n].dfGCPPixel);
            poPoints[n].dfGCPLine = oGrid.ToTargetRow(poPoints[n].dfGCPLine);
        }
        oTarget.SetGCPs(nNumPoints, poPoints, oSource.GetGCPSpatialRef());
        GDALDeinitGCPs(nNumPoints, poPoints);
        CPLFree(poPoints);
    }
}

void CopyBand(GDALRasterBand& oSource, bool bSameValues, GDALRasterBand& oTarget) {
    GDALColorTable* poColours = oSource.GetColorTable();
    if (bSameValues && poColours != nullptr) {
        oTarget.SetColorTable(poColours);
    }
    const GDALColorInterp eColour = oSource.GetColorInterpretation();
    if (eColour != oTarget.GetColorInterpretation() && eColour != GCI_PaletteIndex &&
        eColour != GCI_Undefined) {
        oTarget.SetColorInterpretation(eColour);
    }
    CopyMetadata(oSource, oTarget);
    if (oSource.GetDescription()[0] != '\0') {
        oTarget.SetDescription(oSource.GetDescription());
    }
    if (oSource.GetUnitType()[0] != '\0') {
        oTarget.SetUnitType(oSource.GetUnitType());
    }
    int bHas = FALSE;
    const double dfOffset = oSource.GetOffset(&bHas);
    if (bHas && dfOffset != 0.0) {
        oTarget.SetOffset(dfOffset);
    }
    const double dfScale = oSource.GetScale(&bHas);
    if (bHas && dfScale != 1.0) {
        oTarget.SetScale(dfScale);
    }
    if (char** papszNames = oSource.GetCategoryNames()) {
        oTarget.SetCategoryNames(papszNames);
    }
}

}  // namespace

void CopyDescription(GDALDataset& oSource, const Grid& oGrid, bool bSameValues,
                     GDALDataset& oTarget) {
    GdalMessages::ForgetFailures();
    // Whether pixels are points decides how some formats store the geotransform: metadata first.
    CopyMetadata(oSource, oTarget);
    CopyGeoreference(oSource, oGrid, oTarget);
    CopyRationalPolynomials(oSource, oGrid, oTarget);
    for (int nBand = 1; nBand <= oSource.GetRasterCount(); ++nBand) {
        CopyBand(*oSource.GetRasterBand(nBand), bSameValues, *oTarget.GetRasterBand(nBand));
    }
    GdalMessages::Demote("the target lacks a part of the description");
}

}  // namespace vetra::tool
