#include "tests/module/model/Port_Fixture.h"

#include "module/model/Port_Status.h"
#include "module/model/Record_Filling.h"

using namespace KPRV;

namespace {

struct Port_Instances : Port_Fixture
{
    _hbaPortInfo port = {};
    Port_Instances()
    {
        copy_text(port.portWWN, "W");
        copy_text(port.nodeWWN, "N");
        port.systemName = "host";
    }
};

} // namespace

TEST_F(Port_Instances, PortGroup)
{
    const Set_Properties expected = {
        {"InstanceID", "20008c7cff000001"},
        {"Name", "10008c7cff000001"},
        {"NameFormat", "WWN"},
        {"ElementName", "20008c7cff000001:10008c7cff000001"},
        {"Caption", "10.0.0.1"},
        {"Description", "10.0.0.1"},
    };
    EXPECT_EQ(walk(LOGICALPORTGROUP), std::vector<Set_Properties>{expected});
}

TEST_F(Port_Instances, EnabledStates)
{
    const std::pair<sint32, const char*> states[] = {{6, "1"},  {7, "1"},  {8, "9"},  {9, "4"},  {10, "3"},
                                                     {11, "2"}, {12, "1"}, {13, "6"}, {14, "1"}, {0, "1"}};
    for (const auto& [status, expected] : states) {
        port.status = status;
        EXPECT_EQ(taken(helper->getFCPortInstance(port))["EnabledState"], expected) << status;
        EXPECT_EQ(taken(helper->getSCSIProtocolEndpointInstance(port, false))["EnabledState"], expected);
    }
}

TEST_F(Port_Instances, BuildersAreTraced)
{
    taken(helper->getFCPortInstance(port));
    taken(helper->getFCPortStatisticsInstance(port, {}, false));
    taken(helper->getSCSIProtocolEndpointInstance(port, true));
    taken(helper->getLogicalPortGroupInstance(port));
    taken(helper->getAlarmDeviceInstance(port, true));
    Lines expected;
    for (const char* name :
         {"getFCPortInstance", "getFCPortStatisticsInstance", "getSCSIProtocolEndpointInstance",
          "getLogicalPortGroupInstance", "getAlarmDeviceInstance"}) {
        expected.push_back(std::string("DBG Entering: ") + name);
        expected.push_back(std::string("DBG Returning: ") + name);
    }
    EXPECT_EQ(log.traces(), expected);
}
