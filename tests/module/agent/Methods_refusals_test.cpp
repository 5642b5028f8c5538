#include "tests/module/agent/Methods_Fixture.h"

namespace KPRV {
namespace {

using Method_Refusals = Methods;

TEST_F(Method_Refusals, AnswerAnotherNumberOfParameters)
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

TEST_F(Method_Refusals, CountTheMembersOfAnObjectAndThenFindNoPosition)
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

TEST_F(Method_Refusals, AnswerAParameterOfAnotherTypeAtEveryPosition)
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

TEST_F(Method_Refusals, ReadTheFirstOfTwoWrongParametersFirst)
{
    EXPECT_EQ(NO_STRING, error("configuration.setPortByWwn", "[1, 2, 3]"));
    EXPECT_EQ(NO_OBJECT, error("configuration.setPortByWwn", "['a', 2, 3]"));
    EXPECT_EQ(NO_ARRAY, error("configuration.setPortByWwn", "['a', {}, 3]"));
    EXPECT_EQ(NO_STRING, error("diagnostics.doLEDTest", "['1', '2', 3, 'x', 1, 1, 1]"));
    EXPECT_EQ(NO_INT, error("diagnostics.doLEDTest", "['1', '2', '3', 'x', 1, 1, 1]"));
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(Method_Refusals, LiftARefusalOfTheLibrary)
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

TEST_F(Method_Refusals, TellWhatTheLibraryThrows)
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

} // namespace
} // namespace KPRV
