#ifndef VETRA_APPS_KERNEL_RESPONSE_H
#define VETRA_APPS_KERNEL_RESPONSE_H

#include <vector>

#include "kernel/axisfilter.h"

namespace vetra::tool {

/// Frequencies at equal steps, in cycles per pixel.
struct FrequencyGrid {
    double dfFirst = 0.0;
    double dfStep = 0.0;
    int nCount = 0;

    double Get(int n) const { return dfFirst + n * dfStep; }
};

/// A grid from one frequency to another, both multiples of 1/512, on which no lobe of the filter's
/// response is missed.
FrequencyGrid MakeGrid(const AxisFilter& oFilter, double dfFirst, double dfLast);

/// The gain of a filter without its carrier: the magnitude of the Fourier integral of its impulse
/// response, in which the weights of a phase hold for all fractions that round to it. A method that
/// is evaluated anew at each position is met to 1e-4 by its weights at 64 sub-pixels.
///
/// Takes time of frequencies x weights. \throws Interrupted
std::vector<double> GetGains(const AxisFilter& oFilter, const FrequencyGrid& oGrid);

/// What a filter without its carrier does, in figures.
struct ResponseFigures {
    double dfGainAtZero = 0.0;         ///< 1 keeps the level of an image
    double dfGainAtHalfNyquist = 0.0;  ///< at 0.25 cycles per pixel
    double dfGainAtNyquist = 0.0;      ///< at 0.5 cycles per pixel
    /// The largest gain from 0.75 to 2 cycles per pixel, where the images of detail of up to 0.25
    /// cycles per pixel lie.
    double dfLargestImage = 0.0;
    /// How far values beside a step of height 1 leave its two levels.
    double dfOvershoot = 0.0;
    double dfSmallestWeight = 0.0;  ///< 0 if none is negative
    double dfSmallestSum = 0.0;     ///< of the weights of a phase
    double dfLargestSum = 0.0;
};

/// Time as `GetGains`. \throws Interrupted
ResponseFigures GetFigures(const AxisFilter& oFilter);

}  // namespace vetra::tool

#endif  // VETRA_APPS_KERNEL_RESPONSE_H
