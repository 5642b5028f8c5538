#include "tests/module/agent/Agent_Fixture.h"

namespace KPRV {
namespace {

class Discovery : public Agent_Fixture
{
protected:
    /// The library answers each question with the question.
    void echo(const char* symbol)
    {
        library.answers(symbol, [](const Json::Value& request) { return request; });
    }
    void host_has(const std::string& inventory)
    {
        library.answers("getGlobalInfo", json(inventory));
        for (const char* symbol : {"getHbaByMac", "getHbaByWwn", "getPortByWwn"})
            echo(symbol);
    }
    /// The calls behind the first one.
    Lines asked() const
    {
        Lines told = library.told();
        EXPECT_FALSE(told.empty());
        if (!told.empty())
            told.erase(told.begin());
        return told;
    }
};

class All_Hbas : public Discovery
{
protected:
    static constexpr const char* METHOD = "discovery.getAllHbasByHost";

    Lines asked_for(const std::string& record)
    {
        library.calls.clear();
        host_has("{'numOfAdapters': 1, 'adapter': [" + record + "]}");
        result(METHOD, "[]");
        return asked();
    }
};

TEST_F(All_Hbas, AreAskedForByTheFirstAddressThatTheirKindHas)
{
    const Lines by_mac = {R"(getHbaByMac {"mac":"m"})"}, by_wwn = {R"(getHbaByWwn {"wwn":"w"})"};
    const auto record = [](const char* kinds) {
        return std::string("{'mac': 'm', 'wwn': 'w'") + kinds + "}";
    };
    EXPECT_EQ(by_mac, asked_for(record(", 'cna': true, 'fc': true, 'fcoe': true, 'ethPort': true")));
    EXPECT_EQ(by_mac, asked_for(record(", 'cna': true")));
    EXPECT_EQ(by_wwn, asked_for(record(", 'cna': false, 'fc': true, 'ethPort': true")));
    EXPECT_EQ(by_wwn, asked_for(record(", 'fcoe': true, 'ethPort': true")));
    EXPECT_EQ(by_mac, asked_for(record(", 'ethPort': true")));
    EXPECT_EQ(by_wwn, asked_for(record("")));
}

TEST_F(All_Hbas, ComeInTheOrderOfTheInventoryWithTheirFailures)
{
    host_has("{'numOfAdapters': 3, 'adapter': [{'fc': true, 'wwn': '1'}, {'cna': true, 'mac': '2'}, {}]}");
    library.answers("getHbaByMac", json("{'error': {'code': 1}}"));
    EXPECT_EQ(R"([{"wwn":"1"},{"error":{"code":1}},{"wwn":""}])", result(METHOD, "{'any': 'params'}"));
    EXPECT_EQ((Lines{R"(getGlobalInfo {"any":"params"})", R"(getHbaByWwn {"wwn":"1"})",
                     R"(getHbaByMac {"mac":"2"})", R"(getHbaByWwn {"wwn":""})"}),
              library.told());
}

TEST_F(All_Hbas, OfAHostWithoutAdaptersAreNull)
{
    for (const char* inventory :
         {"{'numOfAdapters': 0, 'adapter': []}", "{'numOfAdapters': -1}", "{}", "null", "[]", "'text'",
          "{'adapter': [{'wwn': 'w'}]}", "{'error': {'code': 1}}"}) {
        host_has(inventory);
        EXPECT_EQ("null", result(METHOD, "[]")) << inventory;
    }
    EXPECT_EQ(8u, library.calls.size());
}

TEST_F(All_Hbas, AreAsManyAsTheInventorySays)
{
    host_has("{'numOfAdapters': 1, 'adapter': [{'wwn': '1'}, {'wwn': '2'}]}");
    EXPECT_EQ(R"([{"wwn":"1"}])", result(METHOD, "[]"));
    host_has("{'numOfAdapters': 2, 'adapter': [{'wwn': '1'}]}");
    EXPECT_EQ(R"([{"wwn":"1"},{"wwn":""}])", result(METHOD, "[]"));
}

TEST_F(All_Hbas, FailWhereTheInventoryOrTheWalkDoes)
{
    host_has("{'numOfAdapters': 'two'}");
    EXPECT_EQ(NO_INT, error(METHOD, "[]"));
    host_has("{'numOfAdapters': 2, 'adapter': [{'wwn': '1'}, {'wwn': 2}]}");
    EXPECT_EQ(NO_STRING, error(METHOD, "[]"));
    host_has("{'numOfAdapters': 2, 'adapter': [{'wwn': '1'}, {'wwn': '2'}]}");
    library.calls.clear();
    library.throws("getHbaByWwn", HbaAgentError{3, "gone"});
    EXPECT_EQ("USERDEFINEDError 3 gone", error(METHOD, "[]"));
    EXPECT_EQ(1u, library.count("getHbaByWwn"));
    library.throws("getGlobalInfo", HbaAgentError{4, "off"});
    EXPECT_EQ("USERDEFINEDError 4 off", error(METHOD, "[]"));
}

TEST_F(All_Hbas, AreCountedInTheLog)
{
    host_has("{'numOfAdapters': 1, 'adapter': [{}]}");
    const Log_Capture log;
    result(METHOD, "[]");
    EXPECT_EQ((Lines{"DBG Entering ProviderDiscoveryMethods::getAllHbasByHost", "DBG numOfAdapters=1",
                     "DBG Returning ProviderDiscoveryMethods::getAllHbasByHost"}),
              log.said());
}

class All_Ports : public Discovery
{
protected:
    static constexpr const char* METHOD = "discovery.getAllPortsByHba";
    static constexpr const char* INVENTORY =
        "{'numOfAdapters': 3, 'adapter': ["
        "{'wwn': '20:0a', 'mac': '00:0a', 'numOfPorts': 5,"
        " 'portHasFc': [true, false, false, true, false], 'portHasEth': [true, true, false, true, false],"
        " 'portHasFcoe': [true, true, true], 'portWwn': ['w0', 'w1', 'w2', 'w3', 'w4'],"
        " 'portMac': ['m0', 'm1', 'm2', 'm3', 'm4'], 'fcoeMac': ['f0', 'f1', 'f2']},"
        "{'wwn': '20:0b', 'mac': '00:0b', 'numOfPorts': 0},"
        "{'wwn': '20:0A', 'mac': '00:0c', 'numOfPorts': 1, 'portHasFc': [true], 'portWwn': ['other']}]}";
};

TEST_F(All_Ports, AreAskedForByTheFirstKindThatTheyHave)
{
    host_has(INVENTORY);
    EXPECT_EQ(R"([{"wwn":"w0"},{"mac":"m1"},{"mac":"f2"},{"wwn":"w3"},null])", result(METHOD, "['20:0a']"));
    EXPECT_EQ(
        (Lines{R"(getGlobalInfo ["20:0a"])", R"(getPortByWwn {"wwn":"w0"})", R"(getPortByWwn {"mac":"m1"})",
               R"(getPortByWwn {"mac":"f2"})", R"(getPortByWwn {"wwn":"w3"})", "getPortByWwn null"}),
        library.told());
}

TEST_F(All_Ports, BelongToTheFirstAdapterOfThatAddressWhateverItsCase)
{
    host_has(INVENTORY);
    // The third adapter has the same WWN but for the case; the walk ends at the first.
    EXPECT_EQ(5u, json(result(METHOD, "['20:0A']")).size());
    EXPECT_EQ(5u, json(result(METHOD, "['00:0A']")).size());
    EXPECT_EQ(R"([{"wwn":"other"}])", result(METHOD, "['00:0C']"));
}

TEST_F(All_Ports, OfAnUnknownAdapterAreNull)
{
    host_has(INVENTORY);
    for (const char* address : {"['20:0']", "['20:0a ']", "['200a']", "['']", R"(["20:0a\u0000"])", "[true]"})
        EXPECT_EQ("null", result(METHOD, address)) << address;
    for (const char* inventory : {"{}", "null", "[]", "{'numOfAdapters': 0, 'adapter': [{'wwn': 'w'}]}"}) {
        host_has(inventory);
        EXPECT_EQ("null", result(METHOD, "['w']")) << inventory;
    }
    EXPECT_EQ(0u, library.count("getPortByWwn"));
}

TEST_F(All_Ports, OfAnAdapterWithoutAddressAreFoundByTheEmptyText)
{
    host_has("{'numOfAdapters': 1, 'adapter': [{'wwn': 'w', 'numOfPorts': 1}]}");
    EXPECT_EQ("[null]", result(METHOD, "['']"));
}

TEST_F(All_Ports, ThatAreNotThereAreAFailure)
{
    const char* const none = "JSONRPCError 200 Unable to find any Port attributes";
    host_has(INVENTORY);
    EXPECT_EQ(none, error(METHOD, "['20:0B']"));
    host_has("{'numOfAdapters': 1, 'adapter': [{'wwn': 'w', 'numOfPorts': -1}]}");
    EXPECT_EQ(none, error(METHOD, "['w']"));
    host_has("{'numOfAdapters': 1, 'adapter': [{'wwn': 'w'}]}");
    EXPECT_EQ(none, error(METHOD, "['w']"));
}

TEST_F(All_Ports, KeepTheirFailuresAndEndWithWhatIsThrown)
{
    host_has(INVENTORY);
    library.answers("getPortByWwn", json("{'error': 1}"));
    EXPECT_EQ(R"([{"error":1}])", result(METHOD, "['00:0c']"));
    library.throws("getPortByWwn", std::runtime_error("lost"));
    EXPECT_EQ("JSONRPCError 200 lost", error(METHOD, "['20:0a']"));
    EXPECT_EQ(2u, library.count("getPortByWwn"));
    EXPECT_EQ(NO_STRING, error(METHOD, "[5]"));
}

TEST_F(All_Ports, TraceTheirMethod)
{
    host_has(INVENTORY);
    const Log_Capture log;
    result(METHOD, "['00:0c']");
    EXPECT_EQ((Lines{"DBG Entering ProviderDiscoveryMethods::getAllPortsByHba",
                     "DBG Returning ProviderDiscoveryMethods::getAllPortsByHba"}),
              log.said());
}

TEST_F(Discovery, WrapsOneAnswerOfAll)
{
    for (const char* answer : {"{'a': 1}", "[1, 2]", "null", "{'error': {'code': 1}}"}) {
        library.answers("getFcByFcWwn", json(answer));
        EXPECT_EQ("[" + compact(json(answer)) + "]", result("discovery.getAllFcByPort", "['w']"));
        library.answers("getFcoeByPort", json(answer));
        EXPECT_EQ("[" + compact(json(answer)) + "]", result("discovery.getAllFcoeByPort", "['w']"));
    }
}

} // namespace
} // namespace KPRV
