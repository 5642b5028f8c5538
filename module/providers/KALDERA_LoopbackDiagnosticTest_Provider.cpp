#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/providers/run_diagnostic.h"
#include "module/schema/KALDERA_FCPort.h"
#include "module/schema/KALDERA_LoopbackDiagnosticTest_Skeleton.h"
#include "module/schema/KALDERA_LoopbackDiagnosticTest_methods.h"

namespace KPRV {

class KALDERA_LoopbackDiagnosticTest_Provider
    : public Test_Skeleton<KALDERA_LoopbackDiagnosticTest_Skeleton,
                           KALDERA_LoopbackDiagnosticTest_RunDiagnostic_method>
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_LoopbackDiagnosticTest*,
                                         Enum_Instances_Handler<KALDERA_LoopbackDiagnosticTest>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(LOOPBACKDIAGNOSTICTEST, handler->wanted()), *handler,
                           SAYING(WARN, "No loopback diagnostic test is available"));
    }

    Invoke_Method_Status RunDiagnostic(const KALDERA_LoopbackDiagnosticTest* self,
                                       const CIM_ManagedElement* ManagedElement, const CIM_DiagnosticSetting*,
                                       const CIM_JobSettingData*, CIM_ConcreteJob*& Job,
                                       Property<uint32>& return_value)
    {
        LOG_SCOPE("RunDiagnostic");
        if (!self)
            return INVOKE_METHOD_UNSUPPORTED;
        const Run_Answer answer(LOG_HERE, Job, return_value);
        const auto* const port = tested_as<KALDERA_FCPort>(ManagedElement);
        if (!port)
            return answer.wrong_element();
        return answer.of(diagnostic_helper()->runLoopbackTest(port->DeviceID.value, self->Name.value));
    }
};

PROVIDER_PROC(KALDERA_LoopbackDiagnosticTest)

} // namespace KPRV
