#include "rasterjob/resamplejob.h"

#include <omp.h>

#include <algorithm>
#include <memory>

#include "gdalraster/errors.h"
#include "gdalraster/pixeltypes.h"
#include "gdalraster/sourceraster.h"
#include "gdalraster/targetformat.h"
#include "gdalraster/targetraster.h"
#include "methods.h"
#include "rasterjob/interrupt.h"
#include "rasterjob/progress.h"
#include "rasterjob/targetfile.h"
#include "vetra/base/utils/resample/blockplanner.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"
#include "vetra/base/utils/resample/resample.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::tool {

namespace {

using utils::IRasterResampler;

constexpr long long kMegabyte = 1024 * 1024;
constexpr long long kProcessBytes = 64 * kMegabyte;
// Blocks are smaller than memory allows where an image has many, so that the progress moves.
constexpr long long kFewestBlocks = 64;
constexpr long long kSmallestBlock = 8 * kMegabyte;
// Share of the progress that a run has where another format is made from its result.
constexpr double kStageShare = 0.8;

// How far a position moves so that a method's window lies around it. The windows of means and
// medians start at the pixel nearest to a position; left there, images would move by half a window.
struct WindowShift {
    explicit WindowShift(const IRasterResampler& oResampler) {
        int nColOff, nRowOff, nCols, nRows;
        utils::WindowAnchorPoint eColAnchor, eRowAnchor;
        oResampler.GetWindowExtents(nColOff, nRowOff, nCols, nRows, eColAnchor, eRowAnchor);
        if (eColAnchor == utils::eWAP_NEAREST) {
            dfCols = -(nColOff + (nCols - 1) / 2.0);
        }
        if (eRowAnchor == utils::eWAP_NEAREST) {
            dfRows = -(nRowOff + (nRows - 1) / 2.0);
        }
    }

    bool IsNone() const { return dfCols == 0.0 && dfRows == 0.0; }

    double dfCols = 0.0;
    double dfRows = 0.0;
};

// What the blocks of a run have in common.
struct RunPlan {
    TargetPlan oTarget;
    std::unique_ptr<IRasterResampler> poResampler;
    // Pixels without a whole window are filled in a second run, from where they are and not from
    // where their window starts.
    bool bFillApart = false;
    bool bJoined = false;       // all bands are channels of one run
    bool bExactNodata = false;  // the nodata value is stored after the run, not by it
};

gobs::NativeDataTypeCode ChooseType(const ResampleOptions& oOptions, SourceRaster& oSource) {
    if (oOptions.oType) {
        return *oOptions.oType;
    }
    const std::vector<SourceBand>& oBands = oSource.GetBands();
    const auto Name = [](const SourceBand& oBand) {
        return gobs::DataTypeAdapter::TypeToString(oBand.eType);
    };
    for (std::size_t n = 1; n < oBands.size(); ++n) {
        if (oBands[n].eType != oBands[0].eType) {
            throw RunError("the bands have different types (band 1 is " + Name(oBands[0]) +
                           ", band " + std::to_string(n + 1) + " is " + Name(oBands[n]) +
                           "): name one for the target with --type");
        }
    }
    return oBands[0].eType;
}

std::optional<NodataValue> ChooseNodata(const ResampleOptions& oOptions, SourceRaster& oSource,
                                        gobs::NativeDataTypeCode eType) {
    std::optional<NodataValue> oNodata =
        oOptions.oTargetNodata ? oOptions.oTargetNodata : oOptions.oNodata;
    if (!oNodata) {
        for (const SourceBand& oBand : oSource.GetBands()) {
            if (oBand.oNodata && !oNodata) {
                oNodata = oBand.oNodata;
            } else if (oBand.oNodata && !oBand.oNodata->IsSame(*oNodata)) {
                throw RunError("the bands have different nodata values (" + oNodata->ToText() +
                               " and " + oBand.oNodata->ToText() +
                               "): name one for the target with --dst-nodata");
            }
        }
    }
    if (oNodata && !oNodata->Fits(eType)) {
        throw RunError("pixels of type " + gobs::DataTypeAdapter::TypeToString(eType) +
                       " can't have the nodata value " + oNodata->ToText() +
                       ": name another for the target with --dst-nodata");
    }
    return oNodata;
}

// Fails before any file is made where the engine would refuse.
void CheckEngine(const std::string& sMethod, const IRasterResampler& oResampler,
                 SourceRaster& oSource, gobs::NativeDataTypeCode eType) {
    for (const SourceBand& oBand : oSource.GetBands()) {
        try {
            RunOnePixel(oResampler.GetResampleInfo(), oBand.eType, eType);
        } catch (const DataException& oError) {
            throw RunError("pixels of type " + gobs::DataTypeAdapter::TypeToString(oBand.eType) +
                           " can't be resampled by " + sMethod + " to type " +
                           gobs::DataTypeAdapter::TypeToString(eType) + ": " + oError.GetMessage());
        }
    }
}

RunPlan MakePlan(const ResampleOptions& oOptions, SourceRaster& oSource) {
    RunPlan oPlan;
    TargetPlan& oTarget = oPlan.oTarget;
    oTarget.oGrid = PlanGrid(oSource.GetDataset(), oOptions.oGrid);
    oTarget.eType = ChooseType(oOptions, oSource);
    oTarget.oNodata = ChooseNodata(oOptions, oSource, oTarget.eType);
    oTarget.bMaskBand = oSource.NeedsMaskBand();
    oTarget.oOptions = oOptions.oCreationOptions;

    oPlan.poResampler = MakeResampler(oOptions.sMethod);
    oTarget.bSameValues = IsNearest(*oPlan.poResampler);
    if (oSource.HasPalette() && !oTarget.bSameValues) {
        throw RunError(
            "the source's pixels are numbers of palette entries, between which nothing can be "
            "interpolated: use --method NEAR, or expand the palette first (gdal_translate -expand "
            "rgb)");
    }
    if (oOptions.eFill) {
        oPlan.poResampler->SetNodataFillAction(*oOptions.eFill);
    }
    oPlan.bExactNodata = oTarget.oNodata && oTarget.oNodata->NeedsExactStore(oTarget.eType);
    const bool bBackground = oTarget.oNodata && !oPlan.bExactNodata;
    oPlan.poResampler->SetClampBgdFlag(bBackground);
    oPlan.poResampler->SetOutBgd(bBackground ? oTarget.oNodata->AsDouble() : 0.0);
    CheckEngine(oOptions.sMethod, *oPlan.poResampler, oSource, oTarget.eType);
    oPlan.bFillApart = oPlan.poResampler->GetNodataFillAction() == utils::eNFA_NN &&
                       !WindowShift(*oPlan.poResampler).IsNone();
    if (oPlan.bFillApart) {
        oPlan.poResampler->SetNodataFillAction(utils::eNFA_BGD);
    }

    // The background of an alpha band is 0 whatever that of the others.
    const std::vector<SourceBand>& oBands = oSource.GetBands();
    oPlan.bJoined = oSource.HasOneMask() && !(oTarget.oNodata && oSource.HasAlpha()) &&
                    std::all_of(oBands.begin(), oBands.end(),
                                [&](const auto& o) { return o.eType == oBands[0].eType; });
    return oPlan;
}

// Resamples block after block.
class BlockRun {
 public:
    // oUnmoved maps target pixels to where they are, whatever the method's window.
    BlockRun(const RunPlan& oPlan, SourceRaster& oSource, const utils::BufPosScaleOffTfm& oUnmoved)
        : moPlan(oPlan),
          moSource(oSource),
          moUnmoved(oUnmoved),
          moSrc(GetSourceTypes(oSource), oPlan.bJoined),
          moTgt(std::vector(oSource.GetBands().size(), oPlan.oTarget.eType), oPlan.bJoined) {
        moAlphaInfo = oPlan.poResampler->GetResampleInfo();
        moInfo = moAlphaInfo;
        if (oSource.HasAlpha() && !oPlan.bJoined) {
            moAlphaInfo.mbClampBgd = false;
            moAlphaInfo.mdfOutBgd = 0.0;
        }
    }

    long long GetSrcPixelBytes() const { return moSrc.GetPixelBytes() + moSource.GetMaskBytes(); }
    long long GetTgtPixelBytes() const {
        return moTgt.GetPixelBytes() + (NeedsOutcome() ? 1 : 0) + (moPlan.bFillApart ? 1 : 0) +
               (moPlan.oTarget.bMaskBand ? 1 : 0);
    }

    void Run(const utils::BlockPlanner& oPlanner, const utils::ResampleBlock& oBlock,
             TargetRaster& oTarget) {
        const auto nNumPix = static_cast<std::size_t>(oBlock.oTarget.GetNumPix());
        moSource.Read(oBlock.oSource, moSrc);
        moTgt.Resize(oBlock.oTarget.nCols, oBlock.oTarget.nRows);
        if (NeedsOutcome()) {
            moOutcome.Reserve(nNumPix);
        }
        if (moPlan.oTarget.bMaskBand) {
            moMask.Reserve(nNumPix);
            std::fill_n(moMask.Get(), nNumPix, static_cast<unsigned char>(0));
        }
        const utils::BufPosBlockTfm oTfm = oPlanner.GetLocalTfm(oBlock);
        for (int nGroup = 0; nGroup < moTgt.GetNumGroups(); ++nGroup) {
            ThrowIfInterrupted();
            RunGroup(nGroup, oTfm, oBlock);
        }
        oTarget.Write(oBlock.oTarget, moTgt, moMask.Get());
    }

 private:
    static std::vector<gobs::NativeDataTypeCode> GetSourceTypes(SourceRaster& oSource) {
        std::vector<gobs::NativeDataTypeCode> oTypes;
        for (const SourceBand& oBand : oSource.GetBands()) {
            oTypes.push_back(oBand.eType);
        }
        return oTypes;
    }

    bool NeedsOutcome() const {
        return moPlan.oTarget.bMaskBand || moPlan.bExactNodata || moPlan.bFillApart;
    }

    // Fills the pixels that became background from their nearest pixels. Returns what became of
    // each pixel; of those that are already computed, that they were left alone.
    const unsigned char* FillApart(const utils::ResampleBuffer& oSrc, int nGroup,
                                   utils::ResampleInfo oInfo, const utils::ResampleBlock& oBlock) {
        const auto nNumPix = static_cast<std::size_t>(oBlock.oTarget.GetNumPix());
        oInfo.meMethod = GetPlainTwin(oInfo.meMethod) == oInfo.meMethod ? eRM_NEAR : eRM_SQNEAR;
        unsigned char* pabyRequest = moOutcome.Get();
        std::replace_if(
            pabyRequest, pabyRequest + nNumPix,
            [](unsigned char n) { return n != utils::ePO_BACKGROUND; }, utils::ePO_UNTOUCHED);
        std::replace(pabyRequest, pabyRequest + nNumPix,
                     static_cast<unsigned char>(utils::ePO_BACKGROUND),
                     static_cast<unsigned char>(utils::ePO_NEAREST));
        moFilled.Reserve(nNumPix);
        utils::ResampleBuffer oTgt = moTgt.GetGroup(nGroup, pabyRequest);
        const utils::BufPosBlockTfm oTfm(moUnmoved, oBlock.oTarget, oBlock.oSource.nCol,
                                         oBlock.oSource.nRow);
        utils::Resample(oSrc, oTgt, oTfm, oInfo, moFilled.Get());
        return moFilled.Get();
    }

    void RunGroup(int nGroup, const utils::BufPosBlockTfm& oTfm,
                  const utils::ResampleBlock& oBlock) {
        const long long nNumPix = oBlock.oTarget.GetNumPix();
        const bool bAlpha = moSource.GetBands()[static_cast<std::size_t>(nGroup)].bAlpha;
        const utils::ResampleInfo& oInfo = bAlpha ? moAlphaInfo : moInfo;
        const utils::ResampleBuffer oSrc = moSrc.GetGroup(nGroup, moSource.GetMask(nGroup, moSrc));
        utils::ResampleBuffer oTgt = moTgt.GetGroup(nGroup, nullptr);
        if (!NeedsOutcome()) {
            utils::Resample(oSrc, oTgt, oTfm, oInfo);
            return;
        }
        utils::Resample(oSrc, oTgt, oTfm, oInfo, moOutcome.Get());
        const unsigned char* pabyOutcome =
            moPlan.bFillApart ? FillApart(oSrc, nGroup, oInfo, oBlock) : moOutcome.Get();
        if (moPlan.bExactNodata && !bAlpha) {
            moPlan.oTarget.oNodata->StoreBackground(oTgt.GetDatatype(), pabyOutcome, nNumPix,
                                                    oTgt.GetNumChan(), oTgt.GetBuf());
        }
        if (moPlan.oTarget.bMaskBand) {
            // A pixel is valid when one of its bands is.
            unsigned char* pabyMask = moMask.Get();
            for (long long n = 0; n < nNumPix; ++n) {
                pabyMask[n] = pabyOutcome[n] != utils::ePO_BACKGROUND ? 255 : pabyMask[n];
            }
        }
    }

    const RunPlan& moPlan;
    SourceRaster& moSource;
    const utils::BufPosScaleOffTfm& moUnmoved;
    BandArrays moSrc;
    BandArrays moTgt;
    utils::ResampleInfo moInfo;
    utils::ResampleInfo moAlphaInfo;
    ByteArray moOutcome;
    ByteArray moFilled;
    ByteArray moMask;
};

int CPL_STDCALL ShowCopy(double dfDone, const char*, void* poProgress) {
    static_cast<Progress*>(poProgress)->Show(kStageShare + (1.0 - kStageShare) * dfDone);
    return GetInterrupt() == 0 ? TRUE : FALSE;
}

}  // namespace

void RunResample(const ResampleOptions& oOptions) {
    GDALAllRegister();
    if (oOptions.nThreads > 0) {
        omp_set_num_threads(oOptions.nThreads);
    }
    // What the process needs before it has any pixels, then a third for GDAL's blocks and half for
    // ours. The rest is for single large blocks of a file.
    const long long nBytes = oOptions.nMemoryMb * kMegabyte;
    const long long nPixelBytes = std::max(nBytes - kProcessBytes, nBytes / 4);
    GDALSetCacheMax64(nPixelBytes / 3);
    const long long nBlockBytes = nPixelBytes / 2;

    SourceRaster oSource(oOptions.sSource, oOptions.oNodata);
    const RunPlan oPlan = MakePlan(oOptions, oSource);
    const Grid& oGrid = oPlan.oTarget.oGrid;
    const TargetFormat oFormat(oOptions.sFormat, oOptions.sTarget);
    oFormat.CheckHolds(oPlan.oTarget.eType);
    TargetFile oFile(ResolveTarget(oOptions.sTarget, oSource));

    const WindowShift oShift(*oPlan.poResampler);
    const utils::BufPosScaleOffTfm oTfm(oGrid.nCols, oGrid.nRows, oGrid.dfColScale, oShift.dfCols,
                                        oGrid.dfRowScale, oShift.dfRows, 0, 0);
    const utils::BufPosScaleOffTfm oUnmoved(oGrid.nCols, oGrid.nRows, oGrid.dfColScale, 0.0,
                                            oGrid.dfRowScale, 0.0, 0, 0);
    BlockRun oRun(oPlan, oSource, oUnmoved);
    const long long nAllBytes =
        static_cast<long long>(oSource.GetNumCols()) * oSource.GetNumRows() *
            oRun.GetSrcPixelBytes() +
        static_cast<long long>(oGrid.nCols) * oGrid.nRows * oRun.GetTgtPixelBytes();
    const utils::BlockPlanner oPlanner(
        oTfm, oSource.GetNumCols(), oSource.GetNumRows(), *oPlan.poResampler,
        oRun.GetSrcPixelBytes(), oRun.GetTgtPixelBytes(),
        std::min(nBlockBytes, std::max(kSmallestBlock, nAllBytes / kFewestBlocks)));

    const bool bStaged = oFormat.IsCopyOnly();
    TargetPlan oTargetPlan = oPlan.oTarget;
    if (bStaged) {
        oTargetPlan.oOptions.clear();
    }
    Progress oProgress(oOptions.bQuiet);
    TargetRaster oTarget(bStaged ? GetStageDriver() : oFormat.GetDriver(),
                         bStaged ? oFile.GetStagePath() : oFile.GetPath(), oTargetPlan, oSource);
    const long long nNumBlocks = oPlanner.GetNumBlocks();
    for (long long nBlock = 0; nBlock < nNumBlocks; ++nBlock) {
        ThrowIfInterrupted();
        oRun.Run(oPlanner, oPlanner.GetBlock(nBlock), oTarget);
        // The end is reported when the file is in its place.
        oProgress.Show((bStaged ? kStageShare : 1.0) * static_cast<double>(nBlock + 1) /
                       static_cast<double>(nNumBlocks + 1));
    }
    oTarget.Close();
    if (bStaged) {
        try {
            CopyRaster(oFile.GetStagePath(), oFormat.GetDriver(), oFile.GetPath(),
                       oOptions.oCreationOptions, ShowCopy, &oProgress);
        } catch (const RunError&) {
            ThrowIfInterrupted();
            throw;
        }
    }
    ThrowIfInterrupted();
    oFile.Commit(oSource);
    oProgress.Show(1.0);
}

}  // namespace vetra::tool
