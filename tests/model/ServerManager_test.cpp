#include "model/ServerManager.h"

#include "tests/model/Manager_Fixture.h"

using namespace KPRV;

using ServerManager_Classes = Manager_Fixture;

TEST_F(ServerManager_Classes, serves_the_server_side_alone)
{
    const ServerManager* manager = ServerManager::getServerManager();
    EXPECT_EQ(ServerManager::getServerManager(), manager);
    EXPECT_EQ(served(manager), (std::vector<uint32>{10, 11, 12, 13, 14, 15, 37}));
    log.clear();
    EXPECT_TRUE(classes(manager, 1).empty());
    EXPECT_EQ(log.said(), requested(1, NOT_SUPPORTED));
    EXPECT_EQ(log.lines()[0].file, "ServerManager.cpp");
}

TEST_F(ServerManager_Classes, needs_no_driver)
{
    Driver_Status_Override driver(2);
    classes(ServerManager::getServerManager(), 12);
    EXPECT_EQ(log.said("ERR"), Lines{});
}
