#include "tests/module/agent/Agent_Fixture.h"

namespace KPRV {
namespace {

/// The tests of paths to several targets, by wire name and what the library calls them.
class Targeted_Tests : public Agent_Fixture,
                       public ::testing::WithParamInterface<std::pair<const char*, const char*>>
{
protected:
    const std::string method = std::string("diagnostics.") + GetParam().first;

    /// One request as it reaches the library.
    std::string posted(const char* port, const char* local, const char* remote, int fabric) const
    {
        return std::string(R"(postDiagnostics {"function":")") + GetParam().second +
               R"(","hbaWwn":"h","localPortWwn":")" + local + R"(","numCycles":3,"portWwn":")" + port +
               R"(","remotePortWwn":")" + remote + R"(","requestID":"1","vfID":)" + std::to_string(fabric) +
               "}";
    }
};

TEST_P(Targeted_Tests, PostOneTestForEachTargetAndGiveTheLastAnswer)
{
    library.answers("postDiagnostics",
                    [](const Json::Value& request) -> Json::Value { return request["portWwn"]; });
    EXPECT_EQ(R"("p3")",
              result(method,
                     "['1', 'h', [{'vfID': 5, 'portWwn': 'p1', 'localPortWwn': 'l1', 'remotePortWwn': 'r1'},"
                     " {'vfID': -1, 'portWwn': 'p2', 'localPortWwn': 'l2', 'remotePortWwn': 'r2', 'x': 1},"
                     " {'portWwn': 'p3'}], 3]"));
    EXPECT_EQ((Lines{posted("p1", "l1", "r1", 5), posted("p2", "l2", "r2", 0), posted("p3", "", "", 0)}),
              library.told());
}

TEST_P(Targeted_Tests, PostNothingWithoutTargets)
{
    EXPECT_EQ("null", result(method, "['1', 'h', [], 3]"));
    EXPECT_EQ("null", result(method, "['1', 'h', null, 3]"));
    EXPECT_TRUE(library.calls.empty());
}

TEST_P(Targeted_Tests, ReadTheTargetsLast)
{
    EXPECT_EQ(NO_STRING, error(method, "[1, 'h', 5, 'x']"));
    EXPECT_EQ(NO_STRING, error(method, "['1', 2, 5, 'x']"));
    EXPECT_EQ(NO_INT, error(method, "['1', 'h', 5, 'x']"));
    EXPECT_EQ(NO_ARRAY, error(method, "['1', 'h', 5, 3]"));
    EXPECT_EQ(NO_ARRAY, error(method, "['1', 'h', {}, 3]"));
    EXPECT_TRUE(library.calls.empty());
}

TEST_P(Targeted_Tests, EndAtATargetThatIsNone)
{
    const auto with = [&](const char* target) {
        library.calls.clear();
        const std::string said = error(method, std::string("['1', 'h', [{}, ") + target + ", {}], 3]");
        EXPECT_EQ(1u, library.calls.size());
        return said;
    };
    for (const char* target : {"'text'", "5", "[]"})
        EXPECT_EQ(NO_MEMBERS, with(target));
    EXPECT_EQ(NO_INT, with("{'vfID': '1'}"));
    for (const char* key : {"portWwn", "localPortWwn", "remotePortWwn"})
        EXPECT_EQ(NO_STRING, with((std::string("{'") + key + "': 5}").c_str()));
    EXPECT_EQ("null", result(method, "['1', 'h', [null], 3]"));
}

TEST_P(Targeted_Tests, LiftTheRefusalOfTheLastAloneAndEndWithWhatIsThrown)
{
    library.answers("postDiagnostics", [](const Json::Value& request) -> Json::Value {
        if (request["portWwn"] == "throw")
            throw HbaAgentError{6, "busy"};
        return request["portWwn"] == "refuse" ? json("{'error': 1}") : json("{'posted': true}");
    });
    EXPECT_EQ(R"({"posted":true})", result(method, "['1', 'h', [{'portWwn': 'refuse'}, {}], 3]"));
    EXPECT_EQ(R"({"error":1,"version":"1.1"})", result(method, "['1', 'h', [{}, {'portWwn': 'refuse'}], 3]"));
    library.calls.clear();
    EXPECT_EQ("USERDEFINEDError 6 busy", error(method, "['1', 'h', [{}, {'portWwn': 'throw'}, {}], 3]"));
    EXPECT_EQ(2u, library.calls.size());
}

INSTANTIATE_TEST_SUITE_P(All, Targeted_Tests,
                         ::testing::Values(std::pair("doEchoTest", "EchoTest"),
                                           std::pair("doFCPingTest", "FCPingTest"),
                                           std::pair("doFCTraceRoute", "FCTraceTest")),
                         [](const auto& test) { return std::string(test.param.first); });

using Diagnostics = Agent_Fixture;

TEST_F(Diagnostics, GivesTheNumberOfTheNextRequest)
{
    const Log_Capture log;
    for (const int number : {1, 0, -1, 2147483647}) {
        library.integer = number;
        EXPECT_EQ(std::to_string(number),
                  result("diagnostics.getRequestID", "['parameters', 'are', 'not read']"));
        EXPECT_EQ(std::to_string(number), result("diagnostics.getRequestID", "null"));
    }
    EXPECT_EQ(8u, library.count("getRequestID"));
    const Lines said = log.said();
    ASSERT_EQ(16u, said.size());
    EXPECT_EQ("DBG Entering ProviderDiscoveryMethods::getRequestID", said[0]);
    EXPECT_EQ("DBG returning ProviderDiscoveryMethods::getRequestID", said[1]);
}

TEST_F(Diagnostics, TakesTheNumberOfARequestAsATextOnly)
{
    for (const char* method :
         {"diagnostics.startTests", "diagnostics.dPortEnable", "diagnostics.doPOSTest"}) {
        const char* const rest = std::string(method).ends_with("Tests") ? ", true]" : ", 'p', true]";
        EXPECT_EQ(NO_STRING, error(method, std::string("[7") + rest));
        EXPECT_EQ("null", result(method, std::string("['7'") + rest));
    }
}

TEST_F(Diagnostics, NeedsAParameterThatNobodyReads)
{
    for (const char* method : {"diagnostics.doLoopbackTest", "diagnostics.doEthLoopbackTest"}) {
        EXPECT_EQ(MISMATCH, error(method, "['1', 'p', 1, 2, 3, 'f', 'd']"));
        for (const char* unread : {"'h'", "null", "5", "{}"})
            EXPECT_EQ("null", result(method, std::string("['1', ") + unread + ", 'p', 1, 2, 3, 'f', 'd']"));
        EXPECT_EQ(4u, library.calls.size());
        EXPECT_FALSE(library.calls.back().request.isMember("hbaWwn"));
        library.calls.clear();
    }
}

TEST_F(Diagnostics, SwitchesAPortForTheTestThatIsNone)
{
    for (const char* params : {"['1', 'p', false]", "['1', 'p', true]"}) {
        library.calls.clear();
        result("diagnostics.doPOSTest", params);
        result("diagnostics.dPortEnable", params);
        ASSERT_EQ(2u, library.calls.size());
        EXPECT_EQ("setDport", library.calls[0].name);
        EXPECT_EQ(library.calls[0], library.calls[1]);
        EXPECT_FALSE(library.calls[0].request.isMember("function"));
    }
}

} // namespace
} // namespace KPRV
