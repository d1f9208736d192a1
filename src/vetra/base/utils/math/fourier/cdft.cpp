#include "vetra/base/utils/math/fourier/cdft.h"

#include <cstddef>
#include <memory>

#include "vetra/base/utils/math/arguments.h"
#include "vetra/base/utils/math/fourier/passes.h"
#include "vetra/base/utils/math/fourier/transpose.h"
#include "vetra/base/utils/math/sincos.h"
#include "vetra/threadcore/ompthreads.h"

using namespace vetra::utils::math;
using vetra::OMPCanShare;
using vetra::OMPGetMaxThreads;
using vetra::OMPThreadCount;
using vetra::ParameterException;
using vetra::utils::low::GetBestLevel;

void InitSinCosTable(int n, float* table) {
    CheckAtLeast(n, 2, "n", VETRA_HERE);
    CheckPointer(table, "table", VETRA_HERE);
    const double dfStep = 6.283185307179586 / n;
    const int nEntries = n / 2;
    const bool bShare = OMPCanShare(nEntries);
    const OMPThreadCount oThreads(nEntries);
#pragma omp parallel for schedule(static) if (bShare)
    for (int k = 0; k < nEntries; ++k) {
        double dfSin;
        double dfCos;
        sincos(k * dfStep, dfSin, dfCos);
        float* pafEntry = table + 2 * static_cast<std::ptrdiff_t>(k);
        pafEntry[0] = static_cast<float>(dfCos);
        pafEntry[1] = static_cast<float>(-dfSin);
    }
}

void CDFT1d(int n, int m, float* a, float* b, const float* table, bool flag) {
    CheckTransformLength(n, 2, "n", VETRA_HERE);
    if (m < 0 || m > 30 || n != 1 << m) {
        throw ParameterException("m", ParameterException::eInvalid, FormatString("%d", m),
                                 "the binary logarithm of n", "m must be the binary logarithm of n",
                                 VETRA_HERE);
    }
    CheckPointer(a, "a", VETRA_HERE);
    CheckPointer(b, "b", VETRA_HERE);
    CheckPointer(table, "table", VETRA_HERE);
    fourier::GetPasses(GetBestLevel()).pfnTableTransform(n, a, b, table, flag);
}

void CDFT2d(int n, FFTComplex* data, const float* table, bool flag) {
    CheckTransformLength(n, 2, "n", VETRA_HERE);
    CheckPointer(data, "data", VETRA_HERE);
    CheckPointer(table, "table", VETRA_HERE);
    const fourier::Passes& oPasses = fourier::GetPasses(GetBestLevel());
    const OMPThreadCount oThreads(n);
    const bool bShare = OMPCanShare(n);
    const std::ptrdiff_t nRowFloats = 2 * static_cast<std::ptrdiff_t>(n);
    float* pafData = reinterpret_cast<float*>(data);
    const auto fnRow = [=](std::ptrdiff_t i) { return pafData + i * nRowFloats; };
    // Allocated here for all threads: nothing may be thrown inside a team.
    const std::size_t nScratch =
        static_cast<std::size_t>(OMPGetMaxThreads()) * static_cast<std::size_t>(nRowFloats);
    const std::unique_ptr<float[]> pafScratch(new float[nScratch]);
    for (int nPass = 0; nPass < 2; ++nPass) {
#pragma omp parallel
        {
            float* pafWork = pafScratch.get() + omp_get_thread_num() * nRowFloats;
#pragma omp for schedule(static)
            for (int i = 0; i < n; ++i) {
                oPasses.pfnTableTransform(n, fnRow(i), pafWork, table, flag);
            }
        }
        // Later bands are longer: dealt out in turn, all threads get alike.
#pragma omp parallel for schedule(static, 1) if (bShare)
        for (std::ptrdiff_t nBand = 0; nBand < fourier::BandCount(n); ++nBand) {
            fourier::TransposeBand(n, nBand, fnRow);
        }
    }
}
