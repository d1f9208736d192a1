#ifndef VETRA_BASE_UTILS_TIME_SYSTEMTIME_H
#define VETRA_BASE_UTILS_TIME_SYSTEMTIME_H

#include <chrono>
#include <cstdint>

namespace vetra::tsys {

/// A reading of the system's clock, cut to the millisecond.
struct SystemTime {
    std::int64_t nSeconds;  ///< since 1970 UTC
    std::int32_t nMilliseconds;
};

inline SystemTime GetSystemTime() {
    using namespace std::chrono;
    const auto now = floor<milliseconds>(system_clock::now());
    const auto second = floor<seconds>(now);
    return {second.time_since_epoch().count(), static_cast<std::int32_t>((now - second).count())};
}

}  // namespace vetra::tsys

#endif  // VETRA_BASE_UTILS_TIME_SYSTEMTIME_H
