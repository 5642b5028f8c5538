#include "module/managers/HDRManager.h"

#include "module/managers/Class_Dispatch.h"
#include "module/model/PortHelper.h"

namespace KPRV {

namespace {

Array<Instance*> by_port_helper(classId_t id, const Wanted& wanted)
{
    return PortHelper::getPortHelperObject()->getInstancesByClass(id, wanted);
}

// clang-format off
constexpr Class_Row rows[] = {
//   class           needs           helper
    {STORAGEEXTENT,  Needs::DRIVER,  by_port_helper},
    {TAPEDRIVE,      Needs::DRIVER,  by_port_helper},
    {LOGICALDISK,    Needs::DRIVER,  by_port_helper},
};
// clang-format on

} // namespace

HDRManager::HDRManager()
{
    LOG(DBG, "Inside HDRManager Constructor");
    PortHelper::getPortHelperObject();
}

HDRManager* HDRManager::getHDRManager()
{
    static HDRManager manager;
    return &manager;
}

Array<Instance*> HDRManager::getInstances(classId_t id, const Wanted& wanted) const
{
    LOG_SCOPE("getInstances");
    return dispatch_class(LOG_HERE, rows, id, wanted);
}

} // namespace KPRV
