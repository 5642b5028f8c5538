#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_Collection.h"
#include "module/schema/CIM_ManagedElement.h"
#include "module/schema/KALDERA_FCPort.h"
#include "module/schema/KALDERA_LogicalPortGroup.h"
#include "module/schema/KALDERA_MemberOfCollection_Skeleton.h"

namespace KPRV {

class KALDERA_MemberOfCollection_Provider : public KALDERA_MemberOfCollection_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_MemberOfCollection*,
                                         Enum_Instances_Handler<KALDERA_MemberOfCollection>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_FCPort> ports(fc_hba_instances(FCPORT));
        if (ports.empty())
            return SAYING(WARN, "No FC Ports Found!").answer(ENUM_INSTANCES_OK);
        List<KALDERA_LogicalPortGroup> groups(fc_hba_instances(LOGICALPORTGROUP));
        if (groups.empty())
            return SAYING(ERR, "Error: Invalid number of instances returned!\n")
                .answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_MemberOfCollection::Collection,
                         &KALDERA_MemberOfCollection::Member);
        return join_equal(
            Matches::FIRST, ports, &KALDERA_FCPort::DeviceID, groups, &KALDERA_LogicalPortGroup::Name,
            [&](const KALDERA_FCPort* port, const KALDERA_LogicalPortGroup* group) { pair(group, port); });
    }
};

PROVIDER_PROC(KALDERA_MemberOfCollection)

} // namespace KPRV
