#include "vetra/base/utils/time/timer.h"

#include <gtest/gtest.h>
#include <sys/resource.h>

#include <chrono>
#include <ctime>
#include <functional>
#include <thread>
#include <type_traits>
#include <vector>

#include "vetra/base/utils/time/clock.h"
#include "vetra/base/utils/time/usleep.h"

namespace vetra::tsys {
namespace {

using Milliseconds = std::chrono::duration<double, std::milli>;

// Milliseconds that a call takes by a clock that nobody sets.
double Measure(const std::function<void()>& fnCall) {
    const auto begin = std::chrono::steady_clock::now();
    fnCall();
    return Milliseconds(std::chrono::steady_clock::now() - begin).count();
}

// CPU time of the process so far, in milliseconds.
double CpuTime() {
    timespec oTime;
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &oTime);
    return static_cast<double>(oTime.tv_sec) * 1e3 + static_cast<double>(oTime.tv_nsec) * 1e-6;
}

void Burn(double dfMilliseconds) {
    for (const double dfStart = CpuTime(); CpuTime() < dfStart + dfMilliseconds;) {
    }
}

// Both clocks are cut to the millisecond: an interval is right to less than one. The outer
// measurement is longer and the inner one shorter, however the threads are scheduled.
TEST(Clocks, RightToTheMillisecond) {
    for (const unsigned long nWait : {0ul, 1000ul, 37'000ul, 100'000ul}) {
        double dfInner = 0.0;
        double dfElapsed = 0.0;
        double dfSinceStart = 0.0;
        const double dfOuter = Measure([&] {
            Clock oClock;
            oClock.ResetStartEpoch();
            Timer oTimer;
            oTimer.Start();
            dfInner = Measure([&] { USleep(nWait); });
            oTimer.Stop();
            dfElapsed = oTimer.GetElapsedTime();
            dfSinceStart = oClock.TimeSinceStart() * 1e3;
        });
        EXPECT_GE(dfInner, static_cast<double>(nWait) * 1e-3);
        for (const double df : {dfElapsed, dfSinceStart}) {
            EXPECT_GT(df, dfInner - 1.0);
            EXPECT_LT(df, dfOuter + 1.0);
        }
    }
}

TEST(Timer, CpuTimes) {
    Timer oTimer;
    const double dfBefore = CpuTime();
    oTimer.Start();
    Burn(200.0);
    oTimer.Stop();
    const double dfSpent = CpuTime() - dfBefore;
    // The system splits CPU time into the two by its ticks, but their sum is right.
    EXPECT_NEAR(oTimer.GetUserTime() + oTimer.GetKernelTime(), dfSpent, 10.0);
    EXPECT_GT(oTimer.GetUserTime(), 0.0);

    oTimer.Start();
    USleep(100'000);
    EXPECT_GE(oTimer.GetElapsedTime(), 99.0);
    EXPECT_LT(oTimer.GetUserTime() + oTimer.GetKernelTime(), 20.0);
}

TEST(Timer, States) {
    Timer oTimer;
    EXPECT_FALSE(oTimer.GetTimerStatus());
    for (int n = 0; n < 2; ++n) {
        EXPECT_EQ(oTimer.GetElapsedTime(), 0.0);
        EXPECT_EQ(oTimer.GetKernelTime(), 0.0);
        EXPECT_EQ(oTimer.GetUserTime(), 0.0);
        oTimer.Stop();
    }
    for (double (Timer::*pfnRead)() :
         {&Timer::GetElapsedTime, &Timer::GetKernelTime, &Timer::GetUserTime}) {
        oTimer.Start();
        EXPECT_TRUE(oTimer.GetTimerStatus());
        const double dfFirst = (oTimer.*pfnRead)();
        EXPECT_FALSE(oTimer.GetTimerStatus());
        Burn(5.0);
        EXPECT_EQ((oTimer.*pfnRead)(), dfFirst);
    }
    oTimer.Start();
    USleep(200'000);
    Timer oOther;
    oOther = oTimer;
    oTimer.Start();
    EXPECT_LT(oTimer.GetElapsedTime(), 150.0);
    EXPECT_TRUE(oOther.GetTimerStatus());
    EXPECT_GT(oOther.GetElapsedTime(), 199.0);
    oTimer = oOther;
    EXPECT_EQ(oTimer.GetElapsedTime(), oOther.GetElapsedTime());
}

template <typename T>
struct Derived : T {
    Derived() = default;
    Derived(const Derived& oOther) : T(oOther) {}
};

TEST(Clocks, CopiesTakeNothingOver) {
    EXPECT_FALSE(std::is_copy_constructible_v<Clock>);
    EXPECT_FALSE(std::is_copy_constructible_v<Timer>);
    Derived<Timer> oTimer;
    const Derived<Clock> oClock;
    oTimer.Start();
    USleep(50'000);
    Derived<Timer> oTimerCopy(oTimer);
    const Derived<Clock> oClockCopy(oClock);
    EXPECT_FALSE(oTimerCopy.GetTimerStatus());
    EXPECT_EQ(oTimerCopy.GetElapsedTime(), 0.0);
    EXPECT_GT(oClock.TimeSinceStart(), oClockCopy.TimeSinceStart() + 0.048);
    Clock oAssigned;
    oAssigned = oClock;
    EXPECT_GT(oAssigned.TimeSinceStart(), 0.048);
}

TEST(USleep, WholeMilliseconds) {
    EXPECT_LT(Measure([] {
                  for (int n = 0; n < 100; ++n) {
                      USleep(999);
                  }
              }),
              90.0);
    EXPECT_GE(Measure([] { USleep(2999); }), 2.0);
}

TEST(Timer, CurrentTimeAsString) {
    // The hour may turn between the readings.
    for (int nTry = 0; nTry < 3; ++nTry) {
        const std::time_t nBefore = std::time(nullptr);
        const std::string sText = Timer::GetCurrentTimeAsString();
        if (std::time(nullptr) == nBefore) {
            char szExpected[64];
            // The process has the locale "C".
            std::strftime(szExpected, sizeof szExpected, "%a %b %e %H:%M:%S %Y\n",
                          std::localtime(&nBefore));
            EXPECT_EQ(sText, szExpected);
            return;
        }
    }
    ADD_FAILURE() << "three seconds turned";
}

// For ThreadSanitizer, and for the shared buffers of the C library.
TEST(Clocks, FromSeveralThreads) {
    const Clock oShared;
    std::vector<std::thread> voThreads;
    for (int n = 0; n < 4; ++n) {
        voThreads.emplace_back([&] {
            for (int i = 0; i < 2000; ++i) {
                Timer oTimer;
                oTimer.Start();
                EXPECT_EQ(Timer::GetCurrentTimeAsString().size(), 25u);
                EXPECT_GE(oShared.TimeSinceStart(), 0.0);
                EXPECT_GE(oTimer.GetElapsedTime(), 0.0);
                USleep(1);
            }
        });
    }
    for (std::thread& oThread : voThreads) {
        oThread.join();
    }
}

}  // namespace
}  // namespace vetra::tsys
