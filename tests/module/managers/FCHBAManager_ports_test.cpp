#include "module/managers/FCHBAManager.h"

#include "module/adapter/ProviderUtil.h"
#include "tests/module/model/Port_Fixture.h"
#include "tests/support/Driver_Status_Override.h"

using namespace KPRV;

namespace {

struct FCHBAManager_Ports : Port_Fixture
{
    FCHBAManager_Ports()
    {
        library.answers("getHbaByWwn", json("{'hbaData': {'hasEthPort': true}, 'driver': {}}"));
        library.answers("getEthPhyPortIndicesByAdapter", list_of({"AA:01"}));
        library.answers("getEthPortByEthMac", json("{'ethData': {}}"));
        library.answers("getOpticsSFP", json("{}"));
        library.answers("getDynamicPortStatistics", json("[{'id': 1}]"));
        library.answers("getAdapterIdByPort", json("{'adapterId': 1}"));
    }
};

} // namespace

TEST_F(FCHBAManager_Ports, ClassesAndTheirHelpers)
{
    for (const classId_t id : {COMPUTERSYSTEM, FCPORT, SCSIPROTOCOLENDPOINT, FCPORTSTATISTICS, ETHERNETPORT,
                               LOGICALPORTGROUP, LANENDPOINT, PHYSICALCONNECTOR, ALARMDEVICE}) {
        const Array<Instance*> instances = manager->getInstances(id);
        ASSERT_EQ(instances.size(), 1u) << id;
        EXPECT_STREQ(instances[0]->__meta_class->name, ProviderUtil::getClassName(id));
        EXPECT_EQ(instances[0]->__refs, 1);
        destroy(instances[0]);
    }
}

TEST_F(FCHBAManager_Ports, OfOneAdapterWhateverTheDriver)
{
    Driver_Status_Override driver(3);
    EXPECT_EQ(taken(manager->getFCPortInstancesByAdapter("20008c7cff000000"), "DeviceID"),
              Lines{"10008c7cff000001"});
    EXPECT_EQ(taken(manager->getEthernetPortInstancesByAdapter("8c7cff000010"), "DeviceID"), Lines{"AA01"});
    EXPECT_EQ(taken(manager->getInstances(FCPORT)).size(), 0u);
}

TEST_F(FCHBAManager_Ports, SetsAnAlarm)
{
    library.answers("setPortByWwn", json("{}"));
    EXPECT_EQ(manager->setAlarmState("10008c7cff000001", 3), 1);
    EXPECT_EQ(log.traces(), (Lines{"DBG Entering: setAlarmState", "DBG Returning: setAlarmState"}));
}

TEST_F(FCHBAManager_Ports, AllTestsInOrderWithoutALookAtTheDriver)
{
    Driver_Status_Override driver(3);
    library.answers("getAllAdaptersIndexString", list_of({}));
    EXPECT_EQ(taken(manager->getAllDiagnosticTestInstances(), "Name"),
              (Lines{"Kaldera:MemoryTest", "Kaldera:InternalLoopbackTest", "Kaldera:SerdesLoopbackTest",
                     "Kaldera:ExternalLoopbackTest", "Kaldera:SerdesEthLoopbackTest",
                     "Kaldera:ExternalEthLoopbackTest", "Kaldera:PCILoopbackTest"}));
}
