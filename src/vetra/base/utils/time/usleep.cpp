#include "vetra/base/utils/time/usleep.h"

#include <chrono>
#include <thread>

void USleep(const unsigned long& microseconds) {
    if (microseconds < 1000) {
        std::this_thread::yield();
    } else {
        std::this_thread::sleep_for(std::chrono::milliseconds(microseconds / 1000));
    }
}
