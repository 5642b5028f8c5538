#include "kldrcim/server/Object_Relay.h"

#include <gtest/gtest.h>

#include <atomic>
#include <set>
#include <stdexcept>

namespace KPRV::kldrcim {

namespace {

/// More than go without a thread, and no whole number of what is handed over at a time.
constexpr unsigned MANY = 1001;
/// What may be on its way at a time, and what goes without a thread.
constexpr unsigned UNDER_WAY = 3 * 32, FEW = 64;

Object_Relay::Object numbered(unsigned number)
{
    const std::string text = std::to_string(number);
    if (number % 2)
        return Path_Value{.class_name = text};
    return Instance_Value{.path = {.class_name = text}};
}

std::string text_of(const Object_Relay::Object& object)
{
    const auto* instance = std::get_if<Instance_Value>(&object);
    return (instance ? instance->path : std::get<Path_Value>(object)).class_name;
}

} // namespace

TEST(Object_Relay, KeepsTheOrderOfMany)
{
    std::vector<std::string> seen, expected;
    std::set<std::thread::id> threads;
    Object_Relay relay([&](Object_Relay::Object& object) {
        seen.push_back(text_of(object));
        threads.insert(std::this_thread::get_id());
        return true;
    });
    for (unsigned i = 0; i < MANY; ++i) {
        expected.push_back(std::to_string(i));
        EXPECT_TRUE(relay.put(numbered(i)));
    }
    relay.finish();
    EXPECT_EQ(expected, seen);
    EXPECT_EQ(2u, threads.size());
}

TEST(Object_Relay, BeginsNoThreadForAFew)
{
    unsigned count = 0;
    Object_Relay relay([&, here = std::this_thread::get_id()](Object_Relay::Object&) {
        EXPECT_EQ(here, std::this_thread::get_id());
        return ++count < FEW;
    });
    for (unsigned i = 0; i < FEW; ++i)
        EXPECT_EQ(i + 1 < FEW, relay.put(numbered(i)));
    relay.finish();
    EXPECT_EQ(FEW, count);
}

TEST(Object_Relay, TellsSoonThatNobodyWantsMore)
{
    unsigned seen = 0, given = 0;
    Object_Relay relay([&](Object_Relay::Object&) { return ++seen < FEW + 10; });
    while (given < MANY && relay.put(numbered(given)))
        ++given;
    EXPECT_LE(given, FEW + UNDER_WAY);
    relay.finish();
    EXPECT_EQ(FEW + 10, seen);
}

TEST(Object_Relay, WaitsForAFunctionThatIsSlow)
{
    std::atomic<unsigned> given = 0, seen = 0;
    Object_Relay relay([&](Object_Relay::Object&) {
        EXPECT_LE(given, seen + UNDER_WAY);
        ++seen;
        return true;
    });
    for (; given < MANY; ++given)
        relay.put(numbered(given));
    relay.finish();
    EXPECT_EQ(MANY, seen);
}

TEST(Object_Relay, HandsOnWhatTheFunctionThrows)
{
    unsigned seen = 0, given = 0;
    Object_Relay relay([&](Object_Relay::Object&) -> bool {
        if (++seen == FEW + 40)
            throw std::runtime_error("full");
        return true;
    });
    while (given < MANY && relay.put(numbered(given)))
        ++given;
    EXPECT_LE(given, FEW + 40 + UNDER_WAY);
    EXPECT_THROW(relay.finish(), std::runtime_error);
}

TEST(Object_Relay, EndsInTheMiddle)
{
    unsigned seen = 0;
    {
        Object_Relay relay([&](Object_Relay::Object&) { return ++seen != 0; });
        for (unsigned i = 0; i < MANY; ++i)
            relay.put(numbered(i));
    }
    EXPECT_LE(seen, MANY);
    EXPECT_GE(seen + UNDER_WAY, MANY);
}

} // namespace KPRV::kldrcim
