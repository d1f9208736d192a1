#include "vetra/base/utils/math/hostdensify.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "vetra/base/utils/math/arguments.h"
#include "vetra/base/utils/math/densify/rows.h"
#include "vetra/threadcore/ompthreads.h"

namespace vetra::utils::math {

void HostDensify(float* data, const int& rows, const int& cols, const int& rowStep,
                 const int& colStep) {
    CheckAtLeast(cols, 1, "cols", VETRA_HERE);
    CheckAtLeast(rowStep, 1, "rowStep", VETRA_HERE);
    CheckAtLeast(colStep, 1, "colStep", VETRA_HERE);
    if (rows < 1) {
        return;
    }
    CheckPointer(data, "data", VETRA_HERE);

    // A copy: a caller's int could be written by another thread.
    const densify::Grid oGrid{data, rows, cols, rowStep, colStep};
    const densify::Rows& oRows = densify::GetRows(low::GetBestLevel());
    // Beside its own rows a thread needs copies of two others; with some rows of its own all these
    // stay small beside the grid.
    constexpr int kLeastRows = 16;
    const int nShares = oGrid.nRows / kLeastRows;
    const OMPThreadCount oThreads(nShares);
    const bool bShare = OMPCanShare(nShares);
    const std::ptrdiff_t nPitch = oGrid.nCols;
    std::vector<float> vfCopies(bShare ? 2 * static_cast<std::size_t>(OMPGetMaxThreads()) *
                                             static_cast<std::size_t>(nPitch)
                                       : 0);
#pragma omp parallel if (bShare)
    {
        const std::int64_t nTeam = omp_get_num_threads();
        const std::int64_t nThread = omp_get_thread_num();
        const int nFirst = static_cast<int>(nThread * oGrid.nRows / nTeam);
        const int nEnd = static_cast<int>((nThread + 1) * oGrid.nRows / nTeam);
        float* pafBefore = bShare ? vfCopies.data() + 2 * nThread * nPitch : nullptr;
        float* pafBehind = bShare ? pafBefore + nPitch : nullptr;
        const auto fnCopy = [&](std::int64_t nRow, float* pafCopy) {
            if (nRow < nFirst || nRow >= nEnd) {
                std::copy_n(oGrid.pafData + nRow * nPitch, nPitch, pafCopy);
            }
        };
        fnCopy(nFirst / oGrid.nRowStep * oGrid.nRowStep, pafBefore);
        const std::int64_t nBehind =
            (nEnd - 1) / oGrid.nRowStep * std::int64_t{oGrid.nRowStep} + oGrid.nRowStep;
        fnCopy(std::min<std::int64_t>(oGrid.nRows - 1, nBehind), pafBehind);
#pragma omp barrier
        oRows.pfnFill(oGrid, {nFirst, nEnd, pafBefore, pafBehind});
    }
}

}  // namespace vetra::utils::math
