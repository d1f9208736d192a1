#include <gdal_priv.h>
#include <gdalwarper.h>

#include <map>
#include <memory>
#include <stdexcept>
#include <string>

#include "workload.h"

using namespace vetra::gobs;

namespace {

GDALDataType TypeOf(const Work& oWork) {
    return oWork.eType == eDT_8U ? GDT_Byte : oWork.eType == eDT_16U ? GDT_UInt16 : GDT_Float32;
}

// An image in memory as a dataset, pixels interleaved, without a copy.
std::shared_ptr<GDALDataset> Wrap(const Work& oWork, int nSize, unsigned char* pabySamples) {
    const GDALDataType eType = TypeOf(oWork);
    const int nBytes = GDALGetDataTypeSizeBytes(eType);
    auto* poDriver = GetGDALDriverManager()->GetDriverByName("MEM");
    std::shared_ptr<GDALDataset> poDataset(poDriver->Create("", nSize, nSize, 0, eType, nullptr),
                                           [](GDALDataset* po) { GDALClose(po); });
    for (int c = 0; c < oWork.nChan; ++c) {
        char szPointer[32] = {};
        CPLPrintPointer(szPointer, pabySamples + c * nBytes, sizeof szPointer);
        CPLStringList aosOptions;
        aosOptions.SetNameValue("DATAPOINTER", szPointer);
        aosOptions.SetNameValue("PIXELOFFSET", std::to_string(nBytes * oWork.nChan).c_str());
        aosOptions.SetNameValue("LINEOFFSET", std::to_string(nBytes * oWork.nChan * nSize).c_str());
        poDataset->AddBand(eType, aosOptions.List());
    }
    return poDataset;
}

// Target to source, as the positions of the rotated work say; the warper asks for nothing else.
int RotatedTransform(void*, int bDstToSrc, int nCount, double* padfX, double* padfY, double*,
                     int* panSuccess) {
    const double dfC = RotatedCols()[1] - RotatedCols()[0];
    const double dfS = RotatedRows()[1] - RotatedRows()[0];
    for (int i = 0; i < nCount; ++i) {
        const double x = padfX[i] - (bDstToSrc ? 0.5 : 900.5);
        const double y = padfY[i] - (bDstToSrc ? 0.5 : 100.5);
        const double dfNorm = dfC * dfC + dfS * dfS;
        padfX[i] = bDstToSrc ? 900.5 + x * dfC - y * dfS : 0.5 + (x * dfC + y * dfS) / dfNorm;
        padfY[i] = bDstToSrc ? 100.5 + x * dfS + y * dfC : 0.5 + (y * dfC - x * dfS) / dfNorm;
        panSuccess[i] = TRUE;
    }
    return TRUE;
}

void Check(CPLErr eError) {
    if (eError != CE_None) {
        throw std::runtime_error(CPLGetLastErrorMsg());
    }
}

}  // namespace

Case GdalCase(const Work& oWork) {
    // One thread, and the geometries that a user would do with it.
    // GDAL widens its kernels where it reduces; at these scales by a third.
    const std::map<std::string, GDALResampleAlg> oMethods = {{"NEAR", GRA_NearestNeighbour},
                                                             {"BILIN", GRA_Bilinear},
                                                             {"CUBIC", GRA_Cubic},
                                                             {"SINC8", GRA_Lanczos}};
    const auto itMethod = oMethods.find(oWork.MethodName());
    if (!oWork.IsCommon() || oWork.nThreads != 1 || itMethod == oMethods.end()) {
        return {};
    }
    GDALAllRegister();
    const auto poSrc = Wrap(oWork, kSourceSize, SourceSamples(oWork).data());
    if (oWork.eGeometry == Work::Geometry::eRotated) {
        const auto poTgt = Wrap(oWork, kTargetSize, TargetSamples().data());
        const std::shared_ptr<GDALWarpOptions> poOptions(GDALCreateWarpOptions(),
                                                         GDALDestroyWarpOptions);
        poOptions->hSrcDS = GDALDataset::ToHandle(poSrc.get());
        poOptions->hDstDS = GDALDataset::ToHandle(poTgt.get());
        poOptions->eResampleAlg = itMethod->second;
        poOptions->pfnTransformer = RotatedTransform;
        poOptions->dfWarpMemoryLimit = 1e9;
        GDALWarpInitDefaultBandMapping(poOptions.get(), oWork.nChan);
        // The options refer to the datasets, which have to live as long.
        return {"GDAL", [poOptions, poSrc, poTgt] {
                    GDALWarpOperation oOperation;
                    Check(oOperation.Initialize(poOptions.get()));
                    Check(oOperation.ChunkAndWarpImage(0, 0, kTargetSize, kTargetSize));
                }};
    }
    const GDALResampleAlg eMethod = itMethod->second;
    return {"GDAL", [=] {
                GDALRasterIOExtraArg oExtra;
                INIT_RASTERIO_EXTRA_ARG(oExtra);
                oExtra.eResampleAlg = static_cast<GDALRIOResampleAlg>(eMethod);
                const int nFirst = static_cast<int>(FirstSource(oWork.eGeometry));
                const int nBytes = GDALGetDataTypeSizeBytes(TypeOf(oWork));
                Check(poSrc->RasterIO(
                    GF_Read, nFirst, nFirst, kSourceSize - 2 * nFirst, kSourceSize - 2 * nFirst,
                    TargetSamples().data(), kTargetSize, kTargetSize, TypeOf(oWork), oWork.nChan,
                    nullptr, nBytes * oWork.nChan, GSpacing{nBytes} * oWork.nChan * kTargetSize,
                    nBytes, &oExtra));
            }};
}
