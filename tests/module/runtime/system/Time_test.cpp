#include "module/runtime/system/Time.h"
#include "tests/support/Eventually.h"

#include <chrono>
#include <csignal>
#include <cstdlib>
#include <ctime>
#include <gtest/gtest.h>
#include <sys/time.h>

using namespace KPRV;

/// One that nobody sets.
using Clock = std::chrono::steady_clock;

TEST(Time, UnitsAreMicroseconds)
{
    EXPECT_EQ(Time::USEC, 1u);
    EXPECT_EQ(Time::MSEC, 1000u);
    EXPECT_EQ(Time::SEC, 1000000u);
}

TEST(Time, NowCountsFromTheEpoch)
{
    // Two looks at clocks are apart by what the machine does in between, and clocks are set: a day shows the
    // epoch and the unit as well.
    const sint64 day = 86400 * sint64(Time::SEC);
    EXPECT_LT(std::abs(sint64(Time::now()) - sint64(time(nullptr)) * sint64(Time::SEC)), day);
}

TEST(Time, SleepTakesAtLeastItsTime)
{
    const auto start = Clock::now();
    Time::sleep(20 * Time::MSEC);
    EXPECT_GE(Clock::now() - start, std::chrono::milliseconds(20));
}

TEST(Time, SleepSplitsSecondsAndRemainder)
{
    const auto start = Clock::now();
    Time::sleep(Time::SEC + 10 * Time::MSEC);
    EXPECT_GE(Clock::now() - start, std::chrono::milliseconds(1010));
}

TEST(Time, SleepOfNothingReturnsAtOnce)
{
    const auto start = Clock::now();
    Time::sleep(0);
    EXPECT_LT(Clock::now() - start, PATIENCE);
}

TEST(Time, SleepSleepsOnAfterASignal)
{
    static volatile sig_atomic_t signals = 0;
    struct sigaction count = {}, before = {};
    count.sa_handler = [](int) { signals = signals + 1; };
    ASSERT_EQ(0, sigaction(SIGALRM, &count, &before));
    const itimerval every_5_ms = {{0, 5000}, {0, 5000}};
    const auto start = Clock::now();
    setitimer(ITIMER_REAL, &every_5_ms, nullptr);
    Time::sleep(50 * Time::MSEC);
    EXPECT_GE(Clock::now() - start, std::chrono::milliseconds(50));
    const itimerval never = {};
    setitimer(ITIMER_REAL, &never, nullptr);
    EXPECT_GT(signals, 0);
    sigaction(SIGALRM, &before, nullptr);
}
