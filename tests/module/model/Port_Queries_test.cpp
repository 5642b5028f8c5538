#include "tests/module/model/Port_Fixture.h"

using namespace KPRV;

namespace {

struct Port_Queries : Port_Fixture
{
    Json::Value out;
};

} // namespace

TEST_F(Port_Queries, DetailsByWwnAndByMac)
{
    EXPECT_EQ(helper->getPortDetails("10008c7cff000001", out), 0);
    EXPECT_EQ(out, fc_port());
    EXPECT_EQ(log.said(), Lines{"INFO getPortDetails success - 10008c7cff000001"});
    EXPECT_EQ(helper->getPortDetails("8c7cff000002", out), 0);
    // Only a flat MAC is known as one.
    EXPECT_EQ(helper->getPortDetails("8c:7c:ff:00:00:02", out), 0);
    EXPECT_EQ(library.told(), (Lines{R"(getPortByWwn {"wwn":"10:00:8c:7c:ff:00:00:01"})",
                                     R"(getPortByWwn {"mac":"8c:7c:ff:00:00:02"})",
                                     R"(getPortByWwn {"wwn":"8c:7c:ff:00:00:02"})"}));
}

TEST_F(Port_Queries, DetailsThatFail)
{
    for (const char* answer : {"null", "{'error': null}"}) {
        library.answers("getPortByWwn", json(answer));
        EXPECT_EQ(helper->getPortDetails("AABB", out), -1);
    }
    EXPECT_EQ(log.said(), Lines(2, "ERR Port Info is NOT available"));
    log.clear();
    library.throws("getPortByWwn", HbaAgentError{7, "busy"});
    EXPECT_EQ(helper->getPortDetails("AABB", out), -1);
    library.throws("getPortByWwn", std::runtime_error("broken"));
    EXPECT_EQ(helper->getPortDetails("AABB", out), -1);
    library.throws("getPortByWwn", 5);
    EXPECT_EQ(helper->getPortDetails("AABB", out), -1);
    EXPECT_EQ(log.said(), (Lines{"ERR AABB - libGetPortByWwn got User exception 7: busy",
                                 "ERR AABB - libGetPortByWwn got std exception: broken",
                                 "ERR libGetPortByWwn got default exception for AABB"}));
    EXPECT_EQ(helper->getPortDetails("A", out), -1);
}

TEST_F(Port_Queries, Disabled)
{
    EXPECT_FALSE(helper->isPortDisabled(PORT));
    library.answers("getPortByWwn", with(fc_port(), "portStatus", false));
    EXPECT_TRUE(helper->isPortDisabled(PORT));
    log.clear();
    library.answers("getPortByWwn", without(fc_port(), "portStatus"));
    EXPECT_FALSE(helper->isPortDisabled("AABB"));
    EXPECT_EQ(log.said(), (Lines{"INFO getPortDetails success - AABB", "ERR Unable to get port status"}));
    log.clear();
    library.answers("getPortByWwn", Json::Value());
    EXPECT_FALSE(helper->isPortDisabled(PORT));
    EXPECT_EQ(log.said("ERR"), (Lines{"ERR Port Info is NOT available", "ERR Unable to get port status"}));
    library.throws("getPortByWwn", 5);
    EXPECT_FALSE(helper->isPortDisabled(PORT));
    EXPECT_EQ(log.said().back(), "ERR Unable to get port status");
}

TEST_F(Port_Queries, NumberOfPorts)
{
    library.answers("getFcPhyPortIndicesByAdapter", list_of({"1", "2"}));
    EXPECT_EQ(helper->getNumberOfPorts("AABB", out), 2);
    EXPECT_EQ(out, list_of({"1", "2"}));
    EXPECT_EQ(library.told(), Lines{R"(getFcPhyPortIndicesByAdapter {"indexStr":"AA:BB"})"});
    // Ports, under the name of adapters.
    EXPECT_EQ(log.said(), Lines{"INFO Number of Adapters: 2"});
    log.clear();
    for (const char* answer : {"null", "{'error': 1}", "{}", "[]", "{'indexStrings': 'x'}"}) {
        library.answers("getFcPhyPortIndicesByAdapter", json(answer));
        EXPECT_EQ(helper->getNumberOfPorts("AABB", out), -1) << answer;
    }
    EXPECT_EQ(log.said(), Lines(5, "ERR libGetFcPhyPortIndicesByAdapter returns NULL for AABB"));
    library.throws("getFcPhyPortIndicesByAdapter", HbaAgentError{7, "busy"});
    EXPECT_THROW(helper->getNumberOfPorts("AABB", out), HbaAgentError);
}

TEST_F(Port_Queries, Optics)
{
    library.answers("getOpticsSFP", json("{'speed': '8G'}"));
    EXPECT_EQ(helper->getOpticsInfo("AABB", out), 0);
    EXPECT_EQ(out, json("{'speed': '8G'}"));
    EXPECT_EQ(library.told(), Lines{R"(getOpticsSFP {"indexStr":"AA:BB"})"});
    for (const char* answer : {"null", "{'error': 1}"}) {
        library.answers("getOpticsSFP", json(answer));
        EXPECT_EQ(helper->getOpticsInfo("AABB", out), -1);
    }
    EXPECT_EQ(log.said(), Lines(2, "ERR Unable to get SFP info for AABB"));
    log.clear();
    library.throws("getOpticsSFP", HbaAgentError{7, "busy"});
    EXPECT_EQ(helper->getOpticsInfo("AABB", out), -1);
    library.throws("getOpticsSFP", 5);
    EXPECT_EQ(helper->getOpticsInfo("AABB", out), -1);
    EXPECT_EQ(log.said(), (Lines{"ERR AABB - libGetOpticsSFP got User exception 7: busy",
                                 "ERR AABB - libGetOpticsSFP got default exception"}));
}
