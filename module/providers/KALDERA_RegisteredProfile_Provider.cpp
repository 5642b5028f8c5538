#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_RegisteredProfile_Skeleton.h"

namespace KPRV {

class KALDERA_RegisteredProfile_Provider : public KALDERA_RegisteredProfile_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_RegisteredProfile*,
                                         Enum_Instances_Handler<KALDERA_RegisteredProfile>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(server_instances(REGISTEREDPROFILE), *handler, SAYING_NOTHING);
    }
};

PROVIDER_PROC(KALDERA_RegisteredProfile)

} // namespace KPRV
