#pragma once

#include "module/adapter/classId_t.h"
#include "module/model/Logged_Life.h"
#include "module/runtime/Array.h"
#include "module/runtime/Instance.h"
#include "module/schema/KALDERA_ComputerSystem.h"

namespace KPRV {

/// Publishes the host itself, the scoping system of all else. It needs no adapter and no library.
class CommonHelper
{
public:
    static CommonHelper* getCommonHelperObject();

    /// One instance, always; the caller owns it. `id` gives the class name that it bears (1).
    Array<Instance*> getComputerSystemInstances(classId_t id) const;

    /// `result` and `host` are what `ProviderUtil::getHostInfo` gave. What is not named is null.
    KALDERA_ComputerSystem* getComputerSystemInstance(classId_t id, int result, const char* host) const;

private:
    CommonHelper();

    const Logged_Life _life;
};

} // namespace KPRV
