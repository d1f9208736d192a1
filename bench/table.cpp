#include "table.h"

#include <cstdio>
#include <string>

#include "floor.h"
#include "vetra/textcore/formatstring.h"
#include "workload.h"

bool TableReporter::ReportContext(const Context&) { return true; }

void TableReporter::ReportRuns(const std::vector<Run>& voRuns) {
    for (const Run& oRun : voRuns) {
        const std::string sName = oRun.run_name.function_name;
        const std::size_t nSlash = sName.rfind('/');
        if (oRun.error_occurred) {
            std::fprintf(stderr, "%s: %s\n", sName.c_str(), oRun.error_message.c_str());
            continue;
        }
        if (oRun.run_type != Run::RT_Aggregate || oRun.aggregate_name != "median") {
            continue;
        }
        const std::string sWork = sName.substr(0, nSlash);
        moTimes[sWork][sName.substr(nSlash + 1)] = oRun.GetAdjustedRealTime();
    }
}

namespace {

std::string Cell(double df) { return df > 0.0 ? FormatString("%.2f", df) : std::string(); }

std::string RatioCell(double dfOurs, double dfTheirs) {
    return Cell(dfOurs > 0.0 && dfTheirs > 0.0 ? dfOurs / dfTheirs : 0.0);
}

}  // namespace

double TableReporter::TimeOf(const Work& oWork, const std::string& sLibrary) const {
    const auto itWork = moTimes.find(oWork.Name());
    if (itWork == moTimes.end()) {
        return 0.0;
    }
    const auto itTime = itWork->second.find(sLibrary);
    return itTime == itWork->second.end() ? 0.0 : itTime->second / oWork.TargetPixels();
}

void TableReporter::Finalize() {
    PrintPeers();
    PrintBaselines();
    PrintBareLoops();
    const MachineRates& oRates = GetMachineRates();
    std::printf("\nFloors: memory moves %.1f bytes per ns, a core does %.1f operations per ns.\n",
                oRates.dfBytesPerNs, oRates.dfOperationsPerNs);
}

void TableReporter::PrintPeers() {
    std::printf("| work | vetra | OpenCV | GDAL | ours / OpenCV's | ours / GDAL's | floor |\n");
    std::printf("|---|---|---|---|---|---|---|\n");
    for (const Work& oWork : AllWorks()) {
        const double dfOurs = TimeOf(oWork, "vetra");
        if (!oWork.IsCommon() || dfOurs == 0.0) {
            continue;
        }
        const double dfOpenCv = TimeOf(oWork, "OpenCV");
        const double dfGdal = TimeOf(oWork, "GDAL");
        std::printf("| %s | %s | %s | %s | %s | %s | %s |\n", oWork.Name().c_str(),
                    Cell(dfOurs).c_str(), Cell(dfOpenCv).c_str(), Cell(dfGdal).c_str(),
                    RatioCell(dfOurs, dfOpenCv).c_str(), RatioCell(dfOurs, dfGdal).c_str(),
                    oWork.nThreads == 1 ? Cell(FloorOf(oWork)).c_str() : "");
    }
}

void TableReporter::PrintBaselines() {
    std::printf("\n| work | vetra | compared with | its time | ratio | ours / OpenCV's |\n");
    std::printf("|---|---|---|---|---|---|\n");
    for (const Work& oWork : AllWorks()) {
        const double dfOurs = TimeOf(oWork, "vetra");
        const Work oBase = oWork.Baseline();
        const double dfPlain = TimeOf(oWork, "plain loop");
        const bool bPlain = dfPlain > 0.0;
        if (dfOurs == 0.0 || (oBase.Name() == oWork.Name() && !bPlain)) {
            continue;
        }
        const double dfBase = bPlain ? dfPlain : TimeOf(oBase, "vetra");
        std::printf("| %s | %s | %s | %s | %s | %s |\n", oWork.Name().c_str(), Cell(dfOurs).c_str(),
                    bPlain ? "plain loop of the tests" : oBase.Name().c_str(), Cell(dfBase).c_str(),
                    RatioCell(dfOurs, dfBase).c_str(),
                    oWork.bAvx2 ? RatioCell(dfOurs, TimeOf(oBase, "OpenCV")).c_str() : "");
    }
}

void TableReporter::PrintBareLoops() {
    std::printf("\n| work | vetra | bare loop | ratio |\n|---|---|---|---|\n");
    for (const Work& oWork : AllWorks()) {
        const double dfOurs = TimeOf(oWork, "vetra");
        const double dfBare = TimeOf(oWork, "bare loop");
        if (dfBare > 0.0) {
            std::printf("| %s | %s | %s | %s |\n", oWork.Name().c_str(), Cell(dfOurs).c_str(),
                        Cell(dfBare).c_str(), RatioCell(dfOurs, dfBare).c_str());
        }
    }
}
