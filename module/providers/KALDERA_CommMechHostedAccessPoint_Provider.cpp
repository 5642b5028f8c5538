#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_CIMXMLCommunicationMechanism.h"
#include "module/schema/KALDERA_CommMechHostedAccessPoint_Skeleton.h"
#include "module/schema/KALDERA_ComputerSystem.h"

namespace KPRV {

class KALDERA_CommMechHostedAccessPoint_Provider : public KALDERA_CommMechHostedAccessPoint_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_CommMechHostedAccessPoint*,
                                         Enum_Instances_Handler<KALDERA_CommMechHostedAccessPoint>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_ComputerSystem> systems(fc_hba_instances(COMPUTERSYSTEM));
        if (systems.size() != 1)
            return SAYING(ERR, "Invalid number of ComputerSystem instances").answer(ENUM_INSTANCES_FAILED);
        List<KALDERA_CIMXMLCommunicationMechanism> mechanisms(server_instances(CIMXMLCOMMUNICATIONMECHANISM));
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_CommMechHostedAccessPoint::Antecedent,
                         &KALDERA_CommMechHostedAccessPoint::Dependent);
        return join_each(systems, mechanisms, pair);
    }
};

PROVIDER_PROC(KALDERA_CommMechHostedAccessPoint)

} // namespace KPRV
