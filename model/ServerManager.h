#pragma once

#include "adapter/classId_t.h"
#include "runtime/Array.h"
#include "runtime/Instance.h"

namespace KPRV {

/// Describes the server side of the module: its profiles, the object manager, the namespace and the services.
/// Nothing here depends on adapters or the driver.
class ServerManager
{
public:
    /// Made at first use, gone when the module is unloaded.
    static ServerManager* getServerManager();

    /// As `FCHBAManager::getInstances`.
    Array<Instance*> getInstances(classId_t id) const;

private:
    ServerManager() = default;
};

} // namespace KPRV
