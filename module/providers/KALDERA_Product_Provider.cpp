#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_Product_Skeleton.h"

namespace KPRV {

class KALDERA_Product_Provider : public KALDERA_Product_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_Product*,
                                         Enum_Instances_Handler<KALDERA_Product>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(PRODUCT, handler->wanted()), *handler,
                           SAYING(ERR, "No Adapter Found!"));
    }
};

PROVIDER_PROC(KALDERA_Product)

} // namespace KPRV
