// Times the copies of pixels in CPU time of their one thread, each beside a plain loop over the two
// types, or memcpy where the types are the same, interleaved in one run, and prints a table of
// medians. Takes the options of Google Benchmark, for instance --benchmark_filter=32R.

#include <benchmark/benchmark.h>

#include <cstdio>
#include <cstring>
#include <map>
#include <string>
#include <tuple>
#include <type_traits>
#include <utility>
#include <vector>

#include "bench/options.h"
#include "vetra/vetra.h"

namespace {

using vetra::gobs::DataTypeAdapter;
using vetra::gobs::NativeDataTypeCode;
namespace low = vetra::utils::low;

constexpr unsigned int kCached = 16384;               // samples that stay in the caches
constexpr unsigned int kUncached = 32 * 1024 * 1024;  // samples that don't
constexpr unsigned int kChannels = 3;

// As `kCached`, but the compiler doesn't know it: a plain loop shall not be made for this one
// count.
volatile unsigned int nPlainCount = kCached;

template <NativeDataTypeCode eCode, typename Sample>
struct Type {
    using T = Sample;
    static constexpr NativeDataTypeCode kCode = eCode;
};
using Types =
    std::tuple<Type<vetra::gobs::eDT_8U, unsigned char>, Type<vetra::gobs::eDT_8S, signed char>,
               Type<vetra::gobs::eDT_16U, unsigned short>, Type<vetra::gobs::eDT_16S, short>,
               Type<vetra::gobs::eDT_32U, unsigned int>, Type<vetra::gobs::eDT_32S, int>,
               Type<vetra::gobs::eDT_32R, float>, Type<vetra::gobs::eDT_64R, double>>;

// Of each work, in the order of the table.
std::vector<std::pair<std::string, unsigned int>> vWorks;

// Runs fnOurs and fnPeer, which each write nSamples.
template <typename Ours, typename Peer>
void Register(const std::string& sWork, unsigned int nSamples, Ours fnOurs, Peer fnPeer) {
    vWorks.emplace_back(sWork, nSamples);
    const auto fnRegister = [&](const char* pszLibrary, auto fnRun) {
        benchmark::RegisterBenchmark((sWork + pszLibrary).c_str(),
                                     [fnRun](benchmark::State& oState) {
                                         for (auto _ : oState) {
                                             fnRun();
                                             benchmark::ClobberMemory();
                                         }
                                     });
    };
    fnRegister("/vetra", fnOurs);
    fnRegister("/peer", fnPeer);
}

// Small values, which every type has.
template <typename T>
std::vector<T>& In() {
    static std::vector<T> vValues;
    while (vValues.size() < kCached) {
        vValues.push_back(static_cast<T>(vValues.size() % 101));
    }
    return vValues;
}

template <typename T>
std::vector<T>& Out() {
    static std::vector<T> vValues(kCached);
    return vValues;
}

template <typename T>
unsigned char* Bytes(std::vector<T>& vValues) {
    return reinterpret_cast<unsigned char*>(vValues.data());
}

template <typename Tin, typename Tout>
[[gnu::noinline]] void PlainLoop(Tout* paOut, const Tin* paIn, unsigned int nCount) {
    for (unsigned int i = 0; i < nCount; ++i) {
        paOut[i] = static_cast<Tout>(paIn[i]);
    }
}

template <typename Tin, typename Tout>
[[gnu::noinline]] void PlainRaster(Tout* paOut, const Tin* paIn, unsigned int nNumPix) {
    for (unsigned int k = 0; k < nNumPix; ++k) {
        for (unsigned int j = 0; j < kChannels; ++j) {
            paOut[k * kChannels + j] = static_cast<Tout>(paIn[j]);
        }
    }
}

template <typename From, typename To>
void RegisterPair() {
    using Tin = typename From::T;
    using Tout = typename To::T;
    const auto fnOurs = [] {
        low::CopyPixel(Bytes(Out<Tout>()), Bytes(In<Tin>()), To::kCode, From::kCode, kCached);
    };
    const std::string sWork = DataTypeAdapter::TypeToString(From::kCode) + " to " +
                              DataTypeAdapter::TypeToString(To::kCode);
    if constexpr (std::is_same_v<Tin, Tout>) {
        Register(sWork + ", beside memcpy", kCached, fnOurs,
                 [] { std::memcpy(Bytes(Out<Tout>()), Bytes(In<Tin>()), kCached * sizeof(Tin)); });
    } else {
        Register(sWork, kCached, fnOurs,
                 [] { PlainLoop(Out<Tout>().data(), In<Tin>().data(), nPlainCount); });
    }
}

void RegisterMemory() {
    static std::vector<float> vfIn(kUncached, 1.0f);
    static std::vector<float> vfOut(kUncached);
    Register(
        "32R to 32R in memory, beside memcpy", kUncached,
        [] { low::CopyPixel(Bytes(vfOut), Bytes(vfIn), vetra::gobs::eDT_32R, kUncached); },
        [] { std::memcpy(Bytes(vfOut), Bytes(vfIn), kUncached * sizeof(float)); });
}

template <typename From, typename To>
void RegisterRaster() {
    using Tin = typename From::T;
    using Tout = typename To::T;
    constexpr unsigned int nNumPix = kCached / kChannels;
    Register(
        DataTypeAdapter::TypeToString(From::kCode) + " to " +
            DataTypeAdapter::TypeToString(To::kCode) + ", one pixel of 3 to a raster",
        nNumPix * kChannels,
        [] {
            low::CopyPixelToRaster(Bytes(Out<Tout>()), Bytes(In<Tin>()), To::kCode, From::kCode,
                                   kChannels, nNumPix);
        },
        [] { PlainRaster(Out<Tout>().data(), In<Tin>().data(), nPlainCount / kChannels); });
}

class TableReporter : public benchmark::BenchmarkReporter {
 public:
    bool ReportContext(const Context&) override { return true; }

    void ReportRuns(const std::vector<Run>& voRuns) override {
        for (const Run& oRun : voRuns) {
            if (oRun.run_type == Run::RT_Aggregate && oRun.aggregate_name == "median") {
                moTimes[oRun.run_name.function_name] = oRun.GetAdjustedCPUTime();
            }
        }
    }

    void Finalize() override {
        std::printf(
            "| work | vetra, ns per sample | plain loop, ns | ratio |\n|---|---|---|---|\n");
        for (const auto& [sWork, nSamples] : vWorks) {
            const double dfOurs = moTimes[sWork + "/vetra"];
            const double dfPeer = moTimes[sWork + "/peer"];
            if (dfOurs > 0.0 && dfPeer > 0.0) {
                std::printf("| %s | %.3f | %.3f | %.2f |\n", sWork.c_str(), dfOurs / nSamples,
                            dfPeer / nSamples, dfOurs / dfPeer);
            }
        }
    }

 private:
    std::map<std::string, double> moTimes;
};

}  // namespace

int main(int argc, char** argv) {
    std::apply(
        []<typename... From>(From...) {
            const auto fnTargets = []<typename F>(F) {
                std::apply([]<typename... To>(To...) { (RegisterPair<F, To>(), ...); }, Types{});
            };
            (fnTargets(From{}), ...);
        },
        Types{});
    RegisterRaster<Type<vetra::gobs::eDT_8U, unsigned char>,
                   Type<vetra::gobs::eDT_8U, unsigned char>>();
    RegisterRaster<Type<vetra::gobs::eDT_64R, double>, Type<vetra::gobs::eDT_32R, float>>();
    RegisterMemory();
    TableReporter oTable;
    return RunBenchmarks(argc, argv, 25, "0.002", oTable);
}
