// Times our rotations and quaternions beside those of Eigen, interleaved in one run, and prints a
// table. Takes the options of Google Benchmark, for instance --benchmark_filter=matrix.

#include <benchmark/benchmark.h>

#include <array>
#include <cmath>
#include <cstdio>
#include <map>
#include <random>
#include <string>
#include <vector>

#include "bench/options.h"
#include "vetra/vetra.h"

#ifdef VETRA_BENCH_EIGEN
#include <Eigen/Geometry>
#endif

namespace {

using vetra::qtn::Quaternion;

// As many as stay in the first-level cache.
constexpr std::size_t kCount = 256;

/// The same random rotations in every form.
struct Rotations {
    std::vector<std::array<double, 4>> vQuats{kCount};
    std::vector<std::array<double, 4>> vAxisAngles{kCount};
    std::vector<std::array<double, 3>> vAngles{kCount};
    std::vector<std::array<double, 9>> vMatrices{kCount};

    Rotations() {
        std::mt19937 oRandom(20240607);
        std::uniform_real_distribution<double> oAngle(-3.0, 3.0);
        for (std::size_t i = 0; i < kCount; ++i) {
            vAngles[i] = {oAngle(oRandom), 0.5 * oAngle(oRandom), oAngle(oRandom)};
            const double* padf = vAngles[i].data();
            ConvertRotation(eRT_ZYX, padf, eRT_QUATERNION, vQuats[i].data());
            ConvertRotation(eRT_ZYX, padf, eRT_AXIS_ANGLE, vAxisAngles[i].data());
            ConvertRotation(eRT_ZYX, padf, eRT_MATRIX, vMatrices[i].data());
        }
    }
};

const Rotations& In() {
    static const Rotations oRotations;
    return oRotations;
}

Rotations& Out() {
    static Rotations oRotations;
    return oRotations;
}

template <typename Function>
void Run(benchmark::State& oState, Function fnOne) {
    for (auto _ : oState) {
        for (std::size_t i = 0; i < kCount; ++i) {
            fnOne(i);
        }
        benchmark::ClobberMemory();
    }
}

template <typename Function>
void Register(const std::string& sName, Function fnOne) {
    benchmark::RegisterBenchmark(sName.c_str(),
                                 [fnOne](benchmark::State& oState) { Run(oState, fnOne); });
}

std::size_t Next(std::size_t i) { return (i + 1) % kCount; }

template <typename From, typename To>
auto Ours(RotationType eFrom, From mvFrom, RotationType eTo, To mvTo) {
    const auto* pFrom = (In().*mvFrom).data();
    auto* pTo = (Out().*mvTo).data();
    return [=](std::size_t i) { ConvertRotation(eFrom, pFrom[i].data(), eTo, pTo[i].data()); };
}

std::vector<Quaternion> Quaternions() {
    std::vector<Quaternion> vo;
    for (const auto& q : In().vQuats) {
        vo.emplace_back(q[0], q[1], q[2], q[3]);
    }
    return vo;
}

void RegisterOurs() {
    const Rotations& oIn = In();
    Rotations& oOut = Out();
    Register("product of quaternions (arrays)/vetra", [&](std::size_t i) {
        QuatMult(oIn.vQuats[i].data(), oIn.vQuats[Next(i)].data(), oOut.vQuats[i].data());
    });
    static const std::vector<Quaternion> voQuats = Quaternions();
    static std::vector<Quaternion> voProducts(kCount);
    Register("product of quaternions (objects)/vetra",
             [&](std::size_t i) { voProducts[i] = voQuats[i] * voQuats[Next(i)]; });
    Register("quaternion to matrix/vetra",
             Ours(eRT_QUATERNION, &Rotations::vQuats, eRT_MATRIX, &Rotations::vMatrices));
    Register("matrix to quaternion/vetra",
             Ours(eRT_MATRIX, &Rotations::vMatrices, eRT_QUATERNION, &Rotations::vQuats));
    Register("axis and angle to matrix/vetra",
             Ours(eRT_AXIS_ANGLE, &Rotations::vAxisAngles, eRT_MATRIX, &Rotations::vMatrices));
    Register("matrix to axis and angle/vetra",
             Ours(eRT_MATRIX, &Rotations::vMatrices, eRT_AXIS_ANGLE, &Rotations::vAxisAngles));
    Register("axis and angle to quaternion/vetra",
             Ours(eRT_AXIS_ANGLE, &Rotations::vAxisAngles, eRT_QUATERNION, &Rotations::vQuats));
    Register("quaternion to axis and angle/vetra",
             Ours(eRT_QUATERNION, &Rotations::vQuats, eRT_AXIS_ANGLE, &Rotations::vAxisAngles));
    Register("Euler angles to matrix/vetra",
             Ours(eRT_ZYX, &Rotations::vAngles, eRT_MATRIX, &Rotations::vMatrices));
    Register("matrix to Euler angles/vetra",
             Ours(eRT_MATRIX, &Rotations::vMatrices, eRT_ZYX, &Rotations::vAngles));
    Register("Euler angles to quaternion/vetra",
             Ours(eRT_ZYX, &Rotations::vAngles, eRT_QUATERNION, &Rotations::vQuats));
    Register("quaternion to Euler angles/vetra",
             Ours(eRT_QUATERNION, &Rotations::vQuats, eRT_ZYX, &Rotations::vAngles));
}

#ifdef VETRA_BENCH_EIGEN
// The same numbers in Eigen's types. Its matrices are the transposed ones, by columns: the same in
// memory.
struct EigenRotations {
    std::vector<Eigen::Quaterniond> vQuats{kCount};
    std::vector<Eigen::AngleAxisd> vAxisAngles{kCount};
    std::vector<Eigen::Vector3d> vAngles{kCount};
    std::vector<Eigen::Matrix3d> vMatrices{kCount};

    EigenRotations() {
        for (std::size_t i = 0; i < kCount; ++i) {
            vQuats[i] = Eigen::Map<const Eigen::Quaterniond>(In().vQuats[i].data());
            vAxisAngles[i] = Eigen::AngleAxisd(vQuats[i]);
            vAngles[i] = Eigen::Map<const Eigen::Vector3d>(In().vAngles[i].data());
            vMatrices[i] = Eigen::Map<const Eigen::Matrix3d>(In().vMatrices[i].data());
        }
    }
};

Eigen::Quaterniond EulerToEigen(const Eigen::Vector3d& v) {
    return Eigen::AngleAxisd(v[2], Eigen::Vector3d::UnitZ()) *
           Eigen::AngleAxisd(v[1], Eigen::Vector3d::UnitY()) *
           Eigen::AngleAxisd(v[0], Eigen::Vector3d::UnitX());
}

void RegisterEigens() {
    static const EigenRotations oIn;
    static EigenRotations oOut;
    for (const char* pszKind : {"arrays", "objects"}) {
        Register(std::string("product of quaternions (") + pszKind + ")/Eigen",
                 [](std::size_t i) { oOut.vQuats[i] = oIn.vQuats[i] * oIn.vQuats[Next(i)]; });
    }
    Register("quaternion to matrix/Eigen",
             [](std::size_t i) { oOut.vMatrices[i] = oIn.vQuats[i].toRotationMatrix(); });
    Register("matrix to quaternion/Eigen",
             [](std::size_t i) { oOut.vQuats[i] = Eigen::Quaterniond(oIn.vMatrices[i]); });
    Register("axis and angle to matrix/Eigen",
             [](std::size_t i) { oOut.vMatrices[i] = oIn.vAxisAngles[i].toRotationMatrix(); });
    Register("matrix to axis and angle/Eigen",
             [](std::size_t i) { oOut.vAxisAngles[i] = Eigen::AngleAxisd(oIn.vMatrices[i]); });
    Register("axis and angle to quaternion/Eigen",
             [](std::size_t i) { oOut.vQuats[i] = Eigen::Quaterniond(oIn.vAxisAngles[i]); });
    Register("quaternion to axis and angle/Eigen",
             [](std::size_t i) { oOut.vAxisAngles[i] = Eigen::AngleAxisd(oIn.vQuats[i]); });
    Register("Euler angles to matrix/Eigen", [](std::size_t i) {
        oOut.vMatrices[i] = EulerToEigen(oIn.vAngles[i]).toRotationMatrix();
    });
    Register("matrix to Euler angles/Eigen",
             [](std::size_t i) { oOut.vAngles[i] = oIn.vMatrices[i].eulerAngles(2, 1, 0); });
    Register("Euler angles to quaternion/Eigen",
             [](std::size_t i) { oOut.vQuats[i] = EulerToEigen(oIn.vAngles[i]); });
    Register("quaternion to Euler angles/Eigen", [](std::size_t i) {
        oOut.vAngles[i] = oIn.vQuats[i].toRotationMatrix().eulerAngles(2, 1, 0);
    });
}
#endif

/// Prints the medians of benchmarks named "work/library": nanoseconds for one result.
class TableReporter : public benchmark::BenchmarkReporter {
 public:
    bool ReportContext(const Context&) override { return true; }

    void ReportRuns(const std::vector<Run>& voRuns) override {
        for (const Run& oRun : voRuns) {
            if (oRun.run_type == Run::RT_Aggregate && oRun.aggregate_name == "median") {
                const std::string& sName = oRun.run_name.function_name;
                const std::size_t nSlash = sName.rfind('/');
                moTimes[sName.substr(0, nSlash)][sName.substr(nSlash + 1)] =
                    oRun.GetAdjustedCPUTime() / static_cast<double>(kCount);
            }
        }
    }

    void Finalize() override {
        const auto fnCell = [](const char* pszFormat, double df) {
            return df > 0.0 && std::isfinite(df) ? FormatString(pszFormat, df) : std::string();
        };
        std::puts("| work | vetra, ns | Eigen, ns | ours / Eigen's |\n|---|---|---|---|");
        for (auto& [sWork, oTimes] : moTimes) {
            const double dfOurs = oTimes["vetra"];
            const double dfEigens = oTimes["Eigen"];
            std::printf("| %s | %s | %s | %s |\n", sWork.c_str(), fnCell("%.1f", dfOurs).c_str(),
                        fnCell("%.1f", dfEigens).c_str(),
                        fnCell("%.2f", dfOurs / dfEigens).c_str());
        }
    }

 private:
    std::map<std::string, std::map<std::string, double>> moTimes;
};

}  // namespace

int main(int argc, char** argv) {
    RegisterOurs();
#ifdef VETRA_BENCH_EIGEN
    RegisterEigens();
#endif
    TableReporter oTable;
    return RunBenchmarks(argc, argv, 15, "0.01", oTable);
}
