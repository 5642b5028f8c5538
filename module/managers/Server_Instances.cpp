// Of `ServerManager`, what describes the server: its object manager, namespaces, protocol, our software,
// the agent's service.
#include "module/managers/ServerManager.h"
#include "module/model/Fresh_Instances.h"
#include "module/model/Instance_Building.h"
#include "module/runtime/dispatch/cimom.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"
#include "module/schema/CIM_ObjectManager.h"
#include "module/schema/KALDERA_AgentService.h"
#include "module/schema/KALDERA_CIMXMLCommunicationMechanism.h"
#include "module/schema/KALDERA_Namespace.h"
#include "module/schema/KALDERA_ObjectManager.h"
#include "module/schema/KALDERA_ProfileSoftwareIdentity.h"

#include <cstdio>

namespace KPRV {

const char* const prov_build_version = "3.2.3.0";

namespace {

constexpr uint16 OPERATIONAL_STATUS_OK = 2;

String host_text()
{
    char host[255] = {};
    ProviderUtil::getHostInfo(host, sizeof host);
    return host;
}

/// The object manager of the hosting server, for the three properties in which ours takes after it: "CIM
/// Server" if the server refuses to tell, null if it has none.
Ref<CIM_ObjectManager> object_manager_of_server()
{
    const Ref<CIM_ObjectManager> model(create<CIM_ObjectManager>(true));
    Ref<CIM_ObjectManager> found(create<CIM_ObjectManager>(true));
    Instance_Enumerator enumerator;
    if (cimom::enum_instances("root/PG_InterOp", model.ptr(), enumerator) != 0) {
        const String name = "CIM Server";
        found->Name.set(name);
        found->ElementName.set(name);
        found->Description.set(name);
        return found;
    }
    const Ref<Instance> first = enumerator();
    if (const CIM_ObjectManager* manager = cast<CIM_ObjectManager>(first.ptr())) {
        found->Name = manager->Name;
        found->ElementName = manager->ElementName;
        found->Description = manager->Description;
    }
    return found;
}

} // namespace

Array<Instance*> ServerManager::getObjectManagerInstance() const
{
    LOG_SCOPE("getObjectManagerInstance");
    const Ref<CIM_ObjectManager> of_server = object_manager_of_server();
    Ref<KALDERA_ObjectManager> manager(create<KALDERA_ObjectManager>(true));
    set_system_keys(*manager, OBJECTMANAGER, host_text().c_str());
    manager->Name = of_server->Name;
    // What the server shows of its own stands in the caption; the element's name is ours.
    manager->Caption = of_server->ElementName;
    manager->Description = of_server->Description;
    manager->ElementName.set("CIM Server");
    manager->OperationalStatus.set(array_of<uint16>({OPERATIONAL_STATUS_OK}));
    manager->Started.set(true);
    return only(manager.steal());
}

Array<Instance*> ServerManager::getNamespaceInstances() const
{
    LOG_SCOPE("getNamespaceInstances");
    const Ref<CIM_ObjectManager> of_server = object_manager_of_server();
    Ref<KALDERA_Namespace> name_space(create<KALDERA_Namespace>(true));
    set_system_keys(*name_space, NAMESPACE, host_text().c_str());
    name_space->ObjectManagerCreationClassName.set(ProviderUtil::getClassName(OBJECTMANAGER));
    name_space->ObjectManagerName = of_server->Name;
    name_space->Name.set("root/kaldera");
    name_space->ClassType.set(2);
    name_space->ClassInfo.set(11);
    name_space->ClassTypeVersion.set("2.26.0");
    return only(name_space.steal());
}

Array<Instance*> ServerManager::getCIMXMLCommunicationMechanismInstance() const
{
    LOG_SCOPE("getCIMXMLCommunicationMechanismInstance");
    Ref<KALDERA_CIMXMLCommunicationMechanism> mechanism(create<KALDERA_CIMXMLCommunicationMechanism>(true));
    set_system_keys(*mechanism, CIMXMLCOMMUNICATIONMECHANISM, host_text().c_str());
    mechanism->Name.set("CIM-XML");
    mechanism->ElementName.set("CIM-XML Communication Mechanism");
    mechanism->CommunicationMechanism.set(2);
    mechanism->Version.set("1.2");
    mechanism->CIMValidated.set(true);
    mechanism->MultipleOperationsSupported.set(true);
    mechanism->FunctionalProfilesSupported.set(array_of<uint16>({2, 3, 4, 5, 6, 8, 9}));
    mechanism->AuthenticationMechanismsSupported.set(array_of<uint16>({3}));
    mechanism->OperationalStatus.set(array_of<uint16>({OPERATIONAL_STATUS_OK}));
    return only(mechanism.steal());
}

Array<Instance*> ServerManager::getProfileSoftwareIdentityInstances() const
{
    LOG_SCOPE("getProfileSoftwareIdentityInstances");
    const String title = "Kaldera Adapter CIM Provider";
    int major = 0, minor = 0, revision = 0;
    sscanf(prov_build_version, "%d.%d.%d", &major, &minor, &revision);
    Ref<KALDERA_ProfileSoftwareIdentity> software(create<KALDERA_ProfileSoftwareIdentity>(true));
    software->InstanceID.set(title);
    software->Caption.set(title);
    software->ElementName.set(title);
    software->Description.set(title);
    software->Name.set("KLDR Adapter CIM provider");
    software->Manufacturer.set("KLDR");
    software->Classifications.set(array_of<uint16>({32775}));
    software->VersionString.set(prov_build_version);
    software->MajorVersion.set(static_cast<uint16>(major));
    software->MinorVersion.set(static_cast<uint16>(minor));
    software->RevisionNumber.set(static_cast<uint16>(revision));
    software->IdentityInfoType.set(array_of<String>({"SoftwareID", "SoftwareStatus"}));
    software->IdentityInfoValue.set(array_of<String>({title, "Primary"}));
    return only(software.steal());
}

Array<Instance*> ServerManager::getAgentServiceInstances() const
{
    LOG_SCOPE("getAgentServiceInstances");
    Ref<KALDERA_AgentService> service(create<KALDERA_AgentService>(true));
    service->Name.set("Kaldera Agent Service Provider");
    return only(service.steal());
}

} // namespace KPRV
