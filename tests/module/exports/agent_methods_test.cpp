#include "tests/module/agent/Method_Facts.h"
#include "tests/module/exports/Agent_Calls.h"

namespace KPRV {
namespace {

using Agent_Methods = Agent_Calls;

TEST_F(Agent_Methods, AllReachTheLibraryAndGiveItsAnswer)
{
    open("empty.json");
    simulator.add_fault(R"({"call": "*", "do": "answer", "answer": {"answered": [true]}})");
    const Json::Value answer = json(R"({"answered": [true]})");
    size_t methods = 0;
    for (const Fact& fact : facts) {
        if (fact.form == OWN)
            continue;
        SCOPED_TRACE(fact.wire);
        mark();
        const Json::Value params = samples(fact);
        Json::Value request;
        request["method"] = fact.wire;
        request["params"] = params;
        const Json::Value result = reply(compact(request))["result"];
        EXPECT_EQ(answer, fact.form == WRAPPED ? result[0] : result);
        const auto calls = simulator.calls();
        ASSERT_EQ(1u, calls.size());
        EXPECT_EQ(fact.symbol, calls[0].name);
        EXPECT_EQ(expected_query(fact, params), calls[0].request);
        methods++;
    }
    EXPECT_EQ(107u, methods);
}

TEST_F(Agent_Methods, OfTheirOwnReachTheLibraryToo)
{
    open("empty.json");
    simulator.add_fault(R"({"call": "*", "do": "answer", "answer": {"numOfAdapters": 1,
        "adapter": [{"wwn": "w", "mac": "m", "cna": true, "numOfPorts": 1, "portHasFc": [true], "portWwn": ["p"]}]}})");
    const char* const target = R"({"portWwn":"p","localPortWwn":"l","remotePortWwn":"r"})";
    const std::string targeted = std::string(R"(["1", "h", [)") + target + "], 2]";
    struct
    {
        const char* method;
        std::string params;
        Lines calls;
    } const rows[] = {
        {"discovery.getHost", "[]", {"getHost"}},
        {"discovery.getAllHbasByHost", "[]", {"getGlobalInfo", "getHbaByMac"}},
        {"discovery.getAllPortsByHba", R"(["w"])", {"getGlobalInfo", "getPortByWwn"}},
        {"configuration.setAlias", R"([{"type": "CNA"}])", {"setAdapterAlias"}},
        {"configuration.setAliases",
         R"([[{"type": "Port"}, {"type": "Node"}]])",
         {"setPortAlias", "setAdapterAlias"}},
        {"configuration.setLunMaskDataForPort", R"(["p", {}])", {"setLunMaskData"}},
        {"configuration.setAdvancedIoProfile",
         R"(["p", {"addedAdvancedIoProfiles": []}])",
         {"setAdvIoProfile"}},
        {"configuration.resetStatisticsForPorts",
         R"([["p", "q"]])",
         {"resetStatisticsForPort", "resetStatisticsForPort"}},
        {"diagnostics.doEchoTest", targeted, {"postDiagnostics"}},
        {"diagnostics.doFCPingTest", targeted, {"postDiagnostics"}},
        {"diagnostics.doFCTraceRoute", targeted, {"postDiagnostics"}},
        {"diagnostics.getRequestID", "[]", {"getRequestID"}},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.method);
        mark();
        EXPECT_FALSE(call(row.method, row.params)["result"].isNull());
        EXPECT_EQ(row.calls, simulator.call_names());
    }
}

TEST_F(Agent_Methods, WalkTheAdaptersAndPortsOfAHost)
{
    open("demo.json");
    const Json::Value hbas = call("discovery.getAllHbasByHost", "[]")["result"];
    const Json::Value info = call("discovery.getGlobalInfo", "[]")["result"];
    ASSERT_GT(hbas.size(), 1u);
    EXPECT_EQ(info["numOfAdapters"].asUInt(), hbas.size());
    for (unsigned i = 0; i < hbas.size(); i++) {
        const std::string wwn = info["adapter"][i]["wwn"].asString(),
                          mac = info["adapter"][i]["mac"].asString();
        const std::string address = wwn.empty() ? mac : wwn;
        EXPECT_EQ(hbas[i], call("discovery.getHbaByWwn", "[\"" + address + "\"]")["result"]) << address;
        const Json::Value ports = call("discovery.getAllPortsByHba", "[\"" + address + "\"]")["result"];
        EXPECT_EQ(info["adapter"][i]["numOfPorts"].asUInt(), ports.size());
        for (const Json::Value& port : ports)
            EXPECT_FALSE(port.isMember("error")) << compact(port);
    }
}

TEST_F(Agent_Methods, SetWhatClientsOfTheModelSee)
{
    open("demo.json");
    const char* const alarm = R"(["10:00:02:4b:4c:10:00:00", {"beaconState": true}, ["beaconState"]])";
    EXPECT_TRUE(call("configuration.setPortByWwn", alarm).isMember("result"));
    const broker::Result alarms = enumerate("KALDERA_AlarmDevice");
    for (const broker::Instance_Value& each : alarms.instances)
        EXPECT_EQ(text_of(each, "DeviceID") == "1000024b4c100000" ? 3u : 1u,
                  each.property("AlarmState")->as_uint())
            << text_of(each, "DeviceID");
}

class Agent_Host : public Agent_Calls
{
protected:
    static constexpr const char* NAME_SPACE = "vmware/esxv2";

    /// A system of the hypervisor's own class.
    void add_system(const char* class_name, const std::vector<const char*>& info)
    {
        std::vector<broker::Plain_Value> texts;
        for (const char* text : info)
            texts.push_back(broker::Plain_Value::text(text));
        broker::Instance_Value system;
        system.path = {{},
                       NAME_SPACE,
                       "CIM_ComputerSystem",
                       {{"CreationClassName", broker::Plain_Value::text(class_name)},
                        {"Name", broker::Plain_Value::text(std::string("system ") + info[0])}}};
        system.properties = system.path.keys;
        system.properties.push_back({"OtherIdentifyingInfo", broker::Plain_Value::array(CMPI_string, texts)});
        server->store().add(NAME_SPACE, system);
    }
    void host_is(const char* inner)
    {
        simulator.add_fault(std::string(R"({"call": "getHost", "do": "answer", "answer": {"result": )") +
                            inner + "}}");
    }
    Json::Value get_host() { return call("discovery.getHost", "[]")["result"]; }
};

TEST_F(Agent_Host, IsCompletedByTheHypervisor)
{
    open("empty.json");
    host_is(R"({"hostManufacturer": "", "hostModel": ""})");
    add_system("CIM_ComputerSystem", {"0", "1", "2"});
    add_system("VMWARE_ESXComputerSystem", {"tag", "Maker", "Model 5"});
    mark();
    EXPECT_EQ(json(R"({"result": {"hostManufacturer": "", "hostModel": ""},
                       "hostManufacturer": "Maker", "hostModel": "Model 5"})"),
              get_host());
    EXPECT_EQ((Lines{"DBG Entering: getOtherIdentifyingInfo", "DBG ComputerSystem Instance in vmware/esx2 ",
                     "DBG Creation class name - CIM_ComputerSystem",
                     "DBG Creation class name - VMWARE_ESXComputerSystem",
                     "DBG Returning: getOtherIdentifyingInfo"}),
              said_by("Host_Identity.cpp"));
}

TEST_F(Agent_Host, IsLeftAloneWithoutOne)
{
    open("empty.json");
    host_is(R"({"hostManufacturer": "", "hostModel": "5"})");
    const Json::Value as_it_is = json(R"({"result": {"hostManufacturer": "", "hostModel": "5"}})");
    EXPECT_EQ(as_it_is, get_host()) << "no such name space";
    server->store().add_name_space(NAME_SPACE);
    EXPECT_EQ(as_it_is, get_host()) << "no system";
    add_system("CIM_ComputerSystem", {"0", "1", "2"});
    EXPECT_EQ(as_it_is, get_host()) << "another system";
}

TEST_F(Agent_Host, IsNotLookedUpWhereItIsKnown)
{
    open("empty.json");
    host_is(R"({"hostManufacturer": "M", "hostModel": "5"})");
    add_system("VMWARE_ESXComputerSystem", {"tag", "Maker", "Model 5"});
    mark();
    EXPECT_EQ(json(R"({"result": {"hostManufacturer": "M", "hostModel": "5"}})"), get_host());
    EXPECT_TRUE(said_by("Host_Identity.cpp").empty());
}

} // namespace
} // namespace KPRV
