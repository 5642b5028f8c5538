#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_DiagnosticCompletionRecord_Skeleton.h"

namespace KPRV {

class KALDERA_DiagnosticCompletionRecord_Provider : public KALDERA_DiagnosticCompletionRecord_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_DiagnosticCompletionRecord*,
                                         Enum_Instances_Handler<KALDERA_DiagnosticCompletionRecord>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(DIAGNOSTICCOMPLETIONRECORD, handler->wanted()), *handler,
                           SAYING(INFO, "No completion records are available."));
    }
};

PROVIDER_PROC(KALDERA_DiagnosticCompletionRecord)

} // namespace KPRV
