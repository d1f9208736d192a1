#include "vetra/base/utils/time/timer.h"

#include <gtest/gtest.h>

#include <chrono>
#include <ctime>
#include <functional>
#include <string>
#include <thread>
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

// Spends CPU time outside the kernel.
void Burn(double dfMilliseconds) {
    for (const double dfStart = CpuTime(); CpuTime() < dfStart + dfMilliseconds;) {
        volatile int nSink = 0;
        for (int n = 0; n < 100'000; ++n) {
            nSink = n;
        }
        static_cast<void>(nSink);
    }
}

// Both clocks are cut to the millisecond: an interval is right to less than one. The outer
// measurement is longer and the inner one shorter, however the threads are scheduled.
TEST(Clocks, RightToTheMillisecond) {
    for (const unsigned long nWait : {0ul, 999ul, 2999ul, 100'000ul}) {
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
        EXPECT_GE(dfInner, static_cast<double>(nWait / 1000));
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
    EXPECT_GT(oTimer.GetUserTime(), oTimer.GetKernelTime());

    oTimer.Start();
    USleep(100'000);
    EXPECT_GE(oTimer.GetElapsedTime(), 99.0);
    EXPECT_LT(oTimer.GetUserTime() + oTimer.GetKernelTime(), 20.0);
}

TEST(Timer, States) {
    Timer oTimer;
    oTimer.Stop();
    EXPECT_EQ(oTimer.GetElapsedTime() + oTimer.GetKernelTime() + oTimer.GetUserTime(), 0.0);
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
}

template <typename T>
struct Derived : T {
    Derived() = default;
    Derived(const Derived& oOther) : T(oOther) {}
};

TEST(Clocks, CopiesTakeNothingOver) {
    Derived<Timer> oTimer;
    const Derived<Clock> oClock;
    oTimer.Start();
    USleep(50'000);
    EXPECT_FALSE(Derived<Timer>(oTimer).GetTimerStatus());
    EXPECT_GT(oClock.TimeSinceStart(), Derived<Clock>(oClock).TimeSinceStart() + 0.048);
}

TEST(Timer, CurrentTimeAsString) {
    std::time_t nNow;
    std::string sText;
    do {  // until the second doesn't turn meanwhile
        nNow = std::time(nullptr);
        sText = Timer::GetCurrentTimeAsString();
    } while (std::time(nullptr) != nNow);
    char szExpected[64];
    // The process has the locale "C".
    std::strftime(szExpected, sizeof szExpected, "%a %b %e %H:%M:%S %Y\n", std::localtime(&nNow));
    EXPECT_EQ(sText, szExpected);
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
