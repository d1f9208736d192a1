#ifndef VETRA_BENCH_TABLE_H
#define VETRA_BENCH_TABLE_H

#include <benchmark/benchmark.h>

#include <map>
#include <string>
#include <vector>

/// Collects the medians of benchmarks named "work/library" and prints them as a Markdown table:
/// nanoseconds per target pixel, and the ratio of our time to each peer's. OpenCV's are remap and
/// resize, GDAL's the warper and RasterIO.
class TableReporter : public benchmark::BenchmarkReporter {
 public:
    bool ReportContext(const Context& oContext) override;
    void ReportRuns(const std::vector<Run>& voRuns) override;
    void Finalize() override;

 private:
    /// By work, then by library.
    std::map<std::string, std::map<std::string, double>> moTimes;
};

#endif  // VETRA_BENCH_TABLE_H
