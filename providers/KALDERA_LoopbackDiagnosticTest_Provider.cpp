#include "providers/deliver.h"
#include "providers/managers.h"
#include "providers/proc.h"
#include "schema/KALDERA_LoopbackDiagnosticTest_Skeleton.h"

namespace KPRV {

class KALDERA_LoopbackDiagnosticTest_Provider : public KALDERA_LoopbackDiagnosticTest_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_LoopbackDiagnosticTest*,
                                         Enum_Instances_Handler<KALDERA_LoopbackDiagnosticTest>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(LOOPBACKDIAGNOSTICTEST), *handler,
                           SAYING(WARN, "No loopback diagnostic test is available"));
    }
};

PROVIDER_PROC(KALDERA_LoopbackDiagnosticTest)

} // namespace KPRV
