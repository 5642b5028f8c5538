#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_PhysicalConnector_Skeleton.h"

namespace KPRV {

class KALDERA_PhysicalConnector_Provider : public KALDERA_PhysicalConnector_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_PhysicalConnector*,
                                         Enum_Instances_Handler<KALDERA_PhysicalConnector>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(PHYSICALCONNECTOR, handler->wanted()), *handler,
                           SAYING(ERR, "No Connector Found!"));
    }
};

PROVIDER_PROC(KALDERA_PhysicalConnector)

} // namespace KPRV
