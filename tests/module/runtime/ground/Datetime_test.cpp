#include "module/runtime/ground/Datetime.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <string>
#include <thread>
#include <vector>

namespace KPRV {

namespace {

const Datetime_Rep* rep_of(const Datetime& x)
{
    return *reinterpret_cast<const Datetime_Rep* const*>(&x);
}

/// Runs the rest of a scope in another time zone.
class Time_Zone
{
public:
    explicit Time_Zone(const char* name)
    {
        if (const char* old = getenv("TZ"))
            _old = old;
        setenv("TZ", name, 1);
        tzset();
    }
    ~Time_Zone()
    {
        _old.empty() ? unsetenv("TZ") : setenv("TZ", _old.c_str(), 1);
        tzset();
    }

private:
    std::string _old;
};

} // namespace

TEST(Datetime, Constants)
{
    EXPECT_EQ(1u, Datetime::USEC);
    EXPECT_EQ(1000u, Datetime::MSEC);
    EXPECT_EQ(1000000u, Datetime::SEC);
    EXPECT_EQ(60000000u, Datetime::MIN);
    EXPECT_EQ(3600000000u, Datetime::HOUR);
    EXPECT_EQ(86400000000u, Datetime::DAY);
}

TEST(Datetime, Constructors)
{
    const Datetime none;
    EXPECT_TRUE(none.is_interval());
    EXPECT_EQ(0u, none.usec());
    const Datetime interval(uint64(5));
    EXPECT_TRUE(interval.is_interval());
    EXPECT_EQ(5u, interval.usec());
    const Datetime timestamp(7, -60);
    EXPECT_TRUE(timestamp.is_timestamp());
    EXPECT_EQ(7u, timestamp.usec());
    EXPECT_EQ(-60, timestamp.offset());
    const Datetime text(String("00000000000500.000000:000"));
    EXPECT_EQ(5 * Datetime::MIN, text.usec());
}

TEST(Datetime, AnInvalidTextLeavesAZeroTimestamp)
{
    const Datetime x("what");
    EXPECT_TRUE(x.is_timestamp());
    EXPECT_EQ(0u, x.usec());
    EXPECT_EQ(0, x.offset());
    EXPECT_FALSE(x == Datetime());
    EXPECT_TRUE(Datetime(static_cast<const char*>(nullptr)) == x);
}

TEST(Datetime, AnIntervalReadsBackTheSame)
{
    Datetime x;
    ASSERT_TRUE(x.set("00000000000500.000000:000"));
    EXPECT_TRUE(x.is_interval());
    EXPECT_EQ(5 * Datetime::MIN, x.usec());
    EXPECT_STREQ("00000000000500.000000:000", x.ascii().c_str());

    ASSERT_TRUE(x.set("12345678235959.987654:000"));
    uint32 days, hours, minutes, seconds, usec;
    x.get_interval(days, hours, minutes, seconds, usec);
    EXPECT_EQ(12345678u, days);
    EXPECT_EQ(23u, hours);
    EXPECT_EQ(59u, minutes);
    EXPECT_EQ(59u, seconds);
    EXPECT_EQ(987654u, usec);
    EXPECT_STREQ("12345678235959.987654:000", x.ascii(false).c_str());
    EXPECT_STREQ("12345678 23 59 59.987654:000", x.ascii(true).c_str());
}

TEST(Datetime, FieldsOfAnIntervalAreNotLimitedToTheirUnit)
{
    Datetime x;
    ASSERT_TRUE(x.set("99999999997799.000000:000"));
    EXPECT_EQ(99999999 * Datetime::DAY + 99 * Datetime::HOUR + 77 * Datetime::MIN + 99 * Datetime::SEC,
              x.usec());
}

TEST(Datetime, TheLastThreeCharactersOfAnIntervalAreNotTested)
{
    Datetime x;
    EXPECT_TRUE(x.set("00000000000001.000000:abc"));
    EXPECT_EQ(Datetime::SEC, x.usec());
}

TEST(Datetime, ATimestampReadsBackTheSame)
{
    for (const char* zone : {"UTC", "America/New_York", "XXX-5:30"}) {
        const Time_Zone guard(zone);
        for (const char* text : {"20240229235958.123456+000", "19991231000000.000000-300",
                                 "20260615120000.999999+120", "19700101000000.000000+000",
                                 // Beyond what 32 bits of seconds hold, and before the epoch.
                                 "20991231235959.000001+000", "19010101000000.500000-060"}) {
            Datetime x;
            ASSERT_TRUE(x.set(text));
            EXPECT_TRUE(x.is_timestamp());
            EXPECT_STREQ(text, x.ascii(false).c_str()) << zone;
        }
    }
}

// The offset is carried along and moves nothing: the fields are local time.
TEST(Datetime, TheFieldsOfATimestampAreLocalTime)
{
    const Time_Zone guard("XXX-2");
    Datetime x;
    ASSERT_TRUE(x.set("19700101020000.000000+300"));
    EXPECT_EQ(0u, x.usec());
    EXPECT_EQ(300, x.offset());
    uint32 year, month, day, hours, minutes, seconds, usec;
    sint32 utc;
    x.get_timestamp(year, month, day, hours, minutes, seconds, usec, utc);
    EXPECT_EQ(1970u, year);
    EXPECT_EQ(1u, month);
    EXPECT_EQ(1u, day);
    EXPECT_EQ(2u, hours);
    EXPECT_EQ(300, utc);
    ASSERT_TRUE(x.set("19700101020000.000000-300"));
    EXPECT_EQ(-300, x.offset());
    EXPECT_EQ(0u, x.usec());
}

TEST(Datetime, PrettyTimestamp)
{
    Datetime x;
    ASSERT_TRUE(x.set("20240229235958.123456-060"));
    EXPECT_STREQ("2024/02/29 23:59:58.123456-060", x.ascii(true).c_str());
}

TEST(Datetime, TextsThatDoNotParseLeaveTheValue)
{
    const Datetime before(42, 5);
    for (const char* text : {
             "",
             "00000000000500.000000:00",   // 24 characters
             "00000000000500.000000:0000", // 26
             "00000000000500.000000*000",  // no such form
             "00000000000500,000000:000",  // no point
             "0000000000050a.000000:000",
             "x0000000000500.000000:000",
             "00000000000500.00000x:000",
             "2024022923595x.123456+000",
             "20240229235958.123456+0x0",
             "20240229235958.12345*+000",
             "20240229235958,123456+000",
             "2024022923**58.123456+000",
         }) {
        Datetime x(before);
        EXPECT_FALSE(x.set(text)) << text;
        EXPECT_TRUE(x == before) << text;
    }
    Datetime x(before);
    EXPECT_FALSE(x.set(static_cast<const char*>(nullptr)));
}

TEST(Datetime, SetAndClear)
{
    Datetime x;
    x.set(10, 60);
    EXPECT_TRUE(x == Datetime(10, 60));
    x.set(uint64(11));
    EXPECT_TRUE(x == Datetime(uint64(11)));
    EXPECT_EQ(0, x.offset());
    x.clear();
    EXPECT_TRUE(x == Datetime());
    x.set_interval(1, 2, 3, 4, 5);
    EXPECT_EQ(Datetime::DAY + 2 * Datetime::HOUR + 3 * Datetime::MIN + 4 * Datetime::SEC + 5, x.usec());
}

TEST(Datetime, EqualityIsByAllThreeFields)
{
    EXPECT_TRUE(Datetime(5, 60) == Datetime(5, 60));
    EXPECT_FALSE(Datetime(5, 60) == Datetime(6, 60));
    EXPECT_FALSE(Datetime(5, 60) == Datetime(5, 0));
    EXPECT_FALSE(Datetime(5, 0) == Datetime(uint64(5)));
}

TEST(Datetime, CopiesShareUntilOneIsWritten)
{
    Datetime a(5, 60);
    Datetime b(a);
    EXPECT_EQ(rep_of(a), rep_of(b));
    EXPECT_EQ(2, rep_of(a)->refs);
    b.set(6, 60);
    EXPECT_NE(rep_of(a), rep_of(b));
    EXPECT_EQ(1, rep_of(a)->refs);
    EXPECT_EQ(5u, a.usec());
    b = a;
    EXPECT_EQ(2, rep_of(a)->refs);
    const Datetime& self = b;
    b = self;
    EXPECT_EQ(2, rep_of(a)->refs);
    b.clear();
    EXPECT_EQ(1, rep_of(a)->refs);
    EXPECT_EQ(5u, a.usec());
    const auto* const own = rep_of(a);
    a.set(7, 60);
    EXPECT_EQ(own, rep_of(a)) << "nobody else sees it";
}

TEST(Datetime, ZeroIntervalsStayZeroWhateverOthersWrite)
{
    Datetime a;
    const Datetime b;
    a.set(uint64(9));
    EXPECT_EQ(0u, b.usec());
    EXPECT_EQ(0u, Datetime().usec());
}

TEST(Datetime, Now)
{
    // A day, as in Time's test: the two looks are at different clocks, and clocks are set.
    const auto day = sint64(86400) * sint64(Datetime::SEC);
    const sint64 seconds = sint64(time(nullptr)) * sint64(Datetime::SEC);
    const Datetime x = Datetime::now();
    EXPECT_TRUE(x.is_timestamp());
    EXPECT_LT(std::abs(sint64(x.usec()) - seconds), day);
}

TEST(Datetime, TheLargestValuesFitTheBuffer)
{
    char buffer[33];
    for (bool pretty : {false, true}) {
        buffer[32] = 'X';
        Datetime(~uint64(0)).ascii(buffer, pretty);
        EXPECT_EQ('X', buffer[32]);
        Datetime(~uint64(0) >> 1, 2147483647).ascii(buffer, pretty);
        EXPECT_EQ('X', buffer[32]);
        Datetime(uint64(1) << 63, -2147483647 - 1).ascii(buffer, pretty);
        EXPECT_EQ('X', buffer[32]);
    }
}

TEST(Datetime, PrintWritesTheText)
{
    char* text = nullptr;
    size_t size = 0;
    FILE* file = open_memstream(&text, &size);
    const Datetime x(5 * Datetime::MIN);
    x.print(file, false);
    x.print(file);
    fclose(file);
    EXPECT_STREQ("00000000000500.000000:00000000000 00 05 00.000000:000", text);
    free(text);
}

TEST(Datetime, HandlesThatShareMayBeUsedFromDifferentThreads)
{
    const Datetime shared(5, 0);
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; t++) {
        threads.emplace_back([&shared] {
            for (int i = 0; i < 2000; i++) {
                Datetime mine(shared);
                mine.set(uint64(1));
                Datetime none;
                none = shared;
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(1, rep_of(shared)->refs);
}

} // namespace KPRV
