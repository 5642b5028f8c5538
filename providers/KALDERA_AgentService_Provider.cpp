#include "providers/deliver.h"
#include "providers/managers.h"
#include "providers/proc.h"
#include "schema/KALDERA_AgentService_Skeleton.h"

namespace KPRV {

class KALDERA_AgentService_Provider : public KALDERA_AgentService_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_AgentService*,
                                         Enum_Instances_Handler<KALDERA_AgentService>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(server_instances(AGENTSERVICE), *handler, SAYING(ERR, "No AgentService Found!"));
    }
};

PROVIDER_PROC(KALDERA_AgentService)

} // namespace KPRV
