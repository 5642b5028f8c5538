#include "tests/simulator/Simulator_Fixture.h"

namespace KPRV::simulator {
namespace {

class Adapter_Answers_test : public Simulator_Fixture
{
protected:
    Adapter_Answers_test() { simulator.load_file(inventory("demo.json")); }
};

TEST_F(Adapter_Answers_test, AdaptersAreListedInTheirOrder)
{
    EXPECT_EQ(
        call("getAllAdaptersIndexString"),
        json(
            "{'indexStrings': ['20:00:02:4b:4c:10:00:00', '02:4b:4c:20:00:00', '20:00:02:4b:4c:30:00:00']}"));
    EXPECT_EQ(simulator.symbol<unsigned()>("getNumberOfAdapters")(), 3u);
}

TEST_F(Adapter_Answers_test, IdsCountFromOne)
{
    EXPECT_EQ(call("getAdapterId", "{'indexStr': '20:00:02:4b:4c:10:00:00'}"), json("{'adapterId': 1}"));
    EXPECT_EQ(call("getAdapterId", "{'indexStr': '20:00:02:4B:4C:30:00:00'}"), json("{'adapterId': 3}"));
    EXPECT_EQ(error_code(call("getAdapterId", "{'indexStr': '10:00:02:4b:4c:10:00:00'}")), 2);
}

TEST_F(Adapter_Answers_test, APortLeadsToItsAdaptersId)
{
    EXPECT_EQ(call("getAdapterIdByPort", "{'indexStr': '02:4b:4c:20:00:01'}"), json("{'adapterId': 2}"));
    EXPECT_EQ(call("getAdapterIdByPort", "{'indexStr': '10:00:02:4b:4c:30:00:00'}"),
              json("{'adapterId': 3}"));
    EXPECT_EQ(error_code(call("getAdapterIdByPort", "{'indexStr': '20:00:02:4b:4c:10:00:00'}")), 2);
}

TEST_F(Adapter_Answers_test, AnAdapterIsFoundByWwnOrMacEachUnderItsOwnName)
{
    EXPECT_EQ(call("getHbaByWwn", "{'wwn': '20:00:02:4b:4c:20:00:00'}"),
              call("getHbaByWwn", "{'mac': '02:4b:4c:20:00:00'}"));
    EXPECT_EQ(call("getHbaByMac", "{'mac': '02:4b:4c:20:00:00'}")["hbaData"]["model"], "1020");
    EXPECT_EQ(error_code(call("getHbaByWwn", "{'wwn': '02:4b:4c:20:00:00'}")), 2);
    EXPECT_EQ(error_code(call("getHbaByWwn", "{'mac': '20:00:02:4b:4c:20:00:00'}")), 2);
    EXPECT_EQ(error_code(call("getHbaByWwn", "{'wwn': '2000024b4c200000'}")), 2);
}

TEST_F(Adapter_Answers_test, ASystemMakersCardTellsWhatItsAuthorWrote)
{
    const Json::Value hba = call("getHbaByWwn", "{'wwn': '20:00:02:4b:4c:30:00:00'}")["hbaData"];
    EXPECT_EQ(hba["oem"], "DELL");
    EXPECT_EQ(hba["oemSerialNum"], "KD-186000417");
    EXPECT_EQ(hba["partNum"], "KD-1860");
    EXPECT_EQ(hba["uuid"].asString().size(), 32u);
    EXPECT_FALSE(hba.isMember("fruNum"));
}

TEST_F(Adapter_Answers_test, TheFlashTellsWhetherItCanBeRead)
{
    EXPECT_EQ(call("getFlashInfo", "{'indexStr': '20:00:02:4b:4c:10:00:00'}"), json("{'flashStatus': true}"));
    EXPECT_EQ(call("getFlashInfo", "{'indexStr': '20:00:02:4b:4c:30:00:00'}"),
              json("{'flashStatus': false}"));
    EXPECT_EQ(error_code(call("getFlashInfo", "{'indexStr': '20:00:02:4b:4c:99:00:00'}")), 2);
}

TEST_F(Adapter_Answers_test, TheStateThatIsSetIsReadBack)
{
    const char* adapter = "{'wwn': '20:00:02:4b:4c:10:00:00'}";
    EXPECT_EQ(call("setAdapterState", "{'indexStr': '20:00:02:4b:4c:10:00:00', 'enableState': false}"),
              json("{'status': 0}"));
    EXPECT_FALSE(call("getHbaByWwn", adapter)["hbaData"]["hbaStatus"].asBool());
    EXPECT_TRUE(call("getHbaByWwn", "{'mac': '02:4b:4c:20:00:00'}")["hbaData"]["hbaStatus"].asBool());
    EXPECT_EQ(
        error_code(call("setAdapterState", "{'indexStr': '20:00:02:4b:4c:10:00:00', 'enableState': 1}")), 1);
    call("setAdapterState", "{'indexStr': '20:00:02:4b:4c:10:00:00', 'enableState': true}");
    EXPECT_TRUE(call("getHbaByWwn", adapter)["hbaData"]["hbaStatus"].asBool());
}

} // namespace
} // namespace KPRV::simulator
