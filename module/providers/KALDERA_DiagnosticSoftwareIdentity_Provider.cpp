#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_DiagnosticSoftwareIdentity_Skeleton.h"

namespace KPRV {

class KALDERA_DiagnosticSoftwareIdentity_Provider : public KALDERA_DiagnosticSoftwareIdentity_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_DiagnosticSoftwareIdentity*,
                                         Enum_Instances_Handler<KALDERA_DiagnosticSoftwareIdentity>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(DIAGNOSTICSOFTWAREIDENTITY, handler->wanted()), *handler,
                           SAYING(WARN, "No diagnostic software is installed"));
    }
};

PROVIDER_PROC(KALDERA_DiagnosticSoftwareIdentity)

} // namespace KPRV
