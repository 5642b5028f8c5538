#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_LogicalDisk_Skeleton.h"

namespace KPRV {

class KALDERA_LogicalDisk_Provider : public KALDERA_LogicalDisk_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_LogicalDisk*,
                                         Enum_Instances_Handler<KALDERA_LogicalDisk>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(hdr_instances(LOGICALDISK, handler->wanted()), *handler,
                           SAYING(ERR, "No LogicalDisks Found!"));
    }
};

PROVIDER_PROC(KALDERA_LogicalDisk)

} // namespace KPRV
