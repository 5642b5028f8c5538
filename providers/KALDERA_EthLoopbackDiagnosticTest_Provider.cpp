#include "providers/deliver.h"
#include "providers/managers.h"
#include "providers/proc.h"
#include "schema/KALDERA_EthLoopbackDiagnosticTest_Skeleton.h"

namespace KPRV {

class KALDERA_EthLoopbackDiagnosticTest_Provider : public KALDERA_EthLoopbackDiagnosticTest_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_EthLoopbackDiagnosticTest*,
                                         Enum_Instances_Handler<KALDERA_EthLoopbackDiagnosticTest>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(ETHLOOPBACKDIAGNOSTICTEST), *handler,
                           SAYING(WARN, "No ethloopback diagnostic test is available"));
    }
};

PROVIDER_PROC(KALDERA_EthLoopbackDiagnosticTest)

} // namespace KPRV
