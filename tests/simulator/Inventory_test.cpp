#include "tests/simulator/Simulator_Fixture.h"

#include <map>

namespace KPRV::simulator {
namespace {

class Inventory_test : public Simulator_Fixture
{
};

TEST_F(Inventory_test, AnFcHbaNeedsNoMoreThanAddresses)
{
    simulator.load_file(inventory("one_hba.json"));
    EXPECT_EQ(call("getHbaByWwn", "{'wwn': '20:00:02:4b:4c:10:00:00'}"), json(R"({
        'hbaData': {'wwn': '20:00:02:4b:4c:10:00:00', 'model': '825', 'serialNumber': 'KLDR000001', 'portCount': 1,
                    'isCNA': false, 'hasEthPort': false, 'hbaStatus': true, 'oem': '', 'partNum': '',
                    'oemSerialNum': '', 'uuid': ''},
        'driver': {'storageDriverName': 'kldrfc', 'storageDriverVersion': '3.2.1.0'},
        'firmware': {'version': '3.2.1.0', 'biosVersion': '3.2.1.0'}})"));
    EXPECT_EQ(call("getPortByWwn", "{'wwn': '10:00:02:4b:4c:10:00:00'}"), json(R"({
        'wwn': '10:00:02:4b:4c:10:00:00', 'nodeWwn': '20:00:02:4b:4c:10:00:00', 'PortSymbolicName': 'KLDR port 0',
        'operatingSpeed': 8, 'supportedPortSpeeds': [8, 4, 2], 'portTypeMOFValue': 10, 'maxFrameSize': 2112,
        'portStatus': true, 'portStatusValue': 11, 'isMezz': false, 'beaconState': false})"));
}

TEST_F(Inventory_test, AMacMakesAConvergedAdapter)
{
    simulator.load_file(inventory("one_cna.json"));
    const Json::Value adapter = call("getHbaByWwn", "{'mac': '02:4b:4c:20:00:00'}");
    EXPECT_TRUE(adapter["hbaData"]["isCNA"].asBool());
    EXPECT_TRUE(adapter["hbaData"]["hasEthPort"].asBool());
    EXPECT_EQ(adapter["hbaData"]["portCount"], Json::Value(2));
    EXPECT_EQ(adapter["driver"]["networkDriverName"], "kldrnet");
    EXPECT_EQ(adapter["driver"]["storageDriverName"], "kldrfc");
    EXPECT_EQ(call("getAllAdaptersIndexString"), json("{'indexStrings': ['02:4b:4c:20:00:00']}"));
    EXPECT_EQ(call("getEthPortByEthMac", "{'mac': '02:4B:4C:20:00:01'}"),
              json("{'ethData': {'ethDev': 'eth1', 'ethPortStateMOFValue': 11, 'mtu': 1500}}"));
    EXPECT_TRUE(call("getPortByWwn", "{'wwn': '10:00:02:4b:4c:20:00:01'}")["isFCoE"].asBool());
}

TEST_F(Inventory_test, WhatIsNullIsLeftOutOfTheAnswer)
{
    simulator.load_text(R"({"adapters": [
        {"hbaData": {"hbaMAC": "02:4b:4c:20:00:00", "hasEthPort": null, "uuid": null},
         "driver": {"storageDriverName": null, "storageDriverVersion": null},
         "firmware": null, "flashStatus": null,
         "ethPorts": [{"mac": "02:4b:4c:20:00:01", "ethData": {"mtu": null}},
                      {"mac": "02:4b:4c:20:00:02", "ethData": null}]}]})");
    const Json::Value adapter = call("getHbaByMac", "{'mac': '02:4b:4c:20:00:00'}");
    EXPECT_FALSE(adapter["hbaData"].isMember("hasEthPort"));
    EXPECT_FALSE(adapter["hbaData"].isMember("uuid"));
    EXPECT_FALSE(adapter.isMember("firmware"));
    EXPECT_EQ(adapter["driver"], json("{'networkDriverName': 'kldrnet', 'networkDriverVersion': '3.2.1.0'}"));
    EXPECT_EQ(call("getFlashInfo", "{'indexStr': '02:4b:4c:20:00:00'}"), json("{}"));
    EXPECT_FALSE(call("getEthPortByEthMac", "{'mac': '02:4b:4c:20:00:01'}")["ethData"].isMember("mtu"));
    EXPECT_EQ(error_code(call("getEthPortByEthMac", "{'mac': '02:4b:4c:20:00:02'}")), 2);
}

TEST_F(Inventory_test, ExtraMembersJoinTheAnswer)
{
    simulator.load_text(R"({"host": {"hostModel": "X", "extra": {"hostName": "h"}}, "adapters": [
        {"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00", "extra": {"pcieSpeed": [1, 2], "slot": null}}}]})");
    EXPECT_EQ(call("getHost"),
              json("{'result': {'hostManufacturer': 'KLDR', 'hostModel': 'X', 'hostName': 'h'}}"));
    const Json::Value hba = call("getHbaByWwn", "{'wwn': '20:00:02:4b:4c:10:00:00'}")["hbaData"];
    EXPECT_EQ(hba["pcieSpeed"], json("[1, 2]"));
    EXPECT_TRUE(hba.isMember("slot"));
    EXPECT_FALSE(hba.isMember("extra"));
}

TEST_F(Inventory_test, AnAdapterIsListedByTheAddressItsAuthorChose)
{
    simulator.load_text(R"({"adapters": [{"address": "20:00:02:4b:4c:20:00:00",
        "hbaData": {"wwn": "20:00:02:4b:4c:20:00:00", "hbaMAC": "02:4b:4c:20:00:00"}}]})");
    EXPECT_EQ(call("getAllAdaptersIndexString"), json("{'indexStrings': ['20:00:02:4b:4c:20:00:00']}"));
    EXPECT_EQ(call("getAdapterId", "{'indexStr': '02:4b:4c:20:00:00'}"), json("{'adapterId': 1}"));
}

TEST_F(Inventory_test, TheAuthorsAnswerComesFromThePortTheAdapterOrTheHost)
{
    simulator.load_text(R"({"answers": {"getOpticsSFP": "host", "getServerTime": "noon"}, "adapters": [
        {"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"}, "answers": {"getOpticsSFP": "adapter"},
         "fcPorts": [{"wwn": "10:00:02:4b:4c:10:00:00", "answers": {"getOpticsSFP": "port"}},
                     {"wwn": "10:00:02:4b:4c:10:00:01"}]},
        {"hbaData": {"wwn": "20:00:02:4b:4c:11:00:00"}, "answers": {"getHbaByWwn": null}}]})");
    EXPECT_EQ(call("getOpticsSFP", "{'indexStr': '10:00:02:4b:4c:10:00:00'}"), "port");
    EXPECT_EQ(call("getOpticsSFP", "{'indexStr': '10:00:02:4b:4c:10:00:01'}"), "adapter");
    EXPECT_EQ(call("getOpticsSFP", "{'indexStr': '20:00:02:4b:4c:11:00:00'}"), "host");
    EXPECT_EQ(call("getServerTime"), "noon");
    EXPECT_TRUE(call("getHbaByWwn", "{'wwn': '20:00:02:4b:4c:11:00:00'}").isNull());
    EXPECT_FALSE(call("getPortByWwn", "{'wwn': '10:00:02:4b:4c:10:00:00'}").isMember("answers"));
}

TEST_F(Inventory_test, TheRichHostHasEveryKindOfThing)
{
    simulator.load_file(inventory("rich.json"));
    std::map<std::string, int> counts;
    const Json::Value adapters = call("getAllAdaptersIndexString")["indexStrings"];
    for (const Json::Value& adapter : adapters) {
        Json::Value request;
        request["indexStr"] = adapter;
        counts["Ethernet"] += call("getEthPhyPortIndicesByAdapter", request)["indexStrings"].size();
        const Json::Value ports = call("getFcPhyPortIndicesByAdapter", request)["indexStrings"];
        for (const Json::Value& port : ports) {
            request["indexStr"] = request["wwn"] = request["pPortWwn"] = request["lPortWwn"] = port;
            const Json::Value data = call("getPortByWwn", request);
            for (const char* flag : {"isFCoE", "isMezz", "beaconState", "portStatus"})
                counts[flag] += data[flag].asBool();
            counts["empty slot"] += call("getOpticsSFP", request).isMember("error");
            counts["without statistics"] += call("getDynamicPortStatistics", request).empty();
            for (const Json::Value& remote : call("getAllRemotePorts", request)) {
                request["rPortWwn"] = remote["remotePortWwn"];
                const Json::Value complete = call("getCompleteRemotePort", request);
                counts[complete["deviceData"]["type"].asString()]++;
                counts["LUN"] += complete["lunList"].size();
            }
        }
        counts["FC"] += ports.size();
    }
    EXPECT_EQ(counts, (std::map<std::string, int>{{"Disk", 3},
                                                  {"Ethernet", 2},
                                                  {"FC", 5},
                                                  {"LUN", 12},
                                                  {"Media Changer", 1},
                                                  {"Tape", 1},
                                                  {"Unknown", 1},
                                                  {"beaconState", 1},
                                                  {"empty slot", 1},
                                                  {"isFCoE", 2},
                                                  {"isMezz", 1},
                                                  {"portStatus", 4},
                                                  {"without statistics", 1}}));
}

TEST_F(Inventory_test, EveryInventoryThatComesWithTheSimulatorIsGood)
{
    const std::pair<const char*, unsigned> shipped[] = {
        {"demo.json", 3}, {"empty.json", 0}, {"one_cna.json", 1}, {"one_hba.json", 1},
        {"rich.json", 3}, {"twins.json", 2}, {"portless.json", 2}};
    for (const auto& [name, adapters] : shipped) {
        EXPECT_NO_THROW(simulator.load_file(inventory(name))) << name;
        EXPECT_EQ(simulator.symbol<unsigned()>("getNumberOfAdapters")(), adapters) << name;
    }
}

} // namespace
} // namespace KPRV::simulator
