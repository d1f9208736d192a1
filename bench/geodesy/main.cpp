// Times our geodetic conversions beside GeographicLib's Geocentric, interleaved in one run, and
// prints a table. Takes the options of Google Benchmark, for instance --benchmark_filter=orbit.

#include <benchmark/benchmark.h>

#include <cmath>
#include <cstdio>
#include <functional>
#include <map>
#include <random>
#include <string>
#include <vector>

#include "bench/options.h"
#include "vetra/base/utils/geo/ellipcalc.h"
#include "vetra/base/utils/geo/geodesy.h"
#include "vetra/textcore/formatstring.h"

#ifdef VETRA_BENCH_GEOGRAPHICLIB
#include <GeographicLib/Geocentric.hpp>
#endif

namespace {

constexpr std::size_t kPoints = 4096;
constexpr double kSemiMajor = 6378137.0;
constexpr double kEccSq = 0.00669437999014;

/// In the order of its users' arguments.
struct Triplet {
    double x, y, z;
};
/// Converts all points of the first list into the second.
using Conversion = std::function<void(const std::vector<Triplet>&, std::vector<Triplet>&)>;

template <typename Function>
Conversion EachPoint(Function fnConvert) {
    return [=](const std::vector<Triplet>& voIn, std::vector<Triplet>& voOut) {
        for (std::size_t i = 0; i < voIn.size(); ++i) {
            fnConvert(voIn[i], voOut[i]);
        }
    };
}

struct Case {
    std::string sWork;
    std::string sLibrary;
    std::vector<Triplet> voIn;
    Conversion fnRun;
};

/// Random places, uniform in longitude, latitude and height: longitude and latitude in radians.
std::vector<Triplet> RandomPlaces(double dfMinHgt, double dfMaxHgt) {
    std::mt19937_64 oRandom(1);
    const auto fnUniform = [&](double dfMin, double dfMax) {
        return std::uniform_real_distribution<double>(dfMin, dfMax)(oRandom);
    };
    std::vector<Triplet> voPlaces(kPoints);
    for (Triplet& oPlace : voPlaces) {
        oPlace = {fnUniform(-3.14, 3.14), fnUniform(-1.57, 1.57), fnUniform(dfMinHgt, dfMaxHgt)};
    }
    return voPlaces;
}

std::vector<Case> AllCases() {
    const EllipCalc oCalc(kSemiMajor, kEccSq);
    std::vector<Case> voCases;
    const struct {
        const char* pszName;
        double dfMinHgt, dfMaxHgt;
    } aoShells[] = {
        {"near the surface", -1e3, 2e4}, {"low orbits", 4e5, 1e6}, {"to 40000 km", 0, 4e7}};
    for (const auto& oShell : aoShells) {
        const std::vector<Triplet> voGeo = RandomPlaces(oShell.dfMinHgt, oShell.dfMaxHgt);
        std::vector<Triplet> voXyz(kPoints);
        const Conversion fnForward = EachPoint(
            [=](const Triplet& g, Triplet& p) { oCalc.GeoToXYZ(g.x, g.y, g.z, p.x, p.y, p.z); });
        fnForward(voGeo, voXyz);
        const std::string sForward = std::string("GeoToXYZ, ") + oShell.pszName;
        const std::string sInverse = std::string("XYZToGeo, ") + oShell.pszName;
        voCases.push_back({sForward, "EllipCalc", voGeo, fnForward});
        voCases.push_back(
            {sInverse, "EllipCalc", voXyz, EachPoint([=](const Triplet& p, Triplet& g) {
                 oCalc.XYZToGeo(p.x, p.y, p.z, g.x, g.y, g.z);
             })});
        voCases.push_back(
            {sForward, "functions", voGeo, EachPoint([](const Triplet& g, Triplet& p) {
                 GeoToXYZ(g.x, g.y, g.z, kSemiMajor, kEccSq, p.x, p.y, p.z);
             })});
        voCases.push_back(
            {sInverse, "functions", voXyz, EachPoint([](const Triplet& p, Triplet& g) {
                 XYZToGeo(p.x, p.y, p.z, kSemiMajor, kEccSq, g.x, g.y, g.z);
             })});
#ifdef VETRA_BENCH_GEOGRAPHICLIB
        // In degrees, which are its own unit.
        std::vector<Triplet> voDegrees = voGeo;
        for (Triplet& g : voDegrees) {
            g.x *= 180.0 / 3.141592653589793;
            g.y *= 180.0 / 3.141592653589793;
        }
        const GeographicLib::Geocentric& oPeer = GeographicLib::Geocentric::WGS84();
        voCases.push_back({sForward, "GeographicLib", voDegrees,
                           EachPoint([&oPeer](const Triplet& g, Triplet& p) {
                               oPeer.Forward(g.y, g.x, g.z, p.x, p.y, p.z);
                           })});
        voCases.push_back(
            {sInverse, "GeographicLib", voXyz, EachPoint([&oPeer](const Triplet& p, Triplet& g) {
                 oPeer.Reverse(p.x, p.y, p.z, g.y, g.x, g.z);
             })});
#endif
    }
    return voCases;
}

/// Prints the medians of benchmarks named "work/library": nanoseconds of processor time
/// per point.
class TableReporter : public benchmark::BenchmarkReporter {
 public:
    bool ReportContext(const Context&) override { return true; }

    void ReportRuns(const std::vector<Run>& voRuns) override {
        for (const Run& oRun : voRuns) {
            const std::string sName = oRun.run_name.function_name;
            const std::size_t nSlash = sName.rfind('/');
            if (oRun.run_type == Run::RT_Aggregate && oRun.aggregate_name == "median") {
                moTimes[sName.substr(0, nSlash)][sName.substr(nSlash + 1)] =
                    oRun.GetAdjustedCPUTime() / kPoints;
            }
        }
    }

    void Finalize() override {
        std::printf(
            "| work | EllipCalc | functions | GeographicLib | EllipCalc / its | functions / its "
            "|\n|---|---|---|---|---|---|\n");
        for (auto& [sWork, oTimes] : moTimes) {
            const double dfPeer = oTimes["GeographicLib"];
            std::string sRow = "| " + sWork;
            for (const double df : {oTimes["EllipCalc"], oTimes["functions"], dfPeer,
                                    oTimes["EllipCalc"] / dfPeer, oTimes["functions"] / dfPeer}) {
                sRow += std::isfinite(df) && df > 0.0 ? FormatString(" | %.2f", df) : " | ";
            }
            std::printf("%s |\n", sRow.c_str());
        }
    }

 private:
    /// By work, then by library.
    std::map<std::string, std::map<std::string, double>> moTimes;
};

}  // namespace

int main(int argc, char** argv) {
    const std::vector<Case> voCases = AllCases();
    for (const Case& oCase : voCases) {
        benchmark::RegisterBenchmark((oCase.sWork + "/" + oCase.sLibrary).c_str(),
                                     [&oCase](benchmark::State& oState) {
                                         std::vector<Triplet> voOut(oCase.voIn.size());
                                         for (auto _ : oState) {
                                             oCase.fnRun(oCase.voIn, voOut);
                                             benchmark::DoNotOptimize(voOut.data());
                                             benchmark::ClobberMemory();
                                         }
                                     });
    }
    TableReporter oTable;
    return RunBenchmarks(argc, argv, 31, "0.005", oTable);
}
