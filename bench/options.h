#ifndef VETRA_BENCH_OPTIONS_H
#define VETRA_BENCH_OPTIONS_H

#include <benchmark/benchmark.h>

/// Runs the registered benchmarks in random order, so that a busy moment of the machine hits all
/// libraries alike. Options of Google Benchmark on the command line win over the defaults given.
///
/// \param nRepetitions   how often each benchmark runs
/// \param pszMinSeconds  the least time of a run
/// \return the program's exit status: 1 for an option that Google Benchmark doesn't know
int RunBenchmarks(int argc, char** argv, int nRepetitions, const char* pszMinSeconds,
                  benchmark::BenchmarkReporter& oReporter);

#endif  // VETRA_BENCH_OPTIONS_H
