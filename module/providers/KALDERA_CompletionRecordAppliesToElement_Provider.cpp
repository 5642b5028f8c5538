#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_CompletionRecordAppliesToElement_Skeleton.h"

namespace KPRV {

class KALDERA_CompletionRecordAppliesToElement_Provider
    : public KALDERA_CompletionRecordAppliesToElement_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_CompletionRecordAppliesToElement*,
                   Enum_Instances_Handler<KALDERA_CompletionRecordAppliesToElement>* handler)
    {
        LOG_SCOPE("enum_instances");
        // The list arrives already paired.
        return deliver_all(fc_hba_instances(COMPLETIONRECORDAPPLIESTOELEMENT, handler->wanted()), *handler,
                           SAYING(INFO, "No completion records or managed elements are present."));
    }
};

PROVIDER_PROC(KALDERA_CompletionRecordAppliesToElement)

} // namespace KPRV
