#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_LogicalPortGroup_Skeleton.h"

namespace KPRV {

class KALDERA_LogicalPortGroup_Provider : public KALDERA_LogicalPortGroup_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_LogicalPortGroup*,
                                         Enum_Instances_Handler<KALDERA_LogicalPortGroup>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(LOGICALPORTGROUP, handler->wanted()), *handler,
                           SAYING(WARN, "No Logical Port Groups found!"));
    }
};

PROVIDER_PROC(KALDERA_LogicalPortGroup)

} // namespace KPRV
