#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/providers/run_diagnostic.h"
#include "module/schema/KALDERA_EthLoopbackDiagnosticTest_Skeleton.h"
#include "module/schema/KALDERA_EthLoopbackDiagnosticTest_methods.h"
#include "module/schema/KALDERA_EthernetPort.h"

namespace KPRV {

class KALDERA_EthLoopbackDiagnosticTest_Provider
    : public Test_Skeleton<KALDERA_EthLoopbackDiagnosticTest_Skeleton,
                           KALDERA_EthLoopbackDiagnosticTest_RunDiagnostic_method>
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_EthLoopbackDiagnosticTest*,
                                         Enum_Instances_Handler<KALDERA_EthLoopbackDiagnosticTest>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(ETHLOOPBACKDIAGNOSTICTEST, handler->wanted()), *handler,
                           SAYING(WARN, "No ethloopback diagnostic test is available"));
    }

    Invoke_Method_Status RunDiagnostic(const KALDERA_EthLoopbackDiagnosticTest* self,
                                       const CIM_ManagedElement* ManagedElement, const CIM_DiagnosticSetting*,
                                       const CIM_JobSettingData*, CIM_ConcreteJob*& Job,
                                       Property<uint32>& return_value)
    {
        LOG_SCOPE("RunDiagnostic");
        if (!self)
            return INVOKE_METHOD_UNSUPPORTED;
        const Run_Answer answer(LOG_HERE, Job, return_value);
        const auto* const port = tested_as<KALDERA_EthernetPort>(ManagedElement);
        if (!port)
            return answer.wrong_element();
        return answer.of(diagnostic_helper()->runEthLoopbackTest(port->DeviceID.value, self->Name.value));
    }
};

PROVIDER_PROC(KALDERA_EthLoopbackDiagnosticTest)

} // namespace KPRV
