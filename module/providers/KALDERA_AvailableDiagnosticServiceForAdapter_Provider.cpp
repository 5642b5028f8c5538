#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_AvailableDiagnosticServiceForAdapter_Skeleton.h"
#include "module/schema/KALDERA_DiagnosticTest.h"
#include "module/schema/KALDERA_PortController.h"

namespace KPRV {

class KALDERA_AvailableDiagnosticServiceForAdapter_Provider
    : public KALDERA_AvailableDiagnosticServiceForAdapter_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_AvailableDiagnosticServiceForAdapter*,
                   Enum_Instances_Handler<KALDERA_AvailableDiagnosticServiceForAdapter>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_PortController> adapters(fc_hba_instances(PORTCONTROLLER));
        if (adapters.empty())
            return SAYING(WARN, "No adapters are present in the host for running dianostics.")
                .answer(ENUM_INSTANCES_OK);
        List<KALDERA_DiagnosticTest> tests(
            FCHBAManager::getFCHBAManager()->getDiagnosticServicesForAdapter());
        if (tests.empty())
            return SAYING(WARN, "No diagnostic tests are available.").answer(ENUM_INSTANCES_OK);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_AvailableDiagnosticServiceForAdapter::ServiceProvided,
                         &KALDERA_AvailableDiagnosticServiceForAdapter::UserOfService);
        return join_each(adapters, tests,
                         [&](const Instance* element, const Instance* test) { pair(test, element); });
    }
};

PROVIDER_PROC(KALDERA_AvailableDiagnosticServiceForAdapter)

} // namespace KPRV
