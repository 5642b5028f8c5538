#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_RegisteredSubProfile_Skeleton.h"

namespace KPRV {

class KALDERA_RegisteredSubProfile_Provider : public KALDERA_RegisteredSubProfile_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_RegisteredSubProfile*,
                                         Enum_Instances_Handler<KALDERA_RegisteredSubProfile>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(server_instances(REGISTEREDSUBPROFILE), *handler, SAYING_NOTHING);
    }
};

PROVIDER_PROC(KALDERA_RegisteredSubProfile)

} // namespace KPRV
