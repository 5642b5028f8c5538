#include "module/model/EthernetPortHelper.h"

#include "tests/module/model/Port_Fixture.h"

using namespace KPRV;

namespace {

constexpr const char* CNA = "8c:7c:ff:00:00:10";
constexpr const char* PORT_MAC = "8c:7c:ff:00:00:11";

/// A host with one converged adapter and one Ethernet port.
struct Ethernet_Ports : Port_Fixture
{
    const EthernetPortHelper* ports = EthernetPortHelper::getEthernetPortHelperObject();
    const Json::Value port = json("{'ethData': {'ethDev': 'eth2', 'ethPortStateMOFValue': 11, 'mtu': 1500}}");

    Ethernet_Ports()
    {
        library.adapters({{CNA, json("{'hbaData': {'hasEthPort': true}, 'driver': {}}")}});
        library.answers("getEthPhyPortIndicesByAdapter", list_of({PORT_MAC}));
        library.answers("getEthPortByEthMac", port);
        library.answers("getOpticsSFP", json("{'transceiver': '10G_BASE-SR'}"));
    }
    std::vector<Set_Properties> walk(classId_t id) { return taken(ports->getInstancesByClass(id)); }
    Lines walk(classId_t id, const char* property) { return taken(ports->getInstancesByClass(id), property); }
};

} // namespace

TEST_F(Ethernet_Ports, OnePort)
{
    EXPECT_EQ(walk(ETHERNETPORT), (std::vector<Set_Properties>{{
                                      {"CreationClassName", "KALDERA_EthernetPort"},
                                      {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                                      {"SystemName", "10.0.0.1"},
                                      {"DeviceID", "8c7cff000011"},
                                      {"PermanentAddress", "8c7cff000011"},
                                      {"NetworkAddresses", "{8c7cff000011}"},
                                      {"LinkTechnology", "2"},
                                      {"Capabilities", "{0}"},
                                      {"EnabledCapabilities", "{0}"},
                                      {"OperationalStatus", "{11}"},
                                      {"PortType", "108"},
                                      {"ElementName", "eth2"},
                                      {"PortNumber", "0"},
                                  }}));
    EXPECT_EQ(library.told(),
              (Lines{"getAllAdaptersIndexString null", R"(getHbaByWwn {"mac":"8c:7c:ff:00:00:10"})",
                     "getAllAdaptersIndexString null",
                     R"(getEthPhyPortIndicesByAdapter {"indexStr":"8c:7c:ff:00:00:10"})",
                     R"(getEthPortByEthMac {"mac":"8c:7c:ff:00:00:11"})",
                     R"(getOpticsSFP {"indexStr":"8c:7c:ff:00:00:11"})"}));
}

TEST_F(Ethernet_Ports, OneEndpointAsksNoTransceiver)
{
    EXPECT_EQ(walk(LANENDPOINT), (std::vector<Set_Properties>{{
                                     {"CreationClassName", "KALDERA_LANEndpoint"},
                                     {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                                     {"SystemName", "10.0.0.1"},
                                     {"Name", "eth2"},
                                     {"ElementName", "eth2"},
                                     {"Description", "eth2"},
                                     {"LANID", "eth2"},
                                     {"NameFormat", "eth2_ETHERNET"},
                                     {"ProtocolIFType", "1"},
                                     {"MACAddress", "8c7cff000011"},
                                     {"MaxDataSize", "1500"},
                                     {"HealthState", "5"},
                                     {"EnabledState", "2"},
                                 }}));
    EXPECT_EQ(library.count("getOpticsSFP"), 0u);
}

TEST_F(Ethernet_Ports, StatesOfAnEndpoint)
{
    const std::tuple<uint32, const char*, const char*> rows[] = {
        {6, "15", "1"}, {8, "5", "9"},   {9, "10", "4"}, {10, "10", "3"},        {11, "5", "2"},
        {12, "0", "1"}, {13, "10", "6"}, {7, "0", "1"},  {4294967295u, "0", "1"}};
    for (const auto& [status, health, enabled] : rows) {
        _ethPortInfo record = {};
        record.status = status;
        Set_Properties set = taken(ports->getLANEndpointInstance(record));
        EXPECT_EQ(set["HealthState"], health) << status;
        EXPECT_EQ(set["EnabledState"], enabled) << status;
    }
}

TEST_F(Ethernet_Ports, PortTypes)
{
    EXPECT_EQ(ports->getPortType("10G_BASE-SR"), 108);
    for (const char* other : {"10G_BASE-LR", "10G_BASE-LRM", "10g_base-sr", "10G_BASE-SR ", ""})
        EXPECT_EQ(ports->getPortType(other), 105) << other;
}

TEST_F(Ethernet_Ports, AMissingTransceiverDoesNotLoseThePort)
{
    for (const char* answer : {"null", "{'error': 1}", "{}", "[]"}) {
        library.answers("getOpticsSFP", json(answer));
        EXPECT_EQ(walk(ETHERNETPORT, "PortType"), Lines{"0"}) << answer;
    }
    EXPECT_EQ(log.said("ERR"), Lines(4, std::string("ERR Unable to get SFP info for ") + PORT_MAC));
    log.clear();
    library.throws("getOpticsSFP", HbaAgentError{7, "busy"});
    EXPECT_EQ(walk(ETHERNETPORT, "PortType"), Lines{"0"});
    library.answers("getOpticsSFP", json("{'transceiver': 5}"));
    EXPECT_EQ(walk(ETHERNETPORT, "PortType"), Lines{"0"});
    const std::string mac = PORT_MAC;
    EXPECT_EQ(
        log.said("ERR"),
        (Lines{"ERR " + mac + " - libGetOpticsSFP got User exception 7: busy",
               "ERR " + mac + " - libGetOpticsSFP got std exception: Type is not convertible to string"}));
    library.answers("getOpticsSFP", json("{'transceiver': null}"));
    EXPECT_EQ(walk(ETHERNETPORT, "PortType"), Lines{"105"});
}

TEST_F(Ethernet_Ports, MissingMembersAreEmpty)
{
    library.answers("getEthPortByEthMac", json("{'ethData': {}}"));
    Set_Properties set = walk(LANENDPOINT).at(0);
    EXPECT_EQ(set["MaxDataSize"], "0");
    EXPECT_EQ(set["Name"], "");
    EXPECT_EQ(set["NameFormat"], "_ETHERNET");
    EXPECT_EQ(set["HealthState"], "0");
    library.answers("getEthPortByEthMac", json("{'ethData': null}"));
    EXPECT_EQ(walk(ETHERNETPORT, "OperationalStatus"), Lines{"{0}"});
}

TEST_F(Ethernet_Ports, TextsAreCutToTheRecord)
{
    const std::string text(2000, 'x');
    library.answers("getEthPhyPortIndicesByAdapter", list_of({text}));
    Json::Value answer = port;
    answer["ethData"]["ethDev"] = text;
    library.answers("getEthPortByEthMac", answer);
    Set_Properties set = walk(ETHERNETPORT).at(0);
    EXPECT_EQ(set["DeviceID"], text.substr(0, 35));
    EXPECT_EQ(set["PermanentAddress"], text.substr(0, 23));
    EXPECT_EQ(set["ElementName"], text.substr(0, 1027));
}

TEST_F(Ethernet_Ports, PortsAreNumberedByTheirPlaceAndLostAlone)
{
    library.answers("getEthPhyPortIndicesByAdapter", list_of({"AA:01", 5, "AA:02", "AA:03", "AA:04"}));
    library.answers("getEthPortByEthMac", [this](const Json::Value& request) {
        if (request["mac"] == "AA:01")
            return json("{'error': 1}");
        if (request["mac"] == "AA:02")
            throw 5;
        return request["mac"] == "AA:03" ? json("{'ethData': {'mtu': -1}}") : port;
    });
    EXPECT_EQ(walk(LANENDPOINT, "MACAddress"), Lines{"AA04"});
    EXPECT_EQ(
        log.said("ERR"),
        (Lines{"ERR Ethernet Port Info is NOT available", "ERR Unable to get Eth port data for AA:01",
               std::string("ERR ") + CNA +
                   " - libGetEthPhyPortIndicesByAdapter got std exception: Type is "
                   "not convertible to string",
               "ERR libGetEthPortByEthMac got default exception for AA:02",
               "ERR Unable to get Eth port data for AA:02",
               "ERR AA:03 - libGetEthPortByEthMac got std exception: Type is not convertible to uint"}));
    EXPECT_EQ(walk(ETHERNETPORT, "PortNumber"), Lines{"4"});
}

TEST_F(Ethernet_Ports, AnFcHbaHasNone)
{
    library.adapters({{CNA, json("{'hbaData': {'hasEthPort': false}, 'driver': {}}")}});
    EXPECT_TRUE(walk(ETHERNETPORT).empty());
    EXPECT_EQ(library.count("getEthPhyPortIndicesByAdapter"), 0u);
    const std::string cna = CNA;
    EXPECT_EQ(log.said(), (Lines{"INFO The string " + cna + " is already in : format", "INFO ethFlag = 0",
                                 "INFO No Ethernet ports found for Adapter - " + cna}));
}

TEST_F(Ethernet_Ports, WithoutAdapters)
{
    library.answers("getAllAdaptersIndexString", json("{'indexStrings': 1}"));
    EXPECT_TRUE(walk(ETHERNETPORT).empty());
    library.answers("getAllAdaptersIndexString", list_of({}));
    EXPECT_TRUE(walk(ETHERNETPORT).empty());
    EXPECT_EQ(log.said(),
              (Lines{"ERR libGetAllAdaptersIndexString returns NULL.", "WARN No adapters in the system. "}));
    EXPECT_EQ(log.lines()[1].file, "EthernetPortHelper.cpp");
}

TEST_F(Ethernet_Ports, WithoutAPortList)
{
    for (const char* answer : {"null", "{'error': 1}", "{}", "[]", "{'indexStrings': 'x'}"}) {
        library.answers("getEthPhyPortIndicesByAdapter", json(answer));
        EXPECT_TRUE(walk(ETHERNETPORT).empty()) << answer;
    }
    EXPECT_EQ(log.said("ERR"), Lines(5, "ERR libGetEthPhyPortIndicesByAdapter returns NULL."));
    log.clear();
    library.throws("getEthPhyPortIndicesByAdapter", HbaAgentError{7, "busy"});
    EXPECT_TRUE(walk(ETHERNETPORT).empty());
    library.throws("getEthPhyPortIndicesByAdapter", std::runtime_error("broken"));
    EXPECT_TRUE(walk(ETHERNETPORT).empty());
    library.throws("getEthPhyPortIndicesByAdapter", 5);
    EXPECT_TRUE(walk(ETHERNETPORT).empty());
    const std::string head = std::string("ERR ") + CNA + " - libGetEthPhyPortIndicesByAdapter got ";
    EXPECT_EQ(log.said("ERR"), (Lines{head + "User exception 7: busy", head + "std exception: broken",
                                      head + "default exception"}));
}

TEST_F(Ethernet_Ports, ByAnIdThatIsNone)
{
    // The library is asked all the same, and refuses.
    library.answers("getEthPhyPortIndicesByAdapter", Json::Value());
    EXPECT_TRUE(ports->getInstancesByAdapterId(7, ETHERNETPORT).empty());
    EXPECT_EQ(library.told()[1], R"(getEthPhyPortIndicesByAdapter {"indexStr":""})");
}

TEST_F(Ethernet_Ports, ByAMac)
{
    library.answers("getAdapterIdByPort", json("{'adapterId': 1}"));
    EXPECT_EQ(taken(ports->getEthernetPortInstancesByAdapter("8c7cff000011"), "DeviceID"),
              Lines{"8c7cff000011"});
    EXPECT_EQ(library.told()[0], R"(getAdapterIdByPort {"indexStr":"8c:7c:ff:00:00:11"})");
    EXPECT_EQ(log.said()[0],
              "DBG getEthernetPortInstancesByMacAddress invoked with MAC Address = 8c:7c:ff:00:00:11");
    EXPECT_EQ(log.traces()[0], "DBG Entering: getEthernetPortInstancesByMacAddress");
    // The adapter is not asked again whether it has Ethernet ports.
    EXPECT_EQ(library.count("getHbaByWwn"), 0u);
}

TEST_F(Ethernet_Ports, ByAMacThatNoAdapterHas)
{
    const auto by_mac = [&](const char* mac) {
        return taken(ports->getEthernetPortInstancesByAdapter(mac)).size();
    };
    for (const char* answer : {"null", "{'error': 1}", "{}", "[]"}) {
        library.answers("getAdapterIdByPort", json(answer));
        EXPECT_EQ(by_mac("AABB"), 0u) << answer;
    }
    for (const char* answer : {"{'adapterId': 0}", "{'adapterId': -1}", "{'adapterId': null}"}) {
        library.answers("getAdapterIdByPort", json(answer));
        EXPECT_EQ(by_mac("AABB"), 0u) << answer;
    }
    library.answers("getAdapterIdByPort", json("{'adapterId': '1'}"));
    EXPECT_EQ(by_mac("AABB"), 0u);
    Lines expected(4, "ERR libGetAdapterIdByPort returns NULL.");
    expected.push_back("ERR libGetAdapterIdByPort got std exception: Type is not convertible to int");
    EXPECT_EQ(log.said("ERR"), expected);
    EXPECT_EQ(log.said("WARN"), Lines(3, "WARN Adapter not found in the system."));
    library.calls.clear();
    EXPECT_EQ(by_mac(""), 0u);
    EXPECT_TRUE(library.calls.empty());
    library.throws("getAdapterIdByPort", HbaAgentError{7, "busy"});
    EXPECT_THROW(by_mac("AABB"), HbaAgentError);
}

TEST_F(Ethernet_Ports, AClassThatIsNotItsOwn)
{
    EXPECT_TRUE(walk(FCPORT).empty());
    EXPECT_TRUE(log.has("INFO Unhandled class support"));
}
