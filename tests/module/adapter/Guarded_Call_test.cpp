#include "module/adapter/Guarded_Call.h"

#include "tests/support/Eventually.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

#include <atomic>
#include <pthread.h>

using namespace KPRV;

namespace {

struct Guarded_Call : testing::Test
{
    Fake_Library library;
    Log_Capture log;
    Json::Value response = "left over";

    bool call(const Guarded_Entry& entry)
    {
        return guarded_call(LOG_HERE, entry, libGetPortByWwn, json("{'wwn': 'a'}"), response);
    }
};

} // namespace

TEST_F(Guarded_Call, HandsOverRequestAndAnswer)
{
    library.answers("getPortByWwn", json("{'a': 1}"));
    EXPECT_TRUE(call({"libGetPortByWwn"}));
    EXPECT_EQ(response, json("{'a': 1}"));
    EXPECT_EQ(library.told(), Lines{R"(getPortByWwn {"wwn":"a"})"});
    EXPECT_EQ(log.said(), Lines{});
}

TEST_F(Guarded_Call, AnExceptionLeavesNullAndALineOfTheCaller)
{
    library.throws("getPortByWwn", HbaAgentError{-7, "busy"});
    EXPECT_FALSE(call({"libGetPortByWwn"}));
    EXPECT_TRUE(response.isNull());
    library.throws("getPortByWwn", std::runtime_error("broken"));
    EXPECT_FALSE(call({"libGetPortByWwn"}));
    library.throws("getPortByWwn", 5);
    EXPECT_FALSE(call({"libGetPortByWwn"}));
    EXPECT_EQ(log.said(), (Lines{"ERR libGetPortByWwn got User exception -7: busy",
                                 "ERR libGetPortByWwn got std exception: broken",
                                 "ERR libGetPortByWwn got default exception"}));
    EXPECT_EQ(log.lines().front().file, "Guarded_Call_test.cpp");
}

TEST_F(Guarded_Call, AnAddressStartsEachText)
{
    const Guarded_Entry entry = {"libGetHbaByWwn", "10:00"};
    library.throws("getPortByWwn", HbaAgentError{7, "busy"});
    call(entry);
    library.throws("getPortByWwn", std::runtime_error("broken"));
    call(entry);
    library.throws("getPortByWwn", "other");
    call(entry);
    EXPECT_EQ(log.said(), (Lines{"ERR 10:00 - libGetHbaByWwn got User exception 7: busy",
                                 "ERR 10:00 - libGetHbaByWwn got std exception: broken",
                                 "ERR 10:00 - libGetHbaByWwn got default exception"}));
}

TEST_F(Guarded_Call, TheThirdTextCanEndInItsAddress)
{
    library.throws("getPortByWwn", 5);
    call({"libGetPortByWwn", "10:00", "10:00"});
    call({.name = "libSetAdapterState", .default_for = "10:00"});
    library.throws("getPortByWwn", HbaAgentError{7, "100 % busy"});
    call({"libGetPortByWwn", "10:00", "10:00"});
    EXPECT_EQ(log.said(), (Lines{"ERR libGetPortByWwn got default exception for 10:00",
                                 "ERR libSetAdapterState got default exception for 10:00",
                                 "ERR 10:00 - libGetPortByWwn got User exception 7: 100 % busy"}));
}

// As hardware tests run: what the C library keeps of such a thread is not what it keeps of one that is
// joined.
TEST_F(Guarded_Call, DoesNotHoldUpADetachedThreadThatEnds)
{
    static std::atomic<bool> is_unwound;
    is_unwound = false;
    struct Told
    {
        ~Told() { is_unwound = true; }
    };
    static std::atomic<bool> has_come_back;
    has_come_back = false;
    library.answers("getPortByWwn", [](const Json::Value&) -> Json::Value { pthread_exit(nullptr); });
    pthread_t thread;
    ASSERT_EQ(pthread_create(
                  &thread, nullptr,
                  [](void* test) -> void* {
                      pthread_detach(pthread_self());
                      const Told told;
                      static_cast<Guarded_Call*>(test)->call({"libGetPortByWwn"});
                      has_come_back = true;
                      return nullptr;
                  },
                  this),
              0);
    EXPECT_TRUE(eventually([] { return is_unwound.load(); }));
    EXPECT_FALSE(has_come_back);
    EXPECT_EQ(log.said(), Lines{});
}

TEST_F(Guarded_Call, DoesNotHoldUpACancelledThread)
{
    library.answers("getPortByWwn", [](const Json::Value&) -> Json::Value { pthread_exit(nullptr); });
    pthread_t thread;
    ASSERT_EQ(pthread_create(
                  &thread, nullptr,
                  [](void* test) -> void* {
                      static_cast<Guarded_Call*>(test)->call({"libGetPortByWwn"});
                      return test;
                  },
                  this),
              0);
    void* result = this;
    pthread_join(thread, &result);
    EXPECT_EQ(result, nullptr);
    EXPECT_EQ(log.said(), Lines{});
}
