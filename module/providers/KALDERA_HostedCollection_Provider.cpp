#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_System.h"
#include "module/schema/CIM_SystemSpecificCollection.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_HostedCollection_Skeleton.h"
#include "module/schema/KALDERA_LogicalPortGroup.h"

namespace KPRV {

class KALDERA_HostedCollection_Provider : public KALDERA_HostedCollection_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_HostedCollection*,
                                         Enum_Instances_Handler<KALDERA_HostedCollection>* handler)
    {
        LOG_SCOPE("enum_instances");
        const Wanted& wanted = handler->wanted();
        List<KALDERA_ComputerSystem> systems(fc_hba_instances(
            COMPUTERSYSTEM, wanted.end<KALDERA_ComputerSystem>(&KALDERA_HostedCollection::Antecedent)));
        if (systems.size() != 1)
            return SAYING(ERR, "Error: Invalid mapping information").answer(ENUM_INSTANCES_FAILED);
        List<KALDERA_LogicalPortGroup> elements(fc_hba_instances(
            LOGICALPORTGROUP, wanted.end<KALDERA_LogicalPortGroup>(&KALDERA_HostedCollection::Dependent)));
        if (elements.empty())
            return SAYING(WARN, "No Logical Port Groups found!").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_HostedCollection::Antecedent,
                         &KALDERA_HostedCollection::Dependent);
        return join_each(systems, elements, pair);
    }
};

PROVIDER_PROC(KALDERA_HostedCollection)

} // namespace KPRV
