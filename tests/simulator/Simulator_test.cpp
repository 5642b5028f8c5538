#include "tests/simulator/Simulator_Fixture.h"

#include <atomic>
#include <dlfcn.h>
#include <thread>

namespace KPRV::simulator {
namespace {

class Simulator_test : public Simulator_Fixture
{
};

TEST_F(Simulator_test, RecordsEveryCallWithItsRequestInOrder)
{
    version();
    call("init_hba_lib", "{'appId': 2}");
    call("getHbaByWwn", "{'wwn': 'nobody'}");
    simulator.symbol<unsigned()>("getNumberOfAdapters")();
    const std::vector<Simulator_Call> calls = simulator.calls();
    EXPECT_EQ(simulator.call_names(), (std::vector<std::string>{"get_agt_version", "init_hba_lib",
                                                                "getHbaByWwn", "getNumberOfAdapters"}));
    EXPECT_TRUE(calls[0].request.isNull());
    EXPECT_EQ(calls[1].request, json("{'appId': 2}"));
    EXPECT_EQ(simulator.requests("getHbaByWwn").at(0), json("{'wwn': 'nobody'}"));
    simulator.clear_calls();
    EXPECT_TRUE(simulator.calls().empty());
}

TEST_F(Simulator_test, RecordsACallThatThrows)
{
    simulator.add_fault(R"({"call": "getHost", "do": "throw", "type": "int"})");
    EXPECT_ANY_THROW(call("getHost"));
    EXPECT_EQ(simulator.requests("getHost").size(), 1u);
}

TEST_F(Simulator_test, ForgetsTheOldestOfVeryManyCalls)
{
    call("getServerTime");
    for (int number = 0; number < 65536; ++number)
        integer("getRequestID");
    EXPECT_EQ(simulator.calls().size(), 65536u);
    EXPECT_TRUE(simulator.requests("getServerTime").empty());
}

TEST_F(Simulator_test, KeepsAsManyCallsAsItIsTold)
{
    for (const unsigned most : {2U, 1U, 0U}) {
        call("getHost");
        call("getServerTime");
        integer("getRequestID");
        simulator.keep_calls(most);
        const std::vector<std::string> latest = {"getServerTime", "getRequestID"};
        EXPECT_EQ(std::vector<std::string>(latest.end() - (most == 2 ? 2 : 1), latest.end()),
                  simulator.call_names());
        call("getHost");
        EXPECT_EQ(simulator.call_names().back(), "getHost");
        EXPECT_EQ(simulator.calls().size(), most == 2 ? 2U : 1U);
    }
    simulator.keep_calls(65536);
}

TEST_F(Simulator_test, ACallThatIsHeldLetsTheOthersGoOn)
{
    simulator.add_fault(R"({"call": "getHost", "do": "hold"})");
    std::atomic<bool> answered = false;
    std::thread caller([&] {
        call("getHost");
        answered = true;
    });
    EXPECT_TRUE(simulator.wait_for_calls("getHost", 1));
    EXPECT_TRUE(call("getGlobalInfo").isObject());
    EXPECT_FALSE(answered);
    EXPECT_FALSE(simulator.wait_for_calls("getHost", 2, 1));
    simulator.release();
    caller.join();
    EXPECT_TRUE(answered);
}

TEST_F(Simulator_test, ClearingTheFaultsLetsGoWhomTheyHold)
{
    simulator.add_fault(R"({"call": "getHost", "do": "hold"})");
    std::thread caller([&] { EXPECT_TRUE(call("getHost").isObject()); });
    EXPECT_TRUE(simulator.wait_for_calls("getHost", 1));
    simulator.clear_faults();
    caller.join();
}

TEST_F(Simulator_test, ManyThreadsMayCallAtOnce)
{
    simulator.load_file(inventory("demo.json"));
    const char* wwn = "10:00:02:4b:4c:10:00:00";
    std::atomic<int> wrong = 0;
    const auto work = [&](bool on) {
        Json::Value request;
        request["indexStr"] = wwn;
        request["port"]["beaconState"] = on;
        request["propArray"].append("beaconState");
        Json::Value question;
        question["wwn"] = wwn;
        for (int turn = 0; turn < 200; ++turn) {
            wrong += call("setPortByWwn", request)["status"] != Json::Value(0);
            wrong += !call("getPortByWwn", question)["beaconState"].isBool();
            wrong += call("getGlobalInfo")["numOfAdapters"] != Json::Value(3);
        }
    };
    std::vector<std::thread> threads;
    for (int number = 0; number < 4; ++number)
        threads.emplace_back(work, number % 2 == 0);
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(wrong, 0);
    EXPECT_EQ(simulator.calls().size(), 4u * 200 * 3);
}

TEST_F(Simulator_test, OneThatIsOpenIsFoundByItsBareName)
{
    void* library = dlopen("libdzntj.so", RTLD_NOW | RTLD_NOLOAD);
    EXPECT_NE(library, nullptr);
    dlclose(library);
}

TEST_F(Simulator_test, ALibraryOrAFunctionThatIsNotThereIsTold)
{
    EXPECT_THROW(Simulator_Control("no/such/library.so"), std::runtime_error);
    EXPECT_THROW(simulator.symbol<void()>("getNothing"), std::runtime_error);
}

} // namespace
} // namespace KPRV::simulator
