#include "tests/module/model/Port_Fixture.h"

using namespace KPRV;

namespace {

struct Port_Endpoints : Port_Fixture
{
    Json::Value target = json("{'deviceData': {'isTarget': true, 'stateMofValue': 10}}");

    Lines names() { return walk(SCSIPROTOCOLENDPOINT, "Name"); }
};

constexpr const char* INITIATOR = "10008c7cff000001";
constexpr const char* TARGET = "10008c7cff000001_500601600000000a";
constexpr const char* TARGET_2 = "10008c7cff000001_500601600000000b";

} // namespace

TEST_F(Port_Endpoints, ThePortAndItsTarget)
{
    remote_ports({REMOTE}, target);
    Set_Properties initiator = {
        {"CreationClassName", "KALDERA_SCSIProtocolEndpoint"},
        {"SystemCreationClassName", "KALDERA_ComputerSystem"},
        {"SystemName", "10.0.0.1"},
        {"Name", INITIATOR},
        {"ElementName", INITIATOR},
        {"OperationalStatus", "{11}"},
        {"ProtocolIFType", "1"},
        {"OtherTypeDescription", "SCSI"},
        {"ConnectionType", "2"},
        {"Role", "2"},
        {"EnabledState", "2"},
    };
    Set_Properties remote = initiator;
    remote["Name"] = remote["ElementName"] = TARGET;
    remote["OperationalStatus"] = "{10}";
    remote["EnabledState"] = "3";
    remote["Role"] = "3";
    EXPECT_EQ(std::string(TARGET).size(), 33u);
    EXPECT_EQ(walk(SCSIPROTOCOLENDPOINT), (std::vector<Set_Properties>{initiator, remote}));
    const Lines told = library.told();
    EXPECT_EQ(Lines(told.begin() + 3, told.end()),
              (Lines{R"(getAllRemotePorts {"lPortWwn":"10:00:8c:7c:ff:00:00:01",)"
                     R"("pPortWwn":"10:00:8c:7c:ff:00:00:01"})",
                     R"(getCompleteRemotePort {"lPortWwn":"10:00:8c:7c:ff:00:00:01",)"
                     R"("pPortWwn":"10:00:8c:7c:ff:00:00:01","rPortWwn":"50:06:01:60:00:00:00:0a"})"}));
    EXPECT_EQ(log.said(), (Lines{"DBG numOfPorts = 1", "DBG Number of Rports = 1"}));
}

TEST_F(Port_Endpoints, EachTargetGoesByItsOwnName)
{
    remote_ports({REMOTE, REMOTE_2}, target);
    EXPECT_EQ(names(), (Lines{INITIATOR, TARGET, TARGET_2}));
}

TEST_F(Port_Endpoints, AnInitiatorOfTheZoneIsNone)
{
    for (const char* device : {"{'isTarget': false}", "{'x': 1}", "{'isTarget': null}", "{}", "[]", "'x'"}) {
        remote_ports({REMOTE}, with(Json::objectValue, "deviceData", json(device)));
        EXPECT_EQ(names(), Lines{INITIATOR}) << device;
    }
    EXPECT_EQ(log.said("ERR"), Lines{});
}

TEST_F(Port_Endpoints, WithoutAListOfRemotePorts)
{
    for (const char* answer : {"null", "{'error': 1}", "{}", "5"}) {
        library.answers("getAllRemotePorts", json(answer));
        EXPECT_EQ(names(), Lines{INITIATOR}) << answer;
    }
    EXPECT_EQ(log.said("ERR"), Lines(4, "ERR libGetAllRemotePorts returns NULL."));
    log.clear();
    library.throws("getAllRemotePorts", 5);
    EXPECT_EQ(names(), Lines{INITIATOR});
    EXPECT_EQ(log.said("ERR"), Lines{"ERR libGetAllRemotePorts got default exception"});
    library.answers("getAllRemotePorts", json("[]"));
    EXPECT_EQ(names(), Lines{INITIATOR});
    EXPECT_EQ(library.count("getCompleteRemotePort"), 0u);
}

TEST_F(Port_Endpoints, ABadRemotePortIsLostAlone)
{
    for (const char* answer : {"null", "{'error': 1}", "{}", "{'deviceData': null}", "[]"}) {
        remote_ports({REMOTE, REMOTE_2}, target);
        library.answers("getCompleteRemotePort", [&](const Json::Value& request) {
            return request["rPortWwn"] == REMOTE ? json(answer) : target;
        });
        EXPECT_EQ(names(), (Lines{INITIATOR, TARGET_2})) << answer;
    }
    EXPECT_EQ(log.said("ERR"),
              Lines(5, std::string("ERR libGetCompleteRemotePort returned NULL for ") + REMOTE));
}

TEST_F(Port_Endpoints, AThrowingRemotePortIsLostAlone)
{
    remote_ports({REMOTE, REMOTE_2}, target, REMOTE);
    EXPECT_EQ(names(), (Lines{INITIATOR, TARGET_2}));
    EXPECT_EQ(log.said("ERR"), Lines{"ERR libGetCompleteRemotePort got User exception 7: busy"});
}

TEST_F(Port_Endpoints, WrongTypesLoseTheirRemotePort)
{
    remote_ports({5, REMOTE_2}, target);
    EXPECT_EQ(names(), (Lines{INITIATOR, TARGET_2}));
    EXPECT_EQ(library.count("getCompleteRemotePort"), 1u);
    target["deviceData"]["stateMofValue"] = "up";
    remote_ports({REMOTE}, target);
    EXPECT_EQ(names(), Lines{INITIATOR});
    EXPECT_EQ(log.said("ERR"),
              (Lines{"ERR libGetAllRemotePorts got std exception: Type is not convertible to string",
                     "ERR libGetCompleteRemotePort got std exception: Type is not convertible to int"}));
}

TEST_F(Port_Endpoints, OverLongNamesAreCut)
{
    const std::string text(100, 'x');
    library.answers("getPortByWwn", fc_port(text.c_str()));
    remote_ports({text}, target);
    const std::string wwn = text.substr(0, 23);
    EXPECT_EQ(names(), (Lines{wwn, wwn + "_" + wwn}));
}

TEST_F(Port_Endpoints, APortWithoutAWwnHasNoRemotePorts)
{
    library.answers("getPortByWwn", without(fc_port(), "wwn"));
    EXPECT_EQ(names(), Lines{""});
    EXPECT_EQ(library.count("getAllRemotePorts"), 0u);
    EXPECT_EQ(log.said("ERR").size(), 1u);
}
