#include "module/managers/FCHBAManager.h"

#include "module/diagnostics/DiagnosticHelper.h"
#include "module/managers/Class_Dispatch.h"
#include "module/model/AccessPointHelper.h"
#include "module/model/AdapterHelper.h"
#include "module/model/CommonHelper.h"
#include "module/model/EthernetPortHelper.h"
#include "module/model/Fresh_Instances.h"
#include "module/model/PhysicalAssetHelper.h"
#include "module/model/PortHelper.h"
#include "module/update/SoftwareUpdateHelper.h"

namespace KPRV {

namespace {

Array<Instance*> by_adapter_helper(classId_t id, const Wanted& wanted)
{
    return AdapterHelper::getAdapterHelperInstance()->getInstancesByClass(id, wanted);
}
Array<Instance*> by_common_helper(classId_t id, const Wanted& wanted)
{
    return CommonHelper::getCommonHelperObject()->getComputerSystemInstances(id, wanted);
}
Array<Instance*> by_port_helper(classId_t id, const Wanted& wanted)
{
    return PortHelper::getPortHelperObject()->getInstancesByClass(id, wanted);
}
Array<Instance*> by_access_point_helper(classId_t id, const Wanted&)
{
    return AccessPointHelper::getAccessPointHelperInstance()->getInstancesByClass(id);
}
Array<Instance*> by_ethernet_port_helper(classId_t id, const Wanted& wanted)
{
    return EthernetPortHelper::getEthernetPortHelperObject()->getInstancesByClass(id, wanted);
}
Array<Instance*> by_diagnostic_helper(classId_t id, const Wanted&)
{
    return DiagnosticHelper::getDiagnosticHelperObject()->getInstancesByClass(id);
}
Array<Instance*> by_physical_asset_helper(classId_t id, const Wanted&)
{
    return PhysicalAssetHelper::getPhysicalAssetHelperObject()->getInstancesByClass(id);
}
Array<Instance*> by_software_update_helper(classId_t id, const Wanted&)
{
    return SoftwareUpdateHelper::getSoftwareUpdateHelperInstance()->getInstancesByClass(id);
}

// clang-format off
constexpr Class_Row rows[] = {
//   class                                       needs            helper
    {COMPUTERSYSTEM,                             Needs::NOTHING,  by_common_helper},
    {PORTCONTROLLER,                             Needs::DRIVER,   by_adapter_helper},
    {FCPORT,                                     Needs::DRIVER,   by_port_helper},
    {SCSIPROTOCOLENDPOINT,                       Needs::DRIVER,   by_port_helper},
    {FCPORTSTATISTICS,                           Needs::DRIVER,   by_port_helper},
    {PHYSICALPACKAGE,                            Needs::DRIVER,   by_adapter_helper},
    {PRODUCT,                                    Needs::DRIVER,   by_adapter_helper},
    {ADAPTERSOFTWAREIDENTITY,                    Needs::DRIVER,   by_adapter_helper},
    {REMOTESERVICEACCESSPOINT,                   Needs::NOTHING,  by_access_point_helper},
    {HBASOFTWAREINSTALLATIONSERVICE,             Needs::DRIVER,   by_software_update_helper},
    {HBASOFTWAREINSTALLATIONSERVICECAPABILITIES, Needs::DRIVER,   by_software_update_helper},
    {ETHERNETPORT,                               Needs::DRIVER,   by_ethernet_port_helper},
    {MEMORYDIAGNOSTICTEST,                       Needs::DRIVER,   by_diagnostic_helper},
    {LOOPBACKDIAGNOSTICTEST,                     Needs::DRIVER,   by_diagnostic_helper},
    {PCILOOPBACKDIAGNOSTICTEST,                  Needs::DRIVER,   by_diagnostic_helper},
    {ETHLOOPBACKDIAGNOSTICTEST,                  Needs::DRIVER,   by_diagnostic_helper},
    {DIAGNOSTICSOFTWAREIDENTITY,                 Needs::DRIVER,   by_diagnostic_helper},
    {CONCRETEJOB,                                Needs::DRIVER,   by_diagnostic_helper},
    {DIAGNOSTICSERVICERECORD,                    Needs::DRIVER,   by_diagnostic_helper},
    {DIAGNOSTICCOMPLETIONRECORD,                 Needs::DRIVER,   by_diagnostic_helper},
    {LOGICALPORTGROUP,                           Needs::DRIVER,   by_port_helper},
    {AFFECTEDJOBELEMENT,                         Needs::DRIVER,   by_diagnostic_helper},
    {SERVICERECORDAPPLIESTOELEMENT,              Needs::DRIVER,   by_diagnostic_helper},
    {COMPLETIONRECORDAPPLIESTOELEMENT,           Needs::DRIVER,   by_diagnostic_helper},
    {LANENDPOINT,                                Needs::DRIVER,   by_ethernet_port_helper},
    {PHYSICALCONNECTOR,                          Needs::DRIVER,   by_physical_asset_helper},
    {ALARMDEVICE,                                Needs::DRIVER,   by_port_helper},
};
// clang-format on

} // namespace

FCHBAManager::FCHBAManager()
{
    LOG(DBG, "Inside FCHBAManager Constructor");
    CommonHelper::getCommonHelperObject();
    AdapterHelper::getAdapterHelperInstance();
    PortHelper::getPortHelperObject();
    AccessPointHelper::getAccessPointHelperInstance();
    SoftwareUpdateHelper::getSoftwareUpdateHelperInstance();
    EthernetPortHelper::getEthernetPortHelperObject();
    DiagnosticHelper::getDiagnosticHelperObject();
    PhysicalAssetHelper::getPhysicalAssetHelperObject();
}

FCHBAManager* FCHBAManager::getFCHBAManager()
{
    static FCHBAManager manager;
    return &manager;
}

Array<Instance*> FCHBAManager::getInstances(classId_t id, const Wanted& wanted) const
{
    LOG_SCOPE("getInstances");
    return dispatch_class(LOG_HERE, rows, id, wanted);
}

Array<Instance*> FCHBAManager::getFCPortInstancesByAdapter(const String& address, const Wanted& wanted) const
{
    LOG_SCOPE("getFCPortInstancesByAdapter");
    return PortHelper::getPortHelperObject()->getFCPortInstancesByAdapter(address, wanted);
}

Array<Instance*> FCHBAManager::getEthernetPortInstancesByAdapter(const String& mac,
                                                                 const Wanted& wanted) const
{
    LOG_SCOPE("getEthernetPortInstancesByAdapter");
    return EthernetPortHelper::getEthernetPortHelperObject()->getEthernetPortInstancesByAdapter(mac, wanted);
}

DiagnosticHelper* FCHBAManager::getDiagnosticHelper() const
{
    return DiagnosticHelper::getDiagnosticHelperObject();
}

int FCHBAManager::setAlarmState(const String& port, int state) const
{
    return PortHelper::getPortHelperObject()->setAlarmState(port, state);
}

Array<Instance*> FCHBAManager::joined(std::initializer_list<classId_t> ids) const
{
    Fresh_Instances instances;
    for (const classId_t id : ids)
        instances.append(getInstances(id));
    return instances.release();
}

Array<Instance*> FCHBAManager::getDiagnosticServicesForAdapter() const
{
    LOG_SCOPE("getDiagnosticServicesForAdapter");
    return getInstances(MEMORYDIAGNOSTICTEST);
}

Array<Instance*> FCHBAManager::getDiagnosticServicesForFCPort() const
{
    LOG_SCOPE("getDiagnosticServicesForFCPort");
    return joined({LOOPBACKDIAGNOSTICTEST, PCILOOPBACKDIAGNOSTICTEST});
}

Array<Instance*> FCHBAManager::getDiagnosticServicesForEthernetPort() const
{
    LOG_SCOPE("getDiagnosticServicesForEthernetPort");
    return joined({ETHLOOPBACKDIAGNOSTICTEST, PCILOOPBACKDIAGNOSTICTEST});
}

Array<Instance*> FCHBAManager::getAllDiagnosticTestInstances() const
{
    LOG_SCOPE("getAllDiagnosticTestInstances");
    return DiagnosticHelper::getDiagnosticHelperObject()->getDiagnosticServices();
}

} // namespace KPRV
