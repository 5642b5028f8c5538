#include "agent/ProviderDiscoveryMethods.h"
#include "tests/agent/Agent_Fixture.h"

#include <set>
#include <sstream>

namespace KPRV {
namespace {

/// How the answer becomes the result.
enum Form
{
    PLAIN,
    WRAPPED,
    PASSED,
    OWN,
};

struct Fact
{
    const char* wire;
    const char* handler;
    const char* symbol;
    Form form;
    const char* constants;
    const char* parameters;
};

constexpr Fact facts[] = {
#define ROW(wire, handler, symbol, form, constants, parameters)                                              \
    {wire, handler, symbol, form, constants, parameters},
#include "tests/agent/methods.inc"
#undef ROW
};

struct Parameter
{
    std::string key;
    char type;
};

std::vector<Parameter> parameters_of(const Fact& fact)
{
    std::vector<Parameter> result;
    std::istringstream words(fact.parameters);
    for (std::string word; words >> word;)
        result.push_back({word.substr(0, word.find(':')), word.back()});
    return result;
}

Json::Value constants_of(const Fact& fact)
{
    return *fact.constants ? json(fact.constants) : Json::Value();
}

/// A value of the type that no other position has.
Json::Value sample(char type, unsigned position)
{
    const std::string text = "text " + std::to_string(position);
    Json::Value value;
    switch (type) {
    case 'S':
    case 'M':
        return text;
    case 'I':
        return 40 + int(position);
    case 'B':
        return true;
    case 'A':
        value.append(text);
        return value;
    case 'O':
        value["member"] = text;
        return value;
    case '-':
        return 1.5;
    default:
        return value;
    }
}

Json::Value samples(const Fact& fact)
{
    Json::Value params(Json::arrayValue);
    unsigned position = 0;
    for (const Parameter& parameter : parameters_of(fact))
        params.append(sample(parameter.type, position++));
    return params;
}

/// The request that reaches the library.
Json::Value expected_query(const Fact& fact, const Json::Value& params)
{
    if (fact.form == PASSED)
        return params;
    Json::Value query = constants_of(fact);
    unsigned position = 0;
    for (const Parameter& parameter : parameters_of(fact)) {
        if (parameter.type != '-')
            query[parameter.key] = params[position];
        position++;
    }
    return query;
}

class Methods : public Agent_Fixture
{
protected:
    template <class Body>
    void for_each(Body body)
    {
        for (const Fact& fact : facts) {
            SCOPED_TRACE(fact.wire);
            library.calls.clear();
            body(fact);
        }
    }
    /// All but those with a body of their own.
    template <class Body>
    void for_each_of_the_table(Body body)
    {
        size_t methods = 0;
        for_each([&](const Fact& fact) {
            if (fact.form == OWN)
                return;
            body(fact);
            methods++;
        });
        EXPECT_EQ(119u - 12, methods);
    }
    std::vector<Fake_Library::Call> asked(const Fact& fact, const Json::Value& params)
    {
        return {{fact.symbol, expected_query(fact, params)}};
    }
};

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

TEST_F(Methods, RefuseAnotherNumberOfParameters)
{
    for_each([&](const Fact& fact) {
        const int count = int(parameters_of(fact).size());
        if (count == 0)
            return;
        const Log_Capture log("WARN");
        const auto refused = [&](const Json::Value& params, int actual) {
            log.clear();
            EXPECT_EQ(MISMATCH, error_with(fact.wire, params)) << compact(params);
            EXPECT_EQ((Lines{"WARN No. of Params - Expected : " + std::to_string(count) +
                             ", Actual : " + std::to_string(actual) + ", function : " + fact.handler + " "}),
                      log.said());
        };
        Json::Value fewer = samples(fact), more = samples(fact);
        fewer.resize(Json::ArrayIndex(count - 1));
        more.append("more");
        refused(fewer, count - 1);
        refused(more, count + 1);
        refused(Json::Value(), 0);
        refused("text", 0);
        refused(3, 0);
        EXPECT_TRUE(library.calls.empty());

        JsonRpcManager::response reply;
        JsonRpcManager::instance()->process("{\"method\": \"" + std::string(fact.wire) + "\"}", reply);
        EXPECT_EQ(51, json(reply.text)["error"]["code"].asInt()) << "without params";
    });
}

TEST_F(Methods, CountTheMembersOfAnObjectAndThenFindNoPosition)
{
    for_each([&](const Fact& fact) {
        Json::Value params;
        for (const Parameter& parameter : parameters_of(fact))
            params["p" + std::to_string(params.size())] = sample(parameter.type, 0);
        if (params.isNull())
            return;
        EXPECT_EQ(NOT_INDEXED, error_with(fact.wire, params));
        EXPECT_TRUE(library.calls.empty());
    });
}

TEST_F(Methods, RefuseAParameterOfAnotherTypeAtEveryPosition)
{
    size_t refusals = 0;
    for_each_of_the_table([&](const Fact& fact) {
        unsigned position = 0;
        for (const Parameter& parameter : parameters_of(fact)) {
            const auto refused = [&](const char* how, const char* wrong) {
                Json::Value params = samples(fact);
                params[position] = json(wrong);
                EXPECT_EQ(how, error_with(fact.wire, params)) << position << ": " << wrong;
                refusals++;
            };
            switch (parameter.type) {
            case 'S':
            case 'M':
                for (const char* wrong : {"7", "1.5", "[]", "{}", "['text']"})
                    refused(NO_STRING, wrong);
                break;
            case 'I':
                for (const char* wrong : {"'7'", "''", "[]", "{}", "2147483648", "-2147483649", "1e300"})
                    refused(NO_INT, wrong);
                break;
            case 'A':
                for (const char* wrong : {"'text'", "''", "7", "{}", "true", "{'0': 1}"})
                    refused(NO_ARRAY, wrong);
                break;
            case 'O':
                for (const char* wrong : {"'text'", "''", "7", "[]", "false", "[{}]"})
                    refused(NO_OBJECT, wrong);
                break;
            default:
                break;
            }
            position++;
        }
        EXPECT_TRUE(library.calls.empty());
    });
    EXPECT_GT(refusals, 500u);
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

TEST_F(Methods, ReadTheFirstOfTwoWrongParametersFirst)
{
    EXPECT_EQ(NO_STRING, error("configuration.setPortByWwn", "[1, 2, 3]"));
    EXPECT_EQ(NO_OBJECT, error("configuration.setPortByWwn", "['a', 2, 3]"));
    EXPECT_EQ(NO_ARRAY, error("configuration.setPortByWwn", "['a', {}, 3]"));
    EXPECT_EQ(NO_STRING, error("diagnostics.doLEDTest", "['1', '2', 3, 'x', 1, 1, 1]"));
    EXPECT_EQ(NO_INT, error("diagnostics.doLEDTest", "['1', '2', '3', 'x', 1, 1, 1]"));
    EXPECT_TRUE(library.calls.empty());
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

TEST_F(Methods, LiftARefusalOfTheLibrary)
{
    for_each_of_the_table([&](const Fact& fact) {
        const Json::Value refusal = json("{'error': {'code': 9, 'why': 'busy'}, 'other': 1}");
        library.answers(fact.symbol, refusal);
        const Json::Value reply = call_with(fact.wire, samples(fact));
        if (fact.form == WRAPPED) {
            // In an array it stays where it is.
            EXPECT_EQ(refusal, reply["result"][0]);
            EXPECT_EQ(1u, reply["result"].size());
        } else {
            EXPECT_EQ(json("{'error': {'code': 9, 'why': 'busy'}, 'version': '1.1'}"), reply);
        }
    });
}

TEST_F(Methods, TellWhatTheLibraryThrows)
{
    for_each_of_the_table([&](const Fact& fact) {
        library.throws(fact.symbol, HbaAgentError{-7, "no such port"});
        EXPECT_EQ("USERDEFINEDError -7 no such port", error_with(fact.wire, samples(fact)));
        library.throws(fact.symbol, std::runtime_error("lost"));
        EXPECT_EQ("JSONRPCError 200 lost", error_with(fact.wire, samples(fact)));
        library.throws(fact.symbol, 42);
        EXPECT_EQ("UnCaughtError 5000 Unknown error that was not caught",
                  error_with(fact.wire, samples(fact)));
    });
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
