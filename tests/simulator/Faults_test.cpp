#include "tests/simulator/Simulator_Fixture.h"

#include "contracts/adapter/HbaAgentError.h"

#include <chrono>
#include <stdexcept>

namespace KPRV::simulator {
namespace {

const char* first_hba = "{'wwn': '20:00:02:4b:4c:11:00:00'}";
const char* second_hba = "{'wwn': '20:00:02:4B:4C:12:00:00'}";

class Faults_test : public Simulator_Fixture
{
protected:
    Faults_test() { simulator.load_file(inventory("twins.json")); }

    void fault(std::string text)
    {
        std::replace(text.begin(), text.end(), '\'', '"');
        simulator.add_fault(text);
    }
};

TEST_F(Faults_test, AnswersNull)
{
    fault("{'call': 'getHbaByWwn', 'do': 'null'}");
    EXPECT_TRUE(call("getHbaByWwn", first_hba).isNull());
    EXPECT_TRUE(call("getHost").isObject());
}

TEST_F(Faults_test, AnswersAnErrorOfAnyShape)
{
    fault("{'call': 'getHbaByWwn', 'do': 'error', 'code': -7, 'message': 'gone', 'times': 1}");
    EXPECT_EQ(call("getHbaByWwn", first_hba),
              json("{'error': {'name': 'LibraryError', 'code': -7, 'message': 'gone'}}"));
    EXPECT_FALSE(call("getHbaByWwn", first_hba).isMember("error"));
    fault("{'call': 'getHost', 'do': 'error', 'error': null}");
    EXPECT_EQ(call("getHost"), json("{'error': null}"));
}

TEST_F(Faults_test, ThrowsWhatTheCallersMustTellApart)
{
    fault("{'call': 'getHbaByWwn', 'do': 'throw', 'code': 12, 'message': 'lost', 'times': 1}");
    try {
        call("getHbaByWwn", first_hba);
        FAIL();
    } catch (const HbaAgentError& error) {
        EXPECT_EQ(error.code, 12);
        EXPECT_EQ(error.message, "lost");
    }
    fault("{'call': 'getHost', 'do': 'throw', 'type': 'std::runtime_error', 'message': 'broken'}");
    try {
        call("getHost");
        FAIL();
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "broken");
    }
    fault("{'call': 'getGlobalInfo', 'do': 'throw', 'type': 'int', 'code': 5}");
    try {
        call("getGlobalInfo");
        FAIL();
    } catch (int code) {
        EXPECT_EQ(code, 5);
    }
}

TEST_F(Faults_test, AnswersSomethingElse)
{
    fault("{'call': 'getAllAdaptersIndexString', 'do': 'answer', 'answer': {'indexStrings': 'none'}}");
    EXPECT_EQ(call("getAllAdaptersIndexString"), json("{'indexStrings': 'none'}"));
}

TEST_F(Faults_test, LeavesMembersOut)
{
    fault("{'call': 'getHbaByWwn', 'do': 'remove', 'member': 'driver'}");
    fault("{'call': 'getHbaByWwn', 'do': 'remove', 'member': 'hbaData.isCNA'}");
    fault("{'call': 'getHbaByWwn', 'do': 'remove', 'member': 'nothing.at.all'}");
    const Json::Value answer = call("getHbaByWwn", first_hba);
    EXPECT_FALSE(answer.isMember("driver"));
    EXPECT_FALSE(answer["hbaData"].isMember("isCNA"));
    EXPECT_TRUE(answer["hbaData"].isMember("hasEthPort"));
    fault("{'call': 'getAllAdaptersIndexString', 'do': 'remove', 'member': 'indexStrings.0'}");
    EXPECT_EQ(call("getAllAdaptersIndexString"), json("{'indexStrings': ['20:00:02:4b:4c:12:00:00']}"));
}

TEST_F(Faults_test, PutsValuesOfAnyTypeIntoTheAnswer)
{
    fault("{'call': 'getHbaByWwn', 'do': 'set', 'member': 'hbaData', 'value': []}");
    EXPECT_EQ(call("getHbaByWwn", first_hba)["hbaData"], json("[]"));
    fault("{'call': 'getHost', 'do': 'set', 'member': 'result.hostModel', 'value': 7}");
    fault("{'call': 'getHost', 'do': 'set', 'member': 'result.error', 'value': null}");
    const Json::Value host = call("getHost")["result"];
    EXPECT_EQ(host["hostModel"], Json::Value(7));
    EXPECT_TRUE(host.isMember("error"));
    fault("{'call': 'getAllAdaptersIndexString', 'do': 'set', 'member': 'indexStrings.1', 'value': 3}");
    fault("{'call': 'getAllAdaptersIndexString', 'do': 'set', 'member': 'indexStrings.9', 'value': 3}");
    EXPECT_EQ(call("getAllAdaptersIndexString"), json("{'indexStrings': ['20:00:02:4b:4c:11:00:00', 3]}"));
}

TEST_F(Faults_test, TheInventoryItselfStaysWhole)
{
    const Json::Value before = call("getHbaByWwn", first_hba);
    fault("{'call': 'getHbaByWwn', 'do': 'remove', 'member': 'hbaData.model'}");
    call("getHbaByWwn", first_hba);
    simulator.clear_faults();
    EXPECT_EQ(call("getHbaByWwn", first_hba), before);
}

TEST_F(Faults_test, HitsOnlyTheAddressThatItNames)
{
    fault("{'call': '*', 'address': '20:00:02:4b:4c:12:00:00', 'do': 'null'}");
    EXPECT_TRUE(call("getHbaByWwn", first_hba).isObject());
    EXPECT_TRUE(call("getHbaByWwn", second_hba).isNull());
    EXPECT_TRUE(call("getFlashInfo", "{'indexStr': '20:00:02:4b:4c:12:00:00'}").isNull());
    EXPECT_TRUE(call("getHost").isObject());
}

TEST_F(Faults_test, HitsTheCallsThatItCounts)
{
    fault("{'call': 'getHost', 'at': 2, 'do': 'null'}");
    fault("{'call': 'getGlobalInfo', 'at': 2, 'times': 2, 'do': 'null'}");
    fault("{'call': 'getAllAdaptersIndexString', 'at': 2, 'times': 0, 'do': 'null'}");
    const auto nulls = [&](const char* name) {
        std::string pattern;
        for (int number = 0; number < 5; ++number)
            pattern += call(name).isNull() ? 'x' : '.';
        return pattern;
    };
    EXPECT_EQ(nulls("getHost"), ".x...");
    EXPECT_EQ(nulls("getGlobalInfo"), ".xx..");
    EXPECT_EQ(nulls("getAllAdaptersIndexString"), ".xxxx");
}

TEST_F(Faults_test, WhatFailsIsNotDone)
{
    const char* disable = "{'indexStr': '20:00:02:4b:4c:11:00:00', 'enableState': false}";
    for (const char* kind : {"null", "error", "throw"}) {
        fault(std::string("{'call': 'setAdapterState', 'times': 1, 'do': '") + kind + "'}");
        try {
            call("setAdapterState", disable);
        } catch (const HbaAgentError&) {
        }
        EXPECT_TRUE(call("getHbaByWwn", first_hba)["hbaData"]["hbaStatus"].asBool()) << kind;
        simulator.clear_faults();
    }
}

TEST_F(Faults_test, AnswersLate)
{
    fault("{'call': 'getHost', 'do': 'delay', 'milliseconds': 30}");
    const auto start = std::chrono::steady_clock::now();
    EXPECT_TRUE(call("getHost").isObject());
    EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(30));
}

TEST_F(Faults_test, NumbersAndTextsFailAsTheirCallersKnowIt)
{
    fault("{'call': 'getNumberOfAdapters', 'do': 'null'}");
    fault("{'call': 'get_agt_version', 'do': 'error'}");
    fault("{'call': 'getRequestID', 'do': 'answer', 'answer': 77}");
    fault("{'call': 'free_hba_lib', 'do': 'null', 'times': 1}");
    EXPECT_EQ(simulator.symbol<unsigned()>("getNumberOfAdapters")(), 65535u);
    EXPECT_EQ(version(), nullptr);
    EXPECT_EQ(integer("getRequestID"), 77);
    EXPECT_EQ(integer("free_hba_lib"), -1);
}

TEST_F(Faults_test, AnInventoryBringsItsOwnAndTakesTheOthersAway)
{
    fault("{'call': 'getGlobalInfo', 'do': 'null'}");
    simulator.load_text(R"({"faults": [{"call": "getHost", "do": "null"}]})");
    EXPECT_TRUE(call("getHost").isNull());
    EXPECT_TRUE(call("getGlobalInfo").isObject());
}

} // namespace
} // namespace KPRV::simulator
