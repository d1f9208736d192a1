#ifndef VETRA_BENCH_FLOOR_H
#define VETRA_BENCH_FLOOR_H

#include "workload.h"

/// What this machine can't do faster, measured once, with one thread.
struct MachineRates {
    double dfBytesPerNs;       ///< of memory, read and written, where it is copied
    double dfOperationsPerNs;  ///< additions and multiplications of doubles, in registers
};
const MachineRates& GetMachineRates();

/// The time per target pixel, in nanoseconds, below which one thread can't do a work in double: the
/// bytes that have to be moved (positions, the source samples in reach once, target samples) or
/// the additions and multiplications of the formulas, whichever takes longer. Reading samples,
/// their conversion, weights and rounding come on top.
double FloorOf(const Work& oWork);

#endif  // VETRA_BENCH_FLOOR_H
