#include "providers/deliver.h"
#include "providers/managers.h"
#include "providers/proc.h"
#include "schema/KALDERA_PCILoopbackDiagnosticTest_Skeleton.h"

namespace KPRV {

class KALDERA_PCILoopbackDiagnosticTest_Provider : public KALDERA_PCILoopbackDiagnosticTest_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_PCILoopbackDiagnosticTest*,
                                         Enum_Instances_Handler<KALDERA_PCILoopbackDiagnosticTest>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(PCILOOPBACKDIAGNOSTICTEST), *handler,
                           SAYING(WARN, "No PCI loopback diagnostic test is available"));
    }
};

PROVIDER_PROC(KALDERA_PCILoopbackDiagnosticTest)

} // namespace KPRV
