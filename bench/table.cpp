#include "table.h"

#include <cstdio>
#include <string>

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
        moTimes[sWork][sName.substr(nSlash + 1)] = oRun.GetAdjustedRealTime() / kTargetPixels;
    }
}

void TableReporter::Finalize() {
    std::printf("| work | vetra | OpenCV | GDAL | ours / OpenCV's | ours / GDAL's |\n");
    std::printf("|---|---|---|---|---|---|\n");
    const auto fnCell = [](double df) {
        return df > 0.0 ? FormatString("%.2f", df) : std::string();
    };
    for (const Work& oWork : AllWorks()) {
        auto& oTimes = moTimes[oWork.Name()];
        if (oTimes.empty()) {
            continue;
        }
        const double dfOurs = oTimes["vetra"];
        const double dfOpenCv = oTimes["OpenCV"];
        const double dfGdal = oTimes["GDAL"];
        std::printf("| %s | %s | %s | %s | %s | %s |\n", oWork.Name().c_str(),
                    fnCell(dfOurs).c_str(), fnCell(dfOpenCv).c_str(), fnCell(dfGdal).c_str(),
                    fnCell(dfOpenCv > 0.0 ? dfOurs / dfOpenCv : 0.0).c_str(),
                    fnCell(dfGdal > 0.0 ? dfOurs / dfGdal : 0.0).c_str());
    }
}
