#include "module/alerts/Element_Paths.h"
#include "tests/support/Fixed_Host.h"

#include <gtest/gtest.h>

namespace KPRV {
namespace {

TEST(Element_Paths, NameTheElementAsAClientOfTheHostSeesIt)
{
    const Fixed_Host host;
    EXPECT_STREQ("//10.0.0.1/root/kaldera:KALDERA_FCPort.SystemCreationClassName=\"KALDERA_ComputerSystem\","
                 "SystemName=\"10.0.0.1\",CreationClassName=\"KALDERA_FCPort\",DeviceID=\"1000024b4c100000\"",
                 getFCPortObjectPath("1000024b4c100000").c_str());
    EXPECT_STREQ(
        "//10.0.0.1/root/kaldera:KALDERA_EthernetPort.SystemCreationClassName=\"KALDERA_ComputerSystem\","
        "SystemName=\"10.0.0.1\",CreationClassName=\"KALDERA_EthernetPort\",DeviceID=\"024b4c200000\"",
        getEthernetPortObjectPath("024b4c200000").c_str());
    EXPECT_STREQ("//10.0.0.1/root/kaldera:KALDERA_ComputerSystem.Name=\"10.0.0.1\","
                 "CreationClassName=\"KALDERA_ComputerSystem\"",
                 getComputerSystemObjectPath().c_str());
    EXPECT_STREQ("//10.0.0.1/root/kaldera:KALDERA_AgentService.Name=\"Kaldera Agent Service Provider\"",
                 getAgentServiceObjectPath().c_str());
}

TEST(Element_Paths, TakeAnIdAsItIs)
{
    const Fixed_Host host;
    const String path = getFCPortObjectPath("10:00 \"x\"");
    EXPECT_NE(NPOS, path.find("DeviceID=\"10:00 \"x\"\""));
    EXPECT_NE(NPOS, getFCPortObjectPath("").find("DeviceID=\"\""));
}

} // namespace
} // namespace KPRV
