#include "tests/module/exports/Rich_Fixture.h"

namespace KPRV {
namespace {

class Rich_Instances : public Rich_Fixture
{
protected:
    static inline const std::vector<std::string> classes = {"KALDERA_ComputerSystem",
                                                            "KALDERA_PortController",
                                                            "KALDERA_PhysicalPackage",
                                                            "KALDERA_Product",
                                                            "KALDERA_AdapterSoftwareIdentity",
                                                            "KALDERA_FCPort",
                                                            "KALDERA_SCSIProtocolEndpoint",
                                                            "KALDERA_FCPortStatistics",
                                                            "KALDERA_LogicalPortGroup",
                                                            "KALDERA_AlarmDevice",
                                                            "KALDERA_EthernetPort",
                                                            "KALDERA_LANEndpoint",
                                                            "KALDERA_StorageExtent",
                                                            "KALDERA_LogicalDisk",
                                                            "KALDERA_TapeDrive",
                                                            "KALDERA_PhysicalConnector"};

    void expect_whole_answers()
    {
        const This_Host host = This_Host::find();
        for (const std::string& name : classes) {
            SCOPED_TRACE(name);
            std::string text = golden_text(enumerate(name), host.name);
            if (name == "KALDERA_ComputerSystem") {
                // How it is known depends on the machine that the test runs on.
                replace_all(text, broker::quoted(host.code ? "Other" : "IP"), "\"@NAME_FORMAT@\"");
                replace_all(text, broker::quoted(host.code ? "Fully Qualified Domain Name" : "Ipv4 Address"),
                            "\"@NAME_KIND@\"");
            }
            expect_golden("rich_" + name, text);
        }
    }
};

TEST_F(Rich_Instances, ComeWholeAsWrittenDown)
{
    open_rich();
    expect_whole_answers();
}

TEST_F(Rich_Instances, ComeWholeUnderTheHabitsOfBothServers)
{
    under_both_servers([&] { expect_whole_answers(); });
}

TEST_F(Rich_Instances, CostTheLibraryOneWalkAndNothingIsKept)
{
    open_rich();
    for (const std::string& name : classes) {
        SCOPED_TRACE(name);
        for (int round = 0; round < 2; round++) {
            mark();
            enumerate(name);
            EXPECT_EQ(rich::cost_of(name), rich::recorded(simulator));
        }
    }
}

TEST_F(Rich_Instances, AreNamedAndFoundAsTheyAreEnumerated)
{
    under_both_servers([&] {
        for (const std::string& name : classes)
            expect_named_and_found(name, rich::cost_of(name));
    });
}

TEST_F(Rich_Instances, ThatShareAKeyAreAllListedButOnlyTheLastIsFound)
{
    open_rich();
    // A group is named for the node, which the ports of an adapter have in common.
    const broker::Result groups = enumerate("KALDERA_LogicalPortGroup");
    ASSERT_EQ(5u, groups.instances.size());
    EXPECT_TRUE(broker::same_object(groups.instances[0].path, groups.instances[1].path));
    // The search runs to the end of the enumeration, and a later match takes the place of an earlier one.
    const broker::Result found = server->get_instance(groups.instances[0].path);
    ASSERT_EQ(1u, found.instances.size());
    EXPECT_EQ("1000024b4ca10001", text_of(found.instances[0], "Name"));
}

TEST_F(Rich_Instances, OfUnknownIdTypeAndInAnEmptySlotAreToldInTheLog)
{
    open_rich();
    mark();
    enumerate("KALDERA_StorageExtent");
    EXPECT_EQ(Lines{"ERR Default idType. Should not have reached here. "}, said("ERR"));
    mark();
    enumerate("KALDERA_PhysicalConnector");
    EXPECT_EQ(Lines{"WARN getOpticsInfo failed for PortIndex =1 Ret = -1"}, said("WARN"));
    EXPECT_EQ(Lines{"ERR Unable to get SFP info for 10:00:02:4b:4c:a2:00:01"}, said("ERR"));
    mark();
    enumerate("KALDERA_FCPortStatistics");
    EXPECT_EQ(Lines{"WARN libGetDynamicPortStatistics failed for port WWN= 1000024b4ca10001"}, said("WARN"));
}

} // namespace
} // namespace KPRV
