#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_DiagnosticServiceRecord_Skeleton.h"

namespace KPRV {

class KALDERA_DiagnosticServiceRecord_Provider : public KALDERA_DiagnosticServiceRecord_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_DiagnosticServiceRecord*,
                                         Enum_Instances_Handler<KALDERA_DiagnosticServiceRecord>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(DIAGNOSTICSERVICERECORD, handler->wanted()), *handler,
                           SAYING(INFO, "No diagnostic service records are available."));
    }
};

PROVIDER_PROC(KALDERA_DiagnosticServiceRecord)

} // namespace KPRV
