#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_AdapterSoftwareIdentity_Skeleton.h"

namespace KPRV {

class KALDERA_AdapterSoftwareIdentity_Provider : public KALDERA_AdapterSoftwareIdentity_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_AdapterSoftwareIdentity*,
                                         Enum_Instances_Handler<KALDERA_AdapterSoftwareIdentity>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(ADAPTERSOFTWAREIDENTITY, handler->wanted()), *handler,
                           SAYING(ERR, "No Adapter Found!"));
    }
};

PROVIDER_PROC(KALDERA_AdapterSoftwareIdentity)

} // namespace KPRV
