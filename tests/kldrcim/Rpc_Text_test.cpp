#include "kldrcim/walks/Rpc_Text.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {
namespace {

/// The "params" that the words make, as JSON in one line; the error if they make none.
std::string params(const std::string& method, const std::vector<std::string>& words)
{
    std::string error;
    const auto request = rpc_request(method, words, error);
    if (!request)
        return error;
    Json::Value parsed;
    EXPECT_TRUE(Json::Reader().parse(*request, parsed)) << *request;
    EXPECT_EQ(method, parsed["method"].asString());
    EXPECT_TRUE(parsed.isMember("id"));
    Json::StreamWriterBuilder builder;
    builder["indentation"] = "";
    return Json::writeString(builder, parsed["params"]);
}

std::string deep(std::size_t levels)
{
    return std::string(levels, '[') + std::string(levels, ']');
}

constexpr const char* unknown = "discovery.notInTheTable";

TEST(Rpc_Text, NoWordsAreNoParameters)
{
    EXPECT_EQ("[]", params("discovery.getHost", {}));
    EXPECT_EQ("[]", params(unknown, {}));
}

TEST(Rpc_Text, PlainWordsAreStrings)
{
    EXPECT_EQ("[\"10:00:02:4b:4c:10:00:00\"]", params("discovery.getPortByWwn", {"10:00:02:4b:4c:10:00:00"}));
    EXPECT_EQ("[\"10:00\",\"two words\"]", params(unknown, {"10:00", "two words"}));
    EXPECT_EQ("[\"\",\"NULL\",\"-\",\"+1\",\"0x1f\",\"01\"]",
              params(unknown, {"", "NULL", "-", "+1", "0x1f", "01"}));
    EXPECT_EQ("[\"1.\",\".5\",\"1e\",\"1e+\",\"1e5x\",\"--1\",\"truest\"]",
              params(unknown, {"1.", ".5", "1e", "1e+", "1e5x", "--1", "truest"}));
}

TEST(Rpc_Text, ValuesOfJsonAreValues)
{
    EXPECT_EQ("[7,-7,0.5,true,null,\"7\"]", params(unknown, {"7", "-7", "5e-1", "true", "null", "\"7\""}));
    EXPECT_EQ("[1.5,12000.0]", params(unknown, {"1.5", "12e3"}));
    EXPECT_EQ("[\"1.\",\".5\",\"1e\",\"1e+\",\"-a\",\"1x\"]",
              params(unknown, {"1.", ".5", "1e", "1e+", "-a", "1x"}));
    EXPECT_EQ("[{\"a\":[1]},[]]", params(unknown, {"{\"a\": [1]}", "[]"}));
}

TEST(Rpc_Text, TheTableMakesStringsOfWhatLooksLikeNumbers)
{
    EXPECT_EQ("[\"1\",true]", params("diagnostics.startTests", {"1", "true"}));
    EXPECT_EQ("[\"true\",\"null\"]", params("configuration.setAdapterMode", {"true", "null"}));
    EXPECT_EQ("[\"02:4b:4c:20:00:00\",100,200]",
              params("configuration.createVnic", {"02:4b:4c:20:00:00", "100", "200"}));
    // A quoted text is what it says, and beyond the method's parameters the table says nothing.
    EXPECT_EQ("[\"a b\",true,7]", params("diagnostics.startTests", {"\"a b\"", "true", "7"}));
    // What is no boolean is sent all the same: the agent refuses it.
    EXPECT_EQ("[\"1\",\"yes\"]", params("diagnostics.startTests", {"1", "yes"}));
}

TEST(Rpc_Text, OneArrayIsAllParameters)
{
    EXPECT_EQ("[\"a\",1]", params("discovery.getVPort", {"[\"a\", 1]"}));
    EXPECT_EQ("[[\"a\"]]", params("configuration.resetStatisticsForPorts", {"[[\"a\"]]"}));
    EXPECT_EQ("[\"a\",[\"b\"]]", params("configuration.deleteVPort", {"a", "[\"b\"]"}));
}

TEST(Rpc_Text, WhatBeginsAsJsonMustBeJson)
{
    for (const char* word : {"[", "[1,]", "{\"a\"}", "\"open", "[1] 2", "{} {}"}) {
        EXPECT_EQ("not JSON: " + std::string(word), params(unknown, {word}));
        EXPECT_EQ("not JSON: " + std::string(word), params("discovery.getVPort", {"a", word}));
    }
    EXPECT_EQ("not JSON: " + deep(5000), params(unknown, {deep(5000)}));
}

TEST(Rpc_Text, AResultIsWrittenInLines)
{
    const Rpc_Reply reply =
        read_rpc_reply("{\"id\": 1, \"result\": {\"a\": [1, \"\u00e4\"]}, \"version\": \"1.1\"}");
    EXPECT_EQ("", reply.error);
    EXPECT_EQ("{\n  \"a\": \n  [\n    1,\n    \"\u00e4\"\n  ]\n}", reply.result);
    EXPECT_EQ("null", read_rpc_reply("{\"result\": null}").result);
    EXPECT_EQ("7", read_rpc_reply("{\"result\": 7}").result);
    EXPECT_EQ("18446744073709551615", read_rpc_reply("{\"result\": 18446744073709551615}").result);
}

TEST(Rpc_Text, AnErrorIsItsCodeAndMessage)
{
    EXPECT_EQ("51 Mismatch in number of parameters.",
              read_rpc_reply("{\"error\": {\"name\": \"n\", \"code\": 51, \"message\": \"Mismatch in number "
                             "of parameters.\"}}")
                  .error);
    EXPECT_EQ("-1 ", read_rpc_reply("{\"error\": {\"code\": -1, \"message\": \"\"}}").error);
    // The library may lift anything.
    EXPECT_EQ("\"broken\"", read_rpc_reply("{\"error\": \"broken\"}").error);
    EXPECT_EQ("null", read_rpc_reply("{\"error\": null}").error);
    EXPECT_EQ("{\"code\": \"x\"}", read_rpc_reply("{\"error\": {\"code\": \"x\"}}").error);
}

TEST(Rpc_Text, WhatIsNoReplyIsAnError)
{
    EXPECT_EQ("There was an error", read_rpc_reply("There was an error").error);
    EXPECT_EQ("[]", read_rpc_reply("[]").error);
    EXPECT_EQ("an empty reply", read_rpc_reply("").error);
    EXPECT_EQ(deep(5000), read_rpc_reply(deep(5000)).error);
}

} // namespace
} // namespace KPRV::kldrcim
