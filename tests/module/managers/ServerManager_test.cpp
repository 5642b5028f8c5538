#include "module/managers/ServerManager.h"

#include "tests/module/managers/Manager_Fixture.h"

using namespace KPRV;

namespace {

struct ServerManager_Classes : Manager_Fixture
{
    const ServerManager* manager = ServerManager::getServerManager();

    /// What the manager logs at DBG for a class, its own lines alone.
    Lines traces_of(uint32 id)
    {
        Log_Capture all;
        classes(manager, id);
        Lines lines;
        for (const std::string& line : all.traces()) {
            if (line.find("getHostInfo") == line.npos)
                lines.push_back(line);
        }
        return lines;
    }
};

} // namespace

TEST_F(ServerManager_Classes, ServesTheServerSideAlone)
{
    EXPECT_EQ(ServerManager::getServerManager(), manager);
    EXPECT_EQ(served(manager), (std::vector<uint32>{10, 11, 12, 13, 14, 15, 37}));
    log.clear();
    EXPECT_TRUE(classes(manager, 1).empty());
    EXPECT_EQ(log.said(), requested(1, NOT_SUPPORTED));
    EXPECT_EQ(log.lines()[0].file, "ServerManager.cpp");
}

TEST_F(ServerManager_Classes, NeedsNeitherDriverNorAdapters)
{
    Driver_Status_Override driver(2);
    const std::vector<std::pair<uint32, Lines>> expected = {
        {10, Lines(5, "KALDERA_RegisteredProfile")},
        {11, Lines(10, "KALDERA_RegisteredSubProfile")},
        {12, {"KALDERA_Namespace"}},
        {13, {"KALDERA_ObjectManager"}},
        {14, {"KALDERA_CIMXMLCommunicationMechanism"}},
        {15, {"KALDERA_ProfileSoftwareIdentity"}},
        {37, {"KALDERA_AgentService"}},
    };
    for (const auto& [id, names] : expected) {
        log.clear();
        EXPECT_EQ(classes(manager, id), names) << id;
        EXPECT_EQ(log.said(), requested(id)) << id;
    }
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(ServerManager_Classes, IsTraced)
{
    const std::vector<std::pair<uint32, const char*>> operations = {
        {10, "getRegisteredProfileInstances"},
        {11, "getRegisteredSubProfileInstances"},
        {12, "getNamespaceInstances"},
        {13, "getObjectManagerInstance"},
        {14, "getCIMXMLCommunicationMechanismInstance"},
        {15, "getProfileSoftwareIdentityInstances"},
        {37, "getAgentServiceInstances"},
    };
    for (const auto& [id, name] : operations)
        EXPECT_EQ(traces_of(id),
                  (Lines{"DBG Entering: getInstances", std::string("DBG Entering: ") + name,
                         std::string("DBG Returning: ") + name, "DBG Returning: getInstances"}));
}

TEST_F(ServerManager_Classes, SubprofilesByTheShortNameOfAProfile)
{
    EXPECT_EQ(manager->getSubProfilesOfProfile("fc hba").size(), 8u);
    EXPECT_EQ(manager->getSubProfilesOfProfile("SMI-S").size(), 0u);
}
