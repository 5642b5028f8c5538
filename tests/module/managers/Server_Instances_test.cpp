#include "module/managers/ServerManager.h"

#include "module/schema/CIM_ObjectManager.h"
#include "tests/module/model/Taken_Instances.h"
#include "tests/module/runtime/dispatch/Recording_Context.h"
#include "tests/support/Fixed_Host.h"

#include <gtest/gtest.h>

using namespace KPRV;

namespace {

struct Server_Instances : testing::Test
{
    const ServerManager* manager = ServerManager::getServerManager();
    Fixed_Host host;
    Notes notes;
    Recording_Context context{notes};
    Pushed pushed{&context};

    Set_Properties object_manager() { return taken(manager->getObjectManagerInstance()).at(0); }
    Set_Properties name_space() { return taken(manager->getNamespaceInstances()).at(0); }

    /// The server has an object manager with these properties; null leaves one null.
    void server_has(const char* name, const char* element_name, const char* description)
    {
        CIM_ObjectManager* found = create<CIM_ObjectManager>(true);
        const auto set = [](Property<String>& property, const char* text) {
            if (text)
                property.set(text);
        };
        set(found->Name, name);
        set(found->ElementName, element_name);
        set(found->Description, description);
        context.results.insert(context.results.begin(), Ref<Instance>(found));
    }
};

const Notes_List asked = {"enum root/PG_InterOp", "destroy"};

} // namespace

TEST_F(Server_Instances, TheObjectManagerTakesAfterThatOfTheServer)
{
    server_has("Pegasus:1", "Pegasus", "Pegasus CIM Server");
    server_has("second", "second", "second");
    EXPECT_EQ(object_manager(), (Set_Properties{
                                    {"CreationClassName", "KALDERA_ObjectManager"},
                                    {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                                    {"SystemName", "10.0.0.1"},
                                    {"Name", "Pegasus:1"},
                                    {"Caption", "Pegasus"},
                                    {"Description", "Pegasus CIM Server"},
                                    {"ElementName", "CIM Server"},
                                    {"OperationalStatus", "{2}"},
                                    {"Started", "true"},
                                    // Defaults of the schema.
                                    {"EnabledState", "5"},
                                    {"RequestedState", "12"},
                                    {"EnabledDefault", "2"},
                                    {"TransitioningToState", "12"},
                                    {"GatherStatisticalData", "true"},
                                }));
    EXPECT_EQ(notes.list(), asked);
}

TEST_F(Server_Instances, NullsOfTheServerStayNull)
{
    server_has("Pegasus:1", nullptr, nullptr);
    const Set_Properties set = object_manager();
    EXPECT_EQ(set.at("Name"), "Pegasus:1");
    EXPECT_FALSE(set.contains("Caption"));
    EXPECT_FALSE(set.contains("Description"));
    EXPECT_EQ(set.at("ElementName"), "CIM Server");
}

TEST_F(Server_Instances, AServerWithoutAnObjectManagerLeavesThemNull)
{
    Set_Properties set = object_manager();
    for (const char* name : {"Name", "Caption", "Description"})
        EXPECT_FALSE(set.contains(name)) << name;
    EXPECT_EQ(set.at("ElementName"), "CIM Server");
    EXPECT_FALSE(name_space().contains("ObjectManagerName"));
}

TEST_F(Server_Instances, AServerThatRefusesIsNamedForWhatItIs)
{
    context.next_rep = nullptr;
    const Set_Properties set = object_manager();
    for (const char* name : {"Name", "Caption", "Description", "ElementName"})
        EXPECT_EQ(set.at(name), "CIM Server") << name;
    EXPECT_EQ(notes.list(), Notes_List{"enum root/PG_InterOp"});
    EXPECT_EQ(name_space().at("ObjectManagerName"), "CIM Server");
}

TEST_F(Server_Instances, AnInstanceOfAnotherClassTellsNothing)
{
    context.results.push_back(Ref<Instance>(create(&Instance::static_meta_class, true)));
    EXPECT_FALSE(object_manager().contains("Name"));
}

TEST_F(Server_Instances, TheNameSpace)
{
    server_has("Pegasus:1", "Pegasus", "Pegasus CIM Server");
    EXPECT_EQ(name_space(), (Set_Properties{
                                {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                                {"SystemName", "10.0.0.1"},
                                {"ObjectManagerCreationClassName", "KALDERA_ObjectManager"},
                                {"ObjectManagerName", "Pegasus:1"},
                                {"CreationClassName", "KALDERA_Namespace"},
                                {"Name", "root/kaldera"},
                                {"ClassType", "2"},
                                {"ClassInfo", "11"},
                                {"ClassTypeVersion", "2.26.0"},
                            }));
    EXPECT_EQ(notes.list(), asked);
}

TEST_F(Server_Instances, TheCommunicationMechanism)
{
    EXPECT_EQ(taken(manager->getCIMXMLCommunicationMechanismInstance()),
              (std::vector<Set_Properties>{{
                  {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                  {"SystemName", "10.0.0.1"},
                  {"CreationClassName", "KALDERA_CIMXMLCommunicationMechanism"},
                  {"Name", "CIM-XML"},
                  {"ElementName", "CIM-XML Communication Mechanism"},
                  {"CommunicationMechanism", "2"},
                  {"Version", "1.2"},
                  {"CIMValidated", "true"},
                  {"MultipleOperationsSupported", "true"},
                  {"FunctionalProfilesSupported", "{2, 3, 4, 5, 6, 8, 9}"},
                  {"AuthenticationMechanismsSupported", "{3}"},
                  {"OperationalStatus", "{2}"},
                  {"EnabledState", "5"},
                  {"RequestedState", "12"},
                  {"EnabledDefault", "2"},
                  {"TransitioningToState", "12"},
              }}));
    EXPECT_TRUE(notes.list().empty());
}

TEST_F(Server_Instances, TheSoftwareThatImplementsTheProfiles)
{
    const char* title = "Kaldera Adapter CIM Provider";
    EXPECT_STREQ("3.2.3.0", prov_build_version);
    EXPECT_EQ(taken(manager->getProfileSoftwareIdentityInstances()),
              (std::vector<Set_Properties>{{
                  {"InstanceID", title},
                  {"Caption", title},
                  {"ElementName", title},
                  {"Description", title},
                  {"Name", "KLDR Adapter CIM provider"},
                  {"Manufacturer", "KLDR"},
                  {"Classifications", "{32775}"},
                  {"VersionString", "3.2.3.0"},
                  {"MajorVersion", "3"},
                  {"MinorVersion", "2"},
                  {"RevisionNumber", "3"},
                  {"IdentityInfoType", "{SoftwareID, SoftwareStatus}"},
                  {"IdentityInfoValue", "{Kaldera Adapter CIM Provider, Primary}"},
                  {"IsLargeBuildNumber", "false"},
                  {"IsEntity", "false"},
              }}));
}

TEST_F(Server_Instances, TheAgentServiceHasANameAndNothingElse)
{
    EXPECT_EQ(taken(manager->getAgentServiceInstances()),
              (std::vector<Set_Properties>{{{"Name", "Kaldera Agent Service Provider"}}}));
}
