#include "module/managers/HDRManager.h"

#include "tests/module/managers/Manager_Fixture.h"

using namespace KPRV;

using HDRManager_Classes = Manager_Fixture;

TEST_F(HDRManager_Classes, ServesStorageAlone)
{
    const HDRManager* manager = HDRManager::getHDRManager();
    EXPECT_EQ(HDRManager::getHDRManager(), manager);
    EXPECT_EQ(served(manager), (std::vector<uint32>{9, 16, 38}));
    log.clear();
    EXPECT_TRUE(classes(manager, 2).empty());
    EXPECT_EQ(log.said(), requested(2, NOT_SUPPORTED));
    EXPECT_EQ(log.lines()[0].file, "HDRManager.cpp");
}

TEST_F(HDRManager_Classes, AMissingDriverRefusesAll)
{
    Driver_Status_Override driver(3);
    for (const uint32 id : {9, 16, 38}) {
        log.clear();
        EXPECT_TRUE(classes(HDRManager::getHDRManager(), id).empty());
        EXPECT_EQ(log.said(), requested(id, NO_DRIVER));
    }
}
