#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_FCPort_Skeleton.h"

namespace KPRV {

class KALDERA_FCPort_Provider : public KALDERA_FCPort_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_FCPort*,
                                         Enum_Instances_Handler<KALDERA_FCPort>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(FCPORT, handler->wanted()), *handler,
                           SAYING(ERR, "No FC Ports Found!"));
    }
};

PROVIDER_PROC(KALDERA_FCPort)

} // namespace KPRV
