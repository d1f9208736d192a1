#ifndef VETRA_BASE_UTILS_TIME_CLOCK_H
#define VETRA_BASE_UTILS_TIME_CLOCK_H

#include <cstdint>

#include "vetra/export.h"

namespace vetra::tsys {

/// A stopwatch on the system's clock, in whole milliseconds. When that clock is set, the reading
/// jumps with it.
class VETRA_EXPORT Clock {
 public:
    /// Starts now.
    Clock();
    /// Takes over the start of the other clock.
    Clock& operator=(const Clock& oOther) = default;

    /// Starts again, now.
    void ResetStartEpoch();

    /// Seconds since the start.
    double TimeSinceStart() const;

 protected:
    /// Starts now, whatever the other clock does.
    Clock(const Clock&);

 private:
    std::int64_t mnStartSeconds;  // of the system's clock, since 1970
    std::int32_t mnStartMicroseconds;
};

}  // namespace vetra::tsys

#endif  // VETRA_BASE_UTILS_TIME_CLOCK_H
