#ifndef VETRA_APPS_RASTERJOB_WARPMAPPING_H
#define VETRA_APPS_RASTERJOB_WARPMAPPING_H

#include <vector>

#include "gdalraster/geotransformer.h"
#include "gdalraster/grid.h"
#include "rasterjob/positionlattice.h"
#include "rasterjob/targetmapping.h"

namespace vetra::tool {

/// A target in a grid and reference system of its own.
///
/// Blocks are squares, or strips where the file is written by whole rows. A block whose source
/// window is larger than the budget, for instance one across which the source is torn, is halved as
/// it comes up, until its window fits or a single pixel is left.
class WarpMapping : public TargetMapping {
 public:
    /// \param dfError     see `PositionLattice`
    /// \param nPieceCols  columns of the pieces in which the target's file is written
    WarpMapping(const GeoTransformer& oTransformer, double dfError, const Grid& oGrid, int nSrcCols,
                int nSrcRows, const utils::IRasterResampler& oResampler, const BlockBudget& oBudget,
                int nPieceCols);
    bool GetNext(MappedBlock& oMapped) override;

 private:
    void ChooseBlockSize(int nPieceCols);
    void PushRow();
    void FillPositions(const utils::PixelRect& oRect, MappedBlock& oMapped);

    PositionLattice moLattice;
    int mnCols;
    int mnRows;
    int mnSrcCols;
    int mnSrcRows;
    const utils::IRasterResampler& moResampler;
    WindowShift moShift;
    BlockBudget moBudget;
    int mnBlockCols = 0;
    int mnBlockRows = 0;
    int mnNextRow = 0;
    // The next block last.
    std::vector<utils::PixelRect> moPending;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_WARPMAPPING_H
