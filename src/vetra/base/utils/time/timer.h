#ifndef VETRA_BASE_UTILS_TIME_TIMER_H
#define VETRA_BASE_UTILS_TIME_TIMER_H

#include <string>

#include "vetra/chronocore/timestamp.h"
#include "vetra/chronocore/timesystemconverter.h"
#include "vetra/export.h"

namespace vetra::tsys {

/// Measures an interval by the system's clock, and the CPU time of the whole process within it,
/// spent in the kernel and in the program. All in milliseconds; the clock is read in whole ones.
///
/// An object is for one thread at a time; distinct objects are independent.
class VETRA_EXPORT Timer {
 public:
    /// Not running; all times are 0.
    Timer();
    /// Takes over the interval of the other timer, and whether it runs.
    Timer& operator=(const Timer& oOther) = default;

    /// Starts; a running timer starts anew.
    /// \throws DeviceException when the system doesn't tell the CPU times. The timer is unchanged.
    void Start();

    /// Ends the interval of a running timer; otherwise does nothing.
    /// \throws DeviceException as `Start`
    void Stop();

    /// The length of the interval, in milliseconds. Stops a running timer, as the next two do.
    /// \throws DeviceException as `Start`
    double GetElapsedTime();

    /// CPU time that the process spent in the kernel, in milliseconds.
    /// \throws DeviceException as `Start`
    double GetKernelTime();

    /// CPU time that the process spent outside the kernel, in milliseconds.
    /// \throws DeviceException as `Start`
    double GetUserTime();

    /// Whether the timer runs.
    bool GetTimerStatus() const { return mbRunning; }

    /// The current local time in the form of `asctime`, with its line feed at the end:
    /// "Wed Jun 30 21:49:08 1993\n".
    static std::string GetCurrentTimeAsString();

 protected:
    /// As the default constructor, whatever the other timer holds.
    Timer(const Timer&);

 private:
    void CurrentTime(bool bStop);

    double mdfKernelStart;
    double mdfKernelStop;
    double mdfUserStart;
    double mdfUserStop;
    Timestamp moStartTime;
    Timestamp moStopTime;
    TimeSystemConverter moConverter;
    bool mbRunning;
};

}  // namespace vetra::tsys

#endif  // VETRA_BASE_UTILS_TIME_TIMER_H
