#include "tests/simulator/Simulator_Fixture.h"
#include "tests/support/Temp_Folder.h"

#include <sstream>

namespace KPRV::simulator {
namespace {

std::string received;

void receive_log(int level, const char* file, int line, const char* text)
{
    std::ostringstream words;
    words << level << " " << file << " " << line << " " << text;
    received = words.str();
}

void receive_event(const char* text)
{
    received = text;
}

class Life_test : public Simulator_Fixture
{
protected:
    Life_test() { received.clear(); }

    void register_log(void (*callback)(int, const char*, int, const char*))
    {
        simulator.symbol<void(void (*)(int, const char*, int, const char*))>("registerLogMsgCb")(callback);
    }
    void register_event(void (*callback)(const char*))
    {
        simulator.symbol<void(void (*)(const char*))>("registerEventProcessingCb")(callback);
    }
    unsigned adapters() { return simulator.symbol<unsigned()>("getNumberOfAdapters")(); }
};

TEST_F(Life_test, AHostWithoutAnInventoryHasNoAdaptersAndInitialises)
{
    EXPECT_EQ(call("init_hba_lib", "{'appId': 2}"), json("{'result': 0}"));
    EXPECT_TRUE(simulator.status()["initialised"].asBool());
    EXPECT_EQ(adapters(), 0u);
    EXPECT_STREQ(version(), "3.2.1");
    EXPECT_EQ(call("getAllAdaptersIndexString"), json("{'indexStrings': []}"));
    EXPECT_EQ(integer("free_hba_lib"), 0);
    EXPECT_FALSE(simulator.status()["initialised"].asBool());
}

TEST_F(Life_test, TheEnvironmentNamesTheInventoryAnewAfterEachGoodbye)
{
    setenv("KLDR_SIMULATOR_INVENTORY", inventory("one_hba.json").c_str(), 1);
    integer("free_hba_lib");
    EXPECT_EQ(adapters(), 1u);
    setenv("KLDR_SIMULATOR_INVENTORY", inventory("twins.json").c_str(), 1);
    EXPECT_EQ(adapters(), 1u);
    integer("free_hba_lib");
    EXPECT_EQ(adapters(), 2u);
}

TEST_F(Life_test, TheEnvironmentSaysHowManyCallsAreRemembered)
{
    {
        const Environment_Override calls("KLDR_SIMULATOR_CALLS", "2");
        integer("free_hba_lib");
        for (int number = 0; number < 5; ++number)
            integer("getRequestID");
        EXPECT_EQ(simulator.calls().size(), 2u);
    }
    const Environment_Override calls("KLDR_SIMULATOR_CALLS", "2 or so");
    integer("free_hba_lib");
    testing::internal::CaptureStderr();
    call("init_hba_lib", "{'appId': 2}");
    EXPECT_EQ(testing::internal::GetCapturedStderr(),
              "simulator: KLDR_SIMULATOR_CALLS: \"2 or so\" is no number\n");
    simulator.keep_calls(65536);
}

TEST_F(Life_test, AnInventoryThatATestGaveOutlivesTheGoodbye)
{
    simulator.load_file(inventory("twins.json"));
    integer("free_hba_lib");
    EXPECT_EQ(adapters(), 2u);
    simulator.reset();
    EXPECT_EQ(adapters(), 0u);
}

TEST_F(Life_test, TheVersionMayBeAnyTextOrNone)
{
    simulator.load_text(R"({"library": {"version": "4.1.0"}})");
    const char* kept = version();
    simulator.load_text(R"({"library": {"version": null}})");
    EXPECT_EQ(version(), nullptr);
    EXPECT_STREQ(kept, "4.1.0");
}

TEST_F(Life_test, InitialisingMayFailByResultOrByAnyObject)
{
    simulator.load_text(R"({"library": {"init": 7}})");
    EXPECT_EQ(call("init_hba_lib", "{'appId': 2}"), json("{'result': 7}"));
    simulator.load_text(R"({"library": {"init": {}}})");
    EXPECT_EQ(call("init_hba_lib", "{'appId': 2}"), json("{}"));
}

TEST_F(Life_test, LogLinesReachTheCallbackWhileItIsRegistered)
{
    EXPECT_FALSE(simulator.log(1, "port.c", 3, "x"));
    register_log(receive_log);
    EXPECT_TRUE(simulator.status()["logCallback"].asBool());
    EXPECT_TRUE(simulator.log(4, "port.c", 12, "link down"));
    EXPECT_EQ(received, "4 port.c 12 link down");
    EXPECT_EQ(simulator.requests("registerLogMsgCb").at(0), json("{'callback': true}"));
    integer("free_hba_lib");
    EXPECT_FALSE(simulator.log(4, "port.c", 12, "late"));
}

TEST_F(Life_test, EventsReachACallerThatHasRegisteredTwice)
{
    register_event(receive_event);
    EXPECT_FALSE(simulator.event("{}"));
    EXPECT_EQ(call("register_for_events", "{'dropOldEvents': true}"), json("{'status': 0}"));
    EXPECT_TRUE(simulator.event("{\"eventId\": 1}"));
    EXPECT_EQ(received, "{\"eventId\": 1}");
    call("unregister_for_events");
    EXPECT_FALSE(simulator.event("{}"));
    call("register_for_events", "{'dropOldEvents': false}");
    register_event(nullptr);
    EXPECT_FALSE(simulator.event("{}"));
    EXPECT_EQ(simulator.requests("registerEventProcessingCb").at(1), json("{'callback': false}"));
}

TEST_F(Life_test, RequestIdsAreNeverGivenTwice)
{
    const int first = integer("getRequestID");
    EXPECT_EQ(integer("getRequestID"), first + 1);
}

} // namespace
} // namespace KPRV::simulator
