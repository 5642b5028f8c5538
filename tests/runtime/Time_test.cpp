#include "runtime/Time.h"

#include <csignal>
#include <ctime>
#include <gtest/gtest.h>
#include <sys/time.h>

using namespace KPRV;

TEST(Time, units_are_microseconds)
{
    EXPECT_EQ(Time::USEC, 1u);
    EXPECT_EQ(Time::MSEC, 1000u);
    EXPECT_EQ(Time::SEC, 1000000u);
}

TEST(Time, now_counts_from_the_epoch)
{
    const time_t before = time(nullptr);
    const uint64 now = Time::now();
    const time_t after = time(nullptr);
    EXPECT_GE(now + Time::SEC, uint64(before) * Time::SEC);
    EXPECT_LT(now, uint64(after + 1) * Time::SEC);
}

TEST(Time, sleep_takes_at_least_its_time)
{
    const uint64 start = Time::now();
    Time::sleep(20 * Time::MSEC);
    EXPECT_GE(Time::now() - start, 20 * Time::MSEC);
}

TEST(Time, sleep_splits_seconds_and_remainder)
{
    const uint64 start = Time::now();
    Time::sleep(Time::SEC + 10 * Time::MSEC);
    EXPECT_GE(Time::now() - start, Time::SEC + 10 * Time::MSEC);
}

TEST(Time, sleep_of_nothing_returns_at_once)
{
    const uint64 start = Time::now();
    Time::sleep(0);
    EXPECT_LT(Time::now() - start, Time::SEC);
}

TEST(Time, monotonic_runs_with_the_steady_clock)
{
    const auto steady = [] {
        timespec time;
        clock_gettime(CLOCK_MONOTONIC, &time);
        return uint64(time.tv_sec) * 1000000 + uint64(time.tv_nsec) / 1000;
    };
    const uint64 before = steady();
    const uint64 moment = Time::monotonic();
    EXPECT_LE(before, moment);
    EXPECT_LE(moment, steady());
}

TEST(Time, sleep_until_ends_at_its_moment)
{
    const uint64 start = Time::monotonic();
    const uint64 moment = start + 20 * Time::MSEC;
    Time::sleep_until(moment);
    EXPECT_GE(Time::monotonic(), moment);
    EXPECT_LT(Time::monotonic() - start, 30 * Time::SEC);
}

TEST(Time, sleep_until_the_past_returns_at_once)
{
    const uint64 start = Time::monotonic();
    Time::sleep_until(start);
    Time::sleep_until(0);
    EXPECT_LT(Time::monotonic() - start, Time::SEC);
}

TEST(Time, sleep_until_sleeps_on_after_a_signal)
{
    static volatile sig_atomic_t signals = 0;
    struct sigaction count = {}, before = {};
    count.sa_handler = [](int) { signals = signals + 1; };
    ASSERT_EQ(0, sigaction(SIGALRM, &count, &before));
    const itimerval every_5_ms = {{0, 5000}, {0, 5000}};
    const uint64 moment = Time::monotonic() + 50 * Time::MSEC;
    setitimer(ITIMER_REAL, &every_5_ms, nullptr);
    Time::sleep_until(moment);
    EXPECT_GE(Time::monotonic(), moment);
    const itimerval never = {};
    setitimer(ITIMER_REAL, &never, nullptr);
    EXPECT_GT(signals, 0);
    sigaction(SIGALRM, &before, nullptr);
}
