#pragma once

#include "module/adapter/classId_t.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Wanted.h"

namespace KPRV {

/// Serves the storage that was discovered behind the ports: extents, tape drives, logical disks.
class HDRManager
{
public:
    /// Made at first use, gone when the module is unloaded.
    static HDRManager* getHDRManager();

    /// As `FCHBAManager::getInstances`.
    Array<Instance*> getInstances(classId_t id, const Wanted& wanted = {}) const;

private:
    HDRManager();
};

} // namespace KPRV
