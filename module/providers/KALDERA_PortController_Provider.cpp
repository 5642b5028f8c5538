#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_PortController_Skeleton.h"

namespace KPRV {

class KALDERA_PortController_Provider : public KALDERA_PortController_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_PortController*,
                                         Enum_Instances_Handler<KALDERA_PortController>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(PORTCONTROLLER, handler->wanted()), *handler,
                           SAYING(ERR, "No Adapter Found!"));
    }
};

PROVIDER_PROC(KALDERA_PortController)

} // namespace KPRV
