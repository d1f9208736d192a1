#include "vetra/base/utils/time/timer.h"

#include <sys/resource.h>

#include <chrono>
#include <ctime>

#include "vetra/base/utils/time/systemtime.h"
#include "vetra/faultcore/exceptions.h"

namespace vetra::tsys {

namespace {

double ToMilliseconds(const timeval& oTime) {
    return static_cast<double>(oTime.tv_sec) * 1e3 + static_cast<double>(oTime.tv_usec) * 1e-3;
}

}  // namespace

Timer::Timer()
    : mdfKernelStart(0.0),
      mdfKernelStop(0.0),
      mdfUserStart(0.0),
      mdfUserStop(0.0),
      mbRunning(false) {}

Timer::Timer(const Timer&) : Timer() {}

void Timer::Start() {
    CurrentTime(false);
    mbRunning = true;
}

void Timer::Stop() {
    if (mbRunning) {
        CurrentTime(true);
        mbRunning = false;
    }
}

double Timer::GetElapsedTime() {
    Stop();
    double dfDays = 0.0;
    double dfFraction = 0.0;
    (moStopTime - moStartTime).GetTime(dfDays, dfFraction);
    return (dfDays + dfFraction) * 86400.0 * 1000.0;
}

double Timer::GetKernelTime() {
    Stop();
    return mdfKernelStop - mdfKernelStart;
}

double Timer::GetUserTime() {
    Stop();
    return mdfUserStop - mdfUserStart;
}

// Takes the readings of the start or of the stop.
void Timer::CurrentTime(bool bStop) {
    rusage oUsage;
    if (getrusage(RUSAGE_SELF, &oUsage) != 0) {
        throw DeviceException("Error occured when trying to get current process time.", "", "", 0);
    }
    const SystemTime oNow = GetSystemTime();

    using namespace std::chrono;
    const sys_seconds time{seconds(oNow.nSeconds)};
    const auto day = floor<days>(time);
    const year_month_day oDate(day);
    const hh_mm_ss oClock(time - day);
    Timestamp oTime;
    moConverter.CalendarToJulian(
        static_cast<int>(oDate.year()), static_cast<int>(static_cast<unsigned>(oDate.month())),
        static_cast<int>(static_cast<unsigned>(oDate.day())),
        static_cast<int>(oClock.hours().count()), static_cast<int>(oClock.minutes().count()),
        static_cast<double>(oClock.seconds().count()) + oNow.nMilliseconds / 1000.0, oTime);

    (bStop ? mdfKernelStop : mdfKernelStart) = ToMilliseconds(oUsage.ru_stime);
    (bStop ? mdfUserStop : mdfUserStart) = ToMilliseconds(oUsage.ru_utime);
    (bStop ? moStopTime : moStartTime) = oTime;
}

std::string Timer::GetCurrentTimeAsString() {
    const std::time_t nNow = std::time(nullptr);
    std::tm oLocal;
    char szText[64];
    // The forms of the C library that share no memory between threads.
    if (localtime_r(&nNow, &oLocal) == nullptr || asctime_r(&oLocal, szText) == nullptr) {
        return "\n";
    }
    return szText;
}

}  // namespace vetra::tsys
