// Times grids, polynomials and the convex hull, the last beside OpenCV's, interleaved in one run,
// and prints a table of medians. Takes the options of Google Benchmark, for instance
// --benchmark_filter=hull.

#include <benchmark/benchmark.h>

#include <cmath>
#include <cstdio>
#include <map>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "bench/options.h"
#include "vetra/vetra.h"

#ifdef VETRA_BENCH_OPENCV
#include <opencv2/imgproc.hpp>
#endif

namespace {

constexpr std::size_t kPositions = 4096;
constexpr std::size_t kPoints = 1000000;
constexpr int kVertices = 50;

// Of works that take many positions at a time; others are one of their kind.
std::map<std::string, double> oOperations;

template <typename Function>
void Register(const std::string& sWork, const std::string& sLibrary, std::size_t nOperations,
              Function fnRun) {
    oOperations[sWork] = static_cast<double>(nOperations);
    benchmark::RegisterBenchmark((sWork + "/" + sLibrary).c_str(),
                                 [fnRun](benchmark::State& oState) {
                                     for (auto _ : oState) {
                                         fnRun();
                                         benchmark::ClobberMemory();
                                     }
                                 });
}

std::vector<double> Random(std::size_t nCount) {
    std::mt19937 oRandom(20240607);
    std::uniform_real_distribution<double> oRange(0.0, 1.0);
    std::vector<double> vdf(nCount);
    for (double& df : vdf) {
        df = oRange(oRandom);
    }
    return vdf;
}

// Random positions in a grid that fits the second-level cache.
void RegisterGrid() {
    static InterpGrid3D oGrid;
    static const std::vector<double> vdfAt = Random(kPositions * 3);
    static std::vector<double> vdfOut(kPositions * 3);
    oGrid.SetDimension(3);
    oGrid.LayoutGrid(0.0, 0.0, 0.0, 1.0, 1.0, 1.0, 0.0625, 0.0625, 0.0625);
    for (std::size_t i = 0; i < oGrid.GetNumGridPoints() * 3; ++i) {
        oGrid.GetArray()[i] = static_cast<double>(i);
    }
    Register("value in a grid of 17 x 17 x 17 vectors of 3", "vetra", kPositions, [] {
        for (std::size_t i = 0; i < vdfAt.size(); i += 3) {
            oGrid.GetVal(vdfAt[i], vdfAt[i + 1], vdfAt[i + 2], &vdfOut[i]);
        }
    });
}

void RegisterPolynomials() {
    static const std::vector<double> vdfAt = Random(kPositions * 2);
    static std::vector<double> vdfOut(kPositions);
    for (const int nOrder : {3, 5, 6}) {
        const auto nNumCoeffs = static_cast<std::size_t>(Poly2D::GetNumCoeffsForOrder(nOrder));
        const Poly2D oPoly(nOrder, std::vector<double>(nNumCoeffs, 0.5));
        Register("value of a polynomial in two variables, order " + std::to_string(nOrder), "vetra",
                 kPositions, [oPoly] {
                     for (std::size_t i = 0; i < kPositions; ++i) {
                         vdfOut[i] = oPoly.GetValue(vdfAt[2 * i], vdfAt[2 * i + 1]);
                     }
                 });
    }
}

// Random points inside a regular polygon, and its corners.
std::vector<std::pair<double, double>> PolygonPoints() {
    const double dfStep = 2.0 * std::acos(-1.0) / kVertices;
    const double dfInside = std::cos(0.5 * dfStep);
    std::vector<std::pair<double, double>> voPoints;
    const std::vector<double> vdf = Random((kPoints - kVertices) * 2);
    for (std::size_t i = 0; i < vdf.size(); i += 2) {
        const double r = 0.999 * dfInside * std::sqrt(vdf[i]);
        const double a = vdf[i + 1] * kVertices * dfStep;
        voPoints.emplace_back(r * std::cos(a), r * std::sin(a));
    }
    for (int k = 0; k < kVertices; ++k) {
        voPoints.emplace_back(std::cos(k * dfStep), std::sin(k * dfStep));
    }
    return voPoints;
}

void RegisterHull() {
    static const auto voPoints = PolygonPoints();
    const std::string sWork = "hull of 1000000 points, 50 vertices";
    Register(sWork, "vetra", 1, [] {
        if (ConvexHull(voPoints).GetConvexHull().size() != kVertices) {
            std::fprintf(stderr, "the hull is wrong\n");
        }
    });
#ifdef VETRA_BENCH_OPENCV
    static std::vector<cv::Point2f> voFloat;
    for (const auto& [x, y] : voPoints) {
        voFloat.emplace_back(static_cast<float>(x), static_cast<float>(y));
    }
    static std::vector<cv::Point2f> voHull;
    Register(sWork, "OpenCV", 1, [] { cv::convexHull(voFloat, voHull); });
#endif
}

class TableReporter : public benchmark::BenchmarkReporter {
 public:
    bool ReportContext(const Context&) override { return true; }

    void ReportRuns(const std::vector<Run>& voRuns) override {
        for (const Run& oRun : voRuns) {
            if (oRun.run_type == Run::RT_Aggregate && oRun.aggregate_name == "median") {
                const std::string& sName = oRun.run_name.function_name;
                const std::size_t nSlash = sName.rfind('/');
                moTimes[sName.substr(0, nSlash)][sName.substr(nSlash + 1)] =
                    oRun.GetAdjustedRealTime();
            }
        }
    }

    void Finalize() override {
        std::printf("| work | vetra, ns | OpenCV, ns | ours / OpenCV's |\n|---|---|---|---|\n");
        for (auto& [sWork, oTimes] : moTimes) {
            const double dfOurs = oTimes["vetra"] / oOperations[sWork];
            const double dfPeer = oTimes["OpenCV"] / oOperations[sWork];
            const std::string sPeer =
                dfPeer > 0.0 ? FormatString("%.1f | %.2f", dfPeer, dfOurs / dfPeer) : "|";
            std::printf("| %s | %.1f | %s |\n", sWork.c_str(), dfOurs, sPeer.c_str());
        }
    }

 private:
    /// By work, then by library.
    std::map<std::string, std::map<std::string, double>> moTimes;
};

}  // namespace

int main(int argc, char** argv) {
    RegisterGrid();
    RegisterPolynomials();
    RegisterHull();
    TableReporter oTable;
    return RunBenchmarks(argc, argv, 9, "0.05", oTable);
}
