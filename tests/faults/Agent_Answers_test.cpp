// Bad answers of the adapter library on their way through the agent's methods.
#include "tests/faults/Sweep_Fixture.h"

#include <sstream>

namespace KPRV::agent_answers {
namespace {

enum Form
{
    PLAIN,
    WRAPPED,
    OWN,
};

struct Way
{
    const char* entry_point;
    const char* method;
    const char* params;
    Form form;
};

constexpr Way ways[] = {
#define AGENT(entry_point, method, params, form) {#entry_point, method, params, form},
#include "tests/faults/Ways_In.def"
};

constexpr const char* names[][2] = {
    {"@hba", "20:00:02:4b:4c:cc:00:00"},
    {"@fcoe", "10:00:02:4b:4c:aa:00:00"},
    {"@fc", "10:00:02:4b:4c:cc:00:00"},
    {"@far", "50:24:b4:c0:00:cc:00:01"},
    {"@vport", "10:01:02:4b:4c:cc:00:00"},
    {"@cna", "20:00:02:4b:4c:aa:00:00"},
    {"@eth", "02:4b:4c:aa:00:00"},
    {"@vnic", "2"},
    {"@request", "1"},
};

void replace_all(std::string& text, const std::string& from, const std::string& to)
{
    for (std::size_t at = 0; (at = text.find(from, at)) != std::string::npos; at += to.size())
        text.replace(at, from.size(), to);
}

std::string json_text(std::string text)
{
    replace_all(text, "'", "\"");
    for (const auto& [name, value] : names)
        replace_all(text, name, value);
    return text;
}

class Agent_Answers : public Sweep_Fixture, public testing::TestWithParam<Way>
{
protected:
    void SetUp() override { open_host(); }
    void TearDown() override { close_host(); }

    /// There is something to delete, to change, to start and to end.
    void prepare()
    {
        restore();
        for (const auto& [method, params] : {
                 std::pair{"configuration.createVPort", "['@fc','20:01:02:4b:4c:cc:00:00','@vport','x']"},
                 std::pair{"configuration.createVnic", "['@eth',1,2]"},
                 std::pair{"diagnostics.doQuickTest", "['@request','@hba']"},
                 std::pair{"diagnostics.dPortEnable", "['@request','@fc',true]"},
             })
            ASSERT_FALSE(ask(method, params).isMember("error")) << method;
        simulator.clear_calls();
    }

    Json::Value ask(const char* method, const char* params)
    {
        static const broker::Path_Value service = {
            {},
            "root/kaldera",
            "KALDERA_AgentService",
            {{"Name", broker::Plain_Value::text("Kaldera Agent Service Provider")}}};
        const std::string request =
            R"({"method": ")" + std::string(method) + R"(", "params": )" + json_text(params) + "}";
        const broker::Result result = server->invoke_method(
            service, "executeMethod", {{"request", broker::Plain_Value::text(request)}});
        EXPECT_TRUE(result.ok()) << result.rc << " " << thrown_text(result).value_or("");
        EXPECT_EQ(1u, result.done_count);
        const broker::Plain_Value* const response = find_value(result.out, "response");
        Json::Value reply;
        EXPECT_TRUE(response && !response->null);
        if (response && !response->null)
            std::istringstream(response->as_text()) >> reply;
        return reply;
    }
    Json::Value ask(const Way& way) { return ask(way.method, way.params); }
};

Json::Value error_reply(const Bad_Answer& bad)
{
    struct
    {
        const char* name;
        int code;
        const char* message;
    } const errors[] = {
        {},
        {"USERDEFINEDError", THROWN_CODE, THROWN_TEXT},
        {"JSONRPCError", 200, THROWN_TEXT},
        {"UnCaughtError", 5000, "Unknown error that was not caught"},
    };
    Json::Value reply;
    reply["name"] = errors[bad.thrown].name;
    reply["code"] = errors[bad.thrown].code;
    reply["message"] = errors[bad.thrown].message;
    return reply;
}

/// Equal as texts: whether a number has a sign is lost on the way. Over-long ones are not printed.
testing::AssertionResult same(const Json::Value& expected, const Json::Value& actual)
{
    const std::string one = Json::FastWriter().write(expected);
    const std::string other = Json::FastWriter().write(actual);
    if (one == other)
        return testing::AssertionSuccess();
    return testing::AssertionFailure() << one.substr(0, 500) << " and not " << other.substr(0, 500);
}

/// What a client gets: the answer as it is, an error of the library's, or an exception's.
void expect_reply(const Way& way, const Bad_Answer& bad, const Json::Value& reply)
{
    if (bad.thrown) {
        EXPECT_TRUE(same(error_reply(bad), reply["error"]));
        EXPECT_FALSE(reply.isMember("result"));
    } else if (way.form == WRAPPED) {
        EXPECT_LT(0u, reply["result"].size());
        for (const Json::Value& each : reply["result"])
            EXPECT_TRUE(same(bad.answer, each));
    } else if (bad.answer.isObject() && bad.answer.isMember("error")) {
        EXPECT_TRUE(same(bad.answer["error"], reply["error"]));
        EXPECT_FALSE(reply.isMember("result"));
    } else {
        EXPECT_TRUE(reply.isMember("result"));
        EXPECT_TRUE(same(bad.answer, reply["result"]));
        EXPECT_FALSE(reply.isMember("error"));
    }
}

/// What a method reads may be good enough for it, or not: the reply is a result or an error of the agent's.
void expect_own_reply(const Bad_Answer& bad, const Json::Value& reply)
{
    EXPECT_NE(reply.isMember("result"), reply.isMember("error"));
    if (bad.thrown == Bad_Answer::STANDARD || bad.thrown == Bad_Answer::OTHER) {
        EXPECT_TRUE(same(error_reply(bad), reply["error"]));
    }
}

TEST_P(Agent_Answers, ReachTheClientAndNobodyElse)
{
    const Way& way = GetParam();
    prepare();
    const Json::Value good_reply = ask(way);
    EXPECT_TRUE(good_reply.isMember("result")) << good_reply;
    ASSERT_TRUE(was_called(way.entry_point));
    const Json::Value request = simulator.requests(way.entry_point).at(0);
    // A class whose instances have nothing to do with the entry point.
    const char* const neighbour =
        std::string(way.entry_point) == "getHbaByWwn" ? "KALDERA_ComputerSystem" : "KALDERA_PortController";
    const std::vector<std::string> neighbours = lasting_texts(server->enumerate_instances(neighbour));
    EXPECT_FALSE(neighbours.empty());
    const std::vector<Bad_Answer> kinds = std::string(way.entry_point) == "getRequestID"
                                              ? bad_answers_of(INTEGER)
                                              : bad_json_answers(true_answer(way.entry_point, request));
    for (const Bad_Answer& bad : kinds) {
        SCOPED_TRACE(bad.name);
        prepare();
        simulator.add_fault(bad.fault(way.entry_point));
        const Json::Value reply = ask(way);
        EXPECT_TRUE(was_called(way.entry_point));
        way.form == OWN ? expect_own_reply(bad, reply) : expect_reply(way, bad, reply);
        EXPECT_EQ(neighbours, lasting_texts(server->enumerate_instances(neighbour)));
        simulator.clear_faults();
        expect_nothing_left();
        EXPECT_TRUE(same(good_reply, elsewhere([&] { return ask(way); })));
        expect_nothing_left();
    }
}

INSTANTIATE_TEST_SUITE_P(Way, Agent_Answers, testing::ValuesIn(ways), [](const auto& row) {
    return std::to_string(row.index) + "_" + row.param.entry_point;
});

} // namespace
} // namespace KPRV::agent_answers
