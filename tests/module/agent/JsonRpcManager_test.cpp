#include "module/agent/Agent_Errors.h"
#include "module/agent/MethodRegistration.h"
#include "tests/module/agent/Agent_Fixture.h"

#include <thread>

namespace KPRV {
namespace {

class Dispatcher : public Agent_Fixture
{
protected:
    /// The rest of a text that could not be parsed.
    static std::string why_unparsed(const std::string& request)
    {
        const std::string head = "There was an error parsing the JSON text comprising the Procedure Call:\n";
        const JsonRpcManager::response reply = process(request);
        EXPECT_EQ(500, reply.status);
        EXPECT_TRUE(reply.text.starts_with(head)) << reply.text;
        return reply.text.substr(std::min(head.size(), reply.text.size()));
    }
    /// What is thrown at the caller of the dispatcher.
    static std::string let_out(const std::string& request)
    {
        JsonRpcManager::response reply{"untouched", 7};
        try {
            JsonRpcManager::instance()->process(request, reply);
        } catch (const std::exception& error) {
            EXPECT_EQ("untouched", reply.text);
            EXPECT_EQ(7, reply.status);
            return error.what();
        }
        return "nothing: " + reply.text;
    }
};

TEST_F(Dispatcher, WritesRepliesOverSeveralLines)
{
    library.answers("getPortStatistics", json("{'frames': [1, 2], 'name': 'p'}"));
    EXPECT_EQ(R"({
   "id" : 7,
   "result" : {
      "frames" : [ 1, 2 ],
      "name" : "p"
   },
   "version" : "1.1"
}
)",
              reply_text(R"({"id": 7, "method": "discovery.getPortStatistics", "params": ["x"]})"));
    EXPECT_EQ(R"({
   "error" : {
      "code" : 51,
      "message" : "Mismatch in number of parameters.",
      "name" : "USERDEFINEDError"
   },
   "id" : "a",
   "version" : "1.1"
}
)",
              reply_text(R"({"id": "a", "method": "discovery.getPortStatistics"})"));
}

TEST_F(Dispatcher, DoesNotFindAProcedureWithoutAName)
{
    for (const char* request :
         {"{}", "null", R"({"method": null})", R"({"method": ""})", R"({"params": [1]})",
          R"({"Method": "discovery.getHost"})", R"({"method": "discovery.gethost"})",
          R"({"method": " discovery.getHost"})", R"({"method": "getHost"})", R"({"method": true})",
          R"({"method": "discovery.getHost\u0000"})", "{} and what follows is not read", "// nothing\n{}"}) {
        EXPECT_EQ(R"({
   "error" : {
      "code" : 105,
      "message" : "Procedure not found",
      "name" : "JSONRPCError"
   },
   "version" : "1.1"
}
)",
                  reply_text(request))
            << request;
    }
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(Dispatcher, GivesTheIdBackAsItCame)
{
    for (const char* id : {"7", "-7", "4294967296", "18446744073709551615", "1.5", "\"text\"", "\"\"", "null",
                           "true", "[]", "{}", R"({"a":[1,{"b":null}]})", R"("\u0000\u001f\"")"}) {
        const Json::Value found = json(reply_text(std::string(R"({"id": )") + id + "}"));
        EXPECT_EQ(json(id), found["id"]);
        EXPECT_TRUE(found.isMember("id"));
        const Json::Value served =
            json(reply_text(std::string(R"({"method": "discovery.getServerTime", "id": )") + id + "}"));
        EXPECT_EQ(json(id), served["id"]);
        EXPECT_TRUE(served.isMember("result"));
    }
    EXPECT_FALSE(json(reply_text("{}")).isMember("id"));
}

TEST_F(Dispatcher, ServesAllVersionsAlike)
{
    library.answers("getServerTime", json("'now'"));
    for (const char* version : {R"("1.0")", R"("1.1")", R"("2.0")", R"("")", R"("none")", "null", "true"}) {
        const std::string request =
            std::string(R"({"method": "discovery.getServerTime", "version": )") + version + "}";
        EXPECT_EQ(json("{'result': 'now', 'version': '1.1'}"), json(reply_text(request))) << version;
    }
}

TEST_F(Dispatcher, AnswersWhatDoesNotParseWithAPlainText)
{
    EXPECT_EQ("* Line 1, Column 1\n  Syntax error: value, object or array expected.\n", why_unparsed(""));
    EXPECT_EQ("* Line 1, Column 2\n  Missing '}' or object member name\n", why_unparsed("{"));
    for (const char* text : {" ", "hello", "{\"id\": 7, ", "[1", "}", "\"open", "{'method': 'x'}", "/*",
                             "nul", "{\"a\": 1e999}", "{\"a\": \"\\ud800\"}", "\xff\xfe{}", "{\"a\" 1}"})
        EXPECT_NE("", why_unparsed(text)) << text;
    EXPECT_TRUE(library.calls.empty());
}

// Outside the guard around the procedures: these reach the caller, and through it the CIM server.
TEST_F(Dispatcher, LetsOutWhatIsNoRequestAtAll)
{
    const std::string no_object = "in Json::Value::find(begin, end): requires objectValue or nullValue";
    for (const char* request : {"[]", "[{}]", "5", "1.5", "true", "\"discovery.getHost\""})
        EXPECT_EQ(no_object, let_out(request)) << request;

    const std::string no_string = "Type is not convertible to string";
    for (const char* value : {"5", "1.5", "[]", "{}"}) {
        EXPECT_EQ(no_string, let_out(std::string(R"({"method": )") + value + "}"));
        EXPECT_EQ(no_string,
                  let_out(std::string(R"({"method": "discovery.getHost", "version": )") + value + "}"));
    }
    EXPECT_THROW(process(R"({"method": 5})"), std::runtime_error);
    EXPECT_THROW(process(R"({"version": 1.1})"), std::runtime_error);
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(Dispatcher, LiftsOnlyTheErrorOfAnObject)
{
    const auto replied = [&](const char* answer) {
        library.answers("getServerTime", json(answer));
        return compact(json(reply_text(R"({"method": "discovery.getServerTime"})")));
    };
    EXPECT_EQ(R"({"error":{"any":1},"version":"1.1"})", replied("{'error': {'any': 1}, 'time': 5}"));
    EXPECT_EQ(R"({"error":"text","version":"1.1"})", replied("{'error': 'text'}"));
    EXPECT_EQ(R"({"error":null,"version":"1.1"})", replied("{'error': null, 'a': 1}"));
    EXPECT_EQ(R"({"error":false,"version":"1.1"})", replied("{'error': false}"));
    EXPECT_EQ(R"({"result":[{"error":1}],"version":"1.1"})", replied("[{'error': 1}]"));
    EXPECT_EQ(R"({"result":{"a":{"error":1}},"version":"1.1"})", replied("{'a': {'error': 1}}"));
    EXPECT_EQ(R"({"result":"error","version":"1.1"})", replied("'error'"));
    EXPECT_EQ(R"({"result":null,"version":"1.1"})", replied("null"));
    EXPECT_EQ(R"({"result":{},"version":"1.1"})", replied("{}"));
}

// The methods of these tests stay in the dispatcher of this process, under names that no other test lists.
class Own_Methods : public Dispatcher
{
protected:
    static std::string called(JsonRpcManager::Handler handler)
    {
        JsonRpcManager manager = *JsonRpcManager::instance();
        manager._registerMethod("test", handler);
        JsonRpcManager::response reply;
        manager.process(R"({"method": "test", "params": {"a": 1}})", reply);
        EXPECT_EQ(200, reply.status);
        return compact(json(reply.text));
    }
};

TEST_F(Own_Methods, GetTheParamsAndANullResult)
{
    EXPECT_EQ(R"({"result":{"params":{"a":1},"was null":true},"version":"1.1"})",
              called([](const Json::Value& params, Json::Value& result) {
                  const bool null = result.isNull();
                  result["params"] = params;
                  result["was null"] = null;
              }));
    EXPECT_EQ(R"({"result":null,"version":"1.1"})", called([](const Json::Value&, Json::Value&) {}));
}

TEST_F(Own_Methods, LeaveNothingOfTheirResultWhenTheyThrow)
{
    EXPECT_EQ(R"({"error":{"code":5,"message":"five","name":"USERDEFINEDError"},"version":"1.1"})",
              called([](const Json::Value&, Json::Value& result) {
                  result["partial"] = true;
                  throw HbaAgentError{5, "five"};
              }));
    EXPECT_EQ(R"({"error":{"code":200,"message":"out of reach","name":"JSONRPCError"},"version":"1.1"})",
              called([](const Json::Value&, Json::Value& result) {
                  result["error"] = "partial";
                  throw std::out_of_range("out of reach");
              }));
    EXPECT_EQ(R"({"error":{"code":5000,"message":"Unknown error that was not caught",)"
              R"("name":"UnCaughtError"},"version":"1.1"})",
              called([](const Json::Value&, Json::Value& result) {
                  result.append(1);
                  throw "text";
              }));
}

TEST_F(Own_Methods, HaveErrorsOfTheirOwn)
{
    const auto told = [](const char* code_and_message) {
        return std::string(R"({"error":{)") + code_and_message +
               R"(,"name":"USERDEFINEDError"},"version":"1.1"})";
    };
    EXPECT_EQ(told(R"("code":51,"message":"Mismatch in number of parameters.")"),
              called([](const Json::Value&, Json::Value&) { throw ErrorParamMismatch(); }));
    EXPECT_EQ(told(R"("code":54,"message":"Not a JSON array format.")"),
              called([](const Json::Value&, Json::Value&) { throw ErrorBadJsonArray(); }));
    EXPECT_EQ(told(R"("code":55,"message":"Not a JSON Object format.")"),
              called([](const Json::Value&, Json::Value&) { throw ErrorBadJsonObject(); }));
    static_assert(sizeof(ErrorParamMismatch) == sizeof(HbaAgentError));
}

TEST_F(Own_Methods, ReplaceOneOfTheSameName)
{
    JsonRpcManager manager = *JsonRpcManager::instance();
    manager._registerMethod("test", [](const Json::Value&, Json::Value& result) { result = 1; });
    manager._registerMethod("test", [](const Json::Value&, Json::Value& result) { result = 2; });
    manager._registerMethod("", [](const Json::Value&, Json::Value& result) { result = "nameless"; });
    EXPECT_EQ(119u + 2, manager.getMethods().size());
    EXPECT_EQ("", manager.getMethods().front());
    JsonRpcManager::response reply;
    manager.process(R"({"method": "test"})", reply);
    EXPECT_EQ(2, json(reply.text)["result"].asInt());
    manager.process("{}", reply);
    EXPECT_EQ("nameless", json(reply.text)["result"].asString());
}

TEST_F(Dispatcher, IsOneAndEntersItsMethodsOnce)
{
    JsonRpcManager* const manager = JsonRpcManager::instance();
    EXPECT_EQ(manager, JsonRpcManager::instance());
    const Log_Capture log;
    MethodRegistration::registerMethods();
    EXPECT_EQ(Lines{"DBG Entering: registerMethods"}, log.traces());
    EXPECT_EQ(119u, manager->getMethods().size());
    JsonRpcManager::registerMethod("discovery.getHost",
                                   [](const Json::Value&, Json::Value& result) { result = "another"; });
    EXPECT_EQ(119u, manager->getMethods().size());
    EXPECT_EQ("another", call("discovery.getHost", "[]")["result"].asString());
    MethodRegistration::registerMethods();
    library.answers("getHost", json("{'result': {'error': 1}}"));
    EXPECT_EQ(R"({"result":{"error":1}})", result("discovery.getHost", "[]"));
}

TEST_F(Dispatcher, IsAskedByManyThreadsAtOnce)
{
    // The scripted library keeps a list, which is not for threads: its stubs are.
#define ENTRY_POINT(symbol, variable, signature) variable = &default_##signature;
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
    std::vector<std::thread> threads;
    std::atomic<unsigned> good = 0;
    for (unsigned i = 0; i < 64; i++) {
        threads.emplace_back([&good, i] {
            const std::string id = std::to_string(i);
            for (const char* method : {"discovery.getServerTime", "discovery.getHbaByWwn", "none"}) {
                JsonRpcManager::response reply;
                JsonRpcManager::instance()->process(R"({"method": ")" + std::string(method) +
                                                        R"(", "params": ["x"], "id": )" + id + "}",
                                                    reply);
                good += reply.text.find("\"id\" : " + id + ",") != std::string::npos;
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(64u * 3, good);
}

/// The answer as the provider takes it.
String answered(const std::string& request)
{
    String text;
    EXPECT_EQ(200, JsonRpcManager::instance()->answer(request, text));
    return text;
}

TEST_F(Dispatcher, LeavesEarlierRepliesAloneWhateverComesAfterThem)
{
    library.answers("getPortStatistics", json("{'name': 'p'}"));
    const auto request = [](const std::string& id) {
        return R"({"method": "discovery.getPortStatistics", "params": ["x"], "id": ")" + id + R"("})";
    };
    const std::string size(5000, 'i');
    const String first = answered(request("first")), second = answered(request("a longer second"));
    const String third = answered(request(size)), fourth = answered(request("4"));
    const auto reply = [](const std::string& id) {
        return "{\n   \"id\" : \"" + id + "\",\n   \"result\" : {\n      \"name\" : \"p\"\n   },\n   " +
               "\"version\" : \"1.1\"\n}\n";
    };
    EXPECT_EQ(reply("first"), first.c_str());
    EXPECT_EQ(reply("a longer second"), second.c_str());
    EXPECT_EQ(reply(size), third.c_str());
    EXPECT_EQ(reply("4"), fourth.c_str());
    // The comments, errors and depth of one request are none of the next one's.
    EXPECT_NE("", why_unparsed(R"(/* before */ {"method": ["a", } )"));
    EXPECT_EQ(reply("after"), answered(request("after")).c_str());
}

TEST_F(Dispatcher, HoldsOnToShortRepliesOnly)
{
    Kept_Json_Tools tools;
    const auto capacity_after = [&tools](const char* reply) {
        tools.lend(1, [&](Json_Tools& lent) { lent.reply.assign(reply); });
        return tools.lend(1, [](Json_Tools& lent) { return lent.reply.capacity(); });
    };
    EXPECT_EQ(64u, capacity_after(std::string(50, 'a').c_str()));
    EXPECT_EQ(64u, capacity_after("b"));
    EXPECT_EQ(0u, capacity_after(std::string(5000, 'c').c_str()));
    EXPECT_EQ(32u, capacity_after("d"));
    const Kept_Json_Tools copy = tools;
    EXPECT_EQ(0u, Kept_Json_Tools(copy).lend(1, [](Json_Tools& lent) { return lent.reply.capacity(); }));
}

TEST_F(Dispatcher, GivesItsToolsBackWhenAMethodThrows)
{
    Kept_Json_Tools tools;
    const auto tools_of = [&tools](size_t request) {
        return tools.lend(request, [](Json_Tools& lent) { return &lent; });
    };
    const Json_Tools* const kept = tools_of(1);
    EXPECT_THROW(tools.lend(1, [](Json_Tools&) { throw 1; }), int);
    EXPECT_EQ(kept, tools_of(1));
    EXPECT_EQ(kept, tools_of(4096));
    EXPECT_NE(kept, tools_of(4097));
    tools.lend(1, [&](Json_Tools& lent) {
        EXPECT_EQ(kept, &lent);
        EXPECT_NE(kept, tools_of(1));
    });
    EXPECT_EQ(kept, tools_of(1));
}

} // namespace
} // namespace KPRV
