// Times our Fourier transforms beside FFTW (single precision, planned with FFTW_MEASURE, one
// thread), and HostDensify beside a plain pass over the same memory, interleaved in one run, and
// prints a table of medians. Takes the options of Google Benchmark, for instance
// --benchmark_filter=65536.

#include <benchmark/benchmark.h>
#include <omp.h>

#include <cmath>
#include <cstdio>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "bench/options.h"
#include "vetra/vetra.h"
#ifdef VETRA_BENCH_FFTW
#include <fftw3.h>
#endif

namespace {

using Samples = std::vector<FFTComplex>;
using Run = std::function<void()>;

constexpr const char* kFftw = "FFTW";
constexpr const char* kMemory = "plain pass";

Samples MakeSamples(std::size_t n) {
    Samples voData(n);
    for (std::size_t i = 0; i < n; ++i) {
        voData[i] = {std::sin(static_cast<float>(i)), std::cos(static_cast<float>(3 * i))};
    }
    return voData;
}

struct Data {
    explicit Data(std::size_t n) : voOriginal(MakeSamples(n)), voData(voOriginal) {}

    // A transform works on the result of the one before. Now and then it starts anew, so that no
    // number leaves the ordinary range.
    FFTComplex* Fresh() {
        if (++nRuns % 10 == 0) {
            voData = voOriginal;
        }
        return voData.data();
    }

    Samples voOriginal;
    Samples voData;
    int nRuns = 0;
};

Run TableRun(int m) {
    const int n = 1 << m;
    const auto poData = std::make_shared<Data>(static_cast<std::size_t>(n));
    const auto poWork = std::make_shared<std::vector<float>>(2 * static_cast<std::size_t>(n));
    const auto poTable = std::make_shared<std::vector<float>>(static_cast<std::size_t>(n));
    InitSinCosTable(n, poTable->data());
    return [=] { CDFT1d(n, m, &poData->Fresh()->re, poWork->data(), poTable->data(), true); };
}

Run InPlaceRun(int m) {
    const int n = 1 << m;
    const auto poData = std::make_shared<Data>(static_cast<std::size_t>(n));
    const auto poIp = std::make_shared<std::vector<int>>(2 + (1 << (m + 1) / 2));
    const auto poW = std::make_shared<std::vector<float>>(static_cast<std::size_t>(n));
    return [=] { ComplexDFT1d(n, true, poData->Fresh(), poIp->data(), poW->data()); };
}

Run TableRun2d(int n, int nThreads) {
    const auto poData = std::make_shared<Data>(static_cast<std::size_t>(n) * n);
    const auto poTable = std::make_shared<std::vector<float>>(static_cast<std::size_t>(n));
    InitSinCosTable(n, poTable->data());
    return [=] {
        omp_set_num_threads(nThreads);
        CDFT2d(n, poData->Fresh(), poTable->data(), true);
    };
}

Run InPlaceRun2d(int n) {
    const auto poData = std::make_shared<Data>(static_cast<std::size_t>(n) * n);
    const auto poColumn = std::make_shared<Samples>(n);
    const auto poIp = std::make_shared<std::vector<int>>(2 + n);
    const auto poW = std::make_shared<std::vector<float>>(n);
    return [=] {
        ComplexDFT2d(n, n, true, poData->Fresh(), poColumn->data(), poIp->data(), poW->data());
    };
}

#ifdef VETRA_BENCH_FFTW
// In place, like ours.
Run FftwRun(std::vector<int> vnSizes) {
    std::size_t n = 1;
    for (const int nSize : vnSizes) {
        n *= static_cast<std::size_t>(nSize);
    }
    const auto poData = std::make_shared<Data>(n);
    // Planning overwrites the data, which the first runs don't mind.
    auto* pData = reinterpret_cast<fftwf_complex*>(poData->voData.data());
    const std::shared_ptr<fftwf_plan_s> poPlan(
        fftwf_plan_dft(static_cast<int>(vnSizes.size()), vnSizes.data(), pData, pData, FFTW_FORWARD,
                       FFTW_MEASURE),
        &fftwf_destroy_plan);
    poData->voData = poData->voOriginal;
    return [=] {
        poData->Fresh();
        fftwf_execute(poPlan.get());
    };
}
#endif

Run DensifyRun(int nSize, int nRowStep, int nColStep, int nThreads) {
    const auto poGrid =
        std::make_shared<std::vector<float>>(static_cast<std::size_t>(nSize) * nSize, 1.5f);
    return [=] {
        omp_set_num_threads(nThreads);
        vetra::utils::math::HostDensify(poGrid->data(), nSize, nSize, nRowStep, nColStep);
    };
}

// What the memory allows: every sample is read and written once.
Run PlainPassRun(int nSize) {
    const auto poGrid =
        std::make_shared<std::vector<float>>(static_cast<std::size_t>(nSize) * nSize, 1.5f);
    return [=] {
        for (float& f : *poGrid) {
            f = f * 0.5f + 0.75f;
        }
        benchmark::ClobberMemory();
    };
}

struct Work {
    std::string sName;
    std::function<Run()> fnOurs;
    std::string sPeer;
    std::function<Run()> fnPeer;
};

std::vector<Work> AllWorks() {
    std::vector<Work> voWorks;
    const auto fnFftw = [](std::vector<int> vnSizes) -> std::function<Run()> {
#ifdef VETRA_BENCH_FFTW
        return [=] { return FftwRun(vnSizes); };
#else
        static_cast<void>(vnSizes);
        return nullptr;
#endif
    };
    for (const int m : {6, 10, 13, 16, 20}) {
        voWorks.push_back({FormatString("CDFT1d %d", 1 << m), [=] { return TableRun(m); }, kFftw,
                           fnFftw({1 << m})});
        voWorks.push_back({FormatString("ComplexDFT1d %d", 1 << m), [=] { return InPlaceRun(m); },
                           kFftw, fnFftw({1 << m})});
    }
    for (const int nThreads : {1, 2}) {
        voWorks.push_back({FormatString("CDFT2d 2048 x 2048, threads: %d", nThreads),
                           [=] { return TableRun2d(2048, nThreads); }, kFftw,
                           fnFftw({2048, 2048})});
    }
    voWorks.push_back({"ComplexDFT2d 2048 x 2048", [] { return InPlaceRun2d(2048); }, kFftw,
                       fnFftw({2048, 2048})});
    for (const auto& [nRowStep, nColStep] :
         std::vector<std::pair<int, int>>{{8, 8}, {2, 2}, {1, 16}, {1, 2}, {16, 1}}) {
        voWorks.push_back(
            {FormatString("HostDensify 4096 x 4096, steps %d and %d", nRowStep, nColStep),
             [=] { return DensifyRun(4096, nRowStep, nColStep, 1); }, kMemory,
             [] { return PlainPassRun(4096); }});
    }
    return voWorks;
}

// Medians of "work/ours" and "work/peer".
class TableReporter : public benchmark::BenchmarkReporter {
 public:
    bool ReportContext(const Context&) override { return true; }
    void ReportRuns(const std::vector<Run>& voRuns) override {
        for (const Run& oRun : voRuns) {
            if (oRun.run_type == Run::RT_Aggregate && oRun.aggregate_name == "median") {
                moTimes[oRun.run_name.function_name] = oRun.GetAdjustedRealTime();
            }
        }
    }
    void Finalize() override {
        std::printf(
            "| work | vetra, us | peer, us | peer | ours / peer's |\n|---|---|---|---|---|\n");
        for (const Work& oWork : AllWorks()) {
            const double dfOurs = moTimes[oWork.sName + "/ours"] / 1e3;
            const double dfPeer = moTimes[oWork.sName + "/peer"] / 1e3;
            if (dfOurs > 0.0 && dfPeer > 0.0) {
                std::printf("| %s | %.2f | %.2f | %s | %.2f |\n", oWork.sName.c_str(), dfOurs,
                            dfPeer, oWork.sPeer.c_str(), dfOurs / dfPeer);
            } else if (dfOurs > 0.0) {
                std::printf("| %s | %.2f | | | |\n", oWork.sName.c_str(), dfOurs);
            }
        }
    }

 private:
    std::map<std::string, double> moTimes;
};

void Register(const std::string& sName, const std::function<Run()>& fnMake) {
    if (!fnMake) {
        return;
    }
    const auto fnTime = [=](benchmark::State& oState) {
        const Run fnRun = fnMake();
        fnRun();  // touches every page and builds what is kept
        for (auto _ : oState) {
            fnRun();
        }
    };
    benchmark::RegisterBenchmark(sName.c_str(), fnTime)->UseRealTime();
}

}  // namespace

int main(int argc, char** argv) {
    for (const Work& oWork : AllWorks()) {
        Register(oWork.sName + "/ours", oWork.fnOurs);
        Register(oWork.sName + "/peer", oWork.fnPeer);
    }
    TableReporter oTable;
    return RunBenchmarks(argc, argv, 9, "0.02", oTable);
}
