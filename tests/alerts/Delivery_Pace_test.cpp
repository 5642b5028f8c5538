// The rhythm of the delivery thread, over a clock that the test sets.
#include "tests/alerts/Alert_Delivery.h"

#include <gtest/gtest.h>
#include <vector>

namespace KPRV {
namespace {

using Moments = std::vector<uint64>;

class Passes_of_Delivery : public testing::Test
{
protected:
    Passes_of_Delivery()
    {
        slept_until.clear();
        lateness = 0;
        Pace_Override::clock = 1000000;
    }
    static void work(uint64 microseconds) { Pace_Override::clock += microseconds; }

    static inline Moments slept_until;
    /// How long after its moment a sleep ends.
    static inline uint64 lateness;
    const Pace_Override pace{[](uint64 moment) {
        EXPECT_GT(moment, Pace_Override::clock) << "every pass has a sleep";
        slept_until.push_back(moment);
        Pace_Override::clock = moment + lateness;
    }};
};

TEST(Delivery_Pace, IsTheClockThatNobodySets)
{
    EXPECT_EQ(&Time::monotonic, delivery_pace.now);
    EXPECT_EQ(&Time::sleep_until, delivery_pace.sleep_until);
}

TEST_F(Passes_of_Delivery, APassTakesAPeriodWhateverItsWorkTakesOfIt)
{
    Delivery_Passes passes;
    for (const uint64 microseconds : {0, 200, 3000, 19999, 0}) {
        work(microseconds);
        passes.sleep_to_end();
    }
    EXPECT_EQ((Moments{1020000, 1040000, 1060000, 1080000, 1100000}), slept_until);
}

TEST_F(Passes_of_Delivery, ASleepThatEndsLateIsMadeUpForByTheNext)
{
    Delivery_Passes passes;
    lateness = 170;
    for (int i = 0; i < 50; i++) {
        work(100);
        passes.sleep_to_end();
    }
    EXPECT_EQ(2000000u, slept_until.back()) << "50 passes are a second";
}

TEST_F(Passes_of_Delivery, AfterAStallThePeriodsBeginAnewAndNothingIsCaughtUpWith)
{
    Delivery_Passes passes;
    passes.sleep_to_end();
    work(2000005);
    passes.sleep_to_end();
    passes.sleep_to_end();
    // A pass that took the whole period sleeps as well.
    work(20000);
    passes.sleep_to_end();
    passes.sleep_to_end();
    EXPECT_EQ((Moments{1020000, 3040005, 3060005, 3100005, 3120005}), slept_until);
}

TEST_F(Passes_of_Delivery, ASleepThatEndsAPeriodLateIsAStallToo)
{
    Delivery_Passes passes;
    lateness = 45000;
    passes.sleep_to_end();
    lateness = 0;
    passes.sleep_to_end();
    passes.sleep_to_end();
    EXPECT_EQ((Moments{1020000, 1085000, 1105000}), slept_until);
}

} // namespace
} // namespace KPRV
