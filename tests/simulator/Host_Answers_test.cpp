#include "tests/simulator/Simulator_Fixture.h"

namespace KPRV::simulator {
namespace {

class Host_Answers_test : public Simulator_Fixture
{
};

TEST_F(Host_Answers_test, TheHostTellsMakerAndModel)
{
    EXPECT_EQ(call("getHost"),
              json("{'result': {'hostManufacturer': 'KLDR', 'hostModel': 'Simulated host'}}"));
    simulator.load_text(R"({"host": {"hostManufacturer": "", "hostModel": null}})");
    EXPECT_EQ(call("getHost"), json("{'result': {'hostManufacturer': ''}}"));
}

TEST_F(Host_Answers_test, AHostWithoutAdaptersSaysSo)
{
    EXPECT_EQ(call("getGlobalInfo"), json("{'numOfAdapters': 0, 'adapter': []}"));
}

TEST_F(Host_Answers_test, TheOverviewHasARecordPerAdapterAndAnElementPerPhysicalPort)
{
    simulator.load_file(inventory("demo.json"));
    const Json::Value info = call("getGlobalInfo");
    EXPECT_EQ(info["numOfAdapters"], Json::Value(3));
    EXPECT_EQ(info["adapter"][0], json(R"({
        'cna': false, 'fc': true, 'fcoe': false, 'ethPort': false, 'mac': '', 'wwn': '20:00:02:4b:4c:10:00:00',
        'numOfPorts': 2, 'portHasFc': [true, true], 'portHasEth': [false, false], 'portHasFcoe': [false, false],
        'portWwn': ['10:00:02:4b:4c:10:00:00', '10:00:02:4b:4c:10:00:01'], 'portMac': ['', ''],
        'fcoeMac': ['', '']})"));
    EXPECT_EQ(info["adapter"][1], json(R"({
        'cna': true, 'fc': false, 'fcoe': true, 'ethPort': true, 'mac': '02:4b:4c:20:00:00',
        'wwn': '20:00:02:4b:4c:20:00:00', 'numOfPorts': 2, 'portHasFc': [false, false],
        'portHasEth': [true, true], 'portHasFcoe': [true, true],
        'portWwn': ['10:00:02:4b:4c:20:00:00', '10:00:02:4b:4c:20:00:01'],
        'portMac': ['02:4b:4c:20:00:00', '02:4b:4c:20:00:01'],
        'fcoeMac': ['02:4b:4c:20:00:00', '02:4b:4c:20:00:01']})"));
}

TEST_F(Host_Answers_test, PortsOfOneKindOnlyLeaveEmptyPlaces)
{
    simulator.load_text(R"({"adapters": [{"hbaData": {"hbaMAC": "02:4b:4c:20:00:00"},
                                          "ethPorts": [{"mac": "02:4b:4c:20:00:00"}]},
                                         {"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"}}]})");
    const Json::Value info = call("getGlobalInfo");
    EXPECT_EQ(info["adapter"][0]["portWwn"], json("['']"));
    EXPECT_EQ(info["adapter"][0]["portHasFcoe"], json("[false]"));
    EXPECT_EQ(info["adapter"][0]["wwn"], "");
    EXPECT_EQ(info["adapter"][1]["portWwn"], json("[]"));
    EXPECT_EQ(info["adapter"][1]["numOfPorts"], Json::Value(0));
}

} // namespace
} // namespace KPRV::simulator
