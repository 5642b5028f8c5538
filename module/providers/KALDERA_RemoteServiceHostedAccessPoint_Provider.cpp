#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_RemoteServiceAccessPoint.h"
#include "module/schema/KALDERA_RemoteServiceHostedAccessPoint_Skeleton.h"

namespace KPRV {

class KALDERA_RemoteServiceHostedAccessPoint_Provider : public KALDERA_RemoteServiceHostedAccessPoint_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_RemoteServiceHostedAccessPoint*,
                   Enum_Instances_Handler<KALDERA_RemoteServiceHostedAccessPoint>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_RemoteServiceAccessPoint> points(fc_hba_instances(REMOTESERVICEACCESSPOINT));
        if (points.empty())
            return SAYING(WARN, "Warning: No service is available").answer(ENUM_INSTANCES_OK);
        List<KALDERA_ComputerSystem> systems(fc_hba_instances(COMPUTERSYSTEM));
        if (points.size() != 1 || systems.size() != 1)
            return SAYING(ERR, "Error: Invalid mapping information").answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_RemoteServiceHostedAccessPoint::Antecedent,
                         &KALDERA_RemoteServiceHostedAccessPoint::Dependent);
        return join_each(systems, points, pair);
    }
};

PROVIDER_PROC(KALDERA_RemoteServiceHostedAccessPoint)

} // namespace KPRV
