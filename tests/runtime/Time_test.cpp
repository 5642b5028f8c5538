#include "runtime/Time.h"

#include <ctime>
#include <gtest/gtest.h>

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
