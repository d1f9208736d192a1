#ifndef VETRA_APPS_RASTERJOB_BLOCKRUN_H
#define VETRA_APPS_RASTERJOB_BLOCKRUN_H

#include "gdalraster/bandarrays.h"
#include "gdalraster/sourceraster.h"
#include "gdalraster/targetraster.h"
#include "rasterjob/runplan.h"
#include "rasterjob/targetmapping.h"

namespace vetra::tool {

/// The memory of one block, and what is done with it. Steps of different blocks may overlap.
class BlockRun {
 public:
    /// Both must outlive this object.
    BlockRun(const RunPlan& oPlan, const SourceRaster& oSource);

    long long GetSrcPixelBytes() const { return moSrc.GetPixelBytes(); }
    /// Without those of the positions.
    long long GetTgtPixelBytes() const;

    /// \returns false when there is no further block
    bool Plan(TargetMapping& oMapping) { return oMapping.GetNext(moMapped); }
    void Read(SourceRaster& oSource) { oSource.Read(moMapped.oBlock.oSource, moSrc); }
    void Resample();
    /// \returns the number of pixels
    long long Write(TargetRaster& oTarget);

 private:
    bool NeedsOutcome() const;
    // Fills the pixels that became background from their nearest pixels. Returns what became of
    // each pixel; of those that are already computed, that they were left alone or computed.
    const unsigned char* FillApart(const utils::ResampleBuffer& oSrc, int nGroup,
                                   utils::ResampleInfo oInfo);
    void RunGroup(int nGroup);

    const RunPlan& moPlan;
    const SourceRaster& moSource;
    MappedBlock moMapped;
    SourceBlock moSrc;
    BandArrays moTgt;
    utils::ResampleInfo moInfo;
    utils::ResampleInfo moAlphaInfo;
    ByteArray moOutcome;
    ByteArray moFilled;
    ByteArray moMask;
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_BLOCKRUN_H
