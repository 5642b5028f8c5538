#include "module/agent/ProviderDiscoveryMethods.h"
#include "tests/module/agent/Methods_Fixture.h"

#include <set>

namespace KPRV {
namespace {

TEST_F(Methods, Are119InThreeFamilies)
{
    std::vector<std::string> names = JsonRpcManager::instance()->getMethods();
    std::set<std::string> expected;
    std::map<std::string, int> families;
    for (const Fact& fact : facts) {
        EXPECT_TRUE(expected.insert(fact.wire).second) << fact.wire;
        families[std::string(fact.wire).substr(0, std::string(fact.wire).find('.'))]++;
    }
    EXPECT_EQ(119u, names.size());
    EXPECT_EQ(std::vector<std::string>(expected.begin(), expected.end()), names);
    EXPECT_EQ((std::map<std::string, int>{{"discovery", 53}, {"configuration", 46}, {"diagnostics", 20}}),
              families);
}

TEST_F(Methods, SendTheirParametersUnderTheirKeysAndGiveTheAnswer)
{
    for_each_of_the_table([&](const Fact& fact) {
        for (const char* text : {"{'value': [1, {'two': 2}]}", "[1]", "'text'", "-7", "null", "{}", "true"}) {
            const Json::Value answer = json(text);
            library.answers(fact.symbol, answer);
            library.calls.clear();
            const Json::Value params = samples(fact);
            const Json::Value reply = call_with(fact.wire, params);
            ASSERT_TRUE(reply.isMember("result"));
            Json::Value wrapped;
            wrapped.append(answer);
            EXPECT_EQ(fact.form == WRAPPED ? wrapped : answer, reply["result"]);
            EXPECT_EQ(asked(fact, params), library.calls);
        }
    });
}

TEST_F(Methods, TakeNullForEveryParameter)
{
    for_each_of_the_table([&](const Fact& fact) {
        if (fact.form == PASSED)
            return;
        Json::Value params, read;
        for (const Parameter& parameter : parameters_of(fact)) {
            params.append(Json::Value());
            read.append(parameter.type == 'S' || parameter.type == 'M' ? Json::Value("")
                        : parameter.type == 'I'                        ? Json::Value(0)
                        : parameter.type == 'B'                        ? Json::Value(false)
                                                                       : Json::Value());
        }
        EXPECT_TRUE(call_with(fact.wire, params).isMember("result"));
        EXPECT_EQ(asked(fact, read), library.calls);
    });
}

TEST_F(Methods, TakeATruthValueForATextAndForANumber)
{
    for_each_of_the_table([&](const Fact& fact) {
        Json::Value params = samples(fact), read = params;
        unsigned position = 0;
        for (const Parameter& parameter : parameters_of(fact)) {
            if (parameter.type == 'S' || parameter.type == 'M') {
                params[position] = true;
                read[position] = "true";
            } else if (parameter.type == 'I') {
                params[position] = true;
                read[position] = 1;
            }
            position++;
        }
        EXPECT_TRUE(call_with(fact.wire, params).isMember("result"));
        EXPECT_EQ(asked(fact, read), library.calls);
    });
}

TEST_F(Methods, ReadABooleanFromEveryType)
{
    const std::pair<const char*, bool> values[] = {
        {"true", true}, {"false", false}, {"null", false}, {"0", false},  {"-1", true},  {"0.5", true},
        {"''", false},  {"'no'", true},   {"[]", false},   {"[0]", true}, {"{}", false}, {"{'a': 0}", true},
    };
    size_t switches = 0;
    for_each_of_the_table([&](const Fact& fact) {
        unsigned position = 0;
        for (const Parameter& parameter : parameters_of(fact)) {
            if (parameter.type == 'B') {
                for (const auto& [text, value] : values) {
                    Json::Value params = samples(fact), read = params;
                    params[position] = json(text);
                    read[position] = value;
                    library.calls.clear();
                    EXPECT_TRUE(call_with(fact.wire, params).isMember("result"));
                    EXPECT_EQ(asked(fact, read), library.calls) << text;
                }
                switches++;
            }
            position++;
        }
    });
    EXPECT_EQ(5u, switches);
}

TEST_F(Methods, CutFractionsOff)
{
    library.answers("createvNIC", json("{}"));
    EXPECT_EQ("{}", result("configuration.createVnic", "['m', 1.9, -2.9]"));
    EXPECT_EQ(Lines{R"(createvNIC {"mac":"m","maxBandwidth":-2,"minBandwidth":1})"}, library.told());
}

TEST_F(Methods, ChooseTheKeyOfAnAddressByItsLength)
{
    for (const std::string symbol : {"getHbaByWwn", "getPortByWwn"}) {
        library.calls.clear();
        const auto key = [&](const std::string& address) {
            Json::Value params;
            params.append(address);
            call_with("discovery." + symbol, params);
            return library.calls.back().request.getMemberNames().at(0) + "=" +
                   library.calls.back().request.begin()->asString();
        };
        EXPECT_EQ("mac=00:02:4b:4c:00:01", key("00:02:4b:4c:00:01"));
        EXPECT_EQ("wwn=10:00:02:4b:4c:10:00:00", key("10:00:02:4b:4c:10:00:00"));
        EXPECT_EQ("mac=seventeen letters", key("seventeen letters"));
        EXPECT_EQ("wwn=sixteen letters.", key("sixteen letters."));
        EXPECT_EQ("wwn=eighteen letters..", key("eighteen letters.."));
        EXPECT_EQ("wwn=", key(""));
        EXPECT_EQ(6u, library.count(symbol));
    }
}

TEST_F(Methods, WithoutParametersPassOnWhateverComes)
{
    for (const char* name : {"getGlobalInfo", "getServerTime", "getDriverUpdateStatusLog"}) {
        for (const char* params : {"null", "[]", "['x', 2]", "{'a': 1}", "'text'", "5"}) {
            library.calls.clear();
            EXPECT_EQ("null", result(std::string("discovery.") + name, params));
            ASSERT_EQ(1u, library.calls.size());
            EXPECT_EQ(json(params), library.calls[0].request) << params;
        }
    }
}

TEST_F(Methods, WithoutAWireNameAreComplete)
{
    EXPECT_EQ("JSONRPCError 105 Procedure not found", error("discovery.getFcoeByPort", "['p']"));
    EXPECT_EQ("JSONRPCError 105 Procedure not found", error("configuration.setFcByFcWwn", "['p', {}, []]"));
    EXPECT_EQ("JSONRPCError 105 Procedure not found", error("getFcoeByPort", "['p']"));
    EXPECT_TRUE(library.calls.empty());

    library.answers("getFcoeByPort", json("{'mac': 'm'}"));
    library.answers("setFcByFcWwn", json("{'done': true}"));
    Json::Value answer;
    ProviderDiscoveryMethods::getFcoeByPort(json("['p']"), answer);
    EXPECT_EQ(json("{'mac': 'm'}"), answer);
    ProviderDiscoveryMethods::setFcByFcWwn(json("['p', {'a': 1}, ['a']]"), answer);
    EXPECT_EQ(json("{'done': true}"), answer);
    EXPECT_EQ((Lines{R"(getFcoeByPort {"indexStr":"p"})",
                     R"(setFcByFcWwn {"fcPortData":{"a":1},"paramsConfigured":["a"],"portWwn":"p"})"}),
              library.told());
    EXPECT_THROW(ProviderDiscoveryMethods::getFcoeByPort(json("[]"), answer), HbaAgentError);
    EXPECT_THROW(ProviderDiscoveryMethods::setFcByFcWwn(json("['p', 1, ['a']]"), answer), HbaAgentError);
    EXPECT_THROW(ProviderDiscoveryMethods::setFcByFcWwn(json("['p', {}, 1]"), answer), HbaAgentError);
}

} // namespace
} // namespace KPRV
