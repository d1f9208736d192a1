#ifndef VETRA_APPS_GDALRASTER_GEOTRANSFORMER_H
#define VETRA_APPS_GDALRASTER_GEOTRANSFORMER_H

#include <gdal_priv.h>
#include <ogr_spatialref.h>

#include <array>
#include <memory>
#include <string>
#include <vector>

namespace vetra::tool {

/// How a source is georeferenced, and into what.
struct GeoReference {
    std::string sTargetCrs;                 ///< as a user names it; that of the source if empty
    std::string sSourceCrs;                 ///< replaces that of the source
    std::vector<std::string> oTransformer;  ///< NAME=VALUE options of GDAL's transformer
};

/// The grid that suits a source in a reference system.
struct SuggestedGrid {
    std::array<double, 6> vdfGeoTransform{};
    int nCols = 0;
    int nRows = 0;
};

/// Maps between the pixels of a source and those of a georeferenced target: by geotransform, ground
/// control points, rational polynomials or geolocation arrays of the source, and from one reference
/// system to another.
///
/// An object serves one thread at a time; clones serve others.
class GeoTransformer {
 public:
    /// \param oSource  must outlive this object and its clones
    /// \throws UsageError for a reference system that nobody knows, RunError for a source without
    ///         the georeference that is needed.
    GeoTransformer(GDALDataset& oSource, const GeoReference& oReference);

    /// The target's reference system; may be empty.
    const std::shared_ptr<const OGRSpatialReference>& GetCrs() const { return mpoCrs; }
    /// A grid with square pixels that covers the source, with about as many pixels on the diagonal;
    /// that of a north-up source itself where the reference system stays the same.
    /// \throws RunError when the source maps nowhere.
    SuggestedGrid SuggestGrid();
    /// From now on positions are those of this grid's pixels.
    void SetGrid(const std::array<double, 6>& vdfGeoTransform);
    /// After `SetGrid`.
    std::unique_ptr<GeoTransformer> Clone() const;

    /// Turns target positions into source positions, where whole numbers are centres of pixels. A
    /// position without a counterpart becomes NaN. Where several operations lead from one reference
    /// system to the other, that for the mean of the positions is taken.
    /// \param padfCol  `[nCount]` columns
    /// \param padfRow  `[nCount]` rows
    void ToSource(int nCount, double* padfCol, double* padfRow);

 private:
    struct Destroyer {
        void operator()(void* pTransformer) const;
    };

    GeoTransformer() = default;
    void Create();
    bool ReturnsFromEdges(const double* padfExtent, const SuggestedGrid& oGrid);

    GDALDataset* mpoSource = nullptr;
    std::vector<std::string> moOptions;
    bool mbSameCrs = false;
    std::shared_ptr<const OGRSpatialReference> mpoCrs;
    std::unique_ptr<void, Destroyer> mpTransformer;
    std::array<double, 6> mvdfGrid{};
    std::vector<double> mvdfHeights;
    std::vector<int> mvnSuccess;
};

/// A reference system as text that `ParseCrs` reads.
std::string ToWkt(const OGRSpatialReference& oCrs);
/// Reads a reference system as a user names it, for instance EPSG:32633 or a file's name.
/// \throws UsageError
OGRSpatialReference ParseCrs(const std::string& sOption, const std::string& sText);

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_GEOTRANSFORMER_H
