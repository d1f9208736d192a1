#ifndef VETRA_APPS_RASTERJOB_POSITIONLATTICE_H
#define VETRA_APPS_RASTERJOB_POSITIONLATTICE_H

#include <array>
#include <memory>
#include <vector>

#include "gdalraster/geotransformer.h"
#include "rasterjob/targetmapping.h"
#include "vetra/base/utils/resample/postfm/bufposblocktfm.h"

namespace vetra::tool {

/// Source positions of all pixels of a warped target, interpolated between exact ones.
///
/// The target is divided into square cells that start at its first pixel, whatever part of it is
/// asked for. A cell has five by five exact positions, between which a polynomial of degree 4 in
/// each direction interpolates; where that is off by more than the bound at one of 16 places
/// between them, or a position has no counterpart, the cell is divided in four, down to exact
/// positions for all pixels. So a position depends on its pixel alone.
class PositionLattice {
 public:
    /// \param nCols, nRows  size of the target
    /// \param dfError       bound in source pixels; 0 for exact positions
    PositionLattice(const GeoTransformer& oTransformer, int nCols, int nRows, double dfError);

    /// Positions of a rectangle's pixels, NaN for those that map nowhere. Runs on as many threads
    /// as there were when this object was made.
    void Fill(const utils::PixelRect& oRect, PositionArrays& oPositions);

 private:
    struct Part;
    static constexpr int kNodes = 5;
    static constexpr int kCell = 128;
    static constexpr int kSmallestCell = 8;

    void FillCell(GeoTransformer& oTransformer, int nCol, int nRow, int nSize,
                  const Part& oPart) const;
    void Evaluate(GeoTransformer& oTransformer, int nCol, int nRow, int nCols, int nRows,
                  const Part& oPart) const;

    int mnCols;
    int mnRows;
    double mdfError;
    std::vector<std::unique_ptr<GeoTransformer>> moTransformers;
    // Weights of the nodes at each place of a cell's side, node after node.
    std::array<std::array<double, kCell>, kNodes> mvdfWeights;
    // Likewise midway between nodes.
    std::array<std::array<double, kNodes - 1>, kNodes> mvdfMidWeights;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_POSITIONLATTICE_H
