#include "module/adapter/ProviderUtil.h"
#include "module/providers/controller_type.h"
#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_AvailableDiagnosticServiceForFCPort_Skeleton.h"
#include "module/schema/KALDERA_DiagnosticTest.h"
#include "module/schema/KALDERA_FCPort.h"
#include "module/schema/KALDERA_PortController.h"

namespace KPRV {

/// A converged adapter's FC ports do not offer it.
static constexpr diag_test_id_t INTERNAL_LOOPBACK_TEST = diag_test_id_t(2);

class KALDERA_AvailableDiagnosticServiceForFCPort_Provider
    : public KALDERA_AvailableDiagnosticServiceForFCPort_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_AvailableDiagnosticServiceForFCPort*,
                   Enum_Instances_Handler<KALDERA_AvailableDiagnosticServiceForFCPort>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_PortController> adapters(fc_hba_instances(PORTCONTROLLER));
        if (adapters.empty())
            return SAYING(WARN, "No adapters are available.").answer(ENUM_INSTANCES_OK);
        List<KALDERA_DiagnosticTest> tests(FCHBAManager::getFCHBAManager()->getDiagnosticServicesForFCPort());
        if (tests.empty())
            return SAYING(WARN, "No diagnostic tests are available.").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_AvailableDiagnosticServiceForFCPort::ServiceProvided,
                         &KALDERA_AvailableDiagnosticServiceForFCPort::UserOfService);
        const String internal_loopback = ProviderUtil::getDiagTestName(INTERNAL_LOOPBACK_TEST);
        for (uint32 i = 0; i < adapters.size(); i++) {
            const bool is_cna = adapters[i]->ControllerType.value == CONTROLLER_CNA;
            List<KALDERA_FCPort> ports(fc_ports_of(adapters[i]->DeviceID.value));
            if (ports.empty())
                LOG(WARN, "No ports are present for running dianostics.Continue with remaining adapter");
            join_each(ports, tests, [&](const KALDERA_FCPort* port, const KALDERA_DiagnosticTest* test) {
                if (is_cna && name_eq(test->Name.value.c_str(), internal_loopback.c_str()))
                    LOG(INFO, " The PortController is CNA");
                else
                    pair(test, port);
            });
        }
        return ENUM_INSTANCES_OK;
    }
};

PROVIDER_PROC(KALDERA_AvailableDiagnosticServiceForFCPort)

} // namespace KPRV
