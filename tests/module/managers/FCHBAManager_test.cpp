#include "module/managers/FCHBAManager.h"

#include "tests/module/managers/Manager_Fixture.h"

using namespace KPRV;

namespace {

struct FCHBAManager_Classes : Manager_Fixture
{
    const FCHBAManager* manager = FCHBAManager::getFCHBAManager();

    void one_adapter()
    {
        library.adapters({{"AABB", Json::Value()}});
        library.answers("getHbaByWwn",
                        json("{'hbaData': {'portCount': 1}, 'driver': {'storageDriverName': 'sdrv'}}"));
    }
};

} // namespace

TEST_F(FCHBAManager_Classes, IsOneObject)
{
    EXPECT_EQ(FCHBAManager::getFCHBAManager(), manager);
}

TEST_F(FCHBAManager_Classes, WhichItServes)
{
    EXPECT_EQ(served(manager), (std::vector<uint32>{1,  2,  3,  4,  5,  6,  7,  8,  17, 18, 19, 20, 21, 22,
                                                    23, 24, 25, 26, 27, 28, 30, 31, 32, 33, 34, 35, 36}));
}

TEST_F(FCHBAManager_Classes, AClassThatItDoesNotServe)
{
    for (const uint32 id : {0, 9, 10, 29, 37, 38}) {
        log.clear();
        EXPECT_TRUE(classes(manager, id).empty());
        EXPECT_EQ(log.said(), requested(id, NOT_SUPPORTED));
    }
    log.clear();
    classes(manager, 39);
    EXPECT_EQ(log.said(), (Lines{"INFO Requested classId : 39", "INFO ClassId is greater than MAXCLASSID",
                                 "INFO Requested class is: INVALID CLASS", NOT_SUPPORTED}));
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(FCHBAManager_Classes, AdaptersByTheirHelper)
{
    one_adapter();
    EXPECT_EQ(classes(manager, 2), Lines{"KALDERA_PortController"});
    const Lines said = log.said();
    EXPECT_EQ(Lines(said.begin(), said.begin() + 3),
              (Lines{"INFO Requested classId : 2", "INFO Requested class is: KALDERA_PortController",
                     "INFO Number of Adapters: 1"}));
    EXPECT_EQ(classes(manager, 6), Lines{"KALDERA_PhysicalPackage"});
    EXPECT_EQ(classes(manager, 7), Lines{"KALDERA_Product"});
    EXPECT_EQ(classes(manager, 8), Lines(2, "KALDERA_AdapterSoftwareIdentity"));
    EXPECT_EQ(log.lines()[0].file, "FCHBAManager.cpp");
}

TEST_F(FCHBAManager_Classes, AHostWithoutAdaptersHasNone)
{
    EXPECT_TRUE(classes(manager, 2).empty());
    EXPECT_EQ(log.said(), requested(2, "ERR libGetAllAdaptersIndexString returns NULL."));
}

TEST_F(FCHBAManager_Classes, AMissingDriverRefusesAllButTwo)
{
    one_adapter();
    for (const sint32 status : {2, 3}) {
        Driver_Status_Override driver(status);
        for (const uint32 id : served(manager)) {
            log.clear();
            // The host is there without a driver, too.
            EXPECT_EQ(classes(manager, id).size(), id == 1 ? 1u : 0u) << id;
            EXPECT_EQ(log.has(NO_DRIVER), id != 1 && id != 17) << id;
        }
        log.clear();
        classes(manager, 0);
        EXPECT_EQ(log.said(), requested(0, NOT_SUPPORTED));
    }
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(FCHBAManager_Classes, ADriverWithoutAdaptersRefusesNothing)
{
    one_adapter();
    for (const sint32 status : {0, 1}) {
        Driver_Status_Override driver(status);
        EXPECT_EQ(classes(manager, 2).size(), 1u);
    }
}

TEST_F(FCHBAManager_Classes, IsTraced)
{
    Log_Capture all;
    classes(manager, 0);
    EXPECT_EQ(all.traces(), (Lines{"DBG Entering: getInstances", "DBG Returning: getInstances"}));
}

TEST_F(FCHBAManager_Classes, TestsOfAnElementInOrder)
{
    EXPECT_EQ(manager->getDiagnosticServicesForAdapter().size(), 0u);
    EXPECT_EQ(log.said("INFO Requested classId"), Lines{"INFO Requested classId : 21"});
    log.clear();
    manager->getDiagnosticServicesForFCPort();
    EXPECT_EQ(log.said("INFO Requested classId"),
              (Lines{"INFO Requested classId : 22", "INFO Requested classId : 23"}));
    log.clear();
    manager->getDiagnosticServicesForEthernetPort();
    EXPECT_EQ(log.said("INFO Requested classId"),
              (Lines{"INFO Requested classId : 24", "INFO Requested classId : 23"}));
}

TEST_F(FCHBAManager_Classes, TestsByTheirHelper)
{
    one_adapter();
    // Without a model it would count as any model, also as one that withholds tests.
    library.answers("getHbaByWwn", json("{'hbaData': {'model': '825'}, 'driver': {}}"));
    EXPECT_EQ(classes(manager, 21), Lines{"KALDERA_MemoryDiagnosticTest"});
    EXPECT_EQ(classes(manager, 22), Lines(3, "KALDERA_LoopbackDiagnosticTest"));
    EXPECT_EQ(classes(manager, 23), Lines{"KALDERA_PCILoopbackDiagnosticTest"});
    EXPECT_EQ(classes(manager, 24), Lines(2, "KALDERA_EthLoopbackDiagnosticTest"));
    EXPECT_EQ(classes(manager, 25), Lines{"KALDERA_DiagnosticSoftwareIdentity"});
    for (const uint32 id : {26, 27, 28, 31, 32, 33})
        EXPECT_EQ(classes(manager, id), Lines()) << id;
}
