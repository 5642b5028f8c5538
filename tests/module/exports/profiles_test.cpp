#include "kldrcim/formats/Profile_Text.h"
#include "kldrcim/local/Local_Connection.h"
#include "tests/module/exports/Golden.h"
#include "tests/module/exports/Module_Fixture.h"
#include "tests/support/Named_Process.h"

namespace KPRV {
namespace {

using broker::Path_Value;
using broker::Plain_Value;
using broker::Result;

constexpr const char* INTEROP = "root/PG_InterOp";

class Profiles : public Module_Fixture
{
protected:
    void SetUp() override
    {
        Module_Fixture::SetUp();
        open("empty.json");
    }

    /// The ends of the links as "left -> right", each by the key that people know it by.
    Lines links(const std::string& association, const char* left, const char* right)
    {
        Lines lines;
        for (const broker::Instance_Value& link : enumerate(association).instances)
            lines.push_back(end_of(link, left) + " -> " + end_of(link, right));
        return lines;
    }

    static std::string end_of(const broker::Instance_Value& link, const char* role)
    {
        const Plain_Value* end = link.property(role);
        const Path_Value* path = end ? end->as_path() : nullptr;
        if (!path)
            return "(none)";
        if (path->class_name == "KALDERA_ComputerSystem")
            return "(system)";
        const Plain_Value* key = path->key("InstanceID");
        return key ? key->as_text() : path->class_name.substr(sizeof "KALDERA_" - 1);
    }

    /// What the server has of its own.
    void server_has(std::vector<broker::Named_Value> properties)
    {
        server->store().add_class(INTEROP, "PG_ObjectManager", "CIM_ObjectManager");
        server->store().add(INTEROP, {{.class_name = "PG_ObjectManager", .keys = {}}, std::move(properties)});
    }

    broker::Instance_Value only(const char* class_name)
    {
        const Result result = enumerate(class_name);
        EXPECT_EQ(1u, result.instances.size()) << class_name;
        return result.instances.at(0);
    }

    /// Up-calls of one enumeration.
    Lines up_calls(const char* class_name)
    {
        server->calls().clear();
        server->calls().record(true);
        enumerate(class_name);
        server->calls().record(false);
        return server->calls().calls("CBEnumInstances");
    }
};

const Lines SUBPROFILES = {"FC Initiator Ports",  "Profile Registration", "Access Points",
                           "Software Update",     "Software Inventory",   "Physical Asset",
                           "Ethernet Port",       "Diagnostics Profile",  "Host LAN Network Port",
                           "FCoE Initiator Ports"};

// Without an adapter, and with a server that refuses the one question.
TEST_F(Profiles, EighteenThingsConform)
{
    Lines expected = {
        "FC HBA -> (system)",
        "Server -> ObjectManager",
        "Host Discovered Resources -> (system)",
        "Storage HBA -> (system)",
        "SMI-S -> FC HBA",
        "SMI-S -> Server",
        "SMI-S -> Host Discovered Resources",
        "SMI-S -> Storage HBA",
    };
    for (const std::string& subprofile : SUBPROFILES)
        expected.push_back("SMI-S -> " + subprofile);
    ASSERT_EQ(18u, expected.size());
    EXPECT_EQ(expected, links("KALDERA_ElementConformsToProfile", "ConformantStandard", "ManagedElement"));
    mark();
    enumerate("KALDERA_ElementConformsToProfile");
    EXPECT_EQ((Lines{"DBG Entering: enum_instances", "INFO Building association instance for profile : SMI-S",
                     "INFO Building association instance for profile : FC HBA",
                     "INFO Building association instance for profile : Server",
                     "INFO Building association instance for profile : Host Discovered Resources",
                     "INFO Building association instance for profile : Storage HBA",
                     "DBG Returning: enum_instances"}),
              said_by("KALDERA_ElementConformsToProfile_Provider.cpp"));
    EXPECT_EQ(Lines{}, said("ERR"));
    EXPECT_TRUE(simulator.call_names().empty());
}

TEST_F(Profiles, TenSubprofilesBelongToOneEach)
{
    EXPECT_EQ((Lines{"FC HBA -> FC Initiator Ports", "FC HBA -> Access Points", "FC HBA -> Software Update",
                     "FC HBA -> Software Inventory", "FC HBA -> Physical Asset", "FC HBA -> Ethernet Port",
                     "FC HBA -> Diagnostics Profile", "FC HBA -> Host LAN Network Port",
                     "Server -> Profile Registration", "Storage HBA -> FCoE Initiator Ports"}),
              links("KALDERA_SubProfileRequiresProfile", "Antecedent", "Dependent"));
}

TEST_F(Profiles, OneSoftwareImplementsThemAll)
{
    Lines expected;
    for (const char* profile : {"SMI-S", "FC HBA", "Server", "Host Discovered Resources", "Storage HBA"})
        expected.push_back(std::string("Kaldera Adapter CIM Provider -> ") + profile);
    for (const std::string& subprofile : SUBPROFILES)
        expected.push_back("Kaldera Adapter CIM Provider -> " + subprofile);
    EXPECT_EQ(expected, links("KALDERA_ProfileElementSoftwareIdentity", "Antecedent", "Dependent"));
}

TEST_F(Profiles, TheServersOwnHangTogether)
{
    const auto ends = [&](const char* association) { return links(association, "Antecedent", "Dependent"); };
    EXPECT_EQ(Lines{"ObjectManager -> Namespace"}, ends("KALDERA_NamespaceInManager"));
    EXPECT_EQ(Lines{"ObjectManager -> CIMXMLCommunicationMechanism"},
              ends("KALDERA_CommMechanismForManager"));
    EXPECT_EQ(Lines{"(system) -> CIMXMLCommunicationMechanism"}, ends("KALDERA_CommMechHostedAccessPoint"));
    EXPECT_EQ(Lines{"(system) -> ObjectManager"}, ends("KALDERA_ObjectManagerHostedService"));
}

TEST_F(Profiles, AClientThatKnowsNothingFindsAll)
{
    kldrcim::Local_Connection connection(*server);
    kldrcim::Association_Index index(connection);
    std::string text = kldrcim::profile_text(kldrcim::walk_profiles(index, server->catalogue()), true);
    EXPECT_TRUE(index.failures().empty());
    replace_all(text, "KALDERA_ComputerSystem " + This_Host::find().name + "\n",
                "KALDERA_ComputerSystem @HOST@\n");
    expect_golden("profiles", text, ".txt");
}

TEST_F(Profiles, TheFiveInstancesOfTheServerSide)
{
    Result all;
    for (const char* class_name :
         {"KALDERA_ObjectManager", "KALDERA_Namespace", "KALDERA_CIMXMLCommunicationMechanism",
          "KALDERA_ProfileSoftwareIdentity", "KALDERA_AgentService"})
        all.instances.push_back(only(class_name));
    expect_golden("server_side", golden_text(all, This_Host::find().name));
}

// One question each time, without keys, and nobody else asks it.
TEST_F(Profiles, TheServerIsAskedForItsObjectManagerAndNothingElse)
{
    for (const char* asks : {"KALDERA_ObjectManager", "KALDERA_Namespace"})
        EXPECT_EQ(Lines{"CBEnumInstances CIM_ObjectManager"}, up_calls(asks)) << asks;
    for (const char* does_not :
         {"KALDERA_RegisteredProfile", "KALDERA_RegisteredSubProfile", "KALDERA_CIMXMLCommunicationMechanism",
          "KALDERA_ProfileSoftwareIdentity", "KALDERA_AgentService", "KALDERA_CommMechHostedAccessPoint"})
        EXPECT_TRUE(up_calls(does_not).empty()) << does_not;
    EXPECT_EQ(Lines(2, "CBEnumInstances CIM_ObjectManager"), up_calls("KALDERA_NamespaceInManager"));
}

TEST_F(Profiles, TheObjectManagerTakesAfterTheServers)
{
    server_has({{"Name", Plain_Value::text("Pegasus:1")},
                {"ElementName", Plain_Value::text("Pegasus")},
                {"Description", Plain_Value::text("A CIM server")}});
    server_has({{"Name", Plain_Value::text("second")}});
    const broker::Instance_Value manager = only("KALDERA_ObjectManager");
    EXPECT_EQ("Pegasus:1", text_of(manager, "Name"));
    EXPECT_EQ("Pegasus", text_of(manager, "Caption"));
    EXPECT_EQ("A CIM server", text_of(manager, "Description"));
    EXPECT_EQ("CIM Server", text_of(manager, "ElementName"));
    EXPECT_EQ("Pegasus:1", text_of(only("KALDERA_Namespace"), "ObjectManagerName"));
}

// A null is not handed to the client at all.
TEST_F(Profiles, WhatTheServerDoesNotTellIsNull)
{
    server_has(
        {{"Name", Plain_Value::text("Pegasus:1")}, {"ElementName", Plain_Value::null_of(CMPI_string)}});
    const broker::Instance_Value manager = only("KALDERA_ObjectManager");
    EXPECT_EQ("Pegasus:1", text_of(manager, "Name"));
    EXPECT_EQ("(absent)", text_of(manager, "Caption"));
    EXPECT_EQ("CIM Server", text_of(manager, "ElementName"));
}

TEST_F(Profiles, AServerWithoutAnObjectManagerLeavesTheNameNull)
{
    server->store().add_class(INTEROP, "CIM_ObjectManager");
    const broker::Instance_Value manager = only("KALDERA_ObjectManager");
    for (const char* property : {"Name", "Caption", "Description"})
        EXPECT_EQ("(absent)", text_of(manager, property)) << property;
    EXPECT_EQ("CIM Server", text_of(manager, "ElementName"));
    EXPECT_EQ("(absent)", text_of(only("KALDERA_Namespace"), "ObjectManagerName"));
}

TEST_F(Profiles, AServerThatRefusesIsCalledCIMServer)
{
    server->store().refuse(INTEROP, CMPI_RC_ERR_ACCESS_DENIED);
    const broker::Instance_Value manager = only("KALDERA_ObjectManager");
    for (const char* property : {"Name", "Caption", "Description", "ElementName"})
        EXPECT_EQ("CIM Server", text_of(manager, property)) << property;
    EXPECT_EQ("CIM Server", text_of(only("KALDERA_Namespace"), "ObjectManagerName"));
    EXPECT_NE("(none)", links("KALDERA_ElementConformsToProfile", "ConformantStandard", "ManagedElement")[1]);
}

TEST_F(Profiles, TheServerSideSaysWhatIsAskedOfIt)
{
    mark();
    only("KALDERA_ObjectManager");
    EXPECT_EQ((Lines{"DBG Entering: getInstances", "INFO Requested classId : 13",
                     "INFO Requested class is: KALDERA_ObjectManager", "DBG Returning: getInstances"}),
              said_by("ServerManager.cpp"));
    EXPECT_EQ((Lines{"DBG Entering: getObjectManagerInstance", "DBG Returning: getObjectManagerInstance"}),
              said_by("Server_Instances.cpp"));
}

TEST_F(Profiles, TheAccessPointComesAndGoesWithTheAgent)
{
    const std::string host_name = This_Host::find().name;
    EXPECT_TRUE(enumerate("KALDERA_RemoteServiceAccessPoint").instances.empty());
    {
        const Named_Process agent("qxmagent");
        mark();
        const broker::Instance_Value point = only("KALDERA_RemoteServiceAccessPoint");
        EXPECT_EQ("QXM Service", text_of(point, "Name"));
        EXPECT_EQ("https://" + host_name + ":34568/index.html", text_of(point, "AccessInfo"));
        EXPECT_EQ("KALDERA_ComputerSystem", text_of(point, "SystemCreationClassName"));
        EXPECT_EQ(host_name, text_of(point, "SystemName"));
        EXPECT_EQ(200u, point.property("InfoFormat")->as_uint());
        EXPECT_EQ((Lines{"DBG Entering: enum_instances", "DBG Returning instances",
                         "DBG Returning: enum_instances"}),
                  said_by("KALDERA_RemoteServiceAccessPoint_Provider.cpp"));
        EXPECT_EQ(Lines{"(system) -> RemoteServiceAccessPoint"},
                  links("KALDERA_RemoteServiceHostedAccessPoint", "Antecedent", "Dependent"));
    }
    mark();
    EXPECT_TRUE(enumerate("KALDERA_RemoteServiceAccessPoint").instances.empty());
    EXPECT_EQ((Lines{"WARN The QXM Agent is not running so no service available",
                     "WARN Warning: No service is available"}),
              said("WARN"));
    EXPECT_TRUE(enumerate("KALDERA_RemoteServiceHostedAccessPoint").instances.empty());
}

} // namespace
} // namespace KPRV
