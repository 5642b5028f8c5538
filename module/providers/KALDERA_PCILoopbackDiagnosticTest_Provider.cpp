#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/providers/run_diagnostic.h"
#include "module/schema/KALDERA_EthernetPort.h"
#include "module/schema/KALDERA_FCPort.h"
#include "module/schema/KALDERA_PCILoopbackDiagnosticTest_Skeleton.h"
#include "module/schema/KALDERA_PCILoopbackDiagnosticTest_methods.h"

namespace KPRV {

class KALDERA_PCILoopbackDiagnosticTest_Provider
    : public Test_Skeleton<KALDERA_PCILoopbackDiagnosticTest_Skeleton,
                           KALDERA_PCILoopbackDiagnosticTest_RunDiagnostic_method>
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_PCILoopbackDiagnosticTest*,
                                         Enum_Instances_Handler<KALDERA_PCILoopbackDiagnosticTest>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(PCILOOPBACKDIAGNOSTICTEST, handler->wanted()), *handler,
                           SAYING(WARN, "No PCI loopback diagnostic test is available"));
    }

    Invoke_Method_Status RunDiagnostic(const KALDERA_PCILoopbackDiagnosticTest* self,
                                       const CIM_ManagedElement* ManagedElement, const CIM_DiagnosticSetting*,
                                       const CIM_JobSettingData*, CIM_ConcreteJob*& Job,
                                       Property<uint32>& return_value)
    {
        LOG_SCOPE("RunDiagnostic");
        if (!self)
            return INVOKE_METHOD_UNSUPPORTED;
        const Run_Answer answer(LOG_HERE, Job, return_value);
        if (const auto* port = tested_as<KALDERA_FCPort>(ManagedElement)) {
            LOG(INFO, "PCI Loopback Test is requested for FC Port");
            return answer.of(diagnostic_helper()->runPCILoopbackTest(port->DeviceID.value));
        }
        if (const auto* port = tested_as<KALDERA_EthernetPort>(ManagedElement)) {
            LOG(INFO, "PCI Loopback Test is requested for Ethernet Port");
            return answer.of(diagnostic_helper()->runPCILoopbackTest(port->DeviceID.value));
        }
        return answer.wrong_element();
    }
};

PROVIDER_PROC(KALDERA_PCILoopbackDiagnosticTest)

} // namespace KPRV
