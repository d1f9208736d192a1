#include "vetra/base/utils/time/clock.h"

#include "vetra/base/utils/time/systemtime.h"

namespace vetra::tsys {

Clock::Clock() { ResetStartEpoch(); }

Clock::Clock(const Clock&) : Clock() {}

void Clock::ResetStartEpoch() {
    const SystemTime oNow = GetSystemTime();
    mnStartSeconds = oNow.nSeconds;
    mnStartMicroseconds = oNow.nMilliseconds * 1000;
}

double Clock::TimeSinceStart() const {
    const SystemTime oNow = GetSystemTime();
    return (oNow.nMilliseconds * 1000 - mnStartMicroseconds) * 1e-6 +
           static_cast<double>(oNow.nSeconds - mnStartSeconds);
}

}  // namespace vetra::tsys
