#include "rasterjob/resamplejob.h"

#include <cpl_conv.h>
#include <omp.h>

#include <algorithm>
#include <functional>
#include <memory>

#include "gdalraster/errors.h"
#include "gdalraster/overviews.h"
#include "gdalraster/sourceraster.h"
#include "gdalraster/targetformat.h"
#include "gdalraster/targetraster.h"
#include "methods.h"
#include "rasterjob/blockrun.h"
#include "rasterjob/interrupt.h"
#include "rasterjob/pipeline.h"
#include "rasterjob/progress.h"
#include "rasterjob/runplan.h"
#include "rasterjob/targetfile.h"
#include "rasterjob/targetmapping.h"
#include "rasterjob/warpmapping.h"

namespace vetra::tool {

namespace {

constexpr long long kMegabyte = 1024 * 1024;
constexpr long long kProcessBytes = 80 * kMegabyte;
// Blocks under way: one is planned, one read, one computed and one written.
constexpr int kNumSlots = 4;
// Time of the overviews, and of making another format from a finished image, beside that of the
// image itself.
constexpr double kOverviewsTime = 0.5;
constexpr double kCopyTime = 0.3;

// What the process needs before it has any pixels, then a third for GDAL's blocks and half for
// ours. The rest is for single large blocks of a file.
long long DivideMemory(long long nMemoryMb) {
    const long long nBytes = nMemoryMb * kMegabyte;
    const long long nPixelBytes = std::max(nBytes - kProcessBytes, nBytes / 4);
    GDALSetCacheMax64(nPixelBytes / 3);
    return nPixelBytes / 2;
}

void SetThreads(int nThreads) {
    if (nThreads > 0) {
        omp_set_num_threads(nThreads);
    }
    // Those that pack and unpack blocks of files; what the user has set counts.
    if (CPLGetConfigOption("GDAL_NUM_THREADS", nullptr) == nullptr) {
        CPLSetConfigOption("GDAL_NUM_THREADS", std::to_string(omp_get_max_threads()).c_str());
    }
}

// Makes the mapping when the target is there.
using MappingMaker =
    std::function<std::unique_ptr<TargetMapping>(const BlockBudget&, const TargetRaster&)>;

// Fills a new image file from the source.
void FillRaster(SourceRaster& oSource, const RunPlan& oPlan, GDALDriver& oDriver,
                const std::string& sPath, long long nBlockBytes, const MappingMaker& fnMakeMapping,
                Progress& oProgress) {
    TargetRaster oTarget(oDriver, sPath, oPlan.oTarget, oSource);
    std::vector<std::unique_ptr<BlockRun>> oSlots;
    for (int nSlot = 0; nSlot < kNumSlots; ++nSlot) {
        oSlots.push_back(std::make_unique<BlockRun>(oPlan, oSource));
    }
    const BlockBudget oBudget{oSlots[0]->GetSrcPixelBytes(), oSlots[0]->GetTgtPixelBytes(),
                              nBlockBytes / kNumSlots};
    const std::unique_ptr<TargetMapping> poMapping = fnMakeMapping(oBudget, oTarget);
    const Grid& oGrid = oPlan.oTarget.oGrid;
    const double dfNumPix = static_cast<double>(oGrid.nCols) * oGrid.nRows;
    long long nDone = 0;

    const auto Slot = [&](int nSlot) -> BlockRun& {
        return *oSlots[static_cast<std::size_t>(nSlot)];
    };
    PipelineSteps oSteps;
    oSteps.fnPlan = [&](int nSlot) { return Slot(nSlot).Plan(*poMapping); };
    oSteps.fnRead = [&](int nSlot) {
        GdalMessages::Attribute(oSource.GetReadFailure());
        Slot(nSlot).Read(oSource);
    };
    oSteps.fnRun = [&](int nSlot) { Slot(nSlot).Resample(); };
    oSteps.fnWrite = [&](int nSlot) {
        GdalMessages::Attribute(TargetRaster::GetWriteFailure());
        nDone += Slot(nSlot).Write(oTarget);
        oProgress.Show(static_cast<double>(nDone) / dfNumPix);
    };
    GdalMessages::ForgetFailures();
    RunPipeline(kNumSlots, oSteps);
    oTarget.Close();
}

void ResampleInto(SourceRaster& oSource, const RunPlan& oPlan, GDALDriver& oDriver,
                  const std::string& sPath, long long nBlockBytes, Progress& oProgress) {
    FillRaster(
        oSource, oPlan, oDriver, sPath, nBlockBytes,
        [&](const BlockBudget& oBudget, const TargetRaster&) {
            return std::make_unique<ScaledMapping>(oPlan.oTarget.oGrid, oSource.GetNumCols(),
                                                   oSource.GetNumRows(), *oPlan.poResampler,
                                                   oBudget);
        },
        oProgress);
}

// Gives an image overviews, each half as large as the one before and made from it.
void MakeOverviews(const std::string& sMethod, const TargetFile& oFile, const std::string& sPath,
                   long long nBlockBytes, double dfProgressStart, double dfProgressEnd,
                   Progress& oProgress) {
    const int nNumLevels = AddEmptyOverviews(sPath);
    RasterOptions oLevelOptions;
    oLevelOptions.sMethod = sMethod;
    std::string sFrom = sPath;
    double dfPixels = 1.0;
    for (int nLevel = 0; nLevel < nNumLevels; ++nLevel) {
        // Three quarters of what is left.
        dfPixels /= 4.0;
        oProgress.StartPart(dfProgressEnd - (dfProgressEnd - dfProgressStart) * dfPixels);
        const std::string sTo = oFile.GetStagePath("level" + std::to_string(nLevel % 2) + ".tif");
        {
            SourceRaster oSource(sFrom, std::nullopt);
            const int nCols = (oSource.GetNumCols() + 1) / 2;
            const int nRows = (oSource.GetNumRows() + 1) / 2;
            const Grid oGrid = PlanGrid(
                oSource.GetDataset(),
                {GridRequest::eGK_SIZE, static_cast<double>(nCols), static_cast<double>(nRows)});
            const RunPlan oPlan = MakePlan(oLevelOptions, oSource, oGrid);
            ResampleInto(oSource, oPlan, GetStageDriver(), sTo, nBlockBytes, oProgress);
        }
        FillOverview(sPath, nLevel, sTo, ThrowIfInterrupted);
        sFrom = sTo;
    }
}

int CPL_STDCALL ShowCopy(double dfDone, const char*, void* poProgress) {
    static_cast<Progress*>(poProgress)->Show(dfDone);
    return GetInterrupt() == 0 ? TRUE : FALSE;
}

void Prepare(const RasterOptions& oOptions) {
    GDALAllRegister();
    SetThreads(oOptions.nThreads);
}

// What resampling and warping have in common.
// \param fnFill  makes an image file as `ResampleInto` does
template <class Filler>
void RunJob(const RasterOptions& oOptions, SourceRaster& oSource, const Grid& oGrid,
            const Filler& fnFill) {
    const long long nBlockBytes = DivideMemory(oOptions.nMemoryMb);
    const TargetFormat oFormat(oOptions.sFormat, oOptions.sTarget);
    RunPlan oPlan = MakePlan(oOptions, oSource, oGrid);
    oFormat.CheckHolds(oPlan.oTarget.eType);
    const std::string sOverviews = oFormat.ChooseOverviews(
        oOptions.sOverviews, oOptions.oCreationOptions, oPlan.oTarget.bSameValues);
    TargetFile oFile(ResolveTarget(oOptions.sTarget, oSource));

    const bool bStaged = oFormat.IsCopyOnly();
    const std::string sPath = bStaged ? oFile.GetStagePath("stage.tif") : oFile.GetPath();
    if (bStaged) {
        oPlan.oTarget.oOptions.clear();
    }
    const double dfOverviewsTime = sOverviews.empty() ? 0.0 : kOverviewsTime;
    const double dfTime = 1.0 + dfOverviewsTime + (bStaged ? kCopyTime : 0.0);
    Progress oProgress(oOptions.bQuiet);
    // The end is reported when the file is in its place.
    constexpr double kAlmost = 0.995;
    oProgress.StartPart(kAlmost / dfTime);
    fnFill(oSource, oPlan, bStaged ? GetStageDriver() : oFormat.GetDriver(), sPath, nBlockBytes,
           oProgress);
    if (!sOverviews.empty()) {
        MakeOverviews(sOverviews, oFile, sPath, nBlockBytes, kAlmost / dfTime,
                      kAlmost * (1.0 + dfOverviewsTime) / dfTime, oProgress);
    }
    if (bStaged) {
        oProgress.StartPart(kAlmost);
        try {
            CopyRaster(sPath, oFormat.GetDriver(), oFile.GetPath(),
                       oFormat.CompleteCopyOptions(oOptions.oCreationOptions), ShowCopy,
                       &oProgress);
        } catch (const RunError&) {
            ThrowIfInterrupted();
            throw;
        }
    }
    ThrowIfInterrupted();
    oFile.Commit(oSource);
    oProgress.StartPart(1.0);
    oProgress.Show(1.0);
}

}  // namespace

void RunResample(const ResampleOptions& oOptions) {
    Prepare(oOptions);
    SourceRaster oSource(oOptions.sSource, oOptions.oNodata);
    RunJob(oOptions, oSource, PlanGrid(oSource.GetDataset(), oOptions.oGrid), ResampleInto);
}

void RunWarp(const WarpOptions& oOptions) {
    Prepare(oOptions);
    SourceRaster oSource(oOptions.sSource, oOptions.oNodata);
    GeoReference oReference = oOptions.oReference;
    Grid oGrid;
    if (!oOptions.sLike.empty()) {
        oGrid = ReadGrid(oOptions.sLike, oReference.sTargetCrs);
    }
    GeoTransformer oTransformer(oSource.GetDataset(), oReference);
    if (oOptions.sLike.empty()) {
        oGrid = PlanWarpGrid(oTransformer, oOptions.oGrid);
    }
    oGrid.poCrs = oTransformer.GetCrs();
    oTransformer.SetGrid(*oGrid.oGeoTransform);
    const auto Fill = [&](SourceRaster&, const RunPlan& oPlan, GDALDriver& oDriver,
                          const std::string& sPath, long long nBlockBytes, Progress& oProgress) {
        const auto MakeMapping = [&](const BlockBudget& oBudget, const TargetRaster& oTarget) {
            return std::make_unique<WarpMapping>(
                oTransformer, oOptions.dfError, oGrid, oSource.GetNumCols(), oSource.GetNumRows(),
                *oPlan.poResampler, oBudget, oTarget.GetPieceCols());
        };
        FillRaster(oSource, oPlan, oDriver, sPath, nBlockBytes, MakeMapping, oProgress);
    };
    RunJob(oOptions, oSource, oGrid, Fill);
}

}  // namespace vetra::tool
