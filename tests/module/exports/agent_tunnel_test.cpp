#include "tests/module/exports/Agent_Calls.h"
#include "tests/support/Small_Stack.h"

#include <atomic>
#include <thread>

namespace KPRV {
namespace {

using Agent_Tunnel = Agent_Calls;

const char* const SERVER_TIME = R"({"method": "discovery.getServerTime"})";
const char* const NOW = R"({"call": "getServerTime", "do": "answer", "answer": "now"})";
const char* const UNPARSED = "There was an error parsing the JSON text comprising the Procedure Call:\n";

TEST_F(Agent_Tunnel, SucceedsWhateverTheOutcome)
{
    open("empty.json");
    simulator.add_fault(NOW);
    EXPECT_EQ("{\n   \"result\" : \"now\",\n   \"version\" : \"1.1\"\n}\n",
              response_of(execute(SERVER_TIME)));
    EXPECT_EQ(105, reply("{}")["error"]["code"].asInt());
    EXPECT_EQ(51, call("discovery.getLldp", "[]")["error"]["code"].asInt());
    EXPECT_EQ(std::string(UNPARSED) + "* Line 1, Column 2\n  Missing '}' or object member name\n",
              response_of(execute("{")));
}

TEST_F(Agent_Tunnel, IsFoundByEnumeration)
{
    open("empty.json");
    const broker::Result services = server->enumerate_instance_names("KALDERA_AgentService");
    ASSERT_EQ(1u, services.paths.size());
    EXPECT_TRUE(same_object(SERVICE, services.paths[0]));
    const broker::Result result = server->invoke_method(services.paths[0], "executeMethod",
                                                        {{"request", broker::Plain_Value::text("{}")}});
    EXPECT_EQ(105, json(response_of(result))["error"]["code"].asInt());
}

TEST_F(Agent_Tunnel, TakesANullRequestForAnEmptyText)
{
    open("empty.json");
    const std::string empty =
        std::string(UNPARSED) + "* Line 1, Column 1\n  Syntax error: value, object or array expected.\n";
    EXPECT_EQ(empty, response_of(execute("")));
    EXPECT_EQ(empty, response_of(server->invoke_method(SERVICE, "executeMethod", {})));
    EXPECT_EQ(empty,
              response_of(server->invoke_method(SERVICE, "executeMethod",
                                                {{"request", broker::Plain_Value::null_of(CMPI_string)}})));
}

TEST_F(Agent_Tunnel, IsTheOnlyMethodAndKnownInAnyCase)
{
    open("empty.json");
    for (const char* name : {"executeMethod", "EXECUTEMETHOD", "executemethod"})
        EXPECT_EQ(105, json(response_of(execute("{}", name)))["error"]["code"].asInt()) << name;
    for (const char* name : {"execute", "executeMethods", "discovery.getHost", "getHost", ""}) {
        const broker::Result result = execute("{}", name);
        EXPECT_EQ(CMPI_RC_ERR_METHOD_NOT_FOUND, result.rc) << name;
        EXPECT_TRUE(result.out.empty());
    }
}

TEST_F(Agent_Tunnel, IsOpenUnderAnyNameAndInTheClassItself)
{
    open("empty.json");
    for (broker::Path_Value path : {broker::Path_Value{{}, "root/kaldera", "KALDERA_AgentService", {}},
                                    broker::Path_Value{{},
                                                       "root/kaldera",
                                                       "kaldera_agentservice",
                                                       {{"Name", broker::Plain_Value::text("another")}}}}) {
        const broker::Result result =
            server->invoke_method(path, "executeMethod", {{"request", broker::Plain_Value::text("{}")}});
        EXPECT_EQ(105, json(response_of(result))["error"]["code"].asInt());
    }
}

TEST_F(Agent_Tunnel, LogsBothTexts)
{
    open("empty.json");
    simulator.add_fault(NOW);
    mark();
    execute(SERVER_TIME);
    const std::string reply = "{\n   \"result\" : \"now\",\n   \"version\" : \"1.1\"\n}";
    EXPECT_EQ((Lines{"DBG Entering: executeMethod", std::string("DBG ") + SERVER_TIME,
                     "DBG rpcResponse : " + reply, "DBG " + reply, "DBG Returning: executeMethod"}),
              said_by("KALDERA_AgentService_Provider.cpp"));
    EXPECT_EQ((Lines{"DBG Entering ProviderDiscoveryMethods::getServerTime",
                     "DBG Returning ProviderDiscoveryMethods::getServerTime"}),
              said_by("Method.cpp"));
}

TEST_F(Agent_Tunnel, LogsPercentSignsWithoutHarm)
{
    open("empty.json");
    mark();
    execute("%s%n%d %%done%%%% 100%");
    EXPECT_EQ("DBG %s%n%d %done%% 100%", said_by("KALDERA_AgentService_Provider.cpp").at(1));
    mark();
    EXPECT_EQ("%s %% %n", reply(R"({"id": "%s %% %n"})")["id"].asString());
    const Lines lines = said_by("KALDERA_AgentService_Provider.cpp");
    EXPECT_NE(std::string::npos, lines.at(2).find(R"("id" : "%s %% %n")"));
    EXPECT_NE(std::string::npos, lines.at(3).find(R"("id" : "%s % %n")"));
}

TEST_F(Agent_Tunnel, CountsInTheLogWhatDoesNotMatch)
{
    open("empty.json");
    mark();
    call("diagnostics.getDPortTestResults", R"(["a", "b"])");
    EXPECT_EQ(Lines{"WARN No. of Params - Expected : 1, Actual : 2, function : getDPortTestResult "},
              said("WARN"));
    EXPECT_TRUE(simulator.call_names().empty());
}

TEST_F(Agent_Tunnel, TellsWhatTheLibraryThrows)
{
    open("empty.json");
    const auto told = [&](const char* how) {
        simulator.clear_faults();
        simulator.add_fault(std::string(R"({"call": "getServerTime", "do": )") + how + "}");
        const Json::Value error = reply(SERVER_TIME)["error"];
        return error["name"].asString() + " " + error["code"].asString() + " " + error["message"].asString();
    };
    EXPECT_EQ("USERDEFINEDError -3 busy", told(R"("throw", "code": -3, "message": "busy")"));
    EXPECT_EQ("JSONRPCError 200 lost", told(R"("throw", "type": "std::runtime_error", "message": "lost")"));
    EXPECT_EQ("UnCaughtError 5000 Unknown error that was not caught", told(R"("throw", "type": "int")"));
    simulator.clear_faults();
    simulator.add_fault(R"({"call": "getServerTime", "do": "error", "error": {"why": "refused"}})");
    EXPECT_EQ(json(R"({"error": {"why": "refused"}, "version": "1.1"})"), reply(SERVER_TIME));
}

TEST_F(Agent_Tunnel, TakesTextsOfMegabytesOnASmallStack)
{
    open("empty.json");
    const std::string id(1024 * 1024, 'x');
    std::string deep(254, '[');
    deep += std::string(254, ']');
    on_small_stack([&] {
        EXPECT_EQ(id, reply(R"({"id": ")" + id + "\"}")["id"].asString());
        EXPECT_EQ(json(deep), reply(R"({"id": )" + deep + "}")["id"]);
        EXPECT_EQ(std::string(UNPARSED) + "nested deeper than 256 levels",
                  response_of(execute(std::string(1024 * 1024, '['))));
    });
}

TEST_F(Agent_Tunnel, ServesSixtyFourThreadsAtOnce)
{
    open("one_hba.json");
    std::atomic<unsigned> good = 0;
    std::vector<std::thread> clients;
    for (unsigned i = 0; i < 64; i++) {
        clients.emplace_back([this, i, &good] {
            const std::string id = std::to_string(i);
            const Json::Value served = reply(R"({"method": "discovery.getGlobalInfo", "id": )" + id + "}");
            const Json::Value refused =
                reply(R"({"method": "discovery.getLldp", "params": [], "id": ")" + id + "\"}");
            good += served["id"].asUInt() == i && served["result"]["numOfAdapters"].asInt() == 1;
            good += refused["id"].asString() == id && refused["error"]["code"].asInt() == 51;
        });
    }
    for (std::thread& client : clients)
        client.join();
    EXPECT_EQ(128u, good);
    EXPECT_EQ(64u, simulator.requests("getGlobalInfo").size());
}

TEST_F(Agent_Tunnel, LooksAlikeInEveryServer)
{
    for (const broker::Server_Options& options :
         {broker::Server_Options::sfcb_like(), broker::Server_Options::pegasus_like()}) {
        open("empty.json", options);
        simulator.add_fault(NOW);
        EXPECT_EQ("now", reply(SERVER_TIME)["result"].asString());
        EXPECT_TRUE(response_of(server->invoke_method(SERVICE, "executeMethod", {})).starts_with(UNPARSED));
        close();
    }
}

TEST_F(Agent_Tunnel, HasNoOtherOperations)
{
    open("empty.json");
    broker::Instance_Value instance;
    instance.path = SERVICE;
    instance.properties = SERVICE.keys;
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->create_instance(instance).rc);
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->modify_instance(instance).rc);
    EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, server->delete_instance(SERVICE).rc);
}

} // namespace
} // namespace KPRV
