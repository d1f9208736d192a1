#include "gdalraster/targetformat.h"

#include <cpl_conv.h>

#include "gdalraster/errors.h"
#include "gdalraster/pixeltypes.h"

namespace vetra::tool {

namespace {

constexpr const char* kGTiff = "GTiff";
constexpr const char* kCog = "COG";
// Images beyond this size, both ways, are written in tiles: parts of them can be read at once.
constexpr int kLargestStriped = 512;

bool Has(GDALDriver& oDriver, const char* pszItem) {
    const char* pszValue = oDriver.GetMetadataItem(pszItem);
    return pszValue != nullptr && CPLTestBool(pszValue);
}

bool CanWrite(GDALDriver& oDriver) {
    return Has(oDriver, GDAL_DCAP_RASTER) &&
           (Has(oDriver, GDAL_DCAP_CREATE) || Has(oDriver, GDAL_DCAP_CREATECOPY));
}

bool HasExtension(GDALDriver& oDriver, const std::string& sExtension) {
    const char* pszExtensions = oDriver.GetMetadataItem(GDAL_DMD_EXTENSIONS);
    const CPLStringList oExtensions(
        CSLTokenizeString(pszExtensions != nullptr ? pszExtensions : ""));
    return oExtensions.FindString(sExtension.c_str()) >= 0;
}

CPLStringList ToList(const std::vector<std::string>& oOptions) {
    CPLStringList oList;
    for (const std::string& sOption : oOptions) {
        oList.AddString(sOption.c_str());
    }
    return oList;
}

void AddDefault(CPLStringList& oOptions, const char* pszName, const char* pszValue) {
    if (oOptions.FetchNameValue(pszName) == nullptr) {
        oOptions.SetNameValue(pszName, pszValue);
    }
}

GDALDriver* FindByExtension(const std::string& sExtension) {
    GDALDriverManager& oManager = *GetGDALDriverManager();
    GDALDriver* poCopyOnly = nullptr;
    for (int n = 0; n < oManager.GetDriverCount(); ++n) {
        GDALDriver& oDriver = *oManager.GetDriver(n);
        if (!CanWrite(oDriver) || !HasExtension(oDriver, sExtension)) {
            continue;
        }
        if (Has(oDriver, GDAL_DCAP_CREATE)) {
            return &oDriver;
        }
        poCopyOnly = poCopyOnly != nullptr ? poCopyOnly : &oDriver;
    }
    return poCopyOnly;
}

GDALDriver* FindDriver(const std::string& sFormat, const std::string& sPath) {
    if (!sFormat.empty()) {
        return GetGDALDriverManager()->GetDriverByName(sFormat.c_str());
    }
    const std::string sExtension = CPLGetExtension(sPath.c_str());
    GDALDriver* poDriver = sExtension.empty() ? nullptr : FindByExtension(sExtension);
    return poDriver != nullptr ? poDriver : GetGDALDriverManager()->GetDriverByName(kGTiff);
}

}  // namespace

TargetFormat::TargetFormat(const std::string& sFormat, const std::string& sPath)
    : mpoDriver(FindDriver(sFormat, sPath)) {
    if (mpoDriver == nullptr) {
        throw UsageError("--of: there is no format " + sFormat + " (gdalinfo --formats lists all)");
    }
    // A virtual dataset would refer to pixels that are gone when the run ends.
    if (!CanWrite(*mpoDriver) || EQUAL(GetName().c_str(), "VRT") ||
        EQUAL(GetName().c_str(), "MEM")) {
        throw UsageError("--of: images can't be written as " + GetName());
    }
    mbCopyOnly = !Has(*mpoDriver, GDAL_DCAP_CREATE);
}

void TargetFormat::CheckHolds(gobs::NativeDataTypeCode eType) const {
    const auto Lists = [&](const char* pszItem, const char* pszWord) {
        const char* pszList = mpoDriver->GetMetadataItem(pszItem);
        const CPLStringList oWords(
            CSLTokenizeString2(pszList != nullptr ? pszList : "", " \"'", 0));
        return oWords.FindString(pszWord) >= 0;
    };
    // A driver that can create refuses at once, and its list may lack types that it takes.
    const bool bHolds = IsMarkedSignedByte(eType)
                            ? Lists(GDAL_DMD_CREATIONOPTIONLIST, "PIXELTYPE")
                            : !mbCopyOnly || Lists(GDAL_DMD_CREATIONDATATYPES,
                                                   GDALGetDataTypeName(ToGdalType(eType)));
    if (!bHolds) {
        throw RunError("the format " + GetName() + " holds no pixels of type " +
                       gobs::DataTypeAdapter::TypeToString(eType) +
                       ": choose another format with --of or another type with --type");
    }
}

std::string TargetFormat::ChooseOverviews(const std::string& sWanted,
                                          const std::vector<std::string>& oUserOptions,
                                          bool bSameValues) const {
    const bool bCog = EQUAL(GetName().c_str(), kCog);
    if (!sWanted.empty() && !bCog && !EQUAL(GetName().c_str(), kGTiff)) {
        throw UsageError("--overviews: the format " + GetName() + " gets none, only GeoTIFF does");
    }
    if (!sWanted.empty() || !bCog || ToList(oUserOptions).FetchNameValue("OVERVIEWS") != nullptr) {
        return sWanted;
    }
    return bSameValues ? "NEAR" : "AVERAGE,NUMCOLS=2,NUMROWS=2";
}

CPLStringList TargetFormat::CompleteCopyOptions(
    const std::vector<std::string>& oUserOptions) const {
    CPLStringList oOptions = ToList(oUserOptions);
    if (EQUAL(GetName().c_str(), kCog)) {
        AddDefault(oOptions, "BIGTIFF", "IF_SAFER");
        AddDefault(oOptions, "OVERVIEWS", "FORCE_USE_EXISTING");
    }
    return oOptions;
}

GDALDriver& GetStageDriver() { return *GetGDALDriverManager()->GetDriverByName(kGTiff); }

CPLStringList CompleteOptions(GDALDriver& oDriver, const std::vector<std::string>& oUserOptions,
                              SourceRaster& oSource, const Grid& oGrid,
                              gobs::NativeDataTypeCode eType) {
    CPLStringList oOptions = ToList(oUserOptions);
    if (IsMarkedSignedByte(eType)) {
        AddDefault(oOptions, "PIXELTYPE", "SIGNEDBYTE");
    }
    if (!EQUAL(oDriver.GetDescription(), kGTiff)) {
        return oOptions;
    }
    AddDefault(oOptions, "BIGTIFF", "IF_SAFER");
    if (oGrid.nCols > kLargestStriped && oGrid.nRows > kLargestStriped &&
        oOptions.FetchNameValue("BLOCKYSIZE") == nullptr) {
        AddDefault(oOptions, "TILED", "YES");
    }
    // The driver would guess colours from the number of bands.
    GDALDataset& oDataset = oSource.GetDataset();
    const auto Colour = [&](int nBand) {
        return nBand <= oDataset.GetRasterCount()
                   ? oDataset.GetRasterBand(nBand)->GetColorInterpretation()
                   : GCI_Undefined;
    };
    int nColours = 1;
    if (Colour(1) == GCI_RedBand && Colour(2) == GCI_GreenBand && Colour(3) == GCI_BlueBand) {
        nColours = 3;
        AddDefault(oOptions, "PHOTOMETRIC", "RGB");
    } else if (Colour(1) == GCI_CyanBand && Colour(4) == GCI_BlackBand) {
        nColours = 4;
        AddDefault(oOptions, "PHOTOMETRIC", "CMYK");
    } else if (Colour(1) != GCI_PaletteIndex) {
        AddDefault(oOptions, "PHOTOMETRIC", "MINISBLACK");
    }
    if (oDataset.GetRasterCount() > nColours) {
        const bool bAlpha = Colour(nColours + 1) == GCI_AlphaBand;
        const char* pszKind =
            bAlpha
                ? oDataset.GetRasterBand(nColours + 1)->GetMetadataItem("ALPHA", "IMAGE_STRUCTURE")
                : nullptr;
        AddDefault(oOptions, "ALPHA", pszKind != nullptr ? pszKind : (bAlpha ? "YES" : "NO"));
    }
    return oOptions;
}

}  // namespace vetra::tool
