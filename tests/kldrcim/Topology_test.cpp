// The walk over the small host: what it finds, and what it asks.
#include "kldrcim/formats/Output.h"
#include "kldrcim/formats/Topology_Text.h"
#include "kldrcim/local/Local_Connection.h"
#include "kldrcim/walks/Profile_Tree.h"

#include "tests/broker/Toy_Server.h"

namespace KPRV::kldrcim {
namespace {

class Topology_Test : public Toy_Test
{
protected:
    Topology_Test() { server = open_toy(TOY_FABRIC); }
    void SetUp() override { connection.emplace(*server); }

    unsigned count(const std::string& class_name)
    {
        auto* ask = reinterpret_cast<unsigned (*)(const char*)>(server->module().symbol("fabric_count"));
        return ask(class_name.c_str());
    }

    static std::size_t nodes(const Topology& topology, Node_Kind kind)
    {
        return static_cast<std::size_t>(
            std::count_if(topology.nodes.begin(), topology.nodes.end(),
                          [&](const auto& node) { return node.is_met && node.kind == kind; }));
    }

    Topology walk(Topology_Options options)
    {
        options.text_of = [](Node_Kind kind, const Instance_Value& instance) {
            return tree_node_text(kind, instance, false);
        };
        return walk_topology(*connection, options);
    }

    std::optional<Local_Connection> connection;
};

TEST_F(Topology_Test, AsksEachClassOnce)
{
    EXPECT_TRUE(walk({.software = true, .connectors = true, .cross_links = true}).failures.empty());
    for (const std::string& name : server->catalogue().class_names()) {
        // Profiles have a tree of their own.
        bool of_the_plan = name.starts_with("KALDERA_") && name.find("Profile") == name.npos;
        EXPECT_EQ(of_the_plan ? 1u : 0u, count(name)) << name;
    }
}

TEST_F(Topology_Test, ProfilesAskEachOfTheirClassesOnce)
{
    Association_Index index(*connection);
    walk_profiles(index, server->catalogue());
    EXPECT_TRUE(index.failures().empty());
    for (const std::string& name : server->catalogue().class_names()) {
        bool asked =
            name == "TOY_Service" || (name.starts_with("KALDERA_") && name.find("Profile") != name.npos);
        EXPECT_EQ(asked ? 1u : 0u, count(name)) << name;
    }
}

TEST_F(Topology_Test, DoesNotAskForWhatIsNotShown)
{
    const Topology topology = walk({});
    for (const char* name :
         {"KALDERA_AdapterElementSoftwareIdentity", "KALDERA_AdapterSoftwareIdentity", "KALDERA_Realizes",
          "KALDERA_PhysicalPackage", "KALDERA_HostedDependency", "KALDERA_EthernetPortRealizes"})
        EXPECT_EQ(0u, count(name)) << name;
    EXPECT_EQ(0u, nodes(topology, Node_Kind::SOFTWARE));
    EXPECT_EQ(3u, nodes(topology, Node_Kind::FC_PORT));
}

TEST_F(Topology_Test, WhatIsSeenThroughTwoPortsIsOneNode)
{
    const Topology topology = walk({});
    EXPECT_EQ(2u, nodes(topology, Node_Kind::TARGET));
    EXPECT_EQ(3u, nodes(topology, Node_Kind::UNIT));
    std::size_t links = 0, met = 0;
    for (const Topology::Step_Links& each : topology.steps)
        links += each.links.size();
    for (const Topology::Node& node : topology.nodes)
        met += node.is_met;
    // Besides one link to each node but the root, two to what is seen through the other port.
    EXPECT_EQ(met - 1 + 2, links);
}

TEST_F(Topology_Test, FarEndsComeOnceAndOnlyInTheirRole)
{
    Association_Index index(*connection);
    Path_Value initiator = {.class_name = "KALDERA_SCSIProtocolEndpoint",
                            .keys = {{"Name", Plain_Value::text("1000024b4c100000")}}};
    const char* paths = "KALDERA_SCSIInitiatorTargetLogicalUnitPath";
    // Three paths, two targets.
    EXPECT_EQ(2u, index.far_ends(paths, "Initiator", initiator, "Target").size());
    EXPECT_EQ(0u, index.far_ends(paths, "Target", initiator, "LogicalUnit").size());
    EXPECT_EQ(0u, index.far_ends(paths, "Initiator", initiator, "NoSuchRole").size());
    EXPECT_EQ(0u, index.far_ends(paths, "Initiator", initiator, "Target", "Target").size());
}

TEST_F(Topology_Test, AnInstanceThatTheModuleDoesNotHaveKeepsItsKeys)
{
    Association_Index index(*connection);
    Path_Value gone = {.class_name = "KALDERA_FCPort", .keys = {{"DeviceID", Plain_Value::text("gone")}}};
    EXPECT_EQ("gone", index.instance(gone).property("DeviceID")->as_text());
    EXPECT_TRUE(index.failures().empty());
}

TEST_F(Topology_Test, FailuresAreToldOnce)
{
    Association_Index index(*connection);
    Path_Value tape = {.class_name = "KALDERA_TapeDrive",
                       .keys = {{"DeviceID", Plain_Value::text("tape_only")}}};
    index.far_ends("TOY_Broken", "Antecedent", tape, "Dependent");
    index.far_ends("TOY_Broken", "Dependent", tape, "Antecedent");
    index.instance({.class_name = "TOY_Unheard", .keys = {{"K", Plain_Value::text("k")}}});
    ASSERT_EQ(2u, index.failures().size());
    EXPECT_EQ("out of order", index.failures()[0].message);
    EXPECT_EQ(CMPI_RC_ERR_INVALID_CLASS, index.failures()[1].rc);
}

TEST_F(Topology_Test, NoSystemIsNoTree)
{
    testing::internal::CaptureStdout();
    write_tree({}, false);
    write_tree_json({});
    flush_output();
    EXPECT_EQ("[]\n", testing::internal::GetCapturedStdout());
}

} // namespace
} // namespace KPRV::kldrcim
