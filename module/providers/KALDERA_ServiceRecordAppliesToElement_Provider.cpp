#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_ServiceRecordAppliesToElement_Skeleton.h"

namespace KPRV {

class KALDERA_ServiceRecordAppliesToElement_Provider : public KALDERA_ServiceRecordAppliesToElement_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_ServiceRecordAppliesToElement*,
                   Enum_Instances_Handler<KALDERA_ServiceRecordAppliesToElement>* handler)
    {
        LOG_SCOPE("enum_instances");
        // The list arrives already paired.
        return deliver_all(fc_hba_instances(SERVICERECORDAPPLIESTOELEMENT, handler->wanted()), *handler,
                           SAYING(INFO, "No service records or managed elements are present."));
    }
};

PROVIDER_PROC(KALDERA_ServiceRecordAppliesToElement)

} // namespace KPRV
