// Times our resampling beside that of other libraries, interleaved in one run, and prints a table.
// Takes the options of Google Benchmark, for instance --benchmark_filter=rotated.

#include <benchmark/benchmark.h>

#include <chrono>
#include <string>
#include <vector>

#include "bench/options.h"
#include "table.h"
#include "workload.h"

int main(int argc, char** argv) {
    for (const Work& oWork : AllWorks()) {
        for (const auto fnMake : {
                 &VetraCase,
                 &PlainCase,
#ifdef VETRA_BENCH_BARE
                 &BareCase,
#endif
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
    TableReporter oTable;
    return RunBenchmarks(argc, argv, 9, "0.05", oTable);
}
