// The sampling loop.
//
// Each thread of the team takes a contiguous share of the flat target index and walks it in spans
// of up to kSpanPixels pixels. A span goes through the stages positions, modes, places, values,
// store; its arrays stay in the first-level cache. Types matter at the ends only, where samples are
// read and stored: the stages come from tables with an entry per type.

#include <omp.h>

#include <algorithm>
#include <cstddef>
#include <vector>

#include "vetra/base/utils/resample/engine/run.h"

namespace vetra::utils::engine {

void Execute(const Task& oTask) {
    const Run oRun(oTask);
    const long long nNumPix = static_cast<long long>(oTask.nTgtCols) * oTask.nTgtRows;
    const int nMaxThreads = omp_get_max_threads();
    std::vector<Run::ThreadMemory> voMemory;
    for (int i = 0; i < nMaxThreads; ++i) {
        voMemory.push_back(oRun.MakeThreadMemory());
    }
#pragma omp parallel
    {
        const int nThread = omp_get_thread_num();
        const long long nThreads = omp_get_num_threads();
        const long long nShare = nNumPix / nThreads;
        const long long nRest = nNumPix % nThreads;
        const long long nBegin = nThread * nShare + std::min<long long>(nThread, nRest);
        const long long nEnd = nBegin + nShare + (nThread < nRest ? 1 : 0);
        if (nBegin < nEnd) {
            oRun.Walk(nBegin, nEnd, voMemory[static_cast<std::size_t>(nThread)]);
        }
    }
}

}  // namespace vetra::utils::engine
