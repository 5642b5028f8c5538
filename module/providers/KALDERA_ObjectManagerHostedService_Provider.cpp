#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_ObjectManager.h"
#include "module/schema/KALDERA_ObjectManagerHostedService_Skeleton.h"

namespace KPRV {

class KALDERA_ObjectManagerHostedService_Provider : public KALDERA_ObjectManagerHostedService_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_ObjectManagerHostedService*,
                                         Enum_Instances_Handler<KALDERA_ObjectManagerHostedService>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_ObjectManager> managers(server_instances(OBJECTMANAGER));
        List<KALDERA_ComputerSystem> systems(fc_hba_instances(COMPUTERSYSTEM));
        if (managers.size() != 1 || systems.size() != 1)
            return SAYING(ERR, "Invalid number of reference class instances").answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_ObjectManagerHostedService::Antecedent,
                         &KALDERA_ObjectManagerHostedService::Dependent);
        return join_each(systems, managers, pair);
    }
};

PROVIDER_PROC(KALDERA_ObjectManagerHostedService)

} // namespace KPRV
