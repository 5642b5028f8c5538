#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_HostedLANEndpoint_Skeleton.h"
#include "module/schema/KALDERA_LANEndpoint.h"

namespace KPRV {

class KALDERA_HostedLANEndpoint_Provider : public KALDERA_HostedLANEndpoint_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_HostedLANEndpoint*,
                                         Enum_Instances_Handler<KALDERA_HostedLANEndpoint>* handler)
    {
        LOG_SCOPE("enum_instances");
        const Wanted& wanted = handler->wanted();
        List<KALDERA_ComputerSystem> systems(fc_hba_instances(
            COMPUTERSYSTEM, wanted.end<KALDERA_ComputerSystem>(&KALDERA_HostedLANEndpoint::Antecedent)));
        if (systems.size() != 1)
            return SAYING(ERR, "Error: Invalid number of ComputerSystem instances")
                .answer(ENUM_INSTANCES_FAILED);
        List<KALDERA_LANEndpoint> elements(fc_hba_instances(
            LANENDPOINT, wanted.end<KALDERA_LANEndpoint>(&KALDERA_HostedLANEndpoint::Dependent)));
        if (elements.empty())
            return SAYING(WARN, "No Ethernet Port Found").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_HostedLANEndpoint::Antecedent,
                         &KALDERA_HostedLANEndpoint::Dependent);
        return join_each(systems, elements, pair);
    }
};

PROVIDER_PROC(KALDERA_HostedLANEndpoint)

} // namespace KPRV
