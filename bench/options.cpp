#include "bench/options.h"

#include <string>
#include <vector>

int RunBenchmarks(int argc, char** argv, int nRepetitions, const char* pszMinSeconds,
                  benchmark::BenchmarkReporter& oReporter) {
    std::string asDefaults[] = {"--benchmark_repetitions=" + std::to_string(nRepetitions),
                                "--benchmark_enable_random_interleaving=true",
                                std::string("--benchmark_min_time=").append(pszMinSeconds)};
    std::vector<char*> vpszArguments(argv, argv + argc);
    for (std::string& sDefault : asDefaults) {
        vpszArguments.insert(vpszArguments.begin() + 1, sDefault.data());
    }
    int nCount = static_cast<int>(vpszArguments.size());
    benchmark::Initialize(&nCount, vpszArguments.data());
    if (benchmark::ReportUnrecognizedArguments(nCount, vpszArguments.data())) {
        return 1;
    }
    benchmark::RunSpecifiedBenchmarks(&oReporter);
    return 0;
}
