#ifndef VETRA_BENCH_TABLE_H
#define VETRA_BENCH_TABLE_H

#include <benchmark/benchmark.h>

#include <map>
#include <string>
#include <vector>

#include "workload.h"

/// Collects the medians of benchmarks named "work/library" and prints them as Markdown tables.
/// One has nanoseconds per target pixel, the ratio of our time to each peer's, and the floor.
/// OpenCV's are remap, resize, blur and medianBlur, GDAL's the warper and RasterIO. The other
/// compares works of ours with each other, and a third some with loops that do nothing else.
class TableReporter : public benchmark::BenchmarkReporter {
 public:
    bool ReportContext(const Context& oContext) override;
    void ReportRuns(const std::vector<Run>& voRuns) override;
    void Finalize() override;

 private:
    void PrintPeers();
    void PrintBaselines();
    void PrintBareLoops();
    double TimeOf(const Work& oWork, const std::string& sLibrary) const;

    /// By work, then by library.
    std::map<std::string, std::map<std::string, double>> moTimes;
};

#endif  // VETRA_BENCH_TABLE_H
