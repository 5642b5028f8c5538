#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_LANEndpoint_Skeleton.h"

namespace KPRV {

class KALDERA_LANEndpoint_Provider : public KALDERA_LANEndpoint_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_LANEndpoint*,
                                         Enum_Instances_Handler<KALDERA_LANEndpoint>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(LANENDPOINT, handler->wanted()), *handler,
                           SAYING(WARN, "No Ethernet Port Found"));
    }
};

PROVIDER_PROC(KALDERA_LANEndpoint)

} // namespace KPRV
