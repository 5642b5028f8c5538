#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_ComputerSystem_Skeleton.h"

namespace KPRV {

class KALDERA_ComputerSystem_Provider : public KALDERA_ComputerSystem_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_ComputerSystem*,
                                         Enum_Instances_Handler<KALDERA_ComputerSystem>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_one(fc_hba_instances(COMPUTERSYSTEM, handler->wanted()), *handler,
                           SAYING(ERR, "Error: Invalid mapping information"), ENUM_INSTANCES_FAILED);
    }
};

PROVIDER_PROC(KALDERA_ComputerSystem)

} // namespace KPRV
