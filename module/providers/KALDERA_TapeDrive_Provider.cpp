#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_TapeDrive_Skeleton.h"

namespace KPRV {

class KALDERA_TapeDrive_Provider : public KALDERA_TapeDrive_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_TapeDrive*,
                                         Enum_Instances_Handler<KALDERA_TapeDrive>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(hdr_instances(TAPEDRIVE, handler->wanted()), *handler,
                           SAYING(ERR, "No TapeDrives Found!"));
    }
};

PROVIDER_PROC(KALDERA_TapeDrive)

} // namespace KPRV
