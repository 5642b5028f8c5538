#include "tests/simulator/Simulator_Fixture.h"

#include <set>

namespace KPRV::simulator {
namespace {

const std::string fc_port = "10:00:02:4b:4c:a1:00:00";
const std::string disk_array = "50:24:b4:c0:00:a1:00:01";
const std::string tape_drive = "50:24:b4:c0:00:a2:00:01";
const std::string media_changer = "50:24:b4:c0:00:a2:00:02";
const std::string other_host = "10:00:02:4b:4c:77:00:00";

class Remote_Port_Answers_test : public Simulator_Fixture
{
protected:
    Remote_Port_Answers_test() { simulator.load_file(inventory("rich.json")); }

    static Json::Value request(const std::string& local, const std::string& remote = "")
    {
        Json::Value request;
        request["pPortWwn"] = local;
        request["lPortWwn"] = local;
        if (!remote.empty())
            request["rPortWwn"] = remote;
        return request;
    }

    Json::Value remote_port(const std::string& remote, const std::string& local = fc_port)
    {
        return call("getCompleteRemotePort", request(local, remote));
    }

    /// The answer for the one remote port of a host whose author wrote `members` about it.
    Json::Value written(const std::string& members)
    {
        simulator.load(json("{'adapters': [{'hbaData': {'wwn': '20:00:02:4b:4c:10:00:00'}, 'fcPorts': ["
                            "{'wwn': '10:00:02:4b:4c:10:00:00', 'remotePorts': ["
                            "{'remotePortWwn': '50:24:b4:c0:00:00:00:01'" +
                            members + "}]}]}]}"));
        return remote_port("50:24:b4:c0:00:00:00:01", "10:00:02:4b:4c:10:00:00");
    }
};

TEST_F(Remote_Port_Answers_test, AllThatAPortSeesIsListedInOrder)
{
    EXPECT_EQ(call("getAllRemotePorts", request(fc_port)), json(R"([
        {'remotePortWwn': '50:24:b4:c0:00:a1:00:01', 'remoteNodeWwn': '50:24:b4:c0:00:a1:00:00'},
        {'remotePortWwn': '50:24:b4:c0:00:a2:00:01', 'remoteNodeWwn': '50:24:b4:c0:00:a2:00:00'},
        {'remotePortWwn': '50:24:b4:c0:00:a2:00:02', 'remoteNodeWwn': '50:24:b4:c0:00:a2:00:00'},
        {'remotePortWwn': '10:00:02:4b:4c:77:00:00', 'remoteNodeWwn': '20:00:02:4b:4c:77:00:00'}])"));
    EXPECT_EQ(call("getAllRemotePorts", request("10:00:02:4B:4C:A1:00:01")), json("[]"));
}

TEST_F(Remote_Port_Answers_test, TheKindsOfDeviceAreToldApart)
{
    EXPECT_EQ(remote_port(disk_array)["deviceData"],
              json("{'isTarget': true, 'type': 'Disk', 'stateMofValue': 11}"));
    EXPECT_EQ(remote_port(tape_drive)["deviceData"],
              json("{'isTarget': true, 'type': 'Tape', 'stateMofValue': 12}"));
    EXPECT_EQ(remote_port(media_changer)["deviceData"]["type"], "Media Changer");
    EXPECT_EQ(remote_port(other_host), json(R"({
        'remotePortWwn': '10:00:02:4b:4c:77:00:00', 'remoteNodeWwn': '20:00:02:4b:4c:77:00:00',
        'deviceData': {'isTarget': false, 'type': 'Unknown', 'stateMofValue': 11}, 'lunList': []})"));
}

TEST_F(Remote_Port_Answers_test, AUnitTellsWhatItsAuthorWrotePaddedAsInquiryDataIs)
{
    const Json::Value luns = remote_port(disk_array)["lunList"];
    EXPECT_EQ(luns[0], json(R"({'number': 0, 'vendor': 'KLDR    ', 'productID': 'ARRAY 4000      ',
        'productSerialNumber': 'KA-R0', 'lunDescription': '6024b4c0000a10000000000000000003', 'lunDescIdType': 3})"));
    EXPECT_FALSE(luns[2].isMember("productSerialNumber"));
    std::vector<int> id_types;
    for (const Json::Value& lun : luns)
        id_types.push_back(lun["lunDescIdType"].asInt());
    EXPECT_EQ(id_types, (std::vector<int>{3, 2, 1, 8, 0, 10, 5}));
}

TEST_F(Remote_Port_Answers_test, AUnitMayLackDescriptionAndSerialNumber)
{
    const Json::Value plain = remote_port("50:24:b4:c0:00:a3:00:01", "10:00:02:4b:4c:a2:00:00")["lunList"][0];
    EXPECT_EQ(plain["number"].asUInt(), 4026531840u);
    EXPECT_FALSE(plain.isMember("lunDescription"));
    EXPECT_FALSE(plain.isMember("productSerialNumber"));
    const Json::Value mixed = remote_port("50:24:b4:c0:00:a4:00:01", "10:00:02:4b:4c:a3:00:00")["lunList"];
    EXPECT_FALSE(mixed[0].isMember("lunDescription"));
    EXPECT_EQ(mixed[0]["productSerialNumber"], "KJ-R0");
    EXPECT_EQ(mixed[1]["lunDescription"], "5024b4c000a40002");
}

TEST_F(Remote_Port_Answers_test, TheUnitsAloneCanBeAskedFor)
{
    EXPECT_EQ(call("getAllLunsByRemotePort", request(fc_port, tape_drive)),
              remote_port(tape_drive)["lunList"]);
    EXPECT_EQ(call("getAllLunsByRemotePort", request(fc_port, other_host)), json("[]"));
    EXPECT_EQ(error_code(call("getAllLunsByRemotePort", request(fc_port, fc_port))), 2);
}

TEST_F(Remote_Port_Answers_test, OnlyThePortThatSeesARemotePortAnswersForIt)
{
    EXPECT_EQ(error_code(remote_port(disk_array, "10:00:02:4b:4c:a1:00:01")), 2);
    EXPECT_EQ(error_code(remote_port(disk_array, "nowhere")), 2);
    EXPECT_EQ(error_code(remote_port(disk_array, "02:4b:4c:a2:00:00")), 2);
    EXPECT_EQ(error_code(remote_port("50:24:b4:c0:00:ff:00:01")), 2);
    EXPECT_TRUE(remote_port("50:24:B4:C0:00:A1:00:01").isMember("lunList"));
    Json::Value other_logical_port = request(fc_port);
    other_logical_port["lPortWwn"] = "10:00:02:4b:4c:a1:00:01";
    EXPECT_EQ(error_code(call("getAllRemotePorts", other_logical_port)), 2);
}

TEST_F(Remote_Port_Answers_test, AnAddressThatIsNoTextIsRefused)
{
    Json::Value strange = request(fc_port, tape_drive);
    strange["rPortWwn"] = Json::Value(Json::objectValue);
    EXPECT_EQ(error_code(call("getCompleteRemotePort", strange)), 1);
    strange["lPortWwn"] = Json::Value(Json::arrayValue);
    EXPECT_EQ(error_code(call("getAllRemotePorts", strange)), 1);
}

TEST_F(Remote_Port_Answers_test, ARemotePortNeedsNoMoreThanAnAddress)
{
    EXPECT_EQ(written(""), json(R"({'remotePortWwn': '50:24:b4:c0:00:00:00:01',
        'deviceData': {'isTarget': true, 'type': 'Disk', 'stateMofValue': 11}, 'lunList': []})"));
    EXPECT_EQ(written(", 'lunList': [{}, {'lunDescription': 'd'}]")["lunList"], json(R"([
        {'number': 0, 'vendor': 'KLDR    ', 'productID': 'Simulated LUN   ', 'lunDescIdType': 0},
        {'number': 1, 'vendor': 'KLDR    ', 'productID': 'Simulated LUN   ', 'lunDescription': 'd',
         'lunDescIdType': 3}])"));
}

TEST_F(Remote_Port_Answers_test, WhatIsNullIsLeftOutAndWhatIsExtraJoinsUnchecked)
{
    EXPECT_EQ(written(", 'deviceData': null, 'lunList': null"),
              json("{'remotePortWwn': '50:24:b4:c0:00:00:00:01'}"));
    EXPECT_EQ(call("getAllLunsByRemotePort", request("10:00:02:4b:4c:10:00:00", "50:24:b4:c0:00:00:00:01")),
              json("[]"));
    EXPECT_EQ(
        written(", 'deviceData': {'isTarget': null, 'type': null, 'stateMofValue': null}")["deviceData"],
        json("{}"));
    const Json::Value lun =
        written(R"(, 'lunList': [{'number': null, 'productID': null, 'vendor': 'LONGER THAN 8',
        'lunDescIdType': null, 'extra': {'productID': 7}}], 'extra': {'deviceData': []})");
    EXPECT_EQ(lun["lunList"], json("[{'vendor': 'LONGER THAN 8', 'productID': 7}]"));
    EXPECT_EQ(lun["deviceData"], json("[]"));
}

TEST_F(Remote_Port_Answers_test, SeveralPortsMaySeeOneRemotePortOfTheHost)
{
    simulator.load_file(inventory("demo.json"));
    const std::string array = "50:24:b4:c0:00:40:00:01";
    const Json::Value seen = remote_port(array, "10:00:02:4b:4c:10:00:00");
    EXPECT_EQ(seen["lunList"].size(), 3u);
    EXPECT_EQ(remote_port(array, "10:00:02:4b:4c:30:00:00"), seen);
    EXPECT_EQ(error_code(remote_port(array, "10:00:02:4b:4c:20:00:00")), 2);
}

TEST_F(Remote_Port_Answers_test, AFaultHitsOneRemotePortByItsAddress)
{
    simulator.add_fault(
        R"({"call": "getCompleteRemotePort", "address": "50:24:b4:c0:00:a2:00:01", "do": "null"})");
    simulator.add_fault(R"({"call": "getCompleteRemotePort", "do": "remove", "member": "lunList.0.vendor"})");
    EXPECT_TRUE(remote_port(tape_drive).isNull());
    EXPECT_FALSE(remote_port(media_changer)["lunList"][0].isMember("vendor"));
}

} // namespace
} // namespace KPRV::simulator
