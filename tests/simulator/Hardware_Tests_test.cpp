#include "tests/simulator/Simulator_Fixture.h"

#include <atomic>
#include <chrono>
#include <thread>

namespace KPRV::simulator {
namespace {

class Hardware_Tests_test : public Simulator_Fixture
{
protected:
    /// One CNA whose adapter and ports have these outcomes.
    void load(const std::string& adapter, const std::string& fc = "{}", const std::string& eth = "{}")
    {
        simulator.load(
            json("{'adapters': [{'hbaData': {'hbaMAC': '02:4b:4c:20:00:00'}, 'diagnostics': " + adapter +
                 ", 'fcPorts': [{'wwn': '10:00:02:4b:4c:20:00:00', 'diagnostics': " + fc +
                 "}], 'ethPorts': [{'mac': '02:4b:4c:20:00:01', 'diagnostics': " + eth + "}]}]}"));
    }
    Json::Value memory() { return call("diagMemoryTest", "{'hbaWwn': '02:4b:4c:20:00:00'}"); }
    Json::Value loopback()
    {
        return call("diagLoopbackTest", "{'portWwn': '10:00:02:4b:4c:20:00:00', 'mode': 1, 'speed': 4,"
                                        " 'dataPattern': 3048584629, 'frameCount': 131072}");
    }
    Json::Value eth_loopback()
    {
        return call("diagEthLoopbackTest", "{'portWwn': '02:4b:4c:20:00:01', 'mode': 4,"
                                           " 'dataPattern': 3048584629, 'frameCount': 65536}");
    }
    Json::Value pci(const char* address)
    {
        return call("diagPCILoopbackTest",
                    json(std::string("{'dataPattern': 1, 'frameCount': 2, 'portWwn': '") + address + "'}"));
    }
    std::string refusal(const std::string& outcomes)
    {
        try {
            load(outcomes);
        } catch (const std::runtime_error& error) {
            return error.what();
        }
        return "";
    }
};

TEST_F(Hardware_Tests_test, PassByDefault)
{
    load("{}");
    EXPECT_EQ(memory(), json("{'failed': false, 'output': 'Test passed'}"));
    EXPECT_EQ(loopback(), json("{'failed': false, 'output': 'Test passed', 'transmitFrames': 131072,"
                               " 'GoodFrameRcv': 131072, 'outstandingFrames': 0, 'BadFrameNo': 0,"
                               " 'BadFrameInfo': 0}"));
    EXPECT_EQ(eth_loopback()["GoodFrameRcv"], Json::Value(65536));
    EXPECT_EQ(pci("02:4b:4c:20:00:01"), json("{'failed': false, 'output': 'Test passed'}"));
    EXPECT_EQ(pci("10:00:02:4b:4c:20:00:00"), json("{'failed': false, 'output': 'Test passed'}"));
}

TEST_F(Hardware_Tests_test, FailAsTold)
{
    load("{'diagMemoryTest': {'outcome': 'fail', 'status': 17, 'expected value': 5, 'type': 'march',"
         " 'output': 'bit 3'}}",
         "{'diagLoopbackTest': {'outcome': 'fail', 'BadFrameInfo': 9},"
         " 'diagPCILoopbackTest': {'outcome': 'fail', 'output': 'parity'}}",
         "{'diagEthLoopbackTest': {'outcome': 'fail', 'GoodFrameRcv': 1}}");
    EXPECT_EQ(memory(), json("{'failed': true, 'output': 'bit 3', 'status': 17, 'expected value': 5,"
                             " 'type': 'march'}"));
    EXPECT_EQ(loopback(), json("{'failed': true, 'output': 'Test failed', 'transmitFrames': 131072,"
                               " 'GoodFrameRcv': 131071, 'outstandingFrames': 1, 'BadFrameNo': 0,"
                               " 'BadFrameInfo': 9}"));
    EXPECT_EQ(pci("10:00:02:4b:4c:20:00:00"), json("{'failed': true, 'output': 'parity'}"));
    EXPECT_EQ(pci("02:4b:4c:20:00:01")["failed"], Json::Value(false));
    EXPECT_EQ(eth_loopback()["GoodFrameRcv"], Json::Value(1));
}

TEST_F(Hardware_Tests_test, GoWrongAsTold)
{
    load("{'diagMemoryTest': {'outcome': 'error', 'code': 7, 'message': 'busy'}}",
         "{'diagLoopbackTest': {'outcome': 'std::runtime_error', 'message': 'lost'}}",
         "{'diagEthLoopbackTest': {'outcome': 'int', 'code': 3}}");
    EXPECT_EQ(memory()["error"], json("{'name': 'LibraryError', 'code': 7, 'message': 'busy'}"));
    EXPECT_THROW(loopback(), std::runtime_error);
    EXPECT_THROW(eth_loopback(), int);
}

TEST_F(Hardware_Tests_test, TakeTheirTimeAndHoldNobodyUp)
{
    load("{'diagMemoryTest': {'milliseconds': 500}}");
    const auto begin = std::chrono::steady_clock::now();
    std::atomic<bool> over = false;
    std::thread tester([&] {
        EXPECT_FALSE(memory()["failed"].asBool());
        over = true;
    });
    EXPECT_TRUE(simulator.wait_for_calls("diagMemoryTest", 1));
    EXPECT_EQ(0, error_code(call("getAllAdaptersIndexString")));
    EXPECT_FALSE(over);
    tester.join();
    EXPECT_GE(std::chrono::steady_clock::now() - begin, std::chrono::milliseconds(500));
}

TEST_F(Hardware_Tests_test, NeedWhatTheyTest)
{
    load("{}");
    EXPECT_EQ(2, error_code(pci("02:4b:4c:20:00:99")));
    EXPECT_EQ(2, error_code(call("diagMemoryTest", "{'hbaWwn': '10:00:02:4b:4c:20:00:00'}")));
    EXPECT_EQ(1, error_code(call("diagMemoryTest", "{}")));
}

TEST_F(Hardware_Tests_test, AreRefusedWhereTheyMakeNoSense)
{
    EXPECT_NE(std::string::npos, refusal("{'getHost': {}}").find("is no entry point that tests"));
    EXPECT_NE(std::string::npos,
              refusal("{'diagMemoryTest': {'outcome': 'maybe'}}").find("unknown outcome \"maybe\""));
    EXPECT_NE(std::string::npos,
              refusal("{'diagMemoryTest': {'BadFrameNo': 1}}").find("unknown member \"BadFrameNo\""));
    EXPECT_NE(std::string::npos, refusal("{'diagMemoryTest': 1}").find("must be an object"));
}

} // namespace
} // namespace KPRV::simulator
