// The road from the public entry to a sampling template: the pair of sample types is checked and
// classified, complex samples become pairs of real channels, and two switches choose the types and
// the method.

#include "vetra/base/utils/resample/resample.h"

#include <cstdint>

#include "vetra/base/utils/resample/algorithm/resampleaverage.h"
#include "vetra/base/utils/resample/algorithm/resamplebilinear.h"
#include "vetra/base/utils/resample/algorithm/resamplecplxsar.h"
#include "vetra/base/utils/resample/algorithm/resamplecubic.h"
#include "vetra/base/utils/resample/algorithm/resamplecubicps.h"
#include "vetra/base/utils/resample/algorithm/resamplekernel.h"
#include "vetra/base/utils/resample/algorithm/resamplelagrange4.h"
#include "vetra/base/utils/resample/algorithm/resamplelagrange8.h"
#include "vetra/base/utils/resample/algorithm/resamplemedian.h"
#include "vetra/base/utils/resample/algorithm/resamplenearest.h"
#include "vetra/base/utils/resample/algorithm/resamplerinfo.h"
#include "vetra/base/utils/resample/algorithm/resamplesinc16.h"
#include "vetra/base/utils/resample/algorithm/resamplesinc8.h"
#include "vetra/base/utils/resample/engine/dispatch.h"
#include "vetra/basic/gobs/raster/sampletype.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace {

using namespace vetra::utils;
using engine::RunOptions;
using vetra::DataException;
using vetra::ParameterException;
using vetra::gobs::DataTypeAdapter;
using vetra::gobs::NativeDataTypeCode;

[[noreturn]] void RefuseMethod() {
    throw ParameterException("oResParms", ParameterException::eInvalid, "", "",
                             "The provided resample method was not recognized", VETRA_HERE);
}

// What methods read from their coefficients.
struct MethodCoefficients {
    int nWndCols = 0;
    int nWndRows = 0;
    int nSubPixels = 0;
    double dfFc = 0.0;
};

// Reads and checks what a method needs beside its samples.
MethodCoefficients ReadCoefficients(const ResampleInfo& oResParms, int nNumChan) {
    MethodCoefficients oCoefficients;
    switch (oResParms.meMethod) {
        case eRM_AVERAGE:
        case eRM_MEDIAN:
        case eRM_CPLXSAR:
        case eRM_GAUSSIAN:
        case eRM_KERNEL:
        case eRM_SQAVERAGE:
        case eRM_SQMEDIAN:
        case eRM_SQGAUSSIAN:
        case eRM_SQKERNEL:
            oResParms.GetCoefficientInt("NUMCOLS", oCoefficients.nWndCols, true);
            oResParms.GetCoefficientInt("NUMROWS", oCoefficients.nWndRows, true);
            break;
        default:
            return oCoefficients;
    }
    switch (oResParms.meMethod) {
        case eRM_CPLXSAR:
            oResParms.GetCoefficientDouble("FC", oCoefficients.dfFc, false);
            if (nNumChan % 2 != 0) {
                throw ParameterException("oSrc", ParameterException::eInvalid, "", "",
                                         "Internal error: eRM_CPLXSAR requires even number of "
                                         "channels",
                                         VETRA_HERE);
            }
            return oCoefficients;
        case eRM_GAUSSIAN:
        case eRM_SQGAUSSIAN:
            oCoefficients.nSubPixels = kTabulatedSubPixels;
            break;
        case eRM_KERNEL:
        case eRM_SQKERNEL:
            oResParms.GetCoefficientInt("NUMSUBPIXELS", oCoefficients.nSubPixels, true);
            break;
        default:
            return oCoefficients;
    }
    // The two factors stay below 2^32 and 2^31 + 1.
    const long long nTaps = static_cast<long long>(oCoefficients.nWndCols) + oCoefficients.nWndRows;
    const long long nPhases = static_cast<long long>(oCoefficients.nSubPixels) + 1;
    CheckNumWeights(oResParms.mvdfKernelWeights, nTaps * nPhases, VETRA_HERE);
    return oCoefficients;
}

template <typename Tin, typename Tout>
void ResampleFunc(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
                  const ResampleInfo& oResParms, const RunOptions& oOptions) {
    const engine::SamplingArguments<Tin, Tout> oArgs{reinterpret_cast<const Tin*>(oSrc.GetBuf()),
                                                     oSrc.GetNumCols(),
                                                     oSrc.GetNumRows(),
                                                     oSrc.GetMask(),
                                                     oSrc.GetNumChan(),
                                                     reinterpret_cast<Tout*>(oTgt.GetBuf()),
                                                     oTgt.GetNumCols(),
                                                     oTgt.GetNumRows(),
                                                     oTgt.GetMask(),
                                                     oTfm,
                                                     oResParms.mdfClampMin,
                                                     oResParms.mdfClampMax,
                                                     oResParms.mdfOutBgd,
                                                     oResParms.mbClampBgd,
                                                     oOptions};
    const NodataFillAction eFillAction = oResParms.meNodataFillAction;
    const MethodCoefficients oRead = ReadCoefficients(oResParms, oSrc.GetNumChan());
    const std::vector<double>& vdfWeights = oResParms.mvdfKernelWeights;
    switch (oResParms.meMethod) {
        case eRM_NEAR:
            ResampleNearest(oArgs);
            return;
        case eRM_SQNEAR:
            ResampleSqNearest(oArgs);
            return;
        case eRM_BILIN:
            ResampleBilinear(oArgs, eFillAction);
            return;
        case eRM_SQBILIN:
            ResampleSqBilinear(oArgs, eFillAction);
            return;
        case eRM_CUBIC:
            ResampleCubic(oArgs, eFillAction);
            return;
        case eRM_SQCUBIC:
            ResampleSqCubic(oArgs, eFillAction);
            return;
        case eRM_CUBICPS:
            ResampleCubicPs(oArgs);
            return;
        case eRM_SQCUBICPS:
            ResampleSqCubicPs(oArgs);
            return;
        case eRM_LAGRANGE4:
            ResampleLagrange4(oArgs, eFillAction);
            return;
        case eRM_SQLAGRANGE4:
            ResampleSqLagrange4(oArgs, eFillAction);
            return;
        case eRM_LAGRANGE8:
            ResampleLagrange8(oArgs, eFillAction);
            return;
        case eRM_SQLAGRANGE8:
            ResampleSqLagrange8(oArgs, eFillAction);
            return;
        case eRM_SINC8:
            ResampleSinc8(oArgs, eFillAction, vdfWeights);
            return;
        case eRM_SQSINC8:
            ResampleSqSinc8(oArgs, eFillAction, vdfWeights);
            return;
        case eRM_SINC16:
            ResampleSinc16(oArgs, eFillAction, vdfWeights);
            return;
        case eRM_SQSINC16:
            ResampleSqSinc16(oArgs, eFillAction, vdfWeights);
            return;
        case eRM_GAUSSIAN:
        case eRM_KERNEL:
            ResampleKernel(oArgs, eFillAction, oRead.nWndCols, oRead.nWndRows, oRead.nSubPixels,
                           vdfWeights);
            return;
        case eRM_SQGAUSSIAN:
        case eRM_SQKERNEL:
            ResampleSqKernel(oArgs, eFillAction, oRead.nWndCols, oRead.nWndRows, oRead.nSubPixels,
                             vdfWeights);
            return;
        case eRM_AVERAGE:
            ResampleAverage(oArgs, eFillAction, oRead.nWndCols, oRead.nWndRows);
            return;
        case eRM_SQAVERAGE:
            ResampleSqAverage(oArgs, eFillAction, oRead.nWndCols, oRead.nWndRows);
            return;
        case eRM_MEDIAN:
            ResampleMedian(oArgs, eFillAction, oRead.nWndCols, oRead.nWndRows);
            return;
        case eRM_SQMEDIAN:
            ResampleSqMedian(oArgs, eFillAction, oRead.nWndCols, oRead.nWndRows);
            return;
        case eRM_CPLXSAR:
            ResampleCplxSar(oArgs, eFillAction, oRead.nWndCols, oRead.nWndRows, oRead.dfFc);
            return;
        case eRM_CUSTOM:
            break;
    }
    RefuseMethod();
}

// A complex image as a real one with twice the channels, on the same memory. Buffers hand out their
// arrays as writable only when they are writable themselves; this view of a source is only read.
ResampleBuffer MakeRealView(const ResampleBuffer& oBuffer) {
    return ResampleBuffer(DataTypeAdapter::ComplexToScalar(oBuffer.GetDatatype()),
                          oBuffer.GetNumCols(), oBuffer.GetNumRows(), 2 * oBuffer.GetNumChan(),
                          const_cast<unsigned char*>(oBuffer.GetBuf()),
                          const_cast<unsigned char*>(oBuffer.GetMask()), false);
}

// Calls fnRun with a value of the sample type that a real code stands for.
template <typename Function>
void RunWithSampleType(NativeDataTypeCode eType, const Function& fnRun) {
    if (!vetra::gobs::WithSampleType(eType, fnRun)) {
        throw ParameterException("oSrc", ParameterException::eInvalid, "", "",
                                 "Datatype of the provided raster is not supported for resampling",
                                 VETRA_HERE);
    }
}

void ResampleNoConv(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
                    const ResampleInfo& oResParms, const RunOptions& oOptions) {
    RunWithSampleType(oSrc.GetDatatype(), [&]<typename T>(T) {
        ResampleFunc<T, T>(oSrc, oTgt, oTfm, oResParms, oOptions);
    });
}

void ResampleFloatToDT(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
                       const ResampleInfo& oResParms, const RunOptions& oOptions) {
    RunWithSampleType(oTgt.GetDatatype(), [&]<typename T>(T) {
        ResampleFunc<float, T>(oSrc, oTgt, oTfm, oResParms, oOptions);
    });
}

void ResampleDTToFloat(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
                       const ResampleInfo& oResParms, const RunOptions& oOptions) {
    RunWithSampleType(oSrc.GetDatatype(), [&]<typename T>(T) {
        ResampleFunc<T, float>(oSrc, oTgt, oTfm, oResParms, oOptions);
    });
}

void ResampleConverted(ResampleDatatypeConversion eConv, const ResampleBuffer& oSrc,
                       ResampleBuffer& oTgt, const IBufPosTfm& oTfm, const ResampleInfo& oResParms,
                       const RunOptions& oOptions) {
    switch (eConv) {
        case eRDC_FLOAT_TO_DT:
            return ResampleFloatToDT(oSrc, oTgt, oTfm, oResParms, oOptions);
        case eRDC_DT_TO_FLOAT:
            return ResampleDTToFloat(oSrc, oTgt, oTfm, oResParms, oOptions);
        case eRDC_NONE:
            return ResampleNoConv(oSrc, oTgt, oTfm, oResParms, oOptions);
    }
}

}  // namespace

namespace vetra::utils {

void engine::Resample(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
                      const ResampleInfo& oResParms, const RunOptions& oOptions) {
    ResampleDatatypeConversion eConv;
    GetResampleConversionType(oSrc, oTgt, eConv);
    CheckDatatypeOkForResampler(oSrc, oResParms);
    if (DataTypeAdapter::IsComplex(oSrc.GetDatatype())) {
        const ResampleBuffer oRealSrc = MakeRealView(oSrc);
        ResampleBuffer oRealTgt = MakeRealView(oTgt);
        ResampleConverted(eConv, oRealSrc, oRealTgt, oTfm, oResParms, oOptions);
    } else {
        ResampleConverted(eConv, oSrc, oTgt, oTfm, oResParms, oOptions);
    }
}

void Resample(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
              const ResampleInfo& oResParms) {
    engine::Resample(oSrc, oTgt, oTfm, oResParms, RunOptions{});
}

void Resample(const ResampleBuffer& oSrc, ResampleBuffer& oTgt, const IBufPosTfm& oTfm,
              const ResampleInfo& oResParms, unsigned char* pabyOutcome) {
    if (pabyOutcome == nullptr) {
        throw ParameterException("pabyOutcome", ParameterException::eInvalid, "NULL", "non-NULL",
                                 "The outcome of the pixels needs an array", VETRA_HERE);
    }
    RunOptions oOptions;
    oOptions.pabyOutcome = pabyOutcome;
    engine::Resample(oSrc, oTgt, oTfm, oResParms, oOptions);
}

void GetResampleConversionType(const ResampleBuffer& oSrc, const ResampleBuffer& oTgt,
                               ResampleDatatypeConversion& eConv) {
    const NativeDataTypeCode eSrc = oSrc.GetDatatype();
    const NativeDataTypeCode eTgt = oTgt.GetDatatype();
    if (oSrc.GetNumChan() != oTgt.GetNumChan()) {
        throw ParameterException(
            "oTgt", ParameterException::eInvalid, FormatString("NumChan = %d", oTgt.GetNumChan()),
            FormatString("%d", oSrc.GetNumChan()),
            "Target raster must have same number of channels as source raster", VETRA_HERE);
    }
    if (DataTypeAdapter::IsComplex(eSrc) != DataTypeAdapter::IsComplex(eTgt)) {
        throw ParameterException(
            "oTgt", ParameterException::eInvalid, DataTypeAdapter::TypeToString(eTgt), "",
            "Resample conversion between complex and real datatypes is not allowed", VETRA_HERE);
    }
    const auto fnIsFloat = [](NativeDataTypeCode eType) {
        return eType == gobs::eDT_32R || eType == gobs::eDT_C32R;
    };
    if (eSrc == eTgt) {
        eConv = eRDC_NONE;
    } else if (fnIsFloat(eSrc)) {
        eConv = eRDC_FLOAT_TO_DT;
    } else if (fnIsFloat(eTgt)) {
        eConv = eRDC_DT_TO_FLOAT;
    } else {
        throw ParameterException("oTgt", ParameterException::eInvalid, "Datatype", "",
                                 "Source and target datatypes are incompatible for resampling",
                                 VETRA_HERE);
    }
}

void CheckDatatypeOkForResampler(const ResampleBuffer& oSrc, const ResampleInfo& oResParms) {
    if (oResParms.meMethod == eRM_CPLXSAR && !DataTypeAdapter::IsComplex(oSrc.GetDatatype())) {
        throw DataException("eRM_CPLXSAR resampling type requires complex data", VETRA_HERE);
    }
}

}  // namespace vetra::utils
