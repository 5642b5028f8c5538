#include "tests/simulator/Agent_Fixture.h"

namespace KPRV::simulator {
namespace {

class Virtual_Nic_Answers_test : public Agent_Fixture
{
protected:
    static std::string create(int least, int most)
    {
        return "{'mac': '02:4b:4c:20:00:00', 'minBandwidth': " + std::to_string(least) +
               ", 'maxBandwidth': " + std::to_string(most) + "}";
    }

    static std::string on_port(const std::string& member, const std::string& list)
    {
        return "{'mac': '02:4b:4c:20:00:00', '" + member + "': " + list + "}";
    }

    Json::Value functions() { return call("getAdapterPciFnData", "{'indexStr': '20:00:02:4b:4c:20:00:00'}"); }

    Json::Value on_port() { return call("getAllEthPortByEthMac", "{'mac': '02:4b:4c:20:00:00'}"); }
};

TEST_F(Virtual_Nic_Answers_test, AnAdapterTellsItsFunctions)
{
    const Json::Value fc = call("getAdapterPciFnData", "{'indexStr': '20:00:02:4b:4c:10:00:00'}");
    EXPECT_EQ(fc.size(), 2u);
    EXPECT_EQ(fc[0]["type"], "FC");
    ASSERT_EQ(functions().size(), 4u);
    EXPECT_EQ(functions()[1]["type"], "FCoE");
    EXPECT_EQ(functions()[3]["type"], "Ethernet");
    EXPECT_EQ(functions()[3]["port"].asUInt(), 1u);
    EXPECT_EQ(functions()[3]["address"], "02:4b:4c:20:00:01");
    EXPECT_EQ(refused("getAdapterPciFnData", "{'indexStr': 'nowhere'}"), ADDRESS);
}

TEST_F(Virtual_Nic_Answers_test, WhatIsCreatedGetsTheNextFunctionAndAnAddress)
{
    EXPECT_EQ(call("createvNIC", create(1000, 2000).c_str()), json("{'status': 0, 'pciFunctionIndex': 4}"));
    EXPECT_EQ(call("createvNIC", create(0, 10000).c_str())["pciFunctionIndex"].asUInt(), 5u);
    ASSERT_EQ(functions().size(), 6u);
    EXPECT_EQ(functions()[4]["minBandwidth"].asUInt(), 1000u);
    EXPECT_EQ(functions()[4]["maxBandwidth"].asUInt(), 2000u);
    EXPECT_NE(functions()[4]["mac"], functions()[5]["mac"]);
    ASSERT_EQ(on_port().size(), 3u);
    EXPECT_EQ(on_port()[0]["ethDev"], "eth2");
    EXPECT_EQ(on_port()[1]["mac"], functions()[4]["mac"]);
    EXPECT_EQ(refused("getAllEthPortByEthMac", "{'mac': 'nowhere'}"), ADDRESS);
}

TEST_F(Virtual_Nic_Answers_test, ItCountsForItselfFromZero)
{
    done("createvNIC", create(0, 100));
    const std::string mac = functions()[4]["mac"].asString();
    const Json::Value counters = call("getDynamicvNICStatistics", json("{'mac': '" + mac + "'}"));
    EXPECT_EQ(counters["txFrames"], "0");
    EXPECT_NE(call("getDynamicvNICStatistics", "{'mac': '02:4b:4c:20:00:00'}")["txFrames"], "0");
    EXPECT_EQ(error_code(call("getDynamicLldpStatistics", json("{'mac': '" + mac + "'}"))), ADDRESS);
    done("deletevNICs", on_port("pciFunctionIndices", "[4]"));
    EXPECT_EQ(error_code(call("getDynamicvNICStatistics", json("{'mac': '" + mac + "'}"))), ADDRESS);
}

TEST_F(Virtual_Nic_Answers_test, BandwidthIsChangedAsAWholeOrNotAtAll)
{
    done("createvNIC", create(1000, 2000));
    done("createvNIC", create(1000, 2000));
    done("modifyvNIC",
         on_port("vNICs", "[{'pciFunctionIndex': 5, 'minBandwidth': 2000, 'maxBandwidth': 9000}]"));
    EXPECT_EQ(functions()[5]["maxBandwidth"].asUInt(), 9000u);
    const Json::Value before = functions();
    const std::string good = "[{'pciFunctionIndex': 4, 'minBandwidth': 1, 'maxBandwidth': 2}, ";
    EXPECT_EQ(
        refused("modifyvNIC",
                on_port("vNICs", good + "{'pciFunctionIndex': 5, 'minBandwidth': 9, 'maxBandwidth': 8}]")),
        CONFLICT);
    EXPECT_EQ(refused("modifyvNIC", on_port("vNICs", good + "{'pciFunctionIndex': 5, 'minBandwidth': '9'}]")),
              REQUEST);
    EXPECT_EQ(
        refused("modifyvNIC",
                on_port("vNICs", good + "{'pciFunctionIndex': 9, 'minBandwidth': 1, 'maxBandwidth': 2}]")),
        NOT_FOUND);
    EXPECT_EQ(refused("modifyvNIC", on_port("vNICs", good + "7]")), REQUEST);
    EXPECT_EQ(refused("modifyvNIC", on_port("vNICs", "7")), REQUEST);
    EXPECT_EQ(functions(), before);
}

TEST_F(Virtual_Nic_Answers_test, ALinkHasSoMuchToPromiseAndSoManyFunctions)
{
    EXPECT_EQ(refused("createvNIC", create(2000, 1000)), CONFLICT);
    EXPECT_EQ(refused("createvNIC", create(0, 10001)), CONFLICT);
    EXPECT_EQ(refused("createvNIC", create(-1, 1000)), REQUEST);
    EXPECT_EQ(
        refused("createvNIC", "{'mac': '10:00:02:4b:4c:10:00:00', 'minBandwidth': 1, 'maxBandwidth': 2}"),
        ADDRESS);
    done("createvNIC", create(6000, 10000));
    EXPECT_EQ(refused("createvNIC", create(4001, 10000)), CONFLICT);
    done("createvNIC", create(4000, 10000));
    done("createvNIC", create(0, 1));
    done("createvNIC", create(0, 1));
    EXPECT_EQ(refused("createvNIC", create(0, 1)), CONFLICT);
}

TEST_F(Virtual_Nic_Answers_test, APortsOwnFunctionCannotBeDeleted)
{
    done("createvNIC", create(0, 1));
    for (const char* doomed : {"[2]", "[4, 4]", "[4, 77]", "['4']"})
        EXPECT_EQ(refused("deletevNICs", on_port("pciFunctionIndices", doomed)), NOT_FOUND) << doomed;
    EXPECT_EQ(refused("deletevNICs", on_port("pciFunctionIndices", "4")), REQUEST);
    EXPECT_EQ(functions().size(), 5u);
    done("deletevNICs", on_port("pciFunctionIndices", "[4]"));
    EXPECT_EQ(functions().size(), 4u);
}

} // namespace
} // namespace KPRV::simulator
