#include "tests/simulator/Simulator_Fixture.h"

namespace KPRV::simulator {
namespace {

class Optics_Answers_test : public Simulator_Fixture
{
protected:
    Json::Value optics(const std::string& address)
    {
        return call("getOpticsSFP", "{'indexStr': '" + address + "'}");
    }
    Json::Value readings(const std::string& address)
    {
        return call("getOpticsPOM", "{'portWwn': '" + address + "'}");
    }
    using Simulator_Fixture::call;
    Json::Value call(const std::string& name, const std::string& request)
    {
        return call(name, json(request));
    }

    /// A CNA with one physical port, whose two functions have these further members.
    void load_cna(const std::string& fc, const std::string& eth)
    {
        simulator.load(json("{'adapters': [{'hbaData': {'hbaMAC': '02:4b:4c:20:00:00'},"
                            "'fcPorts': [{'wwn': '10:00:02:4b:4c:20:00:00'" +
                            fc + "}], 'ethPorts': [{'mac': '02:4b:4c:20:00:00'" + eth + "}]}]}"));
    }
    Json::Value fc_optics() { return optics("10:00:02:4b:4c:20:00:00"); }
    Json::Value eth_optics() { return optics("02:4b:4c:20:00:00"); }
};

TEST_F(Optics_Answers_test, AnSfpTellsWhatItsAuthorWrotePaddedAsInItsMemory)
{
    simulator.load_file(inventory("rich.json"));
    EXPECT_EQ(optics("10:00:02:4b:4c:a1:00:00"),
              json(R"({'transceiver': '8G_SW', 'vendorName': 'KLDR OPTICS     ',
        'vendorPart': 'KO-8SW          ', 'serialNo': 'KO8R000001      ', 'revision': 'B2  ', 'speed': '2G,4G,8G',
        'extendedID': 'SFP+'})"));
}

TEST_F(Optics_Answers_test, ByDefaultThereIsAnSfpThatSuitsTheAdapter)
{
    simulator.load_file(inventory("one_hba.json"));
    EXPECT_EQ(optics("10:00:02:4b:4c:10:00:00"),
              json(R"({'transceiver': '8G_SW', 'vendorName': 'KLDR            ',
        'vendorPart': 'KO-SFP          ', 'serialNo': 'KS000001P0      ', 'revision': 'A   ', 'speed': '2G,4G,8G',
        'extendedID': 'SFP+'})"));
    simulator.load_file(inventory("one_cna.json"));
    EXPECT_EQ(optics("02:4b:4c:20:00:01")["transceiver"], "10G_BASE-SR");
    EXPECT_EQ(optics("02:4b:4c:20:00:01")["serialNo"], "KS000001P1      ");
    EXPECT_EQ(optics("02:4b:4c:20:00:01"), optics("10:00:02:4b:4c:20:00:01"));
}

TEST_F(Optics_Answers_test, AnEmptySlotIsAnError)
{
    simulator.load_file(inventory("demo.json"));
    EXPECT_EQ(error_code(optics("10:00:02:4b:4c:10:00:01")), 5);
    EXPECT_EQ(error_code(readings("10:00:02:4b:4c:10:00:01")), 5);
    EXPECT_EQ(error_code(optics("10:00:02:4b:4c:99:00:00")), 2);
    EXPECT_EQ(error_code(optics("20:00:02:4b:4c:10:00:00")), 2);
}

TEST_F(Optics_Answers_test, TheFunctionsOfOnePhysicalPortShareWhatIsPluggedIn)
{
    load_cna(", 'optics': {'serialNo': 'A'}", "");
    EXPECT_EQ(eth_optics()["serialNo"], "A               ");
    EXPECT_EQ(fc_optics(), eth_optics());
    load_cna("", ", 'optics': null");
    EXPECT_EQ(error_code(fc_optics()), 5);
    EXPECT_EQ(error_code(eth_optics()), 5);
    load_cna(", 'optics': {'serialNo': 'A'}", ", 'optics': {'serialNo': 'B', 'transceiver': '10G_BASE-LRM'}");
    EXPECT_EQ(fc_optics()["serialNo"], "A               ");
    EXPECT_EQ(eth_optics()["transceiver"], "10G_BASE-LRM");
}

TEST_F(Optics_Answers_test, MembersMayBeLeftOutAndAdded)
{
    load_cna(
        ", 'optics': {'transceiver': null, 'vendorName': null, 'extra': {'serialNo': 7, 'wavelength': 850}}",
        "");
    const Json::Value answer = fc_optics();
    EXPECT_FALSE(answer.isMember("transceiver"));
    EXPECT_FALSE(answer.isMember("vendorName"));
    EXPECT_EQ(answer["serialNo"], Json::Value(7));
    EXPECT_EQ(answer["wavelength"], Json::Value(850));
}

TEST_F(Optics_Answers_test, MonitoredOpticsTellTheirReadings)
{
    load_cna(", 'optics': {'readings': {'temperature': -5, 'txPower': null}}",
             ", 'optics': {'readings': null}");
    EXPECT_EQ(readings("10:00:02:4b:4c:20:00:00"),
              json("{'temperature': -5, 'voltage': 3290, 'biasCurrent': 6500, 'rxPower': 480}"));
    EXPECT_EQ(error_code(readings("02:4b:4c:20:00:00")), 5);
    EXPECT_FALSE(fc_optics().isMember("readings"));
}

TEST_F(Optics_Answers_test, ThePortItselfDoesNotTellThem)
{
    simulator.load_file(inventory("rich.json"));
    const Json::Value port = call("getPortByWwn", "{'wwn': '10:00:02:4b:4c:a1:00:00'}");
    for (const char* name : {"optics", "statistics", "remotePorts"})
        EXPECT_FALSE(port.isMember(name)) << name;
}

} // namespace
} // namespace KPRV::simulator
