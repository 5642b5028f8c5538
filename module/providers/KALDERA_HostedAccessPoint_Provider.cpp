#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_ServiceAccessPoint.h"
#include "module/schema/CIM_System.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_HostedAccessPoint_Skeleton.h"
#include "module/schema/KALDERA_SCSIProtocolEndpoint.h"

namespace KPRV {

class KALDERA_HostedAccessPoint_Provider : public KALDERA_HostedAccessPoint_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_HostedAccessPoint*,
                                         Enum_Instances_Handler<KALDERA_HostedAccessPoint>* handler)
    {
        LOG_SCOPE("enum_instances");
        const Wanted& wanted = handler->wanted();
        List<KALDERA_ComputerSystem> systems(fc_hba_instances(
            COMPUTERSYSTEM, wanted.end<KALDERA_ComputerSystem>(&KALDERA_HostedAccessPoint::Antecedent)));
        if (systems.size() != 1)
            return SAYING(ERR, "Error: Invalid mapping information").answer(ENUM_INSTANCES_FAILED);
        List<KALDERA_SCSIProtocolEndpoint> elements(fc_hba_instances(
            SCSIPROTOCOLENDPOINT,
            wanted.end<KALDERA_SCSIProtocolEndpoint>(&KALDERA_HostedAccessPoint::Dependent)));
        if (elements.empty())
            return SAYING(WARN, "Invalid number of SCSIProtocolEndPoint instances returned.")
                .answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_HostedAccessPoint::Antecedent,
                         &KALDERA_HostedAccessPoint::Dependent);
        return join_each(systems, elements, pair);
    }
};

PROVIDER_PROC(KALDERA_HostedAccessPoint)

} // namespace KPRV
