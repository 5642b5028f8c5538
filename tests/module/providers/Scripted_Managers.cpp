#include "tests/module/providers/Scripted_Managers.h"

#include "module/adapter/ProviderUtil.h"
#include "module/managers/FCHBAManager.h"
#include "module/managers/HDRManager.h"
#include "module/managers/ServerManager.h"
#include "module/model/EthernetPortHelper.h"
#include "module/model/Fresh_Instances.h"
#include "module/model/Registered_Profiles.h"

#include <stdexcept>

// Defines the managers anew: the linker then has no need of those in the archive.

namespace KPRV {

void Managers_Script::clear()
{
    for (auto& [name, list] : lists) {
        for (const Instance* instance : list)
            unref(instance);
    }
    lists.clear();
    fetched.clear();
}

namespace {

Array<Instance*> fetch(const std::string& name)
{
    managers_script.fetched.push_back(name);
    Fresh_Instances result;
    for (const Instance* instance : managers_script.lists[name])
        result.append(clone(instance));
    return result.release();
}

Array<Instance*> fetch(classId_t id)
{
    return fetch(ProviderUtil::getClassName(id) + sizeof "KALDERA_" - 1);
}

/// Storage is asked for at its own manager, and nowhere else.
bool is_storage(classId_t id)
{
    return id == STORAGEEXTENT || id == TAPEDRIVE || id == LOGICALDISK;
}

/// The server's side likewise.
bool is_of_server(classId_t id)
{
    return (id >= REGISTEREDPROFILE && id <= PROFILESOFTWAREIDENTITY) || id == AGENTSERVICE;
}

} // namespace

FCHBAManager::FCHBAManager() = default;
FCHBAManager* FCHBAManager::getFCHBAManager()
{
    static FCHBAManager manager;
    return &manager;
}
Array<Instance*> FCHBAManager::getInstances(classId_t id, const Wanted&) const
{
    if (is_storage(id) || is_of_server(id))
        throw std::logic_error("not a class of this manager");
    return fetch(id);
}
Array<Instance*> FCHBAManager::getFCPortInstancesByAdapter(const String& address, const Wanted&) const
{
    return fetch(std::string("FC ports of ") + address.c_str());
}
Array<Instance*> FCHBAManager::getEthernetPortInstancesByAdapter(const String& address, const Wanted&) const
{
    return fetch(std::string("Ethernet ports of ") + address.c_str());
}
Array<Instance*> FCHBAManager::getDiagnosticServicesForAdapter() const
{
    return fetch("tests for adapters");
}
Array<Instance*> FCHBAManager::getDiagnosticServicesForFCPort() const
{
    return fetch("tests for FC ports");
}
Array<Instance*> FCHBAManager::getDiagnosticServicesForEthernetPort() const
{
    return fetch("tests for Ethernet ports");
}
Array<Instance*> FCHBAManager::getAllDiagnosticTestInstances() const
{
    return fetch("all tests");
}
DiagnosticHelper* FCHBAManager::getDiagnosticHelper() const
{
    throw std::logic_error("no association runs a test");
}
int FCHBAManager::setAlarmState(const String&, int) const
{
    throw std::logic_error("no association sets an alarm");
}

HDRManager::HDRManager() = default;
HDRManager* HDRManager::getHDRManager()
{
    static HDRManager manager;
    return &manager;
}
Array<Instance*> HDRManager::getInstances(classId_t id, const Wanted&) const
{
    if (!is_storage(id))
        throw std::logic_error("not a class of this manager");
    return fetch(id);
}

ServerManager* ServerManager::getServerManager()
{
    static ServerManager manager;
    return &manager;
}
Array<Instance*> ServerManager::getInstances(classId_t id) const
{
    if (!is_of_server(id))
        throw std::logic_error("not a class of this manager");
    return fetch(id);
}
Array<String> ServerManager::getSubProfilesOfProfile(const String& profile) const
{
    managers_script.fetched.push_back(std::string("subprofiles of ") + profile.c_str());
    return subprofiles_of(profile);
}

EthernetPortHelper::EthernetPortHelper() : _life("EthernetPortHelper", LOG_HERE) {}
EthernetPortHelper* EthernetPortHelper::getEthernetPortHelperObject()
{
    static EthernetPortHelper helper;
    return &helper;
}
Array<Instance*> EthernetPortHelper::getInstancesByClass(classId_t, const Wanted&) const
{
    throw std::logic_error("no association asks for the element of a run");
}
Array<Instance*> EthernetPortHelper::getInstancesByAdapterId(int adapter_id, classId_t id,
                                                             const Wanted&) const
{
    if (id != ETHERNETPORT)
        throw std::logic_error("only Ethernet ports are asked for");
    return fetch("Ethernet ports of adapter " + std::to_string(adapter_id));
}

} // namespace KPRV
