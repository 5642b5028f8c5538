#include "model/HDRManager.h"

#include "model/Class_Dispatch.h"

namespace KPRV {

namespace {

// clang-format off
constexpr Class_Row rows[] = {
//   class           needs           helper
    {STORAGEEXTENT,  Needs::DRIVER,  nullptr},
    {TAPEDRIVE,      Needs::DRIVER,  nullptr},
    {LOGICALDISK,    Needs::DRIVER,  nullptr},
};
// clang-format on

} // namespace

HDRManager::HDRManager()
{
    LOG(DBG, "Inside HDRManager Constructor");
}

HDRManager* HDRManager::getHDRManager()
{
    static HDRManager manager;
    return &manager;
}

Array<Instance*> HDRManager::getInstances(classId_t id) const
{
    LOG_SCOPE("getInstances");
    return dispatch_class(LOG_HERE, rows, id);
}

} // namespace KPRV
