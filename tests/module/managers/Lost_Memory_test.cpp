// Whoever makes an instance, or a list of them, must have an owner for it at each moment: every class, with
// each block of memory in turn refused.
#include "module/managers/FCHBAManager.h"
#include "module/managers/HDRManager.h"
#include "module/managers/ServerManager.h"
#include "tests/module/managers/Manager_Fixture.h"
#include "tests/support/Live_Blocks.h"
#include "tests/support/Named_Process.h"

using namespace KPRV;

namespace {

/// A host with something of each class.
struct Lost_Memory : Manager_Fixture
{
    Lost_Memory()
    {
        library.answers("getAllAdaptersIndexString", json("{'indexStrings': ['20:00:8c:7c:ff:00:00:00']}"));
        library.answers("getHbaByWwn",
                        json("{'hbaData': {'wwn': '20:00:8c:7c:ff:00:00:00', 'hbaMAC': '8c:7c:ff:00:00:02',"
                             " 'portCount': 1, 'serialNumber': 'S1', 'model': '1020', 'hasEthPort': true},"
                             " 'driver': {'storageDriverName': 'a', 'storageDriverVersion': '3',"
                             "            'networkDriverName': 'b', 'networkDriverVersion': '4'},"
                             " 'firmware': {'version': '1', 'biosVersion': '2'}}"));
        library.answers("getFlashInfo", json("{'flashStatus': true}"));
        library.answers("getFcPhyPortIndicesByAdapter",
                        json("{'indexStrings': ['10:00:8c:7c:ff:00:00:01']}"));
        library.answers(
            "getPortByWwn",
            json("{'wwn': '10:00:8c:7c:ff:00:00:01', 'nodeWwn': '20:00:8c:7c:ff:00:00:01',"
                 " 'PortSymbolicName': 'a port', 'operatingSpeed': 8,"
                 " 'supportedPortSpeeds': [16, 8, 4], 'portTypeMOFValue': 10, 'portStatusValue': 11,"
                 " 'portStatus': true, 'isFCoE': false, 'isMezz': false, 'beaconState': false}"));
        library.answers("getDynamicPortStatistics", json("[{}]"));
        library.answers("getEthPhyPortIndicesByAdapter", json("{'indexStrings': ['8c:7c:ff:00:00:02']}"));
        library.answers("getEthPortByEthMac", json("{'ethData': {'deviceName': 'eth2'}}"));
        library.answers("getOpticsSFP", json("{'transceiver': '10G_BASE-SR', 'vendorName': 'KLDR'}"));
        library.answers("getAllRemotePorts", json("[{'remotePortWwn': '50:06:01:60:00:00:00:0a'},"
                                                  " {'remotePortWwn': '50:06:01:60:00:00:00:0b'}]"));
        library.answers("getCompleteRemotePort", [](const Json::Value& request) {
            const bool is_tape = request["rPortWwn"].asString().back() == 'b';
            return json(std::string("{'deviceData': {'isTarget': true, 'stateMofValue': 11, 'type': '") +
                        (is_tape ? "Tape" : "Disk") +
                        "'}, 'lunList': [{'number': 0, 'vendor': 'ACME', 'productID':"
                        " 'A', 'lunDescIdType': 3, 'lunDescription': 'x'}]}");
        });
    }

    /// How many instances; they go.
    template <class Manager>
    size_t enumerate(const Manager* manager, classId_t id)
    {
        const Array<Instance*> instances = manager->getInstances(id);
        for (Instance* each : instances)
            destroy(each);
        return instances.size();
    }
    void forget()
    {
        log.clear();
        library.calls.clear();
    }

    template <class Manager>
    void expect_nothing_lost(const Manager* manager, classId_t id)
    {
        SCOPED_TRACE(ProviderUtil::getClassName(id));
        EXPECT_LT(0u, enumerate(manager, id));
        EXPECT_EQ("", lost_without_a_block([&] { enumerate(manager, id); }, [&] { forget(); }));
    }
};

} // namespace

TEST_F(Lost_Memory, OfInstancesThatAreBeingMade)
{
    const Named_Process agent("qxmagent");
    for (const classId_t id :
         {COMPUTERSYSTEM, PORTCONTROLLER, FCPORT, SCSIPROTOCOLENDPOINT, FCPORTSTATISTICS, PHYSICALPACKAGE,
          PRODUCT, ADAPTERSOFTWAREIDENTITY, HBASOFTWAREINSTALLATIONSERVICE,
          HBASOFTWAREINSTALLATIONSERVICECAPABILITIES, ETHERNETPORT, MEMORYDIAGNOSTICTEST,
          DIAGNOSTICSOFTWAREIDENTITY, LOGICALPORTGROUP, LANENDPOINT, PHYSICALCONNECTOR, ALARMDEVICE,
          REMOTESERVICEACCESSPOINT})
        expect_nothing_lost(FCHBAManager::getFCHBAManager(), id);
    for (const classId_t id : {STORAGEEXTENT, TAPEDRIVE, LOGICALDISK})
        expect_nothing_lost(HDRManager::getHDRManager(), id);
    for (const classId_t id : {REGISTEREDPROFILE, REGISTEREDSUBPROFILE, NAMESPACE, OBJECTMANAGER,
                               CIMXMLCOMMUNICATIONMECHANISM, PROFILESOFTWAREIDENTITY, AGENTSERVICE})
        expect_nothing_lost(ServerManager::getServerManager(), id);
}
