#include "vetra/base/utils/math/hostdensify.h"

#include <gtest/gtest.h>
#include <omp.h>

#include <cmath>
#include <cstring>
#include <limits>
#include <random>
#include <vector>

#include "tests/support/refusal.h"
#include "vetra/base/utils/math/densify/rows.h"

namespace vetra::tests {
namespace {

using utils::math::HostDensify;
namespace densify = utils::math::densify;

// The plain formula, sample by sample.
std::vector<float> PlainDensify(const std::vector<float>& d, int nRows, int nCols, int nRowStep,
                                int nColStep) {
    std::vector<float> vfOut = d;
    const auto fnAt = [=](int nRow, int nCol) {
        return static_cast<std::size_t>(nRow) * static_cast<std::size_t>(nCols) +
               static_cast<std::size_t>(nCol);
    };
    const auto fnNext = [](int n0, int nStep, int nCount) {
        return nStep > nCount - 1 - n0 ? nCount - 1 : n0 + nStep;
    };
    for (int nRow = 0; nRow < nRows; ++nRow) {
        for (int nCol = 0; nCol < nCols; ++nCol) {
            const int r0 = nRow / nRowStep * nRowStep;
            const int r1 = fnNext(r0, nRowStep, nRows);
            const int c0 = nCol / nColStep * nColStep;
            const int c1 = fnNext(c0, nColStep, nCols);
            if ((nRow == r0 || nRow == r1) && (nCol == c0 || nCol == c1)) {
                continue;
            }
            const float fx =
                c1 == c0 ? 0.0f : static_cast<float>(nCol - c0) / static_cast<float>(c1 - c0);
            const float fy =
                r1 == r0 ? 0.0f : static_cast<float>(nRow - r0) / static_cast<float>(r1 - r0);
            vfOut[fnAt(nRow, nCol)] =
                (1 - fy) * ((1 - fx) * d[fnAt(r0, c0)] + fx * d[fnAt(r0, c1)]) +
                fy * ((1 - fx) * d[fnAt(r1, c0)] + fx * d[fnAt(r1, c1)]);
        }
    }
    return vfOut;
}

TEST(HostDensify, HasTheBitsOfThePlainFormula) {
    constexpr int kMost = std::numeric_limits<int>::max();
    struct Case {
        int nRows;
        int nCols;
        int nRowStep;
        int nColStep;
    };
    const Case aoCases[] = {
        {1, 1, 1, 1},       {5, 5, 2, 2},          {4, 4, 2, 2},         {7, 9, 1, 1},
        {1, 10, 3, 4},      {10, 1, 4, 3},         {2, 2, kMost, kMost}, {33, 70, 1, 7},
        {65, 31, 8, 1},     {40, 1023, 7, 5},      {41, 1025, 5, 2},     {17, 3000, 4, 1024},
        {300, 2049, 1, 2},  {9, 2500, kMost, 999}, {64, 64, 63, 63},     {64, 64, 64, 64},
        {3, 4097, 2, 3},    {2, 8195, 1, 4},       {4, 4200, 1, 6},      {5, 4104, 2, 8},
        {2, 9001, 1, 5000}, {200, 130, 7, 6},      {100, 90, 90, 7},     {160, 45, 64, 5},
    };
    const int nMaxThreads = omp_get_max_threads();
    for (const Case& o : aoCases) {
        const auto [nRows, nCols, nRowStep, nColStep] = o;
        std::mt19937 oRandom(static_cast<unsigned>(nRows * nCols));
        std::uniform_real_distribution<float> oUniform(-1.0f, 1.0f);
        std::vector<float> vfData(static_cast<std::size_t>(nRows * nCols));
        for (float& f : vfData) {
            f = oUniform(oRandom) < 0.5f ? oUniform(oRandom) : -0.0f;
        }
        vfData[vfData.size() / 2] = std::numeric_limits<float>::infinity();
        const std::vector<float> vfPlain = PlainDensify(vfData, nRows, nCols, nRowStep, nColStep);
        const auto fnExpectPlain = [&](const std::vector<float>& vfOurs) {
            for (std::size_t i = 0; i < vfOurs.size(); ++i) {
                // Which of several NaN comes out depends on the processor.
                if (!(std::isnan(vfOurs[i]) && std::isnan(vfPlain[i])) &&
                    std::memcmp(&vfOurs[i], &vfPlain[i], sizeof(float)) != 0) {
                    ADD_FAILURE() << o.nRows << " x " << o.nCols << " by " << o.nRowStep << ", "
                                  << o.nColStep << ": sample " << i;
                    return;
                }
            }
        };
        for (const int nThreads : {1, 2, 5}) {
            omp_set_num_threads(nThreads);
            std::vector<float> vfOurs = vfData;
            HostDensify(vfOurs.data(), nRows, nCols, nRowStep, nColStep);
            fnExpectPlain(vfOurs);
        }
        for (const utils::low::Level eLevel : utils::low::GetSupportedLevels()) {
            std::vector<float> vfOurs = vfData;
            densify::GetRows(eLevel).pfnFill({vfOurs.data(), nRows, nCols, nRowStep, nColStep},
                                             {0, nRows, nullptr, nullptr});
            fnExpectPlain(vfOurs);
        }
    }
    omp_set_num_threads(nMaxThreads);
}

TEST(HostDensify, Refusals) {
    float afData[] = {1.0f, 2.0f, 3.0f, 4.0f};
    const auto fnRange = [](const char* psz, int nGot) {
        return Refusal{psz, ParameterException::eOutOfRange, std::to_string(nGot), ">= 1",
                       std::string(psz) + " must be at least 1"};
    };
    ExpectRefusal(fnRange("cols", 0), [&] { HostDensify(afData, 2, 0, 1, 1); });
    ExpectRefusal(fnRange("rowStep", 0), [&] { HostDensify(afData, 2, 2, 0, 1); });
    ExpectRefusal(fnRange("colStep", -3), [&] { HostDensify(afData, 2, 2, 1, -3); });
    ExpectRefusal(
        {"data", ParameterException::eInvalid, "NULL", "non-NULL", "data must be a valid pointer"},
        [] { HostDensify(nullptr, 2, 2, 1, 1); });
    for (const int nRows : {0, -2}) {
        HostDensify(nullptr, nRows, 2, 1, 1);
    }
}

}  // namespace
}  // namespace vetra::tests
