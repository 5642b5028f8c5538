#include "model/FCHBAManager.h"

#include "model/AdapterHelper.h"
#include "model/Class_Dispatch.h"
#include "model/Fresh_Instances.h"

namespace KPRV {

namespace {

Array<Instance*> by_adapter_helper(classId_t id)
{
    return AdapterHelper::getAdapterHelperInstance()->getInstancesByClass(id);
}

// clang-format off
constexpr Class_Row rows[] = {
//   class                                       needs            helper
    {COMPUTERSYSTEM,                             Needs::NOTHING,  nullptr},
    {PORTCONTROLLER,                             Needs::DRIVER,   by_adapter_helper},
    {FCPORT,                                     Needs::DRIVER,   nullptr},
    {SCSIPROTOCOLENDPOINT,                       Needs::DRIVER,   nullptr},
    {FCPORTSTATISTICS,                           Needs::DRIVER,   nullptr},
    {PHYSICALPACKAGE,                            Needs::DRIVER,   by_adapter_helper},
    {PRODUCT,                                    Needs::DRIVER,   by_adapter_helper},
    {ADAPTERSOFTWAREIDENTITY,                    Needs::DRIVER,   by_adapter_helper},
    {REMOTESERVICEACCESSPOINT,                   Needs::NOTHING,  nullptr},
    {HBASOFTWAREINSTALLATIONSERVICE,             Needs::DRIVER,   nullptr},
    {HBASOFTWAREINSTALLATIONSERVICECAPABILITIES, Needs::DRIVER,   nullptr},
    {ETHERNETPORT,                               Needs::DRIVER,   nullptr},
    {MEMORYDIAGNOSTICTEST,                       Needs::DRIVER,   nullptr},
    {LOOPBACKDIAGNOSTICTEST,                     Needs::DRIVER,   nullptr},
    {PCILOOPBACKDIAGNOSTICTEST,                  Needs::DRIVER,   nullptr},
    {ETHLOOPBACKDIAGNOSTICTEST,                  Needs::DRIVER,   nullptr},
    {DIAGNOSTICSOFTWAREIDENTITY,                 Needs::DRIVER,   nullptr},
    {CONCRETEJOB,                                Needs::DRIVER,   nullptr},
    {DIAGNOSTICSERVICERECORD,                    Needs::DRIVER,   nullptr},
    {DIAGNOSTICCOMPLETIONRECORD,                 Needs::DRIVER,   nullptr},
    {LOGICALPORTGROUP,                           Needs::DRIVER,   nullptr},
    {AFFECTEDJOBELEMENT,                         Needs::DRIVER,   nullptr},
    {SERVICERECORDAPPLIESTOELEMENT,              Needs::DRIVER,   nullptr},
    {COMPLETIONRECORDAPPLIESTOELEMENT,           Needs::DRIVER,   nullptr},
    {LANENDPOINT,                                Needs::DRIVER,   nullptr},
    {PHYSICALCONNECTOR,                          Needs::DRIVER,   nullptr},
    {ALARMDEVICE,                                Needs::DRIVER,   nullptr},
};
// clang-format on

} // namespace

FCHBAManager::FCHBAManager()
{
    LOG(DBG, "Inside FCHBAManager Constructor");
    AdapterHelper::getAdapterHelperInstance();
}

FCHBAManager* FCHBAManager::getFCHBAManager()
{
    static FCHBAManager manager;
    return &manager;
}

Array<Instance*> FCHBAManager::getInstances(classId_t id) const
{
    LOG_SCOPE("getInstances");
    return dispatch_class(LOG_HERE, rows, id);
}

Array<Instance*> FCHBAManager::getDiagnosticServicesForAdapter() const
{
    LOG_SCOPE("getDiagnosticServicesForAdapter");
    return getInstances(MEMORYDIAGNOSTICTEST);
}

Array<Instance*> FCHBAManager::getDiagnosticServicesForFCPort() const
{
    LOG_SCOPE("getDiagnosticServicesForFCPort");
    Fresh_Instances tests;
    tests.append(getInstances(LOOPBACKDIAGNOSTICTEST));
    tests.append(getInstances(PCILOOPBACKDIAGNOSTICTEST));
    return tests.release();
}

Array<Instance*> FCHBAManager::getDiagnosticServicesForEthernetPort() const
{
    LOG_SCOPE("getDiagnosticServicesForEthernetPort");
    Fresh_Instances tests;
    tests.append(getInstances(ETHLOOPBACKDIAGNOSTICTEST));
    tests.append(getInstances(PCILOOPBACKDIAGNOSTICTEST));
    return tests.release();
}

} // namespace KPRV
