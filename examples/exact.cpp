// The same image by one thread, by many, and by a formula: every bit is equal.

#include <omp.h>
#include <vetra/vetra.h>

#include <cmath>
#include <cstdio>
#include <cstring>

using namespace vetra::utils;

namespace {

constexpr int kSize = 300;

// [formula]
// Bilinear sampling as one would write it: in double, and rounded to the target's type at the end.
float Sample(const float* pafImage, double x, double y) {
    const int x0 = static_cast<int>(std::floor(x));
    const int y0 = static_cast<int>(std::floor(y));
    const double dx = x - x0;
    const double dy = y - y0;
    const float* p = pafImage + y0 * kSize + x0;
    const double dfUpper = p[0] + (static_cast<double>(p[1]) - p[0]) * dx;
    const double dfLower = p[kSize] + (static_cast<double>(p[kSize + 1]) - p[kSize]) * dx;
    return static_cast<float>(dfUpper + (dfLower - dfUpper) * dy);
}
// [formula]

}  // namespace

int main() {
    ResampleBuffer oSource(vetra::gobs::eDT_32R, kSize, kSize, 1);
    float* pafSource = reinterpret_cast<float*>(oSource.GetBuf());
    for (int i = 0; i < kSize * kSize; ++i) {
        pafSource[i] = static_cast<float>(std::sin(i * 0.37) * 1000.0);
    }

    // [threads]
    const BufPosScaleOffTfm oEnlarge(kSize, kSize, 0.71, 3.0, 0.53, 5.0, 0, 0);
    const BilinearResampler oResampler;
    omp_set_num_threads(1);
    ResampleBuffer oOne(vetra::gobs::eDT_32R, kSize, kSize, 1);
    oResampler.Resample(oSource, oOne, oEnlarge);
    omp_set_num_threads(7);
    ResampleBuffer oSeven(vetra::gobs::eDT_32R, kSize, kSize, 1);
    oResampler.Resample(oSource, oSeven, oEnlarge);
    const std::size_t nBytes = sizeof(float) * kSize * kSize;
    const bool bThreads = std::memcmp(oOne.GetBuf(), oSeven.GetBuf(), nBytes) == 0;
    // [threads]

    bool bFormula = true;
    const float* pafOne = reinterpret_cast<const float*>(oOne.GetBuf());
    for (int i = 0; i < kSize * kSize; ++i) {
        double x;
        double y;
        oEnlarge.GetSrcPos(i, x, y);
        bFormula = bFormula && pafOne[i] == Sample(pafSource, x, y);
    }
    std::printf("one thread and seven: %s\n", bThreads ? "equal" : "DIFFERENT");
    std::printf("library and formula: %s\n", bFormula ? "equal" : "DIFFERENT");
    return bThreads && bFormula ? 0 : 1;
}
