#ifndef VETRA_BENCH_WORKLOAD_H
#define VETRA_BENCH_WORKLOAD_H

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "vetra/basic/gobs/raster/datatypeadapter.h"

constexpr int kSourceSize = 4096;
constexpr int kTargetSize = 3000;

/// What is measured: a source of 4096 x 4096 pixels sampled at the pixels of a target.
struct Work {
    enum class Geometry {
        eRotated,  ///< position arrays: turned by 0.17 rad, 0.9 source pixels per target pixel
        eDown,     ///< axis-aligned, 4096 to 3000
        eUp,       ///< axis-aligned, the inner 2048 to 3000
        eUnit,     ///< axis-aligned, the first 3000, pixel by pixel
    };

    Geometry eGeometry;
    const char* pszMethod;  ///< a resampler string
    vetra::gobs::NativeDataTypeCode eType = vetra::gobs::eDT_8U;
    int nChan = 1;
    bool bMask = false;  ///< one source pixel in a hundred is invalid
    int nThreads = 1;    ///< 0: all
    int nTargetSize = kTargetSize;
    bool bAvx2 = false;  ///< on the processor level x86-64-v3, if the machine has a higher one

    std::string Name() const;
    /// The method's name, without what follows a comma.
    std::string MethodName() const;
    /// Columns, and rows, of a mean's or median's window.
    int WindowSize() const;
    /// What it is compared with: the same without a mask, with one thread, a large target, the
    /// machine's own level, or by the plain twin of a squared method. Itself if there is no such.
    Work Baseline() const;
    double TargetPixels() const { return double(nTargetSize) * nTargetSize; }
    /// A work that peers are asked for, too.
    bool IsCommon() const;
};

/// First source column and row, and source pixels per target pixel, of an axis-aligned work.
double FirstSource(Work::Geometry eGeometry);
double ScaleOf(Work::Geometry eGeometry);

/// Images and positions, made once and shared by all cases.
std::vector<unsigned char>& SourceSamples(const Work& oWork);
std::vector<unsigned char>& SourceMask();
std::vector<unsigned char>& TargetSamples();
std::vector<float>& RotatedCols();
std::vector<float>& RotatedRows();
/// Source samples that rotated positions move by within so many target rows.
std::int64_t RotatedAhead(double dfTgtRows);

/// All works of the table.
std::vector<Work> AllWorks();

/// A way of doing a work: the library's name, and the call that is timed. Empty where the library
/// doesn't offer the work.
struct Case {
    std::string sLibrary;
    std::function<void()> fnRun;
};
Case VetraCase(const Work& oWork);
Case OpenCvCase(const Work& oWork);
Case GdalCase(const Work& oWork);
/// The tests' plain evaluation, one pixel after the other.
Case PlainCase(const Work& oWork);
/// A loop that does nothing but this work, for the few that have one.
Case BareCase(const Work& oWork);

#endif  // VETRA_BENCH_WORKLOAD_H
