#include "tests/simulator/Simulator_Fixture.h"

namespace KPRV::simulator {
namespace {

class Port_Answers_test : public Simulator_Fixture
{
protected:
    Port_Answers_test() { simulator.load_file(inventory("demo.json")); }

    Json::Value fc_port() { return call("getPortByWwn", "{'wwn': '10:00:02:4b:4c:10:00:00'}"); }

    Json::Value set_fc_port(const std::string& port, const std::string& names)
    {
        return call("setPortByWwn", json("{'indexStr': '10:00:02:4b:4c:10:00:00', 'port': " + port +
                                         ", 'propArray': " + names + "}"));
    }
};

TEST_F(Port_Answers_test, PortsAreListedByKind)
{
    EXPECT_EQ(call("getFcPhyPortIndicesByAdapter", "{'indexStr': '02:4b:4c:20:00:00'}"),
              json("{'indexStrings': ['10:00:02:4b:4c:20:00:00', '10:00:02:4b:4c:20:00:01']}"));
    EXPECT_EQ(call("getEthPhyPortIndicesByAdapter", "{'indexStr': '02:4b:4c:20:00:00'}"),
              json("{'indexStrings': ['02:4b:4c:20:00:00', '02:4b:4c:20:00:01']}"));
    EXPECT_EQ(call("getEthPhyPortIndicesByAdapter", "{'indexStr': '20:00:02:4b:4c:10:00:00'}"),
              json("{'indexStrings': []}"));
    EXPECT_EQ(error_code(call("getFcPhyPortIndicesByAdapter", "{'indexStr': '10:00:02:4b:4c:20:00:00'}")), 2);
}

TEST_F(Port_Answers_test, APortTellsWhatItsAuthorWrote)
{
    const Json::Value idle = call("getPortByWwn", "{'wwn': '10:00:02:4b:4c:10:00:01'}");
    EXPECT_EQ(idle["operatingSpeed"], Json::Value(99999));
    EXPECT_EQ(idle["portStatusValue"], Json::Value(12));
    EXPECT_TRUE(call("getPortByWwn", "{'wwn': '10:00:02:4b:4c:30:00:00'}")["isMezz"].asBool());
    EXPECT_EQ(call("getEthPortByEthMac", "{'mac': '02:4b:4c:20:00:00'}")["ethData"]["mtu"],
              Json::Value(9000));
}

TEST_F(Port_Answers_test, AnFcPortIsNoEthernetPort)
{
    EXPECT_EQ(error_code(call("getEthPortByEthMac", "{'mac': '10:00:02:4b:4c:10:00:00'}")), 2);
    EXPECT_TRUE(call("getPortByWwn", "{'mac': '02:4b:4c:20:00:01'}")["portStatus"].asBool());
}

TEST_F(Port_Answers_test, AnFcoePortsOwnMacLeadsToItAndASharedOneToTheEthernetPort)
{
    simulator.load_text(R"({"adapters": [{"hbaData": {"hbaMAC": "02:4b:4c:20:00:00"},
        "fcPorts": [{"wwn": "10:00:02:4b:4c:20:00:00", "fcoeMac": "02:4b:4c:20:00:0a"},
                    {"wwn": "10:00:02:4b:4c:20:00:01", "fcoeMac": "02:4b:4c:20:00:01"}],
        "ethPorts": [{"mac": "02:4b:4c:20:00:00"}, {"mac": "02:4b:4c:20:00:01"}]}]})");
    EXPECT_EQ(call("getPortByWwn", "{'mac': '02:4b:4c:20:00:0a'}")["wwn"], "10:00:02:4b:4c:20:00:00");
    EXPECT_EQ(call("getPortByWwn", "{'mac': '02:4b:4c:20:00:01'}")["mac"], "02:4b:4c:20:00:01");
    const Json::Value record = call("getGlobalInfo")["adapter"][0];
    EXPECT_EQ(record["fcoeMac"], json("['02:4b:4c:20:00:0a', '02:4b:4c:20:00:01']"));
}

TEST_F(Port_Answers_test, WhatIsSetIsReadBackAndNothingElse)
{
    EXPECT_EQ(set_fc_port("{'beaconState': true, 'maxFrameSize': 512}", "['beaconState']"),
              json("{'status': 0}"));
    EXPECT_TRUE(fc_port()["beaconState"].asBool());
    EXPECT_EQ(fc_port()["maxFrameSize"], Json::Value(2112));
    set_fc_port("{'alias': 'left'}", "['alias']");
    EXPECT_EQ(fc_port()["alias"], "left");
}

TEST_F(Port_Answers_test, DisablingAPortShowsInItsState)
{
    set_fc_port("{'portStatus': false}", "['portStatus']");
    EXPECT_FALSE(fc_port()["portStatus"].asBool());
    EXPECT_EQ(fc_port()["portStatusValue"], Json::Value(10));
    set_fc_port("{'portStatus': true}", "['portStatus']");
    EXPECT_EQ(fc_port()["portStatusValue"], Json::Value(11));
    call("setPortByWwn",
         "{'indexStr': '02:4b:4c:20:00:00', 'port': {'portStatus': false}, 'propArray': ['portStatus']}");
    EXPECT_EQ(call("getEthPortByEthMac", "{'mac': '02:4b:4c:20:00:00'}")["ethData"]["ethPortStateMOFValue"],
              Json::Value(10));
}

TEST_F(Port_Answers_test, ARequestThatMakesNoSenseChangesNothing)
{
    const Json::Value before = fc_port();
    EXPECT_EQ(error_code(set_fc_port("{'beaconState': 1}", "['beaconState']")), 1);
    EXPECT_EQ(error_code(set_fc_port("{'beaconState': true}", "['beaconState', 'isMezz']")), 1);
    EXPECT_EQ(error_code(set_fc_port("{'beaconState': true}", "'beaconState'")), 1);
    EXPECT_EQ(error_code(set_fc_port("[]", "[]")), 1);
    EXPECT_EQ(fc_port(), before);
    EXPECT_EQ(error_code(call("setPortByWwn", "{'indexStr': 'nowhere', 'port': {}, 'propArray': []}")), 2);
}

} // namespace
} // namespace KPRV::simulator
