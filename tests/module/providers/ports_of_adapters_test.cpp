#include "tests/module/providers/Association_Fixture.h"

namespace KPRV {
namespace {

class Ports_Of_Adapters : public Association_Fixture
{
protected:
    static constexpr const char* NO_FC_PORTS = "INFO There are no FCPORT instances returned";
    static constexpr const char* NO_ETHERNET_PORTS = "INFO There are no ETHPORT instances returned";

    void expect_hosted(const std::string& pairs, const Lines& said = {BUILDING})
    {
        expect("HostedDependency", "Antecedent Dependent", pairs, said);
    }
};

TEST_F(Ports_Of_Adapters, AreControlledByThem)
{
    lists("PortController: a1 DeviceID=aa, a2 DeviceID=bb, a3 DeviceID=cc;"
          "FC ports of aa: p1, p2; FC ports of cc: p3;"
          "Ethernet ports of bb: e1, e2; Ethernet ports of cc: e3");
    expect("ControlledBy", "Antecedent Dependent", "a1 p1, a1 p2, a3 p3");
    expect("EthernetPortControlledBy", "Antecedent Dependent", "a2 e1, a2 e2, a3 e3");
    EXPECT_EQ((Lines{"PortController", "FC ports of aa", "FC ports of bb", "FC ports of cc"}),
              enumerate("ControlledBy", "").fetched);
    EXPECT_EQ(
        (Lines{"PortController", "Ethernet ports of aa", "Ethernet ports of bb", "Ethernet ports of cc"}),
        enumerate("EthernetPortControlledBy", "").fetched);
}

TEST_F(Ports_Of_Adapters, AreNoneWithoutAdaptersAndNothingIsSaid)
{
    lists("");
    for (const char* association : {"ControlledBy", "EthernetPortControlledBy", "HostedDependency"}) {
        expect(association, "Antecedent Dependent", "");
        EXPECT_EQ(Lines{"PortController"}, enumerate(association, "").fetched);
    }
}

TEST_F(Ports_Of_Adapters, DependOnTheEthernetSideOfTheSamePhysicalPort)
{
    lists("PortController: a1 DeviceID=aa ControllerType=1, a2 DeviceID=bb ControllerType=1;"
          "FC ports of aa: p1 PortNumber=1, p0 PortNumber=0, p2 PortNumber=2;"
          "Ethernet ports of aa: e0 PortNumber=0, e1 PortNumber=1, f1 PortNumber=1;"
          "FC ports of bb: q0 PortNumber=0; Ethernet ports of bb: g0 PortNumber=0");
    expect_hosted("e1 p1, e0 p0, g0 q0");
    EXPECT_EQ((Lines{"PortController", "FC ports of aa", "Ethernet ports of aa", "FC ports of bb",
                     "Ethernet ports of bb"}),
              enumerate("HostedDependency", "").fetched);
}

TEST_F(Ports_Of_Adapters, OfPlainFCAdaptersDependOnNothing)
{
    lists("PortController: a1 DeviceID=aa ControllerType=4, a2 DeviceID=bb ControllerType=4;"
          "FC ports of aa: p PortNumber=0; Ethernet ports of aa: e PortNumber=0");
    expect_hosted("");
    EXPECT_EQ(Lines{"PortController"}, enumerate("HostedDependency", "").fetched);
}

TEST_F(Ports_Of_Adapters, ThatLackOneSideAreToldAndTheOthersGoOn)
{
    lists("PortController: a1 DeviceID=aa ControllerType=1, a2 DeviceID=bb ControllerType=0, a3 DeviceID=cc "
          "ControllerType=1;"
          "Ethernet ports of aa: e PortNumber=0;"
          "FC ports of bb: q PortNumber=0;"
          "FC ports of cc: p PortNumber=0; Ethernet ports of cc: f PortNumber=0");
    expect_hosted("f p", {BUILDING, NO_FC_PORTS, NO_ETHERNET_PORTS});
    EXPECT_EQ((Lines{"PortController", "FC ports of aa", "FC ports of bb", "Ethernet ports of bb",
                     "FC ports of cc", "Ethernet ports of cc"}),
              enumerate("HostedDependency", "").fetched);
}

} // namespace
} // namespace KPRV
