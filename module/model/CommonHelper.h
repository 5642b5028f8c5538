#pragma once

#include "module/adapter/classId_t.h"
#include "module/model/Logged_Life.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Wanted.h"
#include "module/schema/KALDERA_ComputerSystem.h"

namespace KPRV {

/// Publishes the host itself, the scoping system of all else. It needs no adapter and no library.
class CommonHelper
{
public:
    static CommonHelper* getCommonHelperObject();

    /// One instance, always; the caller owns it. `id` gives the class name that it bears (1).
    Array<Instance*> getComputerSystemInstances(classId_t id, const Wanted& wanted = {}) const;

    /// `result` and `host` are what `ProviderUtil::getHostInfo` gave. What is not named is null. Null for a
    /// host that is not wanted.
    KALDERA_ComputerSystem* getComputerSystemInstance(classId_t id, int result, const char* host,
                                                      const Wanted& wanted = {}) const;

private:
    CommonHelper();

    const Logged_Life _life;
};

} // namespace KPRV
