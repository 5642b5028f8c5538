#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/providers/run_diagnostic.h"
#include "module/schema/KALDERA_MemoryDiagnosticTest_Skeleton.h"
#include "module/schema/KALDERA_MemoryDiagnosticTest_methods.h"
#include "module/schema/KALDERA_PortController.h"

namespace KPRV {

class KALDERA_MemoryDiagnosticTest_Provider
    : public Test_Skeleton<KALDERA_MemoryDiagnosticTest_Skeleton,
                           KALDERA_MemoryDiagnosticTest_RunDiagnostic_method>
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_MemoryDiagnosticTest*,
                                         Enum_Instances_Handler<KALDERA_MemoryDiagnosticTest>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(MEMORYDIAGNOSTICTEST, handler->wanted()), *handler,
                           SAYING(WARN, "No memory diagnostic test is available"));
    }

    Invoke_Method_Status RunDiagnostic(const KALDERA_MemoryDiagnosticTest* self,
                                       const CIM_ManagedElement* ManagedElement, const CIM_DiagnosticSetting*,
                                       const CIM_JobSettingData*, CIM_ConcreteJob*& Job,
                                       Property<uint32>& return_value)
    {
        LOG_SCOPE("RunDiagnostic");
        if (!self)
            return INVOKE_METHOD_UNSUPPORTED;
        const Run_Answer answer(LOG_HERE, Job, return_value);
        const auto* const adapter = tested_as<KALDERA_PortController>(ManagedElement);
        if (!adapter)
            return answer.wrong_element();
        return answer.of(diagnostic_helper()->runMemoryTest(adapter->DeviceID.value));
    }
};

PROVIDER_PROC(KALDERA_MemoryDiagnosticTest)

} // namespace KPRV
