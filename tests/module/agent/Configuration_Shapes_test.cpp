#include "tests/module/agent/Agent_Fixture.h"

namespace KPRV {
namespace {

using Configuration = Agent_Fixture;

TEST_F(Configuration, SendsAnAliasWhereItsTypeBelongs)
{
    library.answers("setAdapterAlias", json("'adapter'"));
    library.answers("setPortAlias", json("'port'"));
    const auto sent = [&](const char* type) {
        return result("configuration.setAlias", std::string("[{'type': '") + type + "', 'alias': 'a'}]");
    };
    EXPECT_EQ(R"("adapter")", sent("Node"));
    EXPECT_EQ(R"("adapter")", sent("CNA"));
    for (const char* type : {"Port", "", "node", "cna", "Node ", "Eth"})
        EXPECT_EQ(R"("port")", sent(type)) << type;
    EXPECT_EQ(R"(setAdapterAlias {"alias":"a","type":"Node"})", library.told().at(0));
    EXPECT_EQ(R"(setPortAlias {"alias":"a","type":"Port"})", library.told().at(2));
}

TEST_F(Configuration, NeedsTheTypeOfAnAlias)
{
    for (const char* alias : {"{}", "{'Type': 'Node'}", "{'type': null}", "{'type': 5}", "{'type': true}",
                              "{'type': ['Node']}", "null"})
        EXPECT_EQ(NO_STRING, error("configuration.setAlias", std::string("[") + alias + "]")) << alias;
    for (const char* alias : {"'Node'", "5", "[]", "true"})
        EXPECT_EQ(NO_MEMBERS, error("configuration.setAlias", std::string("[") + alias + "]")) << alias;
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(Configuration, SetsEachAliasOfAnArray)
{
    library.answers("setAdapterAlias", json("{'error': {'code': 1}}"));
    library.answers("setPortAlias", json("'port'"));
    EXPECT_EQ(R"(["port",{"error":{"code":1}},"port"])",
              result("configuration.setAliases",
                     "[[{'type': 'Port', 'n': 1}, {'type': 'CNA', 'n': 2}, {'type': 'Port', 'n': 3}]]"));
    EXPECT_EQ((Lines{R"(setPortAlias {"n":1,"type":"Port"})", R"(setAdapterAlias {"n":2,"type":"CNA"})",
                     R"(setPortAlias {"n":3,"type":"Port"})"}),
              library.told());
    library.calls.clear();
    for (const char* none : {"[[]]", "[null]"})
        EXPECT_EQ("null", result("configuration.setAliases", none));
    for (const char* wrong : {"[{}]", "['text']", "[5]"})
        EXPECT_EQ(NO_ARRAY, error("configuration.setAliases", wrong));
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(Configuration, EndsTheAliasesWithTheFirstFailure)
{
    const char* const three = "[[{'type': 'Port'}, {'type': 'Node'}, {'type': 'Port'}]]";
    library.throws("setAdapterAlias", HbaAgentError{8, "full"});
    EXPECT_EQ("USERDEFINEDError 8 full", error("configuration.setAliases", three));
    EXPECT_EQ(2u, library.calls.size());
    library.calls.clear();
    EXPECT_EQ(NO_STRING, error("configuration.setAliases", "[[{'type': 'Port'}, {}, {'type': 'Port'}]]"));
    EXPECT_EQ(1u, library.calls.size());
}

TEST_F(Configuration, SendsLunMasksWithAllThreeMembers)
{
    const char* const method = "configuration.setLunMaskDataForPort";
    library.answers("setLunMaskData", json("{'done': true}"));
    const auto sent = [&](const char* data) {
        library.calls.clear();
        EXPECT_EQ(R"({"done":true})", result(method, std::string("['p', ") + data + "]"));
        return library.told().at(0);
    };
    EXPECT_EQ(R"(setLunMaskData {"addedLunMaskData":[1],"clearLunMaskData":true,"indexStr":"p",)"
              R"("removedLunMaskData":[{"a":2}]})",
              sent("{'addedLunMaskData': [1], 'removedLunMaskData': [{'a': 2}], 'clearLunMaskData': true,"
                   " 'other': 1}"));
    const char* const nothing = R"(setLunMaskData {"addedLunMaskData":null,"clearLunMaskData":false,)"
                                R"("indexStr":"p","removedLunMaskData":null})";
    EXPECT_EQ(nothing, sent("{}"));
    EXPECT_EQ(nothing, sent("null"));
    EXPECT_EQ(nothing, sent("{'addedLunMaskData': null, 'removedLunMaskData': null, 'clearLunMaskData': 0}"));
    library.answers("setLunMaskData", json("{'error': 5}"));
    EXPECT_EQ(R"({"error":5,"version":"1.1"})", result(method, "['p', {}]"));
}

TEST_F(Configuration, RefusesLunMasksThatAreNoLists)
{
    const char* const method = "configuration.setLunMaskDataForPort";
    for (const char* wrong : {"{}", "5", "'text'", "false"}) {
        EXPECT_EQ(NO_ARRAY, error(method, std::string("['p', {'addedLunMaskData': ") + wrong + "}]"));
        EXPECT_EQ(NO_ARRAY, error(method, std::string("['p', {'addedLunMaskData': [],"
                                                      " 'removedLunMaskData': ") +
                                              wrong + "}]"));
    }
    for (const char* wrong : {"5", "'text'", "[]"})
        EXPECT_EQ(NO_MEMBERS, error(method, std::string("['p', ") + wrong + "]"));
    EXPECT_EQ(NO_STRING, error(method, "[5, {'addedLunMaskData': 5}]"));
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(Configuration, SendsTheProfileListsThatAreThere)
{
    const char* const method = "configuration.setAdvancedIoProfile";
    library.answers("setAdvIoProfile", json("{'done': true}"));
    const auto sent = [&](const char* profiles) {
        library.calls.clear();
        EXPECT_EQ(R"({"done":true})", result(method, std::string("['p', ") + profiles + "]"));
        return library.told().at(0);
    };
    EXPECT_EQ(R"(setAdvIoProfile {"addedAdvancedIoProfiles":[1],"indexStr":"p"})",
              sent("{'addedAdvancedIoProfiles': [1], 'other': 2}"));
    EXPECT_EQ(R"(setAdvIoProfile {"indexStr":"p","removedAdvancedIoProfiles":[]})",
              sent("{'removedAdvancedIoProfiles': []}"));
    EXPECT_EQ(
        R"(setAdvIoProfile {"addedAdvancedIoProfiles":null,"indexStr":"p","removedAdvancedIoProfiles":[2]})",
        sent("{'addedAdvancedIoProfiles': null, 'removedAdvancedIoProfiles': [2]}"));
}

TEST_F(Configuration, RefusesProfilesOfAnotherShape)
{
    const char* const method = "configuration.setAdvancedIoProfile";
    for (const char* wrong :
         {"{}", "null", "{'other': []}", "[]", "'text'", "5", "['addedAdvancedIoProfiles']"})
        EXPECT_EQ(NO_OBJECT, error(method, std::string("['p', ") + wrong + "]")) << wrong;
    for (const char* wrong : {"5", "'text'", "{}", "true"}) {
        EXPECT_EQ(NO_ARRAY, error(method, std::string("['p', {'addedAdvancedIoProfiles': ") + wrong + "}]"));
        EXPECT_EQ(NO_ARRAY, error(method, std::string("['p', {'addedAdvancedIoProfiles': [],"
                                                      " 'removedAdvancedIoProfiles': ") +
                                              wrong + "}]"));
    }
    EXPECT_EQ(NO_STRING, error(method, "[5, 5]"));
    EXPECT_TRUE(library.calls.empty());
}

class Port_Resets : public Agent_Fixture
{
protected:
    static constexpr const char* METHOD = "configuration.resetStatisticsForPorts";
    static constexpr const char* ALL_FAILED = "JSONRPCError 200 Couldnt reset any of the port statistics";

    /// The library refuses ports that begin with "bad" by throwing.
    void SetUp() override
    {
        library.answers("resetStatisticsForPort", [](const Json::Value& request) -> Json::Value {
            const std::string port = request["indexStr"].asString();
            if (port.starts_with("bad"))
                throw HbaAgentError{1, "no port"};
            if (port == "lost")
                throw std::runtime_error("lost");
            if (port == "odd")
                throw 5;
            return port;
        });
    }
};

TEST_F(Port_Resets, GiveTheAnswersOfThePortsThatDidNotFail)
{
    EXPECT_EQ(R"(["a","b","c"])", result(METHOD, "[['a', 'b', 'c']]"));
    EXPECT_EQ(
        (Lines{R"(resetStatisticsForPort {"indexStr":"a"})", R"(resetStatisticsForPort {"indexStr":"b"})",
               R"(resetStatisticsForPort {"indexStr":"c"})"}),
        library.told());
    EXPECT_EQ(R"(["a","c"])", result(METHOD, "[['a', 'bad', 'c']]"));
    EXPECT_EQ(R"(["c"])", result(METHOD, "[['bad', 'bad', 'c']]"));
    library.answers("resetStatisticsForPort", json("{'error': 1}"));
    EXPECT_EQ(R"([{"error":1}])", result(METHOD, "[['a']]")) << "a refusal is an answer";
}

TEST_F(Port_Resets, FailWhereNoneSucceeds)
{
    for (const char* ports : {"[['bad']]", "[['bad 1', 'bad 2']]", "[[]]", "[null]"})
        EXPECT_EQ(ALL_FAILED, error(METHOD, ports)) << ports;
    EXPECT_EQ(3u, library.calls.size());
}

TEST_F(Port_Resets, EndWithAnyOtherFailure)
{
    EXPECT_EQ("JSONRPCError 200 lost", error(METHOD, "[['a', 'lost', 'c']]"));
    EXPECT_EQ("UnCaughtError 5000 Unknown error that was not caught", error(METHOD, "[['bad', 'odd', 'c']]"));
    EXPECT_EQ(NO_STRING, error(METHOD, "[['a', 5, 'c']]"));
    EXPECT_EQ(5u, library.calls.size());
    for (const char* wrong : {"[{}]", "['a']", "[5]"})
        EXPECT_EQ(NO_ARRAY, error(METHOD, wrong));
    EXPECT_EQ(5u, library.calls.size());
}

TEST_F(Configuration, NeverTakesAVirtualFabricFromTheWire)
{
    result("configuration.createVPort", "['p', 'n', 'v', 'vfId=5']");
    EXPECT_EQ(MISMATCH, error("configuration.createVPort", "['p', 'n', 'v', 's', 5]"));
    result("configuration.deleteVPort", "['p', [{'vfId': 7}]]");
    EXPECT_EQ((Lines{R"(createVport {"nwwn":"n","pwwn":"p","symbolicName":"vfId=5","vfId":0,"vwwn":"v"})",
                     R"(deleteVport {"pwwn":"p","vfId":0,"vportArray":[{"vfId":7}]})"}),
              library.told());
}

} // namespace
} // namespace KPRV
