#include "module/managers/ServerManager.h"

#include "module/managers/Class_Dispatch.h"
#include "module/model/Registered_Profiles.h"

namespace KPRV {

namespace {

/// The operation of the manager that gives a class.
template <Array<Instance*> (ServerManager::*OPERATION)() const>
Array<Instance*> by(classId_t, const Wanted&)
{
    return (ServerManager::getServerManager()->*OPERATION)();
}

// clang-format off
constexpr Class_Row rows[] = {
//   class                          needs            source
    {REGISTEREDPROFILE,             Needs::NOTHING,  by<&ServerManager::getRegisteredProfileInstances>},
    {REGISTEREDSUBPROFILE,          Needs::NOTHING,  by<&ServerManager::getRegisteredSubProfileInstances>},
    {NAMESPACE,                     Needs::NOTHING,  by<&ServerManager::getNamespaceInstances>},
    {OBJECTMANAGER,                 Needs::NOTHING,  by<&ServerManager::getObjectManagerInstance>},
    {CIMXMLCOMMUNICATIONMECHANISM,  Needs::NOTHING,  by<&ServerManager::getCIMXMLCommunicationMechanismInstance>},
    {PROFILESOFTWAREIDENTITY,       Needs::NOTHING,  by<&ServerManager::getProfileSoftwareIdentityInstances>},
    {AGENTSERVICE,                  Needs::NOTHING,  by<&ServerManager::getAgentServiceInstances>},
};
// clang-format on

} // namespace

ServerManager* ServerManager::getServerManager()
{
    static ServerManager manager;
    return &manager;
}

Array<Instance*> ServerManager::getInstances(classId_t id) const
{
    LOG_SCOPE("getInstances");
    return dispatch_class(LOG_HERE, rows, id, {});
}

Array<Instance*> ServerManager::getRegisteredProfileInstances() const
{
    LOG_SCOPE("getRegisteredProfileInstances");
    return registered_profiles();
}

Array<Instance*> ServerManager::getRegisteredSubProfileInstances() const
{
    LOG_SCOPE("getRegisteredSubProfileInstances");
    return registered_subprofiles();
}

Array<String> ServerManager::getSubProfilesOfProfile(const String& profile) const
{
    LOG_SCOPE("getSubProfilesOfProfile");
    return subprofiles_of(profile);
}

} // namespace KPRV
