#include "table.h"

#include <cstdio>
#include <string>

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
        moTimes[sWork].emplace_back(sName.substr(nSlash + 1),
                                    oRun.GetAdjustedRealTime() / kTargetPixels);
    }
}

void TableReporter::Finalize() {
    std::printf("| work | vetra, ns per pixel | peer, ns per pixel | ours / peer's |\n");
    std::printf("|---|---|---|---|\n");
    for (const Work& oWork : AllWorks()) {
        const std::string sWork = oWork.Name();
        if (moTimes[sWork].empty()) {
            continue;
        }
        double dfOurs = 0.0;
        for (const auto& [sLibrary, dfTime] : moTimes[sWork]) {
            dfOurs = sLibrary == "vetra" ? dfTime : dfOurs;
        }
        const char* pszWork = sWork.c_str();
        bool bAlone = true;
        for (const auto& [sLibrary, dfTime] : moTimes[sWork]) {
            if (sLibrary != "vetra") {
                std::printf("| %s | %.2f | %s: %.2f | %.2f |\n", pszWork, dfOurs, sLibrary.c_str(),
                            dfTime, dfOurs / dfTime);
                bAlone = false;
            }
        }
        if (bAlone) {
            std::printf("| %s | %.2f | | |\n", pszWork, dfOurs);
        }
    }
}
