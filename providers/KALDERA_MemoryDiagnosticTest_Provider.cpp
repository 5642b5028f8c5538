#include "providers/deliver.h"
#include "providers/managers.h"
#include "providers/proc.h"
#include "schema/KALDERA_MemoryDiagnosticTest_Skeleton.h"

namespace KPRV {

class KALDERA_MemoryDiagnosticTest_Provider : public KALDERA_MemoryDiagnosticTest_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_MemoryDiagnosticTest*,
                                         Enum_Instances_Handler<KALDERA_MemoryDiagnosticTest>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(MEMORYDIAGNOSTICTEST), *handler,
                           SAYING(WARN, "No memory diagnostic test is available"));
    }
};

PROVIDER_PROC(KALDERA_MemoryDiagnosticTest)

} // namespace KPRV
