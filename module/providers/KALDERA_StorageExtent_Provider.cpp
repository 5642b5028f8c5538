#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_StorageExtent_Skeleton.h"

namespace KPRV {

class KALDERA_StorageExtent_Provider : public KALDERA_StorageExtent_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_StorageExtent*,
                                         Enum_Instances_Handler<KALDERA_StorageExtent>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(hdr_instances(STORAGEEXTENT, handler->wanted()), *handler,
                           SAYING(ERR, "No StorageExtents Found!"));
    }
};

PROVIDER_PROC(KALDERA_StorageExtent)

} // namespace KPRV
