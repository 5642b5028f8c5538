#pragma once

#include "module/adapter/classId_t.h"
#include "module/model/Adapter_Data.h"
#include "module/model/Logged_Life.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/objects/Instance.h"
#include "module/schema/KALDERA_RemoteServiceAccessPoint.h"

namespace KPRV {

/// Publishes where the management application is reached, while its process runs. Nothing is kept: the access
/// point comes and goes with the process, at the next request.
class AccessPointHelper
{
public:
    static AccessPointHelper* getAccessPointHelperInstance();

    /// The access point, which the caller owns, or nothing while the agent does not run or the host has no
    /// name to be reached by. There is one class here, so the id is not looked at.
    Array<Instance*> getInstancesByClass(classId_t id) const;

    /// At the host `systemName` of the record; null while the agent does not run. What it does not set has
    /// the default of the schema.
    KALDERA_RemoteServiceAccessPoint* getRemoteServiceAccessPointInstance(const _adapterData& adapter) const;

private:
    AccessPointHelper();

    const Logged_Life _life;
};

} // namespace KPRV
