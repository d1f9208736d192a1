#include <cmath>
#include <cstdint>
#include <string>
#include <vector>

#include "bare.h"
#include "vetra/base/utils/resample/engine/levels.h"
#include "workload.h"

using namespace vetra::utils;

Case BareCase(const Work& oWork) {
    const std::string sMethod = oWork.MethodName();
    if (oWork.eType != vetra::gobs::eDT_8U || oWork.nChan != 1 || oWork.nThreads != 1 ||
        oWork.nTargetSize != kTargetSize || oWork.bAvx2 ||
        engine::GetBestLevel() < engine::Level::eV4) {
        return {};
    }
    const BareImages oImages{SourceSamples(oWork).data(),
                             oWork.bMask ? SourceMask().data() : nullptr,
                             TargetSamples().data(),
                             kTargetSize,
                             kTargetSize,
                             kSourceSize};
    if (oWork.eGeometry == Work::Geometry::eRotated && (sMethod == "NEAR" || sMethod == "BILIN")) {
        // As far ahead as the engine asks.
        constexpr double kTgtRowsAhead = 4.0;
        const BarePositions oPositions{RotatedCols().data(), RotatedRows().data(),
                                       RotatedAhead(kTgtRowsAhead)};
        const auto pfnLoop = sMethod == "NEAR" ? &BareNearest : &BareBilinear;
        return {"bare loop", [=] { pfnLoop(oImages, oPositions); }};
    }
    if (oWork.eGeometry == Work::Geometry::eDown && sMethod == "NEAR") {
        std::vector<std::int64_t> vnCells(kTargetSize);
        for (std::size_t i = 0; i < vnCells.size(); ++i) {
            vnCells[i] = std::llround(static_cast<double>(i) * ScaleOf(oWork.eGeometry));
        }
        return {"bare loop", [=] { BareScaledNearest(oImages, {vnCells.data(), vnCells.data()}); }};
    }
    return {};
}
