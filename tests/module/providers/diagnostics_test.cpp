#include "tests/module/providers/Association_Fixture.h"

namespace KPRV {
namespace {

class Diagnostics : public Association_Fixture
{
protected:
    static constexpr const char* NO_PORTS =
        "WARN No ports are present for running dianostics.Continue with remaining adapter";
    static constexpr const char* IS_CNA = "INFO  The PortController is CNA";

    void expect_services(const std::string& pairs, const Lines& said = {BUILDING})
    {
        expect("AvailableDiagnosticServiceForFCPort", "ServiceProvided UserOfService", pairs, said);
    }
    void expect_owners(const std::string& pairs, const Lines& said = {BUILDING})
    {
        expect("OwningJobElement", "OwningElement OwnedElement", pairs, said);
    }
};

TEST_F(Diagnostics, AreThereForEachFCPort)
{
    lists("PortController: a1 DeviceID=aa ControllerType=4, a2 DeviceID=bb;"
          "tests for FC ports: t1 Name=Kaldera:InternalLoopbackTest, t2 Name=Kaldera:PCILoopbackTest;"
          "FC ports of aa: p1, p2; FC ports of bb: q1");
    expect_services("t1 p1, t2 p1, t1 p2, t2 p2, t1 q1, t2 q1");
    EXPECT_EQ((Lines{"PortController", "tests for FC ports", "FC ports of aa", "FC ports of bb"}),
              enumerate("AvailableDiagnosticServiceForFCPort", "").fetched);
}

TEST_F(Diagnostics, OfAConvergedAdapterLeaveOutTheInternalLoopbackTest)
{
    lists("PortController: a1 DeviceID=aa ControllerType=1, a2 DeviceID=bb ControllerType=4;"
          "tests for FC ports: t1 Name=Kaldera:InternalLoopbackTest, t2 Name=KALDERA:INTERNALLOOPBACKTEST,"
          " t3 Name=Kaldera:ExternalLoopbackTest;"
          "FC ports of aa: p1, p2; FC ports of bb: q1");
    expect_services("t3 p1, t3 p2, t1 q1, t2 q1, t3 q1", {BUILDING, IS_CNA, IS_CNA, IS_CNA, IS_CNA});
}

TEST_F(Diagnostics, PassAnAdapterWithoutPorts)
{
    lists("PortController: a1 DeviceID=aa, a2 DeviceID=bb; tests for FC ports: t; FC ports of bb: q");
    expect_services("t q", {BUILDING, NO_PORTS});
}

TEST_F(Diagnostics, OwnTheJobsThatBeginWithTheirNames)
{
    lists("ConcreteJob: j1 InstanceID=MEM-1, j2 InstanceID=pci-2, j3 InstanceID=other-3, j4 InstanceID=mem;"
          "all tests: t1 Name=mem, t2 Name=PCI, t3 Name=Mem");
    expect_owners("t1 j1, t2 j2, t1 j4");
    EXPECT_EQ((Lines{"ConcreteJob", "all tests"}), enumerate("OwningJobElement", "").fetched);
}

TEST_F(Diagnostics, TellOfAJobWithoutANameForEachTest)
{
    lists("ConcreteJob: j1 InstanceID=--, j2, j3 InstanceID=-mem-3; all tests: t1 Name=mem, t2 Name=pci");
    const char* const dashes = "INFO Unable to fetch Test Name form Job instance id : --";
    const char* const nothing = "INFO Unable to fetch Test Name form Job instance id : ";
    expect_owners("t1 j3", {BUILDING, dashes, dashes, nothing, nothing});
}

TEST_F(Diagnostics, LookAt128BytesOfAJobsId)
{
    const std::string name(128, 'n');
    lists("ConcreteJob: j InstanceID=" + name + "n-1; all tests: t1 Name=" + name + "n, t2 Name=" + name);
    expect_owners("t2 j");
}

TEST_F(Diagnostics, WithoutTestsOwnNoJobs)
{
    lists("ConcreteJob: j InstanceID=mem-1");
    expect_owners("");
}

} // namespace
} // namespace KPRV
