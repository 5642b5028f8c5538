#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_PhysicalPackage_Skeleton.h"

namespace KPRV {

class KALDERA_PhysicalPackage_Provider : public KALDERA_PhysicalPackage_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_PhysicalPackage*,
                                         Enum_Instances_Handler<KALDERA_PhysicalPackage>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(PHYSICALPACKAGE, handler->wanted()), *handler,
                           SAYING(ERR, "No Adapter Found!"));
    }
};

PROVIDER_PROC(KALDERA_PhysicalPackage)

} // namespace KPRV
