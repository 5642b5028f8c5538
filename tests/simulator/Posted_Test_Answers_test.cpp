#include "tests/simulator/Agent_Fixture.h"
#include "tests/support/Eventually.h"

#include <atomic>
#include <thread>

namespace KPRV::simulator {
namespace {

struct Post
{
    const char* function;
    const char* members;
};

#define HBA "'hbaWwn': '20:00:02:4b:4c:10:00:00'"
#define PORT "'portWwn': '10:00:02:4b:4c:10:00:00'"
#define LOOP "'mode': 1, 'speed': 8, 'numCycles': 1, 'frameCount': '10', 'dataPattern': 'ff'"
#define FAR "'localPortWwn': '10:00:02:4b:4c:10:00:00', 'vfID': 0, 'numCycles': 1, 'remotePortWwn': "
#define ARRAY "'50:24:b4:c0:00:40:00:01'"

// One of each that passes. The ports of a loopback test need no adapter.
constexpr Post posts[] = {
    {"QuickTest", HBA},
    {"MemoryTest", HBA},
    {"QueueTest", HBA ", " PORT},
    {"PCILoopbackTest", HBA ", " PORT ", 'frameCount': '10', 'dataPattern': 'ff', 'numCycles': 1"},
    {"LoopbackTest", PORT ", " LOOP},
    {"EthLoopbackTest", "'portWwn': '02:4b:4c:20:00:00', " LOOP},
    {"LEDTest", HBA ", " PORT ", 'ledBitmap': 1, 'command': 1, 'color': 1, 'frequency': 1"},
    {"EchoTest", HBA ", " PORT ", " FAR ARRAY},
    {"FCPingTest", HBA ", " PORT ", " FAR ARRAY},
    {"FCTraceTest", HBA ", " PORT ", " FAR ARRAY},
};

class Posted_Test_Answers_test : public Agent_Fixture
{
protected:
    static std::string post(const std::string& id, const std::string& function, const std::string& members)
    {
        return "{'function': '" + function + "', 'requestID': '" + id + "', " + members + "}";
    }

    static std::string start(const std::string& id, const char* stop = "false")
    {
        return "{'requestID': '" + id + "', 'stopOnError': " + stop + "}";
    }

    static std::string named(const std::string& id) { return "{'requestID': '" + id + "'}"; }

    Json::Value results(const std::string& id) { return call("getDiagnosticsResults", named(id).c_str()); }

    /// The states of the request's tests, with the outcome of those that are completed.
    std::string outcomes(const std::string& id)
    {
        std::string text;
        const Json::Value answer = results(id);
        for (const Json::Value& each : answer["results"])
            text += (text.empty() ? "" : " ") + each["state"].asString().substr(0, 4) +
                    (each.isMember("result") ? ":" + each["result"].asString() : "");
        return text;
    }

    void load(const std::string& tests)
    {
        simulator.load(json("{'postedTests': " + tests +
                            ", 'adapters': [{'hbaData': {'wwn': '20:00:02:4b:4c:10:00:00'}, "
                            "'fcPorts': [{'wwn': '10:00:02:4b:4c:10:00:00'}]}]}"));
    }
};

TEST_F(Posted_Test_Answers_test, EachTestIsPostedStartedAndPassed)
{
    for (const Post& each : posts) {
        SCOPED_TRACE(each.function);
        const std::string id = std::to_string(integer("getRequestID"));
        done("postDiagnostics", post(id, each.function, each.members));
        EXPECT_EQ(results(id)["state"], "Posted");
        EXPECT_EQ(outcomes(id), "Post");
        done("startTests", start(id));
        EXPECT_EQ(results(id)["state"], "Completed");
        EXPECT_EQ(outcomes(id), "Comp:Passed");
        EXPECT_EQ(results(id)["results"][0]["function"], each.function);
        EXPECT_EQ(results(id)["requestID"], id);
    }
}

TEST_F(Posted_Test_Answers_test, ATestThatLacksAMemberOrLeadsNowhereIsRefused)
{
    const std::tuple<const char*, const char*, int> wrong[] = {
        {"SlowTest", HBA, REQUEST},
        {"QuickTest", PORT, REQUEST},
        {"QueueTest", HBA, REQUEST},
        {"QueueTest", HBA ", 'portWwn': 7", REQUEST},
        {"LoopbackTest", PORT, REQUEST},
        {"QuickTest", "'hbaWwn': 'nowhere'", ADDRESS},
        {"QueueTest", HBA ", 'portWwn': 'nowhere'", ADDRESS},
        {"LoopbackTest", "'portWwn': '02:4b:4c:20:00:00', " LOOP, ADDRESS},
        {"EthLoopbackTest", PORT ", " LOOP, ADDRESS},
        {"EchoTest",
         HBA ", " PORT ", 'localPortWwn': 'nowhere', 'vfID': 0, 'numCycles': 1, 'remotePortWwn': " ARRAY,
         ADDRESS},
        {"EchoTest",
         HBA
         ", " PORT
         ", 'localPortWwn': '10:00:02:4b:4c:10:00:00', 'vfID': 1, 'numCycles': 1, 'remotePortWwn': " ARRAY,
         ADDRESS},
    };
    for (const auto& [function, members, code] : wrong)
        EXPECT_EQ(refused("postDiagnostics", post("1", function, members)), code) << function << members;
    EXPECT_EQ(refused("postDiagnostics", post("", "QuickTest", HBA)), REQUEST);
    EXPECT_EQ(refused("postDiagnostics", "{'function': 'QuickTest', 'requestID': 1, " HBA "}"), REQUEST);
    EXPECT_EQ(refused("getDiagnosticsResults", named("1")), NOT_FOUND);
}

TEST_F(Posted_Test_Answers_test, WhatCannotWorkFailsAndSaysWhy)
{
    const std::pair<std::string, std::string> failing[] = {
        {"'function': 'LoopbackTest', 'portWwn': '10:00:02:4b:4c:10:00:01', " LOOP,
         "nothing is plugged into the port"},
        {"'function': 'EchoTest', " HBA ", " PORT ", " FAR "'50:00:00:00:00:00:00:00'",
         "no answer from \"50:00:00:00:00:00:00:00\""},
        {"'function': 'EchoTest', " HBA ", " PORT ", " FAR "7", "no answer from 7"},
        {"'function': 'DPortTest', " HBA ", " PORT ", 'frameCount': '1', 'dataPattern': 'f', 'numCycles': 1",
         "the port is not enabled as a D-Port"},
    };
    int number = 0;
    for (const auto& [members, reason] : failing) {
        const std::string id = "f" + std::to_string(++number);
        done("postDiagnostics", "{'requestID': '" + id + "', " + members + "}");
        done("startTests", start(id));
        EXPECT_EQ(outcomes(id), "Comp:Failed");
        EXPECT_EQ(results(id)["results"][0]["reason"], reason);
    }
    call("setPortByWwn", "{'indexStr': '10:00:02:4b:4c:10:00:00', 'port': {'portStatus': false}, "
                         "'propArray': ['portStatus']}");
    done("postDiagnostics", post("off", "FCPingTest", HBA ", " PORT ", " FAR ARRAY));
    done("startTests", start("off"));
    EXPECT_EQ(results("off")["results"][0]["reason"], "the port is disabled");
}

TEST_F(Posted_Test_Answers_test, AfterAFailureTheRestRunsOnlyIfAskedTo)
{
    load("{'failing': ['MemoryTest']}");
    for (const char* id : {"go on", "stop"})
        for (const char* function : {"QuickTest", "MemoryTest", "QuickTest"})
            done("postDiagnostics", post(id, function, HBA));
    done("startTests", start("go on"));
    EXPECT_EQ(outcomes("go on"), "Comp:Passed Comp:Failed Comp:Passed");
    done("startTests", start("stop", "true"));
    EXPECT_EQ(outcomes("stop"), "Comp:Passed Comp:Failed Not ");
    EXPECT_EQ(results("stop")["state"], "Completed");
}

TEST_F(Posted_Test_Answers_test, TestsRunOneAfterTheOtherAndCanBeCancelled)
{
    load("{'milliseconds': 600000}");
    done("postDiagnostics", post("1", "QuickTest", HBA));
    done("postDiagnostics", post("1", "MemoryTest", HBA));
    done("startTests", start("1"));
    EXPECT_EQ(results("1")["state"], "Running");
    EXPECT_EQ(outcomes("1"), "Runn Post");
    EXPECT_EQ(results("1")["results"][0]["percentComplete"], Json::Value(0));
    EXPECT_EQ(refused("startTests", start("1")), CONFLICT);
    EXPECT_EQ(refused("postDiagnostics", post("1", "QuickTest", HBA)), CONFLICT);
    done("cancelTests", named("1"));
    EXPECT_EQ(results("1")["state"], "Cancelled");
    EXPECT_EQ(outcomes("1"), "Canc Canc");
    EXPECT_EQ(refused("cancelTests", named("1")), CONFLICT);
}

TEST_F(Posted_Test_Answers_test, ARunningTestEndsByItself)
{
    load("{'milliseconds': 5}");
    done("postDiagnostics", post("1", "QuickTest", HBA));
    done("startTests", start("1"));
    EXPECT_TRUE(eventually([&] { return results("1")["state"] == "Completed"; }));
    EXPECT_EQ(outcomes("1"), "Comp:Passed");
}

TEST_F(Posted_Test_Answers_test, AnIdIsKnownFromItsFirstTestOnAndUsedOnce)
{
    EXPECT_EQ(refused("startTests", start("1")), NOT_FOUND);
    EXPECT_EQ(refused("cancelTests", named("1")), NOT_FOUND);
    done("postDiagnostics", post("1", "QuickTest", HBA));
    EXPECT_EQ(refused("startTests", "{'requestID': '1', 'stopOnError': 1}"), REQUEST);
    EXPECT_EQ(refused("startTests", "{'requestID': 1, 'stopOnError': true}"), REQUEST);
    done("startTests", start("1"));
    EXPECT_EQ(refused("startTests", start("1")), CONFLICT);
    EXPECT_EQ(refused("cancelTests", named("1")), CONFLICT);
    done("postDiagnostics", post("2", "QuickTest", HBA));
    done("cancelTests", named("2"));
    EXPECT_EQ(outcomes("2"), "Canc");
    EXPECT_EQ(refused("startTests", start("2")), CONFLICT);
}

TEST_F(Posted_Test_Answers_test, OfVeryManyRequestsTheOldestIsForgotten)
{
    for (int number = 0; number <= 1024; ++number)
        done("postDiagnostics", post(std::to_string(number), "QuickTest", HBA));
    EXPECT_EQ(refused("getDiagnosticsResults", named("0")), NOT_FOUND);
    EXPECT_EQ(results("1")["state"], "Posted");
    EXPECT_EQ(results("1024")["state"], "Posted");
}

TEST_F(Posted_Test_Answers_test, ADiagnosticPortIsEnabledAndTellsItsResults)
{
    const std::string enable = "{'requestID': '5', 'portWwn': '10:00:02:4b:4c:10:00:00', 'state': ";
    const char* port = "{'portWwn': '10:00:02:4b:4c:10:00:00'}";
    EXPECT_EQ(refused("getDPortTestResult", port), CONFLICT);
    done("setDport", enable + "true}");
    const Json::Value result = call("getDPortTestResult", port);
    EXPECT_EQ(result["requestID"], "5");
    EXPECT_EQ(result["opticalLoopback"], "Passed");
    done("postDiagnostics",
         post("6", "DPortTest", HBA ", " PORT ", 'frameCount': '1', 'dataPattern': 'f', 'numCycles': 1"));
    done("startTests", start("6"));
    EXPECT_EQ(outcomes("6"), "Comp:Passed");
    done("setDport", enable + "false}");
    EXPECT_EQ(refused("getDPortTestResult", port), CONFLICT);
    EXPECT_EQ(refused("setDport", enable + "1}"), REQUEST);
    EXPECT_EQ(refused("setDport", "{'requestID': 5, 'portWwn': '10:00:02:4b:4c:10:00:00', 'state': true}"),
              REQUEST);
    EXPECT_EQ(refused("setDport", "{'requestID': '5', 'portWwn': '02:4b:4c:20:00:00', 'state': true}"),
              ADDRESS);
    EXPECT_EQ(refused("getDPortTestResult", "{'portWwn': 'nowhere'}"), ADDRESS);
}

TEST_F(Posted_Test_Answers_test, OneOfSeveralThreadsStartsARequest)
{
    done("postDiagnostics", post("1", "QuickTest", HBA));
    std::atomic<int> started = 0;
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 8; ++thread)
        threads.emplace_back([&] { started += refused("startTests", start("1")) == 0; });
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(started, 1);
}

} // namespace
} // namespace KPRV::simulator
