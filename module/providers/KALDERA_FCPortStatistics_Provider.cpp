#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_FCPortStatistics_Skeleton.h"

namespace KPRV {

class KALDERA_FCPortStatistics_Provider : public KALDERA_FCPortStatistics_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_FCPortStatistics*,
                                         Enum_Instances_Handler<KALDERA_FCPortStatistics>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(FCPORTSTATISTICS, handler->wanted()), *handler,
                           SAYING(ERR, "No FC Ports Found!"));
    }
};

PROVIDER_PROC(KALDERA_FCPortStatistics)

} // namespace KPRV
