// Times our resampling beside that of other libraries, interleaved in one run, and prints a table.
// Takes the options of Google Benchmark, for instance --benchmark_filter=rotated.

#include <benchmark/benchmark.h>

#include <chrono>
#include <string>
#include <vector>

#include "table.h"
#include "workload.h"

int main(int argc, char** argv) {
    for (const Work& oWork : AllWorks()) {
        for (const auto fnMake : {
                 &VetraCase,
                 &PlainCase,
#ifdef VETRA_BENCH_OPENCV
                 &OpenCvCase,
#endif
#ifdef VETRA_BENCH_GDAL
                 &GdalCase,
#endif
             }) {
            const auto fnTime = [=](benchmark::State& oState) {
                const Case oCase = fnMake(oWork);
                oCase.fnRun();  // touches every page
                for (auto _ : oState) {
                    oCase.fnRun();
                }
            };
            const Case oCase = fnMake(oWork);
            if (oCase.fnRun) {
                benchmark::RegisterBenchmark((oWork.Name() + "/" + oCase.sLibrary).c_str(), fnTime)
                    ->UseRealTime();
            }
        }
    }
    std::vector<char*> vpszArguments(argv, argv + argc);
    // Short runs in random order, so that a busy moment of the machine hits all libraries alike.
    std::string asDefaults[] = {"--benchmark_repetitions=9",
                                "--benchmark_enable_random_interleaving=true",
                                "--benchmark_min_time=0.05"};
    for (std::string& sDefault : asDefaults) {
        vpszArguments.insert(vpszArguments.begin() + 1, sDefault.data());
    }
    int nCount = static_cast<int>(vpszArguments.size());
    benchmark::Initialize(&nCount, vpszArguments.data());
    if (benchmark::ReportUnrecognizedArguments(nCount, vpszArguments.data())) {
        return 1;
    }
    TableReporter oTable;
    benchmark::RunSpecifiedBenchmarks(&oTable);
    return 0;
}
