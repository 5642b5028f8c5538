#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_ProfileSoftwareIdentity_Skeleton.h"

namespace KPRV {

class KALDERA_ProfileSoftwareIdentity_Provider : public KALDERA_ProfileSoftwareIdentity_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_ProfileSoftwareIdentity*,
                                         Enum_Instances_Handler<KALDERA_ProfileSoftwareIdentity>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_one(server_instances(PROFILESOFTWAREIDENTITY), *handler,
                           SAYING(ERR, "Error: Invalid number of ProfileSoftwareIdentity Instances"),
                           ENUM_INSTANCES_FAILED);
    }
};

PROVIDER_PROC(KALDERA_ProfileSoftwareIdentity)

} // namespace KPRV
