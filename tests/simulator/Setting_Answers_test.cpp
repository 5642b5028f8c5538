#include "tests/simulator/Agent_Fixture.h"

namespace KPRV::simulator {
namespace {

struct Setting_Case
{
    const char* get;
    const char* address; // of one that has it
    const char* member;  // one that it has
    const char* without; // an address of something that has it not
};

// clang-format off
constexpr Setting_Case settings[] = {
    {"getAdvAdapterData",     "{'indexStr': '20:00:02:4b:4c:10:00:00'}", "serialNumber",  "{'indexStr': '10:00:02:4b:4c:10:00:00'}"},
    {"getAdvPortDataByPort",  "{'indexStr': '02:4b:4c:20:00:00'}",       "queueDepth",    "{'indexStr': 'nowhere'}"},
    {"getBootOverSanByPort",  "{'indexStr': '10:00:02:4b:4c:10:00:00'}", "bootEnabled",   "{'indexStr': '02:4b:4c:20:00:00'}"},
    {"getFcByFcWwn",          "{'wwn': '10:00:02:4b:4c:10:00:00'}",      "fcId",          "{'wwn': '20:00:02:4b:4c:10:00:00'}"},
    {"getFcoeByPort",         "{'indexStr': '10:00:02:4b:4c:20:00:00'}", "vlanId",        "{'indexStr': '10:00:02:4b:4c:10:00:00'}"},
    {"getPortAuthentication", "{'wwn': '10:00:02:4b:4c:10:00:00'}",      "algorithm",     "{'wwn': '02:4b:4c:20:00:00'}"},
    {"getCee",                "{'mac': '02:4b:4c:20:00:00'}",            "pfcEnabled",    "{'mac': '10:00:02:4b:4c:20:00:00'}"},
    {"getLldp",               "{'mac': '02:4b:4c:20:00:00'}",            "neighbor",      "{'mac': 'nowhere'}"},
};
// clang-format on

class Setting_Answers_test : public Agent_Fixture
{
protected:
    static std::string fcoe(const std::string& values, const std::string& names)
    {
        return "{'indexStr': '10:00:02:4b:4c:20:00:00', 'fcoePort': " + values + ", 'propArray': " + names +
               "}";
    }

    Json::Value fcoe() { return call("getFcoeByPort", "{'indexStr': '10:00:02:4b:4c:20:00:00'}"); }

    Json::Value authentication()
    {
        return call("getPortAuthentication", "{'wwn': '10:00:02:4b:4c:10:00:00'}");
    }

    static std::string authentication(const std::string& values)
    {
        return "{'pPortWwn': '10:00:02:4b:4c:10:00:00', 'portAuth': " + values + "}";
    }

    Json::Value adapter() { return call("getAdvAdapterData", "{'indexStr': '20:00:02:4b:4c:10:00:00'}"); }
};

TEST_F(Setting_Answers_test, EachIsToldOfWhatHasIt)
{
    for (const Setting_Case& each : settings) {
        SCOPED_TRACE(each.get);
        EXPECT_FALSE(call(each.get, each.address)[each.member].isNull());
        EXPECT_EQ(refused(each.get, each.without), ADDRESS);
    }
}

TEST_F(Setting_Answers_test, ToReadOneChangesNothingThatOthersRead)
{
    simulator.load_text(
        R"({"host": {"hostModel": null}, "adapters": [{"hbaData": {"hbaMAC": "02:4b:4c:20:00:00"},
        "firmware": null, "fcPorts": [{"wwn": "10:00:02:4b:4c:20:00:00", "portStatus": null, "maxFrameSize": null}],
        "ethPorts": [{"mac": "02:4b:4c:20:00:00", "portStatus": null}]}]})");
    const auto read = [&] {
        return call("getHost").toStyledString() + call("getGlobalInfo").toStyledString() +
               call("getHbaByMac", "{'mac': '02:4b:4c:20:00:00'}").toStyledString() +
               call("getPortByWwn", "{'wwn': '10:00:02:4b:4c:20:00:00'}").toStyledString() +
               call("getPortByWwn", "{'mac': '02:4b:4c:20:00:00'}").toStyledString();
    };
    const std::string before = read();
    for (const char* name : {"getAdvAdapterData", "getAdvPortDataByPort", "getFcoeByPort"})
        call(name, "{'indexStr': '02:4b:4c:20:00:00'}");
    call("getFcByFcWwn", "{'wwn': '10:00:02:4b:4c:20:00:00'}");
    call("getLldp", "{'mac': '02:4b:4c:20:00:00'}");
    EXPECT_EQ(read(), before);
}

TEST_F(Setting_Answers_test, WhatIsNamedIsSetAndNothingElse)
{
    const Json::Value before = fcoe();
    done("setFcoeByPort", fcoe("{'vlanId': 1003, 'fcoePriority': 5}", "['vlanId']"));
    Json::Value expected = before;
    expected["vlanId"] = 1003;
    EXPECT_EQ(fcoe(), expected);
    EXPECT_EQ(call("getFcoeByPort", "{'indexStr': '10:00:02:4b:4c:20:00:01'}")["vlanId"], Json::Value(1002));
}

TEST_F(Setting_Answers_test, WhatIsNoMemberOrOfAnotherKindIsRefused)
{
    const Json::Value before = fcoe();
    EXPECT_EQ(refused("setFcoeByPort", fcoe("{'vlan': 7}", "['vlan']")), REQUEST);
    EXPECT_EQ(refused("setFcoeByPort", fcoe("{'vlanId': '7'}", "['vlanId']")), REQUEST);
    EXPECT_EQ(refused("setFcoeByPort", fcoe("{'vlanId': 7}", "['vlanId', 'fcMap']")), REQUEST);
    EXPECT_EQ(refused("setFcoeByPort", fcoe("{'vlanId': 7}", "'vlanId'")), REQUEST);
    EXPECT_EQ(refused("setFcoeByPort", fcoe("[]", "[]")), REQUEST);
    EXPECT_EQ(refused("setFcoeByPort", fcoe("{'vlanId': 7}", "[7]")), REQUEST);
    EXPECT_EQ(
        refused("setFcoeByPort", "{'indexStr': '10:00:02:4b:4c:10:00:00', 'fcoePort': {}, 'propArray': []}"),
        ADDRESS);
    EXPECT_EQ(fcoe(), before);
}

TEST_F(Setting_Answers_test, AnFcFunctionIsSetByNameToo)
{
    const std::string request =
        "{'portWwn': '10:00:02:4b:4c:10:00:00', 'fcPortData': {'topology': 'Loop'}, 'paramsConfigured': ";
    done("setFcByFcWwn", request + "['topology']}");
    EXPECT_EQ(call("getFcByFcWwn", "{'wwn': '10:00:02:4b:4c:10:00:00'}")["topology"], "Loop");
    EXPECT_EQ(refused("setFcByFcWwn", request + "['speed']}"), REQUEST);
}

TEST_F(Setting_Answers_test, ASecretCanBeGivenAndIsNeverTold)
{
    const Json::Value before = authentication();
    EXPECT_FALSE(before["secretSet"].asBool());
    done("setPortAuthentication", authentication("{'enabled': true, 'secret': 'open sesame'}"));
    EXPECT_TRUE(authentication()["enabled"].asBool());
    EXPECT_TRUE(authentication()["secretSet"].asBool());
    EXPECT_EQ(authentication().toStyledString().find("sesame"), std::string::npos);
    EXPECT_EQ(refused("setPortAuthentication", authentication("{'enabled': 1}")), REQUEST);
    EXPECT_EQ(refused("setPortAuthentication", authentication("{'secret': 1}")), REQUEST);
    EXPECT_EQ(refused("setPortAuthentication", authentication("[]")), REQUEST);
    done("resetPortAuthentication", "{'pPortWwn': '10:00:02:4b:4c:10:00:00'}");
    EXPECT_EQ(authentication(), before);
    EXPECT_EQ(refused("resetPortAuthentication", "{'pPortWwn': 'nowhere'}"), ADDRESS);
}

TEST_F(Setting_Answers_test, TheModeAndTheTrunkOfAnAdapterAreKept)
{
    EXPECT_EQ(adapter()["adapterMode"], "HBA");
    done("setAdapterMode", "{'indexStr': '20:00:02:4b:4c:10:00:00', 'adapterMode': 'CNA'}");
    EXPECT_EQ(adapter()["adapterMode"], "CNA");
    EXPECT_EQ(refused("setAdapterMode", "{'indexStr': '20:00:02:4b:4c:10:00:00', 'adapterMode': 'fast'}"),
              REQUEST);
    EXPECT_EQ(refused("setAdapterMode", "{'indexStr': '20:00:02:4b:4c:10:00:00', 'adapterMode': 1}"),
              REQUEST);
    EXPECT_EQ(refused("setAdapterMode", "{'indexStr': 'nowhere', 'adapterMode': 'HBA'}"), ADDRESS);

    EXPECT_FALSE(adapter()["trunkingEnabled"].asBool());
    done("setFcTrunkingState", "{'indexStr': '20:00:02:4b:4c:10:00:00', 'enableState': true}");
    EXPECT_TRUE(adapter()["trunkingEnabled"].asBool());
    done("setFcTrunkingState", "{'indexStr': '10:00:02:4b:4c:10:00:01', 'enableState': false}");
    EXPECT_FALSE(adapter()["trunkingEnabled"].asBool());
    EXPECT_EQ(refused("setFcTrunkingState", "{'indexStr': '20:00:02:4b:4c:20:00:00', 'enableState': true}"),
              CONFLICT);
    EXPECT_EQ(refused("setFcTrunkingState", "{'indexStr': '20:00:02:4b:4c:30:00:00', 'enableState': true}"),
              CONFLICT);
    EXPECT_EQ(refused("setFcTrunkingState", "{'indexStr': '20:00:02:4b:4c:10:00:00', 'enableState': 1}"),
              REQUEST);
}

TEST_F(Setting_Answers_test, AdaptersAndPortsHaveAnAlias)
{
    done("setAdapterAlias", "{'type': 'Node', 'Node': '20:00:02:4b:4c:10:00:00', 'alias': 'upper'}");
    EXPECT_EQ(call("getHbaByWwn", "{'wwn': '20:00:02:4b:4c:10:00:00'}")["hbaData"]["alias"], "upper");
    for (const char* address : {"10:00:02:4b:4c:10:00:00", "02:4b:4c:20:00:00"})
        done("setPortAlias", "{'type': 'Port', 'Node': '" + std::string(address) + "', 'alias': 'left'}");
    EXPECT_EQ(call("getPortByWwn", "{'wwn': '10:00:02:4b:4c:10:00:00'}")["alias"], "left");
    EXPECT_EQ(call("getPortByWwn", "{'mac': '02:4b:4c:20:00:00'}")["alias"], "left");
    EXPECT_EQ(refused("setAdapterAlias", "{'type': 'Node', 'Node': '10:00:02:4b:4c:10:00:00', 'alias': ''}"),
              ADDRESS);
    EXPECT_EQ(refused("setPortAlias", "{'type': 'Port', 'Node': '10:00:02:4b:4c:10:00:00', 'alias': 7}"),
              REQUEST);
    EXPECT_EQ(refused("setPortAlias", "{'type': 'Port', 'alias': 'left'}"), REQUEST);
}

TEST_F(Setting_Answers_test, AnEthernetPortIsSet)
{
    const std::string request = "{'mac': '02:4b:4c:20:00:00', 'ethPort': {'mtu': 1500, 'portStatus': false, "
                                "'wwn': 'a'}, 'propArray': ";
    done("setEthPort", request + "['mtu', 'portStatus']}");
    const Json::Value data = call("getEthPortByEthMac", "{'mac': '02:4b:4c:20:00:00'}")["ethData"];
    EXPECT_EQ(data["mtu"], Json::Value(1500));
    EXPECT_EQ(data["ethPortStateMOFValue"], Json::Value(10));
    EXPECT_FALSE(call("getPortByWwn", "{'mac': '02:4b:4c:20:00:00'}")["portStatus"].asBool());
    EXPECT_EQ(refused("setEthPort", request + "['wwn']}"), REQUEST);
    EXPECT_EQ(refused("setEthPort", request + "['beaconState']}"), REQUEST);
    EXPECT_EQ(refused("setEthPort", "{'mac': '10:00:02:4b:4c:20:00:00', 'ethPort': {}, 'propArray': []}"),
              ADDRESS);
}

TEST_F(Setting_Answers_test, AnInventoryMaySayWhatIsSet)
{
    simulator.load_text(R"({"adapters": [{"hbaData": {"hbaMAC": "02:4b:4c:20:00:00"},
        "settings": {"advancedAdapter": {"temperature": 71}},
        "fcPorts": [{"wwn": "10:00:02:4b:4c:20:00:00", "settings": {"bootOverSan": {"bootEnabled": true, "note": 1}}}],
        "ethPorts": [{"mac": "02:4b:4c:20:00:00", "settings": {"lldp": {"neighbor": null}}}]}]})");
    EXPECT_EQ(call("getAdvAdapterData", "{'indexStr': '02:4b:4c:20:00:00'}")["temperature"], Json::Value(71));
    const Json::Value boot = call("getBootOverSanByPort", "{'indexStr': '10:00:02:4b:4c:20:00:00'}");
    EXPECT_TRUE(boot["bootEnabled"].asBool());
    EXPECT_EQ(boot["note"], Json::Value(1));
    EXPECT_FALSE(boot["bootSpeed"].isNull());
    EXPECT_TRUE(call("getLldp", "{'mac': '02:4b:4c:20:00:00'}")["neighbor"].isNull());
    EXPECT_FALSE(call("getPortByWwn", "{'wwn': '10:00:02:4b:4c:20:00:00'}").isMember("settings"));
}

TEST_F(Setting_Answers_test, LogsAreClearedForPortsThatAreThere)
{
    done("clearLogsForPort", "{'propArray': ['10:00:02:4b:4c:10:00:00', '02:4b:4c:20:00:00']}");
    EXPECT_EQ(refused("clearLogsForPort", "{'propArray': ['10:00:02:4b:4c:10:00:00', 'nowhere']}"), ADDRESS);
    EXPECT_EQ(refused("clearLogsForPort", "{'propArray': [7]}"), ADDRESS);
    EXPECT_EQ(refused("clearLogsForPort", "{'propArray': 'all'}"), REQUEST);
}

TEST_F(Setting_Answers_test, TheHostTellsItsTimeAndItsDrivers)
{
    const Json::Value time = call("getServerTime");
    EXPECT_GT(time["seconds"].asInt64(), 1500000000);
    EXPECT_EQ(time["text"].asString().size(), 19u);
    EXPECT_EQ(call("getDriverUpdateStatus")["entries"].size(), 3u);
}

} // namespace
} // namespace KPRV::simulator
