#include "rasterjob/runplan.h"

#include <algorithm>

#include "gdalraster/errors.h"
#include "gdalraster/pixeltypes.h"
#include "methods.h"
#include "rasterjob/targetmapping.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::tool {

namespace {

using utils::IRasterResampler;

gobs::NativeDataTypeCode ChooseType(const RasterOptions& oOptions, SourceRaster& oSource) {
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

std::optional<NodataValue> ChooseNodata(const RasterOptions& oOptions, SourceRaster& oSource,
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

// What marks target pixels that fall beside the source, where the source itself marks none.
void ChooseHoles(const IRasterResampler& oResampler, SourceRaster& oSource, TargetPlan& oTarget) {
    if (oTarget.oNodata || oTarget.bMaskBand || oSource.HasAlpha()) {
        return;
    }
    const gobs::NativeDataTypeCode ePart = gobs::DataTypeAdapter::ComplexToScalar(oTarget.eType);
    if (ePart == gobs::eDT_32R || ePart == gobs::eDT_64R) {
        oTarget.oNodata = NodataValue::FromText("nan");
    } else if (IsNearest(oResampler)) {
        // No value can be kept free without changing samples.
        oTarget.bMaskBand = true;
    } else {
        oTarget.oNodata = NodataValue::FromText("0");
    }
}

}  // namespace

RunPlan MakePlan(const RasterOptions& oOptions, SourceRaster& oSource, const Grid& oGrid) {
    RunPlan oPlan;
    TargetPlan& oTarget = oPlan.oTarget;
    oTarget.oGrid = oGrid;
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
    if (oGrid.poCrs) {
        ChooseHoles(*oPlan.poResampler, oSource, oTarget);
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

}  // namespace vetra::tool
