#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_AffectedJobElement_Skeleton.h"

namespace KPRV {

class KALDERA_AffectedJobElement_Provider : public KALDERA_AffectedJobElement_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_AffectedJobElement*,
                                         Enum_Instances_Handler<KALDERA_AffectedJobElement>* handler)
    {
        LOG_SCOPE("enum_instances");
        // The list arrives already paired.
        return deliver_all(fc_hba_instances(AFFECTEDJOBELEMENT, handler->wanted()), *handler,
                           SAYING(INFO, "Any affectedJobElement association could not be formed."));
    }
};

PROVIDER_PROC(KALDERA_AffectedJobElement)

} // namespace KPRV
