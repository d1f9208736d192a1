#include "gdalraster/geotransformer.h"

#include <cpl_conv.h>
#include <cpl_string.h>
#include <gdal_alg.h>

#include <cmath>
#include <limits>

#include "gdalraster/errors.h"

namespace vetra::tool {

namespace {

// Positions that map nowhere are reported by the transformers as failures; here they are answers.
class Quiet {
 public:
    Quiet() { CPLPushErrorHandler(CPLQuietErrorHandler); }
    Quiet(const Quiet&) = delete;
    Quiet& operator=(const Quiet&) = delete;
    ~Quiet() { CPLPopErrorHandler(); }
};

bool HasOption(const std::vector<std::string>& oOptions, const std::string& sName) {
    for (const std::string& sOption : oOptions) {
        if (EQUALN(sOption.c_str(), (sName + "=").c_str(), sName.size() + 1)) {
            return true;
        }
    }
    return false;
}

bool IsNorthUp(const std::array<double, 6>& vdfTfm) {
    return vdfTfm[1] > 0.0 && vdfTfm[2] == 0.0 && vdfTfm[4] == 0.0 && vdfTfm[5] < 0.0;
}

}  // namespace

std::string ToWkt(const OGRSpatialReference& oCrs) {
    char* pszWkt = nullptr;
    const char* const apszOptions[] = {"FORMAT=WKT2", nullptr};
    oCrs.exportToWkt(&pszWkt, apszOptions);
    const std::string sWkt = pszWkt != nullptr ? pszWkt : "";
    CPLFree(pszWkt);
    return sWkt;
}

OGRSpatialReference ParseCrs(const std::string& sOption, const std::string& sText) {
    OGRSpatialReference oCrs;
    const Quiet oQuiet;
    if (sText.empty() || oCrs.SetFromUserInput(sText.c_str()) != OGRERR_NONE) {
        throw UsageError(sOption + ": " + sText + " is no coordinate reference system");
    }
    oCrs.SetAxisMappingStrategy(OAMS_TRADITIONAL_GIS_ORDER);
    return oCrs;
}

void GeoTransformer::Destroyer::operator()(void* pTransformer) const {
    GDALDestroyTransformer(pTransformer);
}

GeoTransformer::GeoTransformer(GDALDataset& oSource, const GeoReference& oReference)
    : mpoSource(&oSource), moOptions(oReference.oTransformer) {
    std::array<double, 6> vdfTfm{};
    const bool bGeoTransform = oSource.GetGeoTransform(vdfTfm.data()) == CE_None;
    const bool bPoints = !bGeoTransform && oSource.GetGCPCount() > 0;
    OGRSpatialReference oSourceCrs;
    if (!oReference.sSourceCrs.empty()) {
        oSourceCrs = ParseCrs("--src-crs", oReference.sSourceCrs);
        moOptions.push_back("SRC_SRS=" + ToWkt(oSourceCrs));
    } else if (const OGRSpatialReference* poCrs =
                   bPoints ? oSource.GetGCPSpatialRef() : oSource.GetSpatialRef()) {
        oSourceCrs = *poCrs;
    } else if (!bGeoTransform && !bPoints && oSource.GetMetadata("RPC") != nullptr) {
        // That of the polynomials.
        oSourceCrs = ParseCrs("RPC", "EPSG:4326");
    }
    oSourceCrs.SetAxisMappingStrategy(OAMS_TRADITIONAL_GIS_ORDER);
    OGRSpatialReference oCrs = oSourceCrs;
    if (!oReference.sTargetCrs.empty()) {
        oCrs = ParseCrs("--crs", oReference.sTargetCrs);
        if (oSourceCrs.IsEmpty() && !HasOption(moOptions, "SRC_SRS") &&
            !HasOption(moOptions, "METHOD")) {
            throw RunError("the source has no coordinate reference system: name it with --src-crs");
        }
    }
    mbSameCrs = oReference.oTransformer.empty() && bGeoTransform && IsNorthUp(vdfTfm) &&
                (oCrs.IsSame(&oSourceCrs) || oCrs.IsEmpty());
    if (!oCrs.IsEmpty()) {
        moOptions.push_back("DST_SRS=" + ToWkt(oCrs));
    }
    mpoCrs = std::make_shared<const OGRSpatialReference>(oCrs);
    Create();
}

void GeoTransformer::Create() {
    CPLStringList oOptions;
    for (const std::string& sOption : moOptions) {
        oOptions.AddString(sOption.c_str());
    }
    GdalMessages::ForgetFailures();
    mpTransformer.reset(GDALCreateGenImgProjTransformer2(mpoSource, nullptr, oOptions.List()));
    if (!mpTransformer) {
        GdalMessages::Throw("the source can't be georeferenced");
    }
    GdalMessages::Demote("georeference");
}

SuggestedGrid GeoTransformer::SuggestGrid() {
    SuggestedGrid oGrid;
    if (mbSameCrs) {
        mpoSource->GetGeoTransform(oGrid.vdfGeoTransform.data());
        oGrid.nCols = mpoSource->GetRasterXSize();
        oGrid.nRows = mpoSource->GetRasterYSize();
        return oGrid;
    }
    double adfExtent[4];
    const auto Suggest = [&] {
        const Quiet oQuiet;
        if (GDALSuggestedWarpOutput2(mpoSource, GDALGenImgProjTransform, mpTransformer.get(),
                                     oGrid.vdfGeoTransform.data(), &oGrid.nCols, &oGrid.nRows,
                                     adfExtent, 0) != CE_None) {
            throw RunError(
                "no grid can be found for the source in the target's reference system: name it "
                "with --extent and --res or --size");
        }
    };
    Suggest();
    if (!ReturnsFromEdges(adfExtent, oGrid)) {
        // Some projections answer beyond what they are good for. Those answers don't survive the
        // way back.
        CPLSetConfigOption("CHECK_WITH_INVERT_PROJ", "TRUE");
        Create();
        Suggest();
    }
    return oGrid;
}

// Whether points on the edges of an extent lie in the source's reference system at places that map
// back to them, within a pixel.
bool GeoTransformer::ReturnsFromEdges(const double* padfExtent, const SuggestedGrid& oGrid) {
    constexpr int kSteps = 20;
    const double dfWidth = padfExtent[2] - padfExtent[0];
    const double dfHeight = padfExtent[3] - padfExtent[1];
    const Quiet oQuiet;
    for (int nStep = 0; nStep <= kSteps; ++nStep) {
        const double df = static_cast<double>(nStep) / kSteps;
        const double aadf[4][2] = {{df, 0.0}, {df, 1.0}, {0.0, df}, {1.0, df}};
        for (const auto& adf : aadf) {
            const double dfX0 = padfExtent[0] + adf[0] * dfWidth;
            const double dfY0 = padfExtent[1] + adf[1] * dfHeight;
            double dfX = dfX0;
            double dfY = dfY0;
            double dfZ = 0.0;
            int bSuccess = FALSE;
            GDALGenImgProjTransform(mpTransformer.get(), TRUE, 1, &dfX, &dfY, &dfZ, &bSuccess);
            if (bSuccess) {
                GDALGenImgProjTransform(mpTransformer.get(), FALSE, 1, &dfX, &dfY, &dfZ, &bSuccess);
            }
            if (!bSuccess || !(std::fabs(dfX - dfX0) <= dfWidth / oGrid.nCols) ||
                !(std::fabs(dfY - dfY0) <= dfHeight / oGrid.nRows)) {
                return false;
            }
        }
    }
    return true;
}

void GeoTransformer::SetGrid(const std::array<double, 6>& vdfGeoTransform) {
    mvdfGrid = vdfGeoTransform;
    GDALSetGenImgProjTransformerDstGeoTransform(mpTransformer.get(), mvdfGrid.data());
}

std::unique_ptr<GeoTransformer> GeoTransformer::Clone() const {
    std::unique_ptr<GeoTransformer> poClone(new GeoTransformer);
    poClone->mpoSource = mpoSource;
    poClone->moOptions = moOptions;
    poClone->mbSameCrs = mbSameCrs;
    poClone->mpoCrs = mpoCrs;
    poClone->Create();
    poClone->SetGrid(mvdfGrid);
    return poClone;
}

void GeoTransformer::ToSource(int nCount, double* padfCol, double* padfRow) {
    const auto n = static_cast<std::size_t>(nCount);
    mvdfHeights.assign(n, 0.0);
    mvnSuccess.assign(n, FALSE);
    // GDAL counts from edges of pixels.
    for (int i = 0; i < nCount; ++i) {
        padfCol[i] += 0.5;
        padfRow[i] += 0.5;
    }
    const Quiet oQuiet;
    GDALGenImgProjTransform(mpTransformer.get(), TRUE, nCount, padfCol, padfRow, mvdfHeights.data(),
                            mvnSuccess.data());
    for (std::size_t i = 0; i < n; ++i) {
        const bool bOk =
            mvnSuccess[i] != FALSE && std::isfinite(padfCol[i]) && std::isfinite(padfRow[i]);
        padfCol[i] = bOk ? padfCol[i] - 0.5 : std::numeric_limits<double>::quiet_NaN();
        padfRow[i] = bOk ? padfRow[i] - 0.5 : std::numeric_limits<double>::quiet_NaN();
    }
}

}  // namespace vetra::tool
