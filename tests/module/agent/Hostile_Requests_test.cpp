#include "tests/module/agent/Agent_Fixture.h"
#include "tests/support/Small_Stack.h"

namespace KPRV {
namespace {

std::string repeated(const std::string& text, unsigned times)
{
    std::string result;
    for (unsigned i = 0; i < times; i++)
        result += text;
    return result;
}

std::string nested(unsigned levels, const std::string& open, const std::string& close)
{
    return repeated(open, levels) + "1" + repeated(close, levels);
}

using Hostile_Requests = Agent_Fixture;

TEST_F(Hostile_Requests, AreReadToA256thLevelAndNotBeyond)
{
    library.answers("getServerTime", [](const Json::Value& request) { return request; });
    const auto request = [](const std::string& member, unsigned levels) {
        return R"({"method": "discovery.getServerTime", ")" + member + "\": " + nested(levels - 1, "[", "]") +
               "}";
    };
    for (const char* member : {"id", "params"}) {
        EXPECT_EQ(200, process(request(member, 256)).status);
        EXPECT_EQ(500, process(request(member, 257)).status);
    }
    EXPECT_EQ("There was an error parsing the JSON text comprising the Procedure Call:\n"
              "nested deeper than 256 levels",
              process(request("id", 257)).text);
    EXPECT_EQ(2u, library.calls.size());
    for (const char* open : {"[", "{\"a\":", "[1,", "[[],", "// \"\n["})
        EXPECT_EQ(500, process(repeated(open, 100000)).status);
}

TEST_F(Hostile_Requests, FitASmallStack)
{
    library.answers("getServerTime", [](const Json::Value& request) { return request; });
    on_small_stack([] {
        // Read, handed to the library, answered by it, and written again: once in objects, once in arrays.
        for (const std::string& deep : {nested(254, "{\"a\":", "}"), nested(254, "[", "]")}) {
            for (const char* member : {R"("method": "discovery.getServerTime", "params")", "\"id\""}) {
                const JsonRpcManager::response reply =
                    process(std::string("{") + member + ": [" + deep + "]}");
                EXPECT_EQ(200, reply.status);
                EXPECT_GT(reply.text.size(), 254u);
            }
        }
        EXPECT_EQ(500, process(std::string(4000000, '[')).status);
    });
}

TEST_F(Hostile_Requests, MayBeMegabytesLong)
{
    const std::string text(1024 * 1024, 'x');
    Json::Value params;
    params.append(text);
    call_with("discovery.getLldp", params);
    EXPECT_EQ(text, library.calls.at(0).request["mac"].asString());

    Json::Value many;
    for (int i = 0; i < 20000; i++)
        many.append(i);
    EXPECT_EQ(MISMATCH, error_with("discovery.getLldp", many));
    Json::Value ports;
    ports.append(many);
    EXPECT_EQ(NO_STRING, error_with("configuration.resetStatisticsForPorts", ports));

    library.answers("getServerTime", Json::Value(text));
    EXPECT_EQ(text, call_with("discovery.getServerTime", Json::Value())["result"].asString());
    EXPECT_EQ(200, process("{\"method\": \"" + text + "\"}").status);
    EXPECT_EQ(200, process("{" + std::string(4000000, ' ') + "}").status);
    EXPECT_EQ(500, process(text).status);
}

TEST_F(Hostile_Requests, MayHoldMembersTwice)
{
    EXPECT_EQ(
        105,
        json(process(R"({"method": "discovery.getHost", "method": "none"})").text)["error"]["code"].asInt());
    library.answers("getLldp", json("'lldp'"));
    EXPECT_EQ(
        "lldp",
        json(process(R"({"params": [], "method": "discovery.getLldp", "params": ["m"]})").text)["result"]
            .asString());
    EXPECT_EQ(2, json(process(R"({"id": 1, "id": 2})").text)["id"].asInt());
}

TEST_F(Hostile_Requests, MayHoldNulBytes)
{
    // Escaped ones are characters like others.
    call("discovery.getLldp", R"(["a\u0000b"])");
    EXPECT_EQ(std::string("a\0b", 3), library.calls.at(0).request["mac"].asString());
    // Raw ones end the text, unless they stand in a string.
    EXPECT_EQ(500, process(std::string("\0{}", 3)).status);
    EXPECT_EQ(500, process(std::string("{\0}", 3)).status);
    EXPECT_EQ(200, process(std::string("{}\0{", 4)).status);
    EXPECT_EQ(200, process(std::string("{\"id\": \"a\0b\"}", 13)).status);
    // A reply never holds one.
    library.throws("getLldp", HbaAgentError{1, std::string("a\0b", 3)});
    const std::string reply = reply_text(R"({"method": "discovery.getLldp", "params": ["m"]})");
    EXPECT_EQ(std::string::npos, reply.find('\0'));
    EXPECT_NE(std::string::npos, reply.find("a\\u0000b"));
}

TEST_F(Hostile_Requests, MayBeNoUtf8)
{
    for (const char* bytes : {"\xff", "\xc3", "\xed\xa0\x80", "\xf5\x80\x80\x80", "a\x80z"}) {
        library.calls.clear();
        const std::string request = R"({"method": "discovery.getLldp", "id": ")" + std::string(bytes) +
                                    R"(", "params": [")" + bytes + "\"]}";
        EXPECT_EQ(200, process(request).status);
        // The library gets the bytes as they came.
        EXPECT_EQ(bytes, library.calls.at(0).request["mac"].asString());
    }
}

TEST_F(Hostile_Requests, MayHoldNumbersOfAnySize)
{
    for (const char* number :
         {"99999999999999999999999", "-99999999999999999999999", "1e308", "2147483648", "-0.0"}) {
        EXPECT_EQ(json(number), json(process(std::string("{\"id\": ") + number + "}").text)["id"]) << number;
        const std::string params = std::string("['m', ") + number + ", 1]";
        const std::string said = error("configuration.createVnic", params);
        EXPECT_EQ(std::string(number) == "-0.0", said != NO_INT) << number << ": " << said;
    }
    EXPECT_EQ(500, process("{\"id\": 1e400}").status);
    EXPECT_EQ(500, process("{\"id\": " + std::string(100000, '9') + "}").status);
}

} // namespace
} // namespace KPRV
