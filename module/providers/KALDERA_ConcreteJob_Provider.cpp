#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_ConcreteJob_Skeleton.h"

namespace KPRV {

class KALDERA_ConcreteJob_Provider : public KALDERA_ConcreteJob_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_ConcreteJob*,
                                         Enum_Instances_Handler<KALDERA_ConcreteJob>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(CONCRETEJOB, handler->wanted()), *handler,
                           SAYING(INFO, "No jobs are currently running in the system."));
    }
};

PROVIDER_PROC(KALDERA_ConcreteJob)

} // namespace KPRV
