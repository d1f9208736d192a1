#ifndef VETRA_BASE_UTILS_RESAMPLE_ENGINE_TASK_H
#define VETRA_BASE_UTILS_RESAMPLE_ENGINE_TASK_H

#include <cstddef>

#include "vetra/base/utils/resample/engine/levels.h"
#include "vetra/base/utils/resample/engine/pixelmode.h"
#include "vetra/base/utils/resample/postfm/ibufpostfm.h"

namespace vetra::utils::engine {

/// Working memory that the values stage needs, for kLanes pixels at once.
enum class Scratch {
    eNone,
    eTaps,     ///< the weights of a window's columns, and two for each row
    eSamples,  ///< the samples of a window
};

/// A sampling method, as the loop sees it: its window, how it decides what becomes of a pixel, and
/// where its values stage stands in a level's table.
struct Method {
    ModeRule eRule;
    Window oWindow;
    ValuesRow eValues;
    /// Negative nearest samples count as 0.
    bool bNonNegative;
    /// Channels whose values come out of one call of the values stage.
    int nChannels = 1;
    Scratch eScratch = Scratch::eNone;
};

/// The row of values for those windows of a replacing method that hold no masked pixel.
inline ValuesRow PlainRow(const Method& oMethod) {
    return oMethod.eValues == eVR_SQCUBICPS ? eVR_SQCUBIC : eVR_CUBIC;
}

/// Doubles of working memory that a thread needs.
inline std::size_t GetScratchSize(const Method& oMethod) {
    const std::size_t nCols = static_cast<std::size_t>(oMethod.oWindow.nCols);
    const std::size_t nRows = static_cast<std::size_t>(oMethod.oWindow.nRows);
    switch (oMethod.eScratch) {
        case Scratch::eTaps:
            return (nCols + 2 * nRows) * kLanes;
        case Scratch::eSamples:
            return nCols * nRows * kLanes;
        case Scratch::eNone:
            break;
    }
    return 0;
}

/// The ways through the sampling loop. All give the same result.
enum class Path {
    eBest,  ///< whichever of the others is best
    /// Positions, modes and values pixel by pixel: for every transform.
    ePlain,
    // Those for axis-aligned transforms. Positions are tabulated per column.
    eColumns,       ///< windows are read from the source
    eRows,          ///< source rows become doubles (or roots) once
    eFilteredRows,  ///< source rows are filtered along the columns once
    eSums,          ///< sums over the rows of a window are kept running
    eMedians,       ///< medians of neighbouring windows are found together
};
const char* GetPathName(Path ePath);

struct PathChoice {
    Path ePath = Path::ePlain;
    const char* pszWhy = "";
};

/// What a run can be asked for beyond its result. The defaults are what every caller gets; tests
/// ask for the rest.
struct RunOptions {
    /// Takes what became of each target pixel; may be null.
    unsigned char* pabyOutcome = nullptr;
    Level eLevel = GetBestLevel();
    /// ePlain turns off all shortcuts, those of masks, copies and channels too; eColumns only those
    /// that keep rows. Other paths are taken by runs that they suit, and can't be forced on others.
    Path ePath = Path::eBest;
    /// Takes the path that the run took; may be null.
    PathChoice* poTaken = nullptr;
};

/// One run of the sampling loop, with the sample types as codes.
struct Task {
    const void* pSrc;
    int nSrcCols;
    int nSrcRows;
    const unsigned char* pabySrcMask;
    int nSrcType;  ///< index into the stage tables

    void* pTgt;
    int nTgtCols;
    int nTgtRows;
    const unsigned char* pabyTgtMask;
    int nTgtType;

    int nChan;
    const IBufPosTfm* poTfm;
    NodataFillAction eFillAction;
    const Method* poMethod;
    /// What the method prepared for the run; may be null.
    const void* pParameters;
    /// A StoreLimits of the target's type.
    const void* pLimits;
    /// One sample of the target's type.
    const void* pBackground;
    /// Every sample of the target's type passes the clamp unchanged.
    bool bClampIsOpen;

    RunOptions oOptions;
};

/// Runs the sampling loop on an OpenMP team. Throws std::bad_alloc, before any pixel is written,
/// and nothing else.
void Execute(const Task& oTask);

}  // namespace vetra::utils::engine

#endif  // VETRA_BASE_UTILS_RESAMPLE_ENGINE_TASK_H
