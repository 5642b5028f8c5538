#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_RemoteServiceAccessPoint_Skeleton.h"

namespace KPRV {

class KALDERA_RemoteServiceAccessPoint_Provider : public KALDERA_RemoteServiceAccessPoint_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_RemoteServiceAccessPoint*,
                                         Enum_Instances_Handler<KALDERA_RemoteServiceAccessPoint>* handler)
    {
        LOG_SCOPE("enum_instances");
        // The access point comes and goes with its process, so none is no failure.
        List<KALDERA_RemoteServiceAccessPoint> list(fc_hba_instances(REMOTESERVICEACCESSPOINT));
        if (list.empty())
            return SAYING(WARN, "Warning: No service is available").answer(ENUM_INSTANCES_OK);
        return deliver_one(list, *handler, SAYING(ERR, "Error: Invalid mapping information"),
                           ENUM_INSTANCES_FAILED);
    }
};

PROVIDER_PROC(KALDERA_RemoteServiceAccessPoint)

} // namespace KPRV
