#include "model/ServerManager.h"

#include "model/Class_Dispatch.h"

namespace KPRV {

namespace {

// clang-format off
constexpr Class_Row rows[] = {
//   class                          needs            source
    {REGISTEREDPROFILE,             Needs::NOTHING,  nullptr},
    {REGISTEREDSUBPROFILE,          Needs::NOTHING,  nullptr},
    {NAMESPACE,                     Needs::NOTHING,  nullptr},
    {OBJECTMANAGER,                 Needs::NOTHING,  nullptr},
    {CIMXMLCOMMUNICATIONMECHANISM,  Needs::NOTHING,  nullptr},
    {PROFILESOFTWAREIDENTITY,       Needs::NOTHING,  nullptr},
    {AGENTSERVICE,                  Needs::NOTHING,  nullptr},
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
    return dispatch_class(LOG_HERE, rows, id);
}

} // namespace KPRV
