#ifndef VETRA_CHRONOCORE_TIMESTAMP_H
#define VETRA_CHRONOCORE_TIMESTAMP_H

#include "vetra/export.h"

namespace vetra::tsys {

/// A point in time or a span of it, in days, as a sum of two numbers. With the days in one and the
/// fraction of a day in the other it is exact to about 10^-11 s, where a single double would be
/// exact to 4 * 10^-5 s for a Julian date.
class VETRA_EXPORT Timestamp {
 public:
    /// Zero.
    Timestamp() : Timestamp(0.0, 0.0) {}
    /// The sum of two numbers of days.
    Timestamp(double dfDays, double dfFraction) : mdfDays(dfDays), mdfFraction(dfFraction) {}

    /// The span from the other time to this one, part by part.
    Timestamp operator-(const Timestamp& oOther) const {
        return {mdfDays - oOther.mdfDays, mdfFraction - oOther.mdfFraction};
    }

    /// Two numbers whose sum is the time in days.
    void GetTime(double& dfDays, double& dfFraction) const {
        dfDays = mdfDays;
        dfFraction = mdfFraction;
    }

 private:
    double mdfDays;
    double mdfFraction;
};

}  // namespace vetra::tsys

#endif  // VETRA_CHRONOCORE_TIMESTAMP_H
